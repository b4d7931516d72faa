// Texts in fixed fields of records: padded with zeros, and without a terminator when they fill
// their field to its last byte.
#ifndef FOUNDATION_FIELD_TEXT_H
#define FOUNDATION_FIELD_TEXT_H

#include <cstring>
#include <string>

namespace cimple {

inline std::string fieldText(const char* field, std::size_t size) {
    return std::string(field, strnlen(field, size));
}

template <std::size_t N>
std::string fieldText(const char (&field)[N]) {
    return fieldText(field, N);
}

} // namespace cimple

#endif // FOUNDATION_FIELD_TEXT_H
