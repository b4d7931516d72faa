// What changes between refreshes: the state of a port's link, a card's temperature.
#include "tests/road/properties.h"

#include <thread>

using road::expect_properties;
using road::first;
using road::Road;
using road::set_value;
using road::text_of;

namespace {

constexpr std::uint64_t SECOND = 1000000;
constexpr const char* FIRST_PORT = "100002564C000000";
constexpr std::size_t PORTS = 4; // a NIC and an iSCSI function on each connector

void set_link(const char* state) {
    for (const char* name : {"FunctionalPortState", "PhysicalPortState"})
        set_value(FIRST_PORT, "portAttributes", name, state);
}

void await_sleeping_thread() {
    while (vlnsim_paused() != 1)
        std::this_thread::yield();
}

// Moves the clock in one step, after which the provider's thread sleeps again.
void advance(std::uint64_t usec) {
    await_sleeping_thread();
    vlnsim_advance(usec);
    await_sleeping_thread();
}

enum Link { up, down };

void expect_first_port(Road& road, Link link) {
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), PORTS);
    const bool is_up = link == up;
    expect_properties(ports[0], {{"OperationalStatus", is_up ? "{2}" : "{3}"},
                                 {"StatusDescriptions", is_up ? "{OK}" : "{Link Down}"},
                                 {"Speed", is_up ? "10000000000" : "0"},
                                 {"FunctionalPortSpeed", is_up ? "10 Gbps" : "Not Available"}});
    expect_properties(ports[1], {{"OperationalStatus", "{2}"}, {"Speed", "10000000000"}});
}

void poll() {
    for (int i = 0; i < 20; ++i)
        advance(6 * SECOND);
    for (std::size_t i = 0; i < PORTS; ++i)
        advance(2 * SECOND);
}

TEST(Dynamic, ALinkThatGoesDownIsSeenAfterTwoMinutesAndComesBackWithItsSpeeds) {
    Road road({.log = true});
    expect_first_port(road, up);
    set_link("6");
    for (int i = 0; i < 19; ++i)
        advance(6 * SECOND);
    EXPECT_EQ(vlnsim_calls("AX_GetPortState"), 0u);
    expect_first_port(road, up);
    advance(6 * SECOND);
    for (std::size_t i = 0; i < PORTS; ++i)
        advance(2 * SECOND);
    EXPECT_EQ(vlnsim_calls("AX_GetPortState"), PORTS);
    const unsigned long calls = vlnsim_calls(nullptr);
    expect_first_port(road, down);
    EXPECT_EQ(vlnsim_calls(nullptr), calls) << "what the thread has read costs no further call";
    set_link("2");
    poll();
    expect_first_port(road, up);

    // What a refresh reads is newer than what a poll before it has read.
    set_link("6");
    poll();
    expect_first_port(road, down);
    set_link("2");
    road.wait_for_refreshes(1);
    advance(600 * SECOND);
    road.enumerate("VLNMPCA_Card"); // starts the refresh
    road.wait_for_refreshes(2);
    expect_first_port(road, up);
}

// One of the states alone is no reading, at a refresh nor later; a library without the short call
// is asked for everything.
TEST(Dynamic, AFailedReadingLeavesThePort) {
    Road road({.log = true});
    const auto polled = [&road](Link link) {
        poll();
        expect_first_port(road, link);
        vlnsim_clear_faults();
    };
    set_value(FIRST_PORT, "portAttributes", "PhysicalPortState", nullptr);
    expect_first_port(road, up);
    polled(up);
    set_link("6");
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    polled(up);
    vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, 802);
    polled(up);
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    polled(down);
    road.close();
    EXPECT_EQ(road.count_in_log("Error occurred while retrieving NicPort status..."),
              1 + 2 * PORTS);
}

// Rows stay with the names of the ports at the start of the thread.
TEST(Dynamic, PortsMayComeAndGo) {
    Road road({.log = true});
    const auto refresh = [&road](std::size_t number) {
        vlnsim_advance(600 * SECOND);
        road.enumerate("VLNMPCA_Card");
        road.wait_for_refreshes(number);
    };
    expect_first_port(road, up);
    road.wait_for_refreshes(1);
    vlnsim_fault("AX_GetAllLocalHBAInstances", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    refresh(2);
    EXPECT_TRUE(road.enumerate("VLNMPCA_EthernetPort").empty());
    vlnsim_clear_faults();
    set_link("6");
    refresh(3);
    poll();
    expect_first_port(road, down);
}

// Cards that a refresh made anew while the last reading is recent.
TEST(Dynamic, ANewCardHasItsTemperature) {
    Road road({.log = true});
    const auto temperature = [&road] { return first(road, "VLNMPCA_Card", "BoardTemperature"); };
    EXPECT_EQ(temperature(), "52");
    road.wait_for_refreshes(1);
    vlnsim_advance(595 * SECOND);
    EXPECT_EQ(temperature(), "52");
    vlnsim_advance(5 * SECOND);
    road.enumerate("VLNMPCA_Product"); // starts the refresh
    road.wait_for_refreshes(2);
    EXPECT_EQ(temperature(), "52");
}

// Some values are read again when a client looks, but not more often than this.
TEST(Dynamic, WhatClientsLookAtIsReadAtMostEverySoManySeconds) {
    const char* const FC_PORT = "100002564C000004";
    const struct {
        const char *class_name, *property;
        const char *port, *table, *name; // of the hardware
        const char *before, *after;
        const char* call;
        std::uint64_t seconds;
    } rows[] = {
        {"VLNMPCA_Card", "BoardTemperature", FIRST_PORT, "adapterAttributes", "BoardTemperature",
         "52", "61", "AX_GetHBAAttributes", 10},
        {"VLNMPCA_PortController", "PhyLinkDownReason", FIRST_PORT, "portAttributes",
         "PhyLinkDownReason", "0", "3", "AX_GetPortAttributes", 5},
        {"VLNMPCA_FCPortStatistics", "LinkFailures", FC_PORT, "statistics", "LinkFailures", "1",
         "8", "AX_GetPortStatistics", 10},
        {"VLNMPCA_FCPort", "FunctionalPortSpeed", FC_PORT, "portAttributes", "FuncPortSpeed",
         "10 Gbps", "\"4 Gbps\"", "AX_GetPortAttributes", 10},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.property);
        Road road;
        const auto shown = [&] { return first(road, row.class_name, row.property); };
        std::string after = row.after;
        std::erase(after, '"');
        EXPECT_EQ(shown(), row.before);
        set_value(row.port, row.table, row.name, row.after);
        vlnsim_advance(row.seconds * SECOND - 1);
        const unsigned long calls = vlnsim_calls(row.call);
        EXPECT_EQ(shown(), row.before);
        EXPECT_EQ(vlnsim_calls(row.call), calls);
        vlnsim_advance(1);
        EXPECT_EQ(shown(), after);
        EXPECT_GT(vlnsim_calls(row.call), calls);
        set_value(row.port, row.table, row.name, row.before[0] == '1' ? "\"0\"" : "62");
        vlnsim_fault(row.call, VLNSIM_EVERY, VLNSIM_STATUS, 190);
        vlnsim_advance(row.seconds * SECOND);
        EXPECT_EQ(shown(), after) << "what could not be read";
    }
}

TEST(Dynamic, AHostWithoutEthernetPortsHasNoThread) {
    Road road({.scenario = "no-nic.json", .log = true});
    EXPECT_TRUE(road.enumerate("VLNMPCA_EthernetPort").empty());
    road.close();
    EXPECT_EQ(road.count_in_log("DynamicDataFetch_Handler Thread BEGIN"), 0u);
}

// The clock stands still, so the thread would sleep for ever.
TEST(Dynamic, UnloadWakesTheSleepingThread) {
    Road road({.log = true});
    for (int time = 1; time <= 2; ++time) {
        EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), PORTS);
        await_sleeping_thread();
        EXPECT_TRUE(road.manager().cleanup(true).ok());
        EXPECT_EQ(vlnsim_paused(), 0u);
    }
    road.close();
    EXPECT_EQ(road.count_in_log("PERF: DynamicDataFetch_Handler Thread END"), 2u);
}

// The unload waits for no further port.
TEST(Dynamic, UnloadDuringAPoll) {
    Road road;
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), PORTS);
    for (int i = 0; i < 20; ++i)
        advance(6 * SECOND);
    EXPECT_TRUE(road.manager().cleanup(true).ok());
    EXPECT_EQ(vlnsim_calls("AX_GetPortState"), 1u);
}

// Clients and refreshes go on while polls run, each library call taking its time.
TEST(Dynamic, PollsRunBesideClientsAndRefreshes) {
    Road road;
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), PORTS);
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_DELAY, 30 * SECOND);
    std::vector<std::thread> clients;
    for (int client = 0; client < 4; ++client)
        clients.emplace_back([&road] {
            for (int call = 0; call < 60; ++call) {
                vlnsim_advance(6 * SECOND);
                EXPECT_EQ(road.manager().enumerate("VLNMPCA_EthernetPort").value.size(), PORTS);
                EXPECT_EQ(road.manager().enumerate("VLNMPCA_PortController").value.size(), 2u);
            }
        });
    for (std::thread& client : clients)
        client.join();
}

} // namespace
