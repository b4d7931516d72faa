#include "foundation/utf8.h"

#include "cimple/types.h"

#include <algorithm>
#include <cstring>

namespace cimple {

namespace {

constexpr std::string_view REPLACEMENT = "\xEF\xBF\xBD"; // U+FFFD

// Well-formed sequences by their first byte. The range of the second byte leaves out overlong
// forms, surrogates and what is above U+10FFFF.
struct Lead {
    uint8 first, last;
    uint8 second_first, second_last;
    uint8 length;
};

constexpr Lead LEADS[] = {
    {0x00, 0x7F, 0x00, 0x00, 1}, {0xC2, 0xDF, 0x80, 0xBF, 2}, {0xE0, 0xE0, 0xA0, 0xBF, 3},
    {0xE1, 0xEC, 0x80, 0xBF, 3}, {0xED, 0xED, 0x80, 0x9F, 3}, {0xEE, 0xEF, 0x80, 0xBF, 3},
    {0xF0, 0xF0, 0x90, 0xBF, 4}, {0xF1, 0xF3, 0x80, 0xBF, 4}, {0xF4, 0xF4, 0x80, 0x8F, 4},
};

bool in_range(char c, uint8 first, uint8 last) {
    const auto byte = static_cast<uint8>(c);
    return byte >= first && byte <= last;
}

bool fits(std::string_view bytes, const Lead& lead) {
    if (!in_range(bytes[0], lead.first, lead.last) || bytes.size() < lead.length)
        return false;
    if (lead.length > 1 && !in_range(bytes[1], lead.second_first, lead.second_last))
        return false;
    for (std::size_t i = 2; i < lead.length; ++i)
        if (!in_range(bytes[i], 0x80, 0xBF))
            return false;
    return true;
}

// Length of the sequence at the start of the bytes, which are not empty; 0 if it is not well
// formed.
std::size_t sequence_length(std::string_view bytes) {
    for (const Lead& lead : LEADS)
        if (fits(bytes, lead))
            return lead.length;
    return 0;
}

// Nearly all texts are ASCII: eight characters at a time are passed over.
std::size_t ascii_prefix(std::string_view bytes) {
    constexpr uint64 HIGH_BITS = 0x8080808080808080;
    std::size_t at = 0;
    for (uint64 word; bytes.size() - at >= sizeof word; at += sizeof word) {
        std::memcpy(&word, bytes.data() + at, sizeof word);
        if (word & HIGH_BITS)
            break;
    }
    while (at < bytes.size() && !(static_cast<uint8>(bytes[at]) & 0x80))
        ++at;
    return at;
}

// Length of the longest well-formed text at the start of the bytes.
std::size_t text_prefix(std::string_view bytes) {
    std::size_t at = ascii_prefix(bytes);
    while (at < bytes.size()) {
        const std::size_t length = sequence_length(bytes.substr(at));
        if (length == 0)
            break;
        at += length;
    }
    return at;
}

} // namespace

bool is_utf8(std::string_view bytes) noexcept {
    return text_prefix(bytes) == bytes.size();
}

bool are_utf8(std::initializer_list<std::string_view> texts) noexcept {
    return std::all_of(texts.begin(), texts.end(), is_utf8);
}

std::string to_utf8(std::string_view bytes) {
    std::string text;
    text.reserve(bytes.size());
    while (!bytes.empty()) {
        const std::size_t good = text_prefix(bytes);
        text += bytes.substr(0, good);
        bytes.remove_prefix(good);
        if (!bytes.empty()) {
            text += REPLACEMENT;
            bytes.remove_prefix(1);
        }
    }
    return text;
}

std::string_view utf8_prefix(std::string_view text, std::size_t size) noexcept {
    if (text.size() <= size)
        return text;
    constexpr std::size_t MOST_BEHIND_A_LEAD = 3;
    std::size_t end = size;
    while (end > 0 && size - end < MOST_BEHIND_A_LEAD && in_range(text[end], 0x80, 0xBF))
        --end;
    return text.substr(0, in_range(text[end], 0x80, 0xBF) ? size : end); // else it is no text
}

} // namespace cimple
