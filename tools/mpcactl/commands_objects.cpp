// Commands about one object.
#include "tools/mpcactl/commands.h"

#include "tools/mpcactl/assignment.h"

namespace mpcactl {

int get(Session& session, const Command& command) {
    const host::ObjectPath path = session.path(command);
    const host::Class& known = session.known_class(path.class_name);
    print_instance(
        print_context(session, command),
        take(session.manager().get(path, properties(command, {&known}, known.name + " has no"))));
    return EXIT_FINE;
}

int create(Session& session, const Command& command) {
    const host::Class& known = session.known_class(command.class_name);
    host::Instance instance;
    instance.path = {command.name_space, known.name, {}};
    instance.properties =
        read_properties(session.classes(), known, command.assignments, command.name_space);
    for (std::size_t index : known.keys) {
        const std::string& key = known.properties[index].name;
        if (const host::Value* value = instance.property(key); value && !value->is_null())
            instance.path.keys.push_back({key, *value});
    }
    print_path(print_context(session, command), take(session.manager().create(instance)));
    return EXIT_FINE;
}

int modify(Session& session, const Command& command) {
    host::Instance instance;
    instance.path = session.path(command);
    const host::Class& known = session.known_class(instance.path.class_name);
    host::Named_Values changes =
        read_properties(session.classes(), known, command.assignments, command.name_space);
    if (changes.empty())
        throw Usage_Error("modify needs at least one NAME=VALUE");
    instance.properties = instance.path.keys;
    host::Property_List names(std::in_place);
    for (host::Named_Value& change : changes) {
        if (known.find_property(change.name)->key)
            throw Usage_Error("the key " + change.name + " cannot be changed");
        names->push_back(change.name);
        instance.properties.push_back(std::move(change));
    }
    check(session.manager().modify(instance, names));
    return EXIT_FINE;
}

int remove(Session& session, const Command& command) {
    check(session.manager().remove(session.path(command)));
    return EXIT_FINE;
}

namespace {

bool is_zero(const host::Value& value) {
    return (host::is_unsigned(value.type) || host::is_signed(value.type)) && !value.is_null() &&
           value.as_unsigned() == 0 && value.as_signed() == 0;
}

} // namespace

int invoke(Session& session, const Command& command) {
    const host::ObjectPath path = session.path(command);
    const host::Method& method =
        session.known_method(session.known_class(path.class_name), command.method);
    const host::Named_Values inputs =
        read_inputs(session.classes(), method, command.assignments, command.name_space);
    const host::Method_Result result = take(session.manager().invoke(path, method.name, inputs));
    const Print_Context context = print_context(session, command);
    print_method_result(context, method, result);
    if (!command.check || is_zero(result.value))
        return EXIT_FINE;
    std::fflush(stdout);
    std::fprintf(stderr, "mpcactl: %s returned %s\n", method.name.c_str(),
                 to_cell(context, &method.result, result.value).c_str());
    return EXIT_CIM;
}

} // namespace mpcactl
