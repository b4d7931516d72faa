#include "device/adapter.h"
#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "device/library/hba_api.h"
#include "foundation/common.h"
#include "foundation/log.h"

#include <exception>

namespace cimple {

namespace {

using A = FCAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {519, "_NodeSymbolicName", &A::NodeSymbolicName},
    {521, "_OptionROMVersion", &A::OptionROMVersion},
    {526, "_DeviceID", &A::DeviceID},
    {527, "_ModelID", &A::ModelID},
    {528, "Operational Firmware", &A::OpertionalFirmwareVersion},
    {529, "_SLI1FirmwareName", &A::SLI1FirmwareName},
    {530, "_SLI2FirmwareName", &A::SLI2FirmwareName},
    {531, "_IEEE_ADDRESS", Attribute_Row<A>::Raw_Address{&A::IEEEAddress}},
    {532, "_BootCodeEnabled", &A::BootCodeEnabled},
    {534, "_BOOTBIOS_VERSION", &A::BootVersion},
    {544, "_DiagVersion", &A::DiagVersionNumber},
    {545, "INITIAL_FW_LOAD", &A::FunctionalFirmwareVersion},
    {546, "_KERNEL_VERSION", &A::KernelFirmwareVersion},
    {548, "_SLI3FirmwareName", &A::SLI3FirmwareName},
    {549, "_SLIMode", &A::SLIMode},
    {551, "_BoardTemperature", &A::BoardTemperature},
    {553, "_PortNumber", &A::PortNumber},
    {555, "_PCIBusNumber", &A::PCIBusNumber},
    {556, "_FunctionType", &A::FunctionType},
    {560, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {563, "_SPFirmwareVersion", &A::SPFirmwareVersion},
    {564, "_SPFirmwareName", &A::SPFirmwareName},
    {565, "_ULPFirmwareVersion", &A::ULPFirmwareVersion},
    {566, "_ULPFirmwareName", &A::ULPFirmwareName},
    {586, "_SubadapterID", &A::Subadapter_number},
    {587, "_FCUniversalVersion", &A::FCUniversalVersion},
    {588, "FC_X86_BIOSVersion", &A::FC_X86_BIOSVersion},
    {589, "_FC_EFIVersion", &A::FC_EFIVersion},
    {590, "_FC_FCODEVersion", &A::FC_FCODEVersion},
    {591, "_FirmwareOnFlash", &A::FirmwareOnFlash},
};

} // namespace

FCAdapterAttributes::FCAdapterAttributes(Adapter& adapter) {
    VLN_LOG(VLN_DBG, "FCAdapterName:%s", adapter.getAdapterName().c_str());
    readPublishedRecords(adapter.getAdapterName());
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    const AX_WWN wwn = wwnOfPort(PortWWN);
    Attribute_Buffer buffer = fetchAdapterAttributes(wwn);
    readTable(ADAPTER_FAMILY, buffer, *this, TABLE);
    readDriverType(wwn, DriverType);
}

void FCAdapterAttributes::readPublishedRecords(const std::string& adapterName) {
    HBA_Adapter opened(adapterName);
    HBA_ADAPTERATTRIBUTES record;
    HBA_STATUS status = opened.getAttributes(record);
    if (status != HBA_STATUS_OK) {
        VLN_LOG(VLN_ERR, "Error hbaStatus=%d, skipping Adapter %s", status, adapterName.c_str());
        throw std::exception();
    }
    Manufacturer = fieldText(record.Manufacturer);
    SerialNumber = fieldText(record.SerialNumber);
    Model = fieldText(record.Model);
    ModelDescription = fieldText(record.ModelDescription);
    NodeSymbolicName = fieldText(record.NodeSymbolicName);
    numberOfPorts = record.NumberOfPorts;
    VLN_LOG(VLN_DBG, "_NodeSymbolicName=%s", NodeSymbolicName.c_str());

    HBA_PORTATTRIBUTES port;
    status = opened.getPortAttributes(0, port);
    if (status != HBA_STATUS_OK) {
        VLN_LOG(VLN_ERR, "(portIndex = %d) failed with hbaStatus %d", 0, status);
        throw std::exception();
    }
    PortWWN = VLN_Common::wwnText(port.PortWWN.wwn);
    NodeWWN = VLN_Common::wwnText(port.NodeWWN.wwn);
}

} // namespace cimple
