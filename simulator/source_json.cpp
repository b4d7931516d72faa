#include "simulator/source_json.h"

#include <algorithm>
#include <iterator>
#include <nlohmann/json.hpp>

namespace vlnsim {
namespace {

constexpr std::size_t max_depth = 64;

// How far the parser has read; shared by all copies of the iterator that it makes.
struct Position {
    int line = 1;
    char last = 0;
};

class Counting_Iterator {
public:
    using iterator_category = std::input_iterator_tag;
    using value_type = char;
    using difference_type = std::ptrdiff_t;
    using pointer = const char*;
    using reference = const char&;

    Counting_Iterator(const char* at, Position* position) : _at(at), _position(position) {}
    reference operator*() const { return *_at; }
    Counting_Iterator& operator++() {
        _position->last = *_at;
        if (*_at++ == '\n')
            ++_position->line;
        return *this;
    }
    Counting_Iterator operator++(int) {
        Counting_Iterator before = *this;
        ++*this;
        return before;
    }
    friend bool operator==(const Counting_Iterator& a, const Counting_Iterator& b) {
        return a._at == b._at;
    }

private:
    const char* _at;
    Position* _position;
};

using Json = nlohmann::json;

class Tree_Builder : public Json::json_sax_t {
public:
    Tree_Builder(const Position& position, const std::string& file)
        : _position(position), _file(std::make_shared<const std::string>(file)) {}

    Value take() { return std::move(_root); }

    bool null() override {
        add(Value::Kind::null);
        return true;
    }
    bool boolean(bool flag) override {
        add(Value::Kind::boolean).flag = flag;
        return true;
    }
    bool number_integer(number_integer_t number) override {
        Value& value = add(Value::Kind::number);
        value.negative = number < 0;
        value.number = static_cast<std::uint64_t>(number);
        return true;
    }
    bool number_unsigned(number_unsigned_t number) override {
        add(Value::Kind::number).number = number;
        return true;
    }
    bool number_float(number_float_t, const string_t& text) override {
        add(Value::Kind::real).text = text;
        return true;
    }
    bool string(string_t& text) override {
        add(Value::Kind::text).text = text;
        return true;
    }
    bool binary(binary_t&) override { return false; }
    bool start_object(std::size_t) override { return open(Value::Kind::object); }
    bool start_array(std::size_t) override { return open(Value::Kind::list); }
    bool end_object() override { return close(); }
    bool end_array() override { return close(); }

    bool key(string_t& name) override {
        const Value& object = *_open.back();
        const std::string path = object.path.empty() ? name : object.path + "." + name;
        if (const Value* first = object.find(name))
            throw Scenario_Error(*_file, _position.line, path,
                                 "given twice, first in line " + std::to_string(first->line));
        _key = name;
        return true;
    }
    bool parse_error(std::size_t, const std::string&,
                     const nlohmann::detail::exception& e) override {
        std::string what = e.what();
        // The library's own prefix "[...] parse error at line 3, column 4: " repeats what ours
        // says.
        if (const auto colon = what.find(": "); colon != std::string::npos)
            what.erase(0, colon + 2);
        throw Scenario_Error(*_file, line(), _open.empty() ? "" : _open.back()->path, what);
    }

private:
    // A number ends only when the character after it was read, which may be the end of its line.
    int line() const { return _position.line - (_position.last == '\n' ? 1 : 0); }

    Value& add(Value::Kind kind) {
        Value* value = &_root;
        std::string path;
        if (!_open.empty()) {
            Value& parent = *_open.back();
            if (parent.kind == Value::Kind::object) {
                path = parent.path.empty() ? _key : parent.path + "." + _key;
                value = &parent.members.emplace_back(Member{_key, {}}).second;
            } else {
                path = parent.path + "[" + std::to_string(parent.items.size()) + "]";
                value = &parent.items.emplace_back();
            }
        }
        value->kind = kind;
        value->line = line();
        value->file = _file;
        value->path = std::move(path);
        return *value;
    }
    bool open(Value::Kind kind) {
        if (_open.size() == max_depth)
            throw Scenario_Error(*_file, line(), _open.back()->path, "nested too deeply");
        _open.push_back(&add(kind));
        return true;
    }
    bool close() {
        _open.pop_back();
        return true;
    }

    const Position& _position;
    std::shared_ptr<const std::string> _file;
    Value _root;
    std::vector<Value*> _open; // a parent gets no further member while a child is open
    std::string _key;
};

std::string message(const std::string& file, int line, const std::string& path,
                    const std::string& what) {
    std::string text = file + ":" + std::to_string(line) + ": ";
    if (!path.empty())
        text += path + ": ";
    return text + what;
}

} // namespace

const Value* Value::find(std::string_view name) const {
    const auto it = std::find_if(members.begin(), members.end(),
                                 [&](const Member& member) { return member.first == name; });
    return it == members.end() ? nullptr : &it->second;
}

void Value::fail(const std::string& what) const {
    throw Scenario_Error(file ? *file : "scenario", line, path, what);
}

Scenario_Error::Scenario_Error(const std::string& file, int line, const std::string& path,
                               const std::string& what)
    : std::runtime_error(message(file, line, path, what)) {}

Value parse_source(const std::string& text, const std::string& file) {
    Position position;
    Tree_Builder builder(position, file);
    Json::sax_parse(Counting_Iterator(text.data(), &position),
                    Counting_Iterator(text.data() + text.size(), &position), &builder,
                    nlohmann::detail::input_format_t::json, true, true);
    return builder.take();
}

Value merged(const Value& base, const Value& over) {
    if (base.kind != Value::Kind::object || over.kind != Value::Kind::object)
        return over;
    Value result = over;
    result.members.clear();
    for (const auto& [name, value] : base.members) {
        const Value* above = over.find(name);
        result.members.push_back({name, above ? merged(value, *above) : value});
    }
    for (const auto& [name, value] : over.members)
        if (!base.find(name))
            result.members.push_back({name, value});
    return result;
}

} // namespace vlnsim
