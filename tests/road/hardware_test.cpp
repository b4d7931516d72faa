// What a client sees of the hardware of a card: chips, PCI functions, vital product data,
// transceivers, and the VLANs of virtual NIC ports.
#include "tests/road/properties.h"

using road::end_of;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

// A host of one card, with these functions on each of two ports.
std::string card(const std::string& functions, const std::string& more = "") {
    return R"({"description": "A test", "include": ")" VLN_SCENARIOS R"(/parts/cna.json",
        "cards": [{"use": "cna", "ports": 2, )" +
           more + R"("functions": [)" + functions + "]}]}";
}

// Each object of the first port, also what tells its states by codes of the library.
TEST(Hardware, TheCardAndItsPorts) {
    Road road({.scenario = card(R"({"use": "nic"})", R"("subAdapter": 3, )")});
    constexpr const char* MODEL = "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter";
    const auto expect_first = [&road](const char* name,
                                      std::initializer_list<road::Property_Text> rows) {
        SCOPED_TRACE(name);
        expect_properties(road.enumerate(name).at(0), rows);
    };
    expect_first("VLNMPCA_Card", {{"Description", MODEL},
                                  {"ElementName", "VLN MPCA:VMC-2210:VR10420117"},
                                  {"Name", "Vorlan Ethernet Adapter VR10420117"},
                                  {"Tag", "0f4a2c117d3e4b529a0102564c000001"},
                                  {"CreationClassName", "VLNMPCA_Card"},
                                  {"Manufacturer", "Vorlan"},
                                  {"Model", "VMC-2210"},
                                  {"SerialNumber", "VR10420117"},
                                  {"SKU", "00VM221"},
                                  {"Version", "7"},
                                  {"PartNumber", "VMC-2210"},
                                  {"PackageType", "9"},
                                  {"HostingBoard", "FALSE"},
                                  {"VendorSpecID", "1453984283"},
                                  {"DeviceID", "8720"},
                                  {"ModelID", "2587"},
                                  {"BoardTemperature", "52"},
                                  {"VLNSerialNumber", "VR10420117"}});
    expect_first("VLNMPCA_FRUVitalProductData",
                 {{"InstanceID", "VR10420117"},
                  {"ElementName", "VLN MPCA FRU:VR10420117"},
                  {"ProductName", "Vorlan VMC-2210 Converged Network Adapter"},
                  {"SerialNumber", "VR10420117"},
                  {"PartNumber", "VMC-2210"},
                  {"Manufacturer", "Vorlan"},
                  {"Date", "1214"},
                  {"UUID", "0f4a2c117d3e4b529a0102564c000001"},
                  {"FRUNumber", "00VM221"},
                  {"FRUFirmwareDetail", "{V:10.2.261.13,D:03152014}"},
                  {"CardFunction", "64"},
                  {"RevisionID", "3"}});
    expect_first("VLNMPCA_Product", {{"Description", MODEL},
                                     {"Name", "VMC-2210"},
                                     {"IdentifyingNumber", "VR10420117"},
                                     {"Vendor", "Vorlan Corporation"},
                                     {"Version", "7"}});
    expect_first("VLNMPCA_PhysicalConnector",
                 {{"InstanceID", "VR10420117:0"},
                  {"ElementName", "VLN MPCA Port:VR10420117:Network Connector:0"},
                  {"Name", "100002564C000000"},
                  {"Tag", "100002564C000000"},
                  {"Model", "VMC-2210"},
                  {"SerialNumber", "VR10420117"},
                  {"OtherIdentifyingInfo", "LocalPhysicalPort:0,Transceiver:SFP"},
                  {"ConnectorLayout", "12"}});
    expect_first("VLNMPCA_LANEndpoint", {{"ElementName", "100002564C000000"},
                                         {"Name", "100002564C000000"},
                                         {"EnabledState", "2"},
                                         {"RequestedState", "12"},
                                         {"CreationClassName", "VLNMPCA_LANEndpoint"},
                                         {"NameFormat", "Ethernet"},
                                         {"ProtocolIFType", "6"},
                                         {"MACAddress", "02:56:4c:00:00:00"}});
    expect_first("VLNMPCA_EnabledLogicalElementCapabilities",
                 {{"InstanceID", "Capabilities:100002564C000000"},
                  {"ElementNameEditSupported", "FALSE"},
                  {"RequestedStatesSupported", "{2}"}});
    expect_first("VLNMPCA_PortController",
                 {{"ElementName", "VMC-2210:VR10420117:0"},
                  {"Name", "VMC-2210:VR10420117:0"},
                  {"DeviceID", "VR10420117:0"},
                  {"OperationalStatus", "{2}"},
                  {"StatusDescriptions", "{OK}"},
                  {"EnabledState", "5"},
                  {"RequestedState", "5"},
                  {"EnabledDefault", "2"},
                  {"Availability", "3"},
                  {"ProtocolSupported", "1"},
                  {"MaxNumberControlled", "1"},
                  {"ProtocolDescription", "Multiple Protocols FCoE+NIC,iSCSI+NIC,NIC"},
                  {"ControllerType", "2"},
                  {"SubAdapterId", "03"},
                  {"InterfaceType", "2"},
                  {"AutoNegSupportedSpeeds", ""},
                  {"ForceSupportedSpeeds", "1Gb,10Gb"},
                  {"PortSpeedMode", "2"},
                  {"ConfiguredPortSpeed", "10Gb"},
                  {"DACCableLength", "3"},
                  {"PhyLinkDownReason", "0"}});
}

TEST(Hardware, StatesFollowTheLibrary) {
    const struct {
        const char* state;
        const char* port_status;
        const char* port_enabled;
        const char* controller_status;
        const char* access;
    } rows[] = {
        {"0", "{0}", "1", "{0}", "2"},      {"1", "{0}", "0", "{0}", "1"},
        {"2", "{2}", "2", "{2}", "1"},      {"3", "{10}", "3", "{10}", "2"},
        {"4", "{1}", "1", "{1}", "2"},      {"5", "{11}", "7", "{11}", "2"},
        {"6", "{3}", "3", "{1}", "2"},      {"7", "{6}", "1", "{6}", "2"},
        {"8", "{32776}", "1", "{11}", "2"}, {"20", "{32788}", "1", "{0}", "2"},
        {"21", "{32789}", "3", "{0}", "2"}, {"22", "{32790}", "3", "{0}", "2"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.state);
        Road road({.scenario = card(R"({"use": "nic"})")});
        road::set_value("100002564C000000", "portAttributes", "FunctionalPortState", row.state);
        const auto first = [&road](const char* name, const char* property) {
            return text_of(road.enumerate(name).at(0), property);
        };
        EXPECT_EQ(first("VLNMPCA_EthernetPort", "OperationalStatus"), row.port_status);
        EXPECT_EQ(first("VLNMPCA_EthernetPort", "EnabledState"), row.port_enabled);
        EXPECT_EQ(first("VLNMPCA_LANEndpoint", "EnabledState"), row.port_enabled);
        EXPECT_EQ(first("VLNMPCA_PortController", "OperationalStatus"), row.controller_status);
        EXPECT_EQ(first("VLNMPCA_ControlledBy", "AccessState"), row.access);
    }
}

TEST(Hardware, NamesOfACardFollowWhatItsDataHold) {
    const struct {
        const char* vpd;
        const char* name;
    } rows[] = {
        {R"("MN": "Maker", "SN": "S1", "CF": 80)", "Maker Fibre Channel Adapter S1"},
        {R"("MN": "Maker", "SN": null, "CF": 96)", "Maker iSCSI Onboard Adapter 0"},
        {R"("MN": "Maker", "SN": "S1", "CF": 7)", "VMC-2210"},
        {R"("SN": "S1", "MN": null, "CF": 80)", "VMC-2210"},
    };
    for (const auto& row : rows) {
        Road road({.scenario = card(R"({"use": "nic", "vpd": {"UU": null, "FN": null, )" +
                                    std::string(row.vpd) + "}}")});
        expect_properties(road.enumerate("VLNMPCA_Card").at(0),
                          {{"Name", row.name}, {"Tag", "VR10420117"}, {"SKU", "-"}});
    }
}

// One UUID burnt into two cards must not cost the second card its place.
TEST(Hardware, CardsOfOneUuidStayApart) {
    Road road(
        {.scenario =
             card(R"({"use": "nic", "vpd": {"UU": {"bytes": "00000000000000000000000000000000"}}})",
                  R"("count": 2, )")});
    const auto cards = road.enumerate("VLNMPCA_Card");
    ASSERT_EQ(cards.size(), 2u);
    EXPECT_EQ(text_of(cards[0], "Tag"), "00000000000000000000000000000000");
    expect_properties(cards[1], {{"Tag", "VR10420118"}, {"SKU", "00VM222"}});
    EXPECT_EQ(road.enumerate("VLNMPCA_FRUElementVPD").size(), 2u);
}

TEST(Hardware, TheChipOfACard) {
    Road road({.scenario = card(R"({"use": "nic"})", R"("subAdapter": 3, )")});
    const auto chips = road.enumerate("VLNMPCA_Chip");
    ASSERT_EQ(chips.size(), 1u);
    expect_properties(
        chips[0], {{"CreationClassName", "VLNMPCA_Chip"},
                   {"Tag", "VR10420117:03"},
                   {"Name", "VR10420117:03"},
                   {"Manufacturer", "Vorlan Corporation"},
                   {"Model", "VMC-2210"},
                   {"SerialNumber", "VR10420117"},
                   {"SubAdapterId", "03"},
                   {"ElementName", "VLN MPCA ASIC:VMC-2210:VR10420117:03"},
                   {"BoardTemperature", "52"},
                   {"ThresholdCriticalTemp", "100"},
                   {"ThresholdWarningTemp", "90"},
                   {"TemperatureUnit", "Celsius"},
                   {"Description", "Vorlan VMC-2210 10Gb 2-port PCIe Converged Network Adapter"}});
    const auto held = road.enumerate("VLNMPCA_CardContainsChip");
    ASSERT_EQ(held.size(), 1u);
    EXPECT_EQ(end_of(held[0], "GroupComponent", "Tag"), "0f4a2c117d3e4b529a0102564c000001");
    EXPECT_EQ(end_of(held[0], "PartComponent", "Tag"), "VR10420117:03");
    const auto connected = road.enumerate("VLNMPCA_ConnectorDependsOnChip");
    ASSERT_EQ(connected.size(), 2u);
    EXPECT_EQ(end_of(connected[1], "Antecedent", "Tag"), "100002564C000101");
    EXPECT_EQ(end_of(connected[1], "Dependent", "Tag"), "VR10420117:03");
}

TEST(Hardware, SubAdaptersOfOneCardAreChipsOfTheirOwn) {
    Road road(
        {.scenario = card(R"({"use": "nic", "subAdapter": 1}, {"use": "nic", "subAdapter": 2})")});
    EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 1u);
    const auto chips = road.enumerate("VLNMPCA_Chip");
    ASSERT_EQ(chips.size(), 2u);
    EXPECT_EQ(text_of(chips[0], "Tag"), "VR10420117:01");
    EXPECT_EQ(text_of(chips[1], "Tag"), "VR10420117:02");
    EXPECT_EQ(road.enumerate("VLNMPCA_CardContainsChip").size(), 2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_ConnectorDependsOnChip").size(), 4u);
}

// Whatever its first function fails to tell, another one does; and none of it comes too late for
// what refers to the card.
TEST(Hardware, ACardIsKnownThroughAnyOfItsFunctions) {
    const char* second_alone = R"("vpd": {"UU": null, "FN": null})";
    const struct {
        const char* first;
        std::uint64_t status; // of the first function's calls
        const char* asics;
    } rows[] = {
        {R"("driverType": 1)", 0, "{VR10420117:01, VR10420117:02}"},
        {R"("driverType": 1)", 190, "{VR10420117:02}"},
        {second_alone, 0, "{VR10420117:01, VR10420117:02}"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.first + std::to_string(row.status));
        Road road({.scenario = card(R"({"use": "nic", "subAdapter": 1, )" + std::string(row.first) +
                                    R"(}, {"use": "nic", "subAdapter": 2})"),
                   .log = true});
        for (unsigned call : {1u, 2u}) // on both physical ports
            if (row.status != 0)
                vlnsim_fault("AX_GetVPDV2", call, VLNSIM_STATUS, row.status);
        const auto cards = road.enumerate("VLNMPCA_Card");
        ASSERT_EQ(cards.size(), 1u);
        const std::string tag = "0f4a2c117d3e4b529a0102564c000001";
        expect_properties(cards[0], {{"Tag", tag.c_str()}, {"SKU", "00VM221"}});
        const auto data = road.enumerate("VLNMPCA_FRUVitalProductData");
        ASSERT_EQ(data.size(), 1u);
        EXPECT_EQ(text_of(data[0], "ASICId"), row.asics);
        const auto told = road.enumerate("VLNMPCA_FRUElementVPD");
        ASSERT_EQ(told.size(), 1u);
        EXPECT_EQ(end_of(told[0], "ManagedElement", "Tag"), tag);
        const auto parts = road.enumerate("VLNMPCA_ProductPhysicalComponent");
        ASSERT_EQ(parts.size(), 1u);
        EXPECT_EQ(end_of(parts[0], "PartComponent", "Tag"), tag);
        road.close();
        EXPECT_EQ(road.faults_in_log(), "");
    }
}

TEST(Hardware, ThePCIFunctionOfAPort) {
    Road road({.scenario = card(R"({"use": "nic"})")});
    const auto devices = road.enumerate("VLNMPCA_PCIDevice");
    ASSERT_EQ(devices.size(), 2u);
    expect_properties(devices[0], {{"SystemCreationClassName", "CIM_ComputerSystem"},
                                   {"CreationClassName", "VLNMPCA_PCIDevice"},
                                   {"DeviceID", "0:0:0x2210"},
                                   {"ElementName", "Vorlan:NICAdapter0"},
                                   {"EnabledState", "5"},
                                   {"RequestedState", "5"},
                                   {"PrimaryStatus", "5"},
                                   {"HealthState", "5"},
                                   {"FunctionNumber", "0"},
                                   {"BusNumber", "16"},
                                   {"VendorID", "22186"},
                                   {"PCIDeviceID", "8720"},
                                   {"Command", "326"},
                                   {"PCIStatus", "16"},
                                   {"RevisionID", "3"},
                                   {"BaseClass", "2"},
                                   {"BaseAddresses0", "2449473536"},
                                   {"BaseAddresses2", "0"},
                                   {"BaseAddresses3", "2449735684"},
                                   {"BaseAddress", "{2449473536, 2449604612, 0, 2449735684, 0, 0}"},
                                   {"SubVendorID", "22186"},
                                   {"SubsystemID", "66"},
                                   {"InterruptPin", "1"},
                                   {"PCIEDeviceLinkCap", "4422786"},
                                   {"PCIEDeviceLinkStatusCtrl", "276955200"},
                                   {"VPDData", "{0, 0, 0, 0}"}});
    EXPECT_EQ(text_of(devices[1], "FunctionNumber"), "1");
    const auto identities = road.enumerate("VLNMPCA_ConcreteIdentity");
    ASSERT_EQ(identities.size(), 2u);
    EXPECT_EQ(end_of(identities[1], "SystemElement", "DeviceID"), "100002564C000101");
    EXPECT_EQ(end_of(identities[1], "SameElement", "DeviceID"), text_of(devices[1], "DeviceID"));
    EXPECT_EQ(road.enumerate("VLNMPCA_SystemDevice").size(), 2u);
    const auto conforming = road.enumerate("VLNMPCA_PCIElementConformsToProfile");
    ASSERT_EQ(conforming.size(), 2u);
    EXPECT_EQ(end_of(conforming[0], "ConformantStandard", "InstanceID"), "VLN:PCI Device");
}

TEST(Hardware, VitalProductDataOfACard) {
    Road road({.scenario = card(R"({"use": "nic", "vpd": {"ZZ": "nobody's", "PA": "Adapter",
        "FN": "0123456789ABCDEF more", "CF": 80, "RI": 254,
        "FW": "V:10.2.261.13-very-long,x,D:03152014"}})")});
    const auto data = road.enumerate("VLNMPCA_FRUVitalProductData");
    ASSERT_EQ(data.size(), 1u);
    expect_properties(data[0], {{"InstanceID", "VR10420117"},
                                {"ProductName", "Adapter"},
                                {"SerialNumber", "VR10420117"},
                                {"PartNumber", "VMC-2210"},
                                {"Manufacturer", "Vorlan"},
                                {"Date", "1214"},
                                {"UUID", "0f4a2c117d3e4b529a0102564c000001"},
                                {"FRUNumber", "0123456789ABCDEF"},
                                {"FRUFirmwareDetail", "{V:10.2.261.13-very-long,x,D:03152014}"},
                                {"CardFunction", "80"},
                                {"RevisionID", "254"}});
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_Card").at(0), "Name"),
              "Vorlan Fibre Channel Adapter VR10420117");
    std::size_t firmware = 0;
    for (const auto& software : road.enumerate("VLNMPCA_SoftwareIdentity"))
        if (text_of(software, "VersionString") == "10.2.261.13-very") {
            ++firmware;
            EXPECT_EQ(text_of(software, "ReleaseDate").substr(1, 8), "20140315");
            EXPECT_TRUE(text_of(software, "Name").ends_with(" Firmware"));
        }
    EXPECT_EQ(firmware, 1u);
}

TEST(Hardware, VitalProductDataOfAPort) {
    Road road({.scenario = card(R"({"use": "nic", "pciVpd": {"PA": "Adapter", "PN": "VMC-2210",
        "CP": {"bytes": "1001"}, "ZZ": "own", "V5": "five", "V0": "", "YA": "Slot 9"}})")});
    const auto data = road.enumerate("VLNMPCA_VitalProductData");
    ASSERT_EQ(data.size(), 2u);
    expect_properties(data[0], {{"InstanceID", "VLN MPCA VPD:100002564C000000"},
                                {"ElementName", "VLN MPCA VPD:100002564C000000"},
                                {"ProductName", "Adapter"},
                                {"PartNumber", "VMC-2210"},
                                {"ExtCapability", "??"},
                                {"VPDW", "Slot 9"},
                                {"FieldV0", ""},
                                {"FieldV5", "five"},
                                {"FieldV1", "-"}});
    // Every keyword, also one of its own, in the adapter's order.
    EXPECT_EQ(text_of(data[0], "VPDTags"), "{PN, EC, SN, MN, V0, VB, YA, PA, CP, ZZ, V5}");
    EXPECT_EQ(text_of(data[0], "VPDTagValues"),
              "{VMC-2210, A2, VR10420117, VLN, , 10.2.261.8, Slot 9, Adapter, ??, own, five}");
    const auto links = road.enumerate("VLNMPCA_ElementVPD");
    ASSERT_EQ(links.size(), 2u);
    EXPECT_EQ(end_of(links[1], "SettingData", "InstanceID"), "VLN MPCA VPD:100002564C000101");
}

// What can't be read is left out alone.
TEST(Hardware, UnreadableHardwareCostsItsOwnInstances) {
    Road road({.scenario = card(R"({"use": "nic"})"), .log = true});
    ASSERT_EQ(vlnsim_fault("AX_DiagReadPCIRegistersV2", 1, VLNSIM_STATUS, 1), 0);
    ASSERT_EQ(vlnsim_fault("AX_GetVPD", 1, VLNSIM_STATUS, 190), 0);
    ASSERT_EQ(vlnsim_fault("AX_GetSffData", 2, VLNSIM_STATUS, 251), 0);
    ASSERT_EQ(vlnsim_fault("AX_DiagBeaconState", 1, VLNSIM_STATUS, 63), 0); // not supported
    ASSERT_EQ(vlnsim_fault("AX_DiagBeaconState", 2, VLNSIM_STATUS, 1), 0);
    const auto census = road.census();
    const auto count = [&](const char* name) {
        const auto it = census.find(name);
        return it == census.end() ? 0 : it->second;
    };
    EXPECT_EQ(count("VLNMPCA_EthernetPort"), 2u);
    EXPECT_EQ(count("VLNMPCA_LANEndpoint"), 2u);
    EXPECT_EQ(count("VLNMPCA_PortController"), 2u);
    EXPECT_EQ(count("VLNMPCA_PCIDevice"), 1u); // of the second port, whose data don't come
    EXPECT_EQ(count("VLNMPCA_ConcreteIdentity"), 1u);
    EXPECT_EQ(count("VLNMPCA_VitalProductData"), 0u);
    EXPECT_EQ(count("VLNMPCA_ElementVPD"), 0u);
    EXPECT_EQ(count("VLNMPCA_Transceiver"), 1u);
    EXPECT_EQ(count("VLNMPCA_TransceiverComponent"), 1u);
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    EXPECT_EQ(text_of(ports.at(0), "LocationIndicator"), "4");
    EXPECT_EQ(text_of(ports.at(1), "LocationIndicator"), "-");
    road.close();
    EXPECT_EQ(road.count_in_log("AX_DiagReadPCIRegistersV2 call failed"), 1u);
    EXPECT_EQ(road.count_in_log("NIC port 100002564C000101 CreateVPD failed"), 1u);
    EXPECT_EQ(road.count_in_log("PERF: updateAdapterMaps: cleanExit"), 1u);
}

TEST(Hardware, TheTransceiverOfAPort) {
    Road road({.scenario = card(R"({"use": "nic"}, {"use": "nic"})")}); // two functions a port
    const auto transceivers = road.enumerate("VLNMPCA_Transceiver");
    ASSERT_EQ(transceivers.size(), 2u);
    expect_properties(transceivers[1], {{"Tag", "VR10420117:1"},
                                        {"CreationClassName", "VLNMPCA_Transceiver"},
                                        {"ElementName", "VLN MPCA Transceiver:VR10420117:1"},
                                        {"Manufacturer", "VORLAN"},
                                        {"PartNumber", "VLN-SFP-10G-SR"},
                                        {"Version", "A"},
                                        {"SerialNumber", "VS00040001"},
                                        {"OUI", "00-17-6A"},
                                        {"Identifier", "3"},
                                        {"ExtIdentifier", "4"},
                                        {"Connector", "7"},
                                        {"WaveLength", "850"},
                                        {"Temperature", "31.5"},
                                        {"TemperatureUnit", "Celsius"},
                                        {"TxBiasCurrent", "8.0"},
                                        {"TxPower", "0.5"},
                                        {"RxPower", "0.25"},
                                        {"SFPStatus", "0"},
                                        {"TemperatureHighAlarm", "75.0"},
                                        {"TemperatureLowAlarm", "-5.0"},
                                        {"TemperatureLowWarning", "0.0"},
                                        {"VoltageLowAlarm", "3.0"},
                                        {"VoltageHighWarning", "3.5"},
                                        {"CurrentHighAlarm", "15.0"},
                                        {"CurrentLowWarning", "6.0"},
                                        {"RxPowerHighAlarm", "1.0"}});
    EXPECT_EQ(text_of(transceivers[1], "ManufactureDate").substr(1, 8), "20140315");
    const auto links = road.enumerate("VLNMPCA_TransceiverComponent");
    ASSERT_EQ(links.size(), 2u);
    EXPECT_EQ(end_of(links[1], "GroupComponent", "DeviceID"), "VR10420117:1");
    EXPECT_EQ(end_of(links[1], "PartComponent", "Tag"), "VR10420117:1");
}

TEST(Hardware, VirtualPortsHaveAVLAN) {
    Road road({.scenario = card(
                   R"({"use": "nic", "portAttributes": {"vNICEnabledState": 1, "VNICName": "left",
                      "vNICOuterVLANId": 117, "VNICMinBandwidth": "1 Gbps",
                      "VNICMaxBandwidth": "5 Gbps"}}, {"use": "nic"})")});
    const auto endpoints = road.enumerate("VLNMPCA_VLANEndpoint");
    ASSERT_EQ(endpoints.size(), 2u); // of four functions two
    expect_properties(endpoints[0], {{"ElementName", "VLAN Endpoint:100002564C000000"},
                                     {"Name", "VR10420117:100002564C000000"},
                                     {"Description", "left"},
                                     {"SystemCreationClassName", "CIM_ComputerSystem"},
                                     {"CreationClassName", "VLNMPCA_VLANEndpoint"},
                                     {"ProtocolType", "1"},
                                     {"OtherTypeDescription", "vNIC"},
                                     {"ProtocolIFType", "6"},
                                     {"RequestedState", "12"},
                                     {"EnabledState", "2"},
                                     {"MACAddress", "02:56:4c:00:00:00"}});
    const auto settings = road.enumerate("VLNMPCA_VLANEndpointSettingData");
    ASSERT_EQ(settings.size(), 2u);
    expect_properties(
        settings[0],
        {{"InstanceID", "VLN:VLANEndpointSettingData MPCA:VR10420117:VNIC:left:100002564C000000"},
         {"Description", "VLAN EndpointSettingData:100002564C000000"},
         {"ElementName", "VLN:FCoE Driver Parameter:"},
         {"AccessVLAN", "117"},
         {"MinimumBandwidth", "1 Gbps"},
         {"MaximumBandwidth", "5 Gbps"}});
    const auto identities = road.enumerate("VLNMPCA_VLANEndPointidentity");
    ASSERT_EQ(identities.size(), 2u);
    EXPECT_EQ(end_of(identities[0], "SystemElement", "Name"), "100002564C000000");
    EXPECT_EQ(end_of(identities[0], "SameElement", "Name"), "VR10420117:100002564C000000");
    EXPECT_EQ(road.enumerate("VLNMPCA_HostedVLANEndpoint").size(), 2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_VLANSettingData").size(), 2u);
}

} // namespace
