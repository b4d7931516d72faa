// Loading and unloading again and again, with a refresh running, leaves nothing behind.
#include "tests/hostile/footprint.h"
#include "tests/hostile/sudden_ends.h"

namespace {

constexpr int ROUNDS = 200;
constexpr int WARM_UP = 20; // until the heap has found its size

using sudden_ends::SCENARIO;

TEST(Unload, TwoHundredTimesWithARefreshRunningLeavesNothing) {
    road::Road road({.scenario = SCENARIO});
    road.close(); // of the Road its folder is used, and its checks once
    vlnsim_use_virtual_clock(1400000000ull * 1000000);
    vlnsim_set_host_root(road.root().c_str());
    char error[512];
    ASSERT_EQ(vlnsim_load_scenario_text(SCENARIO.c_str(), "scenario", error, sizeof error), 0);
    ASSERT_EQ(vlnsim_open_libraries(error, sizeof error), 0) << error;
    sudden_ends::Up_Calls up_calls;
    host::Options options;
    options.trace = [&](const std::string& line) { up_calls.trace(line); };
    host::Manager manager(std::move(options));
    hostile::Footprint start;
    for (int round = 0; round < ROUNDS; ++round) {
        if (round == WARM_UP)
            start = hostile::Footprint::now();
        vlnsim_restart();
        ASSERT_TRUE(manager.load(VLN_MODULE).ok());
        EXPECT_EQ(manager.enumerate("VLNMPCA_Card").value.size(), 1u);
        EXPECT_EQ(manager.enumerate("VLNMPCA_StorageVolume").value.size(), sudden_ends::UNITS);
        up_calls.start_refresh(manager, "VLNMPCA_Card");
        std::thread release([&] {
            std::this_thread::yield();
            up_calls.let_go();
        });
        manager.close();
        release.join();
        ASSERT_EQ(manager.fault_count(), 0u) << host::to_string(manager.faults()[0]);
        ASSERT_EQ(manager.live_object_count(), 0u);
    }
    hostile::expect_no_growth(start, hostile::Footprint::now());
    vlnsim_close_libraries();
    vlnsim_reset();
}

} // namespace
