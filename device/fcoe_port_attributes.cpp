#include "device/attribute_table.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = FCoEPortAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {771, "_PortSymbolicName", &A::PortSymbolicName},
    {772, "_PortFcId", &A::PortFcId},
    {773, "_PortType", &A::PortType},
    {774, "_FunctionalPortState", &A::FunctionalPortState},
    {775, "_PORT_SERVICE_TYPE", &A::PORT_SERVICE_TYPE},
    {775, "_PortSupportedClassofService", &A::PortSupportedClassofService},
    {776, "_PortSupportedFc4Types", &A::PortSupportedFc4Types},
    {777, "_PortActiveFc4Types", &A::PortActiveFc4Types},
    {778, "_PortSupportedSpeed", &A::PortSupportedSpeed},
    {779, "_PortSpeed", &A::PortSpeed},
    {780, "_PortMaxFrameSize", &A::PortMaxFrameSize},
    {781, "_OSDeviceName", &A::OSDeviceName},
    {782, "_NumberofDiscoveredPorts", &A::NumberofDiscoveredPorts},
    {802, "_PhysicalPortState", &A::PhysicalPortState},
    {815, "_FuncPortSpeed", &A::FuncPortSpeed},
    {816, "_FuncQosBandwidth", &A::FuncQosBandwidth},
    {823, "_PFCThrottle", &A::PFCThrottle},
    {842, "_PhysicalPortSpeed", &A::PhysicalPortSpeed},
    {855, "_PhyLinkDownReason", &A::PhyLinkDownReason},
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
