#include "schema/mof_parser/word_map.h"

#include "schema/mof_parser/lexer.h"

#include <algorithm>
#include <limits>

namespace mof {

namespace {

constexpr std::string_view RANGE = "..";
constexpr auto LARGEST = std::numeric_limits<std::int64_t>::max();

[[noreturn]] void refuse(const Qualifier& qualifier, const std::string& entry, const char* reason) {
    throw Error(qualifier.position, "'" + entry + "' of " + qualifier.name + " " + reason);
}

// Written as everywhere in MOF; nothing for what is no number, or none of 64 bits with a sign.
std::optional<std::int64_t> number(std::string_view text) {
    try {
        Lexer lexer(text, nullptr);
        const Token token = lexer.next();
        if (token.kind != Token::Kind::integer || lexer.next().kind != Token::Kind::end ||
            token.magnitude > static_cast<std::uint64_t>(LARGEST))
            return std::nullopt;
        const auto value = static_cast<std::int64_t>(token.magnitude);
        return token.negative ? -value : value;
    } catch (const Error&) {
        return std::nullopt;
    }
}

// False: out of the type's range, or no number at all.
bool read_numbers(Word_Map::Entry& entry, const Integer_Range& range) {
    const auto lowest = static_cast<std::int64_t>(0 - range.below);
    const auto highest =
        static_cast<std::int64_t>(std::min(range.max, static_cast<std::uint64_t>(LARGEST)));
    const std::string_view text = entry.value;
    const std::size_t dots = text.find(RANGE);
    const bool single = dots == std::string_view::npos;
    const std::string_view first = text.substr(0, dots);
    const std::string_view last = single ? first : text.substr(dots + RANGE.size());
    const auto low = first.empty() && !single ? lowest : number(first);
    const auto high = last.empty() && !single ? highest : number(last);
    if (!low || !high || *low < lowest || *high > highest || *low > *high)
        return false;
    entry.low = *low;
    entry.high = *high;
    return true;
}

bool overlap(const Word_Map::Entry& a, const Word_Map::Entry& b, bool numbers) {
    if (a.rest || b.rest)
        return a.rest && b.rest;
    return numbers ? a.low <= b.high && b.low <= a.high : a.value == b.value;
}

} // namespace

std::optional<Word_Map> Word_Map::read(const Declaration& declaration) {
    return read(mof::find(declaration.qualifiers, "ValueMap"),
                mof::find(declaration.qualifiers, "Values"), declaration.type);
}

std::optional<Word_Map> Word_Map::read(const Qualifier* map, const Qualifier* words, Type type) {
    if (!map && !words)
        return std::nullopt;
    if (!map || !words)
        throw Error((map ? map : words)->position,
                    (map ? map : words)->name + " stands alone, without " +
                        (map ? "words for its entries" : "entries for its words"));
    const std::vector<Value>&from = map->value.elements, &to = words->value.elements;
    if (from.size() != to.size())
        throw Error(words->position, words->name + " has " + std::to_string(to.size()) +
                                         " words for the " + std::to_string(from.size()) +
                                         " entries of " + map->name);
    const Integer_Range* range = integer_range(type);
    if (!range && type != Type::string)
        throw Error(map->position, std::string("a ") + type_name(type) + " has no " + map->name);
    Word_Map result;
    for (std::size_t i = 0; i < from.size(); i++) {
        Entry entry{from[i].text, to[i].text};
        entry.rest = entry.value == RANGE;
        if (range && !entry.rest && !read_numbers(entry, *range))
            refuse(*map, entry.value, "is no value of the type");
        for (const Entry& earlier : result._entries)
            if (overlap(earlier, entry, range))
                refuse(*map, entry.value, "is claimed twice");
        result._entries.push_back(std::move(entry));
    }
    return result;
}

const std::string* Word_Map::find(std::int64_t value) const {
    for (const Entry& entry : _entries)
        if (!entry.rest && entry.low <= value && value <= entry.high)
            return &entry.word;
    return rest();
}

const std::string* Word_Map::find(std::string_view value) const {
    for (const Entry& entry : _entries)
        if (!entry.rest && entry.value == value)
            return &entry.word;
    return rest();
}

const std::string* Word_Map::rest() const {
    for (const Entry& entry : _entries)
        if (entry.rest)
            return &entry.word;
    return nullptr;
}

} // namespace mof
