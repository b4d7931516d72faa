#include "services/diagnostics/test_support.h"

#include "agent/hardware/port_name.h"
#include "device/library/bound_functions.h"
#include "foundation/log.h"

namespace cimple {

namespace {

constexpr uint32 FEATURE_CABLE_DIAGNOSTICS = 428;

bool has_beacon(const String& device_id) {
    HBA_WWN name{};
    uint32 state = 0;
    return port_name_to_wwn(device_id, name) &&
           AX_DiagBeaconState(wwnOf(&name), &state) == AX_STATUS_OK &&
           state != AX_BEACON_NOT_AVAILABLE;
}

bool has_cable_test(const String& device_id) {
    HBA_WWN name{};
    uint32 value = 0;
    return port_name_to_wwn(device_id, name) &&
           AX_GetHBAFeature(wwnOf(&name), FEATURE_CABLE_DIAGNOSTICS, &value) == AX_STATUS_OK &&
           value != 0;
}

} // namespace

uint32 IsTestSupported(const String& device_id, Diagnostic_Runner test) {
    if (test != Diagnostic_Runner::BEACON)
        return TEST_UNSUPPORTED;
    if (has_beacon(device_id))
        return 0;
    VLN_LOG(VLN_DBG, "Beacon not avaialble for port : %s", device_id.c_str());
    return TEST_UNSUPPORTED;
}

uint32 ISDiagTestSupported(const String& device_id, uint32 test) {
    VLN_LOG(VLN_DBG, "VLNMPCA_TenGBaseT::ISDiagTestSupported");
    if (test != CABLE_TDR) {
        VLN_LOG(VLN_DBG, "VLNMPCA_TenGBaseT:: Unsupported Test: %d", static_cast<int>(test));
        return TEST_UNSUPPORTED;
    }
    if (has_cable_test(device_id))
        return 0;
    VLN_LOG(VLN_DBG, "TDR test feature is not supported for Port %s", device_id.c_str());
    return TEST_UNSUPPORTED;
}

bool port_serves(const String& device_id, const Diagnostic_Row& test) {
    switch (test.runner) {
    case Diagnostic_Runner::BEACON:
        return IsTestSupported(device_id, test.runner) == 0;
    case Diagnostic_Runner::CABLE:
        return ISDiagTestSupported(device_id, test.type) == 0;
    case Diagnostic_Runner::LOOPBACK:
    case Diagnostic_Runner::ECHO:
        break;
    }
    return true;
}

} // namespace cimple
