// The TCP and IP endpoints of an iSCSI port, which has an IP stack of its own.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/ip/ip_interface_maps.h"
#include "agent/iscsi/iscsi_maps.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/VLNMPCA_IPProtocolEndpoint.h"
#include "classes/VLNMPCA_TCPProtocolEndpoint.h"

namespace cimple {

namespace {

constexpr uint16 IF_TYPE_TCP = 4111; // CIM_TCPProtocolEndpoint.ProtocolIFType

// What all endpoints of a port have in common.
template <class Endpoint>
Ref<Endpoint> endpoint_instance(uint32 functional_state, const CIM_ComputerSystem& system) {
    auto endpoint = make_instance<Endpoint>();
    name_in_system(*endpoint, system);
    endpoint->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    endpoint->EnabledState.set(enabled_state(functional_state));
    return endpoint;
}

Ref<VLNMPCA_TCPProtocolEndpoint> tcp_endpoint_instance(const iSCSIPortAttributes& attributes,
                                                       const String& port_name,
                                                       const CIM_ComputerSystem& system) {
    auto endpoint =
        endpoint_instance<VLNMPCA_TCPProtocolEndpoint>(attributes.FunctionalPortState, system);
    const String name = tcp_endpoint_name(port_name);
    endpoint->Name.set(name);
    endpoint->ElementName.set(name);
    endpoint->ProtocolIFType.set(IF_TYPE_TCP);
    endpoint->PortNumber.set(ISCSI_TCP_PORT);
    return endpoint;
}

void set_addresses(VLNMPCA_IPProtocolEndpoint& endpoint, const iSCSIPortAttributes& attributes) {
    const String address = text(attributes.IPAddress);
    const bool ipv6 = is_ipv6(address);
    endpoint.ProtocolIFType.set(ipv6 ? IF_TYPE_IPV6 : IF_TYPE_IPV4);
    (ipv6 ? endpoint.IPv6Address : endpoint.IPv4Address).set(address);
    endpoint.SubnetMask.set(text(attributes.SubnetMask));
    endpoint.AddressOrigin.set(attributes.AddressOrigin);
    endpoint.GatewayAddress.set(text(attributes.GatewayAddress));
    endpoint.IPV6GatewayAddress.set(text(attributes.IPV6GatewayAddr));
    endpoint.VLANEnabled.set(attributes.VLANEnabled);
    endpoint.VLANID.set(attributes.VLANID);
    endpoint.Priority.set(attributes.VLANPriority);
}

Ref<VLNMPCA_IPProtocolEndpoint> ip_endpoint_instance(const iSCSIPortAttributes& attributes,
                                                     uint32 adapter_number, uint32 port_index,
                                                     const String& port_name,
                                                     const CIM_ComputerSystem& system) {
    auto endpoint =
        endpoint_instance<VLNMPCA_IPProtocolEndpoint>(attributes.FunctionalPortState, system);
    endpoint->Name.set(format_text("IPv4_%zu_%d_%s", static_cast<std::size_t>(adapter_number),
                                   static_cast<int>(port_index), attributes.IPAddress.c_str()));
    // How the name is made, for the reader of the console.
    endpoint->Caption.set("IPv4_<AdapterNumber>_<PortNumber>_<IPv4 Address>");
    endpoint->ElementName.set(format_text("IP Protocol Endpoint %s", port_name.c_str()));
    endpoint->Description.set("iSCSI");
    set_addresses(*endpoint, attributes);
    return endpoint;
}

} // namespace

// A port without an address has nothing that speaks TCP.
void ISCSI_Map_Builder::createEndpoints(ISCSI_Port& port) {
    if (is_unset(port.attributes.IPAddress)) {
        VLN_LOG(VLN_DBG,
                "ip not set skipping creating the instance for VLNMPCA_TCPProtocolEndpoint");
        return;
    }
    port.tcp_endpoint =
        insert_instance(_agent.m_VLNMPCA_TCPProtocolEndpoint_map,
                        tcp_endpoint_instance(port.attributes, port.name, *_system));
    if (port.tcp_endpoint)
        VLN_LOG(VLN_DBG, "VLNMPCA_TCPProtocolEndpoint::create() SUCCESFUL");
    port.ip_endpoint = insert_instance(_agent.m_VLNMPCA_IPProtocolEndpoint_map,
                                       ip_endpoint_instance(port.attributes, port.adapter_number,
                                                            port.index, port.name, *_system));
    if (port.ip_endpoint) {
        joinIPEndpoint(port);
        createIPInterface(port);
    }
    associate(_agent.m_VLNMPCA_HostedTCPAccesspoint_map, _system, port.tcp_endpoint);
}

void ISCSI_Map_Builder::joinIPEndpoint(const ISCSI_Port& port) {
    associate(_agent.m_VLNMPCA_IPProtocolEndpointSAPImplementation_map, port.ethernet_port,
              port.ip_endpoint);
    if (associate(_agent.m_VLNMPCA_TCPBindsToIP_map, port.ip_endpoint, port.tcp_endpoint))
        VLN_LOG(VLN_DBG, "VLNMPCA_TCPBindsToIP::create() SUCCESFUL");
    else
        VLN_LOG(VLN_DBG, "Failed to create the VLNMPCA_TCPBindsToIP class");
    associate(_agent.m_VLNMPCA_HostedIPAccessPoint_map, _system, port.ip_endpoint);
}

void ISCSI_Map_Builder::createIPInterface(const ISCSI_Port& port) {
    IP_Interface_Maps interfaces(_agent, _system);
    if (!interfaces.findOrMakeService()) {
        VLN_LOG(VLN_ERR, "Failed to create VLNMPCA_IPConfigurationService instance!!!");
        return;
    }
    const iSCSIPortAttributes& attributes = port.attributes;
    const uint32 status = interfaces.CreateIPInterfaceInstances(
        {port.ip_endpoint, text(port.adapter.SerialNumber), port.name, text(attributes.IPAddress),
         text(attributes.SubnetMask), gateway_text(attributes.GatewayAddress)});
    if (status != MAP_OK && status != SKIP_DEVICE)
        VLN_LOG(VLN_CRIT, "CreateIPInterfaceInstances failed");
}

} // namespace cimple
