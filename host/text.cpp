#include "host/text.h"

#include <algorithm>
#include <numeric>

namespace host {

char fold(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

bool same_name(std::string_view a, std::string_view b) {
    return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(),
                                              [](char x, char y) { return fold(x) == fold(y); });
}

std::size_t Name_Hash::operator()(std::string_view name) const {
    std::uint32_t hash = 2166136261u; // FNV-1a
    for (char c : name)
        hash = (hash ^ static_cast<unsigned char>(fold(c))) * 16777619u;
    return hash;
}

namespace {

// Edits (insert, delete, replace, swap neighbours) from one name to the other, case ignored.
std::size_t distance(std::string_view a, std::string_view b) {
    std::vector<std::size_t> before(b.size() + 1), above(b.size() + 1), row(b.size() + 1);
    std::iota(above.begin(), above.end(), std::size_t{0});
    for (std::size_t i = 1; i <= a.size(); ++i) {
        row[0] = i;
        for (std::size_t j = 1; j <= b.size(); ++j) {
            const bool same = fold(a[i - 1]) == fold(b[j - 1]);
            row[j] = std::min({above[j] + 1, row[j - 1] + 1, above[j - 1] + (same ? 0 : 1)});
            if (i > 1 && j > 1 && fold(a[i - 1]) == fold(b[j - 2]) &&
                fold(a[i - 2]) == fold(b[j - 1]))
                row[j] = std::min(row[j], before[j - 2] + 1);
        }
        std::swap(before, above);
        std::swap(above, row);
    }
    return above[b.size()];
}

std::string lower(std::string_view text) {
    std::string result(text);
    std::transform(result.begin(), result.end(), result.begin(), fold);
    return result;
}

} // namespace

std::vector<std::string> nearest_names(std::string_view name, const std::vector<std::string>& known,
                                       std::size_t count) {
    constexpr std::size_t longest = 256; // a hostile argument is no reason to compute for long
    if (name.empty() || name.size() > longest)
        return {};
    struct Near {
        std::size_t edits;
        const std::string* name;
    };
    std::vector<Near> near;
    const std::size_t limit = std::max<std::size_t>(2, name.size() / 4);
    const std::string folded = lower(name);
    for (const std::string& candidate : known) {
        std::size_t edits = distance(name, candidate);
        // A part of a name, such as "Card", is as good a hint as a misspelt one.
        if (edits > limit && name.size() >= 4 && lower(candidate).find(folded) != std::string::npos)
            edits = limit;
        if (edits <= limit)
            near.push_back({edits, &candidate});
    }
    std::stable_sort(near.begin(), near.end(), [](const Near& a, const Near& b) {
        return a.edits != b.edits ? a.edits < b.edits : a.name->size() < b.name->size();
    });
    // A near miss of one letter should not drag in names that merely look alike.
    if (!near.empty() && near.front().edits <= 2)
        std::erase_if(near, [best = near.front().edits](const Near& n) { return n.edits > best; });
    std::vector<std::string> names;
    for (const Near& found : near)
        if (names.size() < count)
            names.push_back(*found.name);
    return names;
}

std::string did_you_mean(std::string_view name, const std::vector<std::string>& known) {
    const std::vector<std::string> names = nearest_names(name, known);
    return names.empty() ? "" : "; did you mean " + join_or(names) + "?";
}

void append_utf8(std::string& text, std::uint32_t c) {
    const auto tail = [](std::uint32_t bits) { return static_cast<char>(0x80 | (bits & 0x3f)); };
    if (c < 0x80) {
        text += static_cast<char>(c);
    } else if (c < 0x800) {
        text += static_cast<char>(0xc0 | (c >> 6));
        text += tail(c);
    } else if (c < 0x10000) {
        text += static_cast<char>(0xe0 | (c >> 12));
        text += tail(c >> 6);
        text += tail(c);
    } else {
        text += static_cast<char>(0xf0 | ((c >> 18) & 0x07));
        text += tail(c >> 12);
        text += tail(c >> 6);
        text += tail(c);
    }
}

bool is_utf8(std::string_view text) {
    for (std::size_t at = 0; at < text.size();) {
        const auto lead = static_cast<unsigned char>(text[at++]);
        if (lead < 0x80)
            continue;
        const int tail = lead >= 0xf0 ? 3 : lead >= 0xe0 ? 2 : 1;
        std::uint32_t code = lead & (0x3fu >> tail);
        for (int i = 0; i < tail; ++i, ++at) {
            if (at == text.size() || (static_cast<unsigned char>(text[at]) & 0xc0) != 0x80)
                return false;
            code = code << 6 | (static_cast<unsigned char>(text[at]) & 0x3fu);
        }
        constexpr std::uint32_t smallest[] = {0, 0x80, 0x800, 0x10000};
        const bool surrogate = code >= 0xd800 && code < 0xe000;
        if (lead < 0xc0 || lead > 0xf7 || code < smallest[tail] || code > 0x10ffff || surrogate)
            return false;
    }
    return true;
}

std::size_t utf8_length(std::string_view text) {
    std::size_t length = 0;
    for (char c : text)
        length += (static_cast<unsigned char>(c) & 0xc0) != 0x80;
    return length;
}

std::string join_or(const std::vector<std::string>& words) {
    std::string text;
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (i > 0)
            text += i + 1 == words.size() ? " or " : ", ";
        text += words[i];
    }
    return text;
}

} // namespace host
