// The cable test: time domain reflectometry of the four pairs behind a copper PHY.
#include "agent/text.h"
#include "services/diagnostics/polling.h"
#include "services/diagnostics/runner_support.h"
#include "services/diagnostics/runners.h"

#include <cstring>

namespace cimple {

namespace {

AX_STATUS check_state(const Test_Run& run) {
    Port_Attributes port(run);
    if (port.status() != AX_STATUS_OK)
        return NOT_READY;
    if (port.functional_state() != PORT_DISABLED)
        return AX_STATUS_OK;
    VLN_LOG(VLN_ERR, "Source HBA port is disabled. Unable to start test");
    return PORT_STATE_FORBIDS;
}

String start_failure(AX_STATUS status) {
    const auto number = static_cast<int>(status);
    return status == AX_STATUS_NO_DIAGNOSTICS
               ? format_text("Diagnostics not available, error : %d", number)
               : format_text("PHYs test failed with errorCode : %d", number);
}

// The results have the lengths of the pairs where those of other tests have the error cycles, so
// that a cable test counts none: it fails by its state or its result code.
void judge(const Test_Run& run, Test_Report& report) {
    constexpr int NO_ERROR_CYCLES = 0;
    const AX_DiagResults& results = report.results;
    std::memcpy(&report.cable.emplace(), &results, sizeof results);
    const auto cycles = static_cast<int>(results.cyclesComplete);
    const auto time = static_cast<int>(results.milliseconds);
    report.passed = results.state == AX_DIAG_COMPLETE && results.resultCode == 0;
    conclude(report, report.passed
                         ? format_text("%s Succeeded; cycles complete = %d; time taken to execute "
                                       "= %d ms",
                                       run.row.name, cycles, time)
                         : format_text("%s - Result = %s, cycles complete = %d; error cycles = %d; "
                                       "time taken to execute = %d ms",
                                       run.row.name, result_text(results.resultCode), cycles,
                                       NO_ERROR_CYCLES, time));
}

} // namespace

Run_Result PHYTest(const Test_Run& run) {
    if (const AX_STATUS status = check_state(run))
        return {status};
    Test_Report report;
    AX_CableResults cable{};
    const AX_STATUS started = VLN_MethodWrapper::StartCableTest(&run.name, &cable, &report.handle);
    if (started != AX_STATUS_OK)
        return no_test(started, start_failure(started));
    if (poll_test(run, report))
        judge(run, report);
    return end_run(run, report);
}

} // namespace cimple
