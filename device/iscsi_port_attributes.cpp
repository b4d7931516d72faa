#include "device/attribute_table.h"
#include "device/library/hba_api.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/log.h"

#include <exception>

namespace cimple {

namespace {

using A = iSCSIPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {774, "_FunctionalPortState", &A::FunctionalPortState},
    {778, "_PortSupportedSpeed", &A::PortSupportedSpeed},
    {779, "_PortSpeed", &A::PortSpeed},
    {784, "_MaximumMTU", &A::MaximumMTU},
    {785, "_LDTO ", &A::LDTO},
    {786, "_DefaultETO ", &A::DefaultETO},
    {801, "_MaxCDBLength", &A::MaxCDBLength},
    {802, "_PhysicalPortState", takePhysicalPortState<A>},
    {804, "_PermanentMACAddress", &A::PermanentMACAddress},
    {805, "_CurrentMTU ", &A::CurrentMTU},
    {815, "_FuncPortSpeed", &A::FuncPortSpeed},
    {816, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {817, "_CurrentMACAddress", &A::CurrentMACAddress},
    {842, "_PhysicalPortSpeed", &A::PhysicalPortSpeed},
    {855, "_PhyLinkDownReason", &A::PhyLinkDownReason},
    {856, "_FuncQosMinBandwidth", &A::FuncQosMinBandwidth},
    {857, "_IPV6GatewayAddr", &A::IPV6GatewayAddr},
};

} // namespace

iSCSIPortAttributes::iSCSIPortAttributes(Adapter&, uint32, const HBAIdentifier&,
                                         const LocalHBAInfoV4& localHBAInfo)
    : StoragePortAttributes(localHBAInfo) {
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
