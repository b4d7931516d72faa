// A device model over the played library, with a clock that counts its sleeps.
#ifndef TESTS_DEVICE_MODEL_FIXTURE_H
#define TESTS_DEVICE_MODEL_FIXTURE_H

#include "cimple/thread.h"
#include "device/data.h"
#include "tests/device/fake_model_library.h"
#include "tests/device/log_capture.h"

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace cimple {

inline constexpr uint32 NIC = AX_FEATURE_NIC_FUNCTION;
inline constexpr uint32 ISCSI = AX_FEATURE_ISCSI_FUNCTION;
inline constexpr uint32 FCOE = AX_FEATURE_FCOE_FUNCTION;

class Model_Test : public testing::Test {
protected:
    void SetUp() override {
        static constexpr Time::Clock CLOCK = {[] { return uint64{0}; },
                                              [](uint64 usec) { sleeps.push_back(usec); }};
        Time::replace_clock(&CLOCK);
        sleeps.clear();
        fake_library = Fake_Model_Library{};
        log_capture::take();
    }
    void TearDown() override { Time::replace_clock(nullptr); }

    static int logged(const std::string& line) {
        return log_capture::count(log_capture::take(), line);
    }

    // The record and identifier of an instance, for objects that are made without a scan.
    static const LocalHBAInfoV4& info() { return fake_library.instances.front().info; }

    static inline std::vector<uint64> sleeps;
    static inline const HBAIdentifier identifier{};
};

} // namespace cimple

#endif // TESTS_DEVICE_MODEL_FIXTURE_H
