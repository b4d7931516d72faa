// Loading and unloading again and again, with a refresh running, leaves nothing behind.
#include "tests/road/road.h"

#include <fstream>

#include <dlfcn.h>
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

// Two FCoE ports with many units: a SAN pass that takes a while.
const std::string SCENARIO = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "ports": 2, "functions": [{"use": "nic"},
        {"use": "fcoe", "targets": {"luns": 800, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"}}]}]})";
constexpr unsigned long UNITS = 1600;

TEST(Unload, TwoHundredTimesWithARefreshRunningLeavesNothing) {
    road::Road road({.scenario = SCENARIO});
    road.close(); // of the Road its folder is used, and its checks once
    vlnsim_use_virtual_clock(1400000000ull * 1000000);
    vlnsim_set_host_root(road.root().c_str());
    char error[512];
    ASSERT_EQ(vlnsim_load_scenario_text(SCENARIO.c_str(), "scenario", error, sizeof error), 0);
    ASSERT_EQ(vlnsim_open_libraries(error, sizeof error), 0) << error;
    host::Manager manager;
    Footprint start{};
    int unloaded_while_running = 0;
    for (int round = 0; round < ROUNDS; ++round) {
        if (round == WARM_UP)
            start = footprint();
        vlnsim_restart();
        ASSERT_TRUE(manager.load(VLN_MODULE).ok());
        // Answered when the maps are there; the SAN pass goes on.
        EXPECT_EQ(manager.enumerate("VLNMPCA_Card").value.size(), 1u);
        const unsigned long before = vlnsim_calls("HBA_SendReadCapacity");
        manager.close();
        unloaded_while_running += before < UNITS;
#ifndef __SANITIZE_THREAD__ // which keeps it, to know its names
        ASSERT_EQ(dlopen(VLN_MODULE, RTLD_LAZY | RTLD_NOLOAD), nullptr) << "still mapped";
#endif
        ASSERT_EQ(manager.fault_count(), 0u) << host::to_string(manager.faults()[0]);
        ASSERT_EQ(manager.live_object_count(), 0u);
    }
    const Footprint end = footprint();
    EXPECT_GT(unloaded_while_running, ROUNDS / 10); // how many, is up to the scheduler
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
