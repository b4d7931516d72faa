#include "agent/ethernet/mac_text.h"

#include <gtest/gtest.h>

namespace cimple {

TEST(Mac_Text, SeparatorsGo) {
    String digits;
    for (const char* address : {"00-90-fa-00-00-01", "00:90:fa:00:00:01", "0090fa000001"}) {
        EXPECT_TRUE(removeSeptr(address, digits)) << address;
        EXPECT_STREQ(digits.c_str(), "0090fa000001");
    }
}

// Builds for development end at the library's fault, the others leave the port out.
TEST(Mac_Text, OtherLengthsAreRefused) {
    for (const char* address : {"", "00-90-fa-00-00", "00-90-fa-00-00-01-02", "none"}) {
        String digits;
#ifdef CIMPLE_CHECK_LOCKS
        EXPECT_DEATH(removeSeptr(address, digits), "12 == strlen\\(portPermMACAddr.c_str\\(\\)\\)");
#else
        EXPECT_FALSE(removeSeptr(address, digits)) << address;
#endif
    }
}

} // namespace cimple
