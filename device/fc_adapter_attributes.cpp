#include "device/adapter.h"
#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "device/library/hba_api.h"
#include "foundation/common.h"
#include "foundation/field_text.h"
#include "foundation/log.h"

#include <exception>

namespace cimple {

namespace {

using A = FCAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_HA_NODE_SYMBOLIC_NAME, "_NodeSymbolicName", &A::NodeSymbolicName},
    {AX_HA_OPTION_ROM_VERSION, "_OptionROMVersion", &A::OptionROMVersion},
    {AX_HA_DEVICE_ID, "_DeviceID", &A::DeviceID},
    {AX_HA_MODEL_ID, "_ModelID", &A::ModelID},
    {AX_HA_OPERATIONAL_FIRMWARE_VERSION, "Operational Firmware", &A::OpertionalFirmwareVersion},
    {AX_HA_SLI1_FIRMWARE_NAME, "_SLI1FirmwareName", &A::SLI1FirmwareName},
    {AX_HA_SLI2_FIRMWARE_NAME, "_SLI2FirmwareName", &A::SLI2FirmwareName},
    {AX_HA_IEEE_ADDRESS, "_IEEE_ADDRESS", Attribute_Row<A>::Raw_Address{&A::IEEEAddress}},
    {AX_HA_BOOT_CODE_ENABLED, "_BootCodeEnabled", &A::BootCodeEnabled},
    {AX_HA_BOOT_VERSION, "_BOOTBIOS_VERSION", &A::BootVersion},
    {AX_HA_DIAG_VERSION_NUMBER, "_DiagVersion", &A::DiagVersionNumber},
    {AX_HA_FUNCTIONAL_FIRMWARE_VERSION, "INITIAL_FW_LOAD", &A::FunctionalFirmwareVersion},
    {AX_HA_KERNEL_FIRMWARE_VERSION, "_KERNEL_VERSION", &A::KernelFirmwareVersion},
    {AX_HA_SLI3_FIRMWARE_NAME, "_SLI3FirmwareName", &A::SLI3FirmwareName},
    {AX_HA_SLI_MODE, "_SLIMode", &A::SLIMode},
    {AX_HA_BOARD_TEMPERATURE, "_BoardTemperature", &A::BoardTemperature},
    {AX_HA_FC_PORT_NUMBER, "_PortNumber", &A::PortNumber},
    {AX_HA_PCI_BUS_NUMBER, "_PCIBusNumber", &A::PCIBusNumber},
    {AX_HA_FUNCTION_TYPE, "_FunctionType", &A::FunctionType},
    {AX_HA_PCI_FUNCTION_NUMBER, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {AX_HA_SP_FIRMWARE_VERSION, "_SPFirmwareVersion", &A::SPFirmwareVersion},
    {AX_HA_SP_FIRMWARE_NAME, "_SPFirmwareName", &A::SPFirmwareName},
    {AX_HA_ULP_FIRMWARE_VERSION, "_ULPFirmwareVersion", &A::ULPFirmwareVersion},
    {AX_HA_ULP_FIRMWARE_NAME, "_ULPFirmwareName", &A::ULPFirmwareName},
    {AX_HA_SUBADAPTER_NUMBER, "_SubadapterID", &A::Subadapter_number},
    {AX_HA_FC_UNIVERSAL_VERSION, "_FCUniversalVersion", &A::FCUniversalVersion},
    {AX_HA_FC_X86_BIOS_VERSION, "FC_X86_BIOSVersion", &A::FC_X86_BIOSVersion},
    {AX_HA_FC_EFI_VERSION, "_FC_EFIVersion", &A::FC_EFIVersion},
    {AX_HA_FC_FCODE_VERSION, "_FC_FCODEVersion", &A::FC_FCODEVersion},
    {AX_HA_FIRMWARE_ON_FLASH, "_FirmwareOnFlash", &A::FirmwareOnFlash},
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
