// What the tests of the map builders stand on: the simulator's libraries under the agent, and the
// stores as text.
#ifndef TESTS_AGENT_MAPS_FIXTURE_H
#define TESTS_AGENT_MAPS_FIXTURE_H

#include "simulator/vlnsim.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

class Maps_Test : public Agent_Test {
protected:
    void SetUp() override;
    void TearDown() override;

    // Cards of two ports with these functions; `more` may set keys of the cards before them.
    static void load(const std::string& functions, const std::string& more = "");
};

// "type name = value;" of every property that is not null, as the engine prints it.
std::vector<std::string> lines_of(const Instance* instance);

// The value of a property in that text, empty for null.
std::string value_of(const Instance* instance, const std::string& property);

struct Count {
    Store_Id store;
    uint32 count;
};

void expect_counts(ProviderAgent& agent, std::initializer_list<Count> counts);

} // namespace cimple

#endif // TESTS_AGENT_MAPS_FIXTURE_H
