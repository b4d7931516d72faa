// Lower case for names, independent of the locale: CIM identifiers compare as ASCII (DSP0004), and
// the object manager may have set any locale for its own purposes.
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

} // namespace cimple

#endif // CIMPLE_FOLD_H
