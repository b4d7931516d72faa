// The IP endpoints that the host's kernel has on the NIC ports.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/ip/ip_interface_maps.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_IPProtocolEndpoint.h"
#include "device/ip_interface.h"

#include <sys/socket.h>

namespace cimple {

namespace {

constexpr uint16 STATE_ENABLED = 2; // CIM_EnabledLogicalElement.EnabledState
constexpr uint16 STATE_DISABLED = 3;
constexpr uint16 IF_TYPE_OTHER = 1;          // CIM_IPProtocolEndpoint.ProtocolIFType
constexpr uint16 ADDRESS_ORIGIN_UNKNOWN = 0; // CIM_IPProtocolEndpoint.AddressOrigin
constexpr uint16 ADDRESS_ORIGIN_STATIC = 3;
constexpr uint16 ADDRESS_ORIGIN_DHCP = 4;

constexpr char STARS[] = "************************************************************";

// What the kernel tells of an interface.
struct Interface_Facts {
    sint32 family = -1;
    std::string address;
    std::string subnet_mask;
    bool up = false;
};

// False for an interface without an address, whose port is left out.
bool ask_kernel(VLN_IPInterfaceConfig& kernel, const std::string& name, Interface_Facts& facts) {
    facts.family = kernel.GetIPAddressType(name);
    if (facts.family < 0) {
        VLN_LOG(VLN_DBG, "Failed to retrieve IP AddressType for interface: [%s]", name.c_str());
        return false;
    }
    facts.address = kernel.GetIPv4Address(name);
    if (facts.address.empty()) {
        VLN_LOG(VLN_DBG, "Failed to retrieve IP Address for interface: [%s]", name.c_str());
        return false;
    }
    facts.up = kernel.GetInterfaceState(name);
    facts.subnet_mask = kernel.GetIPv4SubnetMask(name);
    if (facts.subnet_mask.empty())
        VLN_LOG(VLN_DBG, "Failed to retrieve IPv4 Subnet for interface: [%s]", name.c_str());
    return true;
}

constexpr uint16 if_type(sint32 family) {
    return family == AF_INET ? IF_TYPE_IPV4 : family == AF_INET6 ? IF_TYPE_IPV6 : IF_TYPE_OTHER;
}

uint16 address_origin(const std::string& word) {
    return word == "Static" ? ADDRESS_ORIGIN_STATIC
           : word == "DHCP" ? ADDRESS_ORIGIN_DHCP
                            : ADDRESS_ORIGIN_UNKNOWN;
}

const NICPortAttributes& attributes_of(Port& port) {
    return static_cast<const NICPortAttributes&>(*port.getPortAttributes());
}

const NICAdapterAttributes& attributes_of(NICAdapter& adapter) {
    return static_cast<const NICAdapterAttributes&>(*adapter.getAdapterAttributes());
}

Ref<VLNMPCA_IPProtocolEndpoint> ip_endpoint_instance(NICAdapter& adapter, Port& port,
                                                     const Interface_Facts& facts,
                                                     const CIM_ComputerSystem& system) {
    const NICPortAttributes& attributes = attributes_of(port);
    const char* interface = attributes.IPProtocolEndpointName.c_str();
    const uint16 state = facts.up ? STATE_ENABLED : STATE_DISABLED;
    auto endpoint = make_instance<VLNMPCA_IPProtocolEndpoint>();
    name_in_system(*endpoint, system);
    endpoint->ProtocolIFType.set(if_type(facts.family));
    endpoint->Name.set(format_text("IPv4_%d_%d_%s_%s", static_cast<int>(adapter.getAdapterNumber()),
                                   static_cast<int>(port.getPortIndex()), facts.address.c_str(),
                                   interface));
    // How the name is made, for the reader of the console.
    endpoint->Caption.set("IPv4_<AdapterNumber>_<PortNumber>_<IPv4 Address>_<IPProtocolEndName>");
    endpoint->ElementName.set(format_text("Vorlan IP Endpoint %s:%s:%s",
                                          attributes_of(adapter).SerialNumber.c_str(),
                                          port.getPortName().c_str(), interface));
    endpoint->EnabledState.set(state);
    endpoint->RequestedState.set(state);
    endpoint->IPv4Address.set(text(facts.address));
    endpoint->SubnetMask.set(text(facts.subnet_mask));
    endpoint->AddressOrigin.set(address_origin(attributes.AddressOrigin));
    endpoint->InterfaceName.set(interface);
    endpoint->GatewayAddress.set(text(attributes.GatewayAddress));
    endpoint->IPV6GatewayAddress.set(text(attributes.IPV6GatewayAddr));
    return endpoint;
}

} // namespace

// END_PASS without the service that configures the interfaces.
uint32 Adapter_Map_Builder::createIPClasses() {
    VLN_LOG(VLN_DBG, "Creating classes for NIC Profile");
    if (!IP_Interface_Maps(_agent, _system).findOrMakeService()) {
        VLN_LOG(VLN_ERR, "Failed to create VLNMPCA_IPConfigurationService instance!!!");
        return END_PASS;
    }
    VLN_IPInterfaceConfig kernel;
    for (const auto& adapter : _agent.m_pData->adapters)
        if (adapter->getAdapterType() == ADAPTER_NIC)
            for (const auto& port : adapter->getPorts()) {
                VLN_LOG(VLN_DBG, "%s", STARS);
                VLN_LOG(VLN_DBG, "Creating classes for Adapter# %d # --- NIC port# %d #",
                        static_cast<int>(adapter->getAdapterNumber()),
                        static_cast<int>(port->getPortIndex()));
                VLN_LOG(VLN_DBG, "%s", STARS);
                createIPEndpoint(static_cast<NICAdapter&>(*adapter), *port, kernel);
            }
    return MAP_OK;
}

void Adapter_Map_Builder::createIPEndpoint(NICAdapter& adapter, Port& port,
                                           VLN_IPInterfaceConfig& kernel) {
    const NICPortAttributes& attributes = attributes_of(port);
    const std::string& interface = attributes.IPProtocolEndpointName;
    VLN_LOG(VLN_DBG, "Protocol Endpoint Name Retrieved from AXAPI %s", interface.c_str());
    Interface_Facts facts;
    if (!ask_kernel(kernel, interface, facts))
        return;
    const auto* endpoint = insert_instance(_agent.m_VLNMPCA_IPProtocolEndpoint_map,
                                           ip_endpoint_instance(adapter, port, facts, *_system));
    if (endpoint)
        joinIPEndpoint({endpoint, text(attributes_of(adapter).SerialNumber),
                        text(port.getPortName()), text(facts.address), text(facts.subnet_mask),
                        gateway_text(attributes.GatewayAddress)});
}

void Adapter_Map_Builder::joinIPEndpoint(const IP_Interface& interface) {
    const auto* lan_endpoint = find_in_system(_agent, _agent.m_VLNMPCA_LANEndpoint_map,
                                              &VLNMPCA_LANEndpoint::Name, interface.port_name);
    if (lan_endpoint)
        associate(_agent.m_VLNMPCA_BindsToLANEndpoint_map, lan_endpoint, interface.endpoint);
    const uint32 status = IP_Interface_Maps(_agent, _system).CreateIPInterfaceInstances(interface);
    if (status == SKIP_DEVICE)
        return;
    if (status != MAP_OK)
        VLN_LOG(VLN_CRIT, "CreateIPInterfaceInstances failed");
    associate(_agent.m_VLNMPCA_HostedIPProtocolEndpoint_map, _system, interface.endpoint);
}

} // namespace cimple
