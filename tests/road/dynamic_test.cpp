// What changes between refreshes: the state of a port's link, a card's temperature.
#include "tests/road/properties.h"

#include <thread>

using road::Road;
using road::text_of;

namespace {

constexpr std::uint64_t SECOND = 1000000;
constexpr const char* FIRST_PORT = "100002564C000000";
constexpr std::size_t PORTS = 4; // a NIC and an iSCSI function on each connector

void set(const char* table, const char* name, const char* value) {
    char error[256] = "";
    ASSERT_EQ(vlnsim_set_value(FIRST_PORT, table, name, value, error, sizeof error), 0) << error;
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

void expect_first_port(Road& road, const char* status, const char* description, const char* speed,
                       const char* speed_text) {
    const auto ports = road.enumerate("VLNMPCA_EthernetPort");
    ASSERT_EQ(ports.size(), PORTS);
    EXPECT_EQ(text_of(ports[0], "OperationalStatus"), status);
    EXPECT_EQ(text_of(ports[0], "StatusDescriptions"), description);
    EXPECT_EQ(text_of(ports[0], "Speed"), speed);
    EXPECT_EQ(text_of(ports[0], "FunctionalPortSpeed"), speed_text);
    EXPECT_EQ(text_of(ports[1], "OperationalStatus"), "{2}");
    EXPECT_EQ(text_of(ports[1], "Speed"), "10000000000");
}

TEST(Dynamic, ALinkThatGoesDownIsSeenAfterTwoMinutes) {
    Road road;
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    set("portAttributes", "FunctionalPortState", "6");
    set("portAttributes", "PhysicalPortState", "6");
    for (int i = 0; i < 19; ++i)
        advance(6 * SECOND);
    EXPECT_EQ(vlnsim_calls("AX_GetPortState"), 0u);
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    advance(6 * SECOND);
    for (std::size_t i = 0; i < PORTS; ++i)
        advance(2 * SECOND);
    EXPECT_EQ(vlnsim_calls("AX_GetPortState"), PORTS);
    const unsigned long calls = vlnsim_calls(nullptr);
    expect_first_port(road, "{3}", "{Link Down}", "0", "Not Available");
    EXPECT_EQ(vlnsim_calls(nullptr), calls) << "what the thread has read costs no further call";
}

void poll() {
    for (int i = 0; i < 20; ++i)
        advance(6 * SECOND);
    for (std::size_t i = 0; i < PORTS; ++i)
        advance(2 * SECOND);
}

TEST(Dynamic, ALinkThatComesBackHasTheSpeedsOfTheLastRefresh) {
    Road road({.log = true});
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    const auto link = [](const char* state) {
        set("portAttributes", "FunctionalPortState", state);
        set("portAttributes", "PhysicalPortState", state);
    };
    link("6");
    poll();
    expect_first_port(road, "{3}", "{Link Down}", "0", "Not Available");
    link("2");
    poll();
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");

    // What a refresh reads is newer than what a poll before it has read.
    link("6");
    poll();
    expect_first_port(road, "{3}", "{Link Down}", "0", "Not Available");
    link("2");
    road.wait_for_refreshes(1);
    advance(600 * SECOND);
    road.enumerate("VLNMPCA_Card"); // starts the refresh
    road.wait_for_refreshes(2);
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
}

// A firmware that does not tell the physical state leaves its port as the refresh showed it.
TEST(Dynamic, APortWithoutAPhysicalStateIsNoPortWithoutALink) {
    Road road;
    set("portAttributes", "PhysicalPortState", nullptr);
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    advance(10 * SECOND);
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    poll();
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
}

// One of the states alone is no reading; a library without the short call is asked for everything.
TEST(Dynamic, AFailedReadingLeavesThePort) {
    Road road({.log = true});
    const auto polled = [&road](const char* status, const char* description, const char* speed,
                                const char* speed_text) {
        poll();
        expect_first_port(road, status, description, speed, speed_text);
        vlnsim_clear_faults();
    };
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    set("portAttributes", "FunctionalPortState", "6");
    set("portAttributes", "PhysicalPortState", "6");
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    polled("{2}", "{OK}", "10000000000", "10 Gbps");
    vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, 802);
    polled("{2}", "{OK}", "10000000000", "10 Gbps");
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    polled("{3}", "{Link Down}", "0", "Not Available");
    road.close();
    EXPECT_EQ(road.count_in_log("Error occurred while retrieving NicPort status..."), 2 * PORTS);
}

// Rows stay with the names of the ports at the start of the thread.
TEST(Dynamic, PortsMayComeAndGo) {
    Road road({.log = true});
    const auto refresh = [&road](std::size_t number) {
        vlnsim_advance(600 * SECOND);
        road.enumerate("VLNMPCA_Card");
        road.wait_for_refreshes(number);
    };
    expect_first_port(road, "{2}", "{OK}", "10000000000", "10 Gbps");
    road.wait_for_refreshes(1);
    vlnsim_fault("AX_GetAllLocalHBAInstances", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    refresh(2);
    EXPECT_TRUE(road.enumerate("VLNMPCA_EthernetPort").empty());
    vlnsim_clear_faults();
    set("portAttributes", "FunctionalPortState", "6");
    set("portAttributes", "PhysicalPortState", "6");
    refresh(3);
    poll();
    expect_first_port(road, "{3}", "{Link Down}", "0", "Not Available");
}

// Cards that a refresh made anew while the last reading is recent.
TEST(Dynamic, ANewCardHasItsTemperature) {
    Road road({.log = true});
    const auto temperature = [&road] {
        return text_of(road.enumerate("VLNMPCA_Card").at(0), "BoardTemperature");
    };
    EXPECT_EQ(temperature(), "52");
    road.wait_for_refreshes(1);
    vlnsim_advance(595 * SECOND);
    EXPECT_EQ(temperature(), "52");
    vlnsim_advance(5 * SECOND);
    road.enumerate("VLNMPCA_Product"); // starts the refresh
    road.wait_for_refreshes(2);
    EXPECT_EQ(temperature(), "52");
}

TEST(Dynamic, TheTemperatureIsReadAtMostEveryTenSeconds) {
    Road road;
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_Card").at(0), "BoardTemperature"), "52");
    set("adapterAttributes", "BoardTemperature", "61");
    vlnsim_advance(10 * SECOND - 1);
    const unsigned long calls = vlnsim_calls("AX_GetHBAAttributes");
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_Card").at(0), "BoardTemperature"), "52");
    EXPECT_EQ(vlnsim_calls("AX_GetHBAAttributes"), calls);
    vlnsim_advance(1);
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_Card").at(0), "BoardTemperature"), "61");
    EXPECT_EQ(vlnsim_calls("AX_GetHBAAttributes"), calls + 1);
    set("adapterAttributes", "BoardTemperature", "62");
    vlnsim_fault("AX_GetHBAAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_advance(10 * SECOND);
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_Card").at(0), "BoardTemperature"), "61");
    EXPECT_EQ(vlnsim_calls("AX_GetHBAAttributes"), calls + 2);
}

TEST(Dynamic, TheReasonOfALinkDownIsReadAtMostEveryFiveSeconds) {
    Road road;
    const auto reason = [&road] {
        return text_of(road.enumerate("VLNMPCA_PortController").at(0), "PhyLinkDownReason");
    };
    EXPECT_EQ(reason(), "0");
    set("portAttributes", "PhyLinkDownReason", "3");
    vlnsim_advance(5 * SECOND - 1);
    EXPECT_EQ(reason(), "0");
    vlnsim_advance(1);
    EXPECT_EQ(reason(), "3");
    set("portAttributes", "PhyLinkDownReason", "7");
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_advance(5 * SECOND);
    EXPECT_EQ(reason(), "3");
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
