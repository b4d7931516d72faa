// What a client sees of iSCSI ports before they have a session.
#include "tests/road/properties.h"

using road::end_of;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

constexpr char FIRST[] = "100002564C000002";

// One card with two connectors, on each a NIC and an iSCSI function with these network properties.
std::string scenario(const std::string& network) {
    return R"({"include": ")" VLN_SCENARIOS
           R"(/parts/cna.json", "cards": [{"use": "cna", "ports": 2,
        "functions": [{"use": "nic"}, {"use": "iscsi", "network": )" +
           network + "}]}]}";
}

// The iSCSI ports of a host, behind those of its NICs.
std::vector<host::Instance> iscsi_ports(Road& road) {
    auto ports = road.enumerate("VLNMPCA_EthernetPort");
    std::erase_if(ports, [](const auto& port) { return text_of(port, "Name") != "iscsi"; });
    return ports;
}

host::Instance one_associated(Road& road, const host::ObjectPath& path, const char* association) {
    auto found = road.manager().associators(path, {association, "", "", ""}).value;
    EXPECT_EQ(found.size(), 1u) << association;
    return found.empty() ? host::Instance{} : found[0];
}

TEST(ISCSI, APortShowsWhatItsFunctionTells) {
    Road road;
    const auto ports = iscsi_ports(road);
    ASSERT_EQ(ports.size(), 2u);
    expect_properties(
        ports[0],
        {{"CreationClassName", "VLNMPCA_EthernetPort"},
         {"SystemCreationClassName", "CIM_ComputerSystem"},
         {"DeviceID", FIRST},
         {"ElementName", FIRST},
         {"PermanentAddress", "02564c000002"},
         {"FunctionalPortSpeed", "10 Gbps"},
         {"FunctionalQosBandwidth", "10 Gbps"},
         {"FunctionalQosMinBandwidth", "1 Gbps"},
         {"EnabledState", "2"},
         {"SRIOVState", "2"},
         {"LDTO", "30"},
         {"MaxCDBLength", "16"},
         {"OtherIdentifyingInfo", "{VR10420117:00, VR10420117:0, VR10420117, 0, NotSupported}"},
         {"IdentifyingDescriptions",
          "{SerialNumber + Sub-AdapterID, SerialNumber:PhysicalPortNumber, SerialNumber, "
          "PhysicalPortNumber, VirtualPortNumber}"}});
    EXPECT_EQ(text_of(ports[1], "DeviceID"), "100002564C000103");
}

// From the second port to what it shares with the NIC on its connector, and to what it does not.
TEST(ISCSI, APortStandsAmongItsSurroundings) {
    Road road;
    const host::ObjectPath port = iscsi_ports(road).at(1).path;
    const auto of_port = [&](const char* association) {
        return one_associated(road, port, association);
    };
    EXPECT_EQ(text_of(of_port("VLNMPCA_ControlledBy"), "DeviceID"), "VR10420117:1");
    EXPECT_EQ(text_of(of_port("VLNMPCA_Realizes"), "InstanceID"), "VR10420117:1");
    EXPECT_EQ(text_of(of_port("VLNMPCA_iSCSIPortConformsToProfile"), "RegisteredName"),
              "iSCSI Initiator Ports");
    expect_properties(
        of_port("VLNMPCA_ConcreteIdentity"),
        {{"DeviceID", "100002564C000103:0x2212"}, {"ElementName", "Vorlan:ISCSIAdapter3"}});
    const auto controller = of_port("VLNMPCA_ProtocolControllerForPort");
    EXPECT_EQ(text_of(controller, "ElementName"),
              "SCSI Protocol Controller:" + text_of(controller, "SystemName"));
    EXPECT_EQ(
        road.manager()
            .associator_names(controller.path, {"VLNMPCA_ProtocolControllerForPort", "", "", ""})
            .value.size(),
        2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_ControlledBy").size(), 4u);
    for (const auto& link : road.enumerate("VLNMPCA_ControlledBy"))
        EXPECT_EQ(text_of(link, "AccessState"), "1");
}

TEST(ISCSI, TheDriverIsAnIdentityOfItsOwnAndRunsThePortControllers) {
    Road road;
    std::size_t links = 0;
    for (const auto& link : road.enumerate("VLNMPCA_ElementSoftwareIdentity")) {
        if (end_of(link, "Antecedent", "InstanceID") != "VLN CNA: Driver vlniscsi v10.2.261.5")
            continue;
        ++links;
        const auto driver = road.manager().get(*link.property("Antecedent")->as_reference()).value;
        expect_properties(driver, {{"Description", "Vorlan CNA Driver"},
                                   {"ElementName", "vlniscsi v10.2.261.5"},
                                   {"Name", "vlniscsi v10.2.261.5"},
                                   {"ClassificationDescriptions", "{CNA iSCSI Driver}"}});
    }
    EXPECT_EQ(links, 2u);
}

// TCP on IP on the port, and the settings of its stack.
TEST(ISCSI, AnAddressBringsTheEndpoints) {
    Road road;
    const host::ObjectPath port = iscsi_ports(road).at(0).path;
    const auto ip = one_associated(road, port, "VLNMPCA_IPProtocolEndpointSAPImplementation");
    expect_properties(ip, {{"Name", "IPv4_2_0_198.51.100.12"},
                           {"Caption", "IPv4_<AdapterNumber>_<PortNumber>_<IPv4 Address>"},
                           {"ElementName", "IP Protocol Endpoint 100002564C000002"},
                           {"Description", "iSCSI"},
                           {"ProtocolIFType", "4096"},
                           {"IPv4Address", "198.51.100.12"},
                           {"SubnetMask", "255.255.255.0"},
                           {"GatewayAddress", "198.51.100.1"},
                           {"AddressOrigin", "3"},
                           {"VLANID", "20"},
                           {"EnabledState", "2"},
                           {"RequestedState", "12"}});
    expect_properties(one_associated(road, ip.path, "VLNMPCA_TCPBindsToIP"),
                      {{"ElementName", "VLN:TCP Endpoint:100002564C000002:3260"},
                       {"CreationClassName", "VLNMPCA_TCPProtocolEndpoint"},
                       {"PortNumber", "3260"}});
    expect_properties(
        one_associated(road, ip.path, "VLNMPCA_StaticIPProtocolEndpointIPAssignmentSettingData"),
        {{"IPv4Address", "198.51.100.12"},
         {"GatewayIPv4Address", "198.51.100.1"},
         {"VLANID", "20"}});
    EXPECT_EQ(
        text_of(one_associated(road, ip.path, "VLNMPCA_RemoteAccessAvailableToElement"), "Name"),
        "198.51.100.1");
    EXPECT_EQ(text_of(one_associated(road, ip.path, "VLNMPCA_IPConfigurationServiceAffectsElement"),
                      "Name"),
              "VLN:IP Configuration Service");
}

TEST(ISCSI, WithoutAnAddressThereIsThePortAndNothingThatSpeaksTCP) {
    for (const char* address : {"0.0.0.0", "::"}) {
        Road road(
            {.scenario = scenario(R"({"address": ")" + std::string(address) + "\"}"), .log = true});
        EXPECT_EQ(iscsi_ports(road).size(), 2u);
        EXPECT_EQ(road.enumerate("VLNMPCA_iSCSIPortConformsToProfile").size(), 2u);
        EXPECT_EQ(road.enumerate("VLNMPCA_PCIDevice").size(), 4u);
        EXPECT_EQ(road.enumerate("VLNMPCA_IPProtocolEndpoint").size(), 2u); // of the NICs
        for (const char* none : {"VLNMPCA_TCPProtocolEndpoint", "VLNMPCA_HostedTCPAccesspoint",
                                 "VLNMPCA_TCPBindsToIP", "VLNMPCA_HostedIPAccessPoint"})
            EXPECT_TRUE(road.enumerate(none).empty()) << none;
        road.close();
        EXPECT_EQ(road.count_in_log("ip not set skipping creating the instance"), 2u) << address;
    }
}

TEST(ISCSI, AnIPv6AddressIsShownAsOne) {
    Road road({.scenario = scenario(R"({"address": "2001:db8::7", "subnetMask": "ffff:ffff::",
        "gateway": "0.0.0.0", "dhcp": true})")});
    auto endpoints = road.enumerate("VLNMPCA_IPProtocolEndpoint");
    std::erase_if(endpoints, [](const auto& i) { return text_of(i, "Description") != "iSCSI"; });
    // The ports of the scenario have one address, and a port number of their own in the name.
    ASSERT_EQ(endpoints.size(), 2u);
    expect_properties(endpoints[0],
                      {{"ProtocolIFType", "4097"}, {"IPv4Address", "-"}, {"AddressOrigin", "4"}});
    EXPECT_TRUE(text_of(endpoints[0], "IPv6Address").starts_with("201:"))
        << text_of(endpoints[0], "IPv6Address");
}

// On a card that has no NIC function there is no connector and no controller to tie it to.
TEST(ISCSI, AFunctionWithoutANicBesideItHasItsPortAllTheSame) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "functions": [{"use": "nic"}]},
        {"use": "cna", "functions": [{"use": "iscsi"}], "serial": "S2",
         "wwpn": "100002564C020000", "mac": "02:56:4C:02:00:00"}]})",
               .log = true});
    EXPECT_EQ(iscsi_ports(road).size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_TCPProtocolEndpoint").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_PCIDevice").size(), 2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_ControlledBy").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_Realizes").size(), 1u);
    road.close();
    EXPECT_EQ(road.count_in_log("Wrong input for"), 0u);
}

TEST(ISCSI, WhatTheLibraryRefusesCostsThatPortAlone) {
    Road road({.scenario = "two-port-cna.json", .log = true});
    ASSERT_EQ(vlnsim_fault("AX_Ini_GetNetworkProperties", 1, VLNSIM_STATUS, 1), 0);
    ASSERT_EQ(vlnsim_fault("AX_DiagReadPCIRegistersV2", VLNSIM_EVERY, VLNSIM_STATUS, 1), 0);
    const auto ports = iscsi_ports(road);
    ASSERT_EQ(ports.size(), 1u);
    EXPECT_EQ(text_of(ports[0], "DeviceID"), "100002564C000103");
    EXPECT_EQ(road.enumerate("VLNMPCA_TCPBindsToIP").size(), 1u);
    EXPECT_TRUE(road.enumerate("VLNMPCA_PCIDevice").empty());
}

} // namespace
