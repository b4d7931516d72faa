#include "host/answer_size.h"

#include "host/scalar_text.h"

#include <algorithm>

namespace host {

namespace {

// Of a host's name as its object manager writes it.
constexpr std::size_t HOST_NAME = 24;

// The bytes of a template, in which each "%" stands for something that is counted apart.
constexpr std::size_t frame(std::string_view text) {
    return text.size() - static_cast<std::size_t>(std::count(text.begin(), text.end(), '%'));
}

std::size_t escaped(std::string_view text) {
    std::size_t size = text.size();
    for (const char c : text)
        size += c == '&' ? 4 : c == '<' || c == '>' ? 3 : c == '"' || c == '\'' ? 5 : 0;
    return size;
}

std::size_t path_size(const ObjectPath& path);

std::size_t scalar_size(const Value& value) {
    if (const ObjectPath* path = value.as_reference())
        return frame("<VALUE.REFERENCE></VALUE.REFERENCE>") + path_size(*path);
    if (const Instance* embedded = value.as_instance()) // as a text of its own
        return frame("<VALUE><![CDATA[]]></VALUE>") + xml_size(*embedded, nullptr, Path_Form::keys);
    if (value.is_null())
        return frame("<VALUE.NULL/>");
    const bool is_text = value.type == CMPI_string || value.type == CMPI_dateTime;
    return frame("<VALUE></VALUE>") +
           (is_text ? escaped(value.as_text()) : number_to_text(value).size());
}

std::size_t value_size(const Value& value) {
    if (!value.is_array())
        return scalar_size(value);
    std::size_t size = frame("<VALUE.ARRAY></VALUE.ARRAY>");
    for (const Value& element : value.as_array())
        size += scalar_size(element);
    return size;
}

std::size_t instance_name_size(const ObjectPath& path) {
    std::size_t size =
        frame("<INSTANCENAME CLASSNAME=\"%\"></INSTANCENAME>") + path.class_name.size();
    for (const Named_Value& key : path.keys) {
        size += frame("<KEYBINDING NAME=\"%\"></KEYBINDING>") + key.name.size() +
                scalar_size(key.value);
        if (!key.value.as_reference())
            size += frame("<KEYVALUE VALUETYPE=\"string\"></KEYVALUE>") - frame("<VALUE></VALUE>");
    }
    return size;
}

// With host and namespace.
std::size_t path_size(const ObjectPath& path) {
    std::size_t size = frame("<INSTANCEPATH><NAMESPACEPATH><HOST>%</HOST><LOCALNAMESPACEPATH>"
                             "</LOCALNAMESPACEPATH></NAMESPACEPATH></INSTANCEPATH>") +
                       HOST_NAME + instance_name_size(path);
    const auto slashes = std::count(path.name_space.begin(), path.name_space.end(), '/');
    return size + path.name_space.size() - static_cast<std::size_t>(slashes) +
           static_cast<std::size_t>(slashes + 1) * frame("<NAMESPACE NAME=\"%\"/>");
}

std::size_t property_size(std::string_view name, const Value& value, const Class* target) {
    if (value.element_type() == CMPI_ref)
        return frame("<PROPERTY.REFERENCE NAME=\"%\" REFERENCECLASS=\"%\"></PROPERTY.REFERENCE>") +
               name.size() + (target ? target->name.size() : 0) +
               (value.is_null() ? 0 : value_size(value));
    const std::size_t type = type_name(value.element_type()).size();
    const std::size_t element =
        value.is_array() ? frame("<PROPERTY.ARRAY NAME=\"%\" TYPE=\"%\"></PROPERTY.ARRAY>")
                         : frame("<PROPERTY NAME=\"%\" TYPE=\"%\"></PROPERTY>");
    return element + name.size() + type + (value.is_null() ? 0 : value_size(value));
}

} // namespace

std::size_t xml_size(const ObjectPath& path, Path_Form form) {
    return form == Path_Form::keys ? instance_name_size(path)
                                   : frame("<OBJECTPATH></OBJECTPATH>") + path_size(path);
}

std::size_t xml_size(const Instance& instance, const Class* known, Path_Form form) {
    std::size_t size =
        frame("<INSTANCE CLASSNAME=\"%\"></INSTANCE>") + instance.class_name().size() +
        (form == Path_Form::keys
             ? frame("<VALUE.NAMEDINSTANCE></VALUE.NAMEDINSTANCE>") +
                   instance_name_size(instance.path)
             : frame("<VALUE.OBJECTWITHPATH></VALUE.OBJECTWITHPATH>") + path_size(instance.path));
    if (!known) {
        for (const Named_Value& named : instance.properties)
            size += property_size(named.name, named.value, nullptr);
        return size;
    }
    auto next = instance.properties.begin(); // in the order of the class
    for (const Property& property : known->properties) {
        const bool given =
            next != instance.properties.end() && same_name(next->name, property.name);
        size += property_size(property.name, given ? next->value : Value::null(property.type),
                              property.target);
        next += given;
    }
    return size;
}

} // namespace host
