#include "services/ip_tables/configuration_provider.h"

#include "agent/element_setting.h"
#include "agent/gates.h"
#include "classes/VLNMPCA_IPAssignmentSettingData.h"
#include "classes/VLNMPCA_IPConfigurationServiceAffectsElement.h"
#include "classes/VLNMPCA_IPProtocolEndpoint.h"
#include "classes/VLNMPCA_IPProtocolEndpointIPAssignmentSettingData.h"
#include "classes/VLNMPCA_OrderedIPAssignmentSettingData.h"
#include "classes/VLNMPCA_StaticIPAssignmentSettingData.h"
#include "classes/VLNMPCA_StaticIPProtocolEndpointIPAssignmentSettingData.h"
#include "services/ip_tables/entries.h"
#include "services/method_call.h"

#include <cstdio>

namespace cimple {

namespace {

constexpr uint32 APPLY_FAILED = 4;

uint32 refuse(const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return APPLY_FAILED;
}

// What a call is about, in the stores.
struct Assignment {
    const VLNMPCA_IPConfigurationService* service = nullptr;
    const VLNMPCA_IPAssignmentSettingData* setting = nullptr;
    const VLNMPCA_IPProtocolEndpoint* endpoint = nullptr;
    const VLNMPCA_StaticIPAssignmentSettingData* static_setting = nullptr;
};

template <class C>
const C* stored(const Instance_Map<C>& store, const Instance* keys) {
    return keys ? store.lookup(keys) : nullptr;
}

bool are_joined(const Instance_Map_Base& store, const Instance* first, const Instance* second) {
    const auto link = association_of(store.meta_class(), {first, second});
    return link && store.find(link.get()) >= 0;
}

// The static setting that the configuration orders.
const VLNMPCA_StaticIPAssignmentSettingData*
find_static_setting(const ProviderAgent& agent, const VLNMPCA_IPAssignmentSettingData* setting) {
    const auto* order =
        find_first(agent.m_VLNMPCA_OrderedIPAssignmentSettingData_map,
                   [&](const VLNMPCA_OrderedIPAssignmentSettingData& each) {
                       return each.GroupComponent && key_eq(each.GroupComponent, setting);
                   });
    return order ? stored(agent.m_VLNMPCA_StaticIPAssignmentSettingData_map, order->PartComponent)
                 : nullptr;
}

// Null, or the line of what is not there.
const char* find_assignment(const ProviderAgent& agent, const VLNMPCA_IPConfigurationService* self,
                            const Instance* configuration, const Instance* endpoint,
                            Assignment& found) {
    const auto& services = agent.m_VLNMPCA_IPConfigurationService_map;
    found.service = services.size() == 1 ? stored(services, self) : nullptr;
    if (!found.service)
        return "Instance not found in m_VLNMPCA_IPConfigurationService_map";
    found.setting = stored(agent.m_VLNMPCA_IPAssignmentSettingData_map, configuration);
    if (!found.setting)
        return "Configuration not found in m_VLNMPCA_IPAssignmentSettingData_map";
    found.endpoint = stored(agent.m_VLNMPCA_IPProtocolEndpoint_map, endpoint);
    if (!found.endpoint)
        return "Endpoint not found in m_VLNMPCA_IPProtocolEndpoint_map";
    found.static_setting = find_static_setting(agent, found.setting);
    const bool joined =
        found.static_setting &&
        are_joined(agent.m_VLNMPCA_IPProtocolEndpointIPAssignmentSettingData_map, found.endpoint,
                   found.setting) &&
        are_joined(agent.m_VLNMPCA_StaticIPProtocolEndpointIPAssignmentSettingData_map,
                   found.endpoint, found.static_setting) &&
        are_joined(agent.m_VLNMPCA_IPConfigurationServiceAffectsElement_map, found.endpoint,
                   found.service);
    return joined ? nullptr : "One or more of the associations do not exist";
}

// The library's name of the port, from that of its endpoint, which begins with the numbers of the
// adapter and of its port.
bool find_port(const ProviderAgent& agent, const VLNMPCA_IPProtocolEndpoint& endpoint,
               HBA_WWN& name) {
    unsigned adapter_number = 0, port_index = 0;
    if (!agent.m_pData ||
        std::sscanf(endpoint.Name.value.c_str(), "IPv4_%u_%u_", &adapter_number, &port_index) != 2)
        return false;
    for (const auto& adapter : agent.m_pData->adapters)
        if (adapter->getAdapterNumber() == adapter_number)
            for (const auto& port : adapter->getPorts())
                if (port->getPortIndex() == port_index)
                    return VLN_MethodWrapper::string2HBAName(&name, port->getPortName().c_str()) ==
                           1;
    return false;
}

bool put_address(const Property<String>& property, AX_IPAddress& address) {
    const auto bytes = parse_ipv4({property.value.c_str(), property.value.size()});
    if (bytes)
        put_ipv4(*bytes, address);
    return bytes.has_value();
}

// False for addresses that are none of IPv4. An interface may have no gateway.
bool read_settings(const VLNMPCA_StaticIPAssignmentSettingData& setting,
                   AX_Ini_NetworkProperties& settings) {
    if (!put_address(setting.IPv4Address, settings.address) ||
        !put_address(setting.SubnetMask, settings.subnetMask))
        return false;
    const Property<String>& gateway = setting.GatewayIPv4Address;
    if (!gateway.value.empty() && !put_address(gateway, settings.gateway))
        return false;
    settings.addressOrigin = AX_ADDRESS_ORIGIN_STATIC;
    settings.vlanEnabled = setting.VLANEnabled.value != 0;
    settings.vlanID = static_cast<uint16>(setting.VLANID.value);
    settings.priority = static_cast<uint8>(setting.Priority.value);
    return true;
}

// The endpoint as the adapter has it now, and the ties to it with it. Its name stays until the
// adapters are read anew.
void show(ProviderAgent& agent, const Assignment& assignment) {
    const VLNMPCA_StaticIPAssignmentSettingData& setting = *assignment.static_setting;
    const auto* endpoint = change(agent.m_VLNMPCA_IPProtocolEndpoint_map, assignment.endpoint,
                                  [&](VLNMPCA_IPProtocolEndpoint& each) {
                                      each.IPv4Address = setting.IPv4Address;
                                      each.SubnetMask = setting.SubnetMask;
                                      each.VLANEnabled = setting.VLANEnabled;
                                      each.VLANID = setting.VLANID;
                                      each.Priority = setting.Priority;
                                      if (!setting.GatewayIPv4Address.value.empty())
                                          each.GatewayAddress = setting.GatewayIPv4Address;
                                      each.AddressOrigin.set(AX_ADDRESS_ORIGIN_STATIC);
                                  });
    auto& links = agent.m_VLNMPCA_IPProtocolEndpointIPAssignmentSettingData_map;
    const auto link = association_of(links.meta_class(), {endpoint, assignment.setting});
    const sint32 index = link ? links.find(link.get()) : -1;
    if (index < 0)
        return;
    links.remove(static_cast<uint32>(index));
    associate(links, endpoint, assignment.setting, {}, [](Instance& each) {
        cast<CIM_ElementSettingData>(&each)->IsCurrent.set(SETTING_IS);
    });
}

uint32 apply(ProviderAgent& agent, const VLNMPCA_IPConfigurationService* self,
             const Instance* configuration, const Instance* endpoint) {
    const Operation_Prologue prologue(agent);
    Assignment assignment;
    if (const char* missing = find_assignment(agent, self, configuration, endpoint, assignment))
        return refuse(missing);
    HBA_WWN port{};
    if (!find_port(agent, *assignment.endpoint, port))
        return refuse("Failed to get the hbaName of the IP Interface");
    AX_Ini_NetworkProperties settings{};
    if (!read_settings(*assignment.static_setting, settings))
        return refuse("The static setting has no IPv4 address");
    if (const AX_STATUS status = VLN_MethodWrapper::SetNetworkSettings(&port, settings)) {
        VLN_LOG(VLN_ERR, "AX Call SetNetworkSettings failed with %d", static_cast<int>(status));
        return APPLY_FAILED;
    }
    show(agent, assignment);
    return METHOD_DONE;
}

} // namespace

sint32 IP_Configuration_Provider::ApplySettingToIPProtocolEndpoint(
    const VLNMPCA_IPConfigurationService* self, CIM_IPAssignmentSettingData* const* configuration,
    CIM_IPProtocolEndpoint* const* endpoint, CIM_ConcreteJob**, Property<uint32>* result) {
    const sint32 status = answer_method(*result, [&](ProviderAgent& agent) {
        return apply(agent, self, configuration ? *configuration : nullptr,
                     endpoint ? *endpoint : nullptr);
    });
    return result->value == APPLY_FAILED ? INVOKE_METHOD_FAILED : status;
}

} // namespace cimple
