// What clients of the object manager work with: values, object paths and instances as plain data.
//
// Nothing here knows CMPI objects: the manager copies everything out of them before a call ends, so
// a reply stays good for as long as its holder likes. Copies are deep in effect (what is shared is
// immutable). Names of classes, keys and properties compare without regard to case.
#ifndef HOST_VALUE_H
#define HOST_VALUE_H

#include "cmpi/cmpi.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace host {

struct ObjectPath;
struct Instance;

// A typed value or a typed null. The type is the CMPI code, with CMPI_ARRAY for an array; texts are
// always CMPI_string, however they were handed in.
struct Value {
    using Array = std::vector<Value>; // elements have the element type; some may be null
    using Data =
        std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double, std::string,
                     std::shared_ptr<const ObjectPath>, std::shared_ptr<const Instance>, Array>;

    CMPIType type = CMPI_null;
    Data data; // uint64_t also for char16, string also for a datetime in its 25 characters

    static Value null(CMPIType type) { return Value{type, {}}; }
    static Value boolean(bool value) { return {CMPI_boolean, value}; }
    static Value unsigned_number(CMPIType type, std::uint64_t value) { return {type, value}; }
    static Value signed_number(CMPIType type, std::int64_t value) { return {type, value}; }
    static Value real(CMPIType type, double value) { return {type, value}; }
    static Value text(std::string value) { return {CMPI_string, std::move(value)}; }
    static Value datetime(std::string value) { return {CMPI_dateTime, std::move(value)}; }
    static Value reference(ObjectPath value);
    static Value instance(Instance value);
    static Value array(CMPIType element_type, Array elements);

    bool is_null() const { return std::holds_alternative<std::monostate>(data); }
    bool is_array() const { return (type & CMPI_ARRAY) != 0; }
    CMPIType element_type() const { return static_cast<CMPIType>(type & ~CMPI_ARRAY); }

    // Each answers a neutral value (0, empty) when the value is null or of another kind.
    bool as_boolean() const;
    std::uint64_t as_unsigned() const; // a negative number answers 0
    std::int64_t as_signed() const;    // a number that does not fit answers 0
    double as_real() const;
    const std::string& as_text() const;
    const ObjectPath* as_reference() const; // null when it is none
    const Instance* as_instance() const;    // null when it is none
    const Array& as_array() const;

    bool operator==(const Value& other) const; // types count: uint8 1 is not uint16 1
};

struct Named_Value {
    std::string name;
    Value value;
};
using Named_Values = std::vector<Named_Value>;

const Value* find(const Named_Values& values, std::string_view name); // null: not there
void set(Named_Values& values, std::string_view name, Value value);   // sets or replaces

// The name of an object. Keys stand in the order of the class.
struct ObjectPath {
    std::string name_space;
    std::string class_name;
    Named_Values keys;

    const Value* key(std::string_view name) const { return find(keys, name); }
    // The same object: order of the keys and case of the names do not matter.
    bool operator==(const ObjectPath& other) const;
};

struct Instance {
    ObjectPath path;
    Named_Values properties; // those that were set, in the order of the class

    const std::string& class_name() const { return path.class_name; }
    const Value* property(std::string_view name) const { return find(properties, name); }
    bool operator==(const Instance& other) const;
};

// ---- CMPI words ----

struct Status {
    CMPIrc rc = CMPI_RC_OK;
    std::string message; // in plain words; may be empty

    bool ok() const { return rc == CMPI_RC_OK; }
};

// "CMPI_RC_ERR_NOT_FOUND"; a number that the interface does not name gives "CMPI_RC_<number>".
std::string rc_name(CMPIrc rc);
// What the code means, as a sentence for people.
std::string rc_sentence(CMPIrc rc);

// The name of a type as MOF has it, "uint16" or "string[]"; "ref" for a reference.
std::string type_name(CMPIType type);

bool is_unsigned(CMPIType type); // of a scalar type
bool is_signed(CMPIType type);
bool is_real(CMPIType type);
// Whether an integer of this scalar type can hold the number.
bool fits_unsigned(CMPIType type, std::uint64_t value);
bool fits_signed(CMPIType type, std::int64_t value);

} // namespace host

#endif // HOST_VALUE_H
