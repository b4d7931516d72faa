// Work without end leaves the process as it was: mixed requests of consoles with refreshes, changes
// and unloads between, loads in any order of classes, and a night of simulated time.
//
// The suite does a little of each. VLN_OPERATIONS in the environment says how many requests are
// made, and a fiftieth of them loads; ./run endure sets it, and gets a line now and then.
#include "tests/hostile/changes.h"
#include "tests/hostile/footprint.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <set>
#include <thread>

namespace hostile {

namespace {

using host::ObjectPath;

constexpr std::uint64_t SECOND = 1000000;
constexpr std::uint64_t MORE_THAN_THE_CACHE = 11 * 60 * SECOND;

std::size_t wanted_operations() {
    constexpr std::size_t IN_THE_SUITE = 10000;
    const char* text = std::getenv("VLN_OPERATIONS");
    const std::size_t number = text ? std::strtoul(text, nullptr, 10) : 0;
    return number ? number : IN_THE_SUITE;
}

bool tells_progress() {
    return std::getenv("VLN_OPERATIONS") != nullptr;
}

// Some consoles on one host. What they may be answered depends on what others have done before, so
// only the object manager's checks of the provider judge the answers.
class Consoles {
public:
    Consoles(road::Road& road, const std::string& scenario, std::mt19937& random)
        : _manager(road.manager()), _random(random) {
        for (const Change& change : read_changes())
            if (change.scenario == scenario)
                _changes.emplace_back(road, change);
        for (const host::Class* known : _manager.provider_classes()) {
            _classes.push_back(known->name);
            if (known->is_association)
                _links.push_back(known->name);
            for (ObjectPath& path : _manager.enumerate_names(known->name).value)
                _paths.push_back(std::move(path));
        }
    }

    void make_request() {
        std::vector<unsigned> weights;
        for (const Kind& kind : KINDS)
            weights.push_back(kind.weight);
        std::discrete_distribution<std::size_t> choose(weights.begin(), weights.end());
        (this->*KINDS[choose(_random)].make)();
    }

private:
    struct Kind {
        unsigned weight; // of a hundred
        void (Consoles::*make)();
    };
    static const Kind KINDS[9];

    template <class List>
    auto& any(List& list) {
        return list[std::uniform_int_distribution<std::size_t>(0, list.size() - 1)(_random)];
    }

    void enumerate() { _manager.enumerate(any(_classes)); }
    void list_names() { _manager.enumerate_names(any(_classes)); }
    void get() { _manager.get(any(_paths)); }
    void get_some() { _manager.get(any(_paths), {{"InstanceID", "DeviceID", "ElementName"}}); }
    void walk_names() {
        host::Association_Filter filter;
        filter.via = any(_links);
        _manager.associator_names(any(_paths), filter);
    }
    void walk_all_names() { _manager.reference_names(any(_paths)); }
    void walk_all() { _manager.associators(any(_paths)); }
    void change() {
        if (!_changes.empty())
            any(_changes).make();
    }
    void let_time_pass() {
        vlnsim_advance(
            std::uniform_int_distribution<std::uint64_t>(1, MORE_THAN_THE_CACHE)(_random));
    }

    host::Manager& _manager;
    std::mt19937& _random;
    std::vector<std::string> _classes, _links;
    std::vector<ObjectPath> _paths;
    std::vector<Prepared_Change> _changes;
};

const Consoles::Kind Consoles::KINDS[] = {
    {35, &Consoles::enumerate}, {15, &Consoles::list_names}, {15, &Consoles::get},
    {10, &Consoles::get_some},  {12, &Consoles::walk_names}, {3, &Consoles::walk_all_names},
    {1, &Consoles::walk_all},   {6, &Consoles::change},      {3, &Consoles::let_time_pass},
};

// The hosts that the table of changes knows, each with all of its changes.
std::vector<std::string> scenarios() {
    std::set<std::string> names;
    for (const Change& change : read_changes())
        names.insert(change.scenario);
    return {names.begin(), names.end()};
}

TEST(Endurance, MixedRequestsLeaveNothing) {
    const std::size_t operations = wanted_operations();
    const std::vector<std::string> hosts = scenarios();
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
            Consoles consoles(road, scenario, random);
            for (std::size_t i = 0; i < operations / rounds; ++i)
                consoles.make_request();
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

// Until the thread of a refresh has ended: this one and that of the port status are left.
void wait_for_refresh() {
    constexpr std::ptrdiff_t OTHER_THREADS = 2;
    while (Footprint::now().threads > OTHER_THREADS)
        std::this_thread::yield();
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
