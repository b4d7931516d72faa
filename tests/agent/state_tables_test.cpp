#include "agent/state_tables.h"

#include <gtest/gtest.h>

namespace cimple {

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
