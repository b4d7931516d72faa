#include "agent/ip/ip_interface_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/state_tables.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities.h"
#include "classes/VLNMPCA_IPAssignmentSettingData.h"
#include "classes/VLNMPCA_IPConfigurationService.h"
#include "classes/VLNMPCA_IPProtocolEndpoint.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_RemoteServiceAccessPoint.h"
#include "classes/VLNMPCA_StaticIPAssignmentSettingData.h"

namespace cimple {

namespace {

constexpr uint16 ENABLED = 2;                       // CIM_EnabledLogicalElement.EnabledState
constexpr uint16 ADDRESS_ORIGIN_NOT_APPLICABLE = 2; // CIM_IPAssignmentSettingData.AddressOrigin
constexpr uint16 ADDRESS_ORIGIN_STATIC = 3;
constexpr uint16 ACCESS_CONTEXT_DEFAULT_GATEWAY = 2; // CIM_RemoteServiceAccessPoint
constexpr uint16 INFO_FORMAT_IPV4_ADDRESS = 3;
constexpr uint16 INFO_FORMAT_IPV6_ADDRESS = 4;

Ref<VLNMPCA_IPConfigurationService> service_instance(const CIM_ComputerSystem& system) {
    auto service = make_instance<VLNMPCA_IPConfigurationService>();
    name_in_system(*service, system);
    service->Name.set("VLN:IP Configuration Service");
    service->ElementName.set("Vorlan IP Configuration Service");
    service->EnabledState.set(ENABLED);
    service->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    return service;
}

Ref<VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities>
capabilities_instance(const String& endpoint_name) {
    auto capabilities = make_instance<VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities>();
    const String name = format_text("VLN:Enabled Logical IPProtocol Endpoint Capabilities for %s",
                                    endpoint_name.c_str());
    capabilities->InstanceID.set(name);
    capabilities->ElementName.set(name);
    capabilities->ElementNameEditSupported.set(false);
    capabilities->RequestedStatesSupported.append(ENABLED);
    return capabilities;
}

Ref<VLNMPCA_IPAssignmentSettingData> setting_instance(const IP_Interface& interface) {
    auto setting = make_instance<VLNMPCA_IPAssignmentSettingData>();
    const String name = format_text("IP AssignmentSettingData for Interface:%s:%s",
                                    interface.serial.c_str(), interface.port_name.c_str());
    setting->InstanceID.set(name);
    setting->ElementName.set(name);
    setting->AddressOrigin.set(ADDRESS_ORIGIN_NOT_APPLICABLE); // the settings below it decide
    return setting;
}

Ref<VLNMPCA_StaticIPAssignmentSettingData> static_setting_instance(const IP_Interface& interface) {
    auto setting = make_instance<VLNMPCA_StaticIPAssignmentSettingData>();
    const String name = format_text("Static IP AssignmentSettingData for Interface:%s:%s",
                                    interface.serial.c_str(), interface.port_name.c_str());
    setting->InstanceID.set(name);
    setting->ElementName.set(name);
    setting->AddressOrigin.set(ADDRESS_ORIGIN_STATIC);
    (is_ipv6(interface.address) ? setting->IPv6Address : setting->IPv4Address)
        .set(interface.address);
    setting->SubnetMask.set(interface.subnet_mask);
    (is_ipv6(interface.gateway) ? setting->GatewayIPv6Address : setting->GatewayIPv4Address)
        .set(interface.gateway);
    // Null where the host's kernel keeps them.
    setting->VLANEnabled = interface.endpoint->VLANEnabled;
    setting->VLANID = interface.endpoint->VLANID;
    setting->Priority = interface.endpoint->Priority;
    return setting;
}

Ref<VLNMPCA_RemoteServiceAccessPoint> gateway_instance(const String& address,
                                                       const CIM_ComputerSystem& system) {
    auto gateway = make_instance<VLNMPCA_RemoteServiceAccessPoint>();
    gateway->InstanceID.set("Default Gateway Address");
    name_in_system(*gateway, system);
    gateway->Name.set(address);
    gateway->ElementName.set("Default Gateway Address");
    gateway->AccessInfo.set(address);
    gateway->InfoFormat.set(is_ipv6(address) ? INFO_FORMAT_IPV6_ADDRESS : INFO_FORMAT_IPV4_ADDRESS);
    gateway->AccessContext.set(ACCESS_CONTEXT_DEFAULT_GATEWAY);
    return gateway;
}

} // namespace

const VLNMPCA_IPConfigurationService* IP_Interface_Maps::findOrMakeService() {
    auto& services = _agent.m_VLNMPCA_IPConfigurationService_map;
    if (services.size() != 0)
        return services[0];
    const auto* service = insert_instance(services, service_instance(*_system));
    if (service)
        associate(_agent.m_VLNMPCA_HostedIPConfigurationService_map, _system, service);
    return service;
}

uint32 IP_Interface_Maps::CreateIPInterfaceInstances(const IP_Interface& interface) {
    const auto* service = findOrMakeService();
    if (!service)
        return SKIP_DEVICE;
    if (const auto* profile = Profile_Maps(_agent).createRegisteredProfile(PROFILE_IP_INTERFACE))
        associate(_agent.m_VLNMPCA_IPProtocolEndpointConformsToProfile_map, profile,
                  interface.endpoint);
    if (!joinCapabilities(interface))
        return SKIP_DEVICE;
    if (!associate(_agent.m_VLNMPCA_IPConfigurationServiceAffectsElement_map, interface.endpoint,
                   service))
        return END_PASS;
    if (!interface.gateway.empty() && !joinGateway(interface))
        return END_PASS;
    return createSettings(interface);
}

bool IP_Interface_Maps::joinCapabilities(const IP_Interface& interface) {
    const auto* capabilities =
        insert_instance(_agent.m_VLNMPCA_EnabledLogicalIPProtocolEndpointCapabilities_map,
                        capabilities_instance(interface.endpoint->Name.value));
    return capabilities && associate(_agent.m_VLNMPCA_IPProtocolEndpointCapabilities_map,
                                     interface.endpoint, capabilities);
}

// Ports of one network share their gateway.
bool IP_Interface_Maps::joinGateway(const IP_Interface& interface) {
    const auto* gateway = findOrMakeGateway(interface.gateway);
    return gateway && associate(_agent.m_VLNMPCA_RemoteAccessAvailableToElement_map, gateway,
                                interface.endpoint);
}

const VLNMPCA_RemoteServiceAccessPoint*
IP_Interface_Maps::findOrMakeGateway(const String& address) {
    auto& gateways = _agent.m_VLNMPCA_RemoteServiceAccessPoint_map;
    if (const auto* known =
            find_in_system(_agent, gateways, &VLNMPCA_RemoteServiceAccessPoint::Name, address))
        return known;
    const auto* gateway = insert_instance(gateways, gateway_instance(address, *_system));
    if (gateway)
        associate(_agent.m_VLNMPCA_RemoteHostedAccessPoint_map, _system, gateway);
    return gateway;
}

uint32 IP_Interface_Maps::createSettings(const IP_Interface& interface) {
    const auto* setting =
        insert_instance(_agent.m_VLNMPCA_IPAssignmentSettingData_map, setting_instance(interface));
    const auto* static_setting = insert_instance(_agent.m_VLNMPCA_StaticIPAssignmentSettingData_map,
                                                 static_setting_instance(interface));
    if (!setting || !static_setting)
        return SKIP_DEVICE;
    const bool joined =
        associate(_agent.m_VLNMPCA_IPProtocolEndpointIPAssignmentSettingData_map,
                  interface.endpoint, setting) &&
        associate(_agent.m_VLNMPCA_StaticIPProtocolEndpointIPAssignmentSettingData_map,
                  interface.endpoint, static_setting) &&
        associate(_agent.m_VLNMPCA_OrderedIPAssignmentSettingData_map, setting, static_setting);
    return joined ? MAP_OK : END_PASS;
}

} // namespace cimple
