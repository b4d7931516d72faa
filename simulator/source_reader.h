// Typed reading of a scenario's values: each question names what is wrong, where, and what is
// known.
#ifndef VLNSIM_SOURCE_READER_H
#define VLNSIM_SOURCE_READER_H

#include "simulator/source_json.h"

#include <initializer_list>
#include <limits>
#include <optional>
#include <span>

namespace vlnsim {

// The numbers that placeholders in texts stand for: "{port}", "{port+1}", "{card:04}" (four digits
// at least), "{card:02X}" (hexadecimal). "{{" makes a brace.
struct Scope {
    std::vector<std::pair<std::string, std::uint64_t>> numbers;

    Scope with(std::string_view name, std::uint64_t number) const;
};

class Node {
public:
    Node(const Value& value, const Scope& scope) : _value(&value), _scope(&scope) {}

    [[noreturn]] void fail(const std::string& what) const { _value->fail(what); }

    const Value& value() const { return *_value; }
    const Scope& scope() const { return *_scope; }
    bool is(Value::Kind kind) const { return _value->kind == kind; }

    // The members of an object, which may have no others than the known ones.
    void expect_object(std::initializer_list<std::string_view> known) const;
    void expect_object(std::span<const std::string_view> known) const;
    void expect_any_object() const;
    std::optional<Node> member(std::string_view name) const; // none as well for null
    std::vector<Node> items() const;                         // of a list
    std::vector<Node> items_or_self() const; // a list, or one value that stands alone

    bool boolean() const;
    std::string text() const; // placeholders are replaced
    // A number, also as text: "0x1F", "12", or with placeholders.
    std::uint64_t number(std::uint64_t maximum = std::numeric_limits<std::uint64_t>::max()) const;
    std::uint32_t number32() const {
        return static_cast<std::uint32_t>(number(std::numeric_limits<std::uint32_t>::max()));
    }
    std::vector<std::uint8_t>
    bytes() const; // a text of hexadecimal digits, blanks and colons between
    std::vector<std::uint8_t> bytes(std::size_t count) const; // exactly so many
    std::uint64_t wwn() const;                                // eight bytes

    // Values with a default for a member that is not there.
    bool boolean(std::string_view name, bool otherwise) const;
    std::string text(std::string_view name, const std::string& otherwise) const;
    // The same, where {"bytes": "hexadecimal digits"} stands for a text of any bytes.
    std::string wild_text(std::string_view name, const std::string& otherwise) const;
    std::uint64_t number(std::string_view name, std::uint64_t otherwise,
                         std::uint64_t maximum = std::numeric_limits<std::uint64_t>::max()) const;
    std::uint32_t number32(std::string_view name, std::uint32_t otherwise) const;

private:
    const Value* _value;
    const Scope* _scope;
};

// "known are: a, b, c", for messages.
std::string known_list(std::span<const std::string_view> names);

// A decimal or 0x number that fills the whole text.
std::optional<std::uint64_t> parse_number(std::string_view text);

} // namespace vlnsim

#endif // VLNSIM_SOURCE_READER_H
