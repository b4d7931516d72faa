// Small text helpers of the object manager: names without regard to case, nearest names, UTF-8.
#ifndef HOST_TEXT_H
#define HOST_TEXT_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace host {

// ASCII letters only, as CIM names have them.
char fold(char c);
bool same_name(std::string_view a, std::string_view b);

struct Name_Hash {
    using is_transparent = void;
    std::size_t operator()(std::string_view name) const;
};
struct Name_Equal {
    using is_transparent = void;
    bool operator()(std::string_view a, std::string_view b) const { return same_name(a, b); }
};
template <class T>
using Name_Map = std::unordered_map<std::string, T, Name_Hash, Name_Equal>;

// Up to count of the known names that a misspelt name is most likely meant to be, nearest first;
// names that differ too much are left out.
std::vector<std::string> nearest_names(std::string_view name, const std::vector<std::string>& known,
                                       std::size_t count = 3);
// "; did you mean A, B or C?", or "" if no name is near.
std::string did_you_mean(std::string_view name, const std::vector<std::string>& known);

void append_utf8(std::string& text, std::uint32_t code_point);
// RFC 3629.
bool is_utf8(std::string_view text);
// Characters, counting each byte that belongs to none as one.
std::size_t utf8_length(std::string_view text);

// "a, b or c"
std::string join_or(const std::vector<std::string>& words);

} // namespace host

#endif // HOST_TEXT_H
