#include "host/path_text.h"

#include "host/scalar_text.h"
#include "host/value_check.h"

#include <cstdio>

namespace host {

std::string quote(std::string_view text) {
    std::string quoted = "\"";
    for (char c : text) {
        switch (c) {
        case '"':
            quoted += "\\\"";
            break;
        case '\\':
            quoted += "\\\\";
            break;
        case '\n':
            quoted += "\\n";
            break;
        case '\r':
            quoted += "\\r";
            break;
        case '\t':
            quoted += "\\t";
            break;
        default:
            if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f) {
                char escape[8];
                std::snprintf(escape, sizeof escape, "\\x%04X", static_cast<unsigned>(c) & 0xffu);
                quoted += escape;
            } else {
                quoted += c;
            }
        }
    }
    return quoted += '"';
}

std::string scalar_to_text(const Value& value, std::string_view surroundings) {
    if (value.is_null())
        return "NULL";
    if (const ObjectPath* path = value.as_reference())
        return quote(path_to_text(*path, surroundings));
    if (std::holds_alternative<std::string>(value.data))
        return quote(value.as_text());
    return number_to_text(value);
}

std::string path_to_text(const ObjectPath& path, std::string_view surroundings) {
    std::string text;
    if (!path.name_space.empty() && !same_name(path.name_space, surroundings))
        text = path.name_space + ":";
    text += path.class_name;
    char separator = '.';
    for (const Named_Value& key : path.keys) {
        text += separator;
        text += key.name + "=" + scalar_to_text(key.value, path.name_space);
        separator = ',';
    }
    return text;
}

namespace {

bool is_name_char(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_';
}

// Reads one path; nested paths are read by a reader of their own over the unquoted text.
class Path_Reader {
public:
    Path_Reader(const ClassRepository& classes, std::string_view text, int depth)
        : _classes(classes), _text(text), _depth(depth) {}

    // Throws the complaint as std::string.
    ObjectPath read(std::string_view name_space) {
        constexpr int deepest = 8;
        if (_depth > deepest)
            throw std::string("references are nested too deeply");
        ObjectPath path;
        path.name_space = read_name_space(name_space);
        path.class_name = read_name("a class name");
        const Class* known = _classes.find(path.class_name);
        if (!known)
            throw "unknown class " + path.class_name +
                did_you_mean(path.class_name, _classes.names());
        if (at_end())
            return path;
        expect('.', "'.' and the keys behind the class name");
        while (true) {
            read_key(*known, path);
            if (at_end())
                return path;
            expect(',', "',' or the end behind the value of a key");
        }
    }

private:
    bool at_end() const { return _at == _text.size(); }
    char peek() const { return at_end() ? '\0' : _text[_at]; }

    [[noreturn]] void fail(const std::string& wanted) const {
        throw wanted + " expected at character " + std::to_string(_at + 1) + " of " +
            quote(_text.substr(0, 200));
    }

    void expect(char c, const char* what) {
        if (at_end() || peek() != c)
            fail(what);
        ++_at;
    }

    std::string read_name_space(std::string_view otherwise) {
        const std::size_t end = _text.find_first_of(":.\"=,");
        if (end == std::string_view::npos || _text[end] != ':')
            return std::string(otherwise);
        _at = end + 1;
        if (end == 0)
            throw std::string("the namespace before ':' is empty");
        return std::string(_text.substr(0, end));
    }

    std::string read_name(const char* what) {
        const std::size_t start = _at;
        while (!at_end() && is_name_char(peek()))
            ++_at;
        if (_at == start)
            fail(what);
        return std::string(_text.substr(start, _at - start));
    }

    void read_key(const Class& known, ObjectPath& path) {
        const std::string name = read_name("the name of a key");
        const Property* property = known.find_property(name);
        if (!property || !property->key) {
            std::vector<std::string> keys;
            for (std::size_t index : known.keys)
                keys.push_back(known.properties[index].name);
            throw known.name + " has no key " + name + "; its keys are " + join_or(keys);
        }
        if (path.key(name))
            throw "the key " + name + " is given twice";
        expect('=', "'=' behind the name of a key");
        path.keys.push_back({property->name, read_value(*property, path.name_space)});
    }

    Value read_value(const Property& property, const std::string& name_space) {
        const bool quoted = peek() == '"';
        const std::string text = quoted ? read_quoted() : read_bare();
        if (property.is_reference()) {
            Path_Reader inner(_classes, text, _depth + 1);
            return Value::reference(inner.read(name_space));
        }
        std::string error;
        Value value = scalar_from_text(property.type, text, error);
        const bool is_text = std::holds_alternative<std::string>(value.data);
        if (error.empty() && quoted != is_text && property.type != CMPI_char16)
            error = quoted ? "a number or boolean stands without quotes"
                           : "a text stands in double quotes";
        if (!error.empty())
            throw property.name + ": " + error;
        return value;
    }

    std::string read_bare() {
        const std::size_t start = _at;
        while (!at_end() && peek() != ',')
            ++_at;
        if (_at == start)
            fail("a value");
        return std::string(_text.substr(start, _at - start));
    }

    std::string read_quoted() {
        std::string text;
        for (++_at; !at_end(); ++_at) {
            const char c = peek();
            if (c == '"') {
                ++_at;
                return text;
            }
            if (c == '\\')
                read_escape(text);
            else
                text += c;
        }
        fail("a closing quote");
    }

    // Leaves the position at the last character of the escape.
    void read_escape(std::string& text) {
        ++_at;
        constexpr std::string_view letters = "btnfr\"'\\", meanings = "\b\t\n\f\r\"'\\";
        const std::size_t letter = letters.find(peek());
        if (!at_end() && letter != std::string_view::npos) {
            text += meanings[letter];
            return;
        }
        if (peek() != 'x' && peek() != 'X')
            fail("an escape such as \\\" or \\\\");
        std::uint32_t code = 0;
        std::size_t digits = 0;
        for (; digits < 4 && _at + 1 < _text.size(); ++digits, ++_at) {
            const int digit = hex_digit(_text[_at + 1]);
            if (digit < 0)
                break;
            code = code * 16 + static_cast<std::uint32_t>(digit);
        }
        if (digits == 0)
            fail("hexadecimal digits behind \\x");
        append_utf8(text, code);
    }

    static int hex_digit(char c) {
        constexpr std::string_view digits = "0123456789abcdef";
        const std::size_t value = digits.find(fold(c));
        return value == std::string_view::npos ? -1 : static_cast<int>(value);
    }

    const ClassRepository& _classes;
    std::string_view _text;
    int _depth;
    std::size_t _at = 0;
};

} // namespace

Parsed_Path parse_path(const ClassRepository& classes, std::string_view text,
                       std::string_view name_space) {
    Parsed_Path parsed;
    try {
        parsed.path = Path_Reader(classes, text, 0).read(name_space);
        if (Complaint wrong = check_path(classes, parsed.path))
            parsed.error = *wrong;
    } catch (const std::string& wrong) {
        parsed.error = wrong;
    }
    return parsed;
}

} // namespace host
