// Loading, unloading, ageing of the data.
#include "tests/road/road.h"

#include <fstream>

using road::Road;

namespace {

constexpr std::uint64_t MINUTE = 60ull * 1000000;

unsigned long scans() {
    return vlnsim_calls("AX_GetLocalHBAInfoV4");
}

TEST(Lifecycle, DataIsReadOnceUntilTheCacheTimesOut) {
    Road road({.log = true});
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(1);
    const unsigned long first = scans();
    ASSERT_GT(first, 0u);
    vlnsim_advance(10 * MINUTE - 1000000);
    road.enumerate("VLNMPCA_Card");
    EXPECT_EQ(scans(), first);
    vlnsim_advance(2 * 1000000);
    road.enumerate("VLNMPCA_Card"); // starts the refresh, and may still see the old stores
    road.wait_for_refreshes(2);
    EXPECT_EQ(scans(), 2 * first);
}

TEST(Lifecycle, CleanupEndsTheAgentAndTheNextCallBuildsItAnew) {
    Road road;
    EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 1u);
    EXPECT_TRUE(road.manager().cleanup(true).ok());
    EXPECT_EQ(road.manager().live_object_count(), 0u);
    EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 1u);
    EXPECT_EQ(vlnsim_calls("AX_InitLib"), 2u);
}

TEST(Lifecycle, TheConfigurationFileIsWrittenAtTheEndAndReadAtTheNextStart) {
    Road road;
    std::ofstream(road.root() / "etc/vorlan_mpca_provider.conf")
        << "# by hand\n VLN_PROVIDER_CACHE_TIMEOUT = 31\nVLN_PROVIDER_CACHE_TIMEOUT= 5 \n"
           "VLN_PROVIDER_REFRESH_SANDATA = no\n";
    const auto settings = road.enumerate("VLNMPCA_ProviderConfigSetting");
    ASSERT_EQ(settings.size(), 3u);
    EXPECT_EQ(road::text_of(settings[0], "current"), "5");
    EXPECT_EQ(road::text_of(settings[2], "current"), "1");
    road.close();
    std::ifstream in(road.root() / "etc/vorlan_mpca_provider.conf");
    const std::string text((std::istreambuf_iterator<char>(in)), {});
    EXPECT_NE(text.find("# Vorlan HBA CIM Provider Configuration Settings #\n"), std::string::npos);
    EXPECT_NE(text.find("VLN_PROVIDER_CACHE_TIMEOUT = 5\n"), std::string::npos);
}

} // namespace
