// Every call into the libraries that a change makes fails once in each way, one failure a change:
// the client gets an answer, nothing is left behind, and the next host shows itself whole.
#include "tests/hostile/changes.h"

#include <map>
#include <set>

#include <unistd.h>

using hostile::Change;
using hostile::Prepared_Change;
using road::Road;

namespace {

constexpr unsigned MOST_CALLS = 3; // of one function; those after them are alike
constexpr unsigned TOO_LONG = 100; // seconds for one change

// The calls that a change makes, as "FUNCTION" or "FUNCTION" again for its second call.
std::vector<std::string> functions_called(const Prepared_Change& change, std::string& answer) {
    std::vector<std::string> functions;
    vlnsim_record_calls(1);
    answer = change.make();
    char line[512];
    for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i)
        functions.emplace_back(line, std::string_view(line).find('('));
    vlnsim_record_calls(0);
    return functions;
}

// A fresh host and a fresh agent, ready for the change.
void begin_again(Road& road) {
    EXPECT_TRUE(road.manager().cleanup(true).ok());
    ASSERT_EQ(road.manager().live_object_count(), 0u);
    vlnsim_restart();
    road.enumerate("VLNMPCA_StorageVolume"); // waits for the SAN pass
}

void expect_an_answer(Road& road, const Prepared_Change& change, std::size_t ports) {
    alarm(TOO_LONG);
    change.make();
    vlnsim_clear_faults();
    alarm(0);
    ASSERT_EQ(road.manager().fault_count(), 0u) << host::to_string(road.manager().faults()[0]);
    begin_again(road);
    ASSERT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), ports);
}

void sweep(Road& road, const Change& row) {
    const std::size_t ports = road.enumerate("VLNMPCA_EthernetPort").size();
    begin_again(road);
    const Prepared_Change change(road, row);
    std::string answer;
    const std::vector<std::string> functions = functions_called(change, answer);
    EXPECT_TRUE(answer == "CMPI_RC_OK" || answer == "CMPI_RC_OK 0") << answer;
    begin_again(road);
    std::map<std::string, unsigned> calls;
    for (const std::string& function : functions) {
        const unsigned call = ++calls[function];
        if (call > MOST_CALLS)
            continue;
        for (const std::uint64_t status : {1u, 7u, 190u, 255u}) {
            SCOPED_TRACE(function + " call " + std::to_string(call) + " status " +
                         std::to_string(status));
            vlnsim_fault(function.c_str(), call, VLNSIM_STATUS, status);
            expect_an_answer(road, change, ports);
        }
        if (call == 1) {
            SCOPED_TRACE(function + " absent");
            vlnsim_fault(function.c_str(), call, VLNSIM_ABSENT, 0);
            expect_an_answer(road, change, ports);
        }
    }
}

TEST(Change_Sweep, EachCallOfEachChangeFails) {
    std::map<std::string, std::vector<Change>> by_scenario;
    for (const Change& row : hostile::read_changes())
        by_scenario[row.scenario].push_back(row);
    ASSERT_FALSE(by_scenario.empty());
    for (const auto& [scenario, rows] : by_scenario) {
        Road road({.scenario = scenario});
        for (const Change& row : rows) {
            SCOPED_TRACE(row.what);
            ASSERT_NO_THROW(sweep(road, row));
        }
    }
}

} // namespace
