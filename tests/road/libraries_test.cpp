// Hosts that lack a library, and hosts that lack adapters.
#include "tests/road/road.h"

using road::Road;

namespace {

std::string scenario_with(const std::string& libraries) {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "libraries": )" + libraries + R"(,
        "cards": [{"use": "cna", "ports": 2,
                   "functions": [{"use": "nic"}, {"use": "iscsi"}, {"use": "fcoe"}]}]})";
}

TEST(Libraries, WithoutAnyEveryEnumerationIsEmptyAtOnceAndTheLogSaysWhy) {
    Road road({.scenario = "no-adapters.json", .libraries = false});
    const std::uint64_t start = vlnsim_now();
    for (const char* name : {"VLNMPCA_EthernetPort", "VLNMPCA_Card", "VLNMPCA_StorageVolume"})
        EXPECT_TRUE(road.enumerate(name).empty());
    EXPECT_EQ(vlnsim_now(), start); // nothing slept
    road.close();
    EXPECT_EQ(road.count_in_log("dlopen failed :liblaxapi.so"), 1u);
    EXPECT_EQ(road.count_in_log("dlopen failed :libaxapi.so"), 1u);
    EXPECT_GE(road.count_in_log("Vorlan CIM Provider load failure"), 1u);
}

TEST(Libraries, TheFallbackServesAsWell) {
    Road road({.scenario = scenario_with(R"({"local": {"present": false}})"), .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 4u);
    road.close();
    EXPECT_EQ(road.count_in_log("Error : In Loading Library "), 1u);
}

TEST(Libraries, WithoutTheHbaApiThePortsAreThere) {
    Road road({.scenario = scenario_with(R"({"hba": {"present": false}})")});
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 4u);
}

TEST(Libraries, AFailingInitialisationIsReportedAndAnsweredWithNothing) {
    Road road;
    ASSERT_EQ(vlnsim_fault("AX_InitLib", VLNSIM_EVERY, VLNSIM_STATUS, 1), 0);
    EXPECT_TRUE(road.enumerate("VLNMPCA_EthernetPort").empty());
    road.close();
    EXPECT_GE(road.count_in_log("AX_InitLib failed with[1]"), 1u);
}

TEST(Adapters, AHostWithoutAnyIsScannedThreeTimesInTwoSeconds) {
    Road road({.scenario = "no-adapters.json"});
    const std::uint64_t start = vlnsim_now();
    EXPECT_TRUE(road.enumerate("VLNMPCA_Card").empty());
    EXPECT_EQ(vlnsim_now() - start, 2000000u);
    EXPECT_EQ(vlnsim_calls("AX_GetAllLocalHBAInstances"), 3u);
}

TEST(Adapters, StorageFunctionsWithoutANicStayUnseen) {
    Road road({.scenario = "no-nic.json"});
    EXPECT_TRUE(road.enumerate("VLNMPCA_Card").empty());
    EXPECT_EQ(road.enumerate("VLNMPCA_ProviderConfigSetting").size(), 3u);
}

} // namespace
