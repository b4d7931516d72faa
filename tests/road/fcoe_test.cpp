// What a client sees of FCoE ports: the ports, what they stand beside, and what changes on them.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

#include <array>
#include <fstream>

using road::expect_properties;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;
using road::walk;

namespace {

constexpr std::uint64_t SECOND = 1000000;
constexpr const char* PORT = "100002564C000105"; // of two-port-cna

// The first of two ports has an Ethernet function beside it, the second has none.
TEST(FCoE, APortWithoutAnEthernetPortStandsAlone) {
    Road road({.scenario = "fcoe-pair.json", .log = true});
    const auto ports = road.enumerate("VLNMPCA_FCPort");
    ASSERT_EQ(ports.size(), 2u);
    for (const char* via : {"VLNMPCA_FCControlledBy", "VLNMPCA_FCRealizes",
                            "VLNMPCA_HostedDependency", "VLNMPCA_FCPortSoftwareIdentity"}) {
        EXPECT_EQ(walk(road, ports[0], via).size(), 1u) << via;
        EXPECT_TRUE(walk(road, ports[1], via).empty()) << via;
    }
    road.close();
    EXPECT_EQ(road.count_in_log("Wrong input"), 0u) << "an end that is not there is no fault";
    EXPECT_EQ(road.count_in_log("MAC address matched matched"), 1u);
}

// A port number or a serial number of its own is enough to part the two; virtual ports are no host.
TEST(FCoE, WhatMakesAPair) {
    const struct {
        const char* nic;
        std::size_t controlled, dependent;
    } rows[] = {
        {R"("driverType": 1)", 1, 1},
        {R"("portNumber": 1)", 0, 1},
        {R"("subAdapter": 2)", 1, 0},
        {R"("serial": "VR99999999")", 0, 0},
        {R"("portAttributes": {"vNICEnabledState": 1})", 1, 0},
    };
    for (const auto& row : rows) {
        Road road({.scenario = road::card(R"({"use": "nic", )" + std::string(row.nic) +
                                          R"(}, {"use": "fcoe"})")});
        EXPECT_EQ(road.enumerate("VLNMPCA_FCPort").size(), 1u) << row.nic;
        EXPECT_EQ(road.enumerate("VLNMPCA_FCControlledBy").size(), row.controlled) << row.nic;
        EXPECT_EQ(road.enumerate("VLNMPCA_HostedDependency").size(), row.dependent) << row.nic;
    }
}

// A function whose registers can't be read lacks its PCI device, and nothing else.
TEST(FCoE, APortWithoutPCIRegistersKeepsAllElse) {
    Road road({.scenario = "fcoe-pair.json"});
    auto census = road.census();
    road.close();
    Road unreadable({.scenario = "fcoe-pair.json"});
    vlnsim_fault("AX_DiagReadPCIRegistersV2", 2, VLNSIM_STATUS, 1); // after the NIC function
    for (const char* cost :
         {"VLNMPCA_PCIDevice", "VLNMPCA_SystemDevice", "VLNMPCA_FCConcreteIdentity",
          "VLNMPCA_PCIElementConformsToProfile", "VLNMPCA_VitalProductData", "VLNMPCA_ElementVPD"})
        --census[cost];
    EXPECT_EQ(unreadable.census(), census);
}

// One of the host's two ways out; a gateway that is told goes first.
TEST(FCoE, TheWayToTheConsoleStandsOnce) {
    const char* const rows[][3] = {
        {"null", "# console\nhttps://console.example/pv\n", "https://console.example/pv"},
        {R"("0.0.0.0")", "https://console.example/pv\r\n", "https://console.example/pv"},
        {R"("192.0.2.1")", "https://console.example/pv\n", "192.0.2.1"},
    };
    for (const auto& [gateway, file, access] : rows) {
        Road road(
            {.scenario = road::card(R"({"use": "nic", "portAttributes": {"GatewayAddress": )" +
                                        std::string(gateway) + R"(}}, {"use": "fcoe"})",
                                    R"("count": 2, )")});
        std::ofstream(road.root() / "etc/vln_smis.conf") << file;
        const auto points = road.enumerate("VLNMPCA_RemoteServiceAccessPoint");
        ASSERT_EQ(points.size(), 1u) << gateway;
        EXPECT_EQ(text_of(points[0], "AccessInfo"), access);
        EXPECT_EQ(road.enumerate("VLNMPCA_RemoteHostedAccessPoint").size(), 1u);
        EXPECT_EQ(road.enumerate("VLNMPCA_SAPAvailableForElement").size(),
                  access == std::string("192.0.2.1") ? 0u : 2u);
    }
}

// A value that can't be read ends its port: what comes after it stays as it was.
TEST(FCoE, AFailedReadingEndsThePort) {
    const struct {
        std::uint64_t missing;
        const char* line;
        std::array<const char*, 4> shown; // status, detail, type and speed
    } rows[] = {
        {802, "AX_GetttributeValue for PortState", {"{2}", "2", "10", "10000000000"}},
        {774, "AX_GetttributeValue for PortState", {"{32790}", "2", "10", "10000000000"}},
        {773, "AX_GetttributeValue for PortType", {"{32790}", "6", "10", "10000000000"}},
        {779, "AX_GetttributeValue for PortSpeed", {"{32790}", "6", "1", "10000000000"}},
        {842, "AX_GetttributeValue for PhysicalPortSpeed", {"{32790}", "6", "1", "4000000000"}},
        {0, nullptr, {"{32790}", "6", "1", "4000000000"}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.missing);
        Road road({.log = true});
        find(road, "VLNMPCA_FCPort", "DeviceID", PORT);
        const std::pair<const char*, const char*> values[] = {{"PhysicalPortState", "22"},
                                                              {"FunctionalPortState", "6"},
                                                              {"PortType", "21"},
                                                              {"PortSpeed", "8"},
                                                              {"PhysicalPortSpeed", "8"}};
        for (const auto& [name, value] : values)
            set_value(PORT, "portAttributes", name, value);
        if (row.line)
            vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, row.missing);
        vlnsim_advance(10 * SECOND);
        const host::Instance port = find(road, "VLNMPCA_FCPort", "DeviceID", PORT);
        expect_properties(port, {{"OperationalStatus", row.shown[0]},
                                 {"DetailedStatus", row.shown[1]},
                                 {"PortType", row.shown[2]},
                                 {"Speed", row.shown[3]},
                                 {"PhysicalPortSpeed", row.line ? "10000000000" : "4000000000"}});
        if (!row.line) {
            expect_properties(
                port, {{"StatusDescriptions", "{Disable}"}, {"OtherPortType", "Point to Point"}});
            continue;
        }
        road.close();
        EXPECT_EQ(road.count_in_log(row.line + std::string(" call failed (251)")), 2u);
    }
}

TEST(FCoE, EveryCounterHasItsProperty) {
    const std::pair<const char*, const char*> plain[] = {
        {"1025", "PacketsTransmitted"},
        {"1032", "PacketsReceived"},
        {"1033", "LIPCount"},
        {"1036", "NOSCount"},
        {"1037", "ErrorFrames"},
        {"1038", "DumpedFrames"},
        {"1039", "LinkFailures"},
        {"1041", "LossOfSignalCounter"},
        {"1040", "LossOfSyncCounter"},
        {"1042", "PrimitiveSeqProtocolErrCount"},
        {"1044", "CRCErrors"},
        {"1043", "InvalidTransmissionWords"},
        {"1045", "TxSequences"},
        {"1028", "RxSequences"},
        {"1029", "ExCountOrig"},
        {"1026", "ExCountResp"},
        {"1027", "ActiveXRIs"},
        {"1048", "ActiveRPIs"},
        {"1047", "ElasticBufOverruns"},
        {"1058", "LinkTransitions"},
        {"1046", "PrimitiveSeqTimesouts"},
        {"1057", "ArbitrationTimeouts"},
    };
    Road road;
    const auto statistics = [&road] {
        vlnsim_advance(10 * SECOND);
        return find(road, "VLNMPCA_FCPortStatistics", "InstanceID",
                    std::string("VLNMPCA :FC Statistics:") + PORT);
    };
    EXPECT_EQ(text_of(statistics(), "LIPCount"), "4294967295") << "one that is not reported";
    for (const auto& [identifier, property] : plain)
        set_value(PORT, "statistics", identifier, identifier);
    set_value(PORT, "statistics", "1030", "1073741824");
    set_value(PORT, "statistics", "1031", "9000000000");
    const host::Instance read = statistics();
    for (const auto& [identifier, property] : plain)
        EXPECT_EQ(text_of(read, property), identifier) << property;
    expect_properties(read, {{"BytesTransmitted", "4294967296"}, {"BytesReceived", "36000000000"}});

    // Two counters are copied only when the library reports them.
    set_value(PORT, "statistics", "1038", "4294967295");
    set_value(PORT, "statistics", "1033", "6");
    expect_properties(statistics(), {{"DumpedFrames", "1038"}, {"LIPCount", "6"}});
    const std::string time = text_of(statistics(), "StatisticTime");
    set_value(PORT, "statistics", "1033", "7");
    vlnsim_fault("AX_GetPortStatistics", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    expect_properties(statistics(), {{"LIPCount", "6"}, {"StatisticTime", time.c_str()}});
    vlnsim_clear_faults();
    EXPECT_NE(text_of(statistics(), "StatisticTime"), time);
}

} // namespace
