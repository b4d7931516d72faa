#include "agent/fcoe/fc_port_maps.h"

#include "agent/associations.h"
#include "agent/fcoe/fc_port_tables.h"
#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_FCPortStatistics.h"
#include "classes/VLNMPCA_PFCThrottle.h"
#include "classes/VLNMPCA_SCSIProtocolInitiatorEndpoint.h"

namespace cimple {

namespace {

constexpr uint16 USAGE_NOT_RESTRICTED = 4;   // CIM_LogicalPort.UsageRestriction
constexpr uint16 LINK_TECHNOLOGY_FC = 4;     // CIM_NetworkPort.LinkTechnology
constexpr uint16 CONNECTION_TYPE_FCOE = 18;  // CIM_SCSIProtocolEndpoint.ConnectionType
constexpr uint16 IF_TYPE_FIBRE_CHANNEL = 56; // IANAifType
constexpr uint16 ROLE_INITIATOR = 2;         // CIM_SCSIProtocolEndpoint.Role
constexpr uint16 STATE_NOT_APPLICABLE = 5;   // EnabledState and RequestedState of an endpoint
constexpr uint32 PFC_THROTTLE_ENABLED = 2;   // of the library

// Who the port is besides its key. Clients know the first four by their position.
void append_identities(VLNMPCA_FCPort& port, const FC_Function& function) {
    const FCoEAdapterAttributes& adapter = function.adapter;
    append_port_identity(port, "OS Device Name", text(function.attributes.OSDeviceName));
    append_port_identity(port, "VORLAN:IEEE_ADDRESS", text(adapter.IEEEAddress));
    append_port_identity(port, "NodeWWN", text(function.attributes.NodeWWN));
    append_port_identity(port, IDENTITY_ASIC, asic_name(adapter));
    append_port_identity(port, IDENTITY_VPD_SERIAL, text(adapter.SerialNumber));
    append_port_identity(port, IDENTITY_PORT_NUMBER,
                         format_text("%d", static_cast<int>(adapter.PortNumber)));
}

void set_adapter_properties(VLNMPCA_FCPort& port, const FCoEAdapterAttributes& adapter) {
    port.PortNumber.set(static_cast<uint16>(adapter.PortNumber));
    port.Description.set(text(adapter.Model));
    port.OperationalFirmware.set(text(adapter.OpertionalFirmwareVersion));
    port.PCIBusNumber.set(adapter.PCIBusNumber);
    port.Generation.set(adapter.PCIFunctionNumber);
    port.HWVersion.set(text(adapter.HWVersion));
}

void set_link_properties(VLNMPCA_FCPort& port, const FCoEPortAttributes& attributes) {
    const Port_Type& type = find_port_type(attributes.PortType);
    port.PortType.set(type.port_type);
    port.OtherPortType.set(type.name);
    append_port_state(&port, find_port_state(portStateMap, attributes.FunctionalPortState));
    append_service_classes(port.SupportedCOS, attributes.PortSupportedClassofService);
    append_service_classes(port.ActiveCOS, attributes.PORT_SERVICE_TYPE);
    append_fc4_types(port.SupportedFC4Types, attributes.PortSupportedFc4Types);
    append_fc4_types(port.ActiveFC4Types, attributes.PortActiveFc4Types);
    port.Speed.set(speed_of_code(attributes.PortSpeed));
    port.MaxSpeed.set(max_speed_of_mask(attributes.PortSupportedSpeed));
    port.PhysicalPortSpeed.set(speed_of_code(attributes.PhysicalPortSpeed));
    port.FunctionalPortSpeed.set(text(attributes.FuncPortSpeed));
    port.FunctionalQosBandwidth.set(text(attributes.FuncQosBandwidth));
    port.LinkTechnology.set(LINK_TECHNOLOGY_FC);
    port.DetailedStatus.set(static_cast<uint16>(attributes.FunctionalPortState));
    port.SupportedMaximumTransmissionUnit.set(attributes.PortMaxFrameSize);
    port.ActiveMaximumTransmissionUnit.set(attributes.PortMaxFrameSize);
}

} // namespace

Ref<VLNMPCA_FCPort> CreateFCPort(const FC_Function& function, const CIM_ComputerSystem& system) {
    const FCoEPortAttributes& attributes = function.attributes;
    auto port = make_instance<VLNMPCA_FCPort>();
    name_in_system(*port, system);
    port->Name.set(function.name);
    port->DeviceID.set(function.name);
    port->PermanentAddress.set(function.name);
    port->NetworkAddresses.append(function.name);
    port->ElementName.set(text(attributes.PortSymbolicName));
    port->UsageRestriction.set(USAGE_NOT_RESTRICTED);
    port->FCID.set(attributes.PortFcId);
    port->NumberOfDiscoveredPorts.set(attributes.NumberofDiscoveredPorts);
    port->FabricName.set(text(attributes.FabricName));
    port->Flags.set(text(attributes.nFlags));
    append_identities(*port, function);
    set_adapter_properties(*port, function.adapter);
    set_link_properties(*port, attributes);
    return port;
}

Ref<VLNMPCA_FCPortStatistics> port_statistics_instance(const FC_Function& function) {
    auto statistics = make_instance<VLNMPCA_FCPortStatistics>();
    statistics->ElementName.set(function.serial_and_name);
    statistics->Description.set("Statistics for the FCOE port.");
    statistics->InstanceID.set(fc_statistics_name(function.name));
    return statistics;
}

Ref<VLNMPCA_SCSIProtocolInitiatorEndpoint>
initiator_endpoint_instance(const String& port_name, const CIM_ComputerSystem& system) {
    auto endpoint = make_instance<VLNMPCA_SCSIProtocolInitiatorEndpoint>();
    name_in_system(*endpoint, system);
    endpoint->Name.set(format_text("Initiator:%s", port_name.c_str()));
    endpoint->ConnectionType.set(CONNECTION_TYPE_FCOE);
    endpoint->ProtocolIFType.set(IF_TYPE_FIBRE_CHANNEL);
    endpoint->Role.set(ROLE_INITIATOR);
    endpoint->RequestedState.set(STATE_NOT_APPLICABLE);
    endpoint->EnabledState.set(STATE_NOT_APPLICABLE);
    return endpoint;
}

bool has_pfc_throttle(const FCoEAdapterAttributes& adapter) {
    return adapter.Model == "ZTr47315-FM" || adapter.FirmwareVersion == "E2 A2";
}

Ref<VLNMPCA_PFCThrottle> pfc_throttle_instance(const FC_Function& function) {
    auto throttle = make_instance<VLNMPCA_PFCThrottle>();
    throttle->InstanceID.set(format_text("VLN:%s", function.name.c_str()));
    throttle->ElementName.set(function.name);
    throttle->PFCThrottle.set(function.attributes.PFCThrottle == PFC_THROTTLE_ENABLED ? "enabled"
                                                                                      : "disabled");
    return throttle;
}

} // namespace cimple
