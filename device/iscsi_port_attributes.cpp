#include "device/attribute_table.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/field_text.h"
#include "foundation/log.h"

#include <exception>

namespace cimple {

namespace {

using A = iSCSIPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_PA_FUNCTIONAL_PORT_STATE, "_FunctionalPortState", &A::FunctionalPortState},
    {AX_PA_PORT_SUPPORTED_SPEED, "_PortSupportedSpeed", &A::PortSupportedSpeed},
    {AX_PA_PORT_SPEED, "_PortSpeed", &A::PortSpeed},
    {AX_PA_MAXIMUM_MTU, "_MaximumMTU", &A::MaximumMTU},
    {AX_PA_LDTO, "_LDTO ", &A::LDTO},
    {AX_PA_DEFAULT_ETO, "_DefaultETO ", &A::DefaultETO},
    {AX_PA_MAX_CDB_LENGTH, "_MaxCDBLength", &A::MaxCDBLength},
    {AX_PA_PHYSICAL_PORT_STATE, "_PhysicalPortState", takePhysicalPortState<A>},
    {AX_PA_PERMANENT_MAC_ADDRESS, "_PermanentMACAddress", &A::PermanentMACAddress},
    {AX_PA_CURRENT_MTU, "_CurrentMTU ", &A::CurrentMTU},
    {AX_PA_FUNCTIONAL_PORT_SPEED, "_FuncPortSpeed", &A::FuncPortSpeed},
    {AX_PA_FUNCTIONAL_QOS_BANDWIDTH, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {AX_PA_CURRENT_MAC_ADDRESS, "_CurrentMACAddress", &A::CurrentMACAddress},
    {AX_PA_PHYSICAL_PORT_SPEED, "_PhysicalPortSpeed", &A::PhysicalPortSpeed},
    {AX_PA_ISCSI_BOOT, "_iSCSIBoot", &A::iSCSIBoot},
    {AX_PA_PHY_LINK_DOWN_REASON, "_PhyLinkDownReason", &A::PhyLinkDownReason},
    {AX_PA_FUNCTIONAL_QOS_MIN_BANDWIDTH, "_FuncQosMinBandwidth", &A::FuncQosMinBandwidth},
    {AX_PA_IPV6_GATEWAY_ADDRESS, "_IPV6GatewayAddr", &A::IPV6GatewayAddr},
};

} // namespace

iSCSIPortAttributes::iSCSIPortAttributes(Adapter&, uint32, const HBAIdentifier&,
                                         const LocalHBAInfoV4& localHBAInfo)
    : StoragePortAttributes(localHBAInfo), EthernetPortFacts(0) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    const AX_WWN wwn = wwnOfPort(PortWWN);
    Attribute_Buffer buffer = fetchPortAttributes(wwn);
    readInitiatorProperties(wwn);
    readNetworkProperties(wwn);
    readTable(PORT_FAMILY, buffer, *this, TABLE);
}

void iSCSIPortAttributes::readInitiatorProperties(AX_WWN wwn) {
    AX_iSCSI_InitiatorProperties properties{};
    if (AX_iSCSI_GetInitiatorProperties(wwn, &properties) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "ERROR: AX_iSCSI_GetInitiatorProperties() Failed.");
        throw std::exception();
    }
    InitiatorName = fieldText(properties.name);
    InitiatorAlias = fieldText(properties.alias);
    LoginOptions = properties.loginOptions;

    const AX_iSCSI_Authentication& authentication = properties.authentication;
    if (authentication.method == AX_ISCSI_AUTH_NONE) {
        AuthenticationMethod = "None";
        return;
    }
    TargetCHAPName = fieldText(authentication.targetCHAPName);
    if (authentication.method == AX_ISCSI_AUTH_ONE_WAY_CHAP) {
        AuthenticationMethod = "One-Way CHAP";
    } else {
        AuthenticationMethod = "Mutual CHAP";
        InitiatorCHAPName = fieldText(authentication.initiatorCHAPName);
    }
}

void iSCSIPortAttributes::readNetworkProperties(AX_WWN wwn) {
    AX_Ini_NetworkProperties properties{};
    if (AX_Ini_GetNetworkProperties(wwn, &properties) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "ERROR: ADPCMD_GetNetConfig: AX_iSCSI_GetNetConfig() Failed.");
        throw std::exception();
    }
    IPAddress = addressText(properties.address);
    SubnetMask = addressText(properties.subnetMask);
    GatewayAddress = addressText(properties.gateway);
    AddressOrigin = properties.addressOrigin;
    LinkUp = properties.linkUp;
    VLANEnabled = properties.vlanEnabled;
    VLANPriority = properties.priority;
    VLANID = properties.vlanID;
}

} // namespace cimple
