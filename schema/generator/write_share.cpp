#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <set>
#include <sstream>

namespace generator {

namespace {

constexpr const char* GROUP = "vorlan_mpca";
constexpr const char* LOCATION = "vorlan_mpca_provider";
constexpr const char* NAME_SPACE = "root/vorlan";
// Profiles are looked for in the interop namespace too (DSP1033).
constexpr const char* PROFILE_CLASS = "VLNMPCA_RegisteredProfile";
constexpr const char* INTEROP_NAME_SPACE = "root/pg_interop";

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
        if (schema_class.superclass)
            visit(*schema_class.superclass);
        for (const mof::Feature& feature : schema_class.declaration->features) {
            visit_target(feature);
            for (const mof::Parameter& parameter : feature.parameters)
                visit_target(parameter);
        }
        _order.push_back(&schema_class);
    }
    void visit_target(const mof::Declaration& declaration) {
        if (!declaration.target.empty())
            visit(*_schema.find(declaration.target));
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

std::string class_declarations(const One_Pass_Order& order, bool provided) {
    std::string text;
    for (const mof::Schema_Class* each : order.classes())
        if (is_provided(*each) == provided)
            text += (text.empty() ? "" : "\n") + each->declaration->text + "\n";
    return text;
}

std::string registration_file(const Catalogue& catalogue) {
    std::ostringstream out;
    for (const mof::Schema_Class* each : catalogue.providers) {
        out << "[" << each->name() << "]\n"
            << "   provider: " << each->name() << "_Provider\n"
            << "   location: " << LOCATION << "\n"
            << "   type: instance method" << (each->is_association ? " association" : "") << "\n"
            << "   group: " << GROUP << "\n"
            << "   unload: never\n"
            << "   namespace: " << NAME_SPACE;
        if (each->name() == PROFILE_CLASS)
            out << " " << INTEROP_NAME_SPACE;
        out << "\n";
    }
    return out.str();
}

} // namespace

void write_share(const Catalogue& catalogue, const Output& output) {
    One_Pass_Order order(catalogue.schema);
    output.write("vorlan_mpca_qualifiers.mof", qualifier_declarations(catalogue.schema.document()));
    output.write("vorlan_mpca_base.mof", class_declarations(order, false));
    output.write("vorlan_mpca_provider.mof", class_declarations(order, true));
    output.write("vorlan_mpca_provider.reg", registration_file(catalogue));
}

} // namespace generator
