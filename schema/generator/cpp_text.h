// How the catalogue's names, types, flags and values look in C++.
#ifndef SCHEMA_GENERATOR_CPP_TEXT_H
#define SCHEMA_GENERATOR_CPP_TEXT_H

#include "schema/mof_parser/mof.h"

namespace generator {

inline constexpr const char* BANNER =
    "// Made by vln_generator from schema/mof; changes belong there.\n";

// "meta", 3, ".cpp" gives "meta_03.cpp".
std::string part_name(const char* stem, std::size_t part, const char* extension);

// Items [begin, end) of a list that is split into parts as equal as can be.
struct Span {
    std::size_t begin;
    std::size_t end;
};
Span part_of(std::size_t size, std::size_t part, std::size_t parts);

// Of a class that we provide, as opposed to one that we only describe.
bool is_provided(const mof::Schema_Class& schema_class);

// A reference in the engine's sense: a pointer to an instance, which embedded objects are as well.
bool is_pointer(const mof::Declaration& declaration);
// The class that a pointer points to: "Instance" for EmbeddedObject.
std::string pointee(const mof::Declaration& declaration);
// "uint32", "String", ...
std::string value_type(mof::Type type);
// The type of the structure's member: Property<uint32>, Property<Array<String>>, CIM_System*, ...
std::string member_type(const mof::Declaration& declaration);
// "TYPE_UINT32", ...
std::string type_code(mof::Type type);

// "VLNMPCA_Card_Reset_method": the structure of a method that the class declares.
std::string method_type(const std::string& class_name, const mof::Feature& method);

// "FLAG_PROPERTY | FLAG_KEY | FLAG_READ"
std::string class_flags(const mof::Schema_Class& schema_class);
std::string feature_flags(const mof::Schema_Feature& feature);
std::string parameter_flags(const mof::Parameter& parameter);

// A text literal with its quotes.
std::string literal(const std::string& text);
// The initialiser of a Meta_Value for one scalar: ".uint16_value = 5".
std::string scalar_initializer(const mof::Value& value, mof::Type type);
// A scalar as an element of a constant array, and that array's element type.
std::string element_literal(const mof::Value& value, mof::Type type);
std::string element_type(mof::Type type);

// Whether the word is free to be a member's name.
bool is_cpp_keyword(const std::string& word);

} // namespace generator

#endif // SCHEMA_GENERATOR_CPP_TEXT_H
