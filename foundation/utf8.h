// Text that may be no text: what devices tell comes as bytes, and goes to a client as UTF-8.
#ifndef FOUNDATION_UTF8_H
#define FOUNDATION_UTF8_H

#include <initializer_list>
#include <string>
#include <string_view>

namespace cimple {

// Whether the bytes are well-formed UTF-8 (RFC 3629). A zero is a character like others.
bool is_utf8(std::string_view bytes) noexcept;
bool are_utf8(std::initializer_list<std::string_view> texts) noexcept;

// The bytes as well-formed UTF-8: each one that is no part of a well-formed sequence becomes the
// replacement character U+FFFD, so that a reader sees where and how many.
std::string to_utf8(std::string_view bytes);

// The beginning of a text, of at most so many bytes, that does not end inside a character.
std::string_view utf8_prefix(std::string_view text, std::size_t size) noexcept;

} // namespace cimple

#endif // FOUNDATION_UTF8_H
