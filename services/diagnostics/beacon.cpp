// The beacon test: it sets the light by which a port is found in a rack.
#include "agent/text.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FCPort.h"
#include "device/library/bound_functions.h"
#include "services/diagnostics/polling.h"
#include "services/diagnostics/runner_support.h"
#include "services/diagnostics/runners.h"

namespace cimple {

namespace {

constexpr uint32 HANDLE = 65535;   // the library gives none
constexpr uint32 INDICATOR_ON = 2; // BeaconSetState, CIM_LogicalDevice.LocationIndicator
constexpr uint32 INDICATOR_OFF = 3;
constexpr AX_STATUS BEACON_NOT_SUPPORTED = 2;

bool has_light(const Test_Run& run) {
    uint32 state = 0;
    return AX_DiagBeaconState(wwnOf(&run.name), &state) != AX_STATUS_OK ||
           state != AX_BEACON_NOT_AVAILABLE;
}

Run_Result not_supported(AX_STATUS status) {
    const auto number = static_cast<int>(status);
    if (status == BEACON_NOT_SUPPORTED)
        VLN_LOG(VLN_ERR, "Beaconing not supported on host or adapter. errorCode %d", number);
    else
        VLN_LOG(VLN_ERR, "Diagnostics service not available on host/adapter. errorCode %d", number);
    VLN_LOG(VLN_ERR,
            "Service is not supported in underlying stack, Concreate job is not created, test "
            "exited with error code %d",
            number);
    return {status};
}

template <class Port>
bool show_on(Instance_Map<Port>& ports, const CIM_LogicalPort* port, uint32 indicator) {
    return change(ports, port, [indicator](Port& each) {
        each.LocationIndicator.set(static_cast<uint16>(indicator));
    });
}

// The port's instance may be another one afterwards: what others hold of it stays as it was.
void show(const Test_Run& run, uint32 indicator) {
    if (run.element == Port_Element::ETHERNET)
        show_on(run.agent.m_VLNMPCA_EthernetPort_map, run.port, indicator);
    else
        show_on(run.agent.m_VLNMPCA_FCPort_map, run.port, indicator);
}

} // namespace

Run_Result SetBeaconState(const Test_Run& run) {
    const uint32 wanted = run.setting->BeaconSetState.value;
    if (wanted != INDICATOR_ON && wanted != INDICATOR_OFF) {
        VLN_LOG(VLN_ERR, "INVALID beacon state");
        return {NOT_READY};
    }
    Test_Report report;
    report.handle = HANDLE;
    if (!has_light(run)) {
        conclude(report, "Beacon state Not Available. Beaconing not set");
        return end_run(run, report);
    }
    const AX_STATUS status = VLN_MethodWrapper::SetBeacon(
        &run.name, wanted == INDICATOR_ON ? AX_BEACON_ON : AX_BEACON_OFF);
    if (status == BEACON_NOT_SUPPORTED || status == AX_STATUS_NO_DIAGNOSTICS)
        return not_supported(status);
    report.passed = status == AX_STATUS_OK;
    if (!report.passed)
        conclude(report, format_text("Unknown Error, errorCode %d", static_cast<int>(status)));
    else
        conclude(report, wanted == INDICATOR_ON ? "Beacon State successfully set to ON"
                                                : "Beacon State successfully set to OFF");
    Run_Result result = end_run(run, report);
    if (report.passed)
        show(run, wanted);
    result.status = status;
    return result;
}

} // namespace cimple
