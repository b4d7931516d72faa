#include "tests/agent/dynamic_fixture.h"

#include "derivedObjects/pattern.h"

namespace cimple {

namespace {

constexpr Time::Clock SIMULATED_CLOCK = {
    vlnsim_now,
    vlnsim_sleep,
    [](uint64 usec, const bool& stop) {
        vlnsim_pause(
            usec,
            [](const void* flag) -> int { return load_flag(*static_cast<const bool*>(flag)); },
            &stop);
    },
    vlnsim_wake,
};

} // namespace

void Dynamic_Test::SetUp() {
    Maps_Test::SetUp();
    vlnsim_use_virtual_clock(START);
    Time::replace_clock(&SIMULATED_CLOCK);
}

void Dynamic_Test::TearDown() {
    end();
    Maps_Test::TearDown();
    vlnsim_use_system_clock();
}

void Dynamic_Test::begin(const std::string& functions) {
    load(functions);
    ASSERT_EQ(pattern_load(pattern_table[0]), PROVIDER_OK);
    agent = ProviderAgent::current();
    ASSERT_EQ(refreshes_started(*agent), 1);
}

void Dynamic_Test::end() {
    if (agent)
        pattern_unload(pattern_table[0]);
    agent = nullptr;
}

void Dynamic_Test::await_sleeping(std::size_t threads) {
    while (vlnsim_paused() != threads)
        std::this_thread::yield();
}

void Dynamic_Test::advance(uint64 usec) {
    await_sleeping(1);
    vlnsim_advance(usec);
    await_sleeping(1);
}

void Dynamic_Test::sleep_nineteen_times() {
    for (int i = 0; i < 19; ++i)
        advance(6 * SECOND);
}

void Dynamic_Test::poll() {
    advance(6 * SECOND);
    advance(2 * SECOND);
    advance(2 * SECOND);
}

void Dynamic_Test::set(const std::string& wwn, const char* table, const char* name,
                       const std::string& value) {
    char error[256] = "";
    EXPECT_EQ(vlnsim_set_value(wwn.c_str(), table, name, value.c_str(), error, sizeof error), 0)
        << error;
}

} // namespace cimple
