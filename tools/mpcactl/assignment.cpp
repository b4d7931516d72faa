#include "tools/mpcactl/assignment.h"

#include "tools/mpcactl/failure.h"

#include "host/scalar_text.h"
#include "host/value_json.h"

namespace mpcactl {

namespace {

struct Context {
    const host::ClassRepository& classes;
    const std::string& name_space;
};

// JSON that a text stands for: itself where JSON is expected, else a text or a plain scalar.
host::Json to_json(const host::Slot_Type& slot, CMPIType type, const std::string& text) {
    if (slot.embedded && !text.empty() && text.front() == '{') {
        host::Json json = host::Json::parse(text, nullptr, false);
        if (json.is_discarded())
            throw Usage_Error("is not JSON: " + text);
        return json;
    }
    if (slot.embedded || type == CMPI_ref)
        return text;
    std::string error;
    const host::Value value = host::scalar_from_text(type, text, error);
    if (!error.empty())
        throw Usage_Error(error);
    return host::to_json(value, "");
}

host::Json array_to_json(const host::Slot_Type& slot, CMPIType type, const std::string& text) {
    if (!text.empty() && text.front() == '[') {
        host::Json json = host::Json::parse(text, nullptr, false);
        if (json.is_discarded())
            throw Usage_Error("is not JSON: " + text);
        return json;
    }
    host::Json array = host::Json::array();
    for (std::size_t start = 0; !text.empty() && start <= text.size();) {
        const std::size_t comma = std::min(text.find(',', start), text.size());
        array.push_back(to_json(slot, type, text.substr(start, comma - start)));
        start = comma + 1;
    }
    return array;
}

host::Value read_value(const Context& context, const host::Slot_Type& slot, const std::string& name,
                       const std::string& text) {
    const auto element = static_cast<CMPIType>(slot.type & ~CMPI_ARRAY);
    try {
        const host::Json json = (slot.type & CMPI_ARRAY) != 0 ? array_to_json(slot, element, text)
                                                              : to_json(slot, element, text);
        return host::value_from_json(context.classes, slot, json, context.name_space);
    } catch (const Usage_Error& wrong) {
        throw Usage_Error(name + ": " + wrong.what());
    } catch (const host::Json_Complaint& wrong) {
        throw Usage_Error(name + (wrong.path.empty() ? "" : "/" + wrong.path) + ": " + wrong.text);
    }
}

// declared is the property or parameter of the name, or null; unknown_text says what there is
// instead.
template <class Find, class Unknown>
host::Named_Values read_all(const Context& context, const std::vector<std::string>& assignments,
                            Find declared, Unknown unknown_text) {
    host::Named_Values values;
    for (const std::string& given : assignments) {
        const std::size_t equals = given.find('=');
        const std::string name = given.substr(0, equals);
        const auto* slot = declared(name);
        if (!slot)
            throw Usage_Error(unknown_text(name));
        if (host::find(values, name))
            throw Usage_Error(name + " is given twice");
        host::Value value = equals == std::string::npos
                                ? host::Value::null(slot->type)
                                : read_value(context, *slot, name, given.substr(equals + 1));
        values.push_back({slot->name, std::move(value)});
    }
    return values;
}

} // namespace

host::Named_Values read_properties(const host::ClassRepository& classes, const host::Class& known,
                                   const std::vector<std::string>& assignments,
                                   const std::string& name_space) {
    return read_all(
        {classes, name_space}, assignments,
        [&](const std::string& name) { return known.find_property(name); },
        [&](const std::string& name) {
            return known.name + " has no property " + name +
                   host::did_you_mean(name, known.property_names());
        });
}

host::Named_Values read_inputs(const host::ClassRepository& classes, const host::Method& method,
                               const std::vector<std::string>& assignments,
                               const std::string& name_space) {
    std::vector<std::string> inputs;
    for (const host::Parameter& parameter : method.parameters)
        if (parameter.in)
            inputs.push_back(parameter.name);
    return read_all(
        {classes, name_space}, assignments,
        [&](const std::string& name) {
            const host::Parameter* parameter = method.find(name);
            return parameter && parameter->in ? parameter : nullptr;
        },
        [&](const std::string& name) {
            return method.name + " has no input " + name + host::did_you_mean(name, inputs) +
                   (inputs.empty() ? "" : "\nIts inputs: " + host::join_or(inputs));
        });
}

} // namespace mpcactl
