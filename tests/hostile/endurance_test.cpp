// Work without end leaves the process as it was: mixed requests of consoles with refreshes, changes
// and unloads between, loads in any order of classes, and a night of simulated time.
//
// The suite does a little of each. VLN_OPERATIONS in the environment says how many requests are
// made, and a fiftieth of them loads; ./run endure sets it, and gets a line now and then.
#include "tests/hostile/consoles.h"
#include "tests/hostile/footprint.h"

#include <algorithm>
#include <cstdio>

namespace hostile {

namespace {

TEST(Endurance, MixedRequestsLeaveNothing) {
    const std::size_t operations = wanted_operations();
    const std::vector<std::string> hosts = changed_hosts();
    constexpr std::size_t VISITS = 3; // of each host in the suite; the first ones find its size
    const std::size_t rounds = std::max(VISITS * hosts.size(), operations / 4000);
    std::mt19937 random(operations);
    Footprint start;
    std::filesystem::path root;
    for (std::size_t round = 0; round < rounds; ++round) {
        if (round == hosts.size())
            start = Footprint::now();
        const std::string& scenario = hosts[round % hosts.size()];
        {
            road::Road road({.scenario = scenario});
            root = road.root();
            std::vector<Change> changes = read_changes();
            std::erase_if(changes, [&](const Change& row) { return row.scenario != scenario; });
            Known_Host known(road, changes);
            Console console(known, random);
            for (std::size_t i = 0; i < operations / rounds; ++i)
                console.make_request();
        }
        std::filesystem::remove_all(root);
        if (tells_progress()) {
            const Footprint now = Footprint::now();
            std::printf("%zu of %zu requests, heap %zu, resident %ld KiB\n",
                        (round + 1) * (operations / rounds), operations, now.heap, now.resident);
        }
    }
    expect_no_growth(start, Footprint::now());
}

// The object manager keeps the brokers of former loads as long as it lives, so it does not for
// long.
TEST(Endurance, LoadsInAnyOrderOfClassesLeaveNothing) {
    constexpr std::size_t LOADS = 20, MOST_CLASSES = 8; // with one object manager
    const std::size_t rounds = std::max<std::size_t>(6, wanted_operations() / 100 / LOADS);
    std::mt19937 random(1);
    Footprint start;
    for (std::size_t round = 0; round < rounds; ++round) {
        if (round == 2)
            start = Footprint::now();
        road::Road road;
        host::Manager& manager = road.manager();
        std::vector<std::string> classes;
        for (const host::Class* known : manager.provider_classes())
            classes.push_back(known->name);
        for (std::size_t load = 0; load < LOADS; ++load) {
            const auto used = classes.begin() + 1 + load % MOST_CLASSES;
            std::shuffle(classes.begin(), classes.end(), random);
            std::for_each(classes.begin(), used, [&](const std::string& name) {
                EXPECT_TRUE(manager.enumerate_names(name).ok()) << name;
            });
            std::shuffle(classes.begin(), used, random);
            std::for_each(classes.begin(), used, [&](const std::string& name) {
                EXPECT_TRUE(manager.cleanup(name, true).ok()) << name;
            });
            manager.close(); // with the last class the agent has gone
            ASSERT_TRUE(manager.load(VLN_MODULE).ok());
        }
        road.close();
        std::filesystem::remove_all(road.root());
    }
    expect_no_growth(start, Footprint::now());
}

// A console that is left open looks now and then. The host has as many refreshes as its cache asks
// for, and a poll of the ports every two minutes.
TEST(Endurance, ANightPassesWithoutATrace) {
    constexpr unsigned HOURS = 12, LOOKS = 60; // in an hour
    constexpr unsigned MOST_REFRESHES = HOURS * 6, FEWEST_REFRESHES = HOURS * 5;
    // Not with FCoE adapters: a search for their names leaves handles of the HBA API open.
    road::Road road({.scenario = "iscsi-sessions.json"});
    const auto look = [&] {
        for (const char* known : {"VLNMPCA_EthernetPort", "VLNMPCA_iSCSISession", "VLNMPCA_Card"})
            EXPECT_TRUE(road.manager().enumerate(known).ok());
        wait_for_refresh();
    };
    look();
    vlnsim_clear_calls();
    Footprint start;
    for (unsigned hour = 0; hour < HOURS; ++hour) {
        if (hour == 1)
            start = Footprint::now();
        for (unsigned i = 0; i < LOOKS; ++i) {
            vlnsim_advance(3600 / LOOKS * SECOND);
            look();
        }
    }
    expect_no_growth(start, Footprint::now());
    const unsigned long refreshes = vlnsim_calls("AX_GetServerAttributes") / 2; // a pass
    EXPECT_LE(refreshes, MOST_REFRESHES);
    EXPECT_GE(refreshes, FEWEST_REFRESHES);
}

} // namespace

} // namespace hostile
