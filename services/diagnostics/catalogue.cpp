#include "services/diagnostics/catalogue.h"

#include <algorithm>
#include <iterator>

namespace cimple {

namespace {

using enum Diagnostic_Runner;

constexpr uint16 LOOP_UNKNOWN = 0; // CIM_DiagnosticSettingData.LoopControl
constexpr uint16 LOOP_COUNT = 3;
constexpr uint32 BEACON_OFF = 3; // VLNMPCA_DiagnosticSettingData.BeaconSetState

constexpr char NO_PATTERN[] = "N/A";

constexpr const char* BEACON_SETTABLE[] = {"HaltOnError", "BeaconSetState"};
constexpr const char* LOOPBACK_SETTABLE[] = {"HaltOnError", "LoopPattern", "LoopControlParameter"};
constexpr const char* ECHO_SETTABLE[] = {"HaltOnError", "TargetDevice", "EchoMechanism",
                                         "LUN",         "BufferSize",   "BufferPattern"};
constexpr const char* CABLE_SETTABLE[] = {"HaltOnError"};

constexpr Diagnostic_Defaults BEACON_DEFAULTS = {nullptr,    LOOP_UNKNOWN, "", NO_PATTERN,
                                                 BEACON_OFF, true,         0,  BEACON_SETTABLE};
constexpr Diagnostic_Defaults LOOPBACK_DEFAULTS = {
    nullptr, LOOP_COUNT, "10", "1a2b3c4d", 0, false, MAX_TEST_LOOPS, LOOPBACK_SETTABLE};
constexpr Diagnostic_Defaults ECHO_DEFAULTS = {
    "VLN: MPCA FCOE Echo test Setting", LOOP_COUNT, "10", "", 0, true, 0, ECHO_SETTABLE};
constexpr Diagnostic_Defaults CABLE_DEFAULTS = {
    "VLN: MPCA PHYTDR test Setting", LOOP_UNKNOWN, "", NO_PATTERN, 0, true, 0, CABLE_SETTABLE};

constexpr char LOOPBACK_HELP[] =
    "Loopback test connects the MAC/PHY transmit output to the receive input. It sends the "
    "LoopPattern of its settings as often as their LoopControlParameter says, and compares what "
    "comes back. The port carries no other traffic meanwhile";

} // namespace

const Diagnostic_Row diagnostic_tests[NUM_DIAGNOSTIC_TESTS] = {
    {"VLNMPCA: NIC LED(Beacon)Test", BEACON, 0, ETHERNET_PORTS | FC_PORTS,
     "Sets the beacon state to either Off(3) or On(2) for the specified WWPN/MAC address"},
    {"VLNMPCA: NIC MAC LoopBackTest", LOOPBACK, LOOPBACK_MAC, ETHERNET_PORTS, LOOPBACK_HELP},
    {"VLNMPCA: NIC PHY LoopBackTest", LOOPBACK, LOOPBACK_PHY, ETHERNET_PORTS, LOOPBACK_HELP},
    {"VLNMPCA: External LoopBackTest", LOOPBACK, LOOPBACK_EXTERNAL, ETHERNET_PORTS | FC_PORTS,
     "Test verifies that the entire data path through an NIC port is working properly"},
    {"VLNMPCA: NIC DMA LoopBackTest", LOOPBACK, LOOPBACK_DMA, ETHERNET_PORTS,
     "Test verifies data misompute errors from host to adapter and vice versa"},
    {"VLNMPCA: FCOE EchoTest", ECHO, 0, FC_PORTS,
     "Test verifies the data path from host to target is working properly"},
    // Consoles show what they know of it themselves: its help has always been empty.
    {"VLNMPCA: PHY TDRTest", CABLE, CABLE_TDR, ETHERNET_PORTS, ""},
};

const Diagnostic_Defaults& Diagnostic_Row::defaults() const {
    switch (runner) {
    case BEACON:
        return BEACON_DEFAULTS;
    case ECHO:
        return ECHO_DEFAULTS;
    case CABLE:
        return CABLE_DEFAULTS;
    case LOOPBACK:
        break;
    }
    return LOOPBACK_DEFAULTS;
}

const Diagnostic_Row* find_diagnostic_test(const String& name) {
    const auto* found = std::find_if(std::begin(diagnostic_tests), std::end(diagnostic_tests),
                                     [&](const Diagnostic_Row& test) { return name == test.name; });
    return found == std::end(diagnostic_tests) ? nullptr : found;
}

} // namespace cimple
