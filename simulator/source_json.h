// JSON with its places in the file: what scenario files are read into.
//
// The parser is nlohmann's; the tree is our own, since every message about a scenario names the
// line and the path of the value that is wrong, also after values were inherited and merged.
#ifndef VLNSIM_SOURCE_JSON_H
#define VLNSIM_SOURCE_JSON_H

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace vlnsim {

struct Member;

struct Value {
    enum class Kind { null, boolean, number, real, text, list, object };

    Kind kind = Kind::null;
    int line = 0;
    std::shared_ptr<const std::string> file;
    std::string path;            // "cards[0].functions[2].wwpn"
    bool flag = false;           // boolean
    bool negative = false;       // number below zero: its two's complement is in number
    std::uint64_t number = 0;    // number
    std::string text;            // text
    std::vector<Value> items;    // list
    std::vector<Member> members; // object, in the order of the file

    const Value* find(std::string_view name) const;
    [[noreturn]] void
    fail(const std::string& what) const; // throws a Scenario_Error about this place
};

struct Member {
    std::string first; // the name
    Value second;
};

// "file:line: path: what is wrong"; the path is left out for the top of the file.
class Scenario_Error : public std::runtime_error {
public:
    Scenario_Error(const std::string& file, int line, const std::string& path,
                   const std::string& what);
};

// Parses a text; // and /* */ comments are allowed. Throws Scenario_Error.
Value parse_source(const std::string& text, const std::string& file);

// The values of both objects, those of over before those of base: objects are merged member by
// member, everything else is replaced. A null in over stays and so hides the value below it.
Value merged(const Value& base, const Value& over);

} // namespace vlnsim

#endif // VLNSIM_SOURCE_JSON_H
