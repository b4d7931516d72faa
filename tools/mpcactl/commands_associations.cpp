// Commands that walk associations.
#include "tools/mpcactl/commands.h"

namespace mpcactl {

namespace {

host::Association_Filter filter(const Session& session, const Command& command) {
    if (!command.via.empty())
        session.known_association(command.via);
    if (!command.result_class.empty())
        session.known_class(command.result_class);
    return {command.via, command.result_class, command.role, command.result_role};
}

// The classes that results may be of: the one named and what is below it, else all.
std::vector<const host::Class*> result_classes(const Session& session, const std::string& name,
                                               bool associations) {
    const host::Class* base = name.empty() ? nullptr : &session.known_class(name);
    std::vector<const host::Class*> classes;
    for (const auto& known : session.classes().classes())
        if ((!base || known->is_a(base)) && (!associations || known->is_association))
            classes.push_back(known.get());
    return classes;
}

} // namespace

int associators(Session& session, const Command& command) {
    const host::Property_List list = properties(
        command, result_classes(session, command.result_class, false),
        command.result_class.empty() ? "no class has a" : command.result_class + " has no");
    print_instances(
        print_context(session, command),
        take(session.manager().associators(session.path(command), filter(session, command), list)));
    return EXIT_FINE;
}

int associator_names(Session& session, const Command& command) {
    print_paths(
        print_context(session, command),
        take(session.manager().associator_names(session.path(command), filter(session, command))));
    return EXIT_FINE;
}

int references(Session& session, const Command& command) {
    const host::Property_List list =
        properties(command, result_classes(session, command.via, true),
                   command.via.empty() ? "no association has a" : command.via + " has no");
    print_instances(
        print_context(session, command),
        take(session.manager().references(session.path(command), filter(session, command), list)));
    return EXIT_FINE;
}

int reference_names(Session& session, const Command& command) {
    print_paths(
        print_context(session, command),
        take(session.manager().reference_names(session.path(command), filter(session, command))));
    return EXIT_FINE;
}

} // namespace mpcactl
