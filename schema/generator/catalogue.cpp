#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"
#include "schema/mof_parser/word_map.h"

#include <algorithm>
#include <fstream>
#include <iterator>

namespace generator {

namespace {

// Names of the engine that a member or parameter would hide, from its own structure or from the
// structures below.
constexpr const char* RESERVED[] = {
    "return_value", "static_meta_class",
    "Property",     "Array",
    "Instance",     "String",
    "Datetime",     "Meta_Class",
    "Meta_Method",  "uint8",
    "sint8",        "uint16",
    "sint16",       "uint32",
    "sint32",       "uint64",
    "sint64",       "real32",
    "real64",       "char16",
    "boolean",
};

void check_name(const mof::Schema& schema, const mof::Declaration& declaration,
                const std::string& structure) {
    const std::string& name = declaration.name;
    if (is_cpp_keyword(name))
        throw mof::Error(declaration.position, "'" + name + "' is a word of C++");
    for (const char* reserved : RESERVED)
        if (mof::same_name(name, reserved))
            throw mof::Error(declaration.position, "'" + name + "' is a name of the engine");
    if (name.find("__") != std::string::npos || name == structure || schema.find(name))
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

void check_words(const mof::Declaration& declaration) {
    mof::Word_Map::read(declaration);
    mof::Word_Map::read(mof::find(declaration.qualifiers, "BitMap"),
                        mof::find(declaration.qualifiers, "BitValues"), declaration.type);
}

bool same_parameter(const mof::Parameter& a, const mof::Parameter& b) {
    return mof::same_name(a.name, b.name) && a.type == b.type && a.array == b.array &&
           mof::same_name(a.target, b.target) && a.is_embedded() == b.is_embedded() &&
           a.is_in() == b.is_in() && a.is_out() == b.is_out();
}

// A method instance is of the structure that belongs to the class asked, so what overrides a method
// has to take what a caller of the base's would give.
void check_parameters(const mof::Schema_Class& owner, const mof::Feature& method) {
    const mof::Schema_Feature* inherited =
        owner.superclass ? owner.superclass->find(method.name) : nullptr;
    if (inherited && !std::equal(method.parameters.begin(), method.parameters.end(),
                                 inherited->feature->parameters.begin(),
                                 inherited->feature->parameters.end(), same_parameter))
        throw mof::Error(method.position, "'" + method.name + "' has not the parameters that " +
                                              inherited->owner->name() + " gives it");
}

// The store of a class finds its instances under the keys of any of its bases.
void check_key(const mof::Schema_Class& owner, const mof::Feature& feature) {
    const mof::Schema_Class* super = owner.superclass;
    if (!super || super->num_keys == 0 || !owner.find(feature.name)->key)
        return;
    const mof::Schema_Feature* inherited = super->find(feature.name);
    if (!inherited || !inherited->key)
        throw mof::Error(feature.position, "'" + feature.name + "' is a key below " +
                                               super->name() + ", which has its keys");
}

void check_feature(const mof::Schema& schema, const mof::Schema_Class& owner,
                   const mof::Feature& feature) {
    check_name(schema, feature, owner.name());
    check_key(owner, feature);
    check_parameters(owner, feature);
    check_target(schema, feature);
    check_words(feature);
    check_spelling(feature.position, feature.name, owner.find(feature.name)->first->name);
    // The engine's array members grow: a fixed length would be a promise that nobody keeps.
    if (feature.array > 0)
        throw mof::Error(feature.position, "an array of fixed length is not supported");
    for (const mof::Parameter& parameter : feature.parameters) {
        check_name(schema, parameter, method_type(owner.name(), feature));
        check_target(schema, parameter);
        check_words(parameter);
        if (parameter.array > 0)
            throw mof::Error(parameter.position, "an array of fixed length is not supported");
    }
    if (feature.default_value)
        for (const mof::Value& element : feature.default_value->elements)
            if (element.kind == mof::Value::Kind::null)
                throw mof::Error(element.position, "null inside an array");
}

void check_class(const mof::Schema_Class& schema_class) {
    const auto refuse = [&](const std::string& reason) {
        throw mof::Error(schema_class.declaration->position, reason);
    };
    const std::string& name = schema_class.name();
    for (const char* reserved : RESERVED)
        if (is_cpp_keyword(name) || mof::same_name(name, reserved))
            refuse("'" + name + "' cannot be the name of a class");
    const auto references =
        std::count_if(schema_class.features.begin(), schema_class.features.end(),
                      [](const mof::Schema_Feature& feature) {
                          return feature.kind() == mof::Feature_Kind::reference;
                      });
    // MOF tells an association by the first word of the list; some compilers insist.
    const mof::Qualifiers& qualifiers = schema_class.qualifiers();
    if (mof::is_true(qualifiers, "Association") &&
        !mof::same_name(qualifiers.front().name, "Association"))
        refuse("Association is the first qualifier of a class");
    if (schema_class.is_association && references < 2)
        refuse("an association has two references at least");
    if (!is_provided(schema_class))
        return;
    if (mof::is_true(schema_class.qualifiers(), "Abstract"))
        refuse("a provided class cannot be abstract");
    if (schema_class.num_keys == 0)
        refuse("a provided class has a key at least");
}

} // namespace

Catalogue load_catalogue(const std::string& path) {
    Catalogue catalogue{mof::load_schema(path), {}};
    for (const auto& each : catalogue.schema.classes()) {
        check_class(*each);
        for (const mof::Feature& feature : each->declaration->features)
            check_feature(catalogue.schema, *each, feature);
        if (is_provided(*each))
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
