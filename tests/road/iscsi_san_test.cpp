// The SAN behind iSCSI ports: who waits for it, and what goes wrong on the way to it. How it is
// shown stands in shown/iscsi-sessions.md.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

#include <fstream>

using road::expect_counts;
using road::expect_lines;
using road::Road;

namespace {

constexpr char SCENARIO[] = "iscsi-sessions.json";
#define ARRAY_A "iqn.2010-04.com.example:array-a"
#define ARRAY_B "iqn.2010-04.com.example:array-b"

// Whoever asks first is shown the whole SAN: when refreshes leave it out, and while the scan of an
// FC port that comes before it goes slowly.
TEST(ISCSI_SAN, WhatJoinsTheAdapterPassWithTheSanWaitsForTheSan) {
    const std::string both = road::card(R"({"use": "nic"},
        {"use": "iscsi", "iscsiTargets": {"sessions": {}}}, {"use": "fcoe", "targets": {"luns": 1}})");
    for (const char* association :
         {"VLNMPCA_SAPAvailableForEthernetPort", "VLNMPCA_iSCSIProtocolEndpointSAPImplementation",
          "VLNMPCA_iSCSIBindsToTCP"}) {
        Road left_out({.scenario = both});
        std::ofstream(left_out.root() / "etc/vorlan_mpca_provider.conf")
            << "VLN_PROVIDER_REFRESH_SANDATA = FALSE\n";
        expect_counts(left_out, {{association, 1}});
        left_out.close();

        Road slow({.scenario = both});
        vlnsim_use_system_clock(); // on which a delay takes its time
        vlnsim_fault("HBA_GetFcpTargetMapping", VLNSIM_EVERY, VLNSIM_DELAY, 20000);
        expect_counts(slow, {{association, 1}});
    }
}

// A login that is not through has no handle of the target's yet: the library's number tells two of
// them apart.
TEST(ISCSI_SAN, TwoSessionsInLoginOnOneTarget) {
    Road road({.scenario = road::card(R"({"use": "nic"}, {"use": "iscsi", "iscsiTargets": [
        {"sessions": {"count": 2, "isidQualifier": 1, "tsih": 0, "state": "loginInProgress"}}, {}]})"),
               .log = true});
    expect_counts(road, {{"VLNMPCA_iSCSISession", 2},
                         {"VLNMPCA_ISCSISessionStatistics", 2},
                         {"VLNMPCA_iSCSIConnection", 2},
                         {"VLNMPCA_iSCSITargetProtocolEndpoint", 2}});
    road.close();
    EXPECT_EQ(road.faults_in_log(), "");
}

// And units that do not answer, or answer badly.
TEST(ISCSI_SAN, MoreTargetsThanTheFirstTableHolds) {
    Road road({.scenario = SCENARIO, .log = true});
    vlnsim_record_calls(1);
    road::find(road, "VLNMPCA_StorageVolume", "Name", "VO\uFFFDL:SIMULATED UNIT:B5:5");
    std::string rooms;
    for (std::size_t i = 0; i < vlnsim_recorded_calls(); ++i) {
        char call[512] = "";
        vlnsim_recorded_call(i, call, sizeof call);
        if (std::string(call).starts_with("AX_iSCSI_GetTargets"))
            rooms += std::string(call).substr(std::string(call).find("room=")) + ";";
    }
    EXPECT_EQ(rooms, "room=128 count=130;room=162 count=130;room=128 count=1;");
    expect_lines(road, {{"Unable to get properties for LUN 3 for target " ARRAY_B, 1},
                        {"Texts of LUN 5 of target " ARRAY_B " are no UTF-8", 1},
                        {"Error retrieving information for iSNS Server", 1},
                        {"Error retrieving information for RedirectDestination Address", 1}});
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
        SCOPED_TRACE(row.line);
        Road road({.scenario = SCENARIO, .log = true});
        vlnsim_fault(row.function, row.call, VLNSIM_STATUS, row.status);
        expect_counts(road, {{"VLNMPCA_iSCSISession", row.sessions},
                             {"VLNMPCA_iSCSITargetProtocolEndpoint", row.targets},
                             {"VLNMPCA_StorageVolume", row.volumes}});
        expect_lines(road, {{row.line, 1}});
    }
}

// A session that a store refuses costs no more than itself; the walk of a port ends at a target
// that one refuses. What stands stays, and so do the other ports.
TEST(ISCSI_SAN, ATargetThatIsListedTwiceEndsTheWalkOfItsPort) {
    Road road({.scenario = road::card(R"({"use": "nic"}, {"use": "iscsi"})", R"("ports": [
        {"iscsiTargets": [{"count": 2, "name": "iqn.2010-04.com.example:twice", "sessions": {}},
                          {"sessions": {}}]},
        {"iscsiTargets": {"count": 3}}], )"),
               .log = true});
    expect_counts(road, {{"VLNMPCA_iSCSISession", 2},
                         {"VLNMPCA_iSCSITargetProtocolEndpoint", 4},
                         {"VLNMPCA_iSCSILocalHostedAccessPoint", 4}});
    expect_lines(road, {{"Insert Failed : m_VLNMPCA_iSCSITargetProtocolEndpoint_map for "
                         "Name = iqn.2010-04.com.example:twice:100002564C000002",
                         1},
                        {"GetiSCSITargets failed", 1},
                        {"GetiSCSITargets succesful", 1}});
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
    Road road({.scenario = road::card(R"({"use": "nic"}, {"use": "iscsi",
        "network": {"address": "0.0.0.0"}, "iscsiTargets": {"sessions": {"count": 2, "isidQualifier": 1}}})"),
               .log = true});
    expect_counts(road, {{"VLNMPCA_TCPProtocolEndpoint", 0},
                         {"VLNMPCA_iSCSIBindsToTCP", 0},
                         {"VLNMPCA_iSCSIConnectionEndpointOfNetworkPipe", 0},
                         {"VLNMPCA_iSCSISession", 2},
                         {"VLNMPCA_NetworkPipeComposition", 2},
                         {"VLNMPCA_SAPAvailableForEthernetPort", 1}, // they share an ISID
                         {"VLNMPCA_iSCSIInitiatorTargetStorageVolumePath", 1}});
    expect_lines(road, {{"Insert Failed : m_VLNMPCA_iSCSI", 0}});
}

} // namespace
