#include "agent/state_tables.h"

#include <gtest/gtest.h>

namespace cimple {

TEST(State_Tables, PortStates) {
    struct Row {
        uint32 state;
        uint16 port_status;
        const char* port_text;
        uint16 controller_status;
        const char* controller_text;
    };
    const Row rows[] = {
        {0, 0, "Unknown", 0, "Unknown"},
        {1, 0, "Unknown", 0, "Unknown"},
        {2, 2, "OK", 2, "OK"},
        {3, 10, "Stopped", 10, "Stopped"},
        {4, 1, "Other", 1, "Other"},
        {5, 11, "InService", 11, "InService"},
        {6, 3, "Link Down", 1, "Other"},
        {7, 6, "Error", 6, "Error"},
        {8, 32776, "InService", 11, "InService"},
        {9, 0, "Unknown", 0, "Unknown"},
        {20, 32788, "Operational. Need RESET", 0, "Unknown"},
        {21, 32789, "Link down. Need RESET", 0, "Unknown"},
        {22, 32790, "Disable", 0, "Unknown"},
        {0xFFFFFFFF, 0, "Unknown", 0, "Unknown"},
    };
    for (const Row& row : rows) {
        const Port_State& port = find_port_state(portStateMap, row.state);
        const Port_State& controller = find_port_state(portControllerStateMap, row.state);
        EXPECT_EQ(port.operational_status, row.port_status) << row.state;
        EXPECT_STREQ(port.description, row.port_text) << row.state;
        EXPECT_EQ(controller.operational_status, row.controller_status) << row.state;
        EXPECT_STREQ(controller.description, row.controller_text) << row.state;
        const Port_State& fcoe = find_fcoe_port_state(row.state);
        EXPECT_EQ(fcoe.operational_status, row.state == 6 ? 1 : row.port_status) << row.state;
        EXPECT_STREQ(fcoe.description, row.state == 6 ? "Other" : row.port_text) << row.state;
    }
}

TEST(State_Tables, PortTypes) {
    const struct {
        uint32 type;
        uint16 port_type;
        const char* name;
    } rows[] = {{1, 0, "Unknown"},
                {2, 1, "Other"},
                {5, 10, "N"},
                {6, 11, "NL"},
                {7, 16, "FL"},
                {8, 15, "F"},
                {9, 14, "E"},
                {10, 18, "G"},
                {20, 1, "Private Loop"},
                {21, 1, "Point to Point"},
                {22, 0, "Unknown"}};
    for (const auto& row : rows) {
        EXPECT_EQ(find_port_type(row.type).port_type, row.port_type) << row.type;
        EXPECT_STREQ(find_port_type(row.type).name, row.name) << row.type;
    }
}

TEST(State_Tables, EnabledStates) {
    const uint16 expected[] = {1, 0, 2, 3, 1, 7, 3, 1, 1};
    for (uint32 state = 0; state < 9; ++state)
        EXPECT_EQ(enabled_state(state), expected[state]) << state;
    EXPECT_EQ(enabled_state(20), 1);
    EXPECT_EQ(enabled_state(21), 3);
    EXPECT_EQ(enabled_state(22), 3);
}

TEST(State_Tables, Speeds) {
    constexpr uint64 G = 1000000000;
    const struct {
        uint32 code;
        uint64 speed;
    } codes[] = {{1, G}, {2, 2 * G}, {4, 10 * G}, {8, 4 * G}, {16, 8 * G}, {0, 0}, {3, 0}, {32, 0}};
    for (const auto& row : codes)
        EXPECT_EQ(speed_of_code(row.code), row.speed) << row.code;
    const struct {
        uint32 mask;
        uint64 speed;
    } masks[] = {{31, 10 * G}, {27, 8 * G}, {11, 4 * G}, {3, 2 * G}, {1, G}, {32, 0}, {36, 10 * G}};
    for (const auto& row : masks)
        EXPECT_EQ(max_speed_of_mask(row.mask), row.speed) << row.mask;
}

} // namespace cimple
