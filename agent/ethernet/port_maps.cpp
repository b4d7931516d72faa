// The ports of a NIC function and the endpoints on them.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/ethernet/beacon.h"
#include "agent/ethernet/ethernet_port.h"
#include "agent/ethernet/mac_text.h"
#include "agent/hardware/pci_maps.h"
#include "agent/hardware/port_name.h"
#include "agent/profiles/profile_maps.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/VLNMPCA_EnabledLogicalElementCapabilities.h"
#include "classes/VLNMPCA_RegisteredProfile.h"

namespace cimple {

namespace {

constexpr uint16 REQUESTED_STATE_ENABLED = 2;  // CIM_EnabledLogicalElement.RequestedState
constexpr uint16 LINK_TECHNOLOGY_ETHERNET = 2; // CIM_NetworkPort.LinkTechnology
constexpr uint16 LINK_TECHNOLOGY_UNKNOWN = 0;
constexpr uint16 IF_TYPE_ETHERNET_CSMACD = 6; // IANAifType
constexpr uint16 IF_TYPE_OTHER = 1;

struct Capability_Word {
    const char* word;
    uint16 value; // CIM_EthernetPort.Capabilities
};

constexpr Capability_Word CAPABILITY_WORDS[] = {
    {"AlertOnLan", 2},
    {"WakeOnLan", 3},
    {"FailOver", 4},
};

void append_capabilities(Property<Array<uint16>>& capabilities, const std::string& words) {
    for (const Capability_Word& row : CAPABILITY_WORDS)
        if (words.find(row.word) != std::string::npos)
            capabilities.append(row.value);
}

Ref<VLNMPCA_LANEndpoint> lan_endpoint_instance(const NICAdapterAttributes& adapter,
                                               const NICPortAttributes& attributes,
                                               const String& port_name,
                                               const CIM_ComputerSystem& system) {
    auto endpoint = make_instance<VLNMPCA_LANEndpoint>();
    endpoint->Description.set(text(adapter.ModelDescription));
    name_in_system(*endpoint, system);
    endpoint->ElementName.set(port_name);
    endpoint->Name.set(port_name);
    endpoint->NameFormat.set("Ethernet");
    endpoint->ProtocolIFType.set(
        attributes.ProtocolIFType == "Ethernet CSMA/CD" ? IF_TYPE_ETHERNET_CSMACD : IF_TYPE_OTHER);
    endpoint->MACAddress.set(text(attributes.CurrentMACAddress));
    endpoint->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    endpoint->EnabledState.set(enabled_state(attributes.FunctionalPortState));
    return endpoint;
}

Ref<VLNMPCA_EnabledLogicalElementCapabilities> capabilities_instance(const String& port_name) {
    auto capabilities = make_instance<VLNMPCA_EnabledLogicalElementCapabilities>();
    capabilities->InstanceID.set(format_text("Capabilities:%s", port_name.c_str()));
    capabilities->ElementName.set(capabilities->InstanceID.value);
    capabilities->ElementNameEditSupported.set(false);
    capabilities->RequestedStatesSupported.append(REQUESTED_STATE_ENABLED);
    return capabilities;
}

} // namespace

// The steps of one port, in order. A port whose Ethernet port can't be made is left out from there
// on.
uint32 Adapter_Map_Builder::createNICPort(NIC_Function& function, Port& nic_port) {
    VLN_LOG(VLN_DBG, "Creating classes for Adapter# %d # --- NIC port# %d #",
            static_cast<int>(function.adapter->getAdapterNumber()),
            static_cast<int>(nic_port.getPortIndex()));
    const auto& attributes = static_cast<const NICPortAttributes&>(*nic_port.getPortAttributes());
    NIC_Port port{function, &attributes, nic_port.getPortIndex(), text(nic_port.getPortName()),
                  physical_port_name(*function.attributes)};
    tieNewCard(function);
    findOrMakeChip(function);
    findOrMakeConnector(port);
    joinConnector(port);
    findOrMakeFirmware(port);
    port.ethernet_port =
        insert_instance(_agent.m_VLNMPCA_EthernetPort_map, CreateEthernetPort(port));
    if (!port.ethernet_port)
        return MAP_OK;
    const uint32 status = createPCIDevice(port);
    if (status != MAP_OK && status != SKIP_DEVICE) {
        VLN_LOG(VLN_CRIT, "CreatePCIDeviceInstance failed");
        return END_PASS;
    }
    associate(_agent.m_VLNMPCA_Realizes_map, port.connector, port.ethernet_port,
              "Insert Failed (CNA): m_VLNMPCA_Realizes_map");
    createLANEndpoint(port);
    joinLANEndpoint(port);
    createVLANObjects(port);
    VLN_LOG(VLN_DBG, "Adding the port controller classes");
    findOrMakePortController(port);
    joinFirmwareToPort(port);
    joinFlashImage(port);
    createTransceiver(port);
    VLN_LOG(VLN_DBG, "Creating controlledby");
    joinControlledBy(port);
    return MAP_OK;
}

uint32 Adapter_Map_Builder::createPCIDevice(const NIC_Port& port) {
    const auto adapter = static_cast<int>(port.function.adapter->getAdapterNumber());
    return PCI_Maps(_agent, _system)
        .CreatePCIDeviceInstance({port.name, "NIC",
                                  format_text("%d:%d", adapter, static_cast<int>(port.index)),
                                  format_text("Vorlan:NICAdapter%d", adapter),
                                  _agent.m_VLNMPCA_ConcreteIdentity_map, port.ethernet_port});
}

// Null for a port with an address that is no MAC address.
Ref<VLNMPCA_EthernetPort> Adapter_Map_Builder::CreateEthernetPort(const NIC_Port& nic_port) const {
    const NICAdapterAttributes& adapter = *nic_port.function.attributes;
    const NICPortAttributes& attributes = *nic_port.attributes;
    const String& port_name = nic_port.name;
    auto port = ethernet_port_instance(adapter, attributes, port_name, *_system);
    String current_address;
    if (!port || !removeSeptr(attributes.CurrentMACAddress, current_address))
        return {};
    port->PortNumber.set(static_cast<uint16>(adapter.PortNumber));
    port->InstanceID.set(format_text("%s:%s", adapter.Model.c_str(), port_name.c_str()));
    port->ElementName.set(text(attributes.IfName));
    port->Name.set(text(attributes.IfName));
    port->NetworkAddresses.append(current_address.substr(0, MAC_DIGITS));
    port->LinkTechnology.set(attributes.LinkTechnology == "Ethernet" ? LINK_TECHNOLOGY_ETHERNET
                                                                     : LINK_TECHNOLOGY_UNKNOWN);
    append_capabilities(port->Capabilities, attributes.Capabilities);
    append_capabilities(port->EnabledCapabilities, attributes.EnabledCapabilities);
    port->PortType.set(0);
    port->SRIOVState.set(static_cast<uint16>(attributes.SRIOVState));
    read_beacon(*port);
    return port;
}

void Adapter_Map_Builder::createLANEndpoint(NIC_Port& port) {
    port.lan_endpoint = insert_instance(
        _agent.m_VLNMPCA_LANEndpoint_map,
        lan_endpoint_instance(*port.function.attributes, *port.attributes, port.name, *_system));
}

// The endpoint's capabilities, and what ties endpoint, port and computer system together.
void Adapter_Map_Builder::joinLANEndpoint(const NIC_Port& port) {
    const auto* capabilities = insert_instance(
        _agent.m_VLNMPCA_EnabledLogicalElementCapabilities_map, capabilities_instance(port.name));
    conformEthernetPort(*port.ethernet_port);
    associate(_agent.m_VLNMPCA_NICCapabilities_map, port.ethernet_port, capabilities);
    associate(_agent.m_VLNMPCA_EndpointCapabilities_map, port.lan_endpoint, capabilities);
    associate(_agent.m_VLNMPCA_NICSAPImplementation_map, port.ethernet_port, port.lan_endpoint);
    associate(_agent.m_VLNMPCA_HostedLANEndpoint_map, _system, port.lan_endpoint);
    associate(_agent.m_VLNMPCA_EthernetPortSystemDevice_map, _system, port.ethernet_port);
}

// The endpoint is part of the second profile, but what conforms to one is an Ethernet port.
void Adapter_Map_Builder::conformEthernetPort(const VLNMPCA_EthernetPort& port) {
    const Profile_Maps profiles(_agent);
    for (Profile profile : {PROFILE_ETHERNET_PORT, PROFILE_HOST_LAN_NETWORK_PORT})
        associate(_agent.m_VLNMPCA_NICPortConformsToProfile_map, profiles.find(profile), &port);
}

} // namespace cimple
