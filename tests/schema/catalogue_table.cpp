// Prints the whole class catalogue as the engine sees it: a row for each class, each feature that a
// class declares or overrides itself, and each parameter, in the order of the tables. What a class
// inherits is its ancestor's own record and stands there. Nothing in it depends on the word size.
//
//   build/lp64/bin/catalogue_table >tests/schema/catalogue.tsv
#include "meta_repository.h"

#include <cinttypes>
#include <cstdio>
#include <string>

using namespace cimple;

namespace {

// The words of the flags but the ones that the first column tells.
std::string words(uint32 flags, uint32 told) {
    std::string list;
    for (uint32 bit = 0; bit < 32; bit++)
        if (flags & ~told & 1u << bit)
            list += (list.empty() ? "" : " ") + std::string(flag_name(bit));
    return list.empty() ? "-" : list;
}

std::string array(sint16 subscript) {
    return subscript == 0 ? "" : subscript < 0 ? "[]" : "[" + std::to_string(subscript) + "]";
}

// A scalar default; the catalogue has no others, and one that came would show by its number.
std::string text(const Meta_Property& property) {
    if (!property.value)
        return "-";
    const Meta_Value& value = *property.value;
    if (property.subscript)
        return "array of " + std::to_string(value.array_value.num_elements);
    switch (property.type) {
    case TYPE_BOOLEAN:
        return value.boolean_value ? "true" : "false";
    case TYPE_UINT8:
        return std::to_string(value.uint8_value);
    case TYPE_UINT16:
        return std::to_string(value.uint16_value);
    case TYPE_UINT32:
        return std::to_string(value.uint32_value);
    case TYPE_UINT64:
        return std::to_string(value.uint64_value);
    case TYPE_STRING:
    case TYPE_DATETIME:
        return std::string("\"") + value.string_value + '"';
    default:
        return "of type " + std::to_string(property.type);
    }
}

void row(const char* kind, const std::string& name, const std::string& type,
         const std::string& flags, const std::string& value) {
    std::printf("%s\t%s\t%s\t%s\t%s\n", kind, name.c_str(), type.c_str(), flags.c_str(),
                value.c_str());
}

void print(const std::string& owner, const Meta_Feature& feature);

void print_method(const std::string& name, const Meta_Method& method) {
    row("method", name, type_name(method.return_type), words(method.flags, FLAG_METHOD), "-");
    for (uint32 i = 0; i + 1 < method.num_meta_features; i++) // the last is the return value
        print(name, *method.meta_features[i]);
}

void print(const std::string& owner, const Meta_Feature& feature) {
    const std::string name = owner + "." + feature.name;
    if (feature.flags & FLAG_METHOD)
        return print_method(name, static_cast<const Meta_Method&>(feature));
    if (feature.flags & FLAG_REFERENCE) {
        const auto& reference = static_cast<const Meta_Reference&>(feature);
        return row("reference", name, reference.meta_class->name + array(reference.subscript),
                   words(feature.flags, FLAG_REFERENCE), "-");
    }
    const auto& property = static_cast<const Meta_Property&>(feature);
    row("property", name, type_name(property.type) + array(property.subscript),
        words(feature.flags, FLAG_PROPERTY), text(property));
}

void print(const Meta_Class& meta_class) {
    const Meta_Class* super = meta_class.super_meta_class;
    row("class", meta_class.name, super ? super->name : "-", words(meta_class.flags, 0),
        std::to_string(meta_class.num_keys));
    for (uint32 i = 0; i < meta_class.num_meta_features; i++)
        if (meta_class.locals[i])
            print(meta_class.name, *meta_class.meta_features[i]);
}

} // namespace

int main() {
    std::puts("# kind, name, type (or superclass, or target), flags, default (or number of keys)");
    for (uint32 i = 0; i < meta_repository.num_meta_classes; i++)
        print(*meta_repository.meta_classes[i]);
}
