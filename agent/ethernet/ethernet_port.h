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

namespace cimple {

// Who the port is besides its key. Later look-ups match the texts by their position.
void append_port_identities(VLNMPCA_EthernetPort& port, const AdapterAttributes& adapter);

// The speeds that the last scan read.
template <class Port_Attributes>
void set_port_speeds(VLNMPCA_EthernetPort& port, const Port_Attributes& attributes) {
    port.Speed.set(speed_of_code(attributes.PortSpeed));
    port.PhysicalPortSpeed.clear(); // told by the status alone, of a link that is down
    port.FunctionalPortSpeed.set(text(attributes.FuncPortSpeed));
}

// The port of that name, 16 digits; what only one kind of function tells is null. Null for a port
// whose address is no MAC address.
template <class Port_Attributes>
Ref<VLNMPCA_EthernetPort>
ethernet_port_instance(const AdapterAttributes& adapter, const Port_Attributes& attributes,
                       const String& name, const CIM_ComputerSystem& system) {
    String address;
    if (!removeSeptr(attributes.PermanentMACAddress, address))
        return {};
    auto port = make_instance<VLNMPCA_EthernetPort>();
    port->Description.set(text(adapter.ModelDescription));
    name_in_system(*port, system);
    port->DeviceID.set(name);
    append_port_state(port.get(), find_port_state(portStateMap, attributes.FunctionalPortState));
    port->PermanentAddress.set(address);
    port->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    port->EnabledState.set(enabled_state(attributes.FunctionalPortState));
    set_port_speeds(*port, attributes);
    port->MaxSpeed.set(max_speed_of_mask(attributes.PortSupportedSpeed));
    port->SupportedMaximumTransmissionUnit.set(attributes.MaximumMTU);
    port->ActiveMaximumTransmissionUnit.set(attributes.CurrentMTU);
    port->Generation.set(adapter.PCIFunctionNumber);
    append_port_identities(*port, adapter);
    port->FunctionalQosBandwidth.set(text(attributes.FuncQosBandwidth));
    port->FunctionalQosMinBandwidth.set(text(attributes.FuncQosMinBandwidth));
    port->PCIBusNumber.set(adapter.PCIBusNumber);
    return port;
}

} // namespace cimple

#endif // VLN_AGENT_ETHERNET_ETHERNET_PORT_H
