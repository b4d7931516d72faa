#include "services/diagnostics/runner_support.h"

#include "services/diagnostics/records.h"

#include <cstdlib>

namespace cimple {

uint32 cycles_of(const Test_Run& run) {
    const Array<String>& parameters = run.setting->LoopControlParameter.value;
    return parameters.size() == 0
               ? 0
               : static_cast<uint32>(std::strtoul(parameters[0].c_str(), nullptr, 10));
}

Run_Result no_test(AX_STATUS status, const String& line) {
    VLN_LOG(VLN_ERR, "%s", line.c_str());
    VLN_LOG(VLN_ERR,
            "Diag Service is not supported/Failed to Run, Concreate job is not created, exited "
            "with the error code %d",
            static_cast<int>(status));
    return {status};
}

Run_Result end_run(const Test_Run& run, const Test_Report& report) {
    return {AX_STATUS_OK, record_run(run, report)};
}

} // namespace cimple
