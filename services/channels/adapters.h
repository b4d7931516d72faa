// How the library knows the adapters that a chip stands for.
#ifndef VLN_SERVICES_CHANNELS_ADAPTERS_H
#define VLN_SERVICES_CHANNELS_ADAPTERS_H

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_EthernetPort.h"

namespace cimple {

// Whether the port is a virtual function: the library knows it by the port that it is one of.
bool is_virtual_function(const VLNMPCA_EthernetPort& port);

// The first Ethernet port of the chip with that tag, or null.
const VLNMPCA_EthernetPort* ethernet_port_of_chip(const ProviderAgent& agent, const String& chip);

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_ADAPTERS_H
