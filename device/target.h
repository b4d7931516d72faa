// One logical unit of the SAN as the host sees it through one port.
#ifndef DEVICE_TARGET_H
#define DEVICE_TARGET_H

#include "cimple/types.h"

#include <string>

namespace cimple {

// The first identification descriptor of inquiry page 0x83 (SPC), all zero until it is read.
struct DeviceIdDescriptor {
    uint32 deviceType = 0;
    uint32 pageCode = 0;
    uint32 pageLength = 0;
    uint32 identifierType = 0;
    uint32 identifierLength = 0;
    uint8 identifier[252] = {};
};

class Target {
public:
    virtual ~Target() noexcept(false) = default;

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
};

} // namespace cimple

#endif // DEVICE_TARGET_H
