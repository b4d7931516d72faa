#include "host/value_check.h"

#include "host/datetime.h"
#include "host/scalar_text.h"

namespace host {

namespace {

std::string expected(CMPIType declared, CMPIType got) {
    return type_name(declared) + " expected, got " + type_name(got);
}

Complaint check_class(const ClassRepository& classes, const std::string& name,
                      const Class* target) {
    const Class* known = classes.find(name);
    if (!known)
        return "class " + name + " is unknown";
    if (target && !known->is_a(target))
        return "class " + known->name + " is no " + target->name;
    return std::nullopt;
}

// The contents of a non-null scalar whose type is right already.
Complaint check_contents(const ClassRepository& classes, const Slot_Type& slot,
                         const Value& value) {
    if (const ObjectPath* path = value.as_reference())
        return check_class(classes, path->class_name, slot.target);
    if (const Instance* instance = value.as_instance())
        return check_class(classes, instance->class_name(), slot.target);
    if (value.type == CMPI_dateTime && !parse_datetime(value.as_text()))
        return "\"" + cut(value.as_text()) + "\" is no datetime";
    return std::nullopt;
}

Complaint check_scalar(const ClassRepository& classes, const Slot_Type& slot, CMPIType declared,
                       Value& value) {
    if (value.is_null()) {
        value.type = declared;
        return std::nullopt;
    }
    const bool embedded = slot.embedded && value.type == CMPI_instance;
    if (value.type != declared && !embedded)
        return expected(slot.embedded ? CMPI_instance : declared, value.type);
    return check_contents(classes, slot, value);
}

} // namespace

Complaint check_value(const ClassRepository& classes, const Slot_Type& slot, Value& value) {
    const bool array = (slot.type & CMPI_ARRAY) != 0;
    const auto declared = static_cast<CMPIType>(slot.type & ~CMPI_ARRAY);
    if (value.is_null()) {
        const bool any = value.type == CMPI_null || value.type == slot.type ||
                         (slot.embedded && value.element_type() == CMPI_instance);
        if (!any)
            return expected(slot.type, value.type);
        value.type = slot.type;
        return std::nullopt;
    }
    if (array != value.is_array())
        return expected(slot.type, value.type);
    if (!array)
        return check_scalar(classes, slot, declared, value);
    if (value.element_type() != declared &&
        !(slot.embedded && value.element_type() == CMPI_instance))
        return expected(slot.type, value.type);
    std::size_t index = 0;
    for (Value& element : std::get<Value::Array>(value.data)) {
        if (Complaint wrong = check_scalar(classes, slot, value.element_type(), element))
            return "element " + std::to_string(index) + ": " + *wrong;
        ++index;
    }
    return std::nullopt;
}

Complaint check_key(const ClassRepository& classes, const Property& property, Value& value) {
    if (value.is_null())
        return "a key cannot be null";
    const bool integers = (is_unsigned(value.type) || is_signed(value.type)) &&
                          (is_unsigned(property.type) || is_signed(property.type));
    if (integers && value.type != property.type) {
        const bool wide = value.type == CMPI_uint64 || value.type == CMPI_sint64;
        const auto* negative = std::get_if<std::int64_t>(&value.data);
        const bool fits = negative ? fits_signed(property.type, *negative)
                                   : fits_unsigned(property.type, value.as_unsigned());
        if (!wide || !fits)
            return expected(property.type, value.type) + (wide ? " that does not fit" : "");
        if (is_unsigned(property.type))
            value = Value::unsigned_number(property.type, value.as_unsigned());
        else
            value = Value::signed_number(property.type, value.as_signed());
        return std::nullopt;
    }
    return check_value(classes, property, value);
}

Complaint check_path(const ClassRepository& classes, ObjectPath& path) {
    const Class* known = classes.find(path.class_name);
    if (!known)
        return "class " + path.class_name + " is unknown";
    path.class_name = known->name;
    for (const Named_Value& key : path.keys) {
        const Property* property = known->find_property(key.name);
        if (!property || !property->key)
            return known->name + " has no key " + key.name;
    }
    Named_Values ordered;
    for (std::size_t index : known->keys) {
        const Property& property = known->properties[index];
        const Value* value = path.key(property.name);
        if (!value || value->is_null())
            return "the key " + property.name + " of " + known->name + " is missing";
        Value fitted = *value;
        if (Complaint wrong = check_key(classes, property, fitted))
            return known->name + "." + property.name + ": " + *wrong;
        if (const ObjectPath* inner = fitted.as_reference()) {
            ObjectPath checked = *inner;
            if (Complaint wrong = check_path(classes, checked))
                return known->name + "." + property.name + ": " + *wrong;
            fitted = Value::reference(std::move(checked));
        }
        ordered.push_back({property.name, std::move(fitted)});
    }
    path.keys = std::move(ordered);
    return std::nullopt;
}

} // namespace host
