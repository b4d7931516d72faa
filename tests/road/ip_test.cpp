// What a client sees of the host's IP interfaces on the NIC ports.
#include "tests/road/properties.h"

using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

void set_port(const char* wwn, const char* name, const char* value) {
    char error[128] = "";
    EXPECT_EQ(vlnsim_set_value(wwn, "portAttributes", name, value, error, sizeof error), 0)
        << error;
}

constexpr char FIRST[] = "100002564C000000";

// The card without its iSCSI functions, whose stacks are their own.
constexpr char TWO_NICS[] = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "ports": 2, "functions": [{"use": "nic"}]}]})";

TEST(IP, AnEndpointForEachInterfaceWithAnAddress) {
    Road road({.scenario = TWO_NICS});
    const auto endpoints = road.enumerate("VLNMPCA_IPProtocolEndpoint");
    ASSERT_EQ(endpoints.size(), 2u);
    expect_properties(
        endpoints[0],
        {{"CreationClassName", "VLNMPCA_IPProtocolEndpoint"},
         {"SystemCreationClassName", "CIM_ComputerSystem"},
         {"Name", "IPv4_0_0_192.0.2.100_vln0p0"},
         {"Caption", "IPv4_<AdapterNumber>_<PortNumber>_<IPv4 Address>_<IPProtocolEndName>"},
         {"ElementName", "Vorlan IP Endpoint VR10420117:100002564C000000:vln0p0"},
         {"ProtocolIFType", "4096"},
         {"EnabledState", "2"},
         {"RequestedState", "2"},
         {"IPv4Address", "192.0.2.100"},
         {"SubnetMask", "255.255.255.0"},
         {"AddressOrigin", "3"},
         {"InterfaceName", "vln0p0"},
         {"GatewayAddress", "192.0.2.1"}});
    EXPECT_EQ(text_of(endpoints[1], "IPv4Address"), "192.0.2.101");

    const auto settings = road.enumerate("VLNMPCA_StaticIPAssignmentSettingData");
    ASSERT_EQ(settings.size(), 2u);
    expect_properties(
        settings[1], {{"InstanceID",
                       "Static IP AssignmentSettingData for Interface:VR10420117:100002564C000101"},
                      {"AddressOrigin", "3"},
                      {"IPv4Address", "192.0.2.101"},
                      {"SubnetMask", "255.255.255.0"},
                      {"GatewayIPv4Address", "192.0.2.1"}});
    const auto assignments = road.enumerate("VLNMPCA_IPAssignmentSettingData");
    ASSERT_EQ(assignments.size(), 2u);
    expect_properties(
        assignments[0],
        {{"InstanceID", "IP AssignmentSettingData for Interface:VR10420117:100002564C000000"},
         {"AddressOrigin", "2"}});
    const auto capabilities =
        road.enumerate("VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities");
    ASSERT_EQ(capabilities.size(), 2u);
    EXPECT_EQ(text_of(capabilities[0], "InstanceID"),
              "VLN:Enabled Logical IPProtocol Endpoint Capabilities for "
              "IPv4_0_0_192.0.2.100_vln0p0");
}

TEST(IP, PortsOfOneNetworkShareTheirGateway) {
    Road road({.scenario = TWO_NICS});
    const auto gateways = road.enumerate("VLNMPCA_RemoteServiceAccessPoint");
    ASSERT_EQ(gateways.size(), 1u);
    expect_properties(gateways[0], {{"Name", "192.0.2.1"},
                                    {"InstanceID", "Default Gateway Address"},
                                    {"AccessInfo", "192.0.2.1"},
                                    {"InfoFormat", "3"},
                                    {"AccessContext", "2"}});
    EXPECT_EQ(road.enumerate("VLNMPCA_RemoteHostedAccessPoint").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_RemoteAccessAvailableToElement").size(), 2u);
}

TEST(IP, WhatTheKernelSaysDecides) {
    Road road({.scenario = TWO_NICS, .log = true});
    set_port(FIRST, "FunctionalPortState", "6"); // the interface is down
    set_port(FIRST, "AddressOrigin", R"("DHCP")");
    set_port(FIRST, "SubnetMask", nullptr);
    set_port(FIRST, "GatewayAddress", nullptr);
    const auto endpoints = road.enumerate("VLNMPCA_IPProtocolEndpoint");
    ASSERT_EQ(endpoints.size(), 2u);
    expect_properties(endpoints[0], {{"EnabledState", "3"},
                                     {"RequestedState", "3"},
                                     {"SubnetMask", ""},
                                     {"AddressOrigin", "4"}});
    EXPECT_EQ(text_of(endpoints[1], "EnabledState"), "2");
    EXPECT_EQ(road.enumerate("VLNMPCA_RemoteAccessAvailableToElement").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_StaticIPAssignmentSettingData").size(), 2u);
    road.close();
    EXPECT_EQ(road.count_in_log("Failed to retrieve IPv4 Subnet for interface: [vln0p0]"), 1u);
}

// The port stays, and the service that could give it an address does too.
TEST(IP, InterfacesWithoutAnIPv4AddressAreLeftOut) {
    struct Row {
        const char* name;
        const char* value;
        const char* line;
    };
    const Row rows[] = {
        {"IPv4Address", nullptr, "Failed to retrieve IP AddressType for interface: [vln0p0]"},
        {"IPProtocolIFType", R"("IPv6")", "Failed to retrieve IP Address for interface: [vln0p0]"},
    };
    for (const Row& row : rows) {
        Road road({.scenario = TWO_NICS, .log = true});
        set_port(FIRST, row.name, row.value);
        const auto endpoints = road.enumerate("VLNMPCA_IPProtocolEndpoint");
        ASSERT_EQ(endpoints.size(), 1u) << row.name;
        EXPECT_EQ(text_of(endpoints[0], "InterfaceName"), "vln0p1");
        EXPECT_EQ(road.enumerate("VLNMPCA_LANEndpoint").size(), 2u);
        EXPECT_EQ(road.enumerate("VLNMPCA_BindsToLANEndpoint").size(), 1u);
        EXPECT_EQ(road.enumerate("VLNMPCA_HostedIPProtocolEndpoint").size(), 1u);
        EXPECT_EQ(road.enumerate("VLNMPCA_IPConfigurationService").size(), 1u);
        road.close();
        EXPECT_EQ(road.count_in_log(row.line), 1u) << row.name;
    }
}

} // namespace
