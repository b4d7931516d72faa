// A simulated host whose libraries stand still in one call, for tests of what ends meanwhile.
#ifndef TESTS_HOSTILE_SUDDEN_ENDS_H
#define TESTS_HOSTILE_SUDDEN_ENDS_H

#include "tests/road/road.h"

#include <chrono>
#include <optional>
#include <thread>

namespace sudden_ends {

// An Ethernet and an FCoE function with some units: both passes have work to do.
inline const std::string SCENARIO = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "functions": [{"use": "nic"},
        {"use": "fcoe", "targets": {"luns": 4, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"}}]}]})";

// Long enough for a thread that is about to wait to do so. A test that comes too early by it sees
// less, and does not fail.
inline void rest() {
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
}

class Held_Road {
public:
    explicit Held_Road(const char* function, unsigned nth = 1) {
        _road.emplace(road::Setup{.scenario = SCENARIO});
        EXPECT_EQ(vlnsim_fault(function, nth, VLNSIM_HOLD, 0), 0);
    }
    ~Held_Road() { vlnsim_clear_faults(); }
    Held_Road(const Held_Road&) = delete;
    Held_Road& operator=(const Held_Road&) = delete;

    road::Road* operator->() { return &*_road; }
    static void wait_until_held() {
        while (vlnsim_held() == 0)
            std::this_thread::yield();
    }

private:
    std::optional<road::Road> _road;
};

} // namespace sudden_ends

#endif // TESTS_HOSTILE_SUDDEN_ENDS_H
