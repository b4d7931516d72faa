// The commands of the program, each over a session that is ready.
#ifndef MPCACTL_COMMANDS_H
#define MPCACTL_COMMANDS_H

#include "tools/mpcactl/session.h"

namespace mpcactl {

// Runs the command that the settings name. The exit status; throws Usage_Error and Cim_Error.
int run_command(Session& session);

} // namespace mpcactl

#endif // MPCACTL_COMMANDS_H
