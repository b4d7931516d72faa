// What stands around a physical port, by the name that functions of all kinds on it share.
//
// Made with the NIC functions: a port without one has neither, and the answers are null.
#ifndef VLN_AGENT_HARDWARE_PHYSICAL_PORT_H
#define VLN_AGENT_HARDWARE_PHYSICAL_PORT_H

#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "classes/VLNMPCA_PhysicalConnector.h"
#include "classes/VLNMPCA_PortController.h"

namespace cimple {

// `name` as physical_port_name() makes it.
inline const VLNMPCA_PhysicalConnector* find_connector(const ProviderAgent& agent,
                                                       const String& name) {
    return find_last(agent.m_VLNMPCA_PhysicalConnector_map,
                     [&](const VLNMPCA_PhysicalConnector& candidate) {
                         return candidate.InstanceID.value == name;
                     });
}

inline const VLNMPCA_PortController* find_port_controller(const ProviderAgent& agent,
                                                          const String& name) {
    return find_in_system(agent, agent.m_VLNMPCA_PortController_map,
                          &VLNMPCA_PortController::DeviceID, name);
}

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_PHYSICAL_PORT_H
