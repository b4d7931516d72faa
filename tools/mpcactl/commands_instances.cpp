// Commands about all instances of a class.
#include "tools/mpcactl/commands.h"

#include "host/value_json.h"

#include <cstdio>

namespace mpcactl {

namespace {

// Those that are asked for the instances of a class: as an object manager asks, the provider of the
// class and of each of its subclasses. A class that nothing serves may have some on the platform.
std::vector<const host::Class*> asked_for(Session& session, const host::Class& known,
                                          const std::string& name_space) {
    std::vector<const host::Class*> asked;
    for (const auto& each : session.classes().classes())
        if (each->is_a(&known) &&
            (each.get() == &known || session.manager().serves(*each, name_space)))
            asked.push_back(each.get());
    return asked;
}

// The answers of all that are asked, also after one has failed; the first failure is told behind
// them. A base class that nothing serves need not have any of its own.
template <class Item, class Ask, class Print>
void ask_all(Session& session, const std::vector<const host::Class*>& asked,
             const std::string& name_space, Ask ask, Print print) {
    std::vector<Item> items;
    host::Status failure;
    for (const host::Class* each : asked) {
        host::Reply<std::vector<Item>> reply = ask(*each);
        std::move(reply.value.begin(), reply.value.end(), std::back_inserter(items));
        const bool expected = asked.size() > 1 && !session.manager().serves(*each, name_space);
        if (!reply.ok() && !expected && failure.ok()) {
            failure = reply.status;
            if (asked.size() > 1)
                failure.message =
                    each->name + ": " +
                    (failure.message.empty() ? host::rc_sentence(failure.rc) : failure.message);
        }
    }
    if (failure.ok() || !items.empty())
        print(items);
    check(failure);
}

} // namespace

int enumerate(Session& session, const Command& command) {
    const host::Class& known = session.known_class(command.class_name);
    const auto asked = asked_for(session, known, command.name_space);
    const host::Property_List list = properties(command, asked, known.name + " has no");
    ask_all<host::Instance>(
        session, asked, command.name_space,
        [&](const host::Class& each) {
            return session.manager().enumerate(each.name, list, command.name_space);
        },
        [&](const std::vector<host::Instance>& instances) {
            print_instances(print_context(session, command), instances);
        });
    return EXIT_FINE;
}

int list_names(Session& session, const Command& command) {
    const host::Class& known = session.known_class(command.class_name);
    ask_all<host::ObjectPath>(
        session, asked_for(session, known, command.name_space), command.name_space,
        [&](const host::Class& each) {
            return session.manager().enumerate_names(each.name, command.name_space);
        },
        [&](const std::vector<host::ObjectPath>& paths) {
            print_paths(print_context(session, command), paths);
        });
    return EXIT_FINE;
}

// Every class is asked, also after one has failed.
int census(Session& session, const Command& command) {
    int status = EXIT_FINE;
    host::Json counts = host::Json::object();
    for (const host::Class* known : session.manager().provider_classes()) {
        if (!session.manager().serves(*known, command.name_space))
            continue;
        const auto reply =
            session.manager().enumerate(known->name, std::nullopt, command.name_space);
        if (!reply.ok()) {
            std::fflush(stdout);
            std::fprintf(stderr, "mpcactl: %s: %s\n", known->name.c_str(),
                         Cim_Error(reply.status).what());
            status = EXIT_CIM;
        } else if (command.format == Format::json) {
            counts[known->name] = reply.value.size();
        } else {
            std::printf("%s\t%zu\n", known->name.c_str(), reply.value.size());
        }
    }
    if (command.format == Format::json)
        std::printf("%s\n", counts.dump(2).c_str());
    return status;
}

} // namespace mpcactl
