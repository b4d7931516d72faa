// The registration of a module: which class it serves, in which namespaces and for which kinds of
// request, as an installer hands it to an object manager.
//
// A section a class: "[Class]", then lines "word: value". "type" names kinds of request,
// "namespace" where they are answered, "group" the process that the provider runs in; other words
// are for others to read. Read once, then used by any number of threads.
#ifndef HOST_REGISTRATION_H
#define HOST_REGISTRATION_H

#include "host/text.h"
#include "host/value.h"

#include <string>
#include <string_view>
#include <vector>

namespace host {

// The kinds of request that a provider may be registered for, each by an interface of its own.
enum class Interface : unsigned { instance = 1, association = 2, method = 4 };
const char* to_string(Interface kind);

class Registration {
public:
    // Throws Setup_Error, "file:line: what is wrong".
    void read(const std::string& path);

    // Before anything was read every class is served everywhere.
    bool is_empty() const { return _entries.empty(); }

    bool has(std::string_view class_name) const { return _entries.contains(class_name); }
    // Whether a request to the class in the namespace has somewhere to go.
    Status check(std::string_view class_name, Interface kind, std::string_view name_space) const;
    bool has_name_space(std::string_view name_space) const;
    Status unknown_name_space(std::string_view name_space) const;

private:
    struct Entry {
        unsigned kinds = 0; // of Interface
        std::vector<std::string> name_spaces;
        std::string group;
    };
    struct Reader;

    Name_Map<Entry> _entries;      // by class
    std::vector<std::string> _all; // namespaces, each once
};

// What an object manager says where nobody was registered for the class.
Status class_not_found(std::string_view class_name, std::string_view name_space);

} // namespace host

#endif // HOST_REGISTRATION_H
