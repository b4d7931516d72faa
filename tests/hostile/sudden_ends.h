// A simulated host on which a refresh stands still where a test wants it: in an up-call, when it
// holds no lock and clients see the stores as they were, or in a library call, when they all wait.
#ifndef TESTS_HOSTILE_SUDDEN_ENDS_H
#define TESTS_HOSTILE_SUDDEN_ENDS_H

#include "tests/road/hosts.h"
#include "tests/road/road.h"

#include <atomic>
#include <chrono>
#include <optional>
#include <thread>

namespace sudden_ends {

// An Ethernet and an FCoE function with some units: both passes have work to do.
inline const std::string SCENARIO = road::card(R"({"use": "nic"},
    {"use": "fcoe", "targets": {"luns": 4, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"}})");
inline constexpr std::size_t UNITS = 4;
inline constexpr std::uint64_t STALE = 11ull * 60 * 1000000; // beyond the cache time-out

// Long enough for a thread that is about to wait to do so. A test that comes too early by it sees
// less, and does not fail.
inline void rest() {
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
}

inline void wait_until_held() {
    while (vlnsim_held() == 0)
        std::this_thread::yield();
}

// The next call of the function stands still.
inline void hold(const char* function) {
    EXPECT_EQ(vlnsim_fault(function, 1, VLNSIM_HOLD, 0), 0);
}

// The up-calls of one manager, as its trace tells them.
class Up_Calls {
public:
    void trace(const std::string& line) {
        if (line.find("up-call enumerateInstances") != 0)
            return;
        while (_held) {
            _stands = true;
            std::this_thread::yield();
        }
        _stands = false;
    }
    // Starts a refresh by a call for the class, and leaves it standing in its first up-call.
    void start_refresh(host::Manager& manager, const char* class_name) {
        _held = true;
        while (!_stands) {
            vlnsim_advance(STALE);
            EXPECT_TRUE(manager.enumerate(class_name).ok());
        }
    }
    void let_go() { _held = false; }

private:
    std::atomic<bool> _held{false};
    std::atomic<bool> _stands{false};
};

class Held_Road {
public:
    explicit Held_Road(bool log = false, const std::string& scenario = SCENARIO) {
        const auto trace = [this](const std::string& line) { up_calls.trace(line); };
        _road.emplace(road::Setup{.scenario = scenario, .log = log, .trace = trace});
    }
    ~Held_Road() {
        up_calls.let_go();
        vlnsim_clear_faults();
    }
    Held_Road(const Held_Road&) = delete;
    Held_Road& operator=(const Held_Road&) = delete;

    road::Road* operator->() { return &*_road; }

    // A refresh that the class started stands in the SAN pass, and no client is inside; or in
    // another call.
    void stand_in_san_pass(const char* class_name, const char* call = "HBA_SendReadCapacity") {
        (*this)->enumerate(class_name);
        (*this)->enumerate("VLNMPCA_StorageVolume");
        up_calls.start_refresh((*this)->manager(), class_name);
        hold(call);
        up_calls.let_go();
        wait_until_held();
    }
    // Lets the library go as soon as that line stands in the log.
    std::thread let_go_after(const std::string& line) {
        return std::thread([this, line] {
            while (_road->count_in_log(line) == 0)
                std::this_thread::yield();
            vlnsim_clear_faults();
        });
    }

    Up_Calls up_calls;

private:
    std::optional<road::Road> _road;
};

} // namespace sudden_ends

#endif // TESTS_HOSTILE_SUDDEN_ENDS_H
