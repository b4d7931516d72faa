// What becomes of the hardware of a card where it is not as on every host: states, names, vital
// product data, what can't be read. How a whole card is shown stands in shown/two-port-cna.md.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::end_of;
using road::expect_properties;
using road::first;
using road::Road;
using road::text_of;

namespace {

// A card with these functions on each of two ports.
std::string card(const std::string& functions, const std::string& more = "") {
    return road::card(functions, R"("ports": 2, )" + more);
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
        EXPECT_EQ(first(road, "VLNMPCA_EthernetPort", "OperationalStatus"), row.port_status);
        EXPECT_EQ(first(road, "VLNMPCA_EthernetPort", "EnabledState"), row.port_enabled);
        EXPECT_EQ(first(road, "VLNMPCA_LANEndpoint", "EnabledState"), row.port_enabled);
        EXPECT_EQ(first(road, "VLNMPCA_PortController", "OperationalStatus"),
                  row.controller_status);
        EXPECT_EQ(first(road, "VLNMPCA_ControlledBy", "AccessState"), row.access);
    }
}

TEST(Hardware, NamesOfACardFollowWhatItsDataHold) {
    const std::pair<const char*, const char*> rows[] = {
        {R"("MN": "Maker", "SN": "S1", "CF": 80)", "Maker Fibre Channel Adapter S1"},
        {R"("MN": "Maker", "SN": null, "CF": 96)", "Maker iSCSI Onboard Adapter 0"},
        {R"("MN": "Maker", "SN": "S1", "CF": 7)", "VMC-2210"},
        {R"("SN": "S1", "MN": null, "CF": 80)", "VMC-2210"},
    };
    for (const auto& [vpd, name] : rows) {
        Road road({.scenario = card(R"({"use": "nic", "vpd": {"UU": null, "FN": null, )" +
                                    std::string(vpd) + "}}")});
        expect_properties(road.enumerate("VLNMPCA_Card").at(0),
                          {{"Name", name}, {"Tag", "VR10420117"}, {"SKU", "-"}});
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

// Whatever its first function fails to tell, another one does; and none of it comes too late for
// what refers to the card.
TEST(Hardware, ACardIsKnownThroughAnyOfItsFunctions) {
    const struct {
        const char* first;
        std::uint64_t status; // of the first function's calls
        const char* asics;
    } rows[] = {
        {R"("driverType": 1)", 0, "{VR10420117:01, VR10420117:02}"},
        {R"("driverType": 1)", 190, "{VR10420117:02}"},
        {R"("vpd": {"UU": null, "FN": null})", 0, "{VR10420117:01, VR10420117:02}"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.first + std::to_string(row.status));
        Road road({.scenario = card(R"({"use": "nic", "subAdapter": 1, )" + std::string(row.first) +
                                    R"(}, {"use": "nic", "subAdapter": 2})"),
                   .log = true});
        for (unsigned call : {1u, 2u}) // on both physical ports
            if (row.status != 0)
                vlnsim_fault("AX_GetVPDV2", call, VLNSIM_STATUS, row.status);
        const auto only = [&road](const char* name) {
            const auto instances = road.enumerate(name);
            EXPECT_EQ(instances.size(), 1u) << name;
            return instances.at(0);
        };
        const std::string tag = "0f4a2c117d3e4b529a0102564c000001";
        expect_properties(only("VLNMPCA_Card"), {{"Tag", tag.c_str()}, {"SKU", "00VM221"}});
        EXPECT_EQ(text_of(only("VLNMPCA_FRUVitalProductData"), "ASICId"), row.asics);
        EXPECT_EQ(end_of(only("VLNMPCA_FRUElementVPD"), "ManagedElement", "Tag"), tag);
        EXPECT_EQ(end_of(only("VLNMPCA_ProductPhysicalComponent"), "PartComponent", "Tag"), tag);
        const auto chips = road.enumerate("VLNMPCA_CardContainsChip");
        ASSERT_EQ(chips.size(), 2u) << "sub-adapters are chips of their own";
        EXPECT_EQ(end_of(chips[1], "PartComponent", "Tag"), "VR10420117:02");
        road.close();
        EXPECT_EQ(road.faults_in_log(), "");
    }
}

TEST(Hardware, WhatAPortTakesAndShowsToTheEye) {
    const struct {
        const char* function;
        const char* connector;
        const char* light;
    } rows[] = {
        {R"("adapterAttributes": {"PortConnectionType": 1}, "beacon": 3)",
         "LocalPhysicalPort:0,Transceiver:SFP", "2"},
        {R"("adapterAttributes": {"PortConnectionType": 2}, "beacon": 2)",
         "LocalPhysicalPort:0,Transceiver:10GBaseT", "3"},
        {R"("adapterAttributes": {"PortConnectionType": 3}, "beacon": null)", "LocalPhysicalPort:0",
         "-"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.function);
        Road road({.scenario = card(R"({"use": "nic", )" + std::string(row.function) + "}")});
        EXPECT_EQ(first(road, "VLNMPCA_PhysicalConnector", "OtherIdentifyingInfo"), row.connector);
        EXPECT_EQ(first(road, "VLNMPCA_EthernetPort", "LocationIndicator"), row.light);
    }
}

// A module that does not measure itself is shown by its name plate.
TEST(Hardware, AModuleWithoutDiagnosticsHasNoReadings) {
    Road road({.scenario = card(R"({"use": "nic", "sff": {"a0": {
        "0": {"bytes": "03 04 07"}, "20": "VORLAN          ", "92": {"bytes": "00"}}, "a2": "FF"}})")});
    expect_properties(road.enumerate("VLNMPCA_Transceiver").at(0),
                      {{"Manufacturer", "VORLAN"},
                       {"SFPStatus", "-"},
                       {"TemperatureUnit", "-"}});
}

TEST(Hardware, VitalProductDataOfACard) {
    Road road({.scenario = card(R"({"use": "nic", "vpd": {"ZZ": "nobody's", "PA": "Adapter",
        "FN": "0123456789ABCDEF more", "CF": 80, "RI": 254,
        "FW": "V:10.2.261.13-very-long,x,D:03152014"}})")});
    expect_properties(road.enumerate("VLNMPCA_FRUVitalProductData").at(0),
                      {{"ProductName", "Adapter"},
                       {"FRUNumber", "0123456789ABCDEF"},
                       {"FRUFirmwareDetail", "{V:10.2.261.13-very-long,x,D:03152014}"},
                       {"CardFunction", "80"},
                       {"RevisionID", "254"}});
    const host::Instance firmware =
        road::find(road, "VLNMPCA_SoftwareIdentity", "VersionString", "10.2.261.13-very");
    EXPECT_EQ(text_of(firmware, "ReleaseDate").substr(1, 8), "20140315");
    EXPECT_TRUE(text_of(firmware, "Name").ends_with(" Firmware"));
}

// Every keyword, also one of its own, in the adapter's order.
TEST(Hardware, VitalProductDataOfAPort) {
    Road road({.scenario = card(R"({"use": "nic", "pciVpd": {"PA": "Adapter", "PN": "VMC-2210",
        "CP": {"bytes": "1001"}, "ZZ": "own", "V5": "five", "V0": "", "YA": "Slot 9"}})")});
    expect_properties(
        road.enumerate("VLNMPCA_VitalProductData").at(0),
        {{"ProductName", "Adapter"},
         {"ExtCapability", "??"},
         {"VPDW", "Slot 9"},
         {"FieldV0", ""},
         {"FieldV5", "five"},
         {"FieldV1", "-"},
         {"VPDTags", "{PN, EC, SN, MN, V0, VB, YA, PA, CP, ZZ, V5}"},
         {"VPDTagValues",
          "{VMC-2210, A2, VR10420117, VLN, , 10.2.261.8, Slot 9, Adapter, ??, own, five}"}});
}

// What can't be read is left out alone.
TEST(Hardware, UnreadableHardwareCostsItsOwnInstances) {
    Road road({.scenario = card(R"({"use": "nic"})"), .log = true});
    ASSERT_EQ(vlnsim_fault("AX_DiagReadPCIRegistersV2", 1, VLNSIM_STATUS, 1), 0);
    ASSERT_EQ(vlnsim_fault("AX_GetVPD", 1, VLNSIM_STATUS, 190), 0);
    ASSERT_EQ(vlnsim_fault("AX_GetSffData", 2, VLNSIM_STATUS, 251), 0);
    ASSERT_EQ(vlnsim_fault("AX_DiagBeaconState", 1, VLNSIM_STATUS, 63), 0); // not supported
    ASSERT_EQ(vlnsim_fault("AX_DiagBeaconState", 2, VLNSIM_STATUS, 1), 0);
    const std::pair<const char*, std::size_t> counts[] = {
        {"VLNMPCA_EthernetPort", 2},
        {"VLNMPCA_LANEndpoint", 2},
        {"VLNMPCA_PortController", 2},
        {"VLNMPCA_PCIDevice", 1}, // of the second port, whose data don't come
        {"VLNMPCA_ConcreteIdentity", 1},
        {"VLNMPCA_VitalProductData", 0},
        {"VLNMPCA_ElementVPD", 0},
        {"VLNMPCA_Transceiver", 1},
        {"VLNMPCA_TransceiverComponent", 1},
    };
    for (const auto& [name, count] : counts)
        EXPECT_EQ(road.enumerate(name).size(), count) << name;
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    EXPECT_EQ(text_of(ports.at(0), "LocationIndicator"), "4");
    EXPECT_EQ(text_of(ports.at(1), "LocationIndicator"), "-");
    road.close();
    EXPECT_EQ(road.count_in_log("AX_DiagReadPCIRegistersV2 call failed"), 1u);
    EXPECT_EQ(road.count_in_log("NIC port 100002564C000101 CreateVPD failed"), 1u);
    EXPECT_EQ(road.count_in_log("PERF: updateAdapterMaps: cleanExit"), 1u);
}

} // namespace
