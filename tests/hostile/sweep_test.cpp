// The sweep, and what it needs to be complete.
#include "tests/hostile/sweep.h"
#include "tests/road/hosts.h"

#include <cstdlib>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <thread>

namespace {

std::string variable(const char* name) {
    const char* value = std::getenv(name);
    return value ? value : "";
}

TEST(Sweep, EachEventOfEachOperationFails) {
    std::vector<std::string> words;
    std::istringstream given(variable("VLN_SWEEP_OPERATIONS"));
    for (std::string word; given >> word;)
        words.push_back(word);
    sweep::Choice choice;
    if (const std::string most = variable("VLN_SWEEP"); !most.empty())
        choice.most = most == "all" ? sweep::ALL : std::stoul(most);
    choice.text = variable("VLN_SWEEP_POINT");
    if (const std::string seed = variable("VLN_SWEEP_SEED"); !seed.empty())
        choice.seed = static_cast<unsigned>(std::stoul(seed));
    const auto operations = sweep::all_operations(words);
    ASSERT_FALSE(operations.empty());
    EXPECT_EQ(
        sweep::sweep_all(operations, choice, std::max(1u, std::thread::hardware_concurrency())),
        0u);
}

// The rows that methods.tsv says must be there: a service joins the sweep with each of its changes.
std::vector<std::string> implemented_changes() {
    std::vector<std::string> changes;
    std::ifstream table(VLN_METHODS);
    for (std::string line; std::getline(table, line);) {
        const std::size_t tab = line.find('\t');
        const std::string name = line.substr(0, tab), what = line.substr(tab + 1);
        if (name.find('.') != std::string::npos) {
            if (what == "implemented")
                changes.push_back(name);
            continue;
        }
        for (const auto& [word, sign] : {std::pair("create implemented", "+"),
                                         {"modify implemented", ""},
                                         {"delete implemented", "-"}})
            if (what.find(word) != std::string::npos)
                changes.push_back(sign + name);
    }
    return changes;
}

TEST(Sweep, EachImplementedChangeHasARow) {
    std::set<std::string> rows;
    for (hostile::Change& row : hostile::read_changes()) {
        const std::size_t mark = row.what.find('#');
        if (mark != std::string::npos)
            row.what.erase(mark, row.what.find_first_not_of("#0123456789", mark) - mark);
        rows.insert(row.what);
    }
    const std::vector<std::string> implemented = implemented_changes();
    ASSERT_GT(implemented.size(), 60u);
    for (const std::string& change : implemented)
        EXPECT_TRUE(rows.contains(change)) << change;
}

// What clients know of a host is asked of it when its library has refused to come up: there is an
// agent then, with empty stores and without a device model.
TEST(Refused, WithoutTheLibraryNothingIsChanged) {
    std::map<std::string, std::vector<hostile::Change>> changes;
    for (const hostile::Change& change : hostile::read_changes())
        changes[change.scenario].push_back(change);
    for (const auto& [scenario, of_host] : changes) {
        road::Road road({.scenario = scenario});
        std::vector<hostile::Prepared_Change> prepared;
        for (const hostile::Change& change : of_host)
            prepared.emplace_back(road, change);
        EXPECT_TRUE(road.manager().cleanup(true).ok());
        vlnsim_restart();
        vlnsim_fault("AX_InitLib", VLNSIM_EVERY, VLNSIM_STATUS, 1);
        for (std::size_t i = 0; i < prepared.size(); ++i)
            EXPECT_NE(prepared[i].make(), "OK 0") << scenario << " " << of_host[i].what;
        for (const host::Class* known : road.manager().provider_classes())
            road.enumerate(known->name);
        EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 0u);
    }
}

// A card with two kinds of function.
const std::string SCENARIO = road::card(R"({"use": "nic"}, {"use": "iscsi"})");

// Without memory for the agent a class is loaded without a share in it: its cleanup takes nothing
// from the class that has found memory since.
TEST(Refused, ACleanupUndoesWhatItsLoadTook) {
    road::Road road({.scenario = SCENARIO});
    sweep::Events& events = sweep::events_of_module();
    bool agent_failed = false;
    for (unsigned long number = 1; number <= 20; ++number) {
        SCOPED_TRACE("allocation " + std::to_string(number));
        vlnsim_restart();
        events.refuse(sweep::ALLOCATION, number);
        road.manager().enumerate("VLNMPCA_Product");
        events.refuse(sweep::ALLOCATION, 0);
        agent_failed |= vlnsim_calls("AX_InitLib") == 0;
        const std::size_t cards = road.manager().enumerate("VLNMPCA_Card").value.size();
        EXPECT_TRUE(road.manager().cleanup("VLNMPCA_Product", true).ok());
        const unsigned long agents = vlnsim_calls("AX_InitLib");
        EXPECT_EQ(road.manager().enumerate("VLNMPCA_Card").value.size(), cards);
        EXPECT_EQ(vlnsim_calls("AX_InitLib"), agents);
        EXPECT_TRUE(road.manager().cleanup(true).ok());
    }
    EXPECT_TRUE(agent_failed);
}

// A refresh that cannot be started leaves its clients what there is, and the log says so. The
// status thread is tried again at the next look.
TEST(Refused, AThreadThatCannotBeStarted) {
    road::Road road({.scenario = SCENARIO, .log = true});
    sweep::Events& events = sweep::events_of_module();
    events.refuse(sweep::THREAD, 1);
    EXPECT_EQ(road.enumerate("VLNMPCA_Product").size(), 0u);
    EXPECT_EQ(road.count_in_log("[VLN_ERR] Error : DataFetch_Handler thread could not be started"),
              1u);
    EXPECT_TRUE(road.manager().cleanup(true).ok());

    EXPECT_EQ(road.enumerate("VLNMPCA_Product").size(), 1u);
    events.refuse(sweep::THREAD, 1);
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 2u);
    EXPECT_EQ(road.count_in_log("[VLN_ERR] PERF: Thread DynamicDataFetch_Handler Creation failed"),
              1u);
    EXPECT_EQ(vlnsim_paused(), 0u);
    vlnsim_advance(11ull * 1000000);
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 2u);
    while (vlnsim_paused() == 0)
        std::this_thread::yield();
}

} // namespace
