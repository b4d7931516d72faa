#include "host/value_json.h"

#include "host/path_text.h"
#include "host/scalar_text.h"
#include "host/value_check.h"

#include <cmath>
#include <cstdlib>

namespace host {

namespace {

Json real_to_json(const Value& value) {
    if (!std::isfinite(value.as_real()))
        return number_to_text(value); // JSON has no such number
    // Through the shortest text, so that a real32 does not show the digits of its real64 form.
    return std::strtod(number_to_text(value).c_str(), nullptr);
}

Json properties_to_json(const Instance& instance) {
    Json properties = Json::object();
    for (const Named_Value& named : instance.properties)
        properties[named.name] = to_json(named.value, instance.path.name_space);
    return properties;
}

[[noreturn]] void refuse(const std::string& path, const std::string& text) {
    throw Json_Complaint{path, text};
}

std::string below(const std::string& outer, const std::string& inner) {
    return inner.empty() ? outer : outer + "/" + inner;
}

Value embedded_from_json(const ClassRepository& classes, const Slot_Type& slot, const Json& json,
                         std::string_view name_space) {
    if (json.is_string())
        return Value::text(json.get<std::string>());
    if (!json.is_object() || !json.contains("class") || !json["class"].is_string())
        refuse("", "an embedded object is {\"class\": ..., \"properties\": {...}}");
    for (const auto& [name, part] : json.items())
        if (name != "class" && name != "properties")
            refuse(name, "unknown; known are class and properties");
    Instance instance;
    instance.path.name_space = name_space;
    const Class* known = classes.find(json["class"].get<std::string>());
    if (!known)
        refuse("class", "unknown class " + json["class"].get<std::string>() +
                            did_you_mean(json["class"].get<std::string>(), classes.names()));
    instance.path.class_name = known->name;
    if (json.contains("properties")) {
        try {
            instance.properties =
                properties_from_json(classes, *known, json["properties"], name_space);
        } catch (const Json_Complaint& inner) {
            refuse(below("properties", inner.path), inner.text);
        }
    }
    Value value = Value::instance(std::move(instance));
    if (Complaint wrong = check_value(classes, slot, value))
        refuse("", *wrong);
    return value;
}

Value number_from_json(CMPIType type, const Json& json) {
    if (is_real(type) && json.is_number())
        return Value::real(type, type == CMPI_real32 ? static_cast<double>(json.get<float>())
                                                     : json.get<double>());
    if (json.is_number_unsigned() && fits_unsigned(type, json.get<std::uint64_t>())) {
        if (is_signed(type))
            return Value::signed_number(type, json.get<std::int64_t>());
        return Value::unsigned_number(type, json.get<std::uint64_t>());
    }
    if (json.is_number_integer() && !json.is_number_unsigned() &&
        fits_signed(type, json.get<std::int64_t>()))
        return Value::signed_number(type, json.get<std::int64_t>());
    refuse("",
           json.dump(-1, ' ', false, Json::error_handler_t::replace) + " is no " + type_name(type));
}

Value scalar_from_json(const ClassRepository& classes, const Slot_Type& slot, CMPIType type,
                       const Json& json, std::string_view name_space) {
    if (json.is_null())
        return Value::null(type);
    if (slot.embedded)
        return embedded_from_json(classes, slot, json, name_space);
    switch (type) {
    case CMPI_boolean:
        if (!json.is_boolean())
            refuse("", "true or false expected");
        return Value::boolean(json.get<bool>());
    case CMPI_string:
    case CMPI_dateTime:
    case CMPI_ref:
        break;
    default:
        return number_from_json(type, json);
    }
    if (!json.is_string())
        refuse("", "a text in quotes expected for a " + type_name(type));
    const std::string text = json.get<std::string>();
    std::string error;
    Value value;
    if (type == CMPI_ref) {
        Parsed_Path parsed = parse_path(classes, text, name_space);
        error = parsed.error;
        value = Value::reference(std::move(parsed.path));
        if (error.empty())
            error = check_value(classes, Slot_Type{type, false, slot.target}, value).value_or("");
    } else {
        value = scalar_from_text(type, text, error);
    }
    if (!error.empty())
        refuse("", error);
    return value;
}

} // namespace

Json to_json(const Value& value, std::string_view surroundings) {
    if (value.is_null())
        return nullptr;
    if (value.is_array()) {
        Json array = Json::array();
        for (const Value& element : value.as_array())
            array.push_back(to_json(element, surroundings));
        return array;
    }
    if (const ObjectPath* path = value.as_reference())
        return path_to_text(*path, surroundings);
    if (const Instance* instance = value.as_instance())
        return {{"class", instance->class_name()}, {"properties", properties_to_json(*instance)}};
    if (value.type == CMPI_boolean)
        return value.as_boolean();
    if (is_real(value.type))
        return real_to_json(value);
    if (const auto* number = std::get_if<std::uint64_t>(&value.data))
        return *number;
    if (const auto* number = std::get_if<std::int64_t>(&value.data))
        return *number;
    return value.as_text();
}

Json to_json(const Instance& instance, std::string_view surroundings) {
    return {{"class", instance.class_name()},
            {"namespace", instance.path.name_space},
            {"path", path_to_text(instance.path, surroundings)},
            {"properties", properties_to_json(instance)}};
}

Value value_from_json(const ClassRepository& classes, const Slot_Type& slot, const Json& json,
                      std::string_view name_space) {
    const auto element_type = static_cast<CMPIType>(slot.type & ~CMPI_ARRAY);
    if (json.is_null())
        return Value::null(slot.type);
    if ((slot.type & CMPI_ARRAY) == 0)
        return scalar_from_json(classes, slot, element_type, json, name_space);
    if (!json.is_array())
        refuse("", "an array expected");
    Value::Array elements;
    CMPIType type = element_type;
    for (const Json& element : json) {
        try {
            elements.push_back(scalar_from_json(classes, slot, element_type, element, name_space));
        } catch (const Json_Complaint& inner) {
            refuse(below(std::to_string(elements.size()), inner.path), inner.text);
        }
        if (!elements.back().is_null())
            type = elements.back().type;
    }
    for (Value& element : elements)
        if (element.is_null())
            element.type = type;
    return Value::array(type, std::move(elements));
}

Named_Values properties_from_json(const ClassRepository& classes, const Class& known,
                                  const Json& json, std::string_view name_space) {
    if (!json.is_object())
        refuse("", "an object with the properties expected");
    Named_Values values;
    for (const auto& [name, part] : json.items()) {
        const Property* property = known.find_property(name);
        if (!property)
            refuse(name, known.name + " has no property " + name +
                             did_you_mean(name, known.property_names()));
        if (find(values, name))
            refuse(name, "the property is given twice");
        try {
            values.push_back(
                {property->name, value_from_json(classes, *property, part, name_space)});
        } catch (const Json_Complaint& inner) {
            refuse(below(name, inner.path), inner.text);
        }
    }
    return values;
}

} // namespace host
