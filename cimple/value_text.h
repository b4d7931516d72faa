// How single values look in the printed forms of classes and instances.
#ifndef CIMPLE_VALUE_TEXT_H
#define CIMPLE_VALUE_TEXT_H

#include "cimple/buffer.h"
#include "cimple/types.h"

namespace cimple {

inline constexpr std::size_t INDENT = 4; // blanks per level of a printed form

// A number or boolean, in decimal whatever the locale; reals as "%f". Not for texts, datetimes and
// characters. value points to it in its natural width.
void append_number(Buffer& out, uint32 type, const void* value);
// 'c' if printable ASCII, else 0xHHHH.
void append_char16(Buffer& out, char16 value);
// In double quotes, with \t \n \f \r \" escaped.
void append_quoted(Buffer& out, const char* text);

} // namespace cimple

#endif // CIMPLE_VALUE_TEXT_H
