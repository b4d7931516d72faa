#include "device/attribute_table.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = NICPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {774, "_FunctionalPortState", &A::FunctionalPortState},
    {778, "_SupportedPortSpeed", &A::PortSupportedSpeed},
    {779, "_PortSpeed", &A::PortSpeed},
    {784, "_MaximumMTU", &A::MaximumMTU},
    {800, "_FunctionType", &A::FunctionType},
    {802, "_PhysicalPortState", takePhysicalPortState<A>},
    {803, "_IfName", &A::IfName},
    {804, "_PermanentMACAddress", &A::PermanentMACAddress},
    {805, "_CurrentMTU ", &A::CurrentMTU},
    {806, "_ProtocolIFType", &A::ProtocolIFType},
    {807, "_LinkTechnology", &A::LinkTechnology},
    {808, "_Capabilities", &A::Capabilities},
    {809, "_EnabledCapabilities", &A::EnabledCapabilities},
    {810, "_IPProtocolEndpointName", &A::IPProtocolEndpointName},
    {811, "_IPProtocolIFType", &A::IPProtocolIFType},
    {812, "_IPv4Address", &A::IPv4Address},
    {813, "_SubnetMask", &A::SubnetMask},
    {814, "_AddressOrigin", &A::AddressOrigin},
    {815, "_FuncPortSpeed", &A::FuncPortSpeed},
    {816, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {817, "_CurrentMACAddress", &A::CurrentMACAddress},
    {818, "_vNICEnabledState", &A::vNICEnabledState},
    {819, "_VNICName", &A::VNICName},
    {820, "_vNICOuterVLANId", &A::vNICOuterVLANId},
    {821, "_VNICMinBandwidth", &A::VNICMinBandwidth},
    {822, "_VNICMaxBandwidth", &A::VNICMaxBandwidth},
    {843, "_GatewayAddress", &A::GatewayAddress},
    {853, "_SRIOVState", &A::SRIOVState},
    {855, "_PhyLinkDownReason", &A::PhyLinkDownReason},
    {856, "_FuncQosMinBandwidth", &A::FuncQosMinBandwidth},
    {857, "_IPV6GatewayAddr", &A::IPV6GatewayAddr},
    {865, "_VEPAState", &A::VEPAState},
};

} // namespace

NICPortAttributes::NICPortAttributes(Adapter&, uint32, const HBAIdentifier&,
                                     const LocalHBAInfoV4& localHBAInfo)
    : PortName(VLN_Common::wwnText(localHBAInfo.portWWN)),
      SpecialFeature(localHBAInfo.SpecialFeatures) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortName.c_str());
    VLN_LOG(VLN_DBG, "Port MAC Address : [%s]", PortName.c_str());
    Attribute_Buffer buffer = fetchPortAttributes(wwnOfPort(PortName));
    VLN_LOG(VLN_ERR, " hbaInfo.SpecialFeatures : (%d) _SpecialFeature : %d \n",
            localHBAInfo.SpecialFeatures, SpecialFeature);
    readTable(PORT_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
