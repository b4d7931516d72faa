#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <fstream>
#include <iterator>

namespace generator {

namespace {

// Names of the engine that a member or parameter would hide.
constexpr const char* RESERVED[] = {"return_value", "static_meta_class"};

void check_name(const mof::Declaration& declaration, const std::string& structure) {
    const std::string& name = declaration.name;
    if (is_cpp_keyword(name))
        throw mof::Error(declaration.position, "'" + name + "' is a word of C++");
    for (const char* reserved : RESERVED)
        if (mof::same_name(name, reserved))
            throw mof::Error(declaration.position, "'" + name + "' is a name of the engine");
    if (name.find("__") != std::string::npos || name == structure)
        throw mof::Error(declaration.position, "'" + name + "' cannot be the name of a member");
}

// MOF does not mind the case of a name, C++ does.
void check_spelling(const mof::Position& position, const std::string& used,
                    const std::string& declared) {
    if (used != declared)
        throw mof::Error(position, "'" + used + "' is spelled '" + declared + "' elsewhere");
}

void check_target(const mof::Schema& schema, const mof::Declaration& declaration) {
    if (!declaration.target.empty())
        check_spelling(declaration.position, declaration.target,
                       schema.find(declaration.target)->name());
}

void check_feature(const mof::Schema& schema, const mof::Schema_Class& owner,
                   const mof::Feature& feature) {
    check_name(feature, owner.name());
    check_target(schema, feature);
    check_spelling(feature.position, feature.name, owner.find(feature.name)->first->name);
    // The engine's array members grow: a fixed length would be a promise that nobody keeps.
    if (feature.array > 0)
        throw mof::Error(feature.position, "an array of fixed length is not supported");
    for (const mof::Parameter& parameter : feature.parameters) {
        check_name(parameter, method_type(owner.name(), feature));
        check_target(schema, parameter);
        if (parameter.array > 0)
            throw mof::Error(parameter.position, "an array of fixed length is not supported");
    }
    if (feature.default_value)
        for (const mof::Value& element : feature.default_value->elements)
            if (element.kind == mof::Value::Kind::null)
                throw mof::Error(element.position, "null inside an array");
}

} // namespace

Catalogue load_catalogue(const std::string& path) {
    Catalogue catalogue{mof::load_schema(path), {}};
    for (const auto& each : catalogue.schema.classes()) {
        if (is_cpp_keyword(each->name()) || mof::same_name(each->name(), "Instance"))
            throw mof::Error(each->declaration->position,
                             "'" + each->name() + "' cannot be the name of a class");
        for (const mof::Feature& feature : each->declaration->features)
            check_feature(catalogue.schema, *each, feature);
        if (!is_provided(*each))
            continue;
        if (mof::is_true(each->qualifiers(), "Abstract"))
            throw mof::Error(each->declaration->position, "a provided class cannot be abstract");
        catalogue.providers.push_back(each.get());
    }
    return catalogue;
}

void Output::write(const std::string& name, const std::string& contents) const {
    const std::filesystem::path path = _folder / name;
    if (mof::read_file(path.string()) == contents)
        return;
    std::filesystem::create_directories(path.parent_path());
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << contents;
    out.close();
    if (!out)
        throw std::runtime_error("cannot write " + path.string());
}

} // namespace generator
