// Lower case and hashes for names, independent of the locale: CIM identifiers compare as ASCII
// (DSP0004), and the object manager may have set any locale for its own purposes.
#ifndef CIMPLE_FOLD_H
#define CIMPLE_FOLD_H

#include "cimple/types.h"

#include <array>

namespace cimple {

inline constexpr std::array<uint8, 256> LOWER_CASE = [] {
    std::array<uint8, 256> table{};
    for (uint32 i = 0; i < table.size(); ++i)
        table[i] = static_cast<uint8>(i >= 'A' && i <= 'Z' ? i + ('a' - 'A') : i);
    return table;
}();

constexpr uint8 fold(char c) noexcept {
    return LOWER_CASE[static_cast<uint8>(c)];
}

// The same for names that differ in case only.
constexpr uint32 name_hash(const char* name) noexcept {
    uint32 hash = 0x811C9DC5u; // FNV-1a
    for (; *name; ++name)
        hash = (hash ^ fold(*name)) * 0x01000193u;
    return hash;
}

// Where in a table of so many slots, a power of two, the search for a name begins.
constexpr uint32 name_slot(const char* name, uint32 slots) noexcept {
    const uint32 hash = name_hash(name);
    return (hash ^ hash >> 16) & (slots - 1);
}

} // namespace cimple

#endif // CIMPLE_FOLD_H
