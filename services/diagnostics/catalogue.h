// The tests that a console can run on a port, each with what is told of it.
//
// A test's name is its key, and that of its settings, its job settings, its capabilities, its help
// and its log: everything else finds them by it.
#ifndef VLN_SERVICES_DIAGNOSTICS_CATALOGUE_H
#define VLN_SERVICES_DIAGNOSTICS_CATALOGUE_H

#include "cimple/string.h"

#include <span>

namespace cimple {

// What carries a test out. Tests of one runner have the same kind of settings.
enum class Diagnostic_Runner : uint8 { BEACON, LOOPBACK, ECHO, CABLE };

// The settings of a test as they are before a console changes them.
struct Diagnostic_Defaults {
    const char* element_name; // null: the test's name
    uint16 loop_control;      // CIM_DiagnosticSettingData.LoopControl
    const char* loop_control_parameter;
    const char* loop_pattern;
    uint32 beacon_set_state; // 0: unset
    bool non_destructive;
    uint32 max_loops;                      // 0: unset
    std::span<const char* const> settable; // names of the properties that a console may set
};

enum Diagnostic_Ports : uint8 { ETHERNET_PORTS = 1, FC_PORTS = 2 };

struct Diagnostic_Row {
    const char* name;
    Diagnostic_Runner runner;
    uint32 type; // by which the runner tells its tests apart
    uint8 ports; // Diagnostic_Ports on which it makes sense
    const char* help;

    const Diagnostic_Defaults& defaults() const;
};

enum Diagnostic_Test_Type : uint32 {
    LOOPBACK_EXTERNAL = 0, // the loopbacks as the management library numbers them
    LOOPBACK_DMA = 2,
    LOOPBACK_MAC = 3,
    LOOPBACK_PHY = 4,
    CABLE_TDR = 2,
};

inline constexpr uint32 NUM_DIAGNOSTIC_TESTS = 7;
inline constexpr uint32 MAX_TEST_LOOPS = 4000;
inline constexpr uint32 MAX_LOG_RECORDS = 200; // of a test; the oldest gives way

// In the order in which consoles list them. The cable test is the last: a host without a port that
// has it leaves it out.
extern const Diagnostic_Row diagnostic_tests[NUM_DIAGNOSTIC_TESTS];

// Null for a name that no test bears.
const Diagnostic_Row* find_diagnostic_test(const String& name);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_CATALOGUE_H
