// Loading and unloading again and again, with a refresh running, leaves nothing behind.
#include "tests/hostile/sudden_ends.h"

#include <fstream>

#include <unistd.h>

namespace fs = std::filesystem;

namespace {

constexpr int ROUNDS = 200;
constexpr int WARM_UP = 20; // until the heap has found its size

struct Footprint {
    std::ptrdiff_t threads, descriptors;
    long resident; // KiB
};

Footprint footprint() {
    const auto entries = [](const char* folder) {
        return std::distance(fs::directory_iterator(folder), fs::directory_iterator());
    };
    std::ifstream statm("/proc/self/statm");
    long size = 0;
    long resident = 0;
    statm >> size >> resident;
    return {entries("/proc/self/task"), entries("/proc/self/fd"),
            resident * sysconf(_SC_PAGESIZE) / 1024};
}

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
    Footprint start{};
    for (int round = 0; round < ROUNDS; ++round) {
        if (round == WARM_UP)
            start = footprint();
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
    const Footprint end = footprint();
    EXPECT_EQ(end.threads, start.threads);
    EXPECT_EQ(end.descriptors, start.descriptors);
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    // The sanitizers keep freed memory, and find leaks on their own.
    EXPECT_LT(end.resident, start.resident + 4096);
#endif
    vlnsim_close_libraries();
    vlnsim_reset();
}

} // namespace
