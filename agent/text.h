// Texts of map builders. What goes into one may come from a device, as any bytes; what comes out is
// valid UTF-8, since object managers refuse or mangle anything else.
#ifndef VLN_AGENT_TEXT_H
#define VLN_AGENT_TEXT_H

#include "cimple/string.h"
#include "foundation/field_text.h"

#include <string_view>

namespace cimple {

inline constexpr char NO_TEXT[] = "n/a"; // stands for a text that the library does not tell

String text(std::string_view bytes);

// The text of a fixed field of a record.
template <std::size_t N>
String field_text(const char (&field)[N]) {
    return text(fieldText(field));
}

// As printf, of any length. A precision counts bytes.
__attribute__((format(printf, 1, 2))) String format_text(const char* format, ...);

} // namespace cimple

#endif // VLN_AGENT_TEXT_H
