// Values and instances as JSON, exactly, and values from JSON, typed by what a class declares.
//
// Integers are exact to 64 bits, null is null, a reference is the text of its path, a datetime its
// 25 characters, an embedded object {"class", "properties"}. Bytes that are no UTF-8 become U+FFFD
// when the JSON is written.
#ifndef HOST_VALUE_JSON_H
#define HOST_VALUE_JSON_H

#include "host/class_repository.h"

#include <nlohmann/json.hpp>

namespace host {

using Json = nlohmann::ordered_json;

// The namespace of a reference is written unless it is that of the surroundings.
Json to_json(const Value& value, std::string_view surroundings);
// {"class", "namespace", "path", "properties"}
Json to_json(const Instance& instance, std::string_view surroundings);

// What is wrong with a JSON value, and where in it ("" or "3" or "properties/Name").
struct Json_Complaint {
    std::string path;
    std::string text;
};

// Throws Json_Complaint. References without a namespace are in the given one.
Value value_from_json(const ClassRepository& classes, const Slot_Type& slot, const Json& json,
                      std::string_view name_space);
// The properties of an instance of the class. Throws Json_Complaint.
Named_Values properties_from_json(const ClassRepository& classes, const Class& known,
                                  const Json& json, std::string_view name_space);

} // namespace host

#endif // HOST_VALUE_JSON_H
