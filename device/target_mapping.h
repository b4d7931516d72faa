// The FCP target mapping of an adapter opened in the HBA API: the logical units that the host sees
// through it.
#ifndef DEVICE_TARGET_MAPPING_H
#define DEVICE_TARGET_MAPPING_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <cstddef>
#include <memory>

namespace cimple {

class Target_Mapping {
public:
    // Asks the library, three times at most: it may have more entries than the buffer holds, or
    // data that it must refresh first. Throws nothing; the status tells.
    explicit Target_Mapping(HBA_HANDLE handle);

    // 0 when the entries may be read.
    HBA_STATUS status() const { return m_status; }
    // How many units the library lists; with another status than 0, how many it claims to have.
    std::size_t size() const;
    const HBA_FCPSCSIENTRY& operator[](std::size_t index) const { return record()->entry[index]; }

private:
    enum class Next { DONE, AGAIN };
    HBA_STATUS fetch(HBA_HANDLE handle);
    bool allocate(uint32 entries);
    Next judge(HBA_STATUS status, HBA_HANDLE handle, uint32& entries);
    HBA_FCPTARGETMAPPING* record() const {
        return reinterpret_cast<HBA_FCPTARGETMAPPING*>(m_bytes.get());
    }

    std::unique_ptr<std::byte[]> m_bytes;
    HBA_STATUS m_status;
};

} // namespace cimple

#endif // DEVICE_TARGET_MAPPING_H
