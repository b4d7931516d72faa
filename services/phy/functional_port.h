// The port through which a physical port and its PHY are reached.
#ifndef VLN_SERVICES_PHY_FUNCTIONAL_PORT_H
#define VLN_SERVICES_PHY_FUNCTIONAL_PORT_H

#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "classes/VLNMPCA_EthernetPort.h"

namespace cimple {

// The first Ethernet port on the physical port of that name, "serial:port number", or null.
inline const VLNMPCA_EthernetPort* find_functional_port(const ProviderAgent& agent,
                                                        const String& physical_port) {
    constexpr uint32 PHYSICAL_PORT = 1; // its place among the port's identities
    return find_first(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& port) {
        const Array<String>& identities = port.OtherIdentifyingInfo.value;
        return identities.size() > PHYSICAL_PORT && identities[PHYSICAL_PORT] == physical_port;
    });
}

} // namespace cimple

#endif // VLN_SERVICES_PHY_FUNCTIONAL_PORT_H
