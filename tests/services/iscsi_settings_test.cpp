// The iSCSI setting service and the settings beside it, as a client calls them.
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using host::Named_Values;
using host::Value;
using road::find;
using road::Road;
using road::text_of;
using services::Fault;
using services::number;

namespace {

constexpr const char* PORT = "100002564C000002";
constexpr const char* MAC = "02-56-4c-00-00-02";
constexpr const char* VAULT = "iqn.2010-04.com.example:vault";
constexpr const char* PORTAL = "198.51.100.200";
constexpr const char* OPEN_PORTAL = "198.51.100.201";
constexpr const char* SECRETS[] = {"who-is-there", "vault-secret-1", "host-secret-22"};

Value text(const std::string& value) {
    return Value::text(value);
}

struct Row {
    const char* method;
    Named_Values inputs;
    std::uint64_t value;
    const char* line;
    Fault fault = {};
};

class ISCSI : public testing::Test {
protected:
    ISCSI() : road({.scenario = "iscsi-empty.json", .log = true}) {
        service = road.enumerate("VLNMPCA_iSCSISettingService").at(0).path;
    }

    // Inputs over those that each method takes.
    static Named_Values with(Named_Values base, const Named_Values& more) {
        for (const host::Named_Value& each : more)
            host::set(base, each.name, each.value);
        return base;
    }
    static Named_Values chap(std::uint32_t method, const char* type = "AuthType",
                             const char* target = "TargetSecret") {
        return {{type, number(CMPI_uint32, method)},
                {"TargetCHAPName", text("vault")},
                {target, text("vault-secret-1")},
                {"InitCHAPName", text("host")},
                {"InitSecret", text("host-secret-22")}};
    }
    static Named_Values discovery() {
        return {{"InitPortMACAddress", text(PORT)},
                {"TargetIPAddress", text(PORTAL)},
                {"AuthType", number(CMPI_uint32, 1)},
                {"TargetCHAPName", text("discovery")},
                {"TargetSecret", text("who-is-there")}};
    }
    static Named_Values target(const std::string& name = VAULT) {
        return {{"InitPortMACAddress", text(PORT)}, {"TargetName", text(name)}};
    }
    static Named_Values login() {
        return with(with(target(), chap(2)), {{"TargetIPAddress", text(PORTAL)}});
    }

    // With those inputs that the method takes.
    std::uint64_t call(const char* method, Named_Values inputs) {
        const auto* known = road.manager().classes().find(service.class_name)->find_method(method);
        std::erase_if(inputs, [&](const auto& each) { return !known->find(each.name); });
        const auto reply = road.manager().invoke(service, method, inputs);
        EXPECT_TRUE(reply.ok()) << method;
        return reply.value.value.as_unsigned();
    }
    void expect(const Row& row) {
        if (row.fault.function)
            vlnsim_fault(row.fault.function, 1, VLNSIM_STATUS, row.fault.status);
        const std::size_t before = road.log_text().size();
        EXPECT_EQ(call(row.method, row.inputs), row.value) << row.method << ": " << row.line;
        EXPECT_NE(road.log_text().find(row.line, before), std::string::npos)
            << row.method << ": " << row.line << road.log_text().substr(before);
        vlnsim_clear_faults();
    }
    std::size_t shown(const char* class_name) { return road.enumerate(class_name).size(); }

    Road road;
    host::ObjectPath service;
};

TEST_F(ISCSI, FromAnEmptyPortToADiskAndBack) {
    EXPECT_EQ(call("AddTargetPortal", with(discovery(), {{"InitPortMACAddress", text(MAC)}})), 0u);
    EXPECT_EQ(shown("VLNMPCA_iSCSITargetProtocolEndpoint"), 3u);
    EXPECT_EQ(shown("VLNMPCA_StorageVolume"), 0u) << "nobody has logged in";

    expect({"TargetLogin", with(login(), {{"InitSecret", text("host-secret-23")}}), 32769,
            "TargetLogin: TargetLogin failed with 109"});
    EXPECT_EQ(shown("VLNMPCA_iSCSISession"), 0u);
    expect({"TargetLogin", with(login(), {{"HeaderDigest", Value::boolean(true)}}), 0,
            "TargetLogin: Login done. Refreshing SAN Data."});
    road::expect_properties(road.enumerate("VLNMPCA_iSCSISession").at(0),
                            {{"EndPointName", VAULT},
                             {"StatusDescriptions", "{OPEN}"},
                             {"MaxDataBurstLength", "131072"},
                             {"iSCSIBoot", "0"}});
    road::expect_properties(road.enumerate("VLNMPCA_iSCSIConnection").at(0),
                            {{"TargetIPAddress", PORTAL},
                             {"MutualAuthentication", "TRUE"},
                             {"HeaderDigestMethod", "3"},
                             {"DataDigestMethod", "2"}});
    EXPECT_EQ(shown("VLNMPCA_StorageVolume"), 2u);

    const Named_Values boot = with(target(), {{"TargetIPAddress", text(PORTAL)},
                                              {"enableBootSession", number(CMPI_uint32, 1)}});
    EXPECT_EQ(call("setBootTargetSession", boot), 0u);
    expect({"RemoveTarget", target(), 32769, "RemoveTarget: RemoveTarget failed with 108."});
    EXPECT_EQ(road.count_in_log("Status: <108>"), 0u) << "no words of the library";
    EXPECT_EQ(shown("VLNMPCA_iSCSISession"), 1u);
    const Named_Values logout = with(target(), {{"SessionID", number(CMPI_uint32, 1)}});
    expect({"TargetLogout", with(logout, {{"TargetIPAddress", text(OPEN_PORTAL)}}), 32769,
            "TargetLogout: TargetLogout failed with 110"});
    expect({"TargetLogout", logout, 0, "TargetLogout: Logout done. Refreshing SAN Data."});
    EXPECT_EQ(shown("VLNMPCA_StorageVolume"), 0u);
    expect({"RemoveTarget", target(), 0, "RemoveTarget: Target removed. Refreshing SAN Data."});
    expect({"RemoveTargetPortal", discovery(), 0,
            "RemoveTargetPortal: Target Portal removed. Refreshing SAN Data."});
    EXPECT_EQ(shown("VLNMPCA_iSCSITargetProtocolEndpoint"), 0u);
    // What is counted shows with the next refresh, for which clients do not wait.
    host::Instance counted;
    for (int i = 0; i < 10000 && text_of(counted, "NormalLogouts") != "1"; ++i)
        counted = find(road, "VLNMPCA_ISCSILoginStatistics", "InstanceID",
                       std::string("VLN:iSCSI Login Statistics:") + PORT);
    road::expect_properties(
        counted,
        {{"SuccessfulLogins", "1"}, {"AuthenticationLoginFailures", "1"}, {"NormalLogouts", "1"}});
    for (const char* secret : SECRETS)
        EXPECT_EQ(road.count_in_log(secret), 0u) << secret;
}

TEST_F(ISCSI, NamesAndSecretsHaveTheirLengths) {
    struct Length {
        std::size_t size;
        bool taken;
    };
    for (const Length& row : {Length{10, false}, {11, true}, {223, true}, {224, false}}) {
        const Named_Values named = target(std::string(row.size, 'x'));
        const char* const refused = "Invalid Target name passed.";
        expect({"RemoveTarget", named, row.taken ? 32769u : 32968u,
                row.taken ? "RemoveTarget failed with 110." : refused});
        expect({"setTargetProperties",
                with(named, {{"ExtendedTimeOutValue", number(CMPI_uint32, 1)}}), 1,
                row.taken ? "SetTargetProperties failed with 110." : refused});
    }
    for (const Length& row : {Length{11, false}, {12, true}, {16, true}, {17, false}})
        for (const std::uint32_t method : {1u, 2u}) {
            const char* const last = method == 1 ? "TargetSecret" : "InitSecret";
            const Named_Values inputs =
                with(with(login(), chap(method)), {{last, text(std::string(row.size, 's'))}});
            expect({"TargetLogin", inputs, row.taken ? 32769u : 32968u,
                    row.taken ? "GetTargetLoginAuthProperties failed with 110"
                              : "TargetLogin: Invalid authentication options passed."});
        }
    expect({"TargetLogin", with(login(), {{"TargetCHAPName", text(std::string(256, 'n'))}}), 32968,
            "Invalid authentication options passed."});
    expect({"TargetLogin", with(login(), {{"AuthType", number(CMPI_uint32, 3)}}), 32968,
            "Invalid authentication options passed."});
    EXPECT_EQ(call("AddTarget", with(target(), {{"TargetIPAddress", text(PORTAL)},
                                                {"AuthType", number(CMPI_uint32, 0)},
                                                {"TargetSecret", text("short")}})),
              0u);
}

TEST_F(ISCSI, EachAnswerHasItsLine) {
    ASSERT_EQ(call("AddTargetPortal", discovery()), 0u);
    const Value one = number(CMPI_uint32, 1), two = number(CMPI_uint32, 2);
    const Named_Values ping = {{"InitPortMACAddress", text("02564c000002")},
                               {"IPAddress", text(PORTAL)},
                               {"TCPPort", number(CMPI_uint32, 3260)}};
    const Named_Values tp = with(discovery(), {{"Port", number(CMPI_uint16, 3260)}});
    const Named_Values unknown_port = {{"InitPortMACAddress", text("100002564C000000")}};
    const char* const no_mac = "Invalid MAC address passed.";
    const char* const no_ip = "Invalid IP address passed.";
    const char* const no_options = "HeaderDigest or ImmediateData or DataDigest are not set";
    const char* const bad_login = "Invalid authentication options passed.";
    std::vector<Row> rows = {
        {"Ping", ping, 0, "Ping to IP address completed successfully"},
        {"Ping", with(ping, {{"IPAddress", text("198.51.100.77")}}), 190,
         "IP address 198.51.100.77 is unreachable."},
        {"Ping", with(ping, {{"IPAddress", text("198.51.100.10")}}), 0, "does not answer."},
        {"Ping", with(ping, {{"TCPPort", number(CMPI_uint32, 0)}}), 5,
         "Invalid argument passed (InitPortMACAddress|IPAddress|TCPPort)"},
        {"Ping", with(ping, unknown_port), 5, no_mac},
        {"AddTargetPortal", with(discovery(), {{"AuthType", two}}), 32968, bad_login},
        {"AddTargetPortal",
         discovery(),
         32769,
         "GetIscsiInitiatorProps failed with 190.",
         {"AX_iSCSI_GetInitiatorProperties", 190}},
        {"AddTargetPortal",
         discovery(),
         32769,
         "AddTargetPortal failed with 190.",
         {"AX_iSCSI_AddSendTargetPortal", 190}},
        {"RemoveTargetPortal", with(discovery(), {{"TargetTCPPort", number(CMPI_uint16, 1)}}),
         32769, "RemoveTargetPortal failed with 110."},
        {"AddTarget", with(login(), {{"AuthType", two}, {"InitSecret", text("short")}}), 32968,
         bad_login},
        {"AddTarget",
         with(login(), {{"Login", Value::boolean(true)}}),
         32769,
         "AddTarget failed with 60.",
         {"AX_iSCSI_AddTarget", 60}},
        {"AddTarget",
         with(login(), {{"Login", Value::boolean(true)}, {"Boot", Value::boolean(true)}}), 0,
         "AddTarget: Target added. Refreshing SAN Data."},
        {"AddTarget", login(), 32769, "AddTarget failed with 111."},
        {"TargetLogin", login(), 32769, "TargetLogin failed with 1.", {"AX_iSCSI_TargetLogin", 1}},
        {"setTargetProperties",
         with(target(), {{"ExtendedTimeOutValue", number(CMPI_uint32, 3200)}}), 0,
         "VLN_MethodWrapper::SetTargetProperties"},
        {"setTargetProperties",
         with(target(), {{"ExtendedTimeOutValue", number(CMPI_uint32, 3201)}}), 1,
         "setTargetProperties: Supported Value range is 0 to 3200"},
        {"setTargetLoginProperties",
         with(with(target(), chap(1, "AuthenticationType", "TgtSecret")), {{"HeaderDigest", one}}),
         0, "VLN_MethodWrapper::SetTargetLoginAuthProperties"},
        {"setTargetLoginProperties", with(target(), {{"HeaderDigest", two}}), 0, no_options},
        {"setTargetLoginProperties",
         target(),
         1,
         "GetTargetLoginAuthProperties failed with 7",
         {"AX_iSCSI_GetTargetLoginAuthProperties", 7}},
        {"setTargetLoginProperties",
         with(target(), {{"HeaderDigest", one}}),
         1,
         "SetTargetLoginAuthProperties failed with 7",
         {"AX_iSCSI_SetTargetLoginAuthProperties", 7}},
        {"setTargetLoginProperties", with(target(), {{"AuthenticationType", two}}), 32968,
         bad_login},
        {"setTPLoginProperties", discovery(), 1, "Invalid IP Address or port number passed."},
        {"setTPLoginProperties", tp, 1, no_options},
        {"setTPLoginProperties", with(tp, {{"DataDigest", two}, {"HeaderDigest", one}}), 1,
         no_options},
        {"setTPLoginProperties", with(tp, {{"DataDigest", one}}), 0,
         "VLN_MethodWrapper::SetTargetPortalProperties"},
        {"setTPLoginProperties",
         with(tp, {{"DataDigest", one}}),
         1,
         "SetTargetPortalProperties failed with 190",
         {"AX_iSCSI_SetSendTargetPortalProperties", 190}},
        {"setBootTargetSession", with(target(), {{"enableBootSession", two}}), 5,
         "Invalid argument passed (enableBootSession)"},
        {"setBootTargetSession",
         with(target(), {{"enableBootSession", one}}),
         60,
         "SetBootTargetSession exited with the error code 60",
         {"AX_iSCSI_SetBootSession", 60}},
    };
    for (const char* method : {"AddTargetPortal", "RemoveTargetPortal"}) {
        rows.push_back({method, with(discovery(), unknown_port), 32968, no_mac});
        for (const char* address : {"300.1.1.1", "1.2.3", "1.2.3.4x", " 1.2.3.4", "one", ""})
            rows.push_back(
                {method, with(discovery(), {{"TargetIPAddress", text(address)}}), 32968, no_ip});
    }
    for (const char* method : {"AddTarget", "RemoveTarget", "TargetLogin", "TargetLogout"})
        rows.push_back({method, with(login(), unknown_port), 32968, no_mac});
    for (const char* method : {"setBootTargetSession", "setTargetLoginProperties",
                               "setTargetProperties", "setTPLoginProperties"})
        rows.push_back({method, with(login(), unknown_port), 5, no_mac});
    for (const Row& row : rows)
        expect(row);

    host::set(service.keys, "Name", text("other"));
    expect({"Ping", ping, 33068, "Invalid instance of VLNMPCA_iSCSISettingService"});
}

// A portal that stands with digests is made anew for a call that wants none, and for no other.
TEST_F(ISCSI, APortalThatStandsOtherwiseIsMadeAnew) {
    const Named_Values open = {{"InitPortMACAddress", text(PORT)},
                               {"TargetIPAddress", text(OPEN_PORTAL)},
                               {"TargetTCPPort", number(CMPI_uint16, 3261)}};
    const Value yes = Value::boolean(true), no = Value::boolean(false);
    ASSERT_EQ(call("AddTargetPortal", with(open, {{"HeaderDigest", yes}})), 0u);
    expect({"AddTargetPortal", with(open, {{"DataDigest", yes}}), 32769,
            "AddTargetPortal failed with 116."});
    expect({"AddTargetPortal", with(open, {{"ImmediateData", no}}), 0,
            "VLN_MethodWrapper::RemoveTargetPortal"});
    EXPECT_EQ(shown("VLNMPCA_iSCSITargetProtocolEndpoint"), 1u);
    expect({"AddTargetPortal", open, 32769, "AddTargetPortal failed with 116."});

    ASSERT_EQ(call("RemoveTargetPortal", open), 0u);
    ASSERT_EQ(call("AddTargetPortal", with(open, {{"HeaderDigest", yes}})), 0u);
    vlnsim_fault("AX_iSCSI_AddSendTargetPortal", 2, VLNSIM_STATUS, 190);
    expect({"AddTargetPortal", open, 32769, "AddTargetPortal failed with 190."});
    EXPECT_EQ(shown("VLNMPCA_iSCSITargetProtocolEndpoint"), 0u) << "what was removed stays so";
}

TEST_F(ISCSI, ARowOfChangesWaitsForNoRefresh) {
    road.enumerate("VLNMPCA_iSCSISession");
    road.wait_for_refreshes(1);
    vlnsim_clear_calls();
    for (int i = 0; i < 50; ++i)
        ASSERT_EQ(
            call("AddTarget", with(target("iqn.2010-04.com.example:added-" + std::to_string(i)),
                                   {{"TargetIPAddress", text(PORTAL)}})),
            0u);
    EXPECT_EQ(vlnsim_calls("AX_iSCSI_GetTargets"), 0u);
    EXPECT_EQ(shown("VLNMPCA_iSCSITargetProtocolEndpoint"), 50u);
    EXPECT_EQ(vlnsim_calls("AX_iSCSI_GetTargets"), 2u) << "one for each port";
}

TEST_F(ISCSI, TheInitiatorProvesItselfAsItIsTold) {
    const host::Instance data = road.enumerate("VLNMPCA_ISCSIInitiatorPropertiesData").at(0);
    const auto failed = CMPI_RC_ERR_FAILED;
    const Value one_way = text("one-way chap"), mutual = text("Mutual CHAP");
    const Value secret = text("twelve-or-16"), name = text("n");
    services::expect_changes(
        road, data,
        {{{{"InitiatorAlias", name}}, failed, "Invalid AuthMethod to process "},
         {{{"AuthMethod", text("Three-Way CHAP")}}, failed, "to process Three-Way CHAP"},
         {{{"InitiatorSCSIName", text(std::string(256, 'n'))}},
          failed,
          "Invalid InitiatorSCSIName to process"},
         {{{"InitiatorAlias", text(std::string(256, 'n'))}},
          failed,
          "Invalid InitiatorAlias to process"},
         {{{"AuthMethod", one_way}, {"TargetCHAPName", name}},
          failed,
          "Err: Invalid input parameters for AuthMethod value 1 "},
         {{{"AuthMethod", mutual}, {"TargetCHAPName", name}, {"TargetSecret", secret}},
          failed,
          "Err: Invalid input parameters for AuthMethod value 2 "},
         {{{"AuthMethod", one_way},
           {"TargetCHAPName", name},
           {"TargetSecret", text("eleven-char")}},
          failed,
          "TargetSecret lenght must be b/w 12 and 16 characters"},
         {{{"AuthMethod", mutual},
           {"TargetCHAPName", name},
           {"TargetSecret", secret},
           {"InitCHAPName", name},
           {"InitSecret", text("seventeen-letters")}},
          failed,
          "Init/Target Secret lenght must be b/w 12 and 16  characters"},
         {{{"AuthMethod", text("None")}, {"ChangeableType", number(CMPI_uint16, 3)}},
          failed,
          "Error:Invalid Input parameter, Changeable Type is not modifiable"},
         {{{"AuthMethod", text("None")}},
          failed,
          "Unable to modify the VLNMPCA_ISCSIInitiatorPropertiesData element setting data",
          {"AX_iSCSI_SetInitiatorProperties", 190}},
         {{{"AuthMethod", mutual},
           {"InitiatorAlias", text("blade 7")},
           {"TargetCHAPName", text("them")},
           {"TargetSecret", secret},
           {"InitCHAPName", text("us")},
           {"InitSecret", text("also-16-letters!")}},
          CMPI_RC_OK,
          "Successfully modified the ISCSI Initiator Properties data"}});
    road::expect_properties(road.manager().get(data.path).value, {{"AuthMethod", "Mutual CHAP"},
                                                                  {"InitiatorAlias", "blade 7"},
                                                                  {"TargetCHAPName", "them"},
                                                                  {"InitCHAPName", "us"},
                                                                  {"TargetSecret", "-"},
                                                                  {"InitSecret", "-"}});
    EXPECT_EQ(road.count_in_log("twelve-or-16"), 0u);
    EXPECT_EQ(road.count_in_log("also-16-letters!"), 0u);

    services::expect_changes(
        road, road.enumerate("VLNMPCA_ISCSIBootData").at(0),
        {{{}, failed, "Error: No parameter specified"},
         {{{"Value", number(CMPI_uint32, 2)}}, failed, "Error: No parameter specified"},
         {{{"Value", number(CMPI_uint32, 1)}},
          CMPI_RC_ERR_NOT_FOUND,
          "ERROR: AX_SetAdapterAttribute failure. iSCSIBoot state has not been set",
          {"AX_SetAdapterAttribute", 190}},
         {{{"Value", number(CMPI_uint32, 1)}},
          CMPI_RC_OK,
          "Successfully modified the iSCSI Boot Status"}});
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_ISCSIBootData").at(0), "Value"), "1");
}

TEST_F(ISCSI, LimitsAreSetAndReadBack) {
    const host::Instance data = road.enumerate("VLNMPCA_ISCSIQOSData").at(0);
    const auto bytes = [](std::uint32_t value) {
        return Named_Values{{"MaxBytesPerSecond", number(CMPI_uint32, value)}};
    };
    const auto ios = [](std::uint32_t value) {
        return Named_Values{{"MaxIOsPerSecond", number(CMPI_uint32, value)}};
    };
    const auto refused = CMPI_RC_ERR_NOT_FOUND;
    const char* const done = "Successfully modified the QoS parameters";
    services::expect_changes(
        road, data,
        {{{}, CMPI_RC_ERR_FAILED, "Error: No parameter specified"},
         {with(bytes(1), {{"ChangeableType", number(CMPI_uint16, 0)}}), CMPI_RC_ERR_FAILED,
          "Modifiable parameters are MaxBytesPerSecond and MaxIOsPerSecond"},
         {bytes(1281), refused, "Err: Invalid value of maxBytesPerSecond specified"},
         {ios(151), refused, "Err: Invalid value of maxIOsPerSecond specified"},
         {bytes(1),
          refused,
          "Err: Unable to determine if port is an iSCSI port",
          {"AX_GetHBAFeature", 1}},
         {bytes(1), refused, "Failed to set the QoS Element setting data", {"AX_SetQoS", 190}},
         {bytes(1280), CMPI_RC_OK, done},
         {ios(149), CMPI_RC_OK, done},
         {bytes(640), CMPI_RC_OK, done}});
    road::expect_properties(road.manager().get(data.path).value,
                            {{"MaxBytesPerSecond", "640"}, {"MaxIOsPerSecond", "149"}});
    const auto ties = road.enumerate("VLNMPCA_PortISCSIQOSSettingData");
    EXPECT_EQ(text_of(ties.at(0), "IsCurrent"), "2");
    EXPECT_EQ(text_of(ties.at(1), "IsCurrent"), "1") << "the other port's";
}

TEST_F(ISCSI, NameServersComeAndGo) {
    const host::Instance state = road.enumerate("VLNMPCA_ISCSIiSNSData").at(0);
    const auto failed = CMPI_RC_ERR_FAILED;
    const Value yes = number(CMPI_uint32, 1), port = number(CMPI_uint32, 3205);
    services::expect_changes(
        road, state,
        {{{}, failed, "Error: No parameter specified"},
         {{{"Enable", yes}}, failed, "Invalid IP address or port passed."},
         {{{"IPAddress", text("198.51.100")}, {"TCPPort", port}}, failed, "Invalid IP address"},
         {{{"Enable", yes}, {"ChangeableType", number(CMPI_uint16, 0)}},
          failed,
          "Modifiable parameters are IPAddress and TCPPort"},
         {{{"IPAddress", text("198.51.100.9")}, {"TCPPort", port}, {"Enable", yes}},
          failed,
          "UpdateiSNSServer exited with the error code 112",
          {"AX_iSCSI_AddiSNSServer", 112}},
         {{{"IPAddress", text("198.51.100.9")}, {"TCPPort", port}, {"Enable", yes}},
          CMPI_RC_OK,
          "VLN_MethodWrapper::UpdateiSNSServer"}});
    road::expect_properties(road.manager().get(state.path).value,
                            {{"IPAddress", "198.51.100.9"}, {"TCPPort", "3205"}, {"Enable", "1"}});

    host::Instance server;
    server.path.class_name = "VLNMPCA_ISCSIISNSServerData";
    host::set(server.properties, "IPAddress", text("198.51.100.10"));
    EXPECT_EQ(road.manager().create(server).status.rc, failed);
    EXPECT_EQ(road.count_in_log("Err:Input parameters missing"), 1u);
    host::set(server.properties, "TCPPort", port);
    host::set(server.properties, "InitPortMACAddress", text(PORT));
    const auto created = road.manager().create(server);
    EXPECT_EQ(created.status.rc, CMPI_RC_OK);
    EXPECT_TRUE(road.manager().get(created.value).ok());
    EXPECT_EQ(road.count_in_log("iSNS server has been updated, but IP address is unreachable"), 1u);
    const auto servers = road.enumerate("VLNMPCA_ISCSIISNSServerData");
    ASSERT_EQ(servers.size(), 3u) << "one of them is the other port's";
    EXPECT_EQ(shown("VLNMPCA_ServiceiSCSIISNSServerSettingData"), 3u);
    EXPECT_EQ(road.manager().modify(servers[0]).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(road.manager().remove(servers[0].path).rc, CMPI_RC_OK);
    EXPECT_EQ(road.manager().remove(servers[0].path).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(shown("VLNMPCA_ISCSIISNSServerData"), 2u);
}

} // namespace
