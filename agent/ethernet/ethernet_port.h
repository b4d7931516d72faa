// What the Ethernet ports of NIC and iSCSI functions have in common.
#ifndef VLN_AGENT_ETHERNET_ETHERNET_PORT_H
#define VLN_AGENT_ETHERNET_ETHERNET_PORT_H

#include "agent/associations.h"
#include "agent/ethernet/mac_text.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "device/adapter_attributes.h"
#include "device/port_attributes.h"

namespace cimple {

// Who the port is besides its key. Later look-ups match the texts by their position.
void append_port_identities(VLNMPCA_EthernetPort& port, const AdapterAttributes& adapter);

// The speeds that the last scan read.
void set_port_speeds(VLNMPCA_EthernetPort& port, const EthernetPortFacts& facts);

// The port of that name, 16 digits; what only one kind of function tells is null. Null for a port
// whose address is no MAC address.
Ref<VLNMPCA_EthernetPort> ethernet_port_instance(const AdapterAttributes& adapter,
                                                 const EthernetPortFacts& facts, const String& name,
                                                 const CIM_ComputerSystem& system);

} // namespace cimple

#endif // VLN_AGENT_ETHERNET_ETHERNET_PORT_H
