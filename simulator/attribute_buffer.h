// The library's own layout of an attribute buffer. Callers know nothing of it: they keep the bytes
// and ask for single values.
//
// A head, then an entry for each value: identifier, length, the bytes, filled up to four. A guard
// word ends the buffer's used part; a caller that writes into the buffer is found out by it or by
// the head.
#ifndef VLNSIM_ATTRIBUTE_BUFFER_H
#define VLNSIM_ATTRIBUTE_BUFFER_H

#include "simulator/host_model.h"

#include <cstdint>
#include <span>

namespace vlnsim {

struct Found_Value {
    enum class Result { found, missing, no_buffer, damaged };
    Result result = Result::missing;
    std::uint8_t* value = nullptr;
    std::uint16_t length = 0;
};

// A value to be laid out; the bytes are not owned.
struct Tagged_Value {
    std::uint16_t identifier;
    std::uint16_t length; // as it is told; a text has its NUL in bytes besides
    std::span<const std::uint8_t> bytes;
};

std::uint32_t buffer_size(std::span<const Tagged_Value> values);
// buffer has room for buffer_size(values) bytes.
void fill_buffer(std::span<const Tagged_Value> values, void* buffer);
Found_Value find_value(void* buffer, std::uint16_t identifier);

} // namespace vlnsim

#endif // VLNSIM_ATTRIBUTE_BUFFER_H
