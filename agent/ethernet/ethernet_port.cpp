#include "agent/ethernet/ethernet_port.h"

#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"

namespace cimple {

void append_port_identities(VLNMPCA_EthernetPort& port, const AdapterAttributes& adapter) {
    append_port_identity(port, IDENTITY_ASIC, asic_name(adapter));
    append_port_identity(port, IDENTITY_PHYSICAL_PORT, physical_port_name(adapter));
    append_port_identity(port, IDENTITY_SERIAL, text(adapter.SerialNumber));
}

void set_port_speeds(VLNMPCA_EthernetPort& port, const EthernetPortFacts& facts) {
    port.Speed.set(speed_of_code(facts.PortSpeed));
    port.PhysicalPortSpeed.clear(); // told by the status alone, of a link that is down
    port.FunctionalPortSpeed.set(text(facts.FuncPortSpeed));
}

Ref<VLNMPCA_EthernetPort> ethernet_port_instance(const AdapterAttributes& adapter,
                                                 const EthernetPortFacts& facts, const String& name,
                                                 const CIM_ComputerSystem& system) {
    String address;
    if (!removeSeptr(facts.PermanentMACAddress, address))
        return {};
    auto port = make_instance<VLNMPCA_EthernetPort>();
    port->Description.set(text(adapter.ModelDescription));
    name_in_system(*port, system);
    port->DeviceID.set(name);
    append_port_state(port.get(), find_port_state(portStateMap, facts.FunctionalPortState));
    port->PermanentAddress.set(address);
    port->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    port->EnabledState.set(enabled_state(facts.FunctionalPortState));
    set_port_speeds(*port, facts);
    port->MaxSpeed.set(max_speed_of_mask(facts.PortSupportedSpeed));
    port->SupportedMaximumTransmissionUnit.set(facts.MaximumMTU);
    port->ActiveMaximumTransmissionUnit.set(facts.CurrentMTU);
    port->Generation.set(adapter.PCIFunctionNumber);
    append_port_identities(*port, adapter);
    port->FunctionalQosBandwidth.set(text(facts.FuncQosBandwidth));
    port->FunctionalQosMinBandwidth.set(text(facts.FuncQosMinBandwidth));
    port->PCIBusNumber.set(adapter.PCIBusNumber);
    return port;
}

} // namespace cimple
