// Data centre bridging, as a client sees and changes it.
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::Change;
using services::expect_changes;

namespace {

// The ports of one card, each with a function of what the port is for.
enum Port {
    CNA,         // FCoE is alone in group 1
    NIC,         // and nothing else
    ONLY_FCOE,   // with one priority under flow control at the most
    ONLY_ISCSI,  // in the group of all others
    MANY_GROUPS, // three
    UNLIMITED,   // priority 6 has no limit
    QUIET,       // sends no LLDP frames
    ROCE,        // on a card without bandwidths
    FOLLOWER,    // of its switch
};

std::string scenario() {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [{"use": "cna",
      "functions": [{"use": "nic"}], "ports": [
        {},
        {"features": {"FCoE": 0, "iSCSI": 0, "DataCentreBridging": 0}},
        {"features": {"iSCSI": 0, "DataCentreBridging": 0}},
        {"features": {"FCoE": 0, "DataCentreBridging": 0}},
        {"bridging": {"configured": {"groups": {"0": [0, 1, 2, 4, 5], "2": [6, 7]}}}},
        {"bridging": {"configured": {"groups": {"0": [0, 1, 2, 4, 5, 7], "15": [6]}}}},
        {"bridging": {"dcbx": {"state": 0}, "lldp": {"txState": 0, "rxState": 2}}},
        {"features": {"RoCE": 1, "PriorityGroupBandwidth": 0}},
        {"bridging": {"configured": {"pg": {"willing": 1, "error": 2}}, "switch": {"flowControl": 24,
            "groups": {"0": [0, 1, 2, 5, 6, 7], "1": [3, 4], "9": [2]}, "bandwidth": [25, 75],
            "pfc": {"enabled": 7, "syncd": 0}}}}
      ]}]})";
}

std::string device(Port port) {
    const std::string number = "0" + std::to_string(port);
    return "100002564C00" + number + number;
}

class Bridging : public testing::Test {
protected:
    host::Instance groups(Port port, const char* kind = "Configured") {
        return find(road, "VLNMPCA_PGData", "InstanceID",
                    std::string(kind) + ":VLNMPCA_PGData:" + device(port));
    }
    host::Instance exchange(Port port) {
        return find(road, "VLNMPCA_DcbxLldpData", "ElementName", device(port));
    }
    void expect(Port port, std::initializer_list<Change> changes) {
        expect_changes(road, groups(port), changes);
    }

    Road road{{.scenario = scenario(), .log = true}};
};

Value number(std::uint32_t value) {
    return services::number(CMPI_uint32, value);
}

Value list(std::initializer_list<std::uint32_t> values) {
    Value::Array elements;
    for (const std::uint32_t value : values)
        elements.push_back(number(value));
    return Value::array(CMPI_uint32, std::move(elements));
}

Value word(const char* text) {
    return Value::text(text);
}

// One property is changed.
Change set(const char* property, const Value& value, CMPIrc status, const char* line,
           const services::Fault& fault = {}) {
    return {{{property, value}}, status, line, fault};
}

constexpr CMPIrc OK = CMPI_RC_OK, INVALID = CMPI_RC_ERR_INVALID_PARAMETER,
                 FAILED = CMPI_RC_ERR_FAILED;

// ---- What is shown ----

TEST_F(Bridging, APortShowsWhatIsConfiguredAndWhatItsSwitchProvides) {
    expect_properties(groups(FOLLOWER), {{"FCoEPriority", "3"},
                                         {"iSCSIPriority", "4"},
                                         {"RoCePriority", "-"},
                                         {"PFCPriority", "{3}"},
                                         {"MaxSupportedPG", "4"},
                                         {"PriorityGroupTwo", "{3}"},
                                         {"PriorityGroupFifteen", "{}"},
                                         {"PriorityBandwidth", "{50, 50, 0, 0, 0, 0, 0, 0}"},
                                         {"PGEnabled", "Enabled"},
                                         {"PGError", "Unknown"},
                                         {"PFCEnabled", "Yes"},
                                         {"iSCSIPriorityAdvertise", "Yes"}});
    expect_properties(groups(FOLLOWER, "Active"),
                      {{"PFCPriority", "{3, 4}"},
                       {"PriorityGroupOne", "{0, 1, 2, 5, 6, 7}"},
                       {"PriorityGroupTwo", "{3, 4}"},
                       {"PriorityBandwidth", "{25, 75, 0, 0, 0, 0, 0, 0}"},
                       {"PFCEnabled", "Unknown"},
                       {"PFCSyncd", "No"}});
    EXPECT_GE(road.count_in_log("switch error: pgindex range is 0 to 7. came for 9"), 1u);
    expect_properties(exchange(QUIET), {{"DCBXState", "Disabled"},
                                        {"DCBXMaximumVersion", "1"},
                                        {"LLDPtxState", "Disabled"},
                                        {"LLDPrxState", "Unknown"},
                                        {"LLDPtxSysCap", "Enabled"}});
    EXPECT_EQ(road.count_in_log("CreateCeeClasses failed with"), 0u);
}

TEST(Bridging_Instances, FunctionsOfOnePortShareWhatIsExchanged) {
    Road road({.scenario = "two-port-cna.json", .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_PGData").size(), 12u);
    EXPECT_EQ(road.enumerate("VLNMPCA_DcbxLldpData").size(), 2u);
    EXPECT_EQ(road.count_in_log("Concurrent mode and instance is already created"), 4u);
    for (const host::Instance& link : road.enumerate("VLNMPCA_PortControllerPGData")) {
        const std::string id = end_of(link, "SettingData", "InstanceID");
        EXPECT_EQ(text_of(link, "IsCurrent"), id.starts_with("Active") ? "1" : "2") << id;
        // The last digits are port and function.
        EXPECT_EQ(end_of(link, "ManagedElement", "DeviceID").back(), id[id.size() - 3]);
    }
    const auto drivers = road.enumerate("VLNMPCA_CEEServiceAffectsDriver");
    EXPECT_EQ(end_of(drivers.at(1), "AffectedElement", "InstanceID"),
              "VLN FCoE: Driver vlnfcoe v10.2.261.5");
}

// A port that cannot be read drops out alone, until it can.
TEST(Bridging_Instances, APortThatCannotBeReadHasNoSettings) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/two-port-cna.json", "faults": [
                 {"function": "AX_CNA_GetCEE_Params", "call": 1, "status": 190}]})",
               .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_PGData").size(), 10u);
    EXPECT_EQ(road.enumerate("VLNMPCA_DcbxLldpData").size(), 2u);
    EXPECT_EQ(road.count_in_log("CreateCeeClasses failed with 190"), 1u);
    const host::Instance data = road.enumerate("VLNMPCA_PGData").at(0);
    EXPECT_TRUE(road.manager().modify(data, {{}}).ok());
    EXPECT_EQ(road.enumerate("VLNMPCA_PGData").size(), 12u);
}

// ---- Priorities of applications ----

TEST_F(Bridging, EachRefusalOfAPriorityHasItsLine) {
    const auto fcoe = [](std::uint32_t value, CMPIrc status, const char* line,
                         const services::Fault& fault = {}) {
        return set("FCoEPriority", number(value), status, line, fault);
    };
    const char* const unknown = "ERROR: Unable to determine port type.";
    const char* const fcoe_failed =
        "VLN_MethodWrapper::vlncimSetCEEParams call for FCoEPriority failed";
    expect(NIC,
           {fcoe(5, FAILED, "ERROR: Cannot set DCB parameters on NIC adapters."),
            fcoe(5, FAILED, fcoe_failed), fcoe(5, FAILED, unknown, {"AX_GetHBAFeature", 190})});
    expect(CNA, {fcoe(8, FAILED, "\nERROR: FCoE priority valid range is 0 to 7\n"),
                 set("iSCSIPriority", number(4000000000), FAILED,
                     "\nERROR: iSCSI priority valid range is 0 to 7\n"),
                 set("iSCSIPriority", number(8), FAILED,
                     "VLN_MethodWrapper::vlncimSetCEEParams call for iSCSIPriority failed"),
                 set("RoCePriority", number(1), FAILED,
                     "ERROR:- Setting RoCE Priority on NON ROCE Port not allowed"),
                 fcoe(3, OK, "PriorityGroup and pfc are not modified."),
                 fcoe(5, FAILED, "ERROR: SetCeeParam failed: Unable to get DCBX state",
                      {"AX_CNA_GetCEE_Params", 190}),
                 fcoe(5, FAILED, fcoe_failed, {"AX_CNA_SetPGPriorityBitmaps", 190}),
                 fcoe(5, FAILED, "Setting DCB Params failed with code 4", {"AX_CNA_GetTLV", 4})});
    expect(ONLY_ISCSI,
           {fcoe(5, FAILED, "ERROR:- Setting FCoE Priority on NON FCoE Port not allowed")});
    expect(ONLY_FCOE, {set("iSCSIPriority", number(5), FAILED,
                           "ERROR:- Setting iSCSI Priority on NON iSCSI Port not allowed")});
    expect(
        MANY_GROUPS,
        {fcoe(5, FAILED, "ERROR: More than 2 priority groups have priorities."),
         fcoe(5, FAILED, "Use 'Setceepriority' command to correct the priority group information."),
         {{{"iSCSIPriority", number(5)}, {"ValidateRule", number(0)}},
          FAILED,
          "ERROR: More than 2 priority groups have priorities."},
         {{{"FCoEPriority", number(5)}, {"ValidateRule", number(0)}}, OK, "ValidateRule = 0"}});
    expect_properties(groups(MANY_GROUPS),
                      {{"FCoEPriority", "5"}, {"PriorityGroupTwo", "{3}"}, {"PFCPriority", "{3}"}});
    expect(ROCE, {set("RoCePriority", number(2), FAILED,
                      "vlncimSetCEEParams call for RoCePriority failed"),
                  set("RoCePriority", number(1), OK,
                      "Note: This setting will only be used when not provided by the switch.")});
    EXPECT_EQ(text_of(groups(ROCE), "RoCePriority"), "1");
}

// Two groups change places where both priorities have one.
TEST_F(Bridging, GroupsFollowAPriority) {
    expect(CNA, {set("FCoEPriority", number(5), OK,
                     "New fcoepriority is assigned to priority group 1.\n")});
    expect_properties(groups(CNA, "Active"), {{"FCoEPriority", "5"},
                                              {"PFCPriority", "{5}"},
                                              {"PriorityGroupOne", "{0, 1, 2, 3, 4, 6, 7}"},
                                              {"PriorityGroupTwo", "{5}"}});
    // The groups stay where flow control alone follows.
    expect(CNA, {set("iSCSIPriority", number(5), OK, "DCB parameter successfully set."),
                 set("FCoEPriority", number(3), OK,
                     "ERROR: Failed to enable pfcpriority, required for new fcoepriority.\n",
                     {"AX_CNA_SetPFC", 190})});
    expect_properties(groups(CNA), {{"PFCPriority", "{5}"}, {"PriorityGroupTwo", "{3}"}});
    // What has no limit leaves its group; on the way there the adapter refuses a state.
    expect(
        UNLIMITED,
        {set("FCoEPriority", number(6), OK,
             "ERROR: Unable to modify priority group information required for new fcoepriority.")});
    EXPECT_EQ(road.count_in_log("New fcoepriority is assigned to priority group 1."), 3u);
    expect_properties(groups(UNLIMITED), {{"PriorityGroupOne", "{0, 1, 2, 3, 4, 5, 7}"},
                                          {"PriorityGroupTwo", "{6}"},
                                          {"PriorityGroupFifteen", "{}"},
                                          {"FCoEPriority", "6"}});
    // For iSCSI alone nothing is under flow control.
    expect(ONLY_ISCSI, {set("iSCSIPriority", number(3), OK,
                            "Warning: Update priority group priorities, if necessary.\n")});
    expect_properties(groups(ONLY_ISCSI), {{"iSCSIPriority", "3"}, {"PFCPriority", "{3}"}});
}

// What was written stays, and the instances show it.
TEST_F(Bridging, AChangeThatFailsPartWayIsReadBack) {
    expect(CNA, {set("FCoEPriority", number(5), FAILED, "Setting DCB Params failed with code 190",
                     {"AX_CNA_SetTLV", 190})});
    expect_properties(groups(CNA), {{"FCoEPriority", "3"}, {"PriorityGroupTwo", "{5}"}});
    expect(CNA, {{{{"FCoEPriority", number(6)}, {"PFCPriority", list({5, 6, 7})}},
                  FAILED,
                  "Max two pfc priority are supported"}});
    expect_properties(groups(CNA, "Active"), {{"FCoEPriority", "6"}, {"PFCPriority", "{6}"}});
    expect_changes(road, exchange(CNA),
                   {{{{"DCBXState", word("Disabled")}, {"LLDPtxState", word("Off")}},
                     INVALID,
                     "Invalid state, supported states are Enabled and Disabled"}});
    expect_properties(exchange(CNA), {{"DCBXState", "Disabled"}, {"LLDPtxState", "Enabled"}});
}

// ---- Groups, bandwidths, flow control ----

TEST_F(Bridging, EachRefusalOfGroupsHasItsLine) {
    const Value all = list({0, 1, 2, 4, 5, 6, 7});
    const char* const failed = "VLNMPCA_PGData_Provider::vlncimSetCeePriority call failed";
    const Value::Array many(100'000, number(1));
    expect(NIC, {set("PFCPriority", list({4}), FAILED,
                     "ERROR: Priority groups not supported on NIC adapters.")});
    expect(ONLY_FCOE, {set("PFCPriority", list({3, 4}), FAILED,
                           "ERROR: Only one PFC priority can be configured on this adapter.")});
    expect(ONLY_ISCSI, {set("PFCPriority", list({}), FAILED,
                            "ERROR: Invalid Priority. \niSCSI Priority and non-iSCSI Priorities "
                            "cannot be assigned to the same priority group.")});
    expect(CNA, {set("PFCPriority", list({5}), FAILED, "ERROR: Unable to get PG settings.",
                     {"AX_CNA_GetCEE_Params", 190}),
                 {{{"PriorityGroupThree", list({5})},
                   {"PriorityGroupFour", list({6})},
                   {"PriorityGroupEight", list({7})}},
                  FAILED,
                  "ERROR: Only 4 priority groups can be configured on this adapter."},
                 set("PFCPriority", list({1, 2, 3}), FAILED, "Max two pfc priority are supported"),
                 set("PriorityGroupTwo", list({3, 300}), FAILED,
                     "ERROR: Invalid priority in priority group 1. Valid range is 0 to 7"),
                 {{{"PriorityGroupFifteen", Value::array(CMPI_uint32, many)}},
                  INVALID,
                  "Invalid PriorityGroup, too many priorities are given"},
                 set("PriorityGroupTwo", list({3, 4}), FAILED,
                     "ERROR: Invalid Priority. \nFCoE Priority and non-FCoE Priorities cannot be "
                     "assigned to the same priority group."),
                 set("PFCPriority", list({3, 5}), FAILED,
                     "ERROR: A PGID's priorities must be PFC priority or non-PFC priorities"),
                 set("PriorityGroupThree", list({7}), FAILED,
                     "ERROR: Priority groups 0 and 2 have same priority"),
                 set("PriorityGroupFifteen", list({7}), FAILED,
                     "ERROR: Priority groups 0 and 15 have same priority"),
                 set("PriorityGroupOne", list({0, 1}), FAILED,
                     "ERROR: Unable to set priority group priorities."),
                 {{{"PriorityGroupThree", list({7})}, {"ValidateRule", number(0)}}, FAILED, failed},
                 set("PFCPriority", list({}), FAILED, "ERROR: Unable to set pfcpriority.",
                     {"AX_CNA_SetPFC", 190}),
                 {{{"PriorityGroupOne", all}, {"PFCPriority", list({3})}},
                  OK,
                  "PriorityGroup and pfc are not modified."},
                 {{{"PriorityGroupOne", list({0, 1, 2, 5, 6, 7})},
                   {"PriorityGroupTwo", list({3, 4})},
                   {"ValidateRule", number(0)}},
                  OK,
                  "ValidateRule = 0"}});
    expect_properties(groups(CNA), {{"PriorityGroupTwo", "{3, 4}"}, {"PFCPriority", "{3}"}});
    testing::internal::CaptureStdout();
    expect(CNA, {set("PFCPriority", list({8}), FAILED, failed)});
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              "\nERROR: Invalid PFC priority. Valid range is 0 to 7");
    EXPECT_EQ(road.count_in_log("ERROR: Invalid PFC priority."), 0u);
}

TEST_F(Bridging, BandwidthsAddUpAndFlowControlIsSwitched) {
    const auto share = [](std::initializer_list<std::uint32_t> values, CMPIrc status,
                          const char* line, const services::Fault& fault = {}) {
        return set("PriorityBandwidth", list(values), status, line, fault);
    };
    const char* const eight = "Invalid PriorityBandwidth data, Should be array of 8 elements";
    const char* const failed = "VLNMPCA_PGData_Provider::vlncimSetPgBW call failed";
    const auto equal = {13u, 13u, 13u, 13u, 12u, 12u, 12u, 12u};
    expect(CNA, {share({100}, INVALID, eight), share({}, INVALID, eight),
                 share({0, 0, 0, 0, 0, 0, 0, 101}, INVALID,
                       "Invalid PriorityBandwidth, Element Value Should be b/w 0 - 100"),
                 share({50, 49, 0, 0, 0, 0, 0, 0}, FAILED,
                       "ERROR: Invalid bandwidth values. All bandwidths must add up to 100"),
                 share(equal, FAILED, failed, {"AX_GetHBAFeature", 190}),
                 share(equal, FAILED,
                       "ERROR: Priority groups are not supported on the specified adapter.",
                       {"AX_GetHBAFeature", 1}),
                 share(equal, FAILED, "ERROR: Setting of bandwidth failed",
                       {"AX_CNA_GetPGPriorityBitmaps", 190}),
                 share(equal, FAILED, "", {"AX_CNA_SetPGBandwidth", 1}),
                 share(equal, OK, "Successfully set priority group bandwidths."),
                 set("PFCEnabled", word("yes"), INVALID, "Invalid PFCEnabled"),
                 set("PFCEnabled", word("No"), OK, "DCB parameter successfully set.")});
    expect_properties(
        groups(CNA, "Active"),
        {{"PriorityBandwidth", "{13, 13, 13, 13, 12, 12, 12, 12}"}, {"PFCEnabled", "No"}});
    expect(ROCE, {share(equal, FAILED,
                        "ERROR: Priority groups are not supported on the specified adapter.")});
    expect(ONLY_ISCSI, {set("PFCEnabled", word("No"), FAILED,
                            "ERROR: Cannot set PFC parameters on a NIC or iSCSI port.")});
}

TEST_F(Bridging, OnlyWhatIsConfiguredIsModified) {
    expect_changes(road, groups(CNA, "Active"),
                   {set("FCoEPriority", number(5), INVALID,
                        "modify_instance is supported only on Configured instance")});
    const auto rename = [](host::Instance instance) {
        host::set(instance.path.keys, "InstanceID", word("other"));
        host::set(instance.properties, "InstanceID", word("other"));
        return instance;
    };
    expect_changes(road, rename(groups(CNA)),
                   {{{}, INVALID, "Invalid instance of VLNMPCA_PGData Data"}});
    expect_changes(road, rename(exchange(CNA)),
                   {{{}, INVALID, "Invalid instance of VLNMPCA_DcbxLldpData Data"}});
}

// ---- What is exchanged, and the throttle ----

TEST_F(Bridging, StatesAreSetInTheirOrder) {
    expect_changes(road, exchange(QUIET),
                   {set("DCBXState", word("Enabled"), INVALID,
                        "ERROR: Cannot enable dcbxstate when transmit(txstate) is disabled."),
                    {{{"DCBXState", word("Enabled")}, {"LLDPtxState", word("Enabled")}},
                     INVALID,
                     "VLN_MethodWrapper::vlncimSetCEEParams call for dcbxstate failed"},
                    set("LLDPtxSysDesc", word("Disabled"), INVALID,
                        "ERROR: Cannot set transmit properties when transmit state is disabled."),
                    set("LLDPtxPortDesc", word("disabled"), INVALID, "Invalid state"),
                    {{{"LLDPtxState", word("Ena")}, {"LLDPtxSysName", word("Dis, for now")}},
                     OK,
                     "DCB parameter successfully set."},
                    {{{"DCBXState", word("Enabled")}, {"LLDPrxState", word("Enabled")}}, OK, ""}});
    expect_properties(exchange(QUIET), {{"DCBXState", "Enabled"},
                                        {"LLDPtxState", "Enabled"},
                                        {"LLDPrxState", "Enabled"},
                                        {"LLDPtxSysDesc", "Enabled"},
                                        {"LLDPtxSysName", "Disabled"}});
    expect_changes(road, exchange(QUIET),
                   {set("LLDPrxState", word("Disabled"), INVALID,
                        "ERROR: Cannot (disable or be disabled) rxstate when DCBX is enabled."),
                    set("LLDPtxSysCap", word("Disabled"), INVALID,
                        "VLN_MethodWrapper::vlncimSetCEEParams call for txsyscap failed",
                        {"AX_CNA_SetLldp", 190})});
}

TEST(Bridging_Throttle, IsSwitchedByTheFirstTwoLetters) {
    Road road({.scenario = "fcoe-pair.json", .log = true});
    const host::Instance throttle = road.enumerate("VLNMPCA_PFCThrottle").at(0);
    const auto turn = [](const char* text, CMPIrc status, const char* line,
                         const services::Fault& fault = {}) {
        return set("PFCThrottle", word(text), status, line, fault);
    };
    expect_changes(road, throttle,
                   {turn("Enable", INVALID, "Invalid PFCThrottle"),
                    turn("d", INVALID, "Invalid PFCThrottle"),
                    turn("disable", FAILED, "VLN_MethodWrapper::SetPfcThrottle failed",
                         {"AX_SetAdapterAttribute", 190}),
                    turn("di", OK, "Setting PFCThrottle to disable")});
    EXPECT_EQ(text_of(road.manager().get(throttle.path).value, "PFCThrottle"), "disabled");
    expect_changes(road, throttle, {{{}, OK, ""}, turn("energy", OK, "PFC throttle has been set")});
    EXPECT_EQ(text_of(road.manager().get(throttle.path).value, "PFCThrottle"), "enabled");
}

} // namespace
