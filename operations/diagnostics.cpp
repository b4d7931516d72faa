// Diagnostic tests: how they are started, looked at and cancelled, and the locating light.
#include "operations/operation_frame.h"

namespace cimple {

AX_STATUS VLN_MethodWrapper::StartLoopBackTest(const HBA_WWN* name, uint32 type, uint32 cycles,
                                               bool haltOnError, const char* pattern,
                                               uint32* handle) {
    Operation_Frame frame("VLN_MethodWrapper::StartLoopBackTest");
    if (!frame.given(handle))
        return frame.status();
    const AX_STATUS status =
        AX_DiagLoopBackTestV3(wwnOf(name), type, cycles, haltOnError, handle, 0, pattern);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "StartLoopBackTest exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::StartEchoTest(const HBA_WWN* name, const HBA_WWN* target,
                                           uint32 cycles, bool haltOnError, const char* pattern,
                                           uint32* handle) {
    Operation_Frame frame("VLN_MethodWrapper::StartEchoTest");
    if (!frame.given(handle))
        return frame.status();
    const AX_STATUS status =
        AX_DiagEchoTestV2(wwnOf(name), wwnOf(target), cycles, haltOnError, handle, 0, pattern);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "StartEchoTest exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::StartCableTest(const HBA_WWN* name, AX_CableResults* cable,
                                            uint32* handle) {
    Operation_Frame frame("VLN_MethodWrapper::StartCableTest");
    if (!frame.given(cable) || !frame.given(handle))
        return frame.status();
    const AX_STATUS status = AX_DiagRunTDR(wwnOf(name), handle, cable);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "StartCableTest exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetTestResults(const HBA_WWN* name, uint32 handle,
                                            AX_DiagResults* results) {
    return results ? AX_DiagGetResults(wwnOf(name), handle, results) : AX_STATUS_INVALID_ARGUMENT;
}

AX_STATUS VLN_MethodWrapper::CancelDiagnostic(const HBA_WWN* name, uint32 handle) {
    Operation_Frame frame("VLN_MethodWrapper::CancelDiagnostic");
    const AX_STATUS status = AX_DiagCancelDiagnostic(wwnOf(name), handle);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "CancelDiagnostic exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetBeacon(const HBA_WWN* name, uint32 state) {
    Operation_Frame frame("VLN_MethodWrapper::SetBeacon");
    const AX_STATUS status = AX_DiagBeacon(wwnOf(name), state);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetBeacon exited with the error code %d", status);
    return status;
}

} // namespace cimple
