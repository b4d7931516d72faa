// The meta model: static records that describe every class the library serves.
//
// One Meta_Class per class, with its features and qualifiers, written by the generator into
// constant tables. All handling of instances (create, copy, compare, convert) is driven by these
// records. Static records hold refs 0, are neither counted nor freed, and lie in read-only memory;
// heap copies start at 1.
#ifndef CIMPLE_META_H
#define CIMPLE_META_H

#include "cimple/types.h"

#include <memory>

namespace cimple {

struct Meta_Class;
struct Meta_Repository;

// Flag bits; the words that print and parse them stand in meta.cpp, row n for bit n.
enum Meta_Flag : uint32 {
    FLAG_PROPERTY = 1u << 0,
    FLAG_REFERENCE = 1u << 1,
    FLAG_METHOD = 1u << 2,
    FLAG_CLASS = 1u << 3,
    FLAG_ABSTRACT = 1u << 4,
    FLAG_AGGREGATE = 1u << 5,
    FLAG_AGGREGATION = 1u << 6,
    FLAG_ASSOCIATION = 1u << 7,
    FLAG_COMPOSITION = 1u << 8,
    FLAG_COUNTER = 1u << 9,
    FLAG_DELETE = 1u << 10,
    FLAG_DN = 1u << 11,
    FLAG_EMBEDDED_OBJECT = 1u << 12,
    FLAG_EXCEPTION = 1u << 13,
    FLAG_EXPENSIVE = 1u << 14,
    FLAG_EXPERIMENTAL = 1u << 15,
    FLAG_GAUGE = 1u << 16,
    FLAG_IF_DELETED = 1u << 17,
    FLAG_IN = 1u << 18,
    FLAG_INDICATION = 1u << 19,
    FLAG_INVISIBLE = 1u << 20,
    FLAG_KEY = 1u << 21,
    FLAG_LARGE = 1u << 22,
    FLAG_OCTETSTRING = 1u << 23,
    FLAG_OUT = 1u << 24,
    FLAG_READ = 1u << 25,
    FLAG_REQUIRED = 1u << 26,
    FLAG_STATIC = 1u << 27,
    FLAG_TERMINAL = 1u << 28,
    FLAG_WEAK = 1u << 29,
    FLAG_WRITE = 1u << 30,
    FLAG_EMBEDDED_INSTANCE = 1u << 31,
};

inline constexpr uint32 FLAG_FEATURE = FLAG_PROPERTY | FLAG_REFERENCE | FLAG_METHOD;
inline constexpr uint32 FLAG_EMBEDDED = FLAG_EMBEDDED_OBJECT | FLAG_EMBEDDED_INSTANCE;

struct Meta_Array_Value {
    const void* elements; // num_elements values in their natural width; strings as char pointers
    uint32 num_elements;
};

// A default or qualifier value: a scalar in its natural width, a string or datetime (CIM text) as a
// char pointer, or an array.
union Meta_Value {
    boolean boolean_value;
    uint8 uint8_value;
    sint8 sint8_value;
    uint16 uint16_value;
    sint16 sint16_value;
    uint32 uint32_value;
    sint32 sint32_value;
    uint64 uint64_value;
    sint64 sint64_value;
    real32 real32_value;
    real64 real64_value;
    char16 char16_value;
    const char* string_value;
    Meta_Array_Value array_value;
};

struct Meta_Qualifier {
    Atomic refs;
    const char* name;
    uint8 type;
    uint8 array;
    const Meta_Value* value;
};

// Head of every feature record; bit 0, 1 or 2 of flags tells which record it is.
struct Meta_Feature {
    Atomic refs;
    uint32 flags;
    const char* name;
    const Meta_Qualifier* const* meta_qualifiers;
    uint32 num_meta_qualifiers;
};

struct Meta_Property : Meta_Feature {
    uint16 type;             // a Type
    sint16 subscript;        // 0 scalar, -1 variable array, above 0 fixed array of that length
    uint32 offset;           // of the Property in the instance
    const Meta_Value* value; // null: no default
};

struct Meta_Reference : Meta_Feature {
    sint16 subscript; // non-zero for an array of references
    const Meta_Class* meta_class;
    uint32 offset;
};

// What classes and methods share: a head and a list of features with the size of the instance
// structure. It lets one routine walk, create and copy both.
struct Meta_Features : Meta_Feature {
    const Meta_Feature* const* meta_features; // inherited ones first, in the structure's order
    uint32 num_meta_features;
    uint32 size; // bytes of the generated instance structure
};

// A method is a class-like record: the adapter builds a method instance from it. Its last feature
// is always the property "return_value" with the flag Out.
struct Meta_Method : Meta_Features {
    uint16 return_type;
};

// Of a key name, without regard to case: eight characters at a time, since names are long. It takes
// a few other characters for equal as well, as a hash may.
constexpr uint64 key_name_hash(const char* name) {
    constexpr uint64 LOWER = 0x2020202020202020u;
    uint64 hash = 0;
    while (*name) {
        uint64 word = 0;
        for (unsigned shift = 0; shift < 64 && *name; shift += 8)
            word |= uint64{static_cast<uint8>(*name++)} << shift;
        hash = (hash ^ (word | LOWER)) * 0x9E3779B97F4A7C15u;
        hash ^= hash >> 32;
    }
    return hash;
}

// Where a key stands among the features of its class.
struct Meta_Key {
    uint64 name_hash; // key_name_hash of its name
    uint32 feature;
};

struct Meta_Class : Meta_Features {
    const uint8* locals; // one per feature: 1 where this class declares or overrides it
    const Meta_Class* super_meta_class; // null at a root
    uint32 num_keys;
    const Meta_Repository* meta_repository;
    const Meta_Key* keys = nullptr; // num_keys of them, ascending
};

// The classes, with a table that finds them by name: name_slot tells where a name stands, unless
// other names do there; then it stands in the next slot that is not theirs.
struct Meta_Repository {
    const Meta_Class* const* meta_classes;
    uint32 num_meta_classes;
    const uint16* name_slots = nullptr; // position of a class plus 1, or 0
    uint32 num_name_slots = 0;          // a power of two, more than there are classes; 0: no table
};

// ---- Counting. A static record (refs 0) stays at 0; dropping the last count frees a heap copy.
// ----

void ref(const Meta_Class* meta_class);
void unref(const Meta_Class* meta_class);

// ---- Look-up. Names compare without regard to case; a null argument finds nothing. ----

const Meta_Class* find_meta_class(const Meta_Repository* repository, const char* name);
const Meta_Class* find_class_in_tree(const Meta_Class* meta_class, const char* name);
// First feature of that name whose flags share a bit with mask. Searches the class's own table,
// which holds the inherited features as well.
const Meta_Feature* find_feature(const Meta_Features* features, const char* name, uint32 mask);
const Meta_Property* find_property(const Meta_Features* features, const char* name);
const Meta_Reference* find_reference(const Meta_Features* features, const char* name);
const Meta_Method* find_method(const Meta_Class* meta_class, const char* name);

bool has_feature_flag(const Meta_Features* features, uint32 mask);

// The method as the class of its method instances: only what Meta_Features holds may be read
// through the result, as its flag Method tells.
inline const Meta_Class* as_class(const Meta_Method* method) {
    return static_cast<const Meta_Class*>(static_cast<const Meta_Features*>(method));
}

// ---- Relations ----

// The class itself counts as its own subclass; the pseudo-class Instance is everybody's ancestor.
bool is_subclass(const Meta_Class* ancestor, const Meta_Class* descendant);
// 0 subclass, 1 not, -1 for a null argument or an unknown name.
int is_subclass_by_name(const Meta_Repository* repository, const char* ancestor_name,
                        const char* descendant_name);
// deep also compares locals, super class and number of keys.
bool identical(const Meta_Class* a, const Meta_Class* b, bool deep = false);

// ---- Types ----

// Code of one of the 14 type words in any case; TYPE_NONE for another text.
Type type_name_to_code(const char* text);
const char* type_name(uint32 type);
// Bytes a scalar of the type takes in an instance, without its null flag.
inline constexpr uint8 TYPE_SIZES[NUM_TYPES] = {
    sizeof(boolean), sizeof(uint8),  sizeof(sint8),  sizeof(uint16), sizeof(sint16),
    sizeof(uint32),  sizeof(sint32), sizeof(uint64), sizeof(sint64), sizeof(real32),
    sizeof(real64),  sizeof(char16), sizeof(void*),  sizeof(void*),
};
constexpr uint32 type_size(uint32 type) noexcept {
    return type < NUM_TYPES ? TYPE_SIZES[type] : sizeof(void*);
}
// Word of a flag bit, 0 to 31.
const char* flag_name(uint32 bit);
// Bit mask of a flag word in any case, 0 if there is none.
uint32 flag_by_name(const char* word);

// Equal without regard to case. The folded first character is tested before anything else, which is
// what keeps linear look-ups cheap. Null equals null only.
bool name_equal(const char* a, const char* b);

// ---- Classes made at run time ----

// A new class: empty without a base (refs 1, the given flags, the size of the instance head), else
// a deep copy of the base with the base's flags, no longer abstract, with the base as its counted
// super class and no local features. The caller owns one count, and is the only one who may change
// the class. Throws std::bad_alloc.
Meta_Class* create_meta_class(const char* name, const Meta_Class* base, uint32 flags);

// The count of whoever makes a class.
struct Class_Releaser {
    void operator()(const Meta_Class* meta_class) const { unref(meta_class); }
};
using Class_Handle = std::unique_ptr<Meta_Class, Class_Releaser>;

// Removes the named qualifiers, or all when names is null, from a class made at run time, from its
// features and from the parameters of its methods. A static class is left alone.
void remove_qualifiers(Meta_Class* meta_class, const char* const* names, uint32 count);

// ---- Printing, a diagnostic facility (standard output) ----

struct Print_Options {
    bool local_only = false; // skip features that the class only inherits
    bool qualifiers = false;
};
void print(const Meta_Class* meta_class, const Print_Options& options = {});

} // namespace cimple

#endif // CIMPLE_META_H
