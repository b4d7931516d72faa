#include "tools/mpcactl/commands.h"

#include "tools/mpcactl/assignment.h"
#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/print.h"

#include "host/value_json.h"

#include <cstdio>
#include <cstdlib>
#include <sys/ioctl.h>
#include <unistd.h>

namespace mpcactl {

namespace {

std::size_t terminal_width() {
    constexpr std::size_t otherwise = 160; // for a file or a pipe
    winsize size{};
    if (isatty(STDOUT_FILENO) && ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0)
        return size.ws_col;
    return otherwise;
}

Print_Context print_context(Session& session) {
    return {session.manager().classes(), session.settings.format, session.settings.name_space,
            session.settings.properties, terminal_width()};
}

// The value of a reply, or its error.
template <class T>
T take(host::Reply<T> reply) {
    if (!reply.ok())
        throw Cim_Error(reply.status);
    return std::move(reply.value);
}

void check(const host::Status& status) {
    if (!status.ok())
        throw Cim_Error(status);
}

int list_classes(Session& session) {
    host::Manager& manager = session.manager();
    host::Json list = host::Json::array();
    for (const auto& known : manager.classes().classes()) {
        const bool served = manager.serves(*known);
        if (!served && !session.settings.all)
            continue;
        if (session.settings.format == Format::table)
            std::printf("%s\n", known->name.c_str());
        else if (session.settings.format == Format::mof)
            std::printf("%s\n\n", known->text.c_str());
        host::Json keys = host::Json::array();
        for (std::size_t index : known->keys)
            keys.push_back(known->properties[index].name);
        list.push_back({{"name", known->name},
                        {"superclass", known->superclass ? host::Json(known->superclass->name)
                                                         : host::Json(nullptr)},
                        {"association", known->is_association},
                        {"served", served},
                        {"keys", keys}});
    }
    if (session.settings.format == Format::json)
        std::printf("%s\n", list.dump(2).c_str());
    return EXIT_FINE;
}

int enumerate(Session& session) {
    const host::Class& known = session.known_class(session.settings.class_name);
    print_instances(print_context(session),
                    take(session.manager().enumerate(known.name, session.properties(&known))));
    return EXIT_FINE;
}

int list_names(Session& session) {
    const host::Class& known = session.known_class(session.settings.class_name);
    print_paths(print_context(session), take(session.manager().enumerate_names(known.name)));
    return EXIT_FINE;
}

// Every class is asked, also after one has failed.
int census(Session& session) {
    int status = EXIT_FINE;
    host::Json counts = host::Json::object();
    for (const host::Class* known : session.manager().provider_classes()) {
        const auto reply = session.manager().enumerate(known->name);
        if (!reply.ok()) {
            std::fprintf(stderr, "mpcactl: %s: %s\n", known->name.c_str(),
                         Cim_Error(reply.status).what());
            status = EXIT_CIM;
        } else if (session.settings.format == Format::json) {
            counts[known->name] = reply.value.size();
        } else {
            std::printf("%s\t%zu\n", known->name.c_str(), reply.value.size());
        }
    }
    if (session.settings.format == Format::json)
        std::printf("%s\n", counts.dump(2).c_str());
    return status;
}

int get(Session& session) {
    const host::ObjectPath path = session.path();
    const host::Class& known = session.known_class(path.class_name);
    print_instance(print_context(session),
                   take(session.manager().get(path, session.properties(&known))));
    return EXIT_FINE;
}

int create(Session& session) {
    const host::Class& known = session.known_class(session.settings.class_name);
    const std::string& name_space = session.settings.name_space;
    host::Instance instance{{name_space, known.name, {}},
                            read_properties(session.manager().classes(), known,
                                            session.settings.assignments, name_space)};
    for (std::size_t index : known.keys) {
        const std::string& key = known.properties[index].name;
        if (const host::Value* value = instance.property(key); value && !value->is_null())
            instance.path.keys.push_back({key, *value});
    }
    print_path(print_context(session), take(session.manager().create(instance)));
    return EXIT_FINE;
}

int modify(Session& session) {
    const host::ObjectPath path = session.path();
    const host::Class& known = session.known_class(path.class_name);
    host::Named_Values changes =
        read_properties(session.manager().classes(), known, session.settings.assignments,
                        session.settings.name_space);
    if (changes.empty())
        throw Usage_Error("modify needs at least one NAME=VALUE");
    host::Property_List names(std::in_place);
    for (const host::Named_Value& change : changes) {
        if (known.find_property(change.name)->key)
            throw Usage_Error("the key " + change.name + " cannot be changed");
        names->push_back(change.name);
    }
    host::Instance instance{path, path.keys};
    for (host::Named_Value& change : changes)
        instance.properties.push_back(std::move(change));
    check(session.manager().modify(instance, names));
    return EXIT_FINE;
}

int remove(Session& session) {
    check(session.manager().remove(session.path()));
    return EXIT_FINE;
}

host::Association_Filter association_filter(Session& session) {
    const Settings& settings = session.settings;
    if (!settings.via.empty())
        session.known_association(settings.via);
    if (!settings.result_class.empty())
        session.known_class(settings.result_class);
    return {settings.via, settings.result_class, settings.role, settings.result_role};
}

int associators(Session& session) {
    print_instances(print_context(session),
                    take(session.manager().associators(session.path(), association_filter(session),
                                                       session.properties(nullptr))));
    return EXIT_FINE;
}

int associator_names(Session& session) {
    print_paths(print_context(session), take(session.manager().associator_names(
                                            session.path(), association_filter(session))));
    return EXIT_FINE;
}

int references(Session& session) {
    print_instances(print_context(session),
                    take(session.manager().references(session.path(), association_filter(session),
                                                      session.properties(nullptr))));
    return EXIT_FINE;
}

int reference_names(Session& session) {
    print_paths(print_context(session), take(session.manager().reference_names(
                                            session.path(), association_filter(session))));
    return EXIT_FINE;
}

int invoke(Session& session) {
    const host::ObjectPath path = session.path();
    const host::Method& method =
        session.known_method(session.known_class(path.class_name), session.settings.method);
    const host::Named_Values inputs =
        read_inputs(session.manager().classes(), method, session.settings.assignments,
                    session.settings.name_space);
    print_method_result(print_context(session),
                        take(session.manager().invoke(path, method.name, inputs)));
    return EXIT_FINE;
}

struct Command {
    const char* name;
    int (*run)(Session& session);
};

constexpr Command COMMANDS[] = {
    {"classes", list_classes},
    {"enum", enumerate},
    {"names", list_names},
    {"census", census},
    {"get", get},
    {"create", create},
    {"modify", modify},
    {"delete", remove},
    {"assoc", associators},
    {"assoc-names", associator_names},
    {"refs", references},
    {"ref-names", reference_names},
    {"invoke", invoke},
};

} // namespace

int run_command(Session& session) {
    for (const Command& command : COMMANDS)
        if (session.settings.command == command.name)
            return command.run(session);
    throw Usage_Error("unknown command " + session.settings.command);
}

} // namespace mpcactl
