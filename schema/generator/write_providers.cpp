#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <set>
#include <sstream>

namespace generator {

namespace {

constexpr const char* MODULE_NAME = "vorlan_mpca_provider_Module";

std::vector<const mof::Schema_Feature*> methods_of(const mof::Schema_Class& schema_class) {
    std::vector<const mof::Schema_Feature*> methods;
    for (const mof::Schema_Feature& feature : schema_class.features)
        if (feature.kind() == mof::Feature_Kind::method)
            methods.push_back(&feature);
    return methods;
}

bool has_methods(const mof::Schema_Class& schema_class) {
    return !schema_class.is_association && !methods_of(schema_class).empty();
}

std::string guarded(const char* guard, const std::string& includes, const std::string& body) {
    return std::string(BANNER) + "#ifndef " + guard + "\n#define " + guard + "\n\n" + includes +
           "\nnamespace cimple {\n\n" + body + "\n} // namespace cimple\n\n#endif\n";
}

std::string provider_types(const Catalogue& catalogue) {
    std::ostringstream out;
    for (const mof::Schema_Class* each : catalogue.providers)
        out << "struct " << each->name() << ";\n";
    out << "\n";
    for (const mof::Schema_Class* each : catalogue.providers)
        out << "struct " << each->name() << "_Provider : Provider_For<" << each->name()
            << ">::type {};\n";
    return guarded("PROVIDER_TYPES_H", "#include \"services/providers.h\"\n", out.str());
}

// Rows in the order of the chain; who includes the file defines what a row is.
std::string provider_classes(const Catalogue& catalogue) {
    std::ostringstream out;
    out << BANNER;
    for (const mof::Schema_Class* each : catalogue.providers)
        out << (each->is_association ? "VLN_PROVIDER_ASSOCIATION(" : "VLN_PROVIDER_CLASS(")
            << each->name() << ")\n";
    return out.str();
}

// ---- Methods ----

// How a parameter reaches a provider: a pointer to its member.
std::string argument_type(const mof::Declaration& parameter) {
    return member_type(parameter) + "*";
}

void stub(std::ostream& out, const mof::Schema_Class& schema_class, const mof::Feature& method) {
    out << "    sint32 " << method.name << "(const " << schema_class.name() << "*";
    for (const mof::Parameter& parameter : method.parameters)
        out << ", " << argument_type(parameter) << " /*" << parameter.name << "*/";
    out << ", Property<" << value_type(method.type) << ">* /*return_value*/) {\n"
        << "        return INVOKE_METHOD_UNSUPPORTED;\n    }\n";
}

std::string method_stubs(const Catalogue& catalogue) {
    std::set<std::string> pointed;
    std::ostringstream stubs;
    for (const mof::Schema_Class* each : catalogue.providers) {
        if (!has_methods(*each))
            continue;
        pointed.insert(each->name());
        stubs << "template <>\nstruct Method_Stubs<" << each->name() << "> {\n";
        for (const mof::Schema_Feature* method : methods_of(*each)) {
            stub(stubs, *each, *method->feature);
            for (const mof::Parameter& parameter : method->feature->parameters)
                if (is_pointer(parameter) && !parameter.target.empty())
                    pointed.insert(parameter.target);
        }
        stubs << "};\n\n";
    }
    std::ostringstream out;
    for (const std::string& name : pointed)
        out << "struct " << name << ";\n";
    out << "\n// The extrinsic methods of a class, in the order of its dispatch, each refused. A "
           "provider\n"
        << "// derives from them and hides those that it implements.\n"
        << "template <class C>\nstruct Method_Stubs {};\n\n"
        << stubs.str();
    return guarded("METHOD_STUBS_H", "#include \"cimple/registration.h\"\n", out.str());
}

// Tries the class's methods in their order.
void invoke_function(std::ostream& out, const mof::Schema_Class& schema_class) {
    const std::string& name = schema_class.name();
    out << "static sint32 invoke_" << name << "(" << name << "_Provider* provider, const " << name
        << "* self,\n    Instance* method) {\n";
    for (const mof::Schema_Feature* method : methods_of(schema_class)) {
        std::string structure = method_type(method->owner->name(), *method->feature);
        out << "    if (auto* m = method_cast<" << structure << ">(method))\n"
            << "        return provider->" << method->name() << "(self";
        for (const mof::Parameter& parameter : method->feature->parameters)
            out << ", &m->" << parameter.name;
        out << ", &m->return_value);\n";
    }
    out << "    return -1;\n}\n\n";
}

// ---- The chain ----

std::string registrations_header(const Catalogue& catalogue, std::size_t parts) {
    std::ostringstream out;
    out << "// One record a class, in the order of the catalogue; each points to the one before.\n"
        << "extern Registration registrations[" << catalogue.providers.size() << "];\n\n"
        << "// Fills the next record.\n"
        << "void add_registration(const char* provider_name, Provider_Proc proc,\n"
        << "                      const Meta_Class* meta_class) noexcept;\n\n";
    for (std::size_t part = 0; part < parts; part++)
        out << "void " << part_name("add_registrations", part, "") << "() noexcept;\n";
    return guarded("REGISTRATIONS_H", "#include \"cimple/registration.h\"\n", out.str());
}

std::string procedures(const Catalogue& catalogue, std::size_t part, std::size_t parts) {
    Span span = part_of(catalogue.providers.size(), part, parts);
    std::ostringstream includes, invokes, calls;
    for (std::size_t i = span.begin; i < span.end; i++) {
        const mof::Schema_Class& each = *catalogue.providers[i];
        const std::string& name = each.name();
        std::string types = "<" + name + "_Provider, " + name;
        includes << "#include \"classes/" << name << ".h\"\n";
        if (has_methods(each))
            invoke_function(invokes, each);
        calls << "    add_registration(" << literal(name + "_Provider") << ", "
              << (each.is_association ? "association_proc" + types + ">"
                  : has_methods(each) ? "method_proc" + types + ", invoke_" + name + ">"
                                      : "instance_proc" + types + ">")
              << ",\n                     &" << name << "::static_meta_class);\n";
    }
    return std::string(BANNER) +
           "#include \"cimple/provider_proc.h\"\n#include \"provider_types.h\"\n"
           "#include \"registrations.h\"\n\n" +
           includes.str() + "\nnamespace cimple {\n\n" + invokes.str() + "void " +
           part_name("add_registrations", part, "") + "() noexcept {\n" + calls.str() +
           "}\n\n} // namespace cimple\n";
}

std::string registration(const Catalogue& catalogue, std::size_t parts) {
    std::ostringstream out;
    std::size_t last = catalogue.providers.size() - 1;
    out << BANNER << "#include \"registrations.h\"\n\nnamespace cimple {\n\n"
        << "Registration registrations[" << catalogue.providers.size() << "];\n\n"
        << "static uint32 num_built = 0;\n\n"
        << "void add_registration(const char* provider_name, Provider_Proc proc,\n"
        << "                      const Meta_Class* meta_class) noexcept {\n"
        << "    const Registration* previous = num_built ? &registrations[num_built - 1] : "
           "nullptr;\n"
        << "    registrations[num_built++] = {" << literal(MODULE_NAME)
        << ", provider_name, proc, meta_class,\n                                  previous};\n}\n\n"
        << "// The fields are written when the library is loaded, so that the chain itself needs "
           "no\n"
        << "// relocation. Nothing else may run this early.\n"
        << "struct Chain_Builder {\n    Chain_Builder() noexcept {\n";
    for (std::size_t part = 0; part < parts; part++)
        out << "        " << part_name("add_registrations", part, "") << "();\n";
    out << "    }\n};\nstatic const Chain_Builder chain_builder;\n\n} // namespace cimple\n\n"
        << "extern \"C\" __attribute__((visibility(\"default\"))) const cimple::Registration*\n"
        << "cimple_module() {\n    return &cimple::registrations[" << last << "];\n}\n";
    return out.str();
}

} // namespace

void write_providers(const Catalogue& catalogue, const Output& output, std::size_t parts) {
    output.write("provider_types.h", provider_types(catalogue));
    output.write("provider_classes.inc", provider_classes(catalogue));
    output.write("method_stubs.h", method_stubs(catalogue));
    output.write("registrations.h", registrations_header(catalogue, parts));
    for (std::size_t part = 0; part < parts; part++)
        output.write(part_name("procs", part, ".cpp"), procedures(catalogue, part, parts));
    output.write("registration.cpp", registration(catalogue, parts));
}

} // namespace generator
