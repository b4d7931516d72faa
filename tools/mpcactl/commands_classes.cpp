// Commands about classes, which ask no provider.
#include "tools/mpcactl/commands.h"

#include "host/value_json.h"

#include <cstdio>

namespace mpcactl {

namespace {

host::Json key_names(const host::Class& known) {
    host::Json keys = host::Json::array();
    for (std::size_t index : known.keys)
        keys.push_back(known.properties[index].name);
    return keys;
}

host::Json base_names(const host::Class& known) {
    host::Json names = host::Json::array();
    for (const host::Class* base = known.superclass; base; base = base->superclass)
        names.push_back(base->name);
    return names;
}

// "uint16[]", "Class ref", "string of Class" for an embedded instance of it.
std::string type_text(const host::Slot_Type& slot) {
    const bool reference = (slot.type & ~CMPI_ARRAY) == CMPI_ref;
    if (reference && slot.target)
        return slot.target->name + " ref" + ((slot.type & CMPI_ARRAY) != 0 ? "[]" : "");
    const std::string text = host::type_name(slot.type);
    if (slot.embedded)
        return text + " of " + (slot.target ? slot.target->name : "any class");
    return text;
}

// The class that declares a property first.
const std::string& origin(const host::Class& known, const std::string& property) {
    const host::Class* at = &known;
    while (at->superclass && at->superclass->find_property(property))
        at = at->superclass;
    return at->name;
}

const char* direction(const host::Parameter& parameter) {
    return parameter.in && parameter.out ? "in out" : parameter.out ? "out" : "in";
}

host::Json to_json(const host::Class& known, bool served) {
    host::Json properties = host::Json::array(), methods = host::Json::array();
    for (const host::Property& each : known.properties)
        properties.push_back({{"name", each.name},
                              {"type", type_text(each)},
                              {"key", each.key},
                              {"origin", origin(known, each.name)}});
    for (const host::Method& method : known.methods) {
        host::Json parameters = host::Json::array();
        for (const host::Parameter& each : method.parameters)
            parameters.push_back({{"name", each.name},
                                  {"type", type_text(each)},
                                  {"in", each.in},
                                  {"out", each.out}});
        methods.push_back({{"name", method.name},
                           {"type", type_text(method.result)},
                           {"static", method.is_static},
                           {"parameters", parameters}});
    }
    return {
        {"name", known.name}, {"bases", base_names(known)}, {"association", known.is_association},
        {"served", served},   {"keys", key_names(known)},   {"properties", properties},
        {"methods", methods}};
}

std::string joined(const host::Json& names) {
    std::string text;
    for (const host::Json& name : names)
        text += (text.empty() ? "" : ", ") + name.get<std::string>();
    return text;
}

using Rows = std::vector<std::vector<std::string>>;

// Columns side by side, each line indented.
void print_rows(const Rows& rows, const std::string& indentation) {
    std::vector<std::size_t> widths;
    for (const auto& row : rows)
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths.resize(std::max(widths.size(), i + 1));
            widths[i] = std::max(widths[i], row[i].size());
        }
    for (const auto& row : rows) {
        std::string line = indentation;
        for (std::size_t i = 0; i < row.size(); ++i)
            line += row[i] + std::string(widths[i] - row[i].size() + 2, ' ');
        line.erase(line.find_last_not_of(' ') + 1);
        std::printf("%s\n", line.c_str());
    }
}

void print_class(const host::Class& known, bool served) {
    const std::string bases = joined(base_names(known)), keys = joined(key_names(known));
    print_rows({{known.is_association ? "Association" : "Class", known.name},
                {"Bases", bases.empty() ? "none" : bases},
                {"Keys", keys.empty() ? "none" : keys},
                {"Served", served ? "by the module" : "by nobody, its subclasses may be"}},
               "");
    Rows properties;
    for (const host::Property& each : known.properties)
        properties.push_back(
            {each.name, type_text(each), each.key ? "key" : "", "of " + origin(known, each.name)});
    std::printf("\nProperties%s\n", properties.empty() ? ": none" : "");
    print_rows(properties, "  ");
    std::printf("\nMethods%s\n", known.methods.empty() ? ": none" : "");
    for (const host::Method& method : known.methods) {
        std::printf("  %s %s%s\n", type_text(method.result).c_str(), method.name.c_str(),
                    method.is_static ? " (static)" : "");
        Rows parameters;
        for (const host::Parameter& each : method.parameters)
            parameters.push_back({direction(each), each.name, type_text(each)});
        print_rows(parameters, "    ");
    }
}

} // namespace

int list_classes(Session& session, const Command& command) {
    host::Json list = host::Json::array();
    for (const auto& known : session.classes().classes()) {
        const bool served = session.manager().serves(*known, command.name_space);
        if (!served && !command.all)
            continue;
        if (command.format == Format::table)
            std::printf("%s\n", known->name.c_str());
        else if (command.format == Format::mof)
            std::printf("%s\n\n", known->text.c_str());
        list.push_back({{"name", known->name},
                        {"superclass", known->superclass ? host::Json(known->superclass->name)
                                                         : host::Json(nullptr)},
                        {"association", known->is_association},
                        {"served", served},
                        {"keys", key_names(*known)}});
    }
    if (command.format == Format::json)
        std::printf("%s\n", list.dump(2).c_str());
    return EXIT_FINE;
}

int show_class(Session& session, const Command& command) {
    const host::Class& known = session.known_class(command.class_name);
    const bool served = session.manager().serves(known, command.name_space);
    if (command.format == Format::json)
        std::printf("%s\n", to_json(known, served).dump(2).c_str());
    else if (command.format == Format::mof)
        std::printf("%s\n", known.text.c_str());
    else
        print_class(known, served);
    return EXIT_FINE;
}

} // namespace mpcactl
