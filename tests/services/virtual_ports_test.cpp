// What a failure costs of virtual ports: the rest is in tables/virtual_ports.txt.
#include "tests/road/road.h"

using road::Road;
using road::text_of;

namespace {

constexpr const char* PORT = "VLNMPCA_VirtualFCPort";
constexpr const char* TARGET = "VLNMPCA_VirtualSCSIProtocolTargetEndpoint";
constexpr const char* VOLUME = "VLNMPCA_VirtualStorageVolume";
constexpr const char* PATH = "VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath";

// A failure costs the port, the target or the unit that it is about, and nothing else.
TEST(Virtual_Ports, FailuresCostWhatTheyTouch) {
    const struct {
        const char* function;
        unsigned call;
        std::uint64_t status;
        std::size_t pools, ports, targets, volumes, named, told;
        const char* line;
    } rows[] = {
        {"AX_VPList", 2, 190, 1, 4, 4, 7, 2, 7,
         "VLNMPCA_PortVirtualization::Failure in listing vports for port: 100002564C010001, "
         "AX Error: 190"},
        {"AX_VPGetAttributes", 1, 190, 1, 3, 2, 2, 1, 2,
         "VLNMPCA_PortVirtualization::Failure in listing vports information for port: "
         "200102564C000001, AX Error: 190"},
        {"AX_VPListTargets", 1, 190, 1, 4, 2, 2, 2, 2, "ListVPortTargets exited with the error"},
        {"AX_VpScsiInquiry", VLNSIM_EVERY, 190, 1, 4, 4, 0, 2, 0, "AX_VpScsiInquiry: status=190"},
        {"AX_VpScsiReadCapacity", 1, 1, 1, 4, 4, 6, 2, 6, "AX_VpScsiReadCapacity: status=1"},
        {"AX_VpScsiReportLUNs", 1, 1, 1, 4, 4, 7, 2, 3, "Cannot Determine VM Visibility."},
        {"AX_GetVMFromVPort", 1, 190, 1, 4, 4, 7, 1, 7, "ListVMfromVPort exited with the error"},
        {"AX_GetVMInfo", VLNSIM_EVERY, 1, 1, 4, 4, 7, 0, 7, "ListVMfromVPort exited"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        Road road({.scenario = "virtual-ports.json", .log = true});
        vlnsim_fault(row.function, row.call, VLNSIM_STATUS, row.status);
        const auto with = [&](const char* class_name, const char* property) {
            std::size_t count = 0;
            for (const host::Instance& each : road.enumerate(class_name))
                count += text_of(each, property) != "-";
            return count;
        };
        EXPECT_EQ(with("VLNMPCA_ResourcePool", "PoolID"), row.pools);
        EXPECT_EQ(with(PORT, "Name"), row.ports);
        EXPECT_EQ(with(TARGET, "Name"), row.targets);
        EXPECT_EQ(with(VOLUME, "DeviceID"), row.volumes);
        EXPECT_EQ(with(PATH, "Initiator"), row.volumes);
        EXPECT_EQ(with("VLNMPCA_VMSystemDevice", "VirtualPortId"), row.ports);
        EXPECT_EQ(with("VLNMPCA_VMSystemDevice", "VMName"), row.named);
        EXPECT_EQ(with(VOLUME, "VMVisibility"), row.told);
        EXPECT_GE(road.count_in_log(row.line), 1u);
        EXPECT_EQ(road.faults_in_log(), "");
    }
}

} // namespace
