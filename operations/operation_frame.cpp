#include "operations/operation_frame.h"

#include <cstring>

namespace cimple {

namespace {

const char* fileOf(const Place& place) {
    const char* slash = std::strrchr(place.file, '/');
    return slash ? slash + 1 : place.file;
}

void logAt(const Place& place, sint32 level, const char* line) {
    if (log_wanted(level))
        log_line(level, fileOf(place), place.line, "%s", line);
}

} // namespace

Operation_Frame::Operation_Frame(const char* entry, const char* exit, Place place)
    : m_exit(exit), m_place(place) {
    logAt(m_place, VLN_DBG, entry);
}

Operation_Frame::~Operation_Frame() {
    if (m_exit)
        logAt(m_place, VLN_DBG, m_exit);
}

bool Operation_Frame::given(const void* pointer, const char* line, sint32 level, Place place) {
    if (pointer)
        return true;
    logAt(place, level, line);
    m_status = AX_STATUS_INVALID_ARGUMENT;
    return false;
}

bool Operation_Frame::offers(const HBA_WWN* name, const Feature_Test& test, Place place) {
    uint32 value = 0;
    m_status = AX_GetHBAFeature(wwnOf(name), test.feature, &value);
    if (m_status != AX_STATUS_OK) {
        logAt(place, VLN_ERR, test.unknown);
        VLN_MethodWrapper::logStatus(m_status);
        return false;
    }
    if (value == 0) {
        logAt(place, VLN_ERR, test.absent);
        m_status = test.absentStatus;
        return false;
    }
    return true;
}

bool Reply::allocate(const Reply_Shape& shape, uint64 count, const No_Memory& noMemory,
                     const Place& place) {
    m_data.reset();
    m_room = 0;
    if (count > (MAXIMUM - shape.head) / shape.entry) {
        if (log_wanted(VLN_ERR))
            log_line(VLN_ERR, fileOf(place), place.line,
                     "The management library asks for a buffer of %llu entries of %zu bytes",
                     static_cast<unsigned long long>(count), shape.entry);
        m_failure = AX_STATUS_ERROR;
        return false;
    }
    // At least a byte, since malloc may answer null for none.
    const std::size_t size = shape.head + static_cast<std::size_t>(count) * shape.entry;
    m_data.reset(std::calloc(size ? size : 1, 1));
    if (!m_data) {
        if (noMemory.line)
            logAt(place, VLN_ERR, noMemory.line);
        m_failure = noMemory.status;
        return false;
    }
    m_room = static_cast<uint32>(count);
    return true;
}

bool Reply::grow(const Reply_Shape& shape, const No_Memory& noMemory, const Place& place) {
    const uint64 needed = shape.fixed ? shape.first : uint64{m_count} + shape.spare;
    return allocate(shape, needed, noMemory, place);
}

bool Reply::countIsSane(const Place& place) {
    if (m_count <= m_room)
        return true;
    if (log_wanted(VLN_ERR))
        log_line(VLN_ERR, fileOf(place), place.line,
                 "The management library reports %u entries in a buffer for %u", m_count, m_room);
    m_data.reset();
    m_failure = AX_STATUS_ERROR;
    return false;
}

} // namespace cimple
