// "Name=value" of the command line, typed by what the class declares.
#ifndef MPCACTL_ASSIGNMENT_H
#define MPCACTL_ASSIGNMENT_H

#include "host/class_repository.h"

#include <string>
#include <vector>

namespace mpcactl {

// Throw Usage_Error for a name that the class or method does not have, or a value that does not
// fit.
host::Named_Values read_properties(const host::ClassRepository& classes, const host::Class& known,
                                   const std::vector<std::string>& assignments,
                                   const std::string& name_space);
host::Named_Values read_inputs(const host::ClassRepository& classes, const host::Method& method,
                               const std::vector<std::string>& assignments,
                               const std::string& name_space);

} // namespace mpcactl

#endif // MPCACTL_ASSIGNMENT_H
