// The locating light of a port.
#ifndef VLN_AGENT_ETHERNET_BEACON_H
#define VLN_AGENT_ETHERNET_BEACON_H

#include "cimple/types.h"
#include "device/library/axapi.h"

namespace cimple {

struct VLNMPCA_EthernetPort;

// The light as CIM_LogicalDevice.LocationIndicator has it: 2 on, 3 off, 4 for an adapter without
// one. 0 with the indicator written, which is left alone for a light in no state; else the
// library's status.
AX_STATUS GetBeaconLEDState(AX_WWN wwn, uint16& indicator);

// Sets the port's LocationIndicator, from its DeviceID. A failure is logged and leaves it null.
void read_beacon(VLNMPCA_EthernetPort& port);

} // namespace cimple

#endif // VLN_AGENT_ETHERNET_BEACON_H
