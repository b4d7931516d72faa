// Ethernet ports, port controllers and cards between refreshes, and the status thread.

#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_PortController.h"
#include "tests/agent/dynamic_fixture.h"

#include <chrono>

namespace cimple {

namespace {

constexpr char FIRST_PORT[] = "100002564C000000";
constexpr char ERROR_LINE[] = "Error occurred while retrieving NicPort status...";

struct Shown {
    uint16 status;
    const char* description;
    uint16 detail;
    uint16 enabled;
    uint64 speed;
};

// What a client would see now.
void expect_shown(ProviderAgent& agent, uint32 index, const Shown& expected) {
    EXPECT_EQ(count_instances(VLNMPCA_EthernetPort::static_meta_class), 2);
    const VLNMPCA_EthernetPort& port = *agent.m_VLNMPCA_EthernetPort_map[index];
    ASSERT_EQ(port.OperationalStatus.value.size(), 1u);
    ASSERT_EQ(port.StatusDescriptions.value.size(), 1u);
    EXPECT_EQ(port.OperationalStatus.value[0], expected.status);
    EXPECT_STREQ(port.StatusDescriptions.value[0].c_str(), expected.description);
    EXPECT_EQ(port.DetailedStatus.value, expected.detail);
    EXPECT_EQ(port.EnabledState.value, expected.enabled);
    EXPECT_EQ(port.Speed.value, expected.speed);
    EXPECT_STREQ(port.FunctionalPortSpeed.value.c_str(),
                 expected.speed ? "10 Gbps" : "Not Available");
}

constexpr uint64 FULL_SPEED = 10000000000;
constexpr Shown AS_SCANNED = {2, "OK", 0, 2, FULL_SPEED};
constexpr Shown UP = {2, "OK", 2, 2, FULL_SPEED};
constexpr Shown DOWN = {3, "Link Down", 6, 3, 0};

} // namespace

TEST_F(Dynamic_Test, AFailedReadingLeavesTheRow) {
    begin();
    expect_shown(*agent, 0, AS_SCANNED);
    await_sleeping(1);
    set(FIRST_PORT, "portAttributes", "FunctionalPortState", "6");
    set(FIRST_PORT, "portAttributes", "PhysicalPortState", "6");
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    {
        Log_Capture log;
        sleep_nineteen_times();
        poll();
        EXPECT_EQ(log.count(VLN_ERR, "AX_GetPortAttributes call failed (190)\n"), 2);
        EXPECT_EQ(log.count(VLN_DBG, ERROR_LINE), 2);
    }
    expect_shown(*agent, 0, UP);

    // One of the states alone is no reading.
    vlnsim_clear_faults();
    vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, 802);
    {
        Log_Capture log;
        sleep_nineteen_times();
        poll();
        EXPECT_EQ(log.count(VLN_DBG, ERROR_LINE), 2);
    }
    expect_shown(*agent, 0, UP);

    // A library without the short call is asked for everything.
    vlnsim_clear_faults();
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    sleep_nineteen_times();
    poll();
    expect_shown(*agent, 0, DOWN);
}

TEST_F(Dynamic_Test, LinkDownReasonAndTemperatureFollowTheHardware) {
    begin();
    const auto look = [this](uint32 reason, sint32 celsius) {
        vlnsim_advance(10 * SECOND);
        EXPECT_EQ(count_instances(VLNMPCA_PortController::static_meta_class), 2);
        EXPECT_EQ(count_instances(VLNMPCA_Card::static_meta_class), 1);
        EXPECT_EQ(agent->m_VLNMPCA_PortController_map[0]->PhyLinkDownReason.value, reason);
        EXPECT_EQ(agent->m_VLNMPCA_PortController_map[1]->PhyLinkDownReason.value, 0u);
        EXPECT_EQ(agent->m_VLNMPCA_Card_map[0]->BoardTemperature.value, celsius);
    };
    look(0, 52);
    set(FIRST_PORT, "portAttributes", "PhyLinkDownReason", "5");
    set(FIRST_PORT, "adapterAttributes", "BoardTemperature", "\"0x645A3D\"");
    look(5, 61);

    set(FIRST_PORT, "portAttributes", "PhyLinkDownReason", "7");
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_GetHBAAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    Log_Capture log;
    look(5, 61);
    EXPECT_EQ(log.count(VLN_ERR, "ERROR: AX_GetPortAttributes call failed (190)"), 2);
    EXPECT_EQ(log.count(VLN_ERR, "ERROR: AX_GetHBAAttributes call failed (190)"), 1);
    EXPECT_EQ(log.count(VLN_ERR, "Error Updating Borad Temperature"), 1);
    vlnsim_clear_faults();
    vlnsim_fault("AX_GetAttributeValue", VLNSIM_EVERY, VLNSIM_MISSING, 0);
    look(5, 61);
    vlnsim_clear_faults();
    look(7, 61);
}

// Rows stay with the names of the ports at the start of the thread.
TEST_F(Dynamic_Test, PortsMayComeAndGo) {
    begin();
    auto* foreign = create<VLNMPCA_EthernetPort>();
    foreign->DeviceID.set("a name that no row has room for");
    ASSERT_GE(agent->m_VLNMPCA_EthernetPort_map.insert(foreign), 0);
    EXPECT_EQ(count_instances(VLNMPCA_EthernetPort::static_meta_class), 3);
    await_sleeping(1);
    {
        Auto_Mutex lock(agent->m_DynamicPortStatusMutex);
        EXPECT_EQ(agent->m_pDynamicPortStatus->rows.size(), 2u);
    }
    foreign = nullptr; // the refresh destroys it
    vlnsim_fault("AX_GetAllLocalHBAInstances", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    agent->m_bAdapterRefreshRequested = true;
    EXPECT_EQ(refreshes_started(*agent), 1);
    set(FIRST_PORT, "portAttributes", "FunctionalPortState", "6");
    set(FIRST_PORT, "portAttributes", "PhysicalPortState", "6");
    sleep_nineteen_times();
    poll();
    EXPECT_EQ(count_instances(VLNMPCA_EthernetPort::static_meta_class), 0);

    vlnsim_clear_faults();
    agent->m_bAdapterRefreshRequested = true;
    EXPECT_EQ(refreshes_started(*agent), 1);
    advance(10 * SECOND);
    expect_shown(*agent, 0, {3, "Link Down", 0, 3, FULL_SPEED}); // as scanned, after the poll
    await_sleeping(1);
    for (int i = 0; i < 18; ++i) // less one for the step above
        advance(6 * SECOND);
    poll();
    expect_shown(*agent, 0, DOWN);
}

// The thread waits for a long operation in the middle of its poll, and the unload for the thread.
TEST_F(Dynamic_Test, UnloadDuringAPoll) {
    begin();
    expect_shown(*agent, 0, AS_SCANNED);
    await_sleeping(1);
    sleep_nineteen_times();
    vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_DELAY, 30 * SECOND);
    Long_Operation operation(*agent);
    vlnsim_advance(6 * SECOND);
    std::thread unload([this] { end(); });
    operation.end();
    unload.join();
    EXPECT_LE(vlnsim_calls("AX_GetPortState"), 1u) << "the second port is not asked any more";
}

// On the host's time: a sleeping thread must not hold up who unloads the provider.
TEST_F(Dynamic_Test, UnloadWakesTheThread) {
    Time::replace_clock(nullptr);
    begin();
    expect_shown(*agent, 0, AS_SCANNED);
    EXPECT_TRUE(agent->m_DynamicPortThreadInitialized);
    const auto start = std::chrono::steady_clock::now();
    end();
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
}

} // namespace cimple
