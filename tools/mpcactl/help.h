// The examples of the help. A test runs each of them.
#ifndef MPCACTL_HELP_H
#define MPCACTL_HELP_H

#include <string>

namespace mpcactl {

// Of a command, or for "" of the program.
std::string examples_of(const std::string& command);

} // namespace mpcactl

#endif // MPCACTL_HELP_H
