#include "host/value.h"

#include "host/text.h"

#include <algorithm>
#include <limits>

namespace host {

Value Value::reference(ObjectPath value) {
    return {CMPI_ref, std::make_shared<const ObjectPath>(std::move(value))};
}

Value Value::instance(Instance value) {
    return {CMPI_instance, std::make_shared<const Instance>(std::move(value))};
}

Value Value::array(CMPIType element_type, Array elements) {
    return {static_cast<CMPIType>(element_type | CMPI_ARRAY), std::move(elements)};
}

bool Value::as_boolean() const {
    const bool* value = std::get_if<bool>(&data);
    return value && *value;
}

std::uint64_t Value::as_unsigned() const {
    if (const auto* value = std::get_if<std::uint64_t>(&data))
        return *value;
    const auto* value = std::get_if<std::int64_t>(&data);
    return value && *value > 0 ? static_cast<std::uint64_t>(*value) : 0;
}

std::int64_t Value::as_signed() const {
    if (const auto* value = std::get_if<std::int64_t>(&data))
        return *value;
    const auto* value = std::get_if<std::uint64_t>(&data);
    constexpr auto most = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
    return value && *value <= most ? static_cast<std::int64_t>(*value) : 0;
}

double Value::as_real() const {
    const double* value = std::get_if<double>(&data);
    return value ? *value : 0;
}

const std::string& Value::as_text() const {
    static const std::string empty;
    const std::string* value = std::get_if<std::string>(&data);
    return value ? *value : empty;
}

const ObjectPath* Value::as_reference() const {
    const auto* value = std::get_if<std::shared_ptr<const ObjectPath>>(&data);
    return value ? value->get() : nullptr;
}

const Instance* Value::as_instance() const {
    const auto* value = std::get_if<std::shared_ptr<const Instance>>(&data);
    return value ? value->get() : nullptr;
}

const Value::Array& Value::as_array() const {
    static const Array empty;
    const Array* value = std::get_if<Array>(&data);
    return value ? *value : empty;
}

bool Value::operator==(const Value& other) const {
    if (type != other.type || data.index() != other.data.index())
        return false;
    if (const ObjectPath* path = as_reference())
        return *path == *other.as_reference();
    if (const Instance* instance = as_instance())
        return *instance == *other.as_instance();
    return data == other.data;
}

const Value* find(const Named_Values& values, std::string_view name) {
    for (const Named_Value& value : values)
        if (same_name(value.name, name))
            return &value.value;
    return nullptr;
}

void set(Named_Values& values, std::string_view name, Value value) {
    for (Named_Value& old : values) {
        if (same_name(old.name, name)) {
            old.value = std::move(value);
            return;
        }
    }
    values.push_back({std::string(name), std::move(value)});
}

namespace {

bool same_values(const Named_Values& a, const Named_Values& b) {
    return a.size() == b.size() && std::all_of(a.begin(), a.end(), [&](const Named_Value& named) {
               const Value* other = find(b, named.name);
               return other && *other == named.value;
           });
}

} // namespace

bool ObjectPath::operator==(const ObjectPath& other) const {
    return same_name(name_space, other.name_space) && same_name(class_name, other.class_name) &&
           same_values(keys, other.keys);
}

bool Instance::operator==(const Instance& other) const {
    return path == other.path && same_values(properties, other.properties);
}

namespace {

struct Code {
    CMPIrc rc;
    const char* name;
    const char* sentence;
};

constexpr Code CODES[] = {
    {CMPI_RC_OK, "CMPI_RC_OK", "no error"},
    {CMPI_RC_ERR_FAILED, "CMPI_RC_ERR_FAILED", "the operation failed"},
    {CMPI_RC_ERR_ACCESS_DENIED, "CMPI_RC_ERR_ACCESS_DENIED", "access denied"},
    {CMPI_RC_ERR_INVALID_NAMESPACE, "CMPI_RC_ERR_INVALID_NAMESPACE", "there is no such namespace"},
    {CMPI_RC_ERR_INVALID_PARAMETER, "CMPI_RC_ERR_INVALID_PARAMETER", "a parameter is not valid"},
    {CMPI_RC_ERR_INVALID_CLASS, "CMPI_RC_ERR_INVALID_CLASS", "there is no such class"},
    {CMPI_RC_ERR_NOT_FOUND, "CMPI_RC_ERR_NOT_FOUND", "there is no such object"},
    {CMPI_RC_ERR_NOT_SUPPORTED, "CMPI_RC_ERR_NOT_SUPPORTED", "the operation is not supported"},
    {CMPI_RC_ERR_CLASS_HAS_CHILDREN, "CMPI_RC_ERR_CLASS_HAS_CHILDREN", "the class has subclasses"},
    {CMPI_RC_ERR_CLASS_HAS_INSTANCES, "CMPI_RC_ERR_CLASS_HAS_INSTANCES", "the class has instances"},
    {CMPI_RC_ERR_INVALID_SUPERCLASS, "CMPI_RC_ERR_INVALID_SUPERCLASS",
     "there is no such superclass"},
    {CMPI_RC_ERR_ALREADY_EXISTS, "CMPI_RC_ERR_ALREADY_EXISTS", "the object exists already"},
    {CMPI_RC_ERR_NO_SUCH_PROPERTY, "CMPI_RC_ERR_NO_SUCH_PROPERTY", "there is no such property"},
    {CMPI_RC_ERR_TYPE_MISMATCH, "CMPI_RC_ERR_TYPE_MISMATCH", "the value has the wrong type"},
    {CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED",
     "the query language is not supported"},
    {CMPI_RC_ERR_INVALID_QUERY, "CMPI_RC_ERR_INVALID_QUERY", "the query is not valid"},
    {CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "CMPI_RC_ERR_METHOD_NOT_AVAILABLE",
     "the method is not available"},
    {CMPI_RC_ERR_METHOD_NOT_FOUND, "CMPI_RC_ERR_METHOD_NOT_FOUND", "there is no such method"},
    {CMPI_RC_DO_NOT_UNLOAD, "CMPI_RC_DO_NOT_UNLOAD", "the provider is not to be unloaded now"},
    {CMPI_RC_NEVER_UNLOAD, "CMPI_RC_NEVER_UNLOAD", "the provider is never to be unloaded"},
    {CMPI_RC_ERR_INVALID_HANDLE, "CMPI_RC_ERR_INVALID_HANDLE", "the object is not usable"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "CMPI_RC_ERR_INVALID_DATA_TYPE", "the data type is unknown"},
    {CMPI_RC_ERROR_SYSTEM, "CMPI_RC_ERROR_SYSTEM", "the operating system reported an error"},
    {CMPI_RC_ERROR, "CMPI_RC_ERROR", "an error of the object manager"},
};

const Code* find_code(CMPIrc rc) {
    for (const Code& code : CODES)
        if (code.rc == rc)
            return &code;
    return nullptr;
}

struct Type_Word {
    CMPIType type;
    const char* word;
};

constexpr Type_Word TYPE_WORDS[] = {
    {CMPI_null, "null"},         {CMPI_boolean, "boolean"}, {CMPI_char16, "char16"},
    {CMPI_real32, "real32"},     {CMPI_real64, "real64"},   {CMPI_uint8, "uint8"},
    {CMPI_uint16, "uint16"},     {CMPI_uint32, "uint32"},   {CMPI_uint64, "uint64"},
    {CMPI_sint8, "sint8"},       {CMPI_sint16, "sint16"},   {CMPI_sint32, "sint32"},
    {CMPI_sint64, "sint64"},     {CMPI_instance, "object"}, {CMPI_ref, "ref"},
    {CMPI_string, "string"},     {CMPI_chars, "chars"},     {CMPI_charsptr, "charsptr"},
    {CMPI_dateTime, "datetime"},
};

// Bits of an integer type, 0 for any other.
int bits(CMPIType type) {
    switch (type) {
    case CMPI_uint8:
    case CMPI_sint8:
        return 8;
    case CMPI_uint16:
    case CMPI_sint16:
    case CMPI_char16:
        return 16;
    case CMPI_uint32:
    case CMPI_sint32:
        return 32;
    case CMPI_uint64:
    case CMPI_sint64:
        return 64;
    default:
        return 0;
    }
}

} // namespace

std::string rc_name(CMPIrc rc) {
    const Code* code = find_code(rc);
    return code ? code->name : "CMPI_RC_" + std::to_string(static_cast<int>(rc));
}

std::string rc_sentence(CMPIrc rc) {
    const Code* code = find_code(rc);
    return code ? code->sentence : "an error with a number that the interface does not name";
}

std::string type_name(CMPIType type) {
    std::string suffix = (type & CMPI_ARRAY) != 0 ? "[]" : "";
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    for (const Type_Word& row : TYPE_WORDS)
        if (row.type == element)
            return row.word + suffix;
    return "type " + std::to_string(element) + suffix;
}

bool is_unsigned(CMPIType type) {
    return type == CMPI_uint8 || type == CMPI_uint16 || type == CMPI_uint32 || type == CMPI_uint64;
}

bool is_signed(CMPIType type) {
    return type == CMPI_sint8 || type == CMPI_sint16 || type == CMPI_sint32 || type == CMPI_sint64;
}

bool is_real(CMPIType type) {
    return type == CMPI_real32 || type == CMPI_real64;
}

bool fits_unsigned(CMPIType type, std::uint64_t value) {
    const int width = is_signed(type) ? bits(type) - 1 : bits(type);
    return width >= 64 || (width > 0 && (value >> width) == 0);
}

bool fits_signed(CMPIType type, std::int64_t value) {
    if (value >= 0)
        return fits_unsigned(type, static_cast<std::uint64_t>(value));
    const int width = bits(type);
    return is_signed(type) && (width == 64 || value >= -(std::int64_t{1} << (width - 1)));
}

} // namespace host
