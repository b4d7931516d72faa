// The classes that the object manager knows, read from MOF, in the form that its checks need.
//
// Built once, then read by any number of threads. Pointers to classes hold as long as the
// repository.
#ifndef HOST_CLASS_REPOSITORY_H
#define HOST_CLASS_REPOSITORY_H

#include "host/text.h"
#include "host/value.h"
#include "schema/mof_parser/word_map.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace host {

struct Class;

// What the MOF tells people of a property, a parameter or a method.
struct Meaning {
    std::string description;
    std::string unit;                   // as PUnit has it
    std::optional<mof::Word_Map> words; // of values
    std::optional<mof::Word_Map> bits;  // of the bits of a value, the lowest is 0
};

// What a property, a parameter and the result of a method have in common.
struct Slot_Type {
    CMPIType type = CMPI_string; // an embedded object has the type string, as in MOF
    bool embedded = false;
    const Class* target = nullptr; // of a reference or an embedded instance; null: any class
    std::shared_ptr<const Meaning> meaning = nullptr; // null: the MOF says nothing
};

// The word for a value that is no array, or the words for its bits; nothing: the MOF has none.
std::optional<std::string> word_of(const Slot_Type& slot, const Value& value);

struct Property : Slot_Type {
    std::string name;
    bool key = false;
    Value default_value = {}; // null: none
    bool is_reference() const { return (type & ~CMPI_ARRAY) == CMPI_ref; }
};

struct Parameter : Slot_Type {
    std::string name;
    bool in = true;
    bool out = false;
};

struct Method {
    std::string name;
    Slot_Type result; // with the meaning of the method
    bool is_static = false;
    std::vector<Parameter> parameters;
    const Parameter* find(std::string_view name) const;
};

struct Class {
    std::string name;
    const Class* superclass = nullptr;
    std::vector<Property> properties; // inherited ones first; references are among them
    std::vector<Method> methods;
    std::vector<std::size_t> keys; // indices of properties
    std::string text;              // the declaration in MOF; empty for a class of the platform file
    std::string description;
    bool is_association = false;

    static constexpr std::size_t npos = static_cast<std::size_t>(-1);
    std::size_t index_of(std::string_view property) const; // npos: no such property
    const Property* find_property(std::string_view name) const;
    const Method* find_method(std::string_view name) const;
    bool is_a(const Class* ancestor) const; // a class is itself, too
    std::vector<std::string> property_names() const;

    Name_Map<std::size_t> index; // of properties by name
};

class ClassRepository {
public:
    // One more class, without properties of its own, as a platform file may declare it.
    struct Extra_Class {
        std::string name;
        std::string superclass; // empty: none
    };

    // Throws mof::Error for a file that cannot be read or is malformed.
    explicit ClassRepository(const std::string& mof_path);
    ClassRepository(const ClassRepository&) = delete;
    ClassRepository& operator=(const ClassRepository&) = delete;

    // Adds a class before the repository is shared; says what is wrong, or nothing.
    std::optional<std::string> add(const Extra_Class& extra);

    const Class* find(std::string_view name) const; // null: unknown
    // In the order of the MOF, then the extra ones in the order of addition.
    const std::vector<std::unique_ptr<Class>>& classes() const { return _classes; }
    std::vector<std::string> names() const;

private:
    Class& append(std::string name, const Class* superclass);
    void fill(Class& target, const mof::Schema_Class& source);
    Slot_Type slot_of(const mof::Declaration& declaration) const; // without meaning
    Method method_of(const mof::Feature& declared, Slot_Type result) const;

    std::vector<std::unique_ptr<Class>> _classes;
    Name_Map<const Class*> _by_name;
};

} // namespace host

#endif // HOST_CLASS_REPOSITORY_H
