#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = iSCSIAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {514, "_Manufacturer", &A::Manufacturer},
    {515, "_SerialNumber", &A::SerialNumber},
    {516, "_Model", &A::Model},
    {517, "_ModelDescription", &A::ModelDescription},
    {520, "_HardwareVersion", &A::HWVersion},
    {521, "_OptionROMVersion", &A::OptionROMVersion},
    {522, "_FirmwareVersion", &A::FirmwareVersion},
    {525, "_DriverName", &A::DriverName},
    {526, "_DeviceID", &A::DeviceID},
    {527, "_ModelID", &A::ModelID},
    {528, "_OpertionalFirmwareVersion", &A::OpertionalFirmwareVersion},
    {528, "_OpertionalFirmwareVersion", &A::OpertionalFirmwareVersion2},
    {533, "_DriverVersion", &A::DriverVersion},
    {534, "_BootImageExpansionROMVersion", &A::BootVersion},
    {555, "_PCIBusNumber", &A::PCIBusNumber},
    {559, "_PortNumber", &A::PortNumber},
    {560, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {562, "_FirmwareStatus", &A::FirmwareStatus},
    {586, "_Subadapter_number", &A::Subadapter_number},
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
