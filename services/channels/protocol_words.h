// The words for what a function does, and the numbers that the library has for them.
#ifndef VLN_SERVICES_CHANNELS_PROTOCOL_WORDS_H
#define VLN_SERVICES_CHANNELS_PROTOCOL_WORDS_H

#include "device/library/axapi.h"

namespace cimple {

struct Protocol_Word {
    const char* word; // in any case, from a client
    uint32_t protocol;
    uint32_t ability; // AX_FUNCTION_
    uint32_t personality;
};

inline constexpr Protocol_Word PROTOCOL_WORDS[] = {
    {"NONE", AX_PROTOCOL_NONE, AX_FUNCTION_NONE, 0},
    {"NIC", AX_PROTOCOL_NIC, AX_FUNCTION_NIC, AX_PERSONALITY_NIC},
    {"ISCSI", AX_PROTOCOL_ISCSI, AX_FUNCTION_ISCSI, AX_PERSONALITY_ISCSI},
    {"FCOE", AX_PROTOCOL_FCOE, AX_FUNCTION_FCOE, AX_PERSONALITY_FCOE},
    {"NIC+ROCE", AX_PROTOCOL_ROCE, AX_FUNCTION_ROCE, AX_PERSONALITY_ROCE},
};

// The row with that value in the column, or null.
inline const Protocol_Word* find_word(uint32_t Protocol_Word::*column, uint32_t value) {
    for (const Protocol_Word& row : PROTOCOL_WORDS)
        if (row.*column == value)
            return &row;
    return nullptr;
}

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_PROTOCOL_WORDS_H
