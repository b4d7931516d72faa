#include "simulator/source_reader.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>

namespace vlnsim {
namespace {

std::string_view kind_name(Value::Kind kind) {
    switch (kind) {
    case Value::Kind::null:
        return "null";
    case Value::Kind::boolean:
        return "true or false";
    case Value::Kind::number:
        return "a number";
    case Value::Kind::real:
        return "a number with a fraction";
    case Value::Kind::text:
        return "a text";
    case Value::Kind::list:
        return "a list";
    case Value::Kind::object:
        break;
    }
    return "an object";
}

[[noreturn]] void fail_kind(const Node& node, std::string_view wanted) {
    node.fail(std::string(wanted) + " is wanted, not " + std::string(kind_name(node.value().kind)));
}

// What is between the braces: NAME[+NUMBER][:[0][WIDTH][X]].
std::string placeholder(const Node& node, std::string_view inside) {
    std::string_view format;
    if (const auto colon = inside.find(':'); colon != std::string_view::npos) {
        format = inside.substr(colon + 1);
        inside = inside.substr(0, colon);
    }
    std::uint64_t plus = 0;
    std::string_view name = inside;
    if (const auto sign = inside.find('+'); sign != std::string_view::npos) {
        const auto number = parse_number(inside.substr(sign + 1));
        if (!number)
            node.fail("a number is wanted after '+' in {" + std::string(inside) + "}");
        plus = *number;
        name = inside.substr(0, sign);
    }
    const auto& numbers = node.scope().numbers;
    const auto it = std::find_if(numbers.begin(), numbers.end(),
                                 [&](const auto& entry) { return entry.first == name; });
    if (it == numbers.end()) {
        std::vector<std::string_view> names;
        for (const auto& entry : numbers)
            names.push_back(entry.first);
        node.fail("unknown placeholder {" + std::string(name) + "}; " + known_list(names));
    }
    const bool hexadecimal = format.ends_with('X');
    if (hexadecimal)
        format.remove_suffix(1);
    const auto width = format.empty() ? std::optional<std::uint64_t>(0)
                                      : parse_number(format.substr(format.starts_with('0')));
    if (!width || *width > 16)
        node.fail("a width from 1 to 16 is wanted after ':' in a placeholder");
    std::array<char, 24> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), it->second + plus,
                                   hexadecimal ? 16 : 10);
    std::string result(digits.data(), end.ptr);
    std::transform(result.begin(), result.end(), result.begin(),
                   [](char c) { return c >= 'a' && c <= 'f' ? static_cast<char>(c - 32) : c; });
    if (result.size() < *width)
        result.insert(0, static_cast<std::size_t>(*width) - result.size(), '0');
    return result;
}

int digit_value(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

} // namespace

Scope Scope::with(std::string_view name, std::uint64_t number) const {
    Scope inner = *this;
    for (auto& entry : inner.numbers)
        if (entry.first == name) {
            entry.second = number;
            return inner;
        }
    inner.numbers.emplace_back(name, number);
    return inner;
}

std::string known_list(std::span<const std::string_view> names) {
    std::string text = names.empty() ? "none is known here" : "known are: ";
    for (std::size_t i = 0; i < names.size(); ++i)
        text += (i ? ", " : "") + std::string(names[i]);
    return text;
}

std::optional<std::uint64_t> parse_number(std::string_view text) {
    int base = 10;
    if (text.starts_with("0x") || text.starts_with("0X")) {
        text.remove_prefix(2);
        base = 16;
    }
    std::uint64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, base);
    if (error != std::errc{} || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

void Node::expect_any_object() const {
    if (!is(Value::Kind::object))
        fail_kind(*this, "an object");
}

void Node::expect_object(std::initializer_list<std::string_view> known) const {
    expect_object(std::span(known.begin(), known.size()));
}

void Node::expect_object(std::span<const std::string_view> known) const {
    expect_any_object();
    for (const auto& [name, value] : _value->members)
        if (std::find(known.begin(), known.end(), name) == known.end())
            Node(value, *_scope).fail("unknown key; " + known_list(known));
}

std::optional<Node> Node::member(std::string_view name) const {
    const Value* found = _value->find(name);
    if (!found || found->kind == Value::Kind::null)
        return std::nullopt;
    return Node(*found, *_scope);
}

std::vector<Node> Node::items() const {
    if (!is(Value::Kind::list))
        fail_kind(*this, "a list");
    std::vector<Node> nodes;
    for (const Value& item : _value->items)
        nodes.emplace_back(item, *_scope);
    return nodes;
}

std::vector<Node> Node::items_or_self() const {
    return is(Value::Kind::list) ? items() : std::vector<Node>{*this};
}

bool Node::boolean() const {
    if (!is(Value::Kind::boolean))
        fail_kind(*this, "true or false");
    return _value->flag;
}

std::string Node::text() const {
    if (!is(Value::Kind::text))
        fail_kind(*this, "a text");
    const std::string& source = _value->text;
    std::string result;
    for (std::size_t i = 0; i < source.size(); ++i) {
        if (source[i] != '{') {
            result += source[i];
        } else if (source.compare(i, 2, "{{") == 0) {
            result += '{';
            ++i;
        } else {
            const auto end = source.find('}', i);
            if (end == std::string::npos)
                fail("'{' without '}'; write '{{' for a brace");
            result += placeholder(*this, std::string_view(source).substr(i + 1, end - i - 1));
            i = end;
        }
    }
    return result;
}

std::uint64_t Node::number(std::uint64_t maximum) const {
    std::uint64_t number = 0;
    if (is(Value::Kind::number)) {
        if (_value->negative)
            fail("a number from 0 to " + std::to_string(maximum) + " is wanted");
        number = _value->number;
    } else if (is(Value::Kind::text)) {
        const std::string digits = text();
        const auto parsed = parse_number(digits);
        if (!parsed)
            fail("\"" + digits + "\" is not a number");
        number = *parsed;
    } else {
        fail_kind(*this, "a number");
    }
    if (number > maximum)
        fail("a number from 0 to " + std::to_string(maximum) + " is wanted");
    return number;
}

std::vector<std::uint8_t> Node::bytes() const {
    const std::string digits = text();
    std::vector<std::uint8_t> result;
    for (std::size_t i = 0; i < digits.size(); ++i) {
        if (digits[i] == ' ' || digits[i] == ':')
            continue;
        const int high = digit_value(digits[i]);
        const int low = i + 1 < digits.size() ? digit_value(digits[i + 1]) : -1;
        if (high < 0 || low < 0)
            fail("\"" + digits + "\" is not a row of bytes in hexadecimal digits");
        result.push_back(static_cast<std::uint8_t>(high * 16 + low));
        ++i;
    }
    return result;
}

std::vector<std::uint8_t> Node::bytes(std::size_t count) const {
    std::vector<std::uint8_t> result = bytes();
    if (result.size() != count)
        fail(std::to_string(count) + " bytes are wanted, not " + std::to_string(result.size()));
    return result;
}

std::uint64_t Node::wwn() const {
    std::uint64_t name = 0;
    for (const std::uint8_t byte : bytes(8))
        name = name << 8 | byte;
    return name;
}

bool Node::boolean(std::string_view name, bool otherwise) const {
    const auto node = member(name);
    return node ? node->boolean() : otherwise;
}

std::string Node::text(std::string_view name, const std::string& otherwise) const {
    const auto node = member(name);
    return node ? node->text() : otherwise;
}

std::string Node::wild_text(std::string_view name, const std::string& otherwise) const {
    const auto node = member(name);
    if (!node || !node->is(Value::Kind::object))
        return node ? node->text() : otherwise;
    node->expect_object({"bytes"});
    const auto bytes = node->member("bytes");
    if (!bytes)
        node->fail("\"bytes\" is wanted");
    const auto values = bytes->bytes();
    return std::string(values.begin(), values.end());
}

std::uint64_t Node::number(std::string_view name, std::uint64_t otherwise,
                           std::uint64_t maximum) const {
    const auto node = member(name);
    return node ? node->number(maximum) : otherwise;
}

std::uint32_t Node::number32(std::string_view name, std::uint32_t otherwise) const {
    const auto node = member(name);
    return node ? node->number32() : otherwise;
}

} // namespace vlnsim
