// A reader of MOF, the Managed Object Format of the DMTF's DSP0004, and a view of the classes read.
//
// Two layers: a document is what the files say, class by class, feature by feature; a Schema is the
// same resolved, with inherited features in place. The library knows nothing of the engine. Every
// fault is an Error that tells file, line and column; hostile bytes give an Error and nothing
// worse. Names compare without regard to case throughout. Nothing here is shared between threads by
// itself; a finished Schema may be read by any number of them.
#ifndef SCHEMA_MOF_PARSER_MOF_H
#define SCHEMA_MOF_PARSER_MOF_H

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace mof {

struct Position {
    std::shared_ptr<const std::string> file;
    std::uint32_t line = 0;   // from 1
    std::uint32_t column = 0; // from 1, in bytes
};
// "file:line:column"
std::string to_string(const Position& position);

// what() is "file:line:column: reason".
class Error : public std::runtime_error {
public:
    Error(Position where, std::string reason);
    const Position& where() const noexcept { return _where; }
    const std::string& reason() const noexcept { return _reason; }

private:
    Position _where;
    std::string _reason;
};

// The intrinsic types, and reference for "Class ref".
enum class Type : std::uint8_t {
    boolean = 0,
    uint8,
    sint8,
    uint16,
    sint16,
    uint32,
    sint32,
    uint64,
    sint64,
    real32,
    real64,
    char16,
    string,
    datetime,
    reference,
};
const char* type_name(Type type); // "ref" for a reference
std::optional<Type> type_by_name(std::string_view name);

bool same_name(std::string_view a, std::string_view b);
// The ordering that goes with same_name.
struct Name_Less {
    using is_transparent = void;
    bool operator()(std::string_view a, std::string_view b) const;
};

// A default or a qualifier's value, already fitted to the type that it is for: an integer written
// for a real property is a real, a number that the type cannot hold is an Error.
struct Value {
    enum class Kind : std::uint8_t { null, boolean, integer, real, text, character, array };
    Kind kind = Kind::null;
    bool boolean = false;
    bool negative = false;       // integer: below zero
    std::uint64_t magnitude = 0; // integer: its absolute value; character: its code
    double real = 0;
    std::string text; // string, and a datetime in its 25 characters
    std::vector<Value> elements;
    Position position;

    std::int64_t as_signed() const noexcept; // of an integer that fits
};

struct Qualifier {
    std::string name;
    Value value; // true where the MOF states none
    Position position;
};
using Qualifiers = std::vector<Qualifier>;

const Qualifier* find(const Qualifiers& qualifiers, std::string_view name);
// Whether the list has the boolean qualifier with the value true; absent gives otherwise.
bool is_true(const Qualifiers& qualifiers, std::string_view name, bool otherwise = false);

inline constexpr int scalar = 0;
inline constexpr int variable_array = -1;

// What parameters and features have in common.
struct Declaration {
    std::string name;
    Qualifiers qualifiers;
    Type type = Type::string; // of a method: its return type
    int array = scalar;       // variable_array, or the length of a fixed array
    std::string target;       // class of a reference; of the value, with EmbeddedInstance("Class")
    Position position;        // of the name

    // A string that holds an object: EmbeddedInstance("Class"), or EmbeddedObject (no target).
    bool is_embedded() const;
};

struct Parameter : Declaration {
    bool is_in() const { return is_true(qualifiers, "In", true); }
    bool is_out() const { return is_true(qualifiers, "Out"); }
};

enum class Feature_Kind : std::uint8_t { property, reference, method };

struct Feature : Declaration {
    Feature_Kind kind = Feature_Kind::property;
    std::optional<Value> default_value; // also for an explicit "= null"
    std::vector<Parameter> parameters;
    std::string text; // as written, from its qualifiers to the semicolon
    bool is_override() const { return find(qualifiers, "Override") != nullptr; }
};

struct Class {
    std::string name;
    std::string superclass; // empty at a root
    Qualifiers qualifiers;
    std::vector<Feature> features; // in the order of declaration
    Position position;             // of the name
    Position superclass_position;
    std::string text; // as written, from its qualifiers to the semicolon
};

// "Qualifier Key : boolean = false, Scope(...), Flavor(...);". Scopes and flavours are in their
// words.
struct Qualifier_Declaration {
    std::string name;
    Type type = Type::boolean;
    int array = scalar;
    std::optional<Value> default_value;
    std::vector<std::string> scopes;
    std::vector<std::string> flavors;
    Position position;
};

struct Document {
    std::vector<Qualifier_Declaration> qualifiers;
    std::vector<Class> classes;
    std::vector<std::string> files; // every file read, in the order of its first line
};

// Contents of a file by path, nothing if it cannot be read.
using Reader = std::function<std::optional<std::string>(const std::string& path)>;
std::optional<std::string> read_file(const std::string& path);

// Reads a file and what it includes; an include is sought beside the file that names it. Throws
// Error, also for a file that cannot be read.
Document parse_file(const std::string& path, const Reader& reader = read_file);
// Reads a text; without a reader an include is an error.
Document parse_text(std::string_view text, const std::string& file_name,
                    const Reader& reader = nullptr);

// ---- The resolved view ----

struct Schema_Class;

struct Schema_Feature {
    const Feature* feature = nullptr;     // as the nearest class declares it
    const Schema_Class* owner = nullptr;  // the class of that declaration
    const Schema_Class* origin = nullptr; // the class that first declares the name
    const Feature* first = nullptr;       // the declaration there
    bool local = false;                   // declared or overridden by the class itself
    bool key = false;                     // also where an override does not restate Key
    const Value* default_value = nullptr; // an override without a default keeps the inherited one

    const std::string& name() const { return feature->name; }
    Feature_Kind kind() const { return feature->kind; }
};

struct Schema_Class {
    const Class* declaration = nullptr;
    const Schema_Class* superclass = nullptr;
    std::size_t number = 0;               // place in the order of declaration, from 0
    std::vector<Schema_Feature> features; // inherited ones first; an override keeps the old place
    std::uint32_t num_keys = 0;
    bool is_association = false; // itself or by inheritance

    const std::string& name() const { return declaration->name; }
    const Qualifiers& qualifiers() const { return declaration->qualifiers; }
    const Schema_Feature* find(std::string_view name) const; // null: no such feature
};

// Owns the document. Throws Error when a class is declared twice or before its superclass, a name
// is used twice, an inherited feature is redeclared without Override or with another type, a
// reference leaves its superclass's range, a class is named that does not exist, or (when the
// document declares qualifiers at all) a qualifier is unknown or of another type.
class Schema {
public:
    explicit Schema(Document document);
    Schema(Schema&&) noexcept = default;
    Schema& operator=(Schema&&) noexcept = default;

    const Document& document() const { return *_document; }
    // In the order of declaration. The pointers hold as long as the schema, moved or not.
    const std::vector<std::unique_ptr<const Schema_Class>>& classes() const { return _classes; }
    const Schema_Class* find(std::string_view name) const; // null: no such class

    // A class counts as its own subclass.
    static bool is_subclass(const Schema_Class* ancestor, const Schema_Class* descendant);
    bool is_subclass(std::string_view ancestor, std::string_view descendant) const;

    // A qualifier of a feature as it stands for the feature's class: an override that does not state
    // it has that of the declaration that it overrides. Null: none has it. Not for the few that are
    // not inherited.
    static const Qualifier* qualifier(const Schema_Feature& feature, std::string_view name);

private:
    std::unique_ptr<Document> _document;
    std::vector<std::unique_ptr<const Schema_Class>> _classes;
    std::map<std::string, const Schema_Class*, Name_Less> _by_name;
};

inline Schema load_schema(const std::string& path, const Reader& reader = read_file) {
    return Schema(parse_file(path, reader));
}

} // namespace mof

#endif // SCHEMA_MOF_PARSER_MOF_H
