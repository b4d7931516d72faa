#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = NICAdapterAttributes;

// One attribute carries the temperature and its two limits, a byte each.
void take_temperature(A& object, uint32 value) {
    object.BoardTemperature = static_cast<uint8>(value);
    object.ThresholdCriticalTemp = static_cast<uint8>(value >> 16);
    object.ThresholdWarningTemp = static_cast<uint8>(value >> 8);
}

constexpr Attribute_Row<A> TABLE[] = {
    {AX_HA_MANUFACTURER, "_Manufacturer", &A::Manufacturer},
    {AX_HA_SERIAL_NUMBER, "_SerialNumber", &A::SerialNumber},
    {AX_HA_MODEL, "_Model", &A::Model},
    {AX_HA_MODEL_DESCRIPTION, "_ModelDescription", &A::ModelDescription},
    {AX_HA_HARDWARE_VERSION, "_HWVersion", &A::HWVersion},
    {AX_HA_OPTION_ROM_VERSION, "_OptionROMVersion", &A::OptionROMVersion},
    {AX_HA_FIRMWARE_VERSION, "_FirmwareVersion", &A::FirmwareVersion},
    {AX_HA_VENDOR_SPECIFIC_ID, "_VendorSpecificID", &A::VendorSpecificID},
    {AX_HA_DRIVER_NAME, "_DriverName", &A::DriverName},
    {AX_HA_DEVICE_ID, "_DeviceID", &A::DeviceID},
    {AX_HA_MODEL_ID, "_ModelID", &A::ModelID},
    {AX_HA_OPERATIONAL_FIRMWARE_VERSION, "_OpertionalFirmwareVersion",
     &A::OpertionalFirmwareVersion},
    {AX_HA_BOOT_CODE_ENABLED, "_BootCodeEnabled", &A::BootCodeEnabled},
    {AX_HA_DRIVER_VERSION, "_DriverVersion", &A::DriverVersion},
    {AX_HA_BOOT_VERSION, "_BootVersion", &A::BootVersion},
    {AX_HA_DIAG_VERSION_NUMBER, "_DiagVersionNumber", &A::DiagVersionNumber},
    {AX_HA_BOARD_TEMPERATURE, "_BoardTemperature", take_temperature},
    {AX_HA_PCI_BUS_NUMBER, "_PCIBusNumber", &A::PCIBusNumber},
    {AX_HA_FUNCTION_TYPE, "_FunctionType", &A::FunctionType},
    {AX_HA_SUB_DEVICE_ID, "_SubDeviceID", &A::SubDeviceID},
    {AX_HA_PORT_NUMBER, "_PortNumber", &A::PortNumber},
    {AX_HA_PCI_FUNCTION_NUMBER, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {AX_HA_SUB_VENDOR_ID, "_SubVendorID", &A::SubVendorID},
    {AX_HA_FIRMWARE_STATUS, "_FirmwareStatus", &A::FirmwareStatus},
    {AX_HA_IPL_FILENAME, "_IPLFilename", &A::IPLFilename},
    {AX_HA_NCSI_VERSION, "_NCSIVersion", &A::NCSIVersion},
    {AX_HA_FCOE_UNIVERSAL_VERSION, "_FCOEUniversalVersion", &A::FCOEUniversalVersion},
    {AX_HA_FCOE_X86_BIOS_VERSION, "_FCOE_X86_BIOSVersion", &A::FCOE_X86_BIOSVersion},
    {AX_HA_FCOE_EFI_VERSION, "_FCOE_EFIVersion", &A::FCOE_EFIVersion},
    {AX_HA_FCOE_FCODE_VERSION, "_FCOE_FCODEVersion", &A::FCOE_FCODEVersion},
    {AX_HA_UEFI_BIOS_VERSION, "_UEFI_BIOSVersion", &A::UEFI_BIOSVersion},
    {AX_HA_UEFI_NIC_VERSION, "_UEFI_NICVersion", &A::UEFI_NICVersion},
    {AX_HA_UEFI_FCODE_VERSION, "_UEFI_FCODEVersion", &A::UEFI_FCODEVersion},
    {AX_HA_UEFI_ISCSI_VERSION, "_UEFI_ISCSIVersion", &A::UEFI_ISCSIVersion},
    {AX_HA_PCI_BUS_SPEED, "_PCIBusSpeed", &A::PCIBusSpeed},
    {AX_HA_PCI_BUS_WIDTH, "_PCIBusWidth", &A::PCIBusWidth},
    {AX_HA_PORT_CONNECTION_TYPE, "_PortConnectionType", &A::PortConnectionType},
    {AX_HA_SUBADAPTER_NUMBER, "_Subadapter_number", &A::Subadapter_number},
    {AX_HA_FIRMWARE_ON_FLASH, "_FirmwareOnFlash", &A::FirmwareOnFlash},
};

} // namespace

NICAdapterAttributes::NICAdapterAttributes(const HBAIdentifier&, const LocalHBAInfoV4& localHBAInfo)
    : CNAAdapterAttributes(localHBAInfo) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    Attribute_Buffer buffer = fetchAdapterAttributes(wwnOfPort(PortWWN));
    readTable(ADAPTER_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
