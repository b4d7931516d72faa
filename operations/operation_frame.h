// What all operations over the management library share: entry and exit line, the test of arguments
// and of the feature that the operation needs, the reply buffer with its one repetition, the line
// and the status text of a failure. An operation states its particulars and nothing else:
//
//     AX_STATUS VLN_MethodWrapper::GetThings(const HBA_WWN* name, AX_ThingList** things) {
//         Operation_Frame frame("VLN_MethodWrapper::GetThings");
//         if (!frame.given(things) || !frame.offers(name, {437, UNKNOWN_LINE, ABSENT_LINE}))
//             return frame.status();
//         Reply reply;
//         const AX_STATUS status = reply.fetch(
//             {offsetof(AX_ThingList, entry), sizeof(AX_Thing), 32},
//             {"Unable to allocate the memory for things"},
//             counted<AX_ThingList>([&](AX_ThingList* list) { return AX_GetThings(wwnOf(name),
//             list); }));
//         if (status != AX_STATUS_OK)
//             VLN_OPERATION_FAILED(status, "GetThings exited with the error code %d", status);
//         else
//             *things = static_cast<AX_ThingList*>(reply.release()); // the caller frees it
//         return status;
//     }
#ifndef OPERATIONS_OPERATION_FRAME_H
#define OPERATIONS_OPERATION_FRAME_H

#include "cimple/types.h"
#include "device/library/bound_functions.h"
#include "foundation/log.h"
#include "operations/method_wrapper.h"

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <new>
#include <vector>

namespace cimple {

// Logs the line of a failed library call at level 3, and what the library says of the status.
#define VLN_OPERATION_FAILED(status, ...)                                                          \
    (VLN_LOG(VLN_ERR, __VA_ARGS__), ::cimple::VLN_MethodWrapper::logStatus(status))

// The feature that an operation needs (AX_GetHBAFeature) and the lines of its absence.
struct Feature_Test {
    uint32 feature;
    const char* unknown; // the query failed: "Unable to determine if adapter supports ..."
    const char* absent;  // "... not supported on this adapter"
    AX_STATUS absentStatus = AX_STATUS_NOT_SUPPORTED;
};

// Where a line of the log comes from: as a default argument, the call site.
struct Place {
    const char* file; // with its directory
    uint32 line;

    static constexpr Place current(const char* file = __builtin_FILE(),
                                   uint32 line = __builtin_LINE()) {
        return {file, line};
    }
};

class Operation_Frame {
public:
    // Logs entry now and exit, if there is one, at the end of the scope, both at level 5.
    explicit Operation_Frame(const char* entry, const char* exit = nullptr,
                             Place place = Place::current());
    ~Operation_Frame();
    Operation_Frame(const Operation_Frame&) = delete;
    Operation_Frame& operator=(const Operation_Frame&) = delete;

    // False, with the line and status 4, for a null pointer.
    bool given(const void* pointer, const char* line = "Invalid Output pointer",
               sint32 level = VLN_DBG, Place place = Place::current());

    // False when the adapter does not offer the feature or can't be asked, with the line at
    // level 3.
    bool offers(const HBA_WWN* name, const Feature_Test& test, Place place = Place::current());

    // Of the test that failed.
    AX_STATUS status() const { return m_status; }

private:
    const char* m_exit;
    Place m_place;
    AX_STATUS m_status = AX_STATUS_OK;
};

// How a reply of the library is laid out and how it grows: a head, then count entries.
struct Reply_Shape {
    std::size_t head;
    std::size_t entry;
    uint32 first;       // entries of the first buffer
    uint32 spare = 0;   // entries of the second buffer beyond what the library asks for
    bool fixed = false; // the second buffer is as large as the first, whatever the library asks for
    AX_STATUS tooSmall = AX_STATUS_MORE_DATA;
    AX_STATUS tooSmallToo = AX_STATUS_MORE_DATA; // where the library has two words for it
};

// What an operation says and answers when there is no memory for the reply, at level 3.
struct No_Memory {
    const char* line; // "Unable to allocate ..."; null for an operation that has its own words
    AX_STATUS status = AX_STATUS_ERROR;
};

// A reply buffer of the library, from malloc since the caller of an operation may become its owner.
class Reply {
public:
    // No reply is larger, whatever the library says of its size.
    static constexpr std::size_t MAXIMUM = 16U << 20;

    // Calls call(buffer, count) with a zeroed buffer and its room in count, where call leaves what
    // the library answers. When the buffer is too small, takes one of the size asked for and calls
    // once more; there is no third attempt. Answers the library's status. A size that no adapter
    // can mean, or more entries reported than there was room for, is logged at level 3 and answered
    // with 1, and the buffer is gone.
    template <class Call>
    AX_STATUS fetch(const Reply_Shape& shape, const No_Memory& noMemory, Call call,
                    Place place = Place::current()) {
        if (!allocate(shape, shape.first, noMemory, place))
            return m_failure;
        m_count = m_room;
        AX_STATUS status = call(m_data.get(), m_count);
        if (status == shape.tooSmall || status == shape.tooSmallToo) {
            if (!grow(shape, noMemory, place))
                return m_failure;
            m_count = m_room;
            status = call(m_data.get(), m_count);
        }
        return status == AX_STATUS_OK && !countIsSane(place) ? m_failure : status;
    }

    void* data() const { return m_data.get(); }
    // As the library left it; on success never above room().
    uint32 count() const { return m_count; }
    // Entries that the buffer has room for.
    uint32 room() const { return m_room; }
    // Hands the buffer over; the new owner frees it with free().
    void* release() { return m_data.release(); }

private:
    struct Free {
        void operator()(void* data) const { std::free(data); }
    };

    bool allocate(const Reply_Shape& shape, uint64 count, const No_Memory& noMemory,
                  const Place& place);
    bool grow(const Reply_Shape& shape, const No_Memory& noMemory, const Place& place);
    bool countIsSane(const Place& place);

    std::unique_ptr<void, Free> m_data;
    uint32 m_room = 0;
    uint32 m_count = 0;
    AX_STATUS m_failure = AX_STATUS_ERROR;
};

// The call of Reply::fetch for a record that has its count at its head.
template <class List, class Call>
auto counted(Call call) {
    return [call](void* buffer, uint32& count) {
        auto* list = static_cast<List*>(buffer);
        list->count = count;
        const AX_STATUS status = call(list);
        count = list->count;
        return status;
    };
}

// A list with its count at its head, copied to the caller: status as of Reply::fetch, without a
// line for what the library refuses. first: entries of the first buffer.
template <class List, class Entry, class Call>
AX_STATUS fetch_list(std::vector<Entry>* entries, uint32 first, const No_Memory& noMemory,
                     Call call, Place place = Place::current()) {
    entries->clear();
    Reply reply;
    const AX_STATUS status = reply.fetch({offsetof(List, entry), sizeof(Entry), first}, noMemory,
                                         counted<List>(call), place);
    if (status != AX_STATUS_OK)
        return status;
    try {
        const auto* list = static_cast<const List*>(reply.data());
        entries->assign(list->entry, list->entry + reply.count());
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", noMemory.line);
        return noMemory.status;
    }
    return AX_STATUS_OK;
}

} // namespace cimple

#endif // OPERATIONS_OPERATION_FRAME_H
