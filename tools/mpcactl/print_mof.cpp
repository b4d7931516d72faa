#include "tools/mpcactl/print.h"

#include "host/path_text.h"

#include <algorithm>
#include <cstdio>

namespace mpcactl {

namespace {

std::string scalar_to_mof(const Print_Context& context, const host::Value& value) {
    if (value.is_null())
        return "NULL";
    // An embedded object is the text of its own MOF.
    if (const host::Instance* instance = value.as_instance())
        return host::quote(to_mof(context, *instance));
    if (value.type == CMPI_char16) {
        char text[16];
        std::snprintf(text, sizeof text, "'\\x%04X'", static_cast<unsigned>(value.as_unsigned()));
        return text;
    }
    return host::scalar_to_text(value, context.name_space);
}

// A comment, which no word can end.
std::string comment(std::string word) {
    for (std::size_t at = 0; (at = word.find("*/", at)) != std::string::npos;)
        word.insert(at + 1, " ");
    return " /* " + word + " */";
}

std::string value_to_mof(const Print_Context& context, const host::Slot_Type* slot,
                         const host::Value& value) {
    const auto one = [&](const host::Value& scalar) {
        const auto word = wanted_word(context, slot, scalar);
        return scalar_to_mof(context, scalar) + (word ? comment(*word) : "");
    };
    if (!value.is_array() || value.is_null())
        return one(value);
    std::string text;
    for (const host::Value& element : value.as_array())
        text += (text.empty() ? "" : ", ") + one(element);
    return "{" + text + "}";
}

} // namespace

std::string to_mof(const Print_Context& context, const host::Instance& instance) {
    const host::Class* known = context.classes.find(instance.class_name());
    std::size_t width = 0;
    for (const host::Named_Value& named : instance.properties)
        width = std::max(width, named.name.size());
    std::string text = "instance of " + instance.class_name() + "\n{\n";
    for (const host::Named_Value& named : instance.properties)
        text +=
            "    " + named.name + std::string(width - named.name.size(), ' ') + " = " +
            value_to_mof(context, known ? known->find_property(named.name) : nullptr, named.value) +
            ";\n";
    return text + "};\n";
}

} // namespace mpcactl
