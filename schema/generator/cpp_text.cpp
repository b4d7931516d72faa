#include "schema/generator/cpp_text.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <limits>

namespace generator {

namespace {

// Qualifiers that are bits of the engine's flag word. Association and Class, Key, In, Out and Read
// have rules of their own.
struct Flag_Word {
    const char* qualifier;
    const char* flag;
};
constexpr Flag_Word FLAG_WORDS[] = {
    {"Abstract", "FLAG_ABSTRACT"},
    {"Aggregate", "FLAG_AGGREGATE"},
    {"Aggregation", "FLAG_AGGREGATION"},
    {"Composition", "FLAG_COMPOSITION"},
    {"Counter", "FLAG_COUNTER"},
    {"Delete", "FLAG_DELETE"},
    {"DN", "FLAG_DN"},
    {"EmbeddedObject", "FLAG_EMBEDDED_OBJECT"},
    {"Exception", "FLAG_EXCEPTION"},
    {"Expensive", "FLAG_EXPENSIVE"},
    {"Experimental", "FLAG_EXPERIMENTAL"},
    {"Gauge", "FLAG_GAUGE"},
    {"IfDeleted", "FLAG_IF_DELETED"},
    {"Indication", "FLAG_INDICATION"},
    {"Invisible", "FLAG_INVISIBLE"},
    {"Large", "FLAG_LARGE"},
    {"OctetString", "FLAG_OCTETSTRING"},
    {"Required", "FLAG_REQUIRED"},
    {"Static", "FLAG_STATIC"},
    {"Terminal", "FLAG_TERMINAL"},
    {"Weak", "FLAG_WEAK"},
};

constexpr std::array<const char*, 14> VALUE_TYPES = {
    "boolean", "uint8",  "sint8",  "uint16", "sint16", "uint32", "sint32",
    "uint64",  "sint64", "real32", "real64", "char16", "String", "Datetime",
};
constexpr std::array<const char*, 14> TYPE_CODES = {
    "TYPE_BOOLEAN", "TYPE_UINT8",  "TYPE_SINT8",  "TYPE_UINT16",   "TYPE_SINT16",
    "TYPE_UINT32",  "TYPE_SINT32", "TYPE_UINT64", "TYPE_SINT64",   "TYPE_REAL32",
    "TYPE_REAL64",  "TYPE_CHAR16", "TYPE_STRING", "TYPE_DATETIME",
};

constexpr const char* KEYWORDS[] = {
    "alignas",       "alignof",     "and",
    "and_eq",        "asm",         "auto",
    "bitand",        "bitor",       "bool",
    "break",         "case",        "catch",
    "char",          "char8_t",     "char16_t",
    "char32_t",      "class",       "compl",
    "concept",       "const",       "consteval",
    "constexpr",     "constinit",   "const_cast",
    "continue",      "co_await",    "co_return",
    "co_yield",      "decltype",    "default",
    "delete",        "do",          "double",
    "dynamic_cast",  "else",        "enum",
    "explicit",      "export",      "extern",
    "false",         "float",       "for",
    "friend",        "goto",        "if",
    "inline",        "int",         "long",
    "mutable",       "namespace",   "new",
    "noexcept",      "not",         "not_eq",
    "nullptr",       "operator",    "or",
    "or_eq",         "private",     "protected",
    "public",        "register",    "reinterpret_cast",
    "requires",      "return",      "short",
    "signed",        "sizeof",      "static",
    "static_assert", "static_cast", "struct",
    "switch",        "template",    "this",
    "thread_local",  "throw",       "true",
    "try",           "typedef",     "typeid",
    "typename",      "union",       "unsigned",
    "using",         "virtual",     "void",
    "volatile",      "wchar_t",     "while",
    "xor",           "xor_eq",
};

void add_words(std::string& flags, const mof::Qualifiers& qualifiers) {
    for (const Flag_Word& word : FLAG_WORDS)
        if (mof::is_true(qualifiers, word.qualifier))
            flags += std::string(" | ") + word.flag;
    if (mof::find(qualifiers, "EmbeddedInstance"))
        flags += " | FLAG_EMBEDDED_INSTANCE";
}

std::string exact(double value) {
    char text[40];
    std::snprintf(text, sizeof text, "%.17g", value);
    std::string result = text;
    if (result.find_first_of(".e") == std::string::npos)
        result += ".0";
    return result;
}

} // namespace

std::string part_name(const char* stem, std::size_t part, const char* extension) {
    std::string number = std::to_string(part);
    if (number.size() < 2)
        number.insert(0, "0");
    return std::string(stem) + "_" + number + extension;
}

Span part_of(std::size_t size, std::size_t part, std::size_t parts) {
    return {size * part / parts, size * (part + 1) / parts};
}

bool is_provided(const mof::Schema_Class& schema_class) {
    return schema_class.name().rfind("VLNMPCA_", 0) == 0;
}

bool is_pointer(const mof::Declaration& declaration) {
    return declaration.type == mof::Type::reference || declaration.is_embedded();
}

std::string pointee(const mof::Declaration& declaration) {
    return declaration.target.empty() ? "Instance" : declaration.target;
}

std::string value_type(mof::Type type) {
    return VALUE_TYPES.at(static_cast<std::size_t>(type));
}

std::string type_code(mof::Type type) {
    return TYPE_CODES.at(static_cast<std::size_t>(type));
}

std::string member_type(const mof::Declaration& declaration) {
    bool pointer = is_pointer(declaration);
    std::string type = pointer ? pointee(declaration) + "*" : value_type(declaration.type);
    if (declaration.array != mof::scalar)
        return "Property<Array<" + type + ">>";
    return pointer ? type : "Property<" + type + ">";
}

std::string method_type(const std::string& class_name, const mof::Feature& method) {
    return class_name + "_" + method.name + "_method";
}

std::string class_flags(const mof::Schema_Class& schema_class) {
    std::string flags = schema_class.is_association ? "FLAG_ASSOCIATION" : "FLAG_CLASS";
    add_words(flags, schema_class.qualifiers());
    return flags;
}

// Read is a property's own unless the MOF denies it; references and methods are not read or
// written.
std::string feature_flags(const mof::Schema_Feature& feature) {
    const mof::Feature& declared = *feature.feature;
    std::string flags = feature.kind() == mof::Feature_Kind::method ? "FLAG_METHOD"
                        : is_pointer(declared)                      ? "FLAG_REFERENCE"
                                                                    : "FLAG_PROPERTY";
    if (feature.key)
        flags += " | FLAG_KEY";
    if (feature.kind() == mof::Feature_Kind::property &&
        mof::is_true(declared.qualifiers, "Read", true))
        flags += " | FLAG_READ";
    add_words(flags, declared.qualifiers);
    // What a modify of our own classes changes is a word for clients, as their descriptions are:
    // the provider decides by itself what it takes.
    if (mof::is_true(declared.qualifiers, "Write") && !is_provided(*feature.owner))
        flags += " | FLAG_WRITE";
    return flags;
}

std::string parameter_flags(const mof::Parameter& parameter) {
    std::string flags = is_pointer(parameter) ? "FLAG_REFERENCE" : "FLAG_PROPERTY";
    if (parameter.is_in())
        flags += " | FLAG_IN";
    if (parameter.is_out())
        flags += " | FLAG_OUT";
    add_words(flags, parameter.qualifiers);
    return flags;
}

std::string literal(const std::string& text) {
    std::string quoted = "\"";
    for (char c : text) {
        auto byte = static_cast<unsigned char>(c);
        if (c == '"' || c == '\\' || c == '?') {
            quoted += '\\';
            quoted += c;
        } else if (byte >= ' ' && byte <= '~') {
            quoted += c;
        } else {
            char octal[5]; // always three digits: a digit that follows is not drawn in
            std::snprintf(octal, sizeof octal, "\\%03o", byte);
            quoted += octal;
        }
    }
    return quoted + "\"";
}

std::string element_literal(const mof::Value& value, mof::Type type) {
    using mof::Type;
    switch (type) {
    case Type::boolean:
        return value.boolean ? "true" : "false";
    case Type::real32:
        return "static_cast<real32>(" + exact(value.real) + ")";
    case Type::real64:
        return exact(value.real);
    case Type::char16:
        return "static_cast<char16>(" + std::to_string(value.magnitude) + ")";
    case Type::string:
    case Type::datetime:
        return value.kind == mof::Value::Kind::null ? "nullptr" : literal(value.text);
    default:
        break;
    }
    // The smallest number of 64 bits has no literal of its own.
    if (value.negative && value.as_signed() == std::numeric_limits<std::int64_t>::min())
        return "-9223372036854775807 - 1";
    return (value.negative ? "-" : "") + std::to_string(value.magnitude) +
           (type == Type::uint64 ? "u" : "");
}

std::string element_type(mof::Type type) {
    bool text = type == mof::Type::string || type == mof::Type::datetime;
    return text ? "const char*" : value_type(type);
}

std::string scalar_initializer(const mof::Value& value, mof::Type type) {
    // A datetime is kept as its text, like a string.
    mof::Type member = type == mof::Type::datetime ? mof::Type::string : type;
    return std::string(".") + mof::type_name(member) + "_value = " + element_literal(value, type);
}

bool is_cpp_keyword(const std::string& word) {
    return std::find(std::begin(KEYWORDS), std::end(KEYWORDS), word) != std::end(KEYWORDS);
}

} // namespace generator
