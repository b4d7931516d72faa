#include "host/located_json.h"

#include "host/manager.h"

#include <vector>

namespace host {

namespace {

using Json = nlohmann::ordered_json;

// Characters of the text for the parser, counting lines. A line counts as begun when a character of
// it is read, so that a token which ends at a line break is on the line before.
class Counting_Iterator {
public:
    using iterator_category = std::input_iterator_tag;
    using value_type = char;
    using difference_type = std::ptrdiff_t;
    using pointer = const char*;
    using reference = const char&;

    Counting_Iterator(const char* at, int* line) : _at(at), _line(line) {}
    reference operator*() const { return *_at; }
    Counting_Iterator& operator++() {
        if (_after_break)
            ++*_line;
        _after_break = *_at == '\n';
        ++_at;
        return *this;
    }
    bool operator==(const Counting_Iterator& other) const { return _at == other._at; }

private:
    const char* _at;
    int* _line; // of the last character read
    bool _after_break = false;
};

// Builds the value, and notes the line of each part of it.
class Builder : public nlohmann::json_sax<Json> {
public:
    Builder(Located_Json& target, const int& line) : _target(target), _line(line) {}

    bool null() override { return add(nullptr); }
    bool boolean(bool value) override { return add(value); }
    bool number_integer(number_integer_t value) override { return add(value); }
    bool number_unsigned(number_unsigned_t value) override { return add(value); }
    bool number_float(number_float_t value, const string_t&) override { return add(value); }
    bool string(string_t& value) override { return add(value); }
    bool binary(binary_t&) override { return false; }
    bool start_object(std::size_t) override { return open(Json::object()); }
    bool start_array(std::size_t) override { return open(Json::array()); }
    bool end_object() override { return close(); }
    bool end_array() override { return close(); }

    bool key(string_t& name) override {
        _key = name;
        if (!_open.back().value->contains(name))
            return true;
        const std::string path = child_path();
        _target.lines[path] = _line;
        _target.fail(path, "the name stands twice in this object");
    }

    bool parse_error(std::size_t, const std::string&,
                     const nlohmann::detail::exception& error) override {
        // The library's text names its own position, in bytes or lines; ours is in front.
        std::string text = error.what();
        if (const std::size_t colon = text.find(": "); colon != std::string::npos)
            text = text.substr(colon + 2);
        const std::string path = _open.empty() ? "" : _open.back().path;
        _target.lines[path] = _line;
        _target.fail(path, "not JSON: " + text);
    }

private:
    struct Level {
        Json* value;
        std::string path;
    };

    std::string child_path() const {
        const Level& parent = _open.back();
        const std::string name =
            parent.value->is_array() ? std::to_string(parent.value->size()) : _key;
        return parent.path.empty() ? name : parent.path + "/" + name;
    }

    // Puts the value into what is open; tells where it is.
    Level place(Json value) {
        if (_open.empty()) {
            _target.lines[""] = _line;
            _target.value = std::move(value);
            return {&_target.value, ""};
        }
        const std::string path = child_path();
        _target.lines[path] = _line;
        Json& parent = *_open.back().value;
        if (parent.is_array()) {
            parent.push_back(std::move(value));
            return {&parent.back(), path};
        }
        Json& child = parent[_key];
        child = std::move(value);
        return {&child, path};
    }

    bool add(Json value) {
        place(std::move(value));
        return true;
    }

    bool open(Json value) {
        constexpr std::size_t deepest = 64;
        if (_open.size() >= deepest)
            _target.fail(_open.back().path, "nested too deeply");
        _open.push_back(place(std::move(value)));
        return true;
    }

    bool close() {
        _open.pop_back();
        return true;
    }

    Located_Json& _target;
    const int& _line;
    std::vector<Level> _open; // outermost first; a value moves only while nothing in it is open
    std::string _key;
};

} // namespace

void Located_Json::fail(const std::string& path, const std::string& text) const {
    // A part that is not there is reported at what it is missing from.
    std::string near = path;
    while (!near.empty() && !lines.contains(near)) {
        const std::size_t slash = near.rfind('/');
        near = slash == std::string::npos ? "" : near.substr(0, slash);
    }
    const auto line = lines.find(near);
    throw Setup_Error(file + ":" + std::to_string(line == lines.end() ? 1 : line->second) + ": " +
                      (path.empty() ? "" : path + ": ") + text);
}

Located_Json parse_located_json(std::string_view text, const std::string& file) {
    Located_Json result;
    result.file = file;
    int line = 1;
    Builder builder(result, line);
    Json::sax_parse(Counting_Iterator(text.data(), &line),
                    Counting_Iterator(text.data() + text.size(), &line), &builder);
    return result;
}

} // namespace host
