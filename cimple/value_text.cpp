#include "cimple/value_text.h"

#include <charconv>

namespace cimple {

namespace {

template <class T>
T get(const void* value) {
    return *static_cast<const T*>(value);
}

// The fixed form with six decimals. printf would take the decimal point of the process's locale.
void append_real(Buffer& out, real64 value) {
    char text[400]; // the largest double has 309 digits
    const auto end = std::to_chars(text, text + sizeof text, value, std::chars_format::fixed, 6);
    out.append(text, static_cast<std::size_t>(end.ptr - text));
}

template <class T>
void append_integer(Buffer& out, T value) {
    char text[24];
    const auto end = std::to_chars(text, text + sizeof text, value);
    out.append(text, static_cast<std::size_t>(end.ptr - text));
}

} // namespace

void append_number(Buffer& out, uint32 type, const void* value) {
    switch (type) {
    case TYPE_BOOLEAN:
        return out.append(get<uint8>(value) ? "true" : "false");
    case TYPE_UINT8:
        return append_integer(out, get<uint8>(value));
    case TYPE_SINT8:
        return append_integer(out, get<sint8>(value));
    case TYPE_UINT16:
        return append_integer(out, get<uint16>(value));
    case TYPE_SINT16:
        return append_integer(out, get<sint16>(value));
    case TYPE_UINT32:
        return append_integer(out, get<uint32>(value));
    case TYPE_SINT32:
        return append_integer(out, get<sint32>(value));
    case TYPE_UINT64:
        return append_integer(out, get<uint64>(value));
    case TYPE_SINT64:
        return append_integer(out, get<sint64>(value));
    case TYPE_REAL32:
        return append_real(out, real64{get<real32>(value)});
    case TYPE_REAL64:
        return append_real(out, get<real64>(value));
    case TYPE_CHAR16:
        return append_integer(out, static_cast<uint16>(get<char16>(value)));
    default:
        return;
    }
}

void append_char16(Buffer& out, char16 value) {
    if (value >= 0x20 && value < 0x7F)
        out.format("'%c'", static_cast<char>(value));
    else
        out.format("0x%04X", static_cast<unsigned>(value));
}

void append_quoted(Buffer& out, const char* text) {
    out.append('"');
    for (; *text; ++text) {
        switch (*text) {
        case '\t':
            out.append("\\t");
            break;
        case '\n':
            out.append("\\n");
            break;
        case '\f':
            out.append("\\f");
            break;
        case '\r':
            out.append("\\r");
            break;
        case '"':
            out.append("\\\"");
            break;
        default:
            out.append(*text);
        }
    }
    out.append('"');
}

} // namespace cimple
