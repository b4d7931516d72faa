#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <set>
#include <sstream>

namespace generator {

namespace {

// Classes that a header only points to.
std::set<std::string> pointees(const mof::Class& declared) {
    std::set<std::string> names;
    auto add = [&](const mof::Declaration& declaration) {
        if (is_pointer(declaration) && !declaration.target.empty())
            names.insert(declaration.target);
    };
    for (const mof::Feature& feature : declared.features) {
        add(feature);
        for (const mof::Parameter& parameter : feature.parameters)
            add(parameter);
    }
    return names;
}

// The members that the class adds. An override adds none: the base has it.
std::string members(const mof::Schema_Class& schema_class) {
    std::ostringstream out;
    for (const mof::Schema_Feature& feature : schema_class.features)
        if (feature.origin == &schema_class && feature.kind() != mof::Feature_Kind::method)
            out << "    " << member_type(*feature.feature) << " " << feature.name() << ";\n";
    return out.str().empty() ? "" : out.str() + "\n";
}

void method_structure(std::ostream& out, const std::string& class_name,
                      const mof::Feature& method) {
    out << "\nstruct " << method_type(class_name, method) << " : Instance {\n";
    for (const mof::Parameter& parameter : method.parameters)
        out << "    " << member_type(parameter) << " " << parameter.name << ";\n";
    out << "    Property<" << value_type(method.type) << "> return_value;\n\n"
        << "    static const Meta_Method static_meta_class;\n};\n";
}

std::string header(const mof::Schema_Class& schema_class) {
    const std::string& name = schema_class.name();
    std::ostringstream out;
    out << BANNER << "#ifndef CLASSES_" << name << "_H\n#define CLASSES_" << name << "_H\n\n";
    if (schema_class.superclass)
        out << "#include \"classes/" << schema_class.superclass->name() << ".h\"\n\n";
    else
        out << "#include \"cimple/instance.h\"\n\n";
    out << "namespace cimple {\n\n";
    std::set<std::string> targets = pointees(*schema_class.declaration);
    for (const std::string& target : targets)
        out << "struct " << target << ";\n";
    out << (targets.empty() ? "" : "\n") << "struct " << name << " : "
        << (schema_class.superclass ? schema_class.superclass->name() : "Instance") << " {\n";
    out << members(schema_class) << "    static const Meta_Class static_meta_class;\n};\n";
    for (const mof::Feature& feature : schema_class.declaration->features)
        if (feature.kind == mof::Feature_Kind::method)
            method_structure(out, name, feature);
    out << "\n} // namespace cimple\n\n#endif\n";
    return out.str();
}

} // namespace

void write_classes(const Catalogue& catalogue, const Output& output) {
    for (const auto& schema_class : catalogue.schema.classes())
        output.write("classes/" + schema_class->name() + ".h", header(*schema_class));
}

} // namespace generator
