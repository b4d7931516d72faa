#include "schema/mof_parser/mof.h"

#include <algorithm>
#include <array>
#include <fstream>
#include <iterator>

namespace mof {

namespace {

constexpr std::array<const char*, 15> TYPE_NAMES = {
    "boolean", "uint8",  "sint8",  "uint16", "sint16", "uint32",   "sint32", "uint64",
    "sint64",  "real32", "real64", "char16", "string", "datetime", "ref",
};

// Not the locale's idea of case: names are ASCII.
char fold(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

} // namespace

std::string to_string(const Position& position) {
    return (position.file ? *position.file : std::string("?")) + ":" +
           std::to_string(position.line) + ":" + std::to_string(position.column);
}

Error::Error(Position where, std::string reason)
    : std::runtime_error(to_string(where) + ": " + reason), _where(std::move(where)),
      _reason(std::move(reason)) {}

const char* type_name(Type type) {
    return TYPE_NAMES.at(static_cast<std::size_t>(type));
}

std::optional<Type> type_by_name(std::string_view name) {
    for (std::size_t i = 0; i < TYPE_NAMES.size(); i++)
        if (same_name(TYPE_NAMES[i], name))
            return static_cast<Type>(i);
    return std::nullopt;
}

bool same_name(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [](char x, char y) { return fold(x) == fold(y); });
}

bool Name_Less::operator()(std::string_view a, std::string_view b) const {
    return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                        [](char x, char y) { return fold(x) < fold(y); });
}

std::int64_t Value::as_signed() const noexcept {
    return static_cast<std::int64_t>(negative ? 0 - magnitude : magnitude);
}

const Qualifier* find(const Qualifiers& qualifiers, std::string_view name) {
    auto found = std::find_if(qualifiers.begin(), qualifiers.end(),
                              [&](const Qualifier& each) { return same_name(each.name, name); });
    return found == qualifiers.end() ? nullptr : &*found;
}

bool is_true(const Qualifiers& qualifiers, std::string_view name, bool otherwise) {
    const Qualifier* qualifier = find(qualifiers, name);
    if (!qualifier)
        return otherwise;
    return qualifier->value.kind == Value::Kind::boolean && qualifier->value.boolean;
}

bool Declaration::is_embedded() const {
    return find(qualifiers, "EmbeddedInstance") || is_true(qualifiers, "EmbeddedObject");
}

std::optional<std::string> read_file(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    if (!in)
        return std::nullopt;
    std::string text(std::istreambuf_iterator<char>(in), {});
    if (in.bad())
        return std::nullopt;
    return text;
}

} // namespace mof
