#include "device/attribute_table.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = NICPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_PA_FUNCTIONAL_PORT_STATE, "_FunctionalPortState", &A::FunctionalPortState},
    {AX_PA_PORT_SUPPORTED_SPEED, "_SupportedPortSpeed", &A::PortSupportedSpeed},
    {AX_PA_PORT_SPEED, "_PortSpeed", &A::PortSpeed},
    {AX_PA_MAXIMUM_MTU, "_MaximumMTU", &A::MaximumMTU},
    {AX_PA_FUNCTION_TYPE, "_FunctionType", &A::FunctionType},
    {AX_PA_PHYSICAL_PORT_STATE, "_PhysicalPortState", takePhysicalPortState<A>},
    {AX_PA_IF_NAME, "_IfName", &A::IfName},
    {AX_PA_PERMANENT_MAC_ADDRESS, "_PermanentMACAddress", &A::PermanentMACAddress},
    {AX_PA_CURRENT_MTU, "_CurrentMTU ", &A::CurrentMTU},
    {AX_PA_PROTOCOL_IF_TYPE, "_ProtocolIFType", &A::ProtocolIFType},
    {AX_PA_LINK_TECHNOLOGY, "_LinkTechnology", &A::LinkTechnology},
    {AX_PA_CAPABILITIES, "_Capabilities", &A::Capabilities},
    {AX_PA_ENABLED_CAPABILITIES, "_EnabledCapabilities", &A::EnabledCapabilities},
    {AX_PA_IP_PROTOCOL_ENDPOINT_NAME, "_IPProtocolEndpointName", &A::IPProtocolEndpointName},
    {AX_PA_IP_PROTOCOL_IF_TYPE, "_IPProtocolIFType", &A::IPProtocolIFType},
    {AX_PA_IPV4_ADDRESS, "_IPv4Address", &A::IPv4Address},
    {AX_PA_SUBNET_MASK, "_SubnetMask", &A::SubnetMask},
    {AX_PA_ADDRESS_ORIGIN, "_AddressOrigin", &A::AddressOrigin},
    {AX_PA_FUNCTIONAL_PORT_SPEED, "_FuncPortSpeed", &A::FuncPortSpeed},
    {AX_PA_FUNCTIONAL_QOS_BANDWIDTH, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {AX_PA_CURRENT_MAC_ADDRESS, "_CurrentMACAddress", &A::CurrentMACAddress},
    {AX_PA_VNIC_ENABLED_STATE, "_vNICEnabledState", &A::vNICEnabledState},
    {AX_PA_VNIC_NAME, "_VNICName", &A::VNICName},
    {AX_PA_VNIC_OUTER_VLAN_ID, "_vNICOuterVLANId", &A::vNICOuterVLANId},
    {AX_PA_VNIC_MIN_BANDWIDTH, "_VNICMinBandwidth", &A::VNICMinBandwidth},
    {AX_PA_VNIC_MAX_BANDWIDTH, "_VNICMaxBandwidth", &A::VNICMaxBandwidth},
    {AX_PA_GATEWAY_ADDRESS, "_GatewayAddress", &A::GatewayAddress},
    {AX_PA_SRIOV_STATE, "_SRIOVState", &A::SRIOVState},
    {AX_PA_PHY_LINK_DOWN_REASON, "_PhyLinkDownReason", &A::PhyLinkDownReason},
    {AX_PA_FUNCTIONAL_QOS_MIN_BANDWIDTH, "_FuncQosMinBandwidth", &A::FuncQosMinBandwidth},
    {AX_PA_IPV6_GATEWAY_ADDRESS, "_IPV6GatewayAddr", &A::IPV6GatewayAddr},
    {AX_PA_VEPA_STATE, "_VEPAState", &A::VEPAState},
};

} // namespace

NICPortAttributes::NICPortAttributes(Adapter&, uint32, const HBAIdentifier&,
                                     const LocalHBAInfoV4& localHBAInfo)
    : EthernetPortFacts(1), PortName(VLN_Common::wwnText(localHBAInfo.portWWN)),
      SpecialFeature(localHBAInfo.SpecialFeatures) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortName.c_str());
    VLN_LOG(VLN_DBG, "Port MAC Address : [%s]", PortName.c_str());
    Attribute_Buffer buffer = fetchPortAttributes(wwnOfPort(PortName));
    VLN_LOG(VLN_ERR, " hbaInfo.SpecialFeatures : (%d) _SpecialFeature : %d \n",
            localHBAInfo.SpecialFeatures, SpecialFeature);
    readTable(PORT_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
