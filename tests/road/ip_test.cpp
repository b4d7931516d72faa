// IP endpoints of NIC and iSCSI ports where they are not as on every host (shown/two-port-cna.md).
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::expect_counts;
using road::expect_lines;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

constexpr char FIRST[] = "100002564C000000";

// Two ports whose NICs alone have a stack, that of the kernel.
const std::string TWO_NICS = road::card(R"({"use": "nic"})", R"("ports": 2, )");

// The same with iSCSI functions of these network properties.
std::string iscsi(const std::string& network) {
    return road::card(R"({"use": "nic"}, {"use": "iscsi", "network": )" + network + "}",
                      R"("ports": 2, )");
}

void set_port(const char* name, const char* value) {
    road::set_value(FIRST, "portAttributes", name, value);
}

TEST(IP, WhatTheKernelSaysDecides) {
    Road road({.scenario = TWO_NICS, .log = true});
    set_port("FunctionalPortState", "6"); // the interface is down
    set_port("AddressOrigin", R"("DHCP")");
    set_port("SubnetMask", nullptr);
    set_port("GatewayAddress", nullptr);
    const auto endpoints = road.enumerate("VLNMPCA_IPProtocolEndpoint");
    ASSERT_EQ(endpoints.size(), 2u);
    expect_properties(endpoints[0], {{"EnabledState", "3"},
                                     {"RequestedState", "3"},
                                     {"SubnetMask", ""},
                                     {"AddressOrigin", "4"}});
    EXPECT_EQ(text_of(endpoints[1], "EnabledState"), "2");
    expect_counts(road, {{"VLNMPCA_RemoteAccessAvailableToElement", 1},
                         {"VLNMPCA_StaticIPAssignmentSettingData", 2}});
    expect_lines(road, {{"Failed to retrieve IPv4 Subnet for interface: [vln0p0]", 1}});
}

// The port stays, and the service that could give it an address does too.
TEST(IP, InterfacesWithoutAnIPv4AddressAreLeftOut) {
    const char* const rows[][3] = {
        {"IPv4Address", nullptr, "Failed to retrieve IP AddressType for interface: [vln0p0]"},
        {"IPProtocolIFType", R"("IPv6")", "Failed to retrieve IP Address for interface: [vln0p0]"},
    };
    for (const auto& [name, value, line] : rows) {
        SCOPED_TRACE(name);
        Road road({.scenario = TWO_NICS, .log = true});
        set_port(name, value);
        EXPECT_EQ(road::first(road, "VLNMPCA_IPProtocolEndpoint", "InterfaceName"), "vln0p1");
        expect_counts(road, {{"VLNMPCA_IPProtocolEndpoint", 1},
                             {"VLNMPCA_LANEndpoint", 2},
                             {"VLNMPCA_BindsToLANEndpoint", 1},
                             {"VLNMPCA_HostedIPProtocolEndpoint", 1},
                             {"VLNMPCA_IPConfigurationService", 1}});
        expect_lines(road, {{line, 1}});
    }
}

TEST(ISCSI, WithoutAnAddressThereIsThePortAndNothingThatSpeaksTCP) {
    for (const std::string address : {"0.0.0.0", "::"}) {
        SCOPED_TRACE(address);
        Road road({.scenario = iscsi(R"({"address": ")" + address + "\"}"), .log = true});
        expect_counts(road, {{"VLNMPCA_EthernetPort", 4},
                             {"VLNMPCA_iSCSIPortConformsToProfile", 2},
                             {"VLNMPCA_PCIDevice", 4},
                             {"VLNMPCA_IPProtocolEndpoint", 2}, // of the NICs
                             {"VLNMPCA_TCPProtocolEndpoint", 0},
                             {"VLNMPCA_HostedTCPAccesspoint", 0},
                             {"VLNMPCA_TCPBindsToIP", 0},
                             {"VLNMPCA_HostedIPAccessPoint", 0}});
        expect_lines(road, {{"ip not set skipping creating the instance", 2}});
    }
}

TEST(ISCSI, AnIPv6AddressIsShownAsOne) {
    Road road({.scenario = iscsi(R"({"address": "2001:db8::7", "subnetMask": "ffff:ffff::",
        "gateway": "0.0.0.0", "dhcp": true})")});
    const auto endpoint = road::find(road, "VLNMPCA_IPProtocolEndpoint", "Description", "iSCSI");
    expect_properties(endpoint,
                      {{"ProtocolIFType", "4097"}, {"IPv4Address", "-"}, {"AddressOrigin", "4"}});
    EXPECT_TRUE(text_of(endpoint, "IPv6Address").starts_with("201:"));
}

// On a card that has no NIC function there is no connector and no controller to tie it to.
TEST(ISCSI, AFunctionWithoutANicBesideItHasItsPortAllTheSame) {
    Road road({.scenario = road::cards(R"({"use": "cna", "functions": [{"use": "nic"}]},
        {"use": "cna", "functions": [{"use": "iscsi"}], "serial": "S2",
         "wwpn": "100002564C020000", "mac": "02:56:4C:02:00:00"})"),
               .log = true});
    expect_counts(road, {{"VLNMPCA_EthernetPort", 2},
                         {"VLNMPCA_TCPProtocolEndpoint", 1},
                         {"VLNMPCA_PCIDevice", 2},
                         {"VLNMPCA_ControlledBy", 1},
                         {"VLNMPCA_Realizes", 1}});
    expect_lines(road, {{"Wrong input for", 0}});
}

TEST(ISCSI, WhatTheLibraryRefusesCostsThatPortAlone) {
    Road road;
    vlnsim_fault("AX_Ini_GetNetworkProperties", 1, VLNSIM_STATUS, 1);
    vlnsim_fault("AX_DiagReadPCIRegistersV2", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    EXPECT_EQ(text_of(road::find(road, "VLNMPCA_EthernetPort", "Name", "iscsi"), "DeviceID"),
              "100002564C000103");
    expect_counts(
        road, {{"VLNMPCA_EthernetPort", 3}, {"VLNMPCA_TCPBindsToIP", 1}, {"VLNMPCA_PCIDevice", 0}});
}

} // namespace
