// The registration of a module: which class it serves in which namespaces, as an installer hands it
// to an object manager.
//
// A section a class: "[Class]", then lines "word: value", of which the one with "namespace" counts.
// Read once, then used by any number of threads.
#ifndef HOST_REGISTRATION_H
#define HOST_REGISTRATION_H

#include "host/text.h"
#include "host/value.h"

#include <string>
#include <string_view>
#include <vector>

namespace host {

class Registration {
public:
    // Throws Setup_Error, "file:line: what is wrong".
    void read(const std::string& path);

    // Whether a request to the class in the namespace has somewhere to go. Before anything was read
    // all have.
    Status check(std::string_view class_name, std::string_view name_space) const;
    Status check_name_space(std::string_view name_space) const;

private:
    Name_Map<std::vector<std::string>> _name_spaces; // by class
    std::vector<std::string> _all;                   // namespaces, each once
};

} // namespace host

#endif // HOST_REGISTRATION_H
