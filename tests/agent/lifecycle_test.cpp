#include "agent/gates.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Product.h"
#include "classes/VLNMPCA_StorageVolume.h"
#include "derivedObjects/pattern.h"
#include "tests/agent/agent_fixture.h"

#include <thread>

namespace cimple {

namespace {

using Lifecycle_Test = Agent_Test;

} // namespace

TEST_F(Lifecycle_Test, LoadFailsWithoutLibrariesAndNobodyHangs) {
    Fake_Library::present = false;
    {
        Agent_Log log;
        EXPECT_EQ(pattern_load(pattern_table[0]), 30);
        EXPECT_EQ(log.count(VLN_ERR, "Vorlan CIM Provider load failure"), 1);
    }
    EXPECT_EQ(pattern_load(pattern_table[0]), 30);
    ProviderAgent* agent = ProviderAgent::current();
    ASSERT_NE(agent, nullptr);
    EXPECT_EQ(ProviderAgent::instance(), agent);
    EXPECT_FALSE(agent->m_bLibraryLoaded);

    Agent_Log log;
    EXPECT_EQ(count_instances(VLNMPCA_Card::static_meta_class), 0);
    EXPECT_EQ(log.count(VLN_DBG, "AX Init failed for VLNMPCA_Card_Provider.cpp"), 1);
    EXPECT_EQ(log.count(VLN_INFO, " Entering BuildCimpleInfo()"), 0);
    EXPECT_EQ(count_instances(VLNMPCA_Product::static_meta_class), 0);
    EXPECT_EQ(count_instances(VLNMPCA_StorageVolume::static_meta_class), 0);
    settle(*agent);
    EXPECT_TRUE(agent->m_bIsAdapterMapsReady && agent->m_bIsSANMapsReady);
    EXPECT_EQ(Fake_Library::scans, 0);

    // The last class whose load failed takes the half-built agent along.
    pattern_unload(pattern_table[0]);
    EXPECT_EQ(ProviderAgent::current(), agent);
    pattern_unload(pattern_table[0]);
}

TEST_F(Lifecycle_Test, LogSettingsAreSavedOnlyIfThereWereSome) {
    { Loaded_Agent agent; }
    EXPECT_FALSE(exists(Host_File::LOG_SETTINGS));
    EXPECT_TRUE(exists(Host_File::FFDC_LOG));

    write(Host_File::LOG_SETTINGS, "1,3,1\n");
    {
        Loaded_Agent agent;
        EXPECT_EQ(CLogger::instance().get_mode(), LOG_MODE_RING);
        CLogger::instance().set_level(5);
    }
    EXPECT_EQ(read(Host_File::LOG_SETTINGS).rfind("1,5,1\n", 0), 0u);
}

TEST_F(Lifecycle_Test, DestructionWaitsForARefreshAndStopsItsBuilding) {
    ASSERT_EQ(pattern_load(pattern_table[0]), 0);
    ProviderAgent* agent = ProviderAgent::current();
    Agent_Log log;
    Long_Operation operation(*agent); // the refresh comes as far as this
    agent->BuildCimpleInfo();
    std::thread releaser([agent] { pattern_unload(pattern_table[0]); });
    for (bool loaded = true; loaded; std::this_thread::yield()) {
        Auto_Mutex lock(agent->m_DataFetchMutex);
        loaded = agent->m_bLibraryLoaded;
    }
    operation.end();
    releaser.join();
    EXPECT_EQ(ProviderAgent::current(), nullptr);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: Clearing the previous thread...with join"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: Updating Adapter Maps..."), 0);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: DataFetch_Handler Thread END"), 1);
}

// Loads and unloads of many classes at once, each with a client call in between.
TEST_F(Lifecycle_Test, ManyThreadsLoadAndUnload) {
    std::vector<std::thread> classes;
    for (int i = 0; i < 8; ++i)
        classes.emplace_back([] {
            for (int round = 0; round < 20; ++round) {
                ASSERT_EQ(pattern_load(pattern_table[0]), 0);
                EXPECT_EQ(count_instances(VLNMPCA_Product::static_meta_class), 0);
                EXPECT_EQ(pattern_unload(pattern_table[0]), 0);
            }
        });
    for (std::thread& each : classes)
        each.join();
    EXPECT_EQ(ProviderAgent::current(), nullptr);
}

} // namespace cimple
