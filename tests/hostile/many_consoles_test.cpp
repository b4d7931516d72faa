// Many consoles at once on one host: requests of every kind, with refreshes and polls beneath them
// and classes that go while others are asked. Whatever they do, the object manager finds no fault,
// the stores are whole afterwards, and nothing is left.
#include "tests/hostile/consoles.h"
#include "tests/hostile/footprint.h"

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <thread>

namespace hostile {

namespace {

constexpr std::size_t CONSOLES = 8;
constexpr std::size_t LARGE_HOSTS = 3;

// A host, and what is changed there.
struct Visit {
    std::string scenario;
    std::vector<Change> changes;
};

// On the two large hosts every change is tried that they have the instances for, and on one of them
// none, so that what it shows has to stay. These come first and last: their size is compared.
std::vector<Visit> visits() {
    const std::vector<Change> all = read_changes();
    const Visit large[] = {{"everything.json", all},
                           {"blade-16-functions.json", all},
                           {"blade-16-functions.json", {}}};
    static_assert(std::size(large) == LARGE_HOSTS);
    std::vector<Visit> visits(std::begin(large), std::end(large));
    for (const std::string& scenario : changed_hosts()) {
        Visit visit{scenario, all};
        std::erase_if(visit.changes, [&](const Change& row) { return row.scenario != scenario; });
        visits.push_back(std::move(visit));
    }
    visits.insert(visits.end(), std::begin(large), std::end(large));
    return visits;
}

// What lives in the agent alone, and goes with it: jobs, records of tests and of its own log, and
// that a console has cleared a driver's log.
const std::set<std::string> OF_THE_AGENT = {
    "VLNMPCA_ConcreteJob",
    "VLNMPCA_OwningJobElement",
    "VLNMPCA_AffectedJobElement",
    "VLNMPCA_DiagnosticServiceRecord",
    "VLNMPCA_DiagnosticCompletionRecord",
    "VLNMPCA_RecordAppliesToElement",
    "VLNMPCA_LogManagesRecord",
    "VLNMPCA_LogEntry",
    "VLNMPCA_RecordLogManagesRecord",
    "VLNMPCA_FCDriverLogEntry",
    "VLNMPCA_FCDriverRecordLogManagesRecord",
    "VLNMPCA_ISCSIDriverLogEntry",
    "VLNMPCA_NICDriverLogEntry",
    "VLNMPCA_NICDriverRecordLogManagesRecord",
};

Names without_agents_own(Names names) {
    std::erase_if(names, [](const auto& row) { return OF_THE_AGENT.contains(row.first); });
    return names;
}

// Classes that do not show the same.
std::string difference(const Names& one, const Names& other) {
    std::string text;
    for (const auto& [a, b] : {std::pair(&one, &other), std::pair(&other, &one)})
        for (const auto& [name, paths] : *a)
            for (const std::string& path : paths)
                if (!b->contains(name) || !b->at(name).contains(path))
                    text += (a == &one ? "- " : "+ ") + path + "\n";
    return text;
}

// All consoles, until each has made its requests. How often they unloaded a class.
std::size_t let_loose(Known_Host& host, std::size_t requests, std::mt19937& random) {
    std::atomic<std::size_t> unloads{0};
    std::vector<std::thread> consoles;
    for (std::size_t number = 0; number < CONSOLES; ++number)
        consoles.emplace_back([&, seed = random()] {
            std::mt19937 own(seed);
            Console console(host, own);
            for (std::size_t request = 0; request < requests; ++request)
                console.make_request();
            unloads += console.unloads();
        });
    for (std::thread& console : consoles)
        console.join();
    return unloads;
}

// What the host shows once all is quiet is what a new agent would show, also after changes.
void expect_whole(road::Road& road, const Names* before) {
    // A refresh that began before the last change tells nothing of it, and the one behind it may
    // have been asked for the SAN alone.
    constexpr int REFRESHES = 2;
    for (int refresh = 0; refresh < REFRESHES; ++refresh) {
        wait_for_refresh();
        vlnsim_advance(MORE_THAN_THE_CACHE);
        road.enumerate("VLNMPCA_EthernetPort");
    }
    wait_for_refresh();
    const Names shown = without_agents_own(all_names(road));
    EXPECT_TRUE(road.manager().cleanup(true).ok()); // with the last class the agent goes
    EXPECT_EQ(difference(without_agents_own(all_names(road)), shown), "");
    if (before) {
        EXPECT_EQ(difference(*before, shown), "");
    }
}

TEST(ManyConsoles, LeaveTheHostWholeAndNothingBehind) {
    constexpr std::size_t MOST_REQUESTS = 500; // of a console between two agents
    const std::vector<Visit> rows = visits();
    const std::size_t requests = wanted_operations() / rows.size() / CONSOLES;
    const std::size_t rounds = requests / MOST_REQUESTS + 1; // of each visit
    std::mt19937 random(wanted_operations());
    Footprint start;
    std::size_t unloads = 0;
    for (std::size_t row = 0; row < rows.size(); ++row) {
        const auto& [scenario, changes] = rows[row];
        SCOPED_TRACE(scenario);
        if (row == LARGE_HOSTS)
            start = Footprint::now();
        std::filesystem::path root;
        {
            road::Road road({.scenario = scenario});
            root = road.root();
            Names before;
            if (changes.empty())
                before = without_agents_own(all_names(road));
            Known_Host host(road, changes);
            for (std::size_t round = 0; round < rounds; ++round) {
                unloads += let_loose(host, requests / rounds, random);
                expect_whole(road, changes.empty() ? &before : nullptr);
            }
        }
        std::filesystem::remove_all(root);
        if (tells_progress()) {
            std::printf("%zu of %zu hosts, %zu classes unloaded\n", row + 1, rows.size(), unloads);
            std::fflush(stdout);
        }
    }
    expect_no_growth(start, Footprint::now());
    EXPECT_GT(unloads, 0u);
}

} // namespace

} // namespace hostile
