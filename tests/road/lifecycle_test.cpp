// Hosts that lack a library or adapters, and the ageing of what was read.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::expect_counts;
using road::expect_lines;
using road::Road;

namespace {

constexpr std::uint64_t MINUTE = 60ull * 1000000;

unsigned long scans() {
    return vlnsim_calls("AX_GetLocalHBAInfoV4");
}

// The time-out is a setting, which counts from the next decision to refresh on.
TEST(Lifecycle, DataIsReadOnceUntilTheCacheTimesOut) {
    Road road({.log = true});
    std::size_t refreshes = 0;
    const auto look = [&] {
        road.enumerate("VLNMPCA_Card"); // starts a refresh, and may still see the old stores
        road.wait_for_refreshes(++refreshes);
    };
    look();
    const unsigned long first = scans();
    ASSERT_GT(first, 0u);
    vlnsim_advance(10 * MINUTE - 1000000);
    road.enumerate("VLNMPCA_Card");
    EXPECT_EQ(scans(), first);
    vlnsim_advance(2 * 1000000);
    look();
    EXPECT_EQ(scans(), 2 * first);
    host::Instance setting = road.enumerate("VLNMPCA_ProviderConfigSetting").at(0);
    host::set(setting.properties, "current", host::Value::unsigned_number(CMPI_uint32, 1));
    EXPECT_TRUE(road.manager().modify(setting).ok());
    vlnsim_advance(MINUTE + 1000000);
    look();
    EXPECT_EQ(scans(), 3 * first);
    expect_lines(road, {{"Cache time-out is modified successfully", 1}});
}

std::string scenario_with(const std::string& libraries) {
    std::string text =
        road::card(R"({"use": "nic"}, {"use": "iscsi"}, {"use": "fcoe"})", R"("ports": 2, )");
    return text.insert(1, R"("libraries": )" + libraries + ", ");
}

TEST(Libraries, WithoutAnyEveryEnumerationIsEmptyAtOnceAndTheLogSaysWhy) {
    Road road({.scenario = "no-adapters.json", .libraries = false});
    const std::uint64_t start = vlnsim_now();
    expect_counts(road,
                  {{"VLNMPCA_EthernetPort", 0}, {"VLNMPCA_Card", 0}, {"VLNMPCA_StorageVolume", 0}});
    EXPECT_EQ(vlnsim_now(), start); // nothing slept
    expect_lines(road, {{"dlopen failed :liblaxapi.so", 1}, {"dlopen failed :libaxapi.so", 1}});
    EXPECT_GE(road.count_in_log("Vorlan CIM Provider load failure"), 1u);
}

TEST(Libraries, TheFallbackServesAsWell) {
    Road road({.scenario = scenario_with(R"({"local": {"present": false}})"), .log = true});
    expect_counts(road, {{"VLNMPCA_EthernetPort", 4}});
    expect_lines(road, {{"Error : In Loading Library ", 1}});
}

TEST(Libraries, WithoutTheHbaApiThePortsAreThere) {
    Road road({.scenario = scenario_with(R"({"hba": {"present": false}})")});
    expect_counts(road, {{"VLNMPCA_EthernetPort", 4}});
}

TEST(Libraries, AFailingInitialisationIsReportedAndAnsweredWithNothing) {
    Road road;
    vlnsim_fault("AX_InitLib", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    expect_counts(road, {{"VLNMPCA_EthernetPort", 0}});
    road.close();
    EXPECT_GE(road.count_in_log("AX_InitLib failed with[1]"), 1u);
}

TEST(Adapters, AHostWithoutAnyIsScannedThreeTimesInTwoSeconds) {
    Road road({.scenario = "no-adapters.json"});
    const std::uint64_t start = vlnsim_now();
    expect_counts(road, {{"VLNMPCA_Card", 0}});
    EXPECT_EQ(vlnsim_now() - start, 2000000u);
    EXPECT_EQ(vlnsim_calls("AX_GetAllLocalHBAInstances"), 3u);
}

TEST(Adapters, StorageFunctionsWithoutANicStayUnseen) {
    Road road({.scenario = "no-nic.json"});
    expect_counts(road, {{"VLNMPCA_Card", 0}, {"VLNMPCA_ProviderConfigSetting", 3}});
}

} // namespace
