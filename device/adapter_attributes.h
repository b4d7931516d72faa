// What the libraries report about an adapter, read once when the adapter object is made.
//
// A member bears the name of the library's attribute as the log lines give it, without the leading
// underscore, and the same name in every class that has it. Numbers that could not be read keep
// their default, texts are empty then. A constructor throws std::exception when nothing can be
// read.
#ifndef DEVICE_ADAPTER_ATTRIBUTES_H
#define DEVICE_ADAPTER_ATTRIBUTES_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <string>

namespace cimple {

class Adapter;

class AdapterAttributes {
public:
    virtual ~AdapterAttributes() noexcept(false) = default;

    uint32 numberOfPorts = 1;
    std::string PortWWN; // 16 upper-case digits, as all names below; of the adapter's port 0
    std::string NodeWWN;

    // What every kind of adapter tells.
    std::string Manufacturer;
    std::string SerialNumber;
    std::string Model;
    std::string ModelDescription;
    std::string OptionROMVersion;
    uint32 DeviceID = 0;
    uint32 ModelID = 0;
    std::string OpertionalFirmwareVersion;
    std::string BootVersion;
    uint32 PCIBusNumber = 0;
    uint32 PortNumber = 0;
    uint32 PCIFunctionNumber = 0;
    std::string Subadapter_number;

protected:
    AdapterAttributes() = default;
};

// Of a function of a converged card, as the management library lists it.
class CNAAdapterAttributes : public AdapterAttributes {
public:
    std::string HWVersion;
    std::string FirmwareVersion;
    std::string DriverName;
    std::string DriverVersion;
    uint32 FirmwareStatus = 0;

protected:
    explicit CNAAdapterAttributes(const LocalHBAInfoV4& localHBAInfo);
};

class NICAdapterAttributes : public CNAAdapterAttributes {
public:
    NICAdapterAttributes(const HBAIdentifier& hbaIdentifier, const LocalHBAInfoV4& localHBAInfo);

    uint32 VendorSpecificID = 0;
    bool BootCodeEnabled = false;
    uint32 DiagVersionNumber = 0;
    uint8 BoardTemperature = 0;      // degrees Celsius: bits 0 to 7 of the attribute
    uint8 ThresholdCriticalTemp = 0; // bits 16 to 23
    uint8 ThresholdWarningTemp = 0;  // bits 8 to 15
    uint32 FunctionType = 0;
    uint32 SubDeviceID = 0;
    uint32 SubVendorID = 0;
    std::string IPLFilename;
    std::string NCSIVersion;
    std::string FCOEUniversalVersion;
    std::string FCOE_X86_BIOSVersion;
    std::string FCOE_EFIVersion;
    std::string FCOE_FCODEVersion;
    std::string UEFI_BIOSVersion;
    std::string UEFI_NICVersion;
    std::string UEFI_FCODEVersion;
    std::string UEFI_ISCSIVersion;
    std::string PCIBusSpeed;
    std::string PCIBusWidth;
    uint32 PortConnectionType = 0;
    std::string FirmwareOnFlash;
};

class iSCSIAdapterAttributes : public CNAAdapterAttributes {
public:
    iSCSIAdapterAttributes(const HBAIdentifier& hbaIdentifier, const LocalHBAInfoV4& localHBAInfo);

    std::string OpertionalFirmwareVersion2; // the same attribute, read a second time
};

// What adapters tell that speak Fibre Channel, over Ethernet or not.
struct FibreChannelFacts {
    uint32 DriverType = 0;
    std::string NodeSymbolicName;
    std::string IEEEAddress; // "xx:xx:xx:xx:xx:xx"
    std::string FunctionalFirmwareVersion;
    std::string KernelFirmwareVersion;
    uint32 SLIMode = 0;
    uint32 BoardTemperature = 0;
    std::string SPFirmwareVersion;
    std::string SPFirmwareName;
    std::string ULPFirmwareVersion;
    std::string ULPFirmwareName;
};

class FCoEAdapterAttributes : public CNAAdapterAttributes, public FibreChannelFacts {
public:
    FCoEAdapterAttributes(const HBAIdentifier& hbaIdentifier, const LocalHBAInfoV4& localHBAInfo);

    uint32 VendorSpecificID = 0;
};

// Reads the published record of the HBA API first, then the management library.
class FCAdapterAttributes : public AdapterAttributes, public FibreChannelFacts {
public:
    explicit FCAdapterAttributes(Adapter& adapter);

    std::string SLI1FirmwareName;
    std::string SLI2FirmwareName;
    bool BootCodeEnabled = false;
    uint32 DiagVersionNumber = 0;
    std::string SLI3FirmwareName;
    uint32 FunctionType = 0;
    std::string FCUniversalVersion;
    std::string FC_X86_BIOSVersion;
    std::string FC_EFIVersion;
    std::string FC_FCODEVersion;
    std::string FirmwareOnFlash;

private:
    void readPublishedRecords(const std::string& adapterName);
};

} // namespace cimple

#endif // DEVICE_ADAPTER_ATTRIBUTES_H
