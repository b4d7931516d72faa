// Fitting values to what a class declares: types, ranges, classes of references, keys of paths.
//
// Every function says in plain words what is wrong, or nothing when all is well; the words fit
// behind the name of the thing that was set ("uint16 expected, got string").
#ifndef HOST_VALUE_CHECK_H
#define HOST_VALUE_CHECK_H

#include "host/class_repository.h"

namespace host {

using Complaint = std::optional<std::string>;

// The value must have exactly the declared type; an embedded object may be an instance or a text. A
// null takes on the declared type. The spelling of a datetime is checked.
Complaint check_value(const ClassRepository& classes, const Slot_Type& slot, Value& value);

// The same for a key: an integer may also come in a wider type when it fits, and becomes the
// declared one.
Complaint check_key(const ClassRepository& classes, const Property& property, Value& value);

// A complete name of an object: the class is known, all its keys are there and not null, no other
// ones, references in it included. Puts names into the spelling of the class and keys into its
// order.
Complaint check_path(const ClassRepository& classes, ObjectPath& path);

} // namespace host

#endif // HOST_VALUE_CHECK_H
