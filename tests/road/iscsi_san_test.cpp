// What a client sees of the SAN behind iSCSI ports.
#include "tests/road/properties.h"

#include <algorithm>
#include <fstream>

using road::end_of;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

constexpr char SCENARIO[] = "iscsi-sessions.json";
constexpr char SECOND[] = "100002564C000103"; // the second port
constexpr char ISID_1[] = "0x400002560001";   // which both ports use
#define ARRAY_A "iqn.2010-04.com.example:array-a"
#define ARRAY_B "iqn.2010-04.com.example:array-b"

std::size_t count_of(Road& road, const char* class_name) {
    return road.enumerate(class_name).size();
}

// The instances whose property begins so.
std::vector<host::Instance> matching(Road& road, const char* class_name, const char* property,
                                     const std::string& start) {
    std::vector<host::Instance> found = road.enumerate(class_name);
    std::erase_if(found, [&](const host::Instance& instance) {
        return !text_of(instance, property).starts_with(start);
    });
    return found;
}

TEST(ISCSI_SAN, AnOpenSession) {
    Road road({.scenario = SCENARIO});
    const auto sessions = road.enumerate("VLNMPCA_iSCSISession");
    ASSERT_EQ(sessions.size(), 9u);
    expect_properties(sessions[0],
                      {{"InstanceID", "VLN:iSCSI Session:100002564C000002:" ARRAY_A ":1"},
                       {"OperationalStatus", "{2}"},
                       {"StatusDescriptions", "{OPEN}"},
                       {"Directionality", "2"},
                       {"SessionType", "3"},
                       {"TSIH", "1"},
                       {"ISIDQualifier", "1"},
                       {"EndPointName", ARRAY_A},
                       {"CurrentConnections", "1"},
                       {"InitialR2T", "FALSE"},
                       {"ImmediateData", "TRUE"},
                       {"MaxUnsolicitedFirstDataBurstLength", "65536"},
                       {"MaxDataBurstLength", "524288"},
                       {"MaxConnectionsPerSession", "1"},
                       {"ErrorRecoveryLevel", "2"},
                       {"DefaultTimeToWait", "2"},
                       {"DefaultTimeToRetain", "20"},
                       {"iSCSIBoot", "1"}});
    const auto statistics = road.enumerate("VLNMPCA_ISCSISessionStatistics");
    ASSERT_EQ(statistics.size(), 7u);
    expect_properties(
        statistics[0],
        {{"InstanceID", "VLN:Session Statistics:100002564C000002:" ARRAY_A ":i0x400002560001:t1:1"},
         {"BytesTransmitted", "78187493530"},
         {"BytesReceived", "4096"},
         {"CommandPDUsTransferred", "77"},
         {"ResponsePDUsTransferred", "76"},
         {"DigestErrors", "1"},
         {"ConnectionTimeoutErrors", "2"},
         {"SessionTargetAlias", "array a"}});
    EXPECT_EQ(text_of(statistics[1], "SessionTargetAlias"), "n/a");
    EXPECT_EQ(count_of(road, "VLNMPCA_ISCSISessionStatisticalData"), 7u);
}

TEST(ISCSI_SAN, ConnectionsOfBothAddressFamilies) {
    Road road({.scenario = SCENARIO});
    const auto connections = road.enumerate("VLNMPCA_iSCSIConnection");
    ASSERT_EQ(connections.size(), 7u);
    expect_properties(
        connections[0],
        {{"InstanceID", "VLN:iSCSI Connection:i0x400002560001:100002564C000002:" ARRAY_A ":t1:0:1"},
         {"StatusDescriptions", "{CONNECTED}"},
         {"SourcePort", "49200"},
         {"DestinationPort", "3260"},
         {"TargetIPAddress", "198.51.100.200"},
         {"RedirectedDestination", "n/a"},
         {"RedirectedDestinationPort", "0"},
         {"TCPMSS", "8960"},
         {"HeaderDigestMethod", "3"},
         {"DataDigestMethod", "2"},
         {"MaxReceiveDataSegmentLength", "8192"},
         {"MaxTransmitDataSegmentLength", "65536"},
         {"AuthenticationMethodUsed", "3"},
         {"MutualAuthentication", "FALSE"}});
    expect_properties(connections[1], {{"TargetIPAddress", "201:db8::b:"},
                                       {"DestinationPort", "3261"},
                                       {"RedirectedDestination", "201:db8::bb:"},
                                       {"RedirectedDestinationPort", "3262"},
                                       {"MutualAuthentication", "TRUE"}});
    expect_properties(connections[2], {{"StatusDescriptions", "{CLOSED}"},
                                       {"AuthenticationMethodUsed", "2"},
                                       {"RedirectedDestination", "n/a"},
                                       {"RedirectedDestinationPort", "3262"}});
    const auto composed = road.enumerate("VLNMPCA_NetworkPipeComposition");
    ASSERT_EQ(composed.size(), 7u);
    EXPECT_EQ(end_of(composed[1], "PartComponent", "InstanceID"),
              text_of(connections[1], "InstanceID"));
    EXPECT_EQ(end_of(composed[1], "GroupComponent", "InstanceID"),
              "VLN:iSCSI Session:100002564C000002:" ARRAY_B ":2");
    const auto bound = road.enumerate("VLNMPCA_iSCSIConnectionEndpointOfNetworkPipe");
    ASSERT_EQ(bound.size(), 7u);
    EXPECT_EQ(end_of(bound[6], "Antecedent", "Name"),
              std::string("VLN:TCP Endpoint:") + SECOND + ":3260");
}

TEST(ISCSI_SAN, SessionsInEveryState) {
    Road road({.scenario = SCENARIO, .log = true});
    const struct {
        const char* id;
        const char* state;
        const char* status;
        const char* description;
    } rows[] = {
        {"Session:100002564C000002:" ARRAY_A ":1", "OPEN", "2", "-"},
        {"Session:100002564C000002:" ARRAY_B ":2", "OPEN", "2", "-"},
        {"Session:100002564C000002:" ARRAY_B ":3", "RECOVERY", "3", "-"},
        {"Closed Session:2:0:100002564C000002:" ARRAY_B ":4", "CLOSED", "10",
         "Target portal 201:db8::c:"},
        {"Closed Session:2:0:100002564C000002:" ARRAY_B ":5", "DELETED", "10", "Target portal n/a"},
        {"Session:100002564C000002:" ARRAY_B ":6", "UNKNOWN", "0", "-"},
        {"Session:100002564C000002:iqn.2010-04.com.example:new:7", "LOGIN_IN_PROGRESS", "8", "-"},
        {"Session:100002564C000002:iqn.2010-04.com.example:new:8", "LOGIN_FAILED", "6", "-"},
        {"Session:100002564C000103:" ARRAY_A ":1", "OPEN", "2", "-"},
    };
    const auto sessions = road.enumerate("VLNMPCA_iSCSISession");
    ASSERT_EQ(sessions.size(), std::size(rows));
    for (std::size_t i = 0; i < std::size(rows); ++i)
        expect_properties(sessions[i],
                          {{"InstanceID", ("VLN:iSCSI " + std::string(rows[i].id)).c_str()},
                           {"StatusDescriptions", ("{" + std::string(rows[i].state) + "}").c_str()},
                           {"OperationalStatus", ("{" + std::string(rows[i].status) + "}").c_str()},
                           {"Description", rows[i].description}});
    road.close();
    EXPECT_EQ(road.count_in_log("Error retrieving information for iSNS Server"), 1u);
    EXPECT_EQ(road.count_in_log("Error retrieving information for RedirectDestination Address"),
              1u);
}

TEST(ISCSI_SAN, EndpointsOfSessionsAndTargets) {
    Road road({.scenario = SCENARIO});
    const auto initiators = road.enumerate("VLNMPCA_iSCSIProtocolEndpoint");
    ASSERT_EQ(initiators.size(), 4u); // of three ISIDs on the first port, one on the second
    expect_properties(initiators[0], {{"CreationClassName", "VLNMPCA_iSCSIProtocolEndpoint"},
                                      {"SystemCreationClassName", "CIM_ComputerSystem"},
                                      {"Name", "100002564C000002 i 0x400002560001"},
                                      {"Identifier", ISID_1},
                                      {"ConnectionType", "7"},
                                      {"Role", "2"}});
    EXPECT_EQ(text_of(initiators[3], "Name"), std::string(SECOND) + " i " + ISID_1);
    for (const char* association :
         {"VLNMPCA_SAPAvailableForISCSIEndpoint", "VLNMPCA_HostedISCSIAccesspoint",
          "VLNMPCA_SAPAvailableForEthernetPort", "VLNMPCA_iSCSIProtocolEndpointSAPImplementation",
          "VLNMPCA_iSCSIBindsToTCP"})
        EXPECT_EQ(count_of(road, association), 4u) << association;
    const auto ports = road.enumerate("VLNMPCA_SAPAvailableForEthernetPort");
    EXPECT_EQ(end_of(ports[3], "ManagedElement", "DeviceID"), SECOND);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSISessionEndpointOfNetworkPipe"), 7u);

    const auto targets = matching(road, "VLNMPCA_iSCSITargetProtocolEndpoint", "Name", ARRAY_A ":");
    ASSERT_EQ(targets.size(), 2u); // once for each port
    expect_properties(targets[0], {{"Name", ARRAY_A ":100002564C000002"},
                                   {"CreationClassName", "VLNMPCA_iSCSITargetProtocolEndpoint"},
                                   {"Identifier", "0x2"},
                                   {"Role", "3"}});
    EXPECT_EQ(text_of(targets[1], "Name"), std::string(ARRAY_A ":") + SECOND);
}

// Whoever asks first is shown the whole SAN: when refreshes leave it out, and while the scan of an
// FC port that comes before it goes slowly.
TEST(ISCSI_SAN, WhatJoinsTheAdapterPassWithTheSanWaitsForTheSan) {
    const std::string both = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "functions": [{"use": "nic"},
         {"use": "iscsi", "iscsiTargets": {"sessions": {}}},
         {"use": "fcoe", "targets": {"luns": 1}}]}]})";
    for (const char* association :
         {"VLNMPCA_SAPAvailableForEthernetPort", "VLNMPCA_iSCSIProtocolEndpointSAPImplementation",
          "VLNMPCA_iSCSIBindsToTCP"}) {
        Road left_out({.scenario = both});
        std::ofstream(left_out.root() / "etc/vorlan_mpca_provider.conf")
            << "VLN_PROVIDER_REFRESH_SANDATA = FALSE\n";
        EXPECT_EQ(count_of(left_out, association), 1u) << association;
        left_out.close();

        Road slow({.scenario = both});
        vlnsim_use_system_clock(); // on which a delay takes its time
        vlnsim_fault("HBA_GetFcpTargetMapping", VLNSIM_EVERY, VLNSIM_DELAY, 20000);
        EXPECT_EQ(count_of(slow, association), 1u) << association;
    }
}

// A login that is not through has no handle of the target's yet: the library's number tells two of
// them apart.
TEST(ISCSI_SAN, TwoSessionsInLoginOnOneTarget) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "functions": [{"use": "nic"}, {"use": "iscsi", "iscsiTargets": [
         {"sessions": {"count": 2, "isidQualifier": 1, "tsih": 0, "state": "loginInProgress"}},
         {}]}]}]})",
               .log = true});
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSISession"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_ISCSISessionStatistics"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSIConnection"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSITargetProtocolEndpoint"), 2u);
    road.close();
    EXPECT_EQ(road.faults_in_log(), "");
}

TEST(ISCSI_SAN, UnitsOfEveryTypeAndTheirPaths) {
    Road road({.scenario = SCENARIO});
    const struct {
        const char* unit;
        const char* path; // behind "VLNMPCA_iSCSIInitiatorTarget"
        const char* id;
        std::size_t paths;
    } rows[] = {
        {"VLNMPCA_TapeDrive", "TapeDrivePath", "0:1:" ARRAY_A ":1", 1},
        {"VLNMPCA_SCSIArbitraryLogicalUnit", "ArbitraryLogicalUnitPath", "0:2:" ARRAY_A ":2", 1},
        {"VLNMPCA_LogicalDisk", "LogicalDiskPath", "0:3:" ARRAY_A ":3", 1},
        {"VLNMPCA_StorageExtent", "StorageExtentPath", "0:4:" ARRAY_A ":4", 1},
        {"VLNMPCA_StorageVolume", "StorageVolumePath", "0:5:" ARRAY_A ":5", 1},
        // Seen by both ports; and over two sessions of one port.
        {"VLNMPCA_StorageVolume", "StorageVolumePath", "0:0:" ARRAY_A ":0", 2},
        {"VLNMPCA_StorageVolume", "StorageVolumePath", "1:2:" ARRAY_B ":300", 2},
        // No session that is usable; no session at all.
        {"VLNMPCA_StorageVolume", "StorageVolumePath", "2:1:iqn.2010-04.com.example:new:1", 0},
        {"VLNMPCA_StorageVolume", "StorageVolumePath", "129:0:iqn.2010-04.com.example:shelf-129:0",
         0},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(matching(road, row.unit, "DeviceID", row.id).size(), 1u) << row.id;
        std::size_t paths = 0;
        for (const auto& path :
             road.enumerate(std::string("VLNMPCA_iSCSIInitiatorTarget") + row.path))
            paths += end_of(path, "LogicalUnit", "DeviceID") == row.id;
        EXPECT_EQ(paths, row.paths) << row.id;
        const auto owned = road.enumerate(std::string(row.unit) + "SystemDevice");
        EXPECT_EQ(owned.size(), count_of(road, row.unit));
    }
    const auto volumes = matching(road, "VLNMPCA_StorageVolume", "DeviceID", "0:0:");
    expect_properties(volumes.at(0), {{"Name", "VORLAN:ISCSI ARRAY:A0000:0"},
                                      {"Description", "boot volume"},
                                      {"Capacity", "21474836480"},
                                      {"BlockSize", "512"},
                                      {"NumberOfBlocks", "41943040"}});
    const auto paths = road.enumerate("VLNMPCA_iSCSIInitiatorTargetStorageVolumePath");
    EXPECT_EQ(end_of(paths.back(), "Initiator", "Name"), std::string(SECOND) + " i " + ISID_1);
    EXPECT_EQ(end_of(paths.back(), "Target", "Name"), std::string(ARRAY_A ":") + SECOND);
    EXPECT_EQ(text_of(paths.back(), "OSDeviceName"), "/dev/sda");
}

TEST(ISCSI_SAN, UnitsThatAnswerBadlyOrNotAtAll) {
    Road road({.scenario = SCENARIO, .log = true});
    const auto volumes = matching(road, "VLNMPCA_StorageVolume", "DeviceID", "1:");
    ASSERT_EQ(std::count_if(volumes.begin(), volumes.end(),
                            [](const host::Instance& volume) {
                                return text_of(volume, "DeviceID").find(ARRAY_B) !=
                                       std::string::npos;
                            }),
              2); // of three units, the first of which does not answer
    EXPECT_EQ(text_of(volumes[0], "Name"), "VO\uFFFDL:SIMULATED UNIT:B5:5");
    road.close();
    EXPECT_EQ(road.count_in_log("Unable to get properties for LUN 3 for target " ARRAY_B), 1u);
    EXPECT_EQ(road.count_in_log("Texts of LUN 5 of target " ARRAY_B " are no UTF-8"), 1u);
}

TEST(ISCSI_SAN, MoreTargetsThanTheFirstTableHolds) {
    Road road({.scenario = SCENARIO});
    vlnsim_record_calls(1);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSITargetProtocolEndpoint"), 131u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSILocalHostedAccessPoint"), 131u);
    std::string rooms;
    for (std::size_t i = 0; i < vlnsim_recorded_calls(); ++i) {
        char call[512] = "";
        vlnsim_recorded_call(i, call, sizeof call);
        if (std::string(call).starts_with("AX_iSCSI_GetTargets"))
            rooms += std::string(call).substr(std::string(call).find("room=")) + ";";
    }
    EXPECT_EQ(rooms, "room=128 count=130;room=162 count=130;room=128 count=1;");
}

// What a failing call costs: instances of the whole host.
TEST(ISCSI_SAN, FailuresCostWhatTheyTouch) {
    const struct {
        const char* function;
        unsigned call;
        std::uint64_t status;
        std::size_t sessions, targets, volumes;
        const char* line;
    } rows[] = {
        {"AX_iSCSI_GetTargets", 1, 190, 1, 1, 1, "ERROR: GetiSCSITargets Failed."},
        {"AX_iSCSI_GetTargets", 2, 8, 1, 1, 1, "ERROR: GetiSCSITargets Failed."},
        {"AX_iSCSI_GetTargets", 3, 1, 8, 130, 133, "GetiSCSITargets failed"},
        {"AX_iSCSI_GetSessions", 2, 1, 2, 1, 1, "ERROR: AX_iSCSI_GetSessions() Failed."},
        {"AX_iSCSI_GetSessionInfo", 1, 1, 8, 131, 133,
         "Unable to list session information for session 0 (TSIH=1)."},
        {"AX_iSCSI_GetSessionInfo", 7, 1, 8, 131, 133,
         "Unable to list session information for session 0 (ISID Qualifier=1)."},
        {"AX_iSCSI_GetLuns", 2, 1, 9, 131, 131, "GetiSCSILuns failed for target " ARRAY_B},
        {"AX_iSCSI_GetLunProperties", 1, 1, 9, 131, 133,
         "Unable to get properties for LUN 0 for target " ARRAY_A},
    };
    for (const auto& row : rows) {
        Road road({.scenario = SCENARIO, .log = true});
        ASSERT_EQ(vlnsim_fault(row.function, row.call, VLNSIM_STATUS, row.status), 0);
        EXPECT_EQ(count_of(road, "VLNMPCA_iSCSISession"), row.sessions) << row.line;
        EXPECT_EQ(count_of(road, "VLNMPCA_iSCSITargetProtocolEndpoint"), row.targets) << row.line;
        EXPECT_EQ(count_of(road, "VLNMPCA_StorageVolume"), row.volumes) << row.line;
        road.close();
        EXPECT_EQ(road.count_in_log(row.line), 1u) << row.line;
    }
}

// A session that a store refuses costs no more than itself; the walk of a port ends at a target
// that one refuses. What stands stays, and so do the other ports.
TEST(ISCSI_SAN, ATargetThatIsListedTwiceEndsTheWalkOfItsPort) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "functions": [{"use": "nic"}, {"use": "iscsi"}], "ports": [
         {"iscsiTargets": [{"count": 2, "name": "iqn.2010-04.com.example:twice", "sessions": {}},
                           {"sessions": {}}]},
         {"iscsiTargets": {"count": 3}}]}]})",
               .log = true});
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSISession"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSITargetProtocolEndpoint"), 4u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSILocalHostedAccessPoint"), 4u);
    road.close();
    EXPECT_EQ(road.count_in_log("Insert Failed : m_VLNMPCA_iSCSITargetProtocolEndpoint_map for "
                                "Name = iqn.2010-04.com.example:twice:100002564C000002"),
              1u);
    EXPECT_EQ(road.count_in_log("GetiSCSITargets failed"), 1u);
    EXPECT_EQ(road.count_in_log("GetiSCSITargets succesful"), 1u);
}

TEST(ISCSI_SAN, ARefreshReplacesWhatIsSeen) {
    Road road({.scenario = SCENARIO, .log = true});
    const auto first = road.census();
    road.wait_for_refreshes(1);
    vlnsim_advance(11ull * 60 * 1000000);
    road.enumerate("VLNMPCA_iSCSISession"); // starts the refresh, and may still see the old stores
    road.wait_for_refreshes(2);
    EXPECT_EQ(road.census(), first);
}

// A port without an address has no TCP endpoint, and its sessions stand all the same.
TEST(ISCSI_SAN, SessionsStandWithoutTheEndsOfTheAdapterPass) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "functions": [{"use": "nic"}, {"use": "iscsi",
         "network": {"address": "0.0.0.0"}, "iscsiTargets": {"sessions": {"count": 2, "isidQualifier": 1}}}]}]})",
               .log = true});
    EXPECT_EQ(count_of(road, "VLNMPCA_TCPProtocolEndpoint"), 0u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSIBindsToTCP"), 0u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSIConnectionEndpointOfNetworkPipe"), 0u);
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSISession"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_NetworkPipeComposition"), 2u);
    EXPECT_EQ(count_of(road, "VLNMPCA_SAPAvailableForEthernetPort"), 1u); // they share an ISID
    EXPECT_EQ(count_of(road, "VLNMPCA_iSCSIInitiatorTargetStorageVolumePath"), 1u);
    road.close();
    EXPECT_EQ(road.count_in_log("Insert Failed : m_VLNMPCA_iSCSI"), 0u);
}

} // namespace
