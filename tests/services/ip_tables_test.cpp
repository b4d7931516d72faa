// The ARP and route tables of iSCSI ports and the static settings of their endpoints, as a client
// reads and changes them.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using host::Instance;
using host::Named_Values;
using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::Fault;

namespace {

constexpr const char* MAC = "02564c000002"; // of the first iSCSI port
constexpr const char* OTHER_MAC = "02564c000103";
constexpr const char* NIC_MAC = "02564c000000";

struct Row {
    std::vector<const char*> values; // of the properties, in the order of the class's names
    CMPIrc status;
    const char* line = "";
    Fault fault = {};
};

class IP_Tables : public testing::Test {
protected:
    Road road{{.log = true}};

    Instance entry(const std::vector<const char*>& names, const std::vector<const char*>& values) {
        Instance instance;
        instance.path.class_name =
            names[1] == std::string("DesMACAddress") ? "VLNMPCA_ARPEntry" : "VLNMPCA_RouteEntry";
        for (std::size_t i = 0; i < values.size(); ++i)
            if (values[i])
                host::set(instance.properties, names[i], Value::text(values[i]));
        return instance;
    }

    template <class Call>
    void expect(const Row& row, Call call) {
        if (row.fault.function)
            vlnsim_fault(row.fault.function, 1, VLNSIM_STATUS, row.fault.status);
        const std::size_t before = road.log_text().size();
        EXPECT_EQ(call(), row.status) << row.line;
        EXPECT_NE(road.log_text().find(row.line, before), std::string::npos) << row.line;
        vlnsim_clear_faults();
    }
    void expect_creations(const std::vector<const char*>& names, std::initializer_list<Row> rows) {
        for (const Row& row : rows)
            expect(row, [&] { return road.manager().create(entry(names, row.values)).status.rc; });
    }

    const std::vector<const char*> arp = {"MACAddress", "DesMACAddress", "DesIPAddress"};
    const std::vector<const char*> route = {"MACAddress", "Destination", "SubnetMask", "Gateway"};
};

TEST_F(IP_Tables, AreShownWithTheirPorts) {
    expect_properties(
        road.enumerate("VLNMPCA_ARPTable").at(1),
        {{"MACAddress", OTHER_MAC}, {"InstanceID", "VLN: MPCA iSCSI ARP Table02564c000103"}});
    expect_properties(road.enumerate("VLNMPCA_RouteTable").at(0),
                      {{"MACAddress", MAC}, {"InstanceID", "VLN: MPCA iSCSI Route Table"}});
    expect_properties(road.enumerate("VLNMPCA_ARPEntry").at(0),
                      {{"MACAddress", MAC},
                       {"DesMACAddress", "02564cfe0001"},
                       {"DesIPAddress", "198.51.100.1"},
                       {"InstanceID", "VLN: MPCA iSCSI ARP Entry:02564c000002:198.51.100.1"}});
    expect_properties(road.enumerate("VLNMPCA_RouteEntry").at(1),
                      {{"MACAddress", MAC},
                       {"Destination", "203.0.113.0"},
                       {"SubnetMask", "255.255.255.0"},
                       {"Gateway", "198.51.100.2"},
                       {"InstanceID", "VLN: MPCA iSCSI Route Entry02564c000002:203.0.113.0"}});
    for (const char* use : {"VLNMPCA_UseOfARPTable", "VLNMPCA_UseOfRouteTable"}) {
        const Instance link = road.enumerate(use).at(0);
        EXPECT_EQ(end_of(link, "Antecedent", "MACAddress"), MAC) << use;
        EXPECT_EQ(end_of(link, "Dependent", "DeviceID"), "100002564C000002") << use;
    }
    EXPECT_EQ(end_of(road.enumerate("VLNMPCA_CollectedARP").at(3), "Collection", "MACAddress"),
              OTHER_MAC)
        << "one address on two ports";
}

TEST_F(IP_Tables, NeighboursAreAddedOrRefused) {
    const char* const mac = "Invalid MAC addr specified";
    const char* const destination = "Invalid destination MAC addr specified";
    const char* const address = "VLNMPCA_ARPTable::Invalid IP Adrress passed";
    const CMPIrc invalid = CMPI_RC_ERR_INVALID_PARAMETER, failed = CMPI_RC_ERR_FAILED;
    const char *const to = "02564C0000FF", *const ip = "198.51.100.7";
    road.enumerate("VLNMPCA_ARPEntry");
    expect_creations(arp, {{{nullptr, to, ip}, invalid, mac},
                           {{"02-56-4c-00-00-2", to, ip}, invalid, mac},
                           {{"02564c0000ff", to, ip}, invalid, mac}, // of no port
                           {{MAC, "02564c0000xx", ip}, invalid, destination},
                           {{MAC, "000000000000", ip}, invalid, destination},
                           {{MAC, to, nullptr}, invalid, address},
                           {{MAC, to, "300.1.1.1"}, invalid, address},
                           {{MAC, to, "1.2.3"}, invalid, address},
                           {{MAC, to, "1.2.3.4x"}, invalid, address},
                           {{MAC, to, "example.com"}, invalid, address}});
    EXPECT_EQ(vlnsim_calls("LAX_Ini_AddARPTableEntry"), 0u);
    expect_creations(
        arp,
        {{{MAC, "ffffffffffff", ip}, failed, "AddARPTableEntry exited with the error code 4"},
         {{NIC_MAC, to, ip}, failed, "AddARPTableEntry exited with the error code 251"},
         {{NIC_MAC, to, ip}, failed, "table could not be located", {"LAX_Ini_AddARPTableEntry", 0}},
         {{MAC, to, ip}, failed, "error code 190", {"LAX_Ini_AddARPTableEntry", 190}},
         {{MAC, "02:56:4C:FE:00:01", "198.51.100.1"}, failed, "Insert Failed : m_VLNMPCA_ARPEntry"},
         {{MAC, to, "198.51.100.1"}, failed, "The table has an entry for this address"},
         {{"02-56-4C-00-00-02", "02:56:4C:00:00:FF", "198.51.100.007"},
          CMPI_RC_OK,
          "VLN_MethodWrapper::AddARPTableEntry"},
         {{MAC, to, ip}, failed, "Insert Failed : m_VLNMPCA_ARPEntry"},
         {{OTHER_MAC, to, ip}, CMPI_RC_OK, "VLN_MethodWrapper::AddARPTableEntry"}});
    const Instance added = find(road, "VLNMPCA_ARPEntry", "DesMACAddress", "02564c0000ff");
    expect_properties(added,
                      {{"MACAddress", MAC},
                       {"DesIPAddress", ip},
                       {"InstanceID", "VLN: MPCA iSCSI ARP Entry:02564c000002:198.51.100.7"}});
    EXPECT_EQ(road.enumerate("VLNMPCA_ARPEntry").size(), 6u);
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedARP").size(), 6u);
}

TEST_F(IP_Tables, RoutesAreAddedOrRefused) {
    const char* const destination = "VLNMPCA_ARPTable::Invalid destination IP Adrress passed";
    const char* const mask = "VLNMPCA_ARPTable::Invalid SubNet Mask passed";
    const char* const gateway = "VLNMPCA_ARPTable::Invalid Gateway passed";
    const CMPIrc invalid = CMPI_RC_ERR_INVALID_PARAMETER, failed = CMPI_RC_ERR_FAILED;
    const char *const to = "192.0.2.0", *const bits = "255.255.255.0", *const by = "198.51.100.3";
    road.enumerate("VLNMPCA_RouteEntry");
    expect_creations(
        route,
        {{{"x", to, bits, by}, invalid, "VLNMPCA_RouteEntry_Provider::convertMACToWWN failed"},
         {{"02564c0000ff", to, bits, by}, invalid, "VLNMPCA_ARPTable::Invalid MAC Adrress passed"},
         {{MAC, "192.0.2", bits, by}, invalid, destination},
         {{MAC, to, "255.255.255.0/24", by}, invalid, mask},
         {{MAC, to, bits, "300.1.1.1"}, invalid, gateway},
         {{MAC, to, bits, nullptr}, invalid, gateway}});
    EXPECT_EQ(vlnsim_calls("LAX_Ini_AddRouteTableEntry"), 0u);
    expect_creations(
        route,
        {{{MAC, to, "255.0.255.0", by}, failed, "AddRouteTableEntry exited with the error code 4"},
         {{MAC, to, bits, "192.0.2.1"}, failed, "The gateway is not in the port's network"},
         {{NIC_MAC, to, bits, by}, failed, "AddRouteTableEntry exited with the error code 251"},
         {{NIC_MAC, to, bits, by},
          failed,
          "table for the port can not be located",
          {"LAX_Ini_AddRouteTableEntry", 0}},
         {{MAC, to, bits, by}, CMPI_RC_OK, "VLN_MethodWrapper::AddRouteTableEntry"},
         {{"02:56:4c:00:00:02", to, bits, by}, failed, "Insert Failed : m_VLNMPCA_RouteEntry"},
         {{OTHER_MAC, to, bits, by}, CMPI_RC_OK},
         {{MAC, to, "255.255.255.128", by}, CMPI_RC_OK}});
    const std::string id = "VLN: MPCA iSCSI Route Entry02564c000002:192.0.2.0";
    const auto ids = [&] {
        std::string text;
        for (const Instance& each : road.enumerate("VLNMPCA_RouteEntry"))
            if (text_of(each, "MACAddress") == MAC && text_of(each, "Destination") == to)
                text += text_of(each, "InstanceID").substr(id.size()) + " ";
        return text;
    };
    EXPECT_EQ(ids(), " :255.255.255.128:198.51.100.3 ");
    road.wait_for_refreshes(1); // whose end counts for the age of the data
    vlnsim_advance(sudden_ends::STALE);
    road.enumerate("VLNMPCA_RouteEntry"); // starts the refresh, and may see it already
    road.wait_for_refreshes(2);
    EXPECT_EQ(ids(), ":255.255.255.0:198.51.100.3 :255.255.255.128:198.51.100.3 ");
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedRoute").size(), 7u);
}

TEST_F(IP_Tables, EntriesAreDeletedByTheirKeys) {
    Instance known = road.enumerate("VLNMPCA_ARPEntry").at(2); // of the second port
    const host::ObjectPath by_route = road.enumerate("VLNMPCA_RouteEntry").at(1).path;
    const auto remove = [&](const host::ObjectPath& path) {
        return [this, &path] { return road.manager().remove(path).rc; };
    };
    host::ObjectPath path = known.path;
    host::set(path.keys, "DesMACAddress", Value::text("02564cfe00c8"));
    expect({{}, CMPI_RC_ERR_NOT_FOUND, "Instance Not found "}, remove(path));
    EXPECT_EQ(vlnsim_calls("LAX_Ini_DeleteARPTableEntry"), 0u);
    host::set(path.keys, "DesMACAddress", Value::text("02-56-4C-FE-00-01"));
    expect({{}, CMPI_RC_ERR_FAILED, "error code 190", {"LAX_Ini_DeleteARPTableEntry", 190}},
           remove(path));
    expect({{}, CMPI_RC_OK, "VLN_MethodWrapper::DeleteARPTableEntry"}, remove(path));
    expect({{}, CMPI_RC_ERR_NOT_FOUND, "Instance Not found "}, remove(path));
    EXPECT_EQ(road.enumerate("VLNMPCA_ARPEntry").size(), 3u);
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedARP").size(), 3u);

    expect({{}, CMPI_RC_ERR_FAILED, "error code 190", {"LAX_Ini_DeleteRouteTableEntry", 190}},
           remove(by_route));
    expect({{}, CMPI_RC_OK, "VLN_MethodWrapper::DeleteRouteTableEntry"}, remove(by_route));
    expect({{}, CMPI_RC_ERR_NOT_FOUND, "Instance Not found "}, remove(by_route));
    EXPECT_EQ(road.enumerate("VLNMPCA_RouteEntry").size(), 3u);
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedRoute").size(), 3u);
}

// ---- Discovery ----

// A host with a NIC and an iSCSI function, which has these keys of its own, on each port.
std::string host_with(const std::string& keys, int ports = 1) {
    return R"({"include": ")" VLN_SCENARIOS
           R"(/parts/cna.json", "cards": [{"use": "cna", "ports": )" +
           std::to_string(ports) + R"(, "functions": [{"use": "nic"}, {"use": "iscsi", )" + keys +
           "}]}]}";
}

TEST(IP_Tables_Host, TablesOfAnyLengthAreReadWithoutTheirBadRows) {
    Road road({.scenario = host_with(R"("arpTable": [
                   {"mac": "02:00:00:00:00:01", "address": "10.0.0.1", "count": 1000},
                   {"mac": "000000000000", "address": "10.1.0.1"},
                   {"mac": "02:00:00:01:00:01", "address": "2001:db8::1"},
                   {"mac": "02:00:00:00:00:01", "address": "10.0.0.1"}],
                 "routeTable": [
                   {"destination": "10.0.0.0", "subnetMask": "255.255.255.0", "count": 300},
                   {"destination": "2001:db8::"}])"),
               .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_ARPEntry").size(), 1000u);
    EXPECT_EQ(vlnsim_calls("LAX_Ini_GetARPTable"), 2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedARP").size(), 1000u);
    EXPECT_EQ(road.enumerate("VLNMPCA_CollectedRoute").size(), 300u);
    for (const char* line :
         {"Number of ARP entries detected 1003", "MAC2String failed for i = 1000: Skipping this",
          "ipAddr2String failed for i = 1001: Skipping this", "CIM ARP Entry creation failed",
          "Number of Route entries detected 301", "ipAddr2String failed for i = 300: Skipping"})
        EXPECT_EQ(road.count_in_log(line), 1u) << line;
}

TEST(IP_Tables_Host, ATableThatCannotBeReadLeavesAllElse) {
    for (const char* function : {"LAX_Ini_GetARPTable", "LAX_Ini_GetRouteTable"}) {
        Road road({.log = true});
        const bool is_arp = std::string(function) == "LAX_Ini_GetARPTable";
        vlnsim_fault(function, 1, VLNSIM_STATUS, 190);
        EXPECT_EQ(road.enumerate("VLNMPCA_ARPEntry").size(), is_arp ? 2u : 4u);
        EXPECT_EQ(road.enumerate("VLNMPCA_RouteEntry").size(), is_arp ? 4u : 2u);
        EXPECT_EQ(road.enumerate("VLNMPCA_ARPTable").size(), 2u);
        EXPECT_EQ(road.enumerate("VLNMPCA_TCPBindsToIP").size(), 2u);
        EXPECT_EQ(
            road.count_in_log(is_arp ? "ARP entry discovery failed for port: 100002564C000002\n"
                                     : "Route Table discovery failed for port 100002564C000002\n"),
            1u);
    }
}

// Tables are named by the port's address.
TEST(IP_Tables_Host, APortWithoutAnAddressHasEmptyTables) {
    Road road({.scenario = host_with(R"("portAttributes": {"PermanentMACAddress":
                   "02:56:4c:00:00:xx"})"),
               .log = true});
    EXPECT_TRUE(road.enumerate("VLNMPCA_ARPEntry").empty());
    EXPECT_EQ(road.count_in_log("Invalid mac address used"), 2u);
}

TEST(IP_Tables_Host, OfTwoPortsWithOneAddressTheFirstHasTables) {
    Road road({.scenario = host_with(R"("mac": "02:56:4c:00:00:01")", 2), .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_ARPEntry").size(), 2u);
    for (const char* kind : {"ARP", "Route"})
        EXPECT_EQ(road.count_in_log("CIM " + std::string(kind) +
                                    " Table creation Failed for port:02564c000001"),
                  1u);
}

// ---- Static settings ----

class Static_Settings : public testing::Test {
protected:
    explicit Static_Settings(const char* network = R"("network": {"address": "198.51.100.77",
            "subnetMask": "255.255.255.0", "gateway": "198.51.100.1", "dhcp": true,
            "vlanEnabled": true, "vlanID": 20, "priority": 3})")
        : road({.scenario = host_with(network), .log = true}) {
        service = road.enumerate("VLNMPCA_IPConfigurationService").at(0).path;
        for (const Instance& each : road.enumerate("VLNMPCA_IPAssignmentSettingData"))
            settings.push_back(Value::reference(each.path));
        for (const Instance& each : road.enumerate("VLNMPCA_IPProtocolEndpoint"))
            endpoints.push_back(Value::reference(each.path));
    }

    void expect(const Named_Values& inputs, const char* line, Fault fault = {}) {
        if (fault.function)
            vlnsim_fault(fault.function, 1, VLNSIM_STATUS, fault.status);
        const auto reply =
            road.manager().invoke(service, "ApplySettingToIPProtocolEndpoint", inputs);
        EXPECT_EQ(reply.status.rc, CMPI_RC_ERR_FAILED) << line;
        EXPECT_EQ(road.count_in_log(line), 1u) << line;
        vlnsim_clear_faults();
    }

    Road road;
    host::ObjectPath service;
    std::vector<Value> settings, endpoints; // of the NIC port, of the iSCSI port
};

TEST_F(Static_Settings, AreAppliedOrRefused) {
    const Value iscsi = settings.at(1);
    const host::ObjectPath known = service;
    host::set(service.keys, "Name", Value::text("other"));
    expect({{"Configuration", iscsi}, {"Endpoint", endpoints.at(1)}},
           "Instance not found in m_VLNMPCA_IPConfigurationService_map");
    service = known;
    expect({{"Endpoint", endpoints[1]}},
           "Configuration not found in m_VLNMPCA_IPAssignmentSettingData_map");
    expect({{"Configuration", iscsi}}, "Endpoint not found in m_VLNMPCA_IPProtocolEndpoint_map");
    expect({{"Configuration", iscsi}, {"Endpoint", endpoints[0]}},
           "One or more of the associations do not exist");
    expect({{"Configuration", settings[0]}, {"Endpoint", endpoints[0]}},
           "AX Call SetNetworkSettings failed with 251");
    const Named_Values inputs = {{"Configuration", iscsi}, {"Endpoint", endpoints[1]}};
    expect(inputs, "AX Call SetNetworkSettings failed with 190",
           {"AX_Ini_SetNetworkProperties", 190});

    const host::ObjectPath endpoint = *endpoints[1].as_reference();
    EXPECT_EQ(text_of(road.manager().get(endpoint).value, "AddressOrigin"), "4");
    const auto reply = road.manager().invoke(service, "ApplySettingToIPProtocolEndpoint", inputs);
    EXPECT_TRUE(reply.ok());
    EXPECT_EQ(reply.value.value.as_unsigned(), 0u);
    const std::map<std::string, std::string> kept = {{"AddressOrigin", "3"},
                                                     {"IPv4Address", "198.51.100.77"},
                                                     {"SubnetMask", "255.255.255.0"},
                                                     {"VLANEnabled", "1"},
                                                     {"VLANID", "20"},
                                                     {"Priority", "3"},
                                                     {"GatewayAddress", "198.51.100.1"}};
    const auto expect_kept = [&] {
        const Instance now = road.manager().get(endpoint).value;
        for (const auto& [name, value] : kept)
            EXPECT_EQ(text_of(now, name), value) << name;
    };
    expect_kept();
    std::string current;
    for (const Instance& each : road.enumerate("VLNMPCA_IPProtocolEndpointIPAssignmentSettingData"))
        current += text_of(each, "IsCurrent");
    EXPECT_EQ(current, "-1");
    road.wait_for_refreshes(1); // whose end counts for the age of the data
    vlnsim_advance(sudden_ends::STALE);
    road.enumerate("VLNMPCA_IPProtocolEndpoint");
    road.wait_for_refreshes(2);
    expect_kept();
}

class IPv6_Settings : public Static_Settings {
protected:
    IPv6_Settings() : Static_Settings(R"("network": {"address": "2001:db8::7"})") {}
};

TEST_F(IPv6_Settings, AreRefused) {
    expect({{"Configuration", settings.at(1)}, {"Endpoint", endpoints.at(1)}},
           "The static setting has no IPv4 address");
    EXPECT_EQ(vlnsim_calls("AX_Ini_SetNetworkProperties"), 0u);
}

TEST(IP_Configuration, NeedsExactlyOneService) {
    Road road({.scenario = "no-adapters.json"});
    EXPECT_TRUE(road.enumerate("VLNMPCA_IPConfigurationService").empty());
    host::ObjectPath path;
    path.class_name = "VLNMPCA_IPConfigurationService";
    for (const char* key : {"Name", "SystemName", "SystemCreationClassName", "CreationClassName"})
        path.keys.push_back({key, Value::text("none")});
    EXPECT_EQ(road.manager().invoke(path, "ApplySettingToIPProtocolEndpoint", {}).status.rc,
              CMPI_RC_ERR_FAILED);
}

} // namespace
