// Object paths as text: namespace:Class.Key="value",Other=5,End="Class.Key=\"nested\"".
//
// This is the form of the DMTF's DSP0004 for the name of an object without a host part. A text is
// quoted, with the escapes of MOF; a reference is the quoted text of its path; so whatever bytes a
// key holds, the text is one line and reads back the same.
#ifndef HOST_PATH_TEXT_H
#define HOST_PATH_TEXT_H

#include "host/class_repository.h"

namespace host {

// The namespace is written unless it is that of the surroundings.
std::string path_to_text(const ObjectPath& path, std::string_view surroundings);

struct Parsed_Path {
    ObjectPath path;
    std::string error; // in plain words; empty: the path is complete and typed by its class
};
// A path without a namespace, nested ones too, is in the given one. Hostile texts give an error.
Parsed_Path parse_path(const ClassRepository& classes, std::string_view text,
                       std::string_view name_space);

// A text in quotes, with the escapes of MOF for quotes, backslashes and control characters.
std::string quote(std::string_view text);

// A scalar as it stands in a path and in MOF: 5, TRUE, "text".
std::string scalar_to_text(const Value& value, std::string_view surroundings);

} // namespace host

#endif // HOST_PATH_TEXT_H
