#include "device/attribute_table.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = FCoEPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_PA_PORT_SYMBOLIC_NAME, "_PortSymbolicName", &A::PortSymbolicName},
    {AX_PA_PORT_FC_ID, "_PortFcId", &A::PortFcId},
    {AX_PA_PORT_TYPE, "_PortType", &A::PortType},
    {AX_PA_FUNCTIONAL_PORT_STATE, "_FunctionalPortState", &A::FunctionalPortState},
    {AX_PA_PORT_SERVICE_TYPE, "_PORT_SERVICE_TYPE", &A::PORT_SERVICE_TYPE},
    {AX_PA_PORT_SERVICE_TYPE, "_PortSupportedClassofService", &A::PortSupportedClassofService},
    {AX_PA_PORT_SUPPORTED_FC4_TYPES, "_PortSupportedFc4Types", &A::PortSupportedFc4Types},
    {AX_PA_PORT_ACTIVE_FC4_TYPES, "_PortActiveFc4Types", &A::PortActiveFc4Types},
    {AX_PA_PORT_SUPPORTED_SPEED, "_PortSupportedSpeed", &A::PortSupportedSpeed},
    {AX_PA_PORT_SPEED, "_PortSpeed", &A::PortSpeed},
    {AX_PA_PORT_MAX_FRAME_SIZE, "_PortMaxFrameSize", &A::PortMaxFrameSize},
    {AX_PA_OS_DEVICE_NAME, "_OSDeviceName", &A::OSDeviceName},
    {AX_PA_NUMBER_OF_DISCOVERED_PORTS, "_NumberofDiscoveredPorts", &A::NumberofDiscoveredPorts},
    {AX_PA_PHYSICAL_PORT_STATE, "_PhysicalPortState", &A::PhysicalPortState},
    {AX_PA_FUNCTIONAL_PORT_SPEED, "_FuncPortSpeed", &A::FuncPortSpeed},
    {AX_PA_FUNCTIONAL_QOS_BANDWIDTH, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {AX_PA_PFC_THROTTLE, "_PFCThrottle", &A::PFCThrottle},
    {AX_PA_PHYSICAL_PORT_SPEED, "_PhysicalPortSpeed", &A::PhysicalPortSpeed},
    {AX_PA_PHY_LINK_DOWN_REASON, "_PhyLinkDownReason", &A::PhyLinkDownReason},
};

} // namespace

FCoEPortAttributes::FCoEPortAttributes(Adapter&, uint32, const HBAIdentifier&,
                                       const LocalHBAInfoV4& localHBAInfo)
    : StoragePortAttributes(localHBAInfo) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    Attribute_Buffer buffer = fetchPortAttributes(wwnOfPort(PortWWN));
    readTable(PORT_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
