// Instances: the head of every generated structure, and the generic operations on them.
//
// A generated structure derives from its base class's structure and adds the members the class
// declares, so a VLNMPCA_Card* is a CIM_Card* is an Instance*. Instances live on the heap, are made
// by create or clone, and are counted: whoever gets one from an operation here owns one count. None
// of these operations locks. An instance with more than one count is shared, and must not be
// written: Ref<const C> is a share, whoever wants to write makes a copy (a store: `change`,
// instance_map.h). What an association refers to is shared as well.
#ifndef CIMPLE_INSTANCE_H
#define CIMPLE_INSTANCE_H

#include "cimple/array.h"
#include "cimple/assert.h"
#include "cimple/datetime.h"
#include "cimple/meta.h"
#include "cimple/string.h"

#include <cstdio>
#include <type_traits>

namespace cimple {

// A value followed by its null flag. A nulled property keeps a valid, empty value.
template <class T>
struct Property {
    T value;
    uint8 null;

    void set(const T& v) {
        value = v;
        null = 0;
    }
    void clear() {
        value = T();
        null = 1;
    }
    // Appends to an array property and makes it non-null.
    template <class U>
    void append(const U& item) {
        value.append(item);
        null = 0;
    }
    bool is_null() const { return null != 0; }
};

inline constexpr uint32 INSTANCE_MAGIC = 0xF00DFACE;

struct Instance {
    uint32 __magic;
    mutable Atomic __refs;
    // For a method instance this is the Meta_Method seen as a class: only what Meta_Features holds
    // may be read through it then, as its flag Method tells.
    const Meta_Class* __meta_class;
    String __name_space;

    // The pseudo-class "Instance", ancestor of every class.
    static const Meta_Class static_meta_class;

    Instance() = delete; // create and clone make instances
    ~Instance() = delete;
    Instance(const Instance&) = delete;
    Instance& operator=(const Instance&) = delete;
};

// ---- Life ----

// A new instance. Without defaults every member is zero or empty and not null; with defaults a
// property takes its default, and is null without one. Counts the class. Throws std::bad_alloc.
Instance* create(const Meta_Class* meta_class, bool defaults = false);
// The same, with every member null.
Instance* create_null(const Meta_Class* meta_class);
// Deep copy with a count of its own; references are cloned, nulls stay null. Counts the class.
// Throws std::bad_alloc.
Instance* clone(const Instance* instance);
void ref(const Instance* instance) noexcept;
// Whether somebody else has a count too.
inline bool is_shared(const Instance* instance) noexcept {
    return instance->__refs.load(std::memory_order_acquire) > 1;
}
// Drops one count and destroys at zero. A null pointer is allowed here and in destroy.
void unref(const Instance* instance) noexcept;
// Tears down and frees whatever the count.
void destroy(Instance* instance) noexcept;

template <class T>
T* create(bool defaults = false) {
    return static_cast<T*>(create(&T::static_meta_class, defaults));
}

// A new instance with every property null, as map builders start from.
template <class T>
T* create_null();

// The instance as a T, or null if its class is no subclass of T's.
template <class T>
T* cast(Instance* instance) {
    return instance && is_subclass(&T::static_meta_class, instance->__meta_class)
               ? static_cast<T*>(instance)
               : nullptr;
}
template <class T>
const T* cast(const Instance* instance) {
    return cast<T>(const_cast<Instance*>(instance));
}

// ---- Contents ----

// Copies value and null flag of each feature, references as clones; features that are null in model
// are skipped. Does nothing unless dest, src and model are of one class.
void copy(Instance* dest, const Instance* src, const Instance* model = nullptr);
void copy_keys(Instance* dest, const Instance* src);
// Sets the null flag of the selected members to value. A scalar reference has no flag and stays as
// it is, so that narrowing an instance to some properties never loses what it refers to.
void nullify(Instance* instance, bool keys, bool non_keys, uint8 value = 1);
void nullify_keys(Instance* instance);
void nullify_non_keys(Instance* instance);
// The namespace, every value and every reference empty, everything null.
void clear(Instance* instance);
// Sets the namespace of the instance and of everything it references; an existing one stays unless
// overwrite is set.
void set_name_space_recursive(Instance* instance, const char* name_space, bool overwrite);
// Leaves non-null what the list (null-terminated; null: everything) names, and keys if keep_keys. A
// named null scalar reference gets an empty instance of its class. 0, or -1 at the first name that
// is neither property nor reference; unknown names are ignored.
int filter_properties(Instance* instance, const char* const* names, bool keep_keys);
// A new instance of the class with everything null but the keys, copied from source if that is of
// the same class.
Instance* create_model(const Meta_Class* meta_class, const Instance* source);

// ---- Comparison ----

bool keys_all_set(const Instance* instance);
// Whether b has each key of a, under its name without regard to case, with the same type and value;
// null flags play no part. The classes may differ, so a subclass instance matches a base-class key.
// Null references equal each other; others match by their keys if one's class is the other's
// subclass. Arrays of references are skipped.
bool key_eq(const Instance* a, const Instance* b);
// A hash of what key_eq compares: key_eq(a, b) implies equal hashes when both have the same keys,
// in whatever order and case.
std::size_t key_hash(const Instance* instance);
// Same class, namespace and members; two null members are equal whatever they held.
bool identical(const Instance* a, const Instance* b);
// Whether a scalar reference of the association points to the instance: the reference accepts its
// class and the keys are equal. An empty or null role means any reference.
bool is_reference_to(const Instance* association, const Instance* instance, const char* role);

// ---- Text ----

// "Class.key=value,key=value" to an instance of meta_class, one of its super classes or a class of
// its repository, everything null but the keys; null on any fault. All keys must be there, once
// each, and nothing else. Numbers are decimal, or hexadecimal if they do not read as decimal, and
// must fit their type; a back-slash in a string stands for the character behind it. Safe on any
// bytes; quoted paths nest eight deep at most.
Instance* model_path_to_instance(const Meta_Class* meta_class, const char* path);
// The reverse; 0, or -1 for a class without keys or a null or array key, and out is left alone.
int instance_to_model_path(const Instance* instance, String& out);
// A diagnostic form. References are printed as nested blocks.
void print(const Instance* instance, std::FILE* stream = stdout, bool keys_only = false);

// ---- Members by description ----

inline const void* member(const Instance* instance, uint32 offset) {
    return reinterpret_cast<const char*>(instance) + offset;
}
inline void* member(Instance* instance, uint32 offset) {
    return reinterpret_cast<char*>(instance) + offset;
}
// The null flag of a property, or of an array of references.
inline uint32 null_flag_offset(const Meta_Feature* feature) {
    if (!(feature->flags & FLAG_PROPERTY))
        return static_cast<const Meta_Reference*>(feature)->offset + type_size(TYPE_INSTANCE);
    const auto* p = static_cast<const Meta_Property*>(feature);
    return p->offset + type_size(p->subscript != 0 ? uint32{TYPE_INSTANCE} : p->type);
}
inline uint8* null_flag(Instance* instance, const Meta_Feature* feature) {
    return static_cast<uint8*>(member(instance, null_flag_offset(feature)));
}
inline const uint8* null_flag(const Instance* instance, const Meta_Feature* feature) {
    return static_cast<const uint8*>(member(instance, null_flag_offset(feature)));
}
// A feature's value is null: its flag, or the null pointer of a scalar reference.
bool is_null(const Instance* instance, const Meta_Feature* feature);
// The pointer of a scalar reference member.
Instance*& reference(Instance* instance, const Meta_Reference* feature);
Instance* reference(const Instance* instance, const Meta_Reference* feature);

template <class T>
T* create_null() {
    return static_cast<T*>(create_null(&T::static_meta_class));
}

// A counted pointer, to a const class where the instance is not to be written. Made from a raw
// pointer it takes over the caller's count, and holds null if the instance is not of T's class.
template <class T>
class Ref {
    using Any = std::conditional_t<std::is_const_v<T>, const Instance, Instance>;

public:
    Ref() noexcept = default;
    Ref(Any* instance) noexcept : _ptr(cast<std::remove_const_t<T>>(instance)) {
        if (instance && !_ptr)
            unref(instance);
    }
    // Of a subclass, or of the same class to be read only.
    template <class U>
    requires(!std::is_same_v<T, U> && std::is_convertible_v<U*, T*>) Ref(Ref<U> other)
    noexcept : _ptr(other.release()) {}
    Ref(const Ref& other) noexcept : _ptr(other._ptr) {
        if (_ptr)
            cimple::ref(_ptr);
    }
    Ref(Ref&& other) noexcept : _ptr(other._ptr) { other._ptr = nullptr; }
    ~Ref() { unref(_ptr); }
    Ref& operator=(Ref other) noexcept {
        T* mine = _ptr;
        _ptr = other._ptr;
        other._ptr = mine;
        return *this;
    }

    T* get() const noexcept { return _ptr; }
    T* operator->() const noexcept { return _ptr; }
    T& operator*() const noexcept { return *_ptr; }
    explicit operator bool() const noexcept { return _ptr != nullptr; }
    // Hands the count to the caller.
    T* release() noexcept {
        T* mine = _ptr;
        _ptr = nullptr;
        return mine;
    }
    void reset(T* instance = nullptr) noexcept { *this = Ref(instance); }
    // A share of what somebody else counts; null for null.
    static Ref share(T* instance) noexcept {
        ref(instance);
        return Ref(instance);
    }

private:
    T* _ptr = nullptr;
};

} // namespace cimple

#endif // CIMPLE_INSTANCE_H
