// What the scans of adapters and of the SAN make of a host, and of failures on the way.
#include "tests/road/hosts.h"
#include "tests/road/scan_host.h"

#include "device/fc_adapter.h"
#include "device/fcoe_adapter.h"
#include "device/iscsi_adapter.h"
#include "device/nic_adapter.h"

#include <gtest/gtest.h>

using namespace cimple;
using road::Calls;
using road::card;
using road::Scan_Host;

namespace {

struct Fault {
    const char* function;
    unsigned call;
    std::uint64_t value;
    vlnsim_fault_kind kind = VLNSIM_STATUS;
};

const std::string NIC_AND_FCOE = card(R"({"use": "nic"}, {"use": "fcoe",
    "targets": {"wwpn": "50:25:64:C0:00:00:00:01", "luns": [{}, {"silent": true}]}})");

void expect_faults(const std::vector<Fault>& faults) {
    vlnsim_clear_faults();
    for (const Fault& fault : faults)
        ASSERT_EQ(vlnsim_fault(fault.function, fault.call, fault.kind, fault.value), 0);
}

// ---- Adapters ----

// The number of each adapter and how many ports it has.
std::string adapters_of(Scan_Host& host) {
    std::string text;
    for (const auto& adapter : host.data().adapters)
        text += std::to_string(adapter->getAdapterNumber()) + ":" +
                std::to_string(adapter->getPortCount()) + " ";
    return text;
}

TEST(Scan, FunctionsBecomeAdaptersOfTheirKinds) {
    std::string functions;
    for (const char* features : {"4", "0x0C", "0x410", "0x14", "0x10", "0xFFFFFBE3"})
        functions += (functions.empty() ? "" : ",") +
                     std::string(R"({"type": "none", "mac": null, "specialFeatures": ")") +
                     features + R"(", "subAdapter": "0x{function}{function}"})";
    Scan_Host host(card(functions));
    host.adapter_scan();
    const struct {
        uint32 type;
        const char* name;
    } expected[] = {{ADAPTER_ISCSI, "Vorlan VMC-2210-00"},
                    {ADAPTER_NIC, "Vorlan VMC-2210-11"},
                    {ADAPTER_NIC, "Vorlan VMC-2210-22"},
                    {ADAPTER_ISCSI, "Vorlan VMC-2210-33"},
                    {ADAPTER_FCOE, "Vorlan VMC-2210-44"}}; // the last is of no kind that is known
    ASSERT_EQ(host.data().adapters.size(), std::size(expected));
    for (std::size_t i = 0; i < std::size(expected); ++i) {
        EXPECT_EQ(host.data().adapters[i]->getAdapterType(), expected[i].type) << i;
        EXPECT_EQ(host.data().adapters[i]->getAdapterName(), expected[i].name) << i;
    }
    // An iSCSI function that does not tell of its initiator has no port.
    EXPECT_EQ(adapters_of(host), "0:0 1:1 2:1 3:0 4:1 ");
    EXPECT_TRUE(host.data().hasNICAdapter && host.data().hasISCSIAdapter &&
                host.data().hasFCoEAdapter && !host.data().hasFCAdapter);
    // What nothing is told of stands as it was.
    const auto& port =
        dynamic_cast<NICPortAttributes&>(*host.data().adapters[1]->getPort(0)->getPortAttributes());
    EXPECT_EQ(port.PortType, 1U);
    EXPECT_EQ(port.SRIOVState, 3U);
    EXPECT_EQ(port.VEPAState, 2U);
}

// The passes of the scan: a look for a NIC function, which needs two lists of instances for a table
// of one word and then one of two, and a pass that makes the adapters.
TEST(Scan, FailuresOfAnAdapterScan) {
    constexpr char LIST[] = "AX_GetAllLocalHBAInstances", V4[] = "AX_GetLocalHBAInfoV4",
                   V3[] = "AX_GetLocalHBAInfoV3", ADAPTER[] = "AX_GetHBAAttributes";
    std::vector<Fault> endless;
    for (unsigned call = 2; call < 100; call += 2)
        endless.push_back({ADAPTER, call, 1});
    const struct {
        std::vector<Fault> faults;
        const char* adapters;
        int count;
        unsigned long lists;
        unsigned sleeps;
    } rows[] = {
        {{}, "0:1 1:1 ", 2, 3, 0},
        {{{V4, 3, 190}}, "0:1 1:1 ", 2, 3, 0}, // the older record serves
        {{{V4, 3, 5}, {V3, 1, 6}}, "0:1 ", 1, 3, 0},
        {{{"AX_GetPortAttributes", 1, 7}}, "0:0 1:1 ", 2, 3, 0},
        // One of two fails: the pass runs again, and the first stands twice.
        {{{ADAPTER, 2, 1}}, "0:1 0:1 1:1 ", 2, 4, 0},
        {{{V4, 3, 190}, {V3, 1, 190}, {ADAPTER, 1, 1}}, "", -1, 3, 0},
        // No end: it is given up, and what the passes made stands once.
        {endless, "0:1 ", 0, 9, 0},
        // A list that fails costs a look. The third finds the function too late.
        {{{LIST, 1, 1}}, "0:1 1:1 ", 2, 4, 1},
        {{{LIST, 1, 1}, {LIST, 3, 9}}, "", 0, 4, 2},
        // The number of instances is the look's, but the table ends the walk.
        {{{LIST, 3, 1, VLNSIM_TOO_SMALL}, {LIST, 4, 1}}, "0:1 ", 1, 4, 0},
    };
    Scan_Host host(NIC_AND_FCOE);
    for (const auto& row : rows) {
        SCOPED_TRACE(&row - rows);
        expect_faults(row.faults);
        const std::uint64_t start = vlnsim_now();
        Calls calls = host.adapter_scan();
        EXPECT_EQ(adapters_of(host), row.adapters);
        EXPECT_EQ(host.data().adapterCount, row.count);
        EXPECT_EQ(host.data().hasNICAdapter, *row.adapters != '\0');
        EXPECT_EQ(calls[LIST], row.lists);
        EXPECT_EQ(vlnsim_now() - start, row.sleeps * 1000000u);
        EXPECT_EQ(vlnsim_violations(), 0u);
    }
}

// ---- Names in the HBA API ----

// Each FCoE adapter looks for its port, from the first name on. Without a match the last name
// stands; an iSCSI adapter takes the name of its number.
TEST(Scan, NamesInTheHbaApi) {
    const struct {
        std::vector<Fault> faults; // in the first one's search
        const char* names;
        unsigned long name_calls, port_calls;
    } rows[] = {
        {{}, "h1 h0 h1 h2 ", 1 + 1 + 2 + 3, 1 + 3 + 5},
        {{{"HBA_GetAdapterName", 2, 1}}, "h1 h2 h1 h2 ", 1 + 3 + 2 + 3, 4 + 3 + 5},
        {{{"HBA_OpenAdapter", 1, 0}}, "h1 h2 h1 h2 ", 1 + 3 + 2 + 3, 4 + 3 + 5},
        {{{"HBA_GetAdapterAttributes", 1, 1}}, "h1 h2 h1 h2 ", 1 + 3 + 2 + 3, 4 + 3 + 5},
        // A port that does not tell its name gets another chance.
        {{{"HBA_GetAdapterPortAttributes", 1, 1}}, "h1 h0 h1 h2 ", 1 + 1 + 2 + 3, 2 + 3 + 5},
        {{{"HBA_GetNumberOfAdapters", 1, 0}}, "h1  h1 h2 ", 1 + 2 + 3, 3 + 5},
        {{{"HBA_GetAdapterName", VLNSIM_EVERY, 1}}, "    ", 1 + 3 * 3, 0},
        // Numbers that cannot be end the search all the same.
        {{{"HBA_GetNumberOfAdapters", 1, 0xFFFFFFF0},
          {"HBA_GetAdapterAttributes", VLNSIM_EVERY, 1}},
         "h1 h2 h2 h2 ",
         1 + 1024 + 3 + 3,
         0},
    };
    const auto fcoe = [](const char* name) {
        return R"(, {"use": "fcoe", "hba": {"ports": 2, "name": ")" + std::string(name) + "\"}}";
    };
    Scan_Host host(
        card(R"({"use": "nic"}, {"use": "iscsi"})" + fcoe("h0") + fcoe("h1") + fcoe("h2")));
    for (const auto& row : rows) {
        SCOPED_TRACE(&row - rows);
        expect_faults(row.faults);
        Calls calls = host.adapter_scan();
        std::string names;
        for (const auto& adapter : host.data().adapters)
            if (const auto* storage = dynamic_cast<Storage_Adapter*>(adapter.get()))
                names += storage->getHbaAdapterName() + " ";
        EXPECT_EQ(names, row.names);
        EXPECT_EQ(calls["HBA_GetAdapterName"], row.name_calls);
        EXPECT_EQ(calls["HBA_GetAdapterPortAttributes"], row.port_calls);
    }
}

TEST(Scan, AnAbsurdNumberOfHbaPorts) {
    const std::string two_named_alike = card(R"({"use": "nic"}, {"use": "fcoe",
        "hba": {"name": "liar", "ports": 4294967295}}, {"use": "fcoe", "hba": {"name": "other"}})");
    Scan_Host host(two_named_alike);
    EXPECT_EQ(host.adapter_scan()["HBA_GetAdapterPortAttributes"], 1 + 1024 + 1u);
}

// ---- The SAN ----

TEST(Scan, AMappingIsTriedThreeTimes) {
    constexpr char MAPPING[] = "HBA_GetFcpTargetMapping";
    const struct {
        std::vector<Fault> faults;
        unsigned long calls, refreshes;
        std::size_t targets;
    } rows[] = {
        {{}, 1, 0, 2},
        {{{MAPPING, 1, 8}, {MAPPING, 2, 0, VLNSIM_TOO_SMALL}}, 3, 1, 2},
        {{{MAPPING, VLNSIM_EVERY, 8}}, 3, 3, 0},
        {{{MAPPING, VLNSIM_EVERY, 7}}, 3, 0, 0},
        {{{MAPPING, 1, 8}, {MAPPING, 2, 2}}, 2, 1, 0},
        {{{"HBA_OpenAdapter", 1, 0}}, 0, 0, 0}, // not for the port
        {{{"HBA_OpenAdapter", 2, 0}}, 1, 0, 1}, // not for the first unit
    };
    Scan_Host host(NIC_AND_FCOE);
    host.adapter_scan();
    const std::size_t handles = vlnsim_open_handles(); // the search for names leaves its own open
    for (const auto& row : rows) {
        SCOPED_TRACE(&row - rows);
        expect_faults(row.faults);
        Calls calls = host.san_scan();
        EXPECT_EQ(calls[MAPPING], row.calls);
        EXPECT_EQ(calls["HBA_RefreshInformation"], row.refreshes);
        EXPECT_EQ(host.targets().size(), row.targets);
        // A silent unit is not asked again: it is no check condition.
        EXPECT_EQ(calls["HBA_SendScsiInquiry"], row.targets * 3);
        EXPECT_EQ(vlnsim_open_handles(), handles);
    }
}

// ---- The FC kind ----

// It reads both libraries; its mapping comes to no target, since those are read through FCoE
// adapters only.
TEST(Scan, AnFcAdapter) {
    Scan_Host host(card(R"({"use": "nic"}, {"use": "fcoe", "hba": {"name": "vfc0"},
        "wwpn": "1000024500000005", "wwnn": "2000024500000005", "fabric": "1000024500000009",
        "serial": "FC1", "targets": {"luns": 1}, "adapterAttributes": {"586": "01"},
        "portAttributes": {"FunctionalPortState": 2, "PhysicalPortState": 6, "864": 1}})"));
    const std::size_t handles = vlnsim_open_handles();
    FCAdapter adapter("vfc0", 4);
    const auto& a = dynamic_cast<FCAdapterAttributes&>(*adapter.getAdapterAttributes());
    EXPECT_EQ(adapter.getAdapterType(), ADAPTER_FC);
    EXPECT_EQ(a.SerialNumber, "FC1");
    EXPECT_EQ(a.NodeWWN, "2000024500000005");
    EXPECT_EQ(a.Subadapter_number, "01");
    ASSERT_EQ(adapter.getPortCount(), 1U);
    auto& port = dynamic_cast<FCPort&>(*adapter.getPort(0));
    EXPECT_EQ(port.getPortName(), "1000024500000005");
    const auto& p = dynamic_cast<FCPortAttributes&>(*port.getPortAttributes());
    EXPECT_EQ(p.PortState, 6U) << "the physical state has the last word";
    EXPECT_EQ(p.FECState, 1U);
    EXPECT_EQ(p.FabricName, "1000024500000009");
    adapter.rescanTargets();
    EXPECT_EQ(port.getTargetCount(), 0U);
    EXPECT_EQ(vlnsim_calls("HBA_GetFcpTargetMapping"), 1u);
    EXPECT_EQ(vlnsim_calls("HBA_SendScsiInquiry"), 0u);

    // Stale data are refreshed once.
    constexpr char ATTRIBUTES[] = "HBA_GetAdapterAttributes";
    expect_faults({{ATTRIBUTES, 1, 8}, {"HBA_GetAdapterPortAttributes", 2, 8}});
    EXPECT_EQ(FCAdapter("vfc0", 0).getPortCount(), 1U);
    EXPECT_EQ(vlnsim_calls("HBA_RefreshInformation"), 2u);
    expect_faults({{ATTRIBUTES, 1, 8}, {ATTRIBUTES, 2, 8}});
    EXPECT_THROW(FCAdapter("vfc0", 0), std::exception);
    EXPECT_THROW(FCAdapter("nobody", 0), std::exception);
    EXPECT_EQ(vlnsim_open_handles(), handles);
}

} // namespace
