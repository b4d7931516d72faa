#include "agent/ethernet/beacon.h"

#include "agent/hardware/port_name.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "device/library/bound_functions.h"
#include "foundation/log.h"
#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint16 INDICATOR_ON = 2;
constexpr uint16 INDICATOR_OFF = 3;
constexpr uint16 INDICATOR_NOT_SUPPORTED = 4;
constexpr AX_STATUS BEACON_NOT_SUPPORTED = 2;

} // namespace

AX_STATUS GetBeaconLEDState(AX_WWN wwn, uint16& indicator) {
    uint32 state = 0;
    const AX_STATUS status = AX_DiagBeaconState(wwn, &state);
    if (status == BEACON_NOT_SUPPORTED || status == AX_STATUS_NO_DIAGNOSTICS) {
        indicator = INDICATOR_NOT_SUPPORTED;
        return AX_STATUS_OK;
    }
    if (status == AX_STATUS_OK && state == AX_BEACON_ON)
        indicator = INDICATOR_ON;
    else if (status == AX_STATUS_OK && state == AX_BEACON_OFF)
        indicator = INDICATOR_OFF;
    return status;
}

void read_beacon(VLNMPCA_EthernetPort& port) {
    HBA_WWN name{};
    if (!port_name_to_wwn(port.DeviceID.value, name))
        return;
    uint16 indicator = 0;
    if (GetBeaconLEDState(wwnOf(&name), indicator) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "VLNMPCA_DiagTestFunc::GetBeaconLEDState failed");
        return;
    }
    if (indicator != 0)
        port.LocationIndicator.set(indicator);
}

} // namespace cimple
