// Commands about classes, which ask no provider.
#include "tools/mpcactl/commands.h"

#include "host/value_json.h"

#include <cstdio>
#include <sstream>

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

// Adds what the MOF tells of it, if anything.
host::Json with_meaning(host::Json json, const host::Slot_Type& slot) {
    if (!slot.meaning)
        return json;
    if (!slot.meaning->description.empty())
        json["description"] = slot.meaning->description;
    if (!slot.meaning->unit.empty())
        json["unit"] = slot.meaning->unit;
    if (slot.meaning->words)
        for (const mof::Word_Map::Entry& entry : slot.meaning->words->entries())
            json["values"].push_back({{"value", entry.value}, {"word", entry.word}});
    if (slot.meaning->bits)
        for (const mof::Word_Map::Entry& entry : slot.meaning->bits->entries())
            json["bits"].push_back({{"bit", entry.value}, {"word", entry.word}});
    return json;
}

host::Json to_json(const host::Class& known, bool served) {
    host::Json properties = host::Json::array(), methods = host::Json::array();
    for (const host::Property& each : known.properties)
        properties.push_back(with_meaning({{"name", each.name},
                                           {"type", type_text(each)},
                                           {"key", each.key},
                                           {"origin", origin(known, each.name)}},
                                          each));
    for (const host::Method& method : known.methods) {
        host::Json parameters = host::Json::array();
        for (const host::Parameter& each : method.parameters)
            parameters.push_back(with_meaning({{"name", each.name},
                                               {"type", type_text(each)},
                                               {"in", each.in},
                                               {"out", each.out}},
                                              each));
        methods.push_back(with_meaning({{"name", method.name},
                                        {"type", type_text(method.result)},
                                        {"static", method.is_static},
                                        {"parameters", parameters}},
                                       method.result));
    }
    host::Json json = {
        {"name", known.name}, {"bases", base_names(known)}, {"association", known.is_association},
        {"served", served},   {"keys", key_names(known)},   {"properties", properties},
        {"methods", methods}};
    if (!known.description.empty())
        json["description"] = known.description;
    return json;
}

std::string joined(const host::Json& names) {
    std::string text;
    for (const host::Json& name : names)
        text += (text.empty() ? "" : ", ") + name.get<std::string>();
    return text;
}

constexpr std::size_t TEXT_WIDTH = 100;

// Words of a text, in lines of one indentation.
void print_text(const std::string& text, const std::string& indentation) {
    std::istringstream words(to_line(text));
    std::string line;
    for (std::string word; words >> word;) {
        if (!line.empty() && indentation.size() + line.size() + 1 + word.size() > TEXT_WIDTH) {
            std::printf("%s%s\n", indentation.c_str(), line.c_str());
            line.clear();
        }
        line += (line.empty() ? "" : " ") + word;
    }
    if (!line.empty())
        std::printf("%s%s\n", indentation.c_str(), line.c_str());
}

// Description and unit, and what has a word: "0 Off; 1 On", "bit 0 Sound; bit 3 Light".
void print_meaning(const host::Slot_Type& slot, const std::string& indentation) {
    if (!slot.meaning)
        return;
    const host::Meaning& meaning = *slot.meaning;
    print_text(meaning.description + (meaning.unit.empty() ? "" : " [" + meaning.unit + "]"),
               indentation);
    std::string words;
    const auto add = [&](const std::optional<mof::Word_Map>& map, const char* what) {
        if (!map)
            return;
        for (const mof::Word_Map::Entry& entry : map->entries())
            words += (words.empty() ? "" : "; ") + (what + entry.value) + " " + entry.word;
    };
    add(meaning.words, "");
    add(meaning.bits, "bit ");
    print_text(words, indentation);
}

using Rows = std::vector<std::vector<std::string>>;

// Columns side by side, each line indented; behind each line what the slot of its row means, if
// there are slots.
void print_rows(const Rows& rows, const std::string& indentation,
                const std::vector<const host::Slot_Type*>& slots = {}) {
    std::vector<std::size_t> widths;
    for (const auto& row : rows)
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths.resize(std::max(widths.size(), i + 1));
            widths[i] = std::max(widths[i], row[i].size());
        }
    for (std::size_t at = 0; at < rows.size(); ++at) {
        std::string line = indentation;
        for (std::size_t i = 0; i < rows[at].size(); ++i)
            line += rows[at][i] + std::string(widths[i] - rows[at][i].size() + 2, ' ');
        line.erase(line.find_last_not_of(' ') + 1);
        std::printf("%s\n", line.c_str());
        if (!slots.empty())
            print_meaning(*slots[at], indentation + "    ");
    }
}

void print_method(const host::Method& method) {
    std::printf("  %s %s%s\n", type_text(method.result).c_str(), method.name.c_str(),
                method.is_static ? " (static)" : "");
    print_meaning(method.result, "      ");
    Rows parameters;
    std::vector<const host::Slot_Type*> slots;
    for (const host::Parameter& each : method.parameters) {
        parameters.push_back({direction(each), each.name, type_text(each)});
        slots.push_back(&each);
    }
    print_rows(parameters, "    ", slots);
}

void print_class(const host::Class& known, bool served) {
    const std::string bases = joined(base_names(known)), keys = joined(key_names(known));
    print_rows({{known.is_association ? "Association" : "Class", known.name},
                {"Bases", bases.empty() ? "none" : bases},
                {"Keys", keys.empty() ? "none" : keys},
                {"Served", served ? "by the module" : "by nobody, its subclasses may be"}},
               "");
    if (!known.description.empty())
        std::printf("\n");
    print_text(known.description, "");
    Rows properties;
    std::vector<const host::Slot_Type*> slots;
    for (const host::Property& each : known.properties) {
        properties.push_back(
            {each.name, type_text(each), each.key ? "key" : "", "of " + origin(known, each.name)});
        slots.push_back(&each);
    }
    std::printf("\nProperties%s\n", properties.empty() ? ": none" : "");
    print_rows(properties, "  ", slots);
    std::printf("\nMethods%s\n", known.methods.empty() ? ": none" : "");
    for (const host::Method& method : known.methods)
        print_method(method);
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
