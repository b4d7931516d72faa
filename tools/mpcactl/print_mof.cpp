#include "tools/mpcactl/print.h"

#include "host/path_text.h"

#include <algorithm>
#include <cstdio>

namespace mpcactl {

namespace {

std::string scalar_to_mof(const host::Value& value, const std::string& name_space) {
    if (value.is_null())
        return "NULL";
    // An embedded object is the text of its own MOF.
    if (const host::Instance* instance = value.as_instance())
        return host::quote(to_mof(*instance, name_space));
    if (value.type == CMPI_char16) {
        char text[16];
        std::snprintf(text, sizeof text, "'\\x%04X'", static_cast<unsigned>(value.as_unsigned()));
        return text;
    }
    return host::scalar_to_text(value, name_space);
}

std::string value_to_mof(const host::Value& value, const std::string& name_space) {
    if (!value.is_array() || value.is_null())
        return scalar_to_mof(value, name_space);
    std::string text;
    for (const host::Value& element : value.as_array())
        text += (text.empty() ? "" : ", ") + scalar_to_mof(element, name_space);
    return "{" + text + "}";
}

} // namespace

std::string to_mof(const host::Instance& instance, const std::string& name_space) {
    std::size_t width = 0;
    for (const host::Named_Value& named : instance.properties)
        width = std::max(width, named.name.size());
    std::string text = "instance of " + instance.class_name() + "\n{\n";
    for (const host::Named_Value& named : instance.properties)
        text += "    " + named.name + std::string(width - named.name.size(), ' ') + " = " +
                value_to_mof(named.value, name_space) + ";\n";
    return text + "};\n";
}

} // namespace mpcactl
