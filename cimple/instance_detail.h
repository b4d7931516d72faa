// What the files of the generic instance operations share: typed access to members by their
// description, and what the index of a store needs to know about keys.
#ifndef CIMPLE_INSTANCE_DETAIL_H
#define CIMPLE_INSTANCE_DETAIL_H

#include "cimple/instance.h"

#include <algorithm>
#include <span>

namespace cimple::detail {

inline std::span<const Meta_Feature* const> features(const Instance* instance) {
    return {instance->__meta_class->meta_features, instance->__meta_class->num_meta_features};
}

inline const Meta_Property* as_property(const Meta_Feature* feature) {
    return static_cast<const Meta_Property*>(feature);
}
inline const Meta_Reference* as_reference(const Meta_Feature* feature) {
    return static_cast<const Meta_Reference*>(feature);
}

inline bool is_key(const Meta_Feature* feature) {
    return (feature->flags & FLAG_KEY) != 0;
}

// Calls visit(Meta_Key) for each key of the class in the features' order, until one answers false.
template <class Visit>
bool each_key(const Meta_Class* meta_class, Visit visit) {
    return std::all_of(meta_class->keys, meta_class->keys + meta_class->num_keys, visit);
}

template <class T>
T& member_as(Instance* instance, uint32 offset) {
    return *static_cast<T*>(member(instance, offset));
}
template <class T>
const T& member_as(const Instance* instance, uint32 offset) {
    return *static_cast<const T*>(member(instance, offset));
}

inline Array<Instance*>& references(Instance* instance, const Meta_Reference* feature) {
    return member_as<Array<Instance*>>(instance, feature->offset);
}
inline const Array<Instance*>& references(const Instance* instance, const Meta_Reference* feature) {
    return member_as<Array<Instance*>>(instance, feature->offset);
}

// What others count is theirs as well: to be called before a write. Builds that check say so at
// once; what is written past these functions shows later (shared_instances.h).
inline void expect_unshared([[maybe_unused]] const Instance* instance) {
#ifdef CIMPLE_CHECK_LOCKS
    CIMPLE_ASSERT(!is_shared(instance));
#endif
}

// Copies the value and the null flag of a property into one of the same type and subscript, which
// may stand at another offset.
void copy_value(Instance* to, const Meta_Property* in_to, const Instance* from,
                const Meta_Property* in_from);

// Clones of all elements; null elements stay null.
Array<Instance*> clone_all(const Array<Instance*>& instances);
void unref_all(Array<Instance*>& instances) noexcept;

// Equal values of one property of two instances, which may stand at different offsets. Null flags
// aside; numbers compare by their bytes.
bool equal_values(const Instance* a, const Meta_Property* in_a, const Instance* b,
                  const Meta_Property* in_b);

// Instances with equal shapes have the same tree of keys: names, types, and the keys of referenced
// instances. Within one shape, key_eq implies equal hashes.
struct Key_Signature {
    uint64 shape;
    uint64 hash;

    bool operator==(const Key_Signature&) const = default;
};
Key_Signature key_signature(const Instance* instance);
// Whether key_eq(a, b) could hold judging by shapes alone: every key of a is one of b.
bool keys_embed(const Instance* a, const Instance* b);

} // namespace cimple::detail

#endif // CIMPLE_INSTANCE_DETAIL_H
