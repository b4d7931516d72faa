// One logical unit of the SAN as the host sees it through one port: an entry of the FCP target
// mapping, with what the unit itself told by SCSI inquiry and read capacity.
//
// Targets are read under the agent's data lock only, and not while a rescan runs. They live until
// the next rescan of their port.
#ifndef DEVICE_TARGET_H
#define DEVICE_TARGET_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <string>

namespace cimple {

class Adapter;

// The first identification descriptor of inquiry page 0x83 (SPC-3, 7.6.3), all zero until it is
// read. The lengths are as the unit tells them; bytes that it did not send are 0.
struct DeviceIdDescriptor {
    uint32 deviceType = 0;
    uint32 pageCode = 0;
    uint32 pageLength = 0;
    uint32 identifierType = 0;
    uint32 identifierLength = 0;
    uint8 identifier[252] = {};
};

// The identifier in upper-case digits; empty, after a line at level 3, unless it has 16, 12 or 8
// bytes.
std::string descriptorText(const DeviceIdDescriptor& descriptor);

class Target {
public:
    // Opens the adapter by itself and asks the unit, with twelve commands at most. A unit that does
    // not answer is described by "Unknown" and 0. Throws std::bad_cast unless the adapter is an
    // FCoEAdapter, and std::exception if it cannot be opened.
    Target(Adapter& adapter, const HBA_FCPSCSIENTRY& entry);
    virtual ~Target() noexcept(false) = default;
    Target(const Target&) = delete;
    Target& operator=(const Target&) = delete;

    uint32 fcId = 0;
    std::string nodeWWN; // 16 upper-case digits
    std::string portWWN;
    uint64 fcpLun = 0;
    std::string osDeviceName;
    uint32 scsiBusNumber = 0;
    uint32 scsiTargetNumber = 0;
    uint32 scsiOSLun = 0;
    uint64 blockLength = 0; // bytes
    uint64 lastLBA = 0;
    uint32 deviceType = 0; // peripheral device type of SPC
    std::string vendor;
    std::string product;
    std::string revision;
    std::string serialNumber;
    DeviceIdDescriptor descriptor;

private:
    class Unit;
    void copyEntry(const HBA_FCPSCSIENTRY& entry);
    void readStandardInquiry(Unit& unit);
    void readSerialNumber(Unit& unit);
    void readDescriptor(Unit& unit);
    void readCapacity(Unit& unit);
};

} // namespace cimple

#endif // DEVICE_TARGET_H
