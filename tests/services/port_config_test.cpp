// The split of adapters into ports and functions, as a client sees and changes it.
#include "tests/road/properties.h"
#include "tests/services/changes.h"
#include "tests/services/texts.h"

using host::Value;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::expect_changes;
using services::inputs_of;

namespace {

constexpr const char* CURRENT = "VLN:Current Configuration:";
constexpr const char* PENDING = "VLN:Pending Configuration:";
constexpr const char* AVAILABLE = "VLN:Available Configuration:";
constexpr const char* PORT = "100002564C000000";
constexpr std::uint64_t MORE_THAN_THE_CACHE = 11ull * 60 * 1000000;

// Adapters that differ in what they allow: two ports; two that can be partitioned; one port; three.
constexpr const char* ADAPTERS = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
  "templates": {"orrigan": {"use": "cna", "functions": [{"use": "nic"}],
    "features": {"ProfileManagement": 1, "ProfileListing": 1}, "channelManagement": {},
    "profiles": {"active": 1, "list": [
      {"id": 1, "flags": 2, "name": "NIC"}, {"id": 16, "flags": 1}, {"id": 99, "flags": 1},
      {"id": 40, "flags": 2, "name": "NIC - ETS Disabled"}, {"id": 50, "name": "none"}]}}},
  "cards": [
  {"use": "orrigan", "portConfig": {"functionCount": 8, "ports": [{"count": 2, "functions": [
     {"can": ["NIC", "NIC+ROCE", "FCOE"], "mac": "02:56:4C:00:{port:02X}:00"},
     {"count": 4, "protocol": "NONE", "can": ["NIC", "NIC+ROCE", "ISCSI", "FCOE", "NONE"]},
     {"protocol": "NONE", "can": []}]}]}},
  {"use": "orrigan", "channelManagement": {"canPartition": true}, "multichannel": 3,
   "portConfig": {"flags": "concurrent", "ports": [{"count": 2, "functions": [
     {"can": ["NIC", "NIC+ROCE"]}, {"count": 3, "can": ["NIC", "NIC+ROCE", "ISCSI", "FCOE"]}]}]}},
  {"use": "orrigan", "portConfig": {"ports": [{"functions": [{}]}]}},
  {"use": "orrigan", "portConfig": {"ports": [{"count": 3, "functions": [{}]}]}}]})";

struct Row {
    const char* wanted; // properties, where P0 and P1 are the protocols of ports
    const char* line;
    bool done = false;
    unsigned call = 0; // of the function that fails
    const char* function = nullptr;
};

class Splits : public testing::Test {
protected:
    explicit Splits(const char* scenario = ADAPTERS) : road({.scenario = scenario, .log = true}) {
        road.enumerate("VLNMPCA_Chip");
        road.wait_for_refreshes(1);
    }

    host::Instance config(const char* kind, int card = 0) {
        return find(road, "VLNMPCA_PortConfigData", "InstanceID",
                    kind + std::string("VR10420") + std::to_string(117 + card) + ":00");
    }
    void expect(const host::Instance& instance, std::initializer_list<Row> rows) {
        for (const Row& row : rows) {
            if (row.function)
                vlnsim_fault(row.function, row.call, VLNSIM_STATUS, 190);
            expect_changes(
                road, instance,
                {{inputs_of(row.wanted), row.done ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND, row.line}});
        }
    }
    std::string sriov_state() {
        return text_of(find(road, "VLNMPCA_EthernetPort", "DeviceID", PORT), "SRIOVState");
    }

    Road road;
};

TEST_F(Splits, EachRuleHasItsLine) {
    expect(
        config(CURRENT),
        {{"P0=FCOE P1=NIC", "Invalid f0 parameter for port 0. Must be NIC or RoCE."},
         {"P0=NIC P1=ISCSI", "for port 1. Must be NIC, RoCE, or none. Port type: 2"},
         {"P0=NIC,FCOE P1=NIC+ROCE PID=16", "No storage functions can be specified on NIC+RoCE"},
         {"P0=NIC+ROCE P1=NIC PID=15",
          "For NIC+RoCE configuration, valid PID must be specified. :15"},
         {"P0=NIC+ROCE P1=NIC PID=100",
          "NIC+RoCE configuration, valid PID must be specified. :100"},
         {"P0=NIC P1=NIC", " For NIC only configuration, valid PID must be specified when SRIOV"},
         {"P0=NIC,FCOE P1=NIC PID=16", "storage configurations, PID must not be specified: 16"},
         {"P0=NIC,ISCSI,ISCSI P1=NIC", "ERROR: Ganged storage is not supported."},
         {"P0=NIC,NIC,NIC,NIC,NIC P1=NIC PID=1 MCType=2",
          "vNIC, the maximum functions per port = 4."},
         {"P0=NIC,NIC,NIC,NIC,NIC,NIC P1=NIC PID=1 MCType=3", " The NIC protocol is not supported"},
         {"P0=NIC,NIC,NIC,NIC,NIC,NIC+ROCE P1=NIC PID=16 MCType=3", " The RoCE protocol is not"},
         {"P0=NIC,NIC,NIC,NIC,NIC,ISCSI P1=NIC MCType=3", " The iSCSI protocol is not supported"},
         {"P0=NIC,NIC,NIC,NIC,NIC,FCOE P1=NIC MCType=3", " The FCoE protocol is not supported"},
         {"P0=NIC,NONE,NONE,NONE,NONE,NONE P1=NIC PID=1 MCType=5", " The NONE protocol is not"},
         {"P0=NIC,ISCSI,FCOE P1=NIC", " Concurrent mode not supported."},
         {"P0=NIC+ROCE P1=NIC PID=16 MCType=4", " NIC+RoCE is not suported when multi channel is"},
         {"P0=NIC,NIC P1=NIC PID=1", "Cannot configure more than one protocol in each port."},
         {"P0=NIC,NIC P1=NIC PID=1", "ValidateParams for SetAdapterPortConfig Failed"},
         {"P0=NIC,NIC P1=NIC PID=1", "::Set Adapter port config failure. Ax Error: [ 4 ]"},
         {"P0=NIC+ROCE P1=NIC PID=20", "Invalid PID. Does not support RoCE nor NIC only. "},
         {"P0=NIC P1=NIC PID=50", "Invalid PID. Does not support RoCE nor NIC only. "},
         {"P0=NIC,NIC P1=NIC PID=40 MCType=3", "NIC - ETS Disabled Configured"},
         {"P0=NIC+ROCE P1=NIC+ROCE PID=16", "Profie Id: 16", true},
         {"P0=nic+roce P1=Nic PID=99", "RoCE Enabled: 1, MC Enabled = 0, NIC Only = 0", true},
         {"P0=NIC,NONE,NONE,NONE,NONE,NONE P1=NIC PID=1 MCType=4", "MC Enabled = 1", true}});
    expect(config(CURRENT, 1), {{"P0=NIC,FCOE P1=NIC PID=0 MCType=0",
                                 "For NPAR adapters, if NPAR is disabled, the only "
                                 "supported protocols are NIC and NIC+ROCE"},
                                {"P0=NIC,ISCSI,FCOE P1=NIC", "Profie Id: 0", true}});
    expect(config(CURRENT, 2),
           {{"P0=NIC PID=1 MCType=2", "single port adapters, multichannel type cannot be vNIC."},
            {"P0=NIC PID=1", "No change in NPAR Ep mode", true}});
}

TEST_F(Splits, WhatAConsoleWritesIsChecked) {
    const std::string many =
        "P0=NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC,NIC "
        "P1=NIC PID=1";
    expect(config(CURRENT),
           {{"NumOfPorts=3", "Invalid MaxPorts passed: 3, The adapter doesnt support passed no of"},
            {"P0=NIC P1=NIC PID=1 MCType=6", "Invalid MC type passed."},
            {"P0=NIC P1=NIC PID=1 MaxFunctionCount=9", "Invalid MaxFunctionCount passed: 9"},
            {"P0=NIC P1=NIC PID=1 MaxFunctionCount=8", "No changes required in NPAR Ep mode", true},
            {"P0=NIC PID=1", "Invalid mi params "},
            {many.c_str(), "Invalid mi params "},
            {"P0=NIC P1=NIC,NICE PID=1", "Invalid Protocol type for function[1] of p1 "},
            {"P0=NIC P1=NIC PID=1 MaxFunctionCount=16", "Enabling NPAR Ep mode", true},
            {"P0=NIC P1=NIC PID=1 MaxFunctionCount=8", "Disabling NPAR Ep mode", true}});
    expect(config(CURRENT, 1),
           {{"P0=NIC P1=NIC PID=1 MaxFunctionCount=16",
             "NPAR Ep is not supported on this adapter. MaxFunctionCount = 0 "}});
    expect(config(CURRENT, 3), {{"P0=NIC P1=NIC PID=1", "Invalid maxPorts value params "}});
    expect(config(PENDING),
           {{"P0=NIC P1=NIC PID=1", "Passed instance is: VLN:Pending Configuration:VR10420117:00, "
                                    "Need to invoke mi on 'Current Configuration' instances."}});
    host::Instance unknown = config(CURRENT);
    host::set(unknown.path.keys, "InstanceID", Value::text("another"));
    host::set(unknown.properties, "InstanceID", Value::text("another"));
    expect(unknown, {{"P0=NIC P1=NIC PID=1", "Invalid instance of VLNMPCA_PortConfigData "}});
}

// The feature of profiles is asked for with each of the two readings, then by the steps.
TEST_F(Splits, ALibraryThatFailsEndsTheChange) {
    constexpr const char *GOOD = "P0=NIC P1=NIC PID=1",
                         *DIVIDED = "P0=NIC,NIC P1=NIC PID=1 MCType=3",
                         *NO_PROFILES =
                             "Unable to determine if adapter supports Profile Management.",
                         *NO_SRIOV = "Unable to determine if adapter supports SRIOV.";
    expect(config(CURRENT),
           {{GOOD, NO_PROFILES, false, 1, "AX_GetHBAFeature"},
            {GOOD, "AX_GetAdapterPortConfig error: 190", false, 2, "AX_GetAdapterPortConfig"},
            {GOOD, NO_PROFILES, false, 3, "AX_GetHBAFeature"},
            {GOOD, NO_SRIOV, false, 4, "AX_GetHBAFeature"},
            {GOOD, "Unable to determine if adapter supports channel management", false, 1,
             "AX_GetChannelMgmtCNAInfo"},
            {GOOD, "AX_ListProfiles error: 190", false, 1, "AX_ListProfiles"},
            {GOOD, "AX_SetAdapterPortConfig error: 190", false, 1, "AX_SetAdapterPortConfig"},
            {"P0=NIC P1=NIC PID=1 MaxFunctionCount=16",
             " Operation failure. SetAriFunctionCount failed.", false, 1, "AX_SetAriFuncs"},
            {DIVIDED, NO_SRIOV, false, 5, "AX_GetHBAFeature"}});
    road::set_value(PORT, "features", "Multichannel", "1");
    expect(config(CURRENT), {{DIVIDED, "Multichannel cannot be enabled if SRIOV is enabled."}});
    EXPECT_EQ(text_of(config(PENDING), "RebootRequired"), "FALSE");
}

TEST_F(Splits, TheProfileWithoutEtsTakesSriovWithIt) {
    const std::string before = sriov_state();
    road::set_value(PORT, "portAttributes", "SRIOVState", "1");
    expect(config(CURRENT), {{"P0=NIC P1=NIC PID=1", "Profie Id: 1", true}});
    EXPECT_EQ(sriov_state(), before) << "only that profile has it looked at";
    expect(config(CURRENT), {{"P0=NIC P1=NIC PID=40", "NIC - ETS Disabled Configured", true}});
    EXPECT_EQ(sriov_state(), "1");
}

struct Split_Cards : Splits {
    Split_Cards() : Splits("split-cards.json") {}
};

TEST_F(Split_Cards, AConfigurationIsInForceAfterAReboot) {
    expect_properties(config(CURRENT), {{"ConfigPort0", "{NIC, FCOE, NIC, NIC}"},
                                        {"MCType", "3"},
                                        {"PID", "0"},
                                        {"RebootRequired", "FALSE"},
                                        {"NumOfPorts", "2"},
                                        {"MaxFunctionCount", "8"},
                                        {"ConcurrentModeAllowed", "TRUE"},
                                        {"GangedModeAllowed", "FALSE"},
                                        {"FuncNumPort1", "{0, 2, 4, 5}"},
                                        {"MACAddrPort1", "{02-56-4c-00-01-00, 02-56-4c-00-01-02, "
                                                         "02-56-4c-00-01-04, 02-56-4c-00-01-05}"},
                                        {"ConfigPort2", "-"}});
    expect_properties(config(AVAILABLE),
                      {{"FuncProtocolsPort0", "{NONE,NIC,NIC+ROCE, NONE,NIC,ISCSI,FCOE,NIC+ROCE, "
                                              "NONE,NIC,NIC+ROCE, NONE,NIC,NIC+ROCE}"},
                       {"ConfigPort0", "-"},
                       {"MCType", "-"}});
    expect(config(CURRENT), {{"P0=NIC+ROCE,NIC P1=NIC+ROCE,NIC PID=16 MCType=0 MaxFunctionCount=16",
                              "Enabling NPAR Ep mode", true}});
    expect_properties(
        config(CURRENT),
        {{"ConfigPort0", "{NIC, FCOE, NIC, NIC}"}, {"MCType", "3"}, {"RebootRequired", "TRUE"}});
    expect_properties(config(PENDING), {{"ConfigPort0", "{NIC+ROCE, NIC, NONE, NONE}"},
                                        {"MCType", "0"},
                                        {"PID", "16"},
                                        {"RebootRequired", "TRUE"}});
    EXPECT_EQ(text_of(config(AVAILABLE), "MaxFunctionCount"), "16");
    vlnsim_reboot();
    vlnsim_advance(MORE_THAN_THE_CACHE);
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(2);
    expect_properties(config(CURRENT), {{"ConfigPort1", "{NIC+ROCE, NIC, NONE, NONE}"},
                                        {"MCType", "0"},
                                        {"PID", "16"},
                                        {"IPLMaxFunctionCount", "16"},
                                        {"RebootRequired", "FALSE"}});
}

TEST_F(Split_Cards, ProfilesAndPersonalitiesHangOnTheirChips) {
    const auto chips = road.enumerate("VLNMPCA_Chip");
    ASSERT_EQ(chips.size(), 3u);
    const auto profiles = road::walk(road, chips[0], "VLNMPCA_ElementPIDData");
    ASSERT_EQ(profiles.size(), 4u);
    expect_properties(profiles[1], {{"InstanceID", "VLN:MPCA PIDData:VR10420117:00:16"},
                                    {"PIDNumbers", "{16}"},
                                    {"PIDDescriptions", "{RoCE for Linux}"},
                                    {"PIDRoCE", "{TRUE}"},
                                    {"PIDNICOnly", "{FALSE}"},
                                    {"ActivePID", "0"},
                                    {"ConfiguredPID", "0"}});
    EXPECT_EQ(road::walk(road, chips[0], "VLNMPCA_ElementPortConfigData").size(), 3u);
    EXPECT_EQ(road::walk(road, chips[1], "VLNMPCA_ElementPortConfigData").size(), 0u);
    const auto personality = road::walk(road, chips[2], "VLNMPCA_ElementPersonalityData");
    ASSERT_EQ(personality.size(), 1u);
    EXPECT_EQ(text_of(personality[0], "Value"), "NIC");
    const auto links = road.enumerate("VLNMPCA_ElementSupportedPersonalitiesData");
    ASSERT_EQ(links.size(), 3u);
    for (std::size_t i = 0; i < links.size(); ++i)
        EXPECT_EQ(text_of(links[i], "IsCurrent"), i == 0 ? "1" : "2");
    EXPECT_EQ(road::walk(road, road.enumerate("VLNMPCA_ChannelMgmtService").at(0),
                         "VLNMPCA_ChannelMgmtServiceElementSettingData")
                  .size(),
              6u);
}

} // namespace
