// How many calls a scan makes, function by function: each is a round trip to a driver, and a scan
// owes its callers not one more than its steps need.
#include "tests/road/scan_host.h"

#include <gtest/gtest.h>

using road::Calls;
using road::Scan_Host;

namespace {

// Values read out of the fetched buffers, per kind of function: the rows of its adapter attributes
// and of its port attributes.
constexpr unsigned long NIC_VALUES = 39 + 32;
constexpr unsigned long ISCSI_VALUES = 19 + 18; // the operational firmware version counts twice
constexpr unsigned long FCOE_VALUES = 29 + 19;  // and here the class of service

// Four cards of two ports: two with NIC and FCoE functions, two with NIC and iSCSI functions. So 16
// instances, every adapter with one port: 8 NIC, 4 FCoE, 4 iSCSI. The HBA API has the 4 FCoE ones,
// in the order of the instances.
TEST(Call_Count, OfAnAdapterScanOfABlade) {
    Scan_Host host("blade-16-functions.json");
    const Calls expected = {
        // The look: a table for one is too small, then one that fits. The creating pass knows the
        // size.
        {"AX_GetAllLocalHBAInstances", 2 + 1},
        // The look ends at the first instance, a NIC function; the creating pass reads each record.
        {"AX_GetLocalHBAInfoV4", 1 + 16},
        // One buffer for each adapter and one for each port.
        {"AX_GetHBAAttributes", 16},
        {"AX_GetPortAttributes", 16},
        {"AX_GetAttributeValue", 8 * NIC_VALUES + 4 * FCOE_VALUES + 4 * ISCSI_VALUES},
        {"AX_GetDriverType", 4}, // FCoE
        {"AX_iSCSI_GetInitiatorProperties", 4},
        {"AX_Ini_GetNetworkProperties", 4},
        // Each FCoE function looks for its name from the first HBA on, and stops at its own: 1 + 2 +
        // 3 + 4 names, each opened, its attributes and those of its one port read. An iSCSI
        // function asks for one name.
        {"HBA_GetNumberOfAdapters", 4},
        {"HBA_GetAdapterName", 10 + 4},
        {"HBA_OpenAdapter", 10},
        {"HBA_GetAdapterAttributes", 10},
        {"HBA_GetAdapterPortAttributes", 10},
    };
    EXPECT_EQ(host.adapter_scan(), expected);
    EXPECT_EQ(vlnsim_violations(), 0u);
}

// Each of the 4 FCoE ports sees one target with 4 disks: 16 units.
TEST(Call_Count, OfASanScanOfABlade) {
    Scan_Host host("blade-16-functions.json");
    host.adapter_scan();
    const Calls expected = {
        // The port opens the adapter once for the mapping, each unit once for itself.
        {"HBA_OpenAdapter", 4 + 16},
        {"HBA_CloseAdapter", 4 + 16},
        {"HBA_GetFcpTargetMapping", 4},
        {"HBA_SendScsiInquiry", 16 * 3}, // standard data, page 0x80, page 0x83
        {"HBA_SendReadCapacity", 16},
    };
    EXPECT_EQ(host.san_scan(), expected);
    EXPECT_EQ(host.targets().size(), 16u);
    EXPECT_EQ(host.san_scan(), expected) << "a scan of a port that has targets already";
    EXPECT_EQ(vlnsim_violations(), 0u);
}

// 2,048 units behind each of the two ports. Of the 16 types that they go round in, 8 have blocks
// and answer read capacity at once; the others answer with a check condition at each of 3 attempts.
TEST(Call_Count, OfASanScanOfFourThousandUnits) {
    Scan_Host host("san-4096-luns.json");
    host.adapter_scan();
    constexpr unsigned long UNITS = 4096;
    const Calls expected = {
        {"HBA_OpenAdapter", 2 + UNITS},     {"HBA_CloseAdapter", 2 + UNITS},
        {"HBA_GetFcpTargetMapping", 2 * 2}, // room for 256 first, then for all
        {"HBA_SendScsiInquiry", UNITS * 3}, {"HBA_SendReadCapacity", UNITS / 2 + UNITS / 2 * 3},
    };
    EXPECT_EQ(host.san_scan(), expected);
    EXPECT_EQ(host.targets().size(), UNITS);
    EXPECT_EQ(vlnsim_violations(), 0u);
}

} // namespace
