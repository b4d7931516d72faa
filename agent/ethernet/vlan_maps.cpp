// The VLAN that a virtual NIC port is bound to.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/VLNMPCA_VLANEndpoint.h"
#include "classes/VLNMPCA_VLANEndpointSettingData.h"

namespace cimple {

namespace {

constexpr uint16 PROTOCOL_TYPE_OTHER = 1; // CIM_ProtocolEndpoint.ProtocolType

Ref<VLNMPCA_VLANEndpoint> vlan_endpoint_instance(const NICAdapterAttributes& adapter,
                                                 const NICPortAttributes& attributes,
                                                 const String& port_name,
                                                 const VLNMPCA_LANEndpoint& lan_endpoint) {
    auto endpoint = make_instance<VLNMPCA_VLANEndpoint>();
    endpoint->ElementName.set(format_text("VLAN Endpoint:%s", port_name.c_str()));
    endpoint->Description.set(text(attributes.VNICName));
    endpoint->SystemCreationClassName.set(lan_endpoint.SystemCreationClassName.value);
    endpoint->SystemName.set(lan_endpoint.SystemName.value);
    endpoint->CreationClassName.set("VLNMPCA_VLANEndpoint");
    endpoint->Name.set(format_text("%s:%s", adapter.SerialNumber.c_str(), port_name.c_str()));
    endpoint->ProtocolType.set(PROTOCOL_TYPE_OTHER);
    endpoint->OtherTypeDescription.set("vNIC");
    endpoint->ProtocolIFType.set(lan_endpoint.ProtocolIFType.value);
    endpoint->RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    endpoint->EnabledState.set(enabled_state(attributes.FunctionalPortState));
    endpoint->MACAddress.set(text(attributes.CurrentMACAddress));
    return endpoint;
}

Ref<VLNMPCA_VLANEndpointSettingData> vlan_setting_instance(const NICAdapterAttributes& adapter,
                                                           const NICPortAttributes& attributes,
                                                           const String& port_name) {
    auto setting = make_instance<VLNMPCA_VLANEndpointSettingData>();
    setting->Description.set(format_text("VLAN EndpointSettingData:%s", port_name.c_str()));
    setting->ElementName.set("VLN:FCoE Driver Parameter:"); // as consoles know it
    setting->InstanceID.set(format_text("VLN:VLANEndpointSettingData MPCA:%s:VNIC:%s:%s",
                                        adapter.SerialNumber.c_str(), attributes.VNICName.c_str(),
                                        port_name.c_str()));
    setting->AccessVLAN.set(static_cast<uint16>(attributes.vNICOuterVLANId));
    setting->MinimumBandwidth.set(text(attributes.VNICMinBandwidth));
    setting->MaximumBandwidth.set(text(attributes.VNICMaxBandwidth));
    return setting;
}

} // namespace

void Adapter_Map_Builder::createVLANObjects(const NIC_Port& port) {
    const NICPortAttributes& attributes = *port.attributes;
    if (attributes.vNICEnabledState == 0 || !port.lan_endpoint)
        return;
    VLN_LOG(VLN_DBG, "Port %s is virtual NIC port", port.name.c_str());
    const NICAdapterAttributes& adapter = *port.function.attributes;
    const auto* endpoint =
        insert_instance(_agent.m_VLNMPCA_VLANEndpoint_map,
                        vlan_endpoint_instance(adapter, attributes, port.name, *port.lan_endpoint));
    associate(_agent.m_VLNMPCA_HostedVLANEndpoint_map, _system, endpoint);
    associate(_agent.m_VLNMPCA_VLANEndPointidentity_map, port.lan_endpoint, endpoint);
    const auto* setting = insert_instance(_agent.m_VLNMPCA_VLANEndpointSettingData_map,
                                          vlan_setting_instance(adapter, attributes, port.name));
    associate(_agent.m_VLNMPCA_VLANSettingData_map, endpoint, setting);
}

} // namespace cimple
