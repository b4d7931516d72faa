// What the installation service does to single ports. m_DataMutex is held, the answer is that of
// the method.
#ifndef VLN_SERVICES_FIRMWARE_PORT_SWITCHES_H
#define VLN_SERVICES_FIRMWARE_PORT_SWITCHES_H

#include "agent/provider_agent.h"
#include "classes/CIM_LogicalPort.h"

namespace cimple {

// The caller starts the refresh that is asked for here, once it has let m_DataMutex go.
uint32 reset_adapter(ProviderAgent& agent, const CIM_LogicalPort* target);
uint32 set_port_enabled(ProviderAgent& agent, const CIM_LogicalPort* target,
                        const Property<boolean>& enabled, Property<uint8>& config_status);
uint32 set_sriov_state(ProviderAgent& agent, const CIM_LogicalPort* target,
                       const Property<boolean>& enabled);
uint32 get_features(const ProviderAgent& agent, const CIM_LogicalPort* target,
                    Property<Array<uint8>>& features);

// The name of a port for the library. False, with a line of the step that failed.
bool adapter_name(const CIM_LogicalPort& target, HBA_WWN& name);

} // namespace cimple

#endif // VLN_SERVICES_FIRMWARE_PORT_SWITCHES_H
