#include "device/adapter.h"
#include "device/attribute_table.h"
#include "device/library/hba_api.h"
#include "device/port_attributes.h"
#include "foundation/common.h"
#include "foundation/field_text.h"
#include "foundation/log.h"

#include <cstring>
#include <exception>

namespace cimple {

FCPortAttributes::FCPortAttributes(Adapter& adapter, uint32 portIndex) {
    readPublishedRecord(adapter.getAdapterName(), portIndex);
    VLN_LOG(VLN_DBG, "Port's WWPN: %s", PortWWN.c_str());
    Attribute_Buffer buffer = fetchPortAttributes(wwnOfPort(PortWWN));
    getPortAttributeNumber(buffer, AX_PA_PHYSICAL_PORT_STATE, "_PortState", &PortState);
    VLN_LOG(VLN_DBG, "Physical port state for FC Port: %d", PortState);
    getPortAttributeNumber(buffer, AX_PA_FEC_STATE, "_FECState", &FECState);
    VLN_LOG(VLN_DBG, "FEC state for FC Port: %d", FECState);
}

void FCPortAttributes::readPublishedRecord(const std::string& adapterName, uint32 portIndex) {
    HBA_PORTATTRIBUTES record;
    const HBA_STATUS status = HBA_Adapter(adapterName).getPortAttributes(portIndex, record);
    if (status != HBA_STATUS_OK) {
        VLN_LOG(VLN_ERR, "(portIndex=%d) failed with hbaStatus %d", portIndex, status);
        throw std::exception();
    }
    PortFcId = record.PortFcId;
    PortType = record.PortType;
    PortState = record.PortState;
    PortSupportedClassofService = record.PortSupportedClassofService;
    std::memcpy(PortSupportedFc4Types.data(), record.PortSupportedFc4Types.bits,
                PortSupportedFc4Types.size());
    std::memcpy(PortActiveFc4Types.data(), record.PortActiveFc4Types.bits,
                PortActiveFc4Types.size());
    OSDeviceName = fieldText(record.OSDeviceName);
    PortSymbolicName = fieldText(record.PortSymbolicName);
    PortSupportedSpeed = record.PortSupportedSpeed;
    PortSpeed = record.PortSpeed;
    PortMaxFrameSize = record.PortMaxFrameSize;
    NodeWWN = VLN_Common::wwnText(record.NodeWWN.wwn);
    PortWWN = VLN_Common::wwnText(record.PortWWN.wwn);
    FabricName = VLN_Common::wwnText(record.FabricName.wwn);
    NumberofDiscoveredPorts = record.NumberofDiscoveredPorts;
}

} // namespace cimple
