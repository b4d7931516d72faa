// What a client sees of FCoE ports: the ports, what they stand beside, and what changes on them.
#include "tests/road/properties.h"

#include <array>
#include <fstream>

using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;
using road::walk;

namespace {

constexpr std::uint64_t SECOND = 1000000;
constexpr const char* PORT = "100002564C000105";   // of two-port-cna
constexpr const char* PAIRED = "100002564C000001"; // of fcoe-pair
constexpr const char* ALONE = "100002564C010000";

std::string cards(const std::string& card) {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [)" + card + "]}";
}

TEST(FCoE, ThePort) {
    Road road;
    const auto ports = road.enumerate("VLNMPCA_FCPort");
    ASSERT_EQ(ports.size(), 2u);
    expect_properties(
        ports[1], {{"PortNumber", "1"},
                   {"Description", "VMC-2210"},
                   {"Name", PORT},
                   {"DeviceID", PORT},
                   {"PermanentAddress", PORT},
                   {"NetworkAddresses", "{100002564C000105}"},
                   {"ElementName", "Vorlan VMC-2210 port 1"},
                   {"UsageRestriction", "4"},
                   {"FCID", "65541"},
                   {"NumberOfDiscoveredPorts", "1"},
                   {"OperationalFirmware", "10.2.261.13"},
                   {"FabricName", "10:00:02:56:4c:fa:b0:01"},
                   {"Flags", "00000041"},
                   {"PortType", "10"},
                   {"OtherPortType", "N"},
                   {"OperationalStatus", "{2}"},
                   {"StatusDescriptions", "{OK}"},
                   {"SupportedCOS", "{3}"},
                   {"ActiveCOS", "{3}"},
                   {"SupportedFC4Types", "{5, 8, 32}"},
                   {"ActiveFC4Types", "{8, 32}"},
                   {"Speed", "10000000000"},
                   {"MaxSpeed", "10000000000"},
                   {"FunctionalPortSpeed", "10 Gbps"},
                   {"FunctionalQosBandwidth", "10 Gbps"},
                   {"PCIBusNumber", "16"},
                   {"Generation", "5"},
                   {"LinkTechnology", "4"},
                   {"DetailedStatus", "2"},
                   {"SupportedMaximumTransmissionUnit", "2048"},
                   {"ActiveMaximumTransmissionUnit", "2048"},
                   {"HWVersion", "7"},
                   {"IdentifyingDescriptions",
                    "{OS Device Name, VORLAN:IEEE_ADDRESS, NodeWWN, SerialNumber + Sub-AdapterID, "
                    "VPD:SERIAL_NUMBER, PhysicalPortNumber}"},
                   {"OtherIdentifyingInfo", "{/sys/class/scsi_host/host5, 02:56:4c:00:01:05, "
                                            "200002564C000105, VR10420117:00, VR10420117, 1}"}});
}

TEST(FCoE, AClientWalksFromThePortToAllThatBelongsToIt) {
    Road road;
    const host::Instance port = find(road, "VLNMPCA_FCPort", "DeviceID", PORT);
    const struct {
        const char* via;
        const char* property;
        std::vector<std::string> values;
    } rows[] = {
        {"VLNMPCA_FCPortConformsToProfile", "InstanceID", {"VLN:FCoE Initiator Ports"}},
        {"VLNMPCA_ElementStatisticalData", "ElementName", {std::string("VR10420117:") + PORT}},
        {"VLNMPCA_FCRealizes", "InstanceID", {"VR10420117:1"}},
        {"VLNMPCA_FCControlledBy", "DeviceID", {"VR10420117:1"}},
        {"VLNMPCA_FCConcreteIdentity", "DeviceID", {std::string(PORT) + ":0x2214"}},
        {"VLNMPCA_FCConcreteIdentity", "ElementName", {"Vorlan:FCOEAdapter5"}},
        {"VLNMPCA_FCPortSoftwareIdentity", "VersionString", {"10.2.261.13"}},
        {"VLNMPCA_DeviceSAPImplementation", "Name", {std::string("Initiator:") + PORT}},
        {"VLNMPCA_FCWWNServiceAffectsFCPort", "Name", {"VLNMPCA_FCWWNService"}},
        {"VLNMPCA_DriverServiceAffectsElement", "Name", {"VLNMPCA_DriverParameterService"}},
        {"VLNMPCA_HostedDependency", "DeviceID", {"100002564C000000", "100002564C000101"}},
        {"VLNMPCA_ElementPFCThrottle", "InstanceID", {}},
    };
    for (const auto& row : rows) {
        std::vector<std::string> values;
        for (const host::Instance& found : walk(road, port, row.via))
            values.push_back(text_of(found, row.property));
        EXPECT_EQ(values, row.values) << row.via;
    }
    EXPECT_EQ(road.enumerate("VLNMPCA_FCSystemDevice").size(), 2u);
    const auto firmware = road.enumerate("VLNMPCA_FCPortSoftwareIdentity");
    EXPECT_EQ(text_of(firmware.at(1), "ElementSoftwareStatus"), "{2, 3, 9}");
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_FCControlledBy").at(1), "AccessState"), "1");
    expect_properties(find(road, "VLNMPCA_SCSIProtocolInitiatorEndpoint", "Name",
                           std::string("Initiator:") + PORT),
                      {{"CreationClassName", "VLNMPCA_SCSIProtocolInitiatorEndpoint"},
                       {"ConnectionType", "18"},
                       {"ProtocolIFType", "56"},
                       {"Role", "2"},
                       {"RequestedState", "5"},
                       {"EnabledState", "5"},
                       {"OtherTypeDescription", "-"}});
}

TEST(FCoE, ServicesAndDriver) {
    Road road;
    expect_properties(road.enumerate("VLNMPCA_FCWWNService").at(0),
                      {{"Name", "VLNMPCA_FCWWNService"},
                       {"Description", "Vorlan FCOE FC WWN Management Service"},
                       {"StartMode", "Automatic"},
                       {"Started", "TRUE"},
                       {"EnabledState", "2"},
                       {"RequestedState", "2"},
                       {"EnabledDefault", "2"},
                       {"Status", "Ok"},
                       {"HealthState", "5"}});
    expect_properties(road.enumerate("VLNMPCA_DriverParameterService").at(0),
                      {{"Description", "Vorlan FCoE MPCA Set Driver Parameters Service"},
                       {"ElementName", "Vorlan FCoE MPCA Set Driver Parameters Service"},
                       {"EnabledState", "2"},
                       {"Status", "OK"}});
    for (const char* association :
         {"VLNMPCA_HostedFCWWNService", "VLNMPCA_FCWWNServiceAffectsSystem",
          "VLNMPCA_HostedDriverParameterService"})
        EXPECT_EQ(road.enumerate(association).size(), 1u) << association;
    const host::Instance driver = find(road, "VLNMPCA_SoftwareIdentity", "InstanceID",
                                       "VLN FCoE: Driver vlnfcoe v10.2.261.5");
    expect_properties(driver, {{"Description", "Vorlan FCoE Driver"},
                               {"ElementName", "vlnfcoe v10.2.261.5"},
                               {"ClassificationDescriptions", "{FCoE Driver}"}});
    EXPECT_EQ(walk(road, driver, "VLNMPCA_SoftwareConformsToProfile").size(), 1u);
    const auto references =
        road.manager().references(driver.path, {"VLNMPCA_InstalledSoftwareIdentity", "", "", ""});
    EXPECT_EQ(references.value.size(), 1u);
}

// Two cards of one model: the first port has an Ethernet function beside it, the second has none.
TEST(FCoE, APortWithoutAnEthernetPortStandsAlone) {
    Road road({.scenario = "fcoe-pair.json", .log = true});
    const auto ports = road.enumerate("VLNMPCA_FCPort");
    ASSERT_EQ(ports.size(), 2u);
    for (const char* via : {"VLNMPCA_FCControlledBy", "VLNMPCA_FCRealizes",
                            "VLNMPCA_HostedDependency", "VLNMPCA_FCPortSoftwareIdentity"}) {
        EXPECT_EQ(walk(road, ports[0], via).size(), 1u) << via;
        EXPECT_TRUE(walk(road, ports[1], via).empty()) << via;
    }
    EXPECT_EQ(walk(road, ports[1], "VLNMPCA_FCConcreteIdentity").size(), 1u);
    EXPECT_EQ(walk(road, ports[1], "VLNMPCA_DeviceSAPImplementation").size(), 1u);
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
        Road road({.scenario = cards(R"({"use": "cna", "functions": [{"use": "nic", )" +
                                     std::string(row.nic) + R"(}, {"use": "fcoe"}]})")});
        EXPECT_EQ(road.enumerate("VLNMPCA_FCPort").size(), 1u) << row.nic;
        EXPECT_EQ(road.enumerate("VLNMPCA_FCControlledBy").size(), row.controlled) << row.nic;
        EXPECT_EQ(road.enumerate("VLNMPCA_HostedDependency").size(), row.dependent) << row.nic;
    }
}

TEST(FCoE, ThePauseThrottleOfAModelAndOfAFirmware) {
    Road road({.scenario = "fcoe-pair.json"});
    expect_properties(find(road, "VLNMPCA_PFCThrottle", "ElementName", PAIRED),
                      {{"InstanceID", "VLN:100002564C000001"}, {"PFCThrottle", "enabled"}});
    expect_properties(find(road, "VLNMPCA_PFCThrottle", "ElementName", ALONE),
                      {{"InstanceID", "VLN:100002564C010000"}, {"PFCThrottle", "disabled"}});
    for (const host::Instance& setting : road.enumerate("VLNMPCA_ElementPFCThrottle"))
        EXPECT_EQ(text_of(setting, "IsCurrent"), "1");
    road.close();
    EXPECT_TRUE(Road().enumerate("VLNMPCA_PFCThrottle").empty());
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

TEST(FCoE, TheWayToTheConsoleStandsOnce) {
    const auto host = [](const char* gateway) {
        return cards(R"({"use": "cna", "count": 2, "functions": [{"use": "nic", "portAttributes":
                         {"GatewayAddress": )" +
                     std::string(gateway) + R"(}}, {"use": "fcoe"}]})");
    };
    Road road({.scenario = host("null")});
    std::ofstream(road.root() / "etc/vln_smis.conf") << "# console\nhttps://console.example/pv\n";
    const auto points = road.enumerate("VLNMPCA_RemoteServiceAccessPoint");
    ASSERT_EQ(points.size(), 1u);
    expect_properties(points[0], {{"Name", "Portvista WebLaunch URL"},
                                  {"ElementName", "Portvista"},
                                  {"Description", "VLN FCoE HBA:Portvista Management Interface"},
                                  {"AccessInfo", "https://console.example/pv"},
                                  {"InfoFormat", "200"},
                                  {"AccessContext", "1"},
                                  {"OtherInfoFormatDescription", "Netquill remote connection"}});
    EXPECT_EQ(road.enumerate("VLNMPCA_RemoteHostedAccessPoint").size(), 1u);
    const auto available = road.enumerate("VLNMPCA_SAPAvailableForElement");
    EXPECT_EQ(available.size(), road.enumerate("VLNMPCA_Card").size());
    EXPECT_FALSE(available.empty());
    road.close();

    Road unset({.scenario = host(R"("0.0.0.0")")});
    std::ofstream(unset.root() / "etc/vln_smis.conf") << "https://console.example/pv\r\n";
    const auto unhindered = unset.enumerate("VLNMPCA_RemoteServiceAccessPoint");
    ASSERT_EQ(unhindered.size(), 1u);
    EXPECT_EQ(text_of(unhindered[0], "AccessInfo"), "https://console.example/pv");
    unset.close();

    Road with_gateway({.scenario = host(R"("192.0.2.1")")});
    std::ofstream(with_gateway.root() / "etc/vln_smis.conf") << "https://console.example/pv\n";
    const auto gateways = with_gateway.enumerate("VLNMPCA_RemoteServiceAccessPoint");
    ASSERT_EQ(gateways.size(), 1u);
    EXPECT_EQ(text_of(gateways[0], "Name"), "192.0.2.1");
    EXPECT_TRUE(with_gateway.enumerate("VLNMPCA_SAPAvailableForElement").empty());
}

TEST(FCoE, StatisticsAreReadAtMostEveryTenSeconds) {
    Road road;
    const auto statistics = [&road] {
        return find(road, "VLNMPCA_FCPortStatistics", "InstanceID",
                    std::string("VLNMPCA :FC Statistics:") + PORT);
    };
    expect_properties(statistics(), {{"Description", "Statistics for the FCOE port."},
                                     {"LinkFailures", "1"},
                                     {"BytesTransmitted", "493824"},
                                     {"NOSCount", "-"}});
    set_value(PORT, "statistics", "LinkFailures", "8");
    set_value(PORT, "statistics", "NOSCount", "2");
    vlnsim_advance(10 * SECOND - 1);
    const unsigned long calls = vlnsim_calls("AX_GetPortStatistics");
    expect_properties(statistics(), {{"LinkFailures", "1"}, {"NOSCount", "-"}});
    EXPECT_EQ(vlnsim_calls("AX_GetPortStatistics"), calls);
    vlnsim_advance(1);
    expect_properties(statistics(), {{"LinkFailures", "8"}, {"NOSCount", "2"}});
}

// A client that asks for the instance by its name does not wait for an enumeration.
TEST(FCoE, StatisticsAreThereBeforeAnyEnumeration) {
    Road road;
    const auto found = walk(road, find(road, "VLNMPCA_FCPort", "DeviceID", PORT),
                            "VLNMPCA_ElementStatisticalData");
    ASSERT_EQ(found.size(), 1u);
    EXPECT_EQ(text_of(found[0], "LinkFailures"), "1");
}

TEST(FCoE, ThePortsStatusIsReadAtMostEveryTenSeconds) {
    Road road;
    const auto port = [&road] { return find(road, "VLNMPCA_FCPort", "DeviceID", PORT); };
    expect_properties(port(), {{"OperationalStatus", "{2}"}, {"Speed", "10000000000"}});
    set_value(PORT, "portAttributes", "PhysicalPortState", "22");
    set_value(PORT, "portAttributes", "FunctionalPortState", "6");
    set_value(PORT, "portAttributes", "PortType", "21");
    set_value(PORT, "portAttributes", "PortSpeed", "8");
    set_value(PORT, "portAttributes", "FuncPortSpeed", "\"4 Gbps\"");
    vlnsim_advance(10 * SECOND - 1);
    const unsigned long calls = vlnsim_calls("AX_GetPortAttributes");
    expect_properties(port(), {{"OperationalStatus", "{2}"}, {"Speed", "10000000000"}});
    EXPECT_EQ(vlnsim_calls("AX_GetPortAttributes"), calls);
    vlnsim_advance(1);
    expect_properties(port(), {{"OperationalStatus", "{32790}"},
                               {"StatusDescriptions", "{Disable}"},
                               {"DetailedStatus", "6"},
                               {"PortType", "1"},
                               {"OtherPortType", "Point to Point"},
                               {"Speed", "4000000000"},
                               {"FunctionalPortSpeed", "4 Gbps"}});
    expect_properties(find(road, "VLNMPCA_FCPort", "DeviceID", "100002564C000004"),
                      {{"OperationalStatus", "{2}"}, {"Speed", "10000000000"}});
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
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.missing);
        Road road({.log = true});
        find(road, "VLNMPCA_FCPort", "DeviceID", PORT);
        set_value(PORT, "portAttributes", "PhysicalPortState", "22");
        set_value(PORT, "portAttributes", "FunctionalPortState", "6");
        set_value(PORT, "portAttributes", "PortType", "21");
        set_value(PORT, "portAttributes", "PortSpeed", "8");
        set_value(PORT, "portAttributes", "PhysicalPortSpeed", "8");
        vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, row.missing);
        vlnsim_advance(10 * SECOND);
        expect_properties(find(road, "VLNMPCA_FCPort", "DeviceID", PORT),
                          {{"OperationalStatus", row.shown[0]},
                           {"DetailedStatus", row.shown[1]},
                           {"PortType", row.shown[2]},
                           {"Speed", row.shown[3]},
                           {"PhysicalPortSpeed", "10000000000"}});
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
