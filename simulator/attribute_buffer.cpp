#include "simulator/attribute_buffer.h"

#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint32_t head_mark = 0x41584154; // "TAXA" in memory
constexpr std::uint32_t guard_mark = 0x5AA55AA5;
constexpr std::size_t alignment = 4;

struct Head {
    std::uint32_t mark;
    std::uint32_t size; // with head and guard
    std::uint32_t count;
    std::uint32_t check; // the three above together
};

std::uint32_t check_of(const Head& head) {
    return head.mark ^ head.size ^ head.count << 16;
}

struct Entry_Head {
    std::uint16_t identifier;
    std::uint16_t length;
    std::uint16_t room; // bytes up to the next entry
    std::uint16_t reserved;
};

std::size_t padded(std::size_t size) {
    return (size + alignment - 1) / alignment * alignment;
}

} // namespace

std::uint32_t buffer_size(std::span<const Tagged_Value> values) {
    std::size_t size = sizeof(Head) + sizeof guard_mark;
    for (const Tagged_Value& value : values)
        size += sizeof(Entry_Head) + padded(value.bytes.size());
    return static_cast<std::uint32_t>(size);
}

void fill_buffer(std::span<const Tagged_Value> values, void* buffer) {
    Head head{head_mark, buffer_size(values), static_cast<std::uint32_t>(values.size()), 0};
    head.check = check_of(head);
    auto* at = static_cast<std::uint8_t*>(buffer);
    std::memcpy(at, &head, sizeof head);
    at += sizeof head;
    for (const Tagged_Value& value : values) {
        const std::size_t room = padded(value.bytes.size());
        const Entry_Head entry{value.identifier, value.length, static_cast<std::uint16_t>(room), 0};
        std::memcpy(at, &entry, sizeof entry);
        at += sizeof entry;
        std::memset(at, 0, room);
        if (!value.bytes.empty())
            std::memcpy(at, value.bytes.data(), value.bytes.size());
        at += room;
    }
    std::memcpy(at, &guard_mark, sizeof guard_mark);
}

Found_Value find_value(void* buffer, std::uint16_t identifier) {
    Found_Value found;
    auto* at = static_cast<std::uint8_t*>(buffer);
    Head head{};
    std::memcpy(&head, at, sizeof head);
    if (head.mark != head_mark) {
        found.result = Found_Value::Result::no_buffer;
        return found;
    }
    if (head.check != check_of(head)) {
        found.result = Found_Value::Result::damaged;
        return found;
    }
    const std::uint8_t* end = at + head.size - sizeof guard_mark;
    std::uint32_t guard = 0;
    std::memcpy(&guard, end, sizeof guard);
    at += sizeof head;
    bool damaged = guard != guard_mark;
    for (std::uint32_t i = 0; i < head.count && !damaged; ++i) {
        Entry_Head entry{};
        damaged = static_cast<std::size_t>(end - at) < sizeof entry;
        if (damaged)
            break;
        std::memcpy(&entry, at, sizeof entry);
        at += sizeof entry;
        damaged = entry.room > end - at;
        if (!damaged && entry.identifier == identifier) {
            found.result = Found_Value::Result::found;
            found.value = at;
            found.length = entry.length;
            return found;
        }
        at += entry.room;
    }
    if (damaged)
        found.result = Found_Value::Result::damaged;
    return found;
}

} // namespace vlnsim
