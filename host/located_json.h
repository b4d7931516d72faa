// JSON whose values know where they stand in the file, for messages that people can act on.
#ifndef HOST_LOCATED_JSON_H
#define HOST_LOCATED_JSON_H

#include <nlohmann/json.hpp>

#include <map>
#include <string>
#include <string_view>

namespace host {

struct Located_Json {
    nlohmann::ordered_json value;
    std::string file;
    std::map<std::string, int> lines; // by path, from 1

    // Ends in Setup_Error: "file:line: path: text". A path is "instances/0/class"; "" is the whole.
    [[noreturn]] void fail(const std::string& path, const std::string& text) const;
};

// Throws Setup_Error for a text that is not JSON and for a name that stands twice in an object.
Located_Json parse_located_json(std::string_view text, const std::string& file);

} // namespace host

#endif // HOST_LOCATED_JSON_H
