// An adapter opened in the HBA API, and the calls that are repeated once when it has stale data.
#ifndef VLN_DEVICE_LIBRARY_HBA_API_H
#define VLN_DEVICE_LIBRARY_HBA_API_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <string>

namespace cimple {

class HBA_Adapter {
public:
    // Throws std::exception, after a line at level 3, if the adapter cannot be opened.
    explicit HBA_Adapter(const std::string& name);
    ~HBA_Adapter();
    HBA_Adapter(const HBA_Adapter&) = delete;
    HBA_Adapter& operator=(const HBA_Adapter&) = delete;

    HBA_HANDLE handle() const { return m_handle; }

    // The record is zeroed before each attempt. The status is that of the last one.
    HBA_STATUS getAttributes(HBA_ADAPTERATTRIBUTES& attributes);
    HBA_STATUS getPortAttributes(uint32 portIndex, HBA_PORTATTRIBUTES& attributes);

private:
    HBA_HANDLE m_handle;
};

// The calls of the published interface take writable texts and write up to 256 bytes. The name is
// terminated whatever the library writes.
struct HBA_Name_Buffer {
    char text[256 + 1] = {};
};
HBA_STATUS readHbaAdapterName(uint32 index, HBA_Name_Buffer& name);
HBA_HANDLE openHbaAdapter(const std::string& name);

// A count of adapters or ports that the API reports, held to what a host can have. An absurd one
// would keep the scan busy for hours; it is cut, with a line at level 3.
uint32 boundedHbaCount(uint32 count, const char* what);

} // namespace cimple

#endif // VLN_DEVICE_LIBRARY_HBA_API_H
