// Virtual ports as a client sees them, what a failure costs of them, and the priority of their
// units. docs/services/virtual_ports.md shows the same host in full.
#include "tests/road/properties.h"
#include "tests/services/changes.h"

#include <cstring>

using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using road::walk;

namespace {

constexpr const char* PORT = "VLNMPCA_VirtualFCPort";
constexpr const char* TARGET = "VLNMPCA_VirtualSCSIProtocolTargetEndpoint";
constexpr const char* VOLUME = "VLNMPCA_VirtualStorageVolume";
constexpr const char* PATH = "VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath";
constexpr const char* SETTING = "VLNMPCA_DriverParameterSettingData";

TEST(Virtual_Ports, ShowWhatTheyAreAndSee) {
    Road road({.scenario = "virtual-ports.json", .log = true});
    expect_properties(
        find(road, "VLNMPCA_ResourcePool", "PoolID", "VLN:Resource Pool:100002564C000001"),
        {{"InstanceID", "VLN:Resource Pool:100002564C000001"},
         {"ElementName", "VLN:Resource Pool:100002564C000001"},
         {"Primordial", "FALSE"}});
    expect_properties(find(road, PORT, "VPortName", "mail"),
                      {{"CreationClassName", "VLN_VirtualFCPort"}, {"Name", "200102564C000001"}});
    expect_properties(find(road, TARGET, "TargetWWPN", "502564C000000001"),
                      {{"CreationClassName", "VLNHBA_VirtualSCSIProtocolTargetEndpoint"},
                       {"Role", "3"},
                       {"IdentifyingDescriptions", "{OS Device Name}"}});
    const host::Instance volume =
        find(road, VOLUME, "DeviceID", "100002564C000001:200102564C000001:502564C000000000:300");
    expect_properties(volume, {{"Description", "LUN Number: 300"},
                               {"ElementName", "Storage Volume:300"},
                               {"CapacityUnit", "Byte"},
                               {"BlockSize", "4096"},
                               {"NumberOfBlocks", "4294967295"},
                               {"LargeNumberOfBlocks", "4294967295"}});
    const auto paths = road.manager().references(volume.path, {PATH, "", "", ""}).value;
    ASSERT_EQ(paths.size(), 1u);
    expect_properties(paths[0], {{"LogicalUnitNumber", "300"}, {"OSDeviceName", "-"}});
    road.close();
    for (const char* line :
         {"No of FC Ports: 2", "FC Port ID: 100002564C010001",
          "No of vports:0 for 100002564C010001", "Creating Resource pool ",
          "HostedResource Pool created and inserted in map",
          "VPort Id :200102564C000001 Node name: 200002564C010001",
          "Creating VPort Targets for FCPort: 100002564C000001, Virtual FC Port: 200102564C000004",
          "Created Initiator for: 200102564C000003",
          "Port Virtualization classes are successfully created"})
        EXPECT_EQ(road.count_in_log(line), 1u) << line;
    EXPECT_EQ(road.count_in_log("OS Lun ID: 300"), 1u);
    EXPECT_EQ(road.count_in_log("LunList Lun ID: 300"), 1u);
    EXPECT_EQ(road.faults_in_log(), "");
}

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

// The port that carries a virtual one is what the adapter is asked through.
TEST(Virtual_Ports, UnitsGetAndLosePriority) {
    Road road({.scenario = "virtual-ports.json", .log = true});
    const auto priority = [](const char* port, const char* lun) {
        host::Instance setting;
        setting.path.class_name = SETTING;
        const auto id = host::Value::text(std::string("VLN:PrioVia:Driver:") + port +
                                          ":502564C000000000:" + lun);
        host::set(setting.path.keys, "InstanceID", id);
        host::set(setting.properties, "InstanceID", id);
        return setting;
    };
    const auto of_port = [&](const char* name) {
        std::string units;
        const host::Instance port = find(road, PORT, "DeviceID", name);
        for (const host::Instance& each : walk(road, port, "VLNMPCA_VPortElementSettingData"))
            units += text_of(each, "InstanceID").substr(12, 6) + text_of(each, "Value") + " ";
        return units;
    };
    const auto last_call = [](const char* wanted) {
        char line[256] = "";
        for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i) {
        }
        vlnsim_clear_calls();
        EXPECT_EQ(std::string(line).substr(0, std::strlen(wanted)), wanted);
    };
    EXPECT_EQ(of_port("200102564C000001"), "Driver1 Config1 ");
    EXPECT_EQ(of_port("200102564C000002"), "Config0 ");
    EXPECT_EQ(road.count_in_log("Could not find the corresponding Virtual FC Port instance."), 1u);
    EXPECT_EQ(walk(road,
                   find(road, SETTING, "InstanceID",
                        "VLN:PrioVia:Driver:200102564C0000FF:502564C000000000:0"),
                   "VLNMPCA_DriverElementSettingData")
                  .size(),
              1u)
        << "a virtual port that is gone";

    vlnsim_record_calls(1);
    EXPECT_TRUE(road.manager().create(priority("200102564C000002", "1")).status.ok());
    last_call("AX_SetOASLunState(100002564C000001, 200102564C000002, 502564C000000000, 1, 1, 0)");
    EXPECT_EQ(of_port("200102564C000002"), "Config0 Driver1 ");
    EXPECT_FALSE(road.manager().create(priority("200102564C000002", "4")).status.ok())
        << "a unit of another virtual port";
    vlnsim_clear_calls();
    EXPECT_TRUE(road.manager().remove(priority("200102564C000002", "1").path).ok());
    last_call("AX_SetOASLunState(100002564C000001, 200102564C000002, 502564C000000000, 1, 0, 0)");
    EXPECT_EQ(of_port("200102564C000002"), "Config0 ");

    host::Named_Values inputs;
    host::set(inputs, "InitiatorWWPN", host::Value::text("200102564C000001"));
    host::set(inputs, "TargetWWPN", host::Value::text("502564C000000000"));
    host::set(inputs, "Option", services::number(CMPI_uint8, 0));
    const host::Instance service = road.enumerate("VLNMPCA_DriverParameterService").at(0);
    EXPECT_EQ(road.manager()
                  .invoke(service.path, "DisableAllPrioViaLuns", inputs)
                  .value.value.as_unsigned(),
              0u);
    EXPECT_EQ(of_port("200102564C000001"), "Config1 ");
    vlnsim_record_calls(0);
}

} // namespace
