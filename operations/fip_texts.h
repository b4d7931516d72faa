// What the texts of a FIP setting mean. No library and no log stands beside it.
#ifndef OPERATIONS_FIP_TEXTS_H
#define OPERATIONS_FIP_TEXTS_H

#include "cimple/types.h"

#include <optional>

namespace cimple {

inline constexpr uint32 MAX_VLAN_ID = 4095;

// The number that fills the text, in any base that C knows; none for another text. What 32 bits do
// not hold is the greatest number that they do, whatever the word size.
std::optional<uint32> numberOfText(const char* text);

// A VLAN, or the line that says why it is none.
struct Read_Vlan {
    const char* refusal = nullptr;
    bool any = false; // the word "any", in any case
    uint16 id = 0;
};
Read_Vlan readVlan(const char* text);

// Whether the lower three bytes are an FC map of the kind that FC-BB-5 sets aside: 0x0EFCxx.
constexpr bool isFCMap(uint32 number) {
    return (number & 0xffff00) == 0xefc00;
}

} // namespace cimple

#endif // OPERATIONS_FIP_TEXTS_H
