#include "agent/gates.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_ProviderConfigSetting.h"
#include "classes/VLNMPCA_StorageVolume.h"
#include "tests/agent/agent_fixture.h"

#include <thread>

namespace cimple {

namespace {

using Refresh_Test = Agent_Test;

} // namespace

TEST_F(Refresh_Test, LimitIs32BitsWide) {
    const struct {
        uint32 minutes;
        uint64 limit;
    } rows[] = {{1, MINUTE}, {71, 71 * MINUTE}, {72, 25032704}, {0, 0}};
    Loaded_Agent agent;
    EXPECT_EQ(refreshes_started(*agent), 1);
    for (const auto& row : rows) {
        agent->m_CacheTimeout = row.minutes;
        if (row.limit) {
            advance(row.limit - 1);
            EXPECT_EQ(refreshes_started(*agent), 0) << row.minutes;
            advance(1);
        }
        EXPECT_EQ(refreshes_started(*agent), 1) << row.minutes;
    }
    agent->m_CacheTimeout = 71;
    advance(1ull << 32);
    EXPECT_EQ(refreshes_started(*agent), 1);
}

TEST_F(Refresh_Test, RequestsStartTheirPassBeforeTheTimeout) {
    Loaded_Agent agent;
    EXPECT_EQ(refreshes_started(*agent), 1);
    const int scans = Fake_Library::scans;

    agent->m_bSANRefreshRequested = true;
    EXPECT_EQ(refreshes_started(*agent), 1);
    EXPECT_EQ(Fake_Library::scans, scans) << "a SAN request leaves the adapter data alone";
    EXPECT_FALSE(agent->m_bSANRefreshRequested);
    EXPECT_TRUE(agent->m_bIsSANMapsReady);

    agent->m_bAdapterRefreshRequested = true;
    EXPECT_EQ(refreshes_started(*agent), 1);
    EXPECT_GT(Fake_Library::scans, scans);
    EXPECT_FALSE(agent->m_bAdapterRefreshRequested);
}

TEST_F(Refresh_Test, DiagnosticsHoldTheRefreshBack) {
    Loaded_Agent agent;
    agent->m_bDiagnosticsRunning = true;
    EXPECT_EQ(refreshes_started(*agent), 0);
    EXPECT_TRUE(agent->m_bAdapterRefreshRequested);
    agent->m_bDiagnosticsRunning = false;
    EXPECT_EQ(refreshes_started(*agent), 1);
}

// Clients of every kind arrive while the first refresh can't go on; all of them see whole stores.
TEST_F(Refresh_Test, ClientsWaitAtTheGates) {
    Loaded_Agent agent;
    Long_Operation operation(*agent);
    agent->BuildCimpleInfo();
    std::vector<std::thread> clients;
    std::atomic<int> seen{0};
    for (int i = 0; i < 4; ++i) {
        clients.emplace_back(
            [&] { seen += count_instances(VLNMPCA_ProviderConfigSetting::static_meta_class); });
        clients.emplace_back([&] {
            Operation_Prologue prologue(*agent);
            seen += static_cast<int>(agent->m_VLNMPCA_ProviderConfigSetting_map.size());
        });
        clients.emplace_back(
            [] { EXPECT_EQ(count_instances(VLNMPCA_StorageVolume::static_meta_class), 0); });
        clients.emplace_back(
            [] { EXPECT_EQ(count_instances(VLNMPCA_Card::static_meta_class), 0); });
    }
    operation.end();
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(seen, 8 * 3);
    settle(*agent);
}

} // namespace cimple
