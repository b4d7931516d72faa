// How many bytes an answer has as CIM-XML (DSP0201), the form in which object managers send it:
// their limits are limits of that. Null properties count, since many send them, and so does the
// path of each object with its host; qualifiers and origins of properties do not.
#ifndef HOST_ANSWER_SIZE_H
#define HOST_ANSWER_SIZE_H

#include "host/class_repository.h"

#include <cstddef>

namespace host {

// What an answer repeats: an enumeration names its objects by their keys alone, an association
// query with namespace and host.
enum class Path_Form { keys, complete };

std::size_t xml_size(const ObjectPath& path, Path_Form form);
// The class tells which properties are null; without it none are, as where a property list was
// given.
std::size_t xml_size(const Instance& instance, const Class* known, Path_Form form);

} // namespace host

#endif // HOST_ANSWER_SIZE_H
