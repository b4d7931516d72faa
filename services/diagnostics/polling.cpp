#include "services/diagnostics/polling.h"

#include "agent/text.h"
#include "cimple/thread.h"

#include <iterator>

namespace cimple {

namespace {

constexpr uint64 WAIT = Datetime::SECOND;
constexpr uint32 CANCEL_ATTEMPTS = 122;
constexpr uint32 CANCEL_ATTEMPTS_AT_UNLOAD = 5;
constexpr char RUNNING[] = "Test is Running/Pending List";

// How often a test of the runner is looked at before it is cancelled. The beacon is never polled.
uint32 budget_of(Diagnostic_Runner runner) {
    switch (runner) {
    case Diagnostic_Runner::LOOPBACK:
        return 1099;
    case Diagnostic_Runner::CABLE:
        return 299;
    case Diagnostic_Runner::ECHO:
    case Diagnostic_Runner::BEACON:
        break;
    }
    return 121;
}

enum class Look : uint8 { RUNS, FAILED, ENDED };

Look failed(Test_Report& report, String text) {
    conclude(report, text);
    return Look::FAILED;
}

// A loopback need not go on once errors show.
Look look_at_running(const Test_Run& run, Test_Report& report) {
    const AX_DiagResults& results = report.results;
    if (run.row.runner != Diagnostic_Runner::LOOPBACK ||
        (results.transmitErrors == 0 && results.receiveErrors == 0 && results.errorCycles == 0))
        return Look::RUNS;
    return failed(report, format_text("Test Runs with errors, TransmitErrors : %d ReceviceErrors : "
                                      "%d XmitErrors : %d",
                                      static_cast<int>(results.transmitErrors),
                                      static_cast<int>(results.receiveErrors),
                                      static_cast<int>(results.errorCycles)));
}

Look look_at(const Test_Run& run, Test_Report& report) {
    report.results = {};
    const AX_STATUS status =
        VLN_MethodWrapper::GetTestResults(&run.name, report.handle, &report.results);
    if (status == AX_STATUS_DIAG_IN_PROGRESS)
        return look_at_running(run, report);
    if (status != AX_STATUS_OK) {
        report.results = {};
        return failed(report, format_text("AXAPI ERROR %d while getting diagnostic results",
                                          static_cast<int>(status)));
    }
    switch (report.results.state) {
    case AX_DIAG_CANCELLED:
        return failed(report, "Test is Canceled, Unknown Error from underlying stack");
    case AX_DIAG_RUNNING:
    case AX_DIAG_PENDING:
        VLN_LOG(VLN_DBG, "%s", RUNNING);
        return Look::RUNS;
    default:
        return Look::ENDED;
    }
}

bool is_cancelled(const HBA_WWN* name, uint32 handle) {
    AX_DiagResults results{};
    return VLN_MethodWrapper::GetTestResults(name, handle, &results) == AX_STATUS_OK &&
           results.state == AX_DIAG_CANCEL_FINISHED;
}

// 0 when the adapter has cancelled the test, or has taken the order to the last without telling
// that it is done.
AX_STATUS CancelTest(const Test_Run& run, uint32 handle) {
    AX_STATUS status = AX_STATUS_ERROR;
    if (handle == 0)
        return status;
    for (uint32 attempt = 0; attempt < CANCEL_ATTEMPTS; ++attempt) {
        if (load_flag(run.stop) && attempt >= CANCEL_ATTEMPTS_AT_UNLOAD)
            break;
        status = VLN_MethodWrapper::CancelDiagnostic(&run.name, handle);
        if (status != AX_STATUS_OK)
            VLN_LOG(VLN_ERR,
                    "Unknown error, Unable to cancel the test, Exited with the error code : %d",
                    static_cast<int>(status));
        Time::sleep(WAIT);
        if (is_cancelled(&run.name, handle)) {
            VLN_LOG(VLN_INFO, "Canceled the %s", run.row.name);
            return AX_STATUS_OK;
        }
    }
    return status;
}

} // namespace

bool poll_test(const Test_Run& run, Test_Report& report) {
    uint32 budget = budget_of(run.row.runner);
    for (;;) {
        Time::sleep(WAIT, run.stop);
        const Look seen = look_at(run, report);
        if (seen != Look::RUNS)
            return seen == Look::ENDED;
        if (budget > 0)
            --budget;
        if (budget > 1 && !load_flag(run.stop))
            continue;
        // Cancelled once, and looked at once more if the adapter would not.
        if (budget == 0 || CancelTest(run, report.handle) == AX_STATUS_OK) {
            conclude(report, RUNNING);
            return false;
        }
        budget = 0;
    }
}

const char* result_text(uint32 code) {
    static constexpr const char* TEXTS[] = {
        "Success",
        "General Error",
        "Link Down",
        "I/O Error",
        "Timeout",
        "Transmit Error",
        "Receive Error",
        "Mailbox Error",
        "Error: Echo test not supported",
        "Error: Echo Failed",
        "Error: Target Unreachable",
        ("Error: HBA temperature exceeded operational range. Adapter stopped.\n\nPlease see the "
         "product documentation"),
        "Error: Failed to allocate resource",
        "Error: Another diagnostic test is running. Please try again",
        "Error: Sequence Timeout",
        "Error: Bus reset received during test",
        "Error: Read-Write test is running",
        "Error: Driver busy. Please try again",
        "Error: Mailbox not ready",
        "Error: Port not ready",
    };
    return code < std::size(TEXTS) ? TEXTS[code] : "Unknown";
}

void conclude(Test_Report& report, String text) {
    report.text = text;
    VLN_LOG(report.passed ? VLN_INFO : VLN_ERR, "%s", report.text.c_str());
}

} // namespace cimple
