// Instances of the platform's own classes, from a file, as up-calls find them.
//
// The file is JSON: a list of {"namespace", "class", "properties"}, or an object with that list as
// "instances" and, as "classes", a list of {"name", "superclass"} for classes that the schema does
// not have. Properties are typed by the class. Read once, then used by any number of threads.
#ifndef HOST_PLATFORM_H
#define HOST_PLATFORM_H

#include "host/class_repository.h"

#include <string>
#include <string_view>
#include <vector>

namespace host {

class Platform {
public:
    // Adds the classes of the file to the repository. Throws Setup_Error, "file:line: path/in/json:
    // what is wrong".
    void read(const std::string& path, ClassRepository& classes);
    // The same from a text; name stands for the file in messages.
    void read_text(std::string_view text, const std::string& name, ClassRepository& classes);

    bool has_name_space(std::string_view name_space) const;
    // Whether there are instances of the class or of its subclasses.
    bool serves(std::string_view name_space, const Class& known,
                const ClassRepository& classes) const;
    // Of the class and its subclasses, in the order of the file.
    std::vector<Instance> instances(std::string_view name_space, const Class& known,
                                    const ClassRepository& classes) const;
    const Instance* find(const ObjectPath& path) const; // null: there is none

private:
    std::vector<Instance> _instances;
};

} // namespace host

#endif // HOST_PLATFORM_H
