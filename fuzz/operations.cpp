#include "fuzz/operations.h"

#include "host/operations.h"
#include "host/request.h"
#include "simulator/vlnsim.h"

namespace fuzz {

using host::Answer;
using host::Named_Value;
using host::ObjectPath;
using host::Request;

namespace {

constexpr std::uint64_t SECOND = 1000000; // microseconds

enum Kind : unsigned {
    ENUMERATE,
    NAMES,
    GET,
    CREATE,
    MODIFY,
    DELETE,
    ASSOCIATORS,
    ASSOCIATOR_NAMES,
    REFERENCES,
    REFERENCE_NAMES,
    INVOKE,
    INVOKE_TOO,
    CHANGE,
    CHANGE_TOO,
    TIME,
    KINDS
};

constexpr const char* WORDS[] = {"enumerate",  "names",          "get",         "create",
                                 "modify",     "delete",         "associators", "associator names",
                                 "references", "reference names"};

} // namespace

void Operations::make(Input& input, unsigned count) {
    _refreshed = false;
    for (unsigned i = 0; i < count && !input.empty(); ++i)
        make_one(input);
}

void Operations::make_one(Input& input) {
    switch (const unsigned kind = input.byte() % KINDS) {
    case ENUMERATE:
    case NAMES:
    case GET:
    case DELETE:
        return ask_instances(input, kind);
    case CREATE:
    case MODIFY:
        return modify(input, kind == CREATE);
    case ASSOCIATORS:
    case ASSOCIATOR_NAMES:
    case REFERENCES:
    case REFERENCE_NAMES:
        return ask_associations(input, kind);
    case INVOKE:
    case INVOKE_TOO:
        return invoke(input);
    case CHANGE:
    case CHANGE_TOO:
        return make_change(input);
    default:
        break;
    }
    const unsigned choice = input.byte();
    if (choice >= 32 || _refreshed)
        return vlnsim_advance(choice * SECOND);
    _refreshed = true;
    say("refresh", "");
    _host.outdate();
    _host.settle();
}

void Operations::ask_instances(Input& input, unsigned kind) {
    const Stocked_Class& stocked = any_class(input);
    const host::Class& known = *stocked.known;
    say(WORDS[kind], known.name);
    const bool whole = kind == ENUMERATE || kind == NAMES;
    const ObjectPath path =
        whole ? ObjectPath{"root/vorlan", known.name, {}} : any_path(input, stocked);
    if (kind == DELETE)
        return remove(path);
    host::Status status;
    CMPIInstanceMI* const mi = _host.core().module.instance(_host.core(), known, status);
    if (!mi)
        return;
    const host::Property_List properties = any_properties(input, known);
    Request request(_host.core(), known, "fuzzed question", path.name_space);
    CMPIContext* const context = request.context();
    CMPIResult* const result =
        request.result(kind == NAMES ? Answer::paths : Answer::instances, &known);
    CMPIObjectPath* const object = request.path(path);
    const char** const names = request.property_list(properties);
    request.finish(kind == ENUMERATE
                       ? mi->ft->enumerateInstances(mi, context, result, object, names)
                   : kind == NAMES ? mi->ft->enumerateInstanceNames(mi, context, result, object)
                                   : mi->ft->getInstance(mi, context, result, object, names));
}

void Operations::ask_associations(Input& input, unsigned kind) {
    const host::Class& via =
        *_associations[input.below(static_cast<std::uint32_t>(_associations.size()))];
    // Mostly an end of an association that the host has.
    const std::vector<host::Instance>* const have = _host.stock_of(via.name);
    ObjectPath path;
    const unsigned choice = input.byte();
    if (choice < 160 && have && !have->empty()) {
        const host::Instance& one = (*have)[input.byte() % have->size()];
        for (const Named_Value& key : one.path.keys)
            if (const ObjectPath* end = key.value.as_reference())
                if (path.class_name.empty() || input.byte() % 2)
                    path = *end;
    }
    if (path.class_name.empty())
        path = any_path(input, any_class(input));
    host::Status status;
    CMPIAssociationMI* const mi = _host.core().module.association(_host.core(), via, status);
    if (!mi)
        return;
    say(WORDS[kind], via.name + " of " + host::path_to_text(path, ""));
    const unsigned filters = input.byte();
    const std::string result_class = filters & 1 ? any_class(input).known->name : "";
    std::string role, result_role;
    if (filters & 2)
        role = input.byte() < 192 ? via.properties[input.byte() % via.properties.size()].name
                                  : any_text(input);
    if (filters & 4)
        result_role = via.properties[input.byte() % via.properties.size()].name;
    const std::string by_class = filters & 8 ? via.name : filters & 16 ? result_class : "";
    const host::Property_List properties = any_properties(input, via);
    const auto text = [](const std::string& given) {
        return given.empty() ? nullptr : given.c_str();
    };
    Request request(_host.core(), via, "fuzzed walk", path.name_space);
    CMPIContext* const context = request.context();
    const bool names = kind == ASSOCIATOR_NAMES || kind == REFERENCE_NAMES;
    CMPIResult* const result = request.result(names ? Answer::paths : Answer::instances, nullptr);
    CMPIObjectPath* const object = request.path(path);
    const char** const list = request.property_list(properties);
    request.finish(
        kind == ASSOCIATORS
            ? mi->ft->associators(mi, context, result, object, text(by_class), text(result_class),
                                  text(role), text(result_role), list)
        : kind == ASSOCIATOR_NAMES
            ? mi->ft->associatorNames(mi, context, result, object, text(by_class),
                                      text(result_class), text(role), text(result_role))
        : kind == REFERENCES
            ? mi->ft->references(mi, context, result, object, text(by_class), text(role), list)
            : mi->ft->referenceNames(mi, context, result, object, text(by_class), text(role)));
}

void Operations::modify(Input& input, bool is_new) {
    const Stocked_Class& stocked = any_class(input);
    const host::Class& known = *stocked.known;
    host::Instance instance;
    if (!stocked.instances.empty())
        instance = stocked.instances[input.byte() % stocked.instances.size()];
    if (stocked.instances.empty() || input.byte() >= 192)
        instance.path = any_path(input, stocked);
    host::Named_Values values;
    for (unsigned count = input.byte() % 4; count > 0; --count) {
        const host::Property& property = known.properties[input.byte() % known.properties.size()];
        host::set(values, property.name, any_value(input, property, property.name));
    }
    std::vector<std::string> names;
    for (const Named_Value& named : values) {
        host::set(instance.properties, named.name, named.value);
        names.push_back(named.name);
    }
    if (is_new)
        create(instance);
    else
        modify(instance,
               input.byte() < 192 ? host::Property_List(names) : any_properties(input, known));
}

void Operations::invoke(Input& input) {
    const Method& called = _methods[input.below(static_cast<std::uint32_t>(_methods.size()))];
    ObjectPath path{"root/vorlan", called.known->name, {}};
    for (const Stocked_Class& stocked : _host.stock())
        if (stocked.known == called.known)
            path = any_path(input, stocked);
    host::Named_Values inputs;
    for (const host::Parameter& parameter : called.method->parameters)
        if (const unsigned choice = input.byte(); choice < 200 && parameter.in)
            inputs.push_back({parameter.name, any_value(input, parameter, parameter.name)});
    const bool odd_name = input.byte() == 255;
    invoke(path, odd_name ? any_text(input) : called.method->name, inputs);
}

// A call that succeeds, with some of it changed.
void Operations::make_change(Input& input) {
    if (_changes.empty())
        return;
    Change change = _changes[input.byte() % _changes.size()];
    const host::Class* const known = _host.core().classes.find(change.instance.class_name());
    const host::Method* const method = known->find_method(change.method);
    for (unsigned count = input.byte() % 4; count > 0; --count)
        spoil(input, change.values, known, method);
    if (input.byte() >= 224)
        for (const Stocked_Class& stocked : _host.stock())
            if (stocked.known == known)
                change.instance.path = any_path(input, stocked);
    if (change.kind == '.')
        return invoke(change.instance.path, change.method, change.values);
    if (change.kind == '-')
        return remove(change.instance.path);
    std::vector<std::string> names;
    for (const Named_Value& value : change.values) {
        host::set(change.instance.properties, value.name, value.value);
        names.push_back(value.name);
    }
    if (change.kind == '+')
        create(change.instance);
    else
        modify(change.instance, names);
}

void Operations::spoil(Input& input, host::Named_Values& values, const host::Class* known,
                       const host::Method* method) {
    const auto spoil_as = [&](const host::Slot_Type& slot, const std::string& name) {
        host::set(values, name, any_value(input, slot, name));
    };
    const unsigned choice = input.byte();
    if (choice >= 224 && !values.empty()) {
        values.erase(values.begin() + input.byte() % static_cast<std::ptrdiff_t>(values.size()));
    } else if (method && !method->parameters.empty()) {
        const host::Parameter& parameter = method->parameters[choice % method->parameters.size()];
        spoil_as(parameter, parameter.name);
    } else if (!method && !known->properties.empty()) {
        const host::Property& property = known->properties[choice % known->properties.size()];
        spoil_as(property, property.name);
    }
}

// ---- The entry points that change something ----

void Operations::invoke(const ObjectPath& path, const std::string& method,
                        const host::Named_Values& inputs) {
    say("invoke", host::path_to_text(path, "") + " " + method);
    const host::Class* const known = _host.core().classes.find(path.class_name);
    host::Status status;
    CMPIMethodMI* const mi =
        known ? _host.core().module.method(_host.core(), *known, status) : nullptr;
    if (!mi)
        return;
    const host::Method* const called = known->find_method(method);
    Request request(_host.core(), *known, "fuzzed method", path.name_space);
    CMPIContext* const context = request.context();
    CMPIResult* const result =
        request.result(Answer::data, nullptr, called ? &called->result : nullptr);
    CMPIObjectPath* const object = request.path(path);
    CMPIArgs* const in = request.args(inputs);
    CMPIArgs* const out = request.args({}, called);
    request.finish(mi->ft->invokeMethod(mi, context, result, object, method.c_str(), in, out));
}

namespace {

const host::Class* served(host::Core& core, const ObjectPath& path) {
    const host::Class* const known = core.classes.find(path.class_name);
    return known && core.module.serves(*known) ? known : nullptr;
}

} // namespace

void Operations::modify(const host::Instance& instance, const host::Property_List& properties) {
    say("modify", host::path_to_text(instance.path, ""));
    if (const host::Class* known = served(_host.core(), instance.path))
        host::modify(_host.core(), {known, instance.path.name_space}, instance, properties);
}

void Operations::create(const host::Instance& instance) {
    say("create", host::path_to_text(instance.path, ""));
    if (const host::Class* known = served(_host.core(), instance.path))
        host::create(_host.core(), {known, instance.path.name_space}, instance);
}

void Operations::remove(const ObjectPath& path) {
    say("delete", host::path_to_text(path, ""));
    if (const host::Class* known = served(_host.core(), path))
        host::remove(_host.core(), {known, path.name_space}, path);
}

void Operations::say(const char* what, const std::string& where) const {
    if (_loud)
        std::fprintf(stderr, "%s %s\n", what, where.c_str());
}

} // namespace fuzz
