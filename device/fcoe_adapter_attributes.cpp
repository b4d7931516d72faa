#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = FCoEAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_HA_MANUFACTURER, "_MANUFACTURER", &A::Manufacturer},
    {AX_HA_SERIAL_NUMBER, "_SerialNumber", &A::SerialNumber},
    {AX_HA_MODEL, "_Model", &A::Model},
    {AX_HA_MODEL_DESCRIPTION, "_ModelDescription", &A::ModelDescription},
    {AX_HA_NODE_SYMBOLIC_NAME, "_NodeSymbolicName", &A::NodeSymbolicName},
    {AX_HA_HARDWARE_VERSION, "_HardwareVersion", &A::HWVersion},
    {AX_HA_OPTION_ROM_VERSION, "_OptionROMVersion", &A::OptionROMVersion},
    {AX_HA_FIRMWARE_VERSION, "_FirmwareVersion", &A::FirmwareVersion},
    {AX_HA_VENDOR_SPECIFIC_ID, "_VendorSpecificID", &A::VendorSpecificID},
    {AX_HA_DRIVER_NAME, "_DriverName", &A::DriverName},
    {AX_HA_DEVICE_ID, "_DeviceID", &A::DeviceID},
    {AX_HA_MODEL_ID, "_ModelID", &A::ModelID},
    {AX_HA_OPERATIONAL_FIRMWARE_VERSION, "_OpertionalFirmwareVersion",
     &A::OpertionalFirmwareVersion},
    {AX_HA_IEEE_ADDRESS, "_IEEEAddress", Attribute_Row<A>::Raw_Address{&A::IEEEAddress}},
    {AX_HA_DRIVER_VERSION, "_DriverVersion", &A::DriverVersion},
    {AX_HA_BOOT_VERSION, "_BootImageExpansionROMVersion", &A::BootVersion},
    {AX_HA_FUNCTIONAL_FIRMWARE_VERSION, "_FunctionalFirmwareVersion",
     &A::FunctionalFirmwareVersion},
    {AX_HA_KERNEL_FIRMWARE_VERSION, "_KernelFirmwareVersion", &A::KernelFirmwareVersion},
    {AX_HA_SLI_MODE, "_SLIMode", &A::SLIMode},
    {AX_HA_BOARD_TEMPERATURE, "_BoardTemperature", &A::BoardTemperature},
    {AX_HA_PCI_BUS_NUMBER, "_PCIBusNumber", &A::PCIBusNumber},
    {AX_HA_PORT_NUMBER, "_PortNumber", &A::PortNumber},
    {AX_HA_PCI_FUNCTION_NUMBER, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {AX_HA_FIRMWARE_STATUS, "_FirmwareStatus", &A::FirmwareStatus},
    {AX_HA_SP_FIRMWARE_VERSION, "_SPFirmwareVersion", &A::SPFirmwareVersion},
    {AX_HA_SP_FIRMWARE_NAME, "_SPFirmwareName", &A::SPFirmwareName},
    {AX_HA_ULP_FIRMWARE_VERSION, "_ULPFirmwareVersion", &A::ULPFirmwareVersion},
    {AX_HA_ULP_FIRMWARE_NAME, "_ULPFirmwareName", &A::ULPFirmwareName},
    {AX_HA_SUBADAPTER_NUMBER, "_Subadapter_number", &A::Subadapter_number},
};

} // namespace

FCoEAdapterAttributes::FCoEAdapterAttributes(const HBAIdentifier&,
                                             const LocalHBAInfoV4& localHBAInfo)
    : CNAAdapterAttributes(localHBAInfo) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    const AX_WWN wwn = wwnOfPort(PortWWN);
    Attribute_Buffer buffer = fetchAdapterAttributes(wwn);
    readTable(ADAPTER_FAMILY, buffer, *this, TABLE);
    readDriverType(wwn, DriverType);
}

} // namespace cimple
