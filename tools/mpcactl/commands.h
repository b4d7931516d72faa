// The commands of the program, each over a session that is ready. A family of commands has a file.
#ifndef MPCACTL_COMMANDS_H
#define MPCACTL_COMMANDS_H

#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/print.h"
#include "tools/mpcactl/session.h"

namespace mpcactl {

// Runs the command. The exit status; throws Usage_Error and Cim_Error.
int run_command(Session& session, const Command& command);

// ---- Parts, used by the commands ----

Print_Context print_context(const Session& session, const Command& command);

// The properties asked for, each of which one of the classes has at least. Throws Usage_Error with
// the nearest names, which begins with the words that say who has none.
host::Property_List properties(const Command& command,
                               const std::vector<const host::Class*>& classes,
                               const std::string& none_has);

// The value of a reply, or its error.
template <class T>
T take(host::Reply<T> reply) {
    if (!reply.ok())
        throw Cim_Error(reply.status);
    return std::move(reply.value);
}

inline void check(const host::Status& status) {
    if (!status.ok())
        throw Cim_Error(status);
}

// ---- The commands, by their names ----

int list_classes(Session& session, const Command& command);
int show_class(Session& session, const Command& command);

int enumerate(Session& session, const Command& command);
int list_names(Session& session, const Command& command);
int census(Session& session, const Command& command);

int get(Session& session, const Command& command);
int create(Session& session, const Command& command);
int modify(Session& session, const Command& command);
int remove(Session& session, const Command& command);
int invoke(Session& session, const Command& command);

int associators(Session& session, const Command& command);
int associator_names(Session& session, const Command& command);
int references(Session& session, const Command& command);
int reference_names(Session& session, const Command& command);

} // namespace mpcactl

#endif // MPCACTL_COMMANDS_H
