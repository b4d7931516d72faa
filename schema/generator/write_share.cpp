// The classes for the MOF compilers of object managers. Such a compiler reads files in the order of
// their names and knows only what came before, so each folder can be read whole:
//
//   mof/           all for a namespace without a CIM Schema: qualifiers, base classes, our classes
//   mof/final/     before our classes, in place of the other two, where the CIM Schema is: what no
//                  release of it has
//   mof/interop/   behind a CIM Schema or our base classes, in the interop namespace
#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <algorithm>
#include <set>
#include <sstream>

namespace generator {

namespace {

// The release that the base classes are taken from.
constexpr const char* CIM_SCHEMA_VERSION = "2.26.0";

// What we use of the CIM Schema and no Final release has, from 2.28 to 2.41. The catalogue follows
// the Experimental one.
constexpr const char* NEVER_FINAL_CLASSES[] = {
    "CIM_ProductElementComponent",
    "CIM_SCSIArbitraryLogicalUnit",
    "CIM_iSCSISessionStatistics",
};

// A property of a base class that no Final release has. No compiler lets us add it to a class that
// is there already, so what we write declares it in those of our classes that set it, and leaves it
// out of the base class, where it would be declared twice. The library does not see the difference:
// a client is given the property by its name.
struct Moved_Property {
    const char* from;
    const char* property;
    const char* to;
};
constexpr Moved_Property MOVED_PROPERTIES[] = {
    {"CIM_LogicalDevice", "LocationIndicator", "VLNMPCA_EthernetPort"},
};

// What a class names: its superclass, and the classes of references and of embedded objects.
template <class Visit>
void for_named(const mof::Schema& schema, const mof::Schema_Class& schema_class, Visit visit) {
    const auto target = [&](const mof::Declaration& declaration) {
        if (!declaration.target.empty())
            visit(*schema.find(declaration.target));
    };
    if (schema_class.superclass)
        visit(*schema_class.superclass);
    for (const mof::Feature& feature : schema_class.declaration->features) {
        target(feature);
        for (const mof::Parameter& parameter : feature.parameters)
            target(parameter);
    }
}

// Puts every class behind those that it names, and leaves the catalogue's order alone elsewhere.
// Classes that name one another in a ring cannot all come first; the one met first in the catalogue
// does.
class One_Pass_Order {
public:
    explicit One_Pass_Order(const mof::Schema& schema) : _schema(schema) {
        for (const auto& each : schema.classes())
            visit(*each);
    }
    const std::vector<const mof::Schema_Class*>& classes() const { return _order; }

private:
    void visit(const mof::Schema_Class& schema_class) {
        if (!_seen.insert(&schema_class).second)
            return;
        for_named(_schema, schema_class, [this](const mof::Schema_Class& named) { visit(named); });
        _order.push_back(&schema_class);
    }

    const mof::Schema& _schema;
    std::set<const mof::Schema_Class*> _seen;
    std::vector<const mof::Schema_Class*> _order;
};

void joined(std::ostream& out, const char* word, const std::vector<std::string>& items) {
    if (items.empty())
        return;
    out << ", " << word << "(";
    for (std::size_t i = 0; i < items.size(); i++)
        out << (i ? ", " : "") << items[i];
    out << ")";
}

std::string qualifier_declarations(const mof::Document& document) {
    std::ostringstream out;
    for (const mof::Qualifier_Declaration& each : document.qualifiers) {
        out << "Qualifier " << each.name << " : " << mof::type_name(each.type)
            << (each.array == mof::scalar ? "" : "[]");
        // The words that we use have boolean defaults or none, and a list goes without.
        bool boolean = each.default_value && each.default_value->kind == mof::Value::Kind::boolean;
        if (each.array == mof::scalar)
            out << " = " << (!boolean ? "null" : each.default_value->boolean ? "true" : "false");
        joined(out, "Scope", each.scopes);
        joined(out, "Flavor", each.flavors);
        out << ";\n";
    }
    return out.str();
}

template <class Names>
bool among(const Names& names, const std::string& name) {
    return std::find(std::begin(names), std::end(names), name) != std::end(names);
}

// Of the CIM Schema. Classes of other parties are theirs to declare.
bool is_base(const mof::Schema_Class& schema_class) {
    return schema_class.name().rfind("CIM_", 0) == 0;
}

const mof::Feature* declared_by(const mof::Schema_Class& schema_class, const char* property) {
    for (const mof::Feature& each : schema_class.declaration->features)
        if (each.name == property)
            return &each;
    return nullptr;
}

void take_out(std::string& text, const std::string& feature) {
    std::size_t begin = text.find(feature);
    begin = text.find_last_not_of(" \t", begin - 1); // the line's end before it
    text.erase(begin, text.find(feature) + feature.size() - begin);
}

// A class as written in the catalogue, with its version and its moved properties.
std::string declaration(const mof::Schema& schema, const mof::Schema_Class& written) {
    std::string text = written.declaration->text;
    for (const Moved_Property& moved : MOVED_PROPERTIES) {
        const mof::Schema_Class* from = schema.find(moved.from);
        const mof::Feature* property = from ? declared_by(*from, moved.property) : nullptr;
        if (!property)
            continue;
        if (from == &written)
            take_out(text, property->text);
        else if (written.name() == moved.to)
            text.insert(text.rfind('}'), "    " + property->text + "\n");
    }
    if (mof::find(written.qualifiers(), "Version"))
        return text;
    const std::string version =
        std::string("Version(\"") + (is_base(written) ? CIM_SCHEMA_VERSION : VLN_VERSION) + "\")";
    if (text[0] != '[')
        return "[" + version + "]\n" + text;
    // Behind the first word, which has to be Association where that is among them.
    const std::string& first = written.qualifiers().front().name;
    const std::size_t behind = text.find(first) + first.size();
    return mof::same_name(first, "Association") ? text.insert(behind, ", " + version)
                                                : "[" + version + ", " + text.substr(1);
}

// What the interop namespace needs of ours: the profile classes, and all that they name.
class Interop_Classes {
public:
    explicit Interop_Classes(const Catalogue& catalogue) : _schema(catalogue.schema) {
        for (const mof::Schema_Class* each : catalogue.providers)
            if (is_interop(catalogue, *each))
                visit(*each);
    }
    bool has(const mof::Schema_Class& schema_class) const { return _classes.count(&schema_class); }

private:
    void visit(const mof::Schema_Class& schema_class) {
        if (!is_provided(schema_class) || !_classes.insert(&schema_class).second)
            return;
        for_named(_schema, schema_class, [this](const mof::Schema_Class& named) { visit(named); });
    }

    const mof::Schema& _schema;
    std::set<const mof::Schema_Class*> _classes;
};

} // namespace

bool is_interop(const Catalogue& catalogue, const mof::Schema_Class& schema_class) {
    constexpr const char* PROFILE_CLASSES[] = {
        "CIM_RegisteredProfile", "CIM_ElementConformsToProfile", "CIM_ReferencedProfile"};
    return is_provided(schema_class) &&
           std::any_of(std::begin(PROFILE_CLASSES), std::end(PROFILE_CLASSES),
                       [&](const char* base) {
                           return catalogue.schema.is_subclass(base, schema_class.name());
                       });
}

void write_share(const Catalogue& catalogue, const Output& output) {
    const One_Pass_Order order(catalogue.schema);
    const auto write = [&](const char* name, const char* what, const auto& belongs) {
        std::string text = what;
        for (const mof::Schema_Class* each : order.classes())
            if (belongs(*each))
                text += "\n" + declaration(catalogue.schema, *each) + "\n";
        output.write(std::string("mof/") + name, text);
    };
    output.write("mof/10_vorlan_mpca_qualifiers.mof",
                 "// Qualifiers, for a namespace without a CIM Schema.\n\n" +
                     qualifier_declarations(catalogue.schema.document()));
    write("20_vorlan_mpca_base.mof",
          "// Base classes, as the CIM Schema has them, for a namespace without one.\n", is_base);
    write("30_vorlan_mpca_provider.mof", "// The classes of the Vorlan CNA management provider.\n",
          is_provided);
    write("final/20_vorlan_mpca_additions.mof",
          "// Base classes that no Final CIM Schema has, for a namespace with one.\n",
          [](const mof::Schema_Class& each) { return among(NEVER_FINAL_CLASSES, each.name()); });
    const Interop_Classes interop(catalogue);
    write("interop/30_vorlan_mpca_interop.mof",
          "// Profiles, and what conforms to them, for the interop namespace.\n",
          [&](const mof::Schema_Class& each) { return interop.has(each); });
}

} // namespace generator
