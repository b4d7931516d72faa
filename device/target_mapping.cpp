#include "device/target_mapping.h"

#include "foundation/log.h"

#include <new>

namespace cimple {

namespace {

constexpr uint32 START_ENTRIES = 256; // so that most hosts need a single call
constexpr int MOST_TRIES = 3;

// More units than any host sees through one port: a greater count is a library gone wrong.
constexpr uint32 MOST_ENTRIES = 65536;

} // namespace

Target_Mapping::Target_Mapping(HBA_HANDLE handle) : m_status(fetch(handle)) {
    if (m_bytes && record()->NumberOfEntries == 0) {
        VLN_LOG(VLN_DBG, "HBA_GetFcpTargetMapping_t() found no target mappings");
        m_bytes.reset();
    }
}

std::size_t Target_Mapping::size() const {
    return m_bytes ? record()->NumberOfEntries : 0;
}

bool Target_Mapping::allocate(uint32 entries) {
    VLN_LOG(VLN_DBG, "To retry the HBA_GetFcpTargetMapping command");
    VLN_LOG(VLN_DBG, "Deleting the allocated memory");
    m_bytes.reset();
    if (entries <= MOST_ENTRIES) {
        const std::size_t size =
            offsetof(HBA_FCPTARGETMAPPING, entry) + entries * sizeof(HBA_FCPSCSIENTRY);
        m_bytes.reset(new (std::nothrow) std::byte[size]());
    }
    if (!m_bytes)
        VLN_LOG(VLN_CRIT, "Could not allocate memory..break ");
    return m_bytes != nullptr;
}

// The buffer of the last try is handed over even if that try failed. The success line below is
// logged for it too, and that is meant: the status is what counts.
HBA_STATUS Target_Mapping::fetch(HBA_HANDLE handle) {
    HBA_STATUS status = HBA_STATUS_ERROR;
    uint32 entries = START_ENTRIES;
    for (int tries = 0; tries < MOST_TRIES; ++tries) {
        if (!allocate(entries))
            return status;
        const uint32 room = entries;
        record()->NumberOfEntries = room;
        status = HBA_GetFcpTargetMapping(handle, record());
        if (status == HBA_STATUS_OK && record()->NumberOfEntries > room) {
            VLN_LOG(VLN_ERR, "ERROR: HBA_GetFcpTargetMapping reports %u entries in room for %u",
                    record()->NumberOfEntries, room);
            record()->NumberOfEntries = room;
        }
        if (judge(status, handle, entries) == Next::DONE)
            break;
    }
    if (m_bytes)
        VLN_LOG(VLN_DBG, "Successful target info fetched");
    return status;
}

Target_Mapping::Next Target_Mapping::judge(HBA_STATUS status, HBA_HANDLE handle, uint32& entries) {
    switch (status) {
    case HBA_STATUS_OK:
        VLN_LOG(VLN_DBG, "All Ok ...break ");
        return Next::DONE;
    case HBA_STATUS_ERROR_MORE_DATA:
        entries = record()->NumberOfEntries;
        VLN_LOG(VLN_DBG, "Increasing the buffer to = %d", entries);
        return Next::AGAIN;
    case HBA_STATUS_ERROR_STALE_DATA:
        HBA_RefreshInformation(handle);
        VLN_LOG(VLN_DBG, "Refresh and retry ... ");
        return Next::AGAIN;
    default:
        m_bytes.reset();
        VLN_LOG(VLN_ERR, "Error hbaStatus=%d", status);
        return Next::DONE;
    }
}

} // namespace cimple
