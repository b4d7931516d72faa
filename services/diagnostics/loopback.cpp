// The loopback tests: within the adapter, within its PHY, and through a plug.
#include "agent/text.h"
#include "device/library/bound_functions.h"
#include "services/diagnostics/polling.h"
#include "services/diagnostics/runner_support.h"
#include "services/diagnostics/runners.h"

#include <algorithm>

namespace cimple {

namespace {

constexpr AX_STATUS UNKNOWN_TYPE = 4;
constexpr uint32 LAST_VERSION_WITHOUT_LOOPBACK = 3;
constexpr uint32 VERSION_WITHOUT_PATTERNS = 1;
constexpr uint32 DEFAULT_VERSION = 2;
constexpr uint32 LINK_UP = 2; // AX_PA_PHYSICAL_PORT_STATE

// Answers the status with which a runner refuses its port.
AX_STATUS refuse(AX_STATUS status, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return status;
}

AX_STATUS check_type(const Test_Run& run) {
    switch (run.row.type) {
    case LOOPBACK_EXTERNAL:
    case LOOPBACK_DMA:
    case LOOPBACK_MAC:
    case LOOPBACK_PHY:
        return AX_STATUS_OK;
    default:
        VLN_LOG(VLN_ERR, "Error: Test type %d is not supported ", static_cast<int>(run.row.type));
        return UNKNOWN_TYPE;
    }
}

// A port that is about to get another name answers to neither of them reliably.
AX_STATUS check_names(const Test_Run& run) {
    AX_NAME port{}, node{};
    uint32 activation = 0;
    if (AX_ReadWWN(wwnOf(&run.name), AX_WWN_CONFIGURED, &port, &node, &activation) !=
            AX_STATUS_OK ||
        (activation != AX_WWN_ACTIVATION_VOLATILE_REBOOT &&
         activation != AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT))
        return AX_STATUS_OK;
    VLN_LOG(VLN_ERR, "WARNING: WWN Management detected a new name change that requires a sytem "
                     "reboot.");
    return refuse(PORT_STATE_FORBIDS,
                  "Please reboot the system. Loopback test is not allowed at this time.");
}

AX_STATUS check_state(Port_Attributes& port) {
    return port.functional_state() == PORT_DISABLED
               ? refuse(PORT_STATE_FORBIDS,
                        "Source HBA port is disabled. Unable to start loopback test")
               : AX_STATUS_OK;
}

uint32 read_version(const Test_Run& run) {
    Attribute_Buffer buffer(AX_ADAPTER_ATTRIBUTES_SIZE);
    uint32 size = buffer.size(), version = DEFAULT_VERSION;
    if (AX_GetHBAAttributes(wwnOf(&run.name), buffer.data(), &size) == AX_STATUS_OK)
        getAdapterAttributeNumber(buffer, AX_HA_DIAG_VERSION_NUMBER, "_DiagVersionNumber",
                                  &version);
    return version;
}

String pattern_for(const Test_Run& run, uint32 version) {
    const String& pattern = run.setting->LoopPattern.value;
    if (version != VERSION_WITHOUT_PATTERNS || pattern.empty())
        return pattern;
    VLN_LOG(VLN_WARN, "User-defined test pattern is NOT supported in this version of Diagnostics");
    VLN_LOG(VLN_WARN, "Test Runs with default pattern 0x1a2b3c4d ");
    return "0x1a2b3c4"; // as far as there is room for it
}

AX_STATUS check_plug(const Test_Run& run, Port_Attributes& port) {
    if (run.row.type != LOOPBACK_EXTERNAL)
        return AX_STATUS_OK;
    const bool is_online = port.number(AX_PA_PHYSICAL_PORT_STATE, "_PhysicalPortState") == LINK_UP;
    if (!is_online)
        VLN_LOG(VLN_ERR, "Port is not online.");
    const bool is_alone =
        run.element != Port_Element::FC ||
        (port.number(AX_PA_PORT_FC_ID, "_PortFcId") == 0 &&
         port.number(AX_PA_NUMBER_OF_DISCOVERED_PORTS, "_NumberofDiscoveredPorts") == 0);
    if (is_online && is_alone)
        return AX_STATUS_OK;
    return refuse(NOT_READY, "Loopback plug is not detected. Unable to run test. Install loopback "
                             "plug and make sure HBA Port is Up/Ready. ");
}

AX_STATUS check_version(uint32 version) {
    return version <= LAST_VERSION_WITHOUT_LOOPBACK
               ? refuse(AX_STATUS_NO_DIAGNOSTICS, "Loopback not supported on this host ")
               : AX_STATUS_OK;
}

// Whether the port can be tested, and with which pattern, in the order in which it is to be found
// out.
AX_STATUS prepare(const Test_Run& run, String& pattern) {
    if (const AX_STATUS status = check_type(run))
        return status;
    if (const AX_STATUS status = check_names(run))
        return status;
    Port_Attributes port(run);
    if (const AX_STATUS status = check_state(port))
        return status;
    const uint32 version = read_version(run);
    pattern = pattern_for(run, version);
    if (const AX_STATUS status = check_plug(run, port))
        return status;
    return check_version(version);
}

String start_failure(AX_STATUS status) {
    const auto number = static_cast<int>(status);
    return status == AX_STATUS_NO_DIAGNOSTICS
               ? format_text("Diagnostics not available, error %d", number)
               : format_text("LoopBack test failed with the errorStats %d", number);
}

void judge(Test_Report& report) {
    const AX_DiagResults& results = report.results;
    const auto cycles = static_cast<int>(results.cyclesComplete);
    const auto time = static_cast<int>(results.milliseconds);
    report.passed = results.resultCode == 0;
    conclude(report,
             report.passed
                 ? format_text("Loopback Test Succeeded; cycles complete = %d; time taken to "
                               "execute = %d ms",
                               cycles, time)
                 : format_text("Loopback - Result = %s, cycles complete = %d; error cycles = %d; "
                               "time taken to execute = %d ms",
                               result_text(results.resultCode), cycles,
                               static_cast<int>(results.errorCycles), time));
}

uint16 percent(uint32 done, uint32 asked) {
    if (asked == 0)
        return 0;
    return static_cast<uint16>(uint64{std::min(done, asked)} * 100 / asked);
}

} // namespace

Run_Result LoopBackTest(const Test_Run& run) {
    const uint32 cycles = cycles_of(run);
    String pattern;
    if (const AX_STATUS status = prepare(run, pattern))
        return {status};
    Test_Report report;
    const AX_STATUS started = VLN_MethodWrapper::StartLoopBackTest(&run.name, run.row.type, cycles,
                                                                   run.setting->HaltOnError.value,
                                                                   pattern.c_str(), &report.handle);
    if (started != AX_STATUS_OK)
        return no_test(started, start_failure(started));
    if (poll_test(run, report))
        judge(report);
    report.percent = percent(report.results.cyclesComplete, cycles);
    return end_run(run, report);
}

} // namespace cimple
