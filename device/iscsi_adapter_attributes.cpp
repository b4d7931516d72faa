#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = iSCSIAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {AX_HA_MANUFACTURER, "_Manufacturer", &A::Manufacturer},
    {AX_HA_SERIAL_NUMBER, "_SerialNumber", &A::SerialNumber},
    {AX_HA_MODEL, "_Model", &A::Model},
    {AX_HA_MODEL_DESCRIPTION, "_ModelDescription", &A::ModelDescription},
    {AX_HA_HARDWARE_VERSION, "_HardwareVersion", &A::HWVersion},
    {AX_HA_OPTION_ROM_VERSION, "_OptionROMVersion", &A::OptionROMVersion},
    {AX_HA_FIRMWARE_VERSION, "_FirmwareVersion", &A::FirmwareVersion},
    {AX_HA_DRIVER_NAME, "_DriverName", &A::DriverName},
    {AX_HA_DEVICE_ID, "_DeviceID", &A::DeviceID},
    {AX_HA_MODEL_ID, "_ModelID", &A::ModelID},
    {AX_HA_OPERATIONAL_FIRMWARE_VERSION, "_OpertionalFirmwareVersion",
     &A::OpertionalFirmwareVersion},
    {AX_HA_OPERATIONAL_FIRMWARE_VERSION, "_OpertionalFirmwareVersion",
     &A::OpertionalFirmwareVersion2},
    {AX_HA_DRIVER_VERSION, "_DriverVersion", &A::DriverVersion},
    {AX_HA_BOOT_VERSION, "_BootImageExpansionROMVersion", &A::BootVersion},
    {AX_HA_PCI_BUS_NUMBER, "_PCIBusNumber", &A::PCIBusNumber},
    {AX_HA_PORT_NUMBER, "_PortNumber", &A::PortNumber},
    {AX_HA_PCI_FUNCTION_NUMBER, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {AX_HA_FIRMWARE_STATUS, "_FirmwareStatus", &A::FirmwareStatus},
    {AX_HA_SUBADAPTER_NUMBER, "_Subadapter_number", &A::Subadapter_number},
};

} // namespace

iSCSIAdapterAttributes::iSCSIAdapterAttributes(const HBAIdentifier&,
                                               const LocalHBAInfoV4& localHBAInfo)
    : CNAAdapterAttributes(localHBAInfo) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    Attribute_Buffer buffer = fetchAdapterAttributes(wwnOfPort(PortWWN));
    VLN_LOG(VLN_DBG, "CALLING iSCSIAdapterAttributes AX CALLS");
    readTable(ADAPTER_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
