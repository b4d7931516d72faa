// The instances of an FC port and of what is made with it alone.
#ifndef VLN_AGENT_FCOE_FC_PORT_MAPS_H
#define VLN_AGENT_FCOE_FC_PORT_MAPS_H

#include "agent/fcoe/fcoe_maps.h"

namespace cimple {

struct VLNMPCA_PFCThrottle;
struct VLNMPCA_SCSIProtocolInitiatorEndpoint;

Ref<VLNMPCA_FCPort> CreateFCPort(const FC_Function& function, const CIM_ComputerSystem& system);
Ref<VLNMPCA_FCPortStatistics> port_statistics_instance(const FC_Function& function);
Ref<VLNMPCA_SCSIProtocolInitiatorEndpoint>
initiator_endpoint_instance(const String& port_name, const CIM_ComputerSystem& system);

// Whether the adapter can throttle its priority flow control: one model, and one firmware on any.
bool has_pfc_throttle(const FCoEAdapterAttributes& adapter);
Ref<VLNMPCA_PFCThrottle> pfc_throttle_instance(const FC_Function& function);

} // namespace cimple

#endif // VLN_AGENT_FCOE_FC_PORT_MAPS_H
