#include "tools/mpcactl/assignment.h"

#include "tools/mpcactl/failure.h"
#include "tools/mpcactl/list_text.h"

#include "host/scalar_text.h"
#include "host/value_json.h"

#include <filesystem>
#include <fstream>

namespace mpcactl {

namespace {

struct Context {
    const host::ClassRepository& classes;
    const std::string& name_space;
};

// Values are walked by calls of one another, so their depth is bounded before they are read.
host::Json parse_json(const std::string& text) {
    constexpr int deepest = 64;
    int depth = 0;
    bool quoted = false;
    for (std::size_t i = 0; i < text.size() && depth <= deepest; ++i) {
        if (quoted && text[i] == '\\')
            ++i;
        else if (text[i] == '"')
            quoted = !quoted;
        else if (!quoted)
            depth += text[i] == '[' || text[i] == '{'   ? 1
                     : text[i] == ']' || text[i] == '}' ? -1
                                                        : 0;
    }
    if (depth > deepest)
        throw Usage_Error("is nested too deeply");
    host::Json json = host::Json::parse(text, nullptr, false);
    if (json.is_discarded())
        throw Usage_Error("is not JSON: " + shown(text));
    return json;
}

// JSON that a text stands for: itself where JSON is expected, else a text or a plain scalar.
host::Json to_json(const host::Slot_Type& slot, CMPIType type, const std::string& text) {
    if (slot.embedded && text.starts_with('{'))
        return parse_json(text);
    if (slot.embedded || type == CMPI_ref)
        return text;
    std::string error;
    const host::Value value = host::scalar_from_text(type, text, error);
    if (!error.empty())
        throw Usage_Error(error);
    return host::to_json(value, "");
}

host::Json array_to_json(const host::Slot_Type& slot, CMPIType type, const std::string& text) {
    const bool objects = slot.embedded && text.starts_with('{');
    if (text.starts_with('[') || objects)
        return parse_json(objects ? "[" + text + "]" : text);
    host::Json array = host::Json::array();
    for (const std::string& element : split_list(text))
        array.push_back(to_json(slot, type, element));
    return array;
}

// The bytes of a file as an array of numbers.
host::Value read_bytes(const std::string& path) {
    constexpr std::uintmax_t most = 16u << 20; // an element takes some fifty bytes
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    std::ifstream file(path, std::ios::binary);
    if (error || !file)
        throw Usage_Error("the file " + path + " cannot be read");
    if (size > most)
        throw Usage_Error("the file " + path + " has " + std::to_string(size) +
                          " bytes, more than " + std::to_string(most));
    host::Value::Array elements;
    elements.reserve(static_cast<std::size_t>(size));
    for (char c = 0; file.get(c) && elements.size() <= most;)
        elements.push_back(host::Value::unsigned_number(CMPI_uint8, static_cast<unsigned char>(c)));
    return host::Value::array(CMPI_uint8, std::move(elements));
}

host::Value read_value(const Context& context, const host::Slot_Type& slot, const std::string& name,
                       const std::string& text) {
    const auto element = static_cast<CMPIType>(slot.type & ~CMPI_ARRAY);
    try {
        if (slot.type == CMPI_uint8A && text.starts_with('@'))
            return read_bytes(text.substr(1));
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
            return known.name + " has no property " + shown(name) +
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
            return method.name + " has no input " + shown(name) + host::did_you_mean(name, inputs) +
                   (inputs.empty() ? "" : "\nIts inputs: " + host::join_or(inputs));
        });
}

} // namespace mpcactl
