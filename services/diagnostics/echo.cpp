// The echo test: from an FCoE port to one of its targets and back.
#include "agent/text.h"
#include "services/diagnostics/polling.h"
#include "services/diagnostics/runner_support.h"
#include "services/diagnostics/runners.h"

namespace cimple {

namespace {

constexpr std::size_t PATTERN_SIZE = 48; // of the library's buffer, with the end mark

// The port, and where its echo is to come from.
AX_STATUS prepare(const Test_Run& run, HBA_WWN& target) {
    Port_Attributes port(run);
    if (port.status() != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "AX_GetPortAttributes command failed. Exited with error code : %d",
                static_cast<int>(port.status()));
        return port.status();
    }
    const uint32 state = port.functional_state();
    if (state == PORT_DISABLED || state == PORT_LINK_DOWN) {
        VLN_LOG(VLN_ERR, "Source HBA port is either disabled or linkdown: %d. Unable to start %s ",
                static_cast<int>(state), run.row.name);
        return PORT_STATE_FORBIDS;
    }
    const bool is_name = nameOfDeviceId(run.setting->TargetDevice.value.c_str(), target,
                                        "VLNMPCA_DiagTestFunc::", VLN_ERR);
    return is_name ? AX_STATUS_OK : NOT_READY;
}

String start_failure(const Test_Run& run, AX_STATUS status) {
    return format_text("%s Unknown error, Exited with error code : %d", run.row.name,
                       static_cast<int>(status));
}

void judge(const Test_Run& run, Test_Report& report) {
    const AX_DiagResults& results = report.results;
    report.passed = results.state == AX_DIAG_COMPLETE && results.resultCode == 0;
    if (report.passed)
        conclude(report, format_text("%s Resulted with Success", run.row.name));
    else if (results.state == AX_DIAG_COMPLETE)
        conclude(report, format_text("%s Resulted with Failure, Result - %s ", run.row.name,
                                     result_text(results.resultCode)));
    else
        conclude(report, start_failure(run, results.resultCode));
}

} // namespace

Run_Result EchoTest(const Test_Run& run) {
    HBA_WWN target{};
    if (const AX_STATUS status = prepare(run, target))
        return {status};
    const String pattern = run.setting->LoopPattern.value.substr(0, PATTERN_SIZE - 1);
    Test_Report report;
    const AX_STATUS started = VLN_MethodWrapper::StartEchoTest(&run.name, &target, cycles_of(run),
                                                               run.setting->HaltOnError.value,
                                                               pattern.c_str(), &report.handle);
    if (started != AX_STATUS_OK)
        return no_test(started, start_failure(run, started));
    if (poll_test(run, report))
        judge(run, report);
    return end_run(run, report);
}

} // namespace cimple
