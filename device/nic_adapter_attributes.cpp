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
    {514, "_Manufacturer", &A::Manufacturer},
    {515, "_SerialNumber", &A::SerialNumber},
    {516, "_Model", &A::Model},
    {517, "_ModelDescription", &A::ModelDescription},
    {520, "_HWVersion", &A::HWVersion},
    {521, "_OptionROMVersion", &A::OptionROMVersion},
    {522, "_FirmwareVersion", &A::FirmwareVersion},
    {523, "_VendorSpecificID", &A::VendorSpecificID},
    {525, "_DriverName", &A::DriverName},
    {526, "_DeviceID", &A::DeviceID},
    {527, "_ModelID", &A::ModelID},
    {528, "_OpertionalFirmwareVersion", &A::OpertionalFirmwareVersion},
    {532, "_BootCodeEnabled", &A::BootCodeEnabled},
    {533, "_DriverVersion", &A::DriverVersion},
    {534, "_BootVersion", &A::BootVersion},
    {544, "_DiagVersionNumber", &A::DiagVersionNumber},
    {551, "_BoardTemperature", take_temperature},
    {555, "_PCIBusNumber", &A::PCIBusNumber},
    {556, "_FunctionType", &A::FunctionType},
    {557, "_SubDeviceID", &A::SubDeviceID},
    {559, "_PortNumber", &A::PortNumber},
    {560, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {561, "_SubVendorID", &A::SubVendorID},
    {562, "_FirmwareStatus", &A::FirmwareStatus},
    {572, "_IPLFilename", &A::IPLFilename},
    {573, "_NCSIVersion", &A::NCSIVersion},
    {574, "_FCOEUniversalVersion", &A::FCOEUniversalVersion},
    {575, "_FCOE_X86_BIOSVersion", &A::FCOE_X86_BIOSVersion},
    {576, "_FCOE_EFIVersion", &A::FCOE_EFIVersion},
    {577, "_FCOE_FCODEVersion", &A::FCOE_FCODEVersion},
    {578, "_UEFI_BIOSVersion", &A::UEFI_BIOSVersion},
    {579, "_UEFI_NICVersion", &A::UEFI_NICVersion},
    {580, "_UEFI_FCODEVersion", &A::UEFI_FCODEVersion},
    {581, "_UEFI_ISCSIVersion", &A::UEFI_ISCSIVersion},
    {582, "_PCIBusSpeed", &A::PCIBusSpeed},
    {583, "_PCIBusWidth", &A::PCIBusWidth},
    {585, "_PortConnectionType", &A::PortConnectionType},
    {586, "_Subadapter_number", &A::Subadapter_number},
    {591, "_FirmwareOnFlash", &A::FirmwareOnFlash},
};

} // namespace

NICAdapterAttributes::NICAdapterAttributes(const HBAIdentifier&, const LocalHBAInfoV4& localHBAInfo)
    : CNAAdapterAttributes(localHBAInfo) {
    VLN_LOG(VLN_DBG, "Port 0's WWPN: %s", PortWWN.c_str());
    Attribute_Buffer buffer = fetchAdapterAttributes(wwnOfPort(PortWWN));
    readTable(ADAPTER_FAMILY, buffer, *this, TABLE);
}

} // namespace cimple
