#include "device/adapter_attributes.h"
#include "device/attribute_table.h"
#include "foundation/common.h"
#include "foundation/log.h"

namespace cimple {

namespace {

using A = FCoEAdapterAttributes;

constexpr Attribute_Row<A> TABLE[] = {
    {514, "_MANUFACTURER", &A::Manufacturer},
    {515, "_SerialNumber", &A::SerialNumber},
    {516, "_Model", &A::Model},
    {517, "_ModelDescription", &A::ModelDescription},
    {519, "_NodeSymbolicName", &A::NodeSymbolicName},
    {520, "_HardwareVersion", &A::HWVersion},
    {521, "_OptionROMVersion", &A::OptionROMVersion},
    {522, "_FirmwareVersion", &A::FirmwareVersion},
    {523, "_VendorSpecificID", &A::VendorSpecificID},
    {525, "_DriverName", &A::DriverName},
    {526, "_DeviceID", &A::DeviceID},
    {527, "_ModelID", &A::ModelID},
    {528, "_OpertionalFirmwareVersion", &A::OpertionalFirmwareVersion},
    {531, "_IEEEAddress", Attribute_Row<A>::Raw_Address{&A::IEEEAddress}},
    {533, "_DriverVersion", &A::DriverVersion},
    {534, "_BootImageExpansionROMVersion", &A::BootVersion},
    {545, "_FunctionalFirmwareVersion", &A::FunctionalFirmwareVersion},
    {546, "_KernelFirmwareVersion", &A::KernelFirmwareVersion},
    {549, "_SLIMode", &A::SLIMode},
    {551, "_BoardTemperature", &A::BoardTemperature},
    {555, "_PCIBusNumber", &A::PCIBusNumber},
    {559, "_PortNumber", &A::PortNumber},
    {560, "_PCIFunctionNumber", &A::PCIFunctionNumber},
    {562, "_FirmwareStatus", &A::FirmwareStatus},
    {563, "_SPFirmwareVersion", &A::SPFirmwareVersion},
    {564, "_SPFirmwareName", &A::SPFirmwareName},
    {565, "_ULPFirmwareVersion", &A::ULPFirmwareVersion},
    {566, "_ULPFirmwareName", &A::ULPFirmwareName},
    {586, "_Subadapter_number", &A::Subadapter_number},
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
