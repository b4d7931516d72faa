// What the tests of the dynamic status stand on: the agent over simulated ports, on the simulator's
// clock, with its status thread under control.
#ifndef TESTS_AGENT_DYNAMIC_FIXTURE_H
#define TESTS_AGENT_DYNAMIC_FIXTURE_H

#include "tests/agent/maps_fixture.h"

namespace cimple {

class Dynamic_Test : public Maps_Test {
protected:
    static constexpr uint64 SECOND = 1000000;

    void SetUp() override;
    void TearDown() override;

    // The agent over two ports with these functions, after its first refresh.
    void begin(const std::string& functions = R"({"use": "nic"})");
    void end();

    // Moves the clock in one step and waits until the status thread, which runs, sleeps again.
    static void advance(uint64 usec);
    // Up to the moment when the status thread begins its first poll, so that the next step is it.
    static void sleep_nineteen_times();
    // The poll of a table of two ports, to its end.
    static void poll();
    static void await_sleeping(std::size_t threads);

    static void set(const std::string& wwn, const char* table, const char* name,
                    const std::string& value);

    ProviderAgent* agent = nullptr;
};

} // namespace cimple

#endif // TESTS_AGENT_DYNAMIC_FIXTURE_H
