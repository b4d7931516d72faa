// Comparing instances: by their keys, by everything, and the hash that goes with the keys.
#include "cimple/instance.h"

#include "cimple/instance_detail.h"

#include <algorithm>
#include <cstring>
#include <functional>
#include <string_view>

namespace cimple {

using namespace detail;

namespace {

bool related(const Instance* a, const Instance* b) {
    return a->__meta_class == b->__meta_class || is_subclass(a->__meta_class, b->__meta_class) ||
           is_subclass(b->__meta_class, a->__meta_class);
}

// What key_eq skips on both sides.
bool is_reference_array(const Meta_Feature* feature) {
    return (feature->flags & FLAG_REFERENCE) && as_reference(feature)->subscript != 0;
}

// The key of b's class with the name, kind and type of a's key, or null. Classes that are related
// have it at the same index, which spares the search.
const Meta_Feature* matching_key(const Meta_Feature* key, std::size_t index, const Instance* b) {
    const Meta_Feature* found = nullptr;
    const auto theirs = features(b);
    if (index < theirs.size() && theirs[index] == key)
        return key;
    found = find_feature(b->__meta_class, key->name, key->flags & FLAG_FEATURE);
    if (!found || !is_key(found))
        return nullptr;
    if (key->flags & FLAG_PROPERTY) {
        const Meta_Property* pa = as_property(key);
        const Meta_Property* pb = as_property(found);
        return pa->type == pb->type && pa->subscript == pb->subscript ? found : nullptr;
    }
    return is_reference_array(found) ? nullptr : found;
}

struct Key {
    const Meta_Feature* feature;
    std::size_t index;
    uint64 name_hash;
};

// Calls visit(key) for each key that key_eq compares, until one answers false. A method instance
// has none.
template <class Visit>
bool all_keys(const Instance* instance, Visit visit) {
    if (instance->__meta_class->flags & FLAG_METHOD)
        return true;
    const auto all = features(instance);
    return each_key(instance->__meta_class, [&](const Meta_Key& key) {
        const Meta_Feature* feature = all[key.feature];
        return is_reference_array(feature) || visit(Key{feature, key.feature, key.name_hash});
    });
}

bool equal_key_references(const Instance* a, const Instance* b) {
    if (!a || !b)
        return a == b;
    return related(a, b) && key_eq(a, b);
}

// ---- Hashing ----

// The finalizer of a 64-bit mixing hash: every input bit reaches every output bit.
constexpr uint64 mix(uint64 x) {
    x ^= x >> 30;
    x *= 0xBF58476D1CE4E5B9u;
    x ^= x >> 27;
    x *= 0x94D049BB133111EBu;
    return x ^ (x >> 31);
}

uint64 hash_bytes(const void* bytes, std::size_t size) {
    return std::hash<std::string_view>{}({static_cast<const char*>(bytes), size});
}

uint64 hash_text(const String& text) {
    return hash_bytes(text.c_str(), text.size());
}

uint64 hash_value(const Instance* instance, const Meta_Property* p) {
    if (p->subscript != 0)
        return member_as<Array_Base>(instance, p->offset).size(); // CIM knows no such key
    if (p->type == TYPE_STRING)
        return hash_text(member_as<String>(instance, p->offset));
    if (p->type == TYPE_DATETIME)
        return member_as<Datetime>(instance, p->offset).usec();
    uint64 bits = 0;
    std::memcpy(&bits, member(instance, p->offset), type_size(p->type));
    return bits;
}

bool identical_references(const Instance* a, const Instance* b, const Meta_Reference* r) {
    if (r->subscript == 0)
        return identical(reference(a, r), reference(b, r));
    const Array<Instance*>& in_a = references(a, r);
    const Array<Instance*>& in_b = references(b, r);
    if (in_a.size() != in_b.size())
        return false;
    for (uint32 i = 0; i < in_a.size(); ++i) {
        if (!identical(in_a[i], in_b[i]))
            return false;
    }
    return true;
}

} // namespace

namespace detail {

bool equal_values(const Instance* a, const Meta_Property* in_a, const Instance* b,
                  const Meta_Property* in_b) {
    if (in_a->subscript != 0)
        return member_as<Array_Base>(a, in_a->offset).equal(member_as<Array_Base>(b, in_b->offset));
    if (in_a->type == TYPE_STRING)
        return member_as<String>(a, in_a->offset) == member_as<String>(b, in_b->offset);
    if (in_a->type == TYPE_DATETIME)
        return member_as<Datetime>(a, in_a->offset) == member_as<Datetime>(b, in_b->offset);
    return std::memcmp(member(a, in_a->offset), member(b, in_b->offset), type_size(in_a->type)) ==
           0;
}

// The keys' contributions are added up, so their order plays no part.
Key_Signature key_signature(const Instance* instance) {
    Key_Signature sum{};
    all_keys(instance, [&](const Key& key) {
        uint64 kind;
        uint64 value = 0;
        if (key.feature->flags & FLAG_PROPERTY) {
            const Meta_Property* p = as_property(key.feature);
            kind = (uint64{p->type} << 16) + static_cast<uint16>(p->subscript);
            value = hash_value(instance, p);
        } else if (const Instance* target = reference(instance, as_reference(key.feature))) {
            const Key_Signature inner = key_signature(target);
            kind = mix(inner.shape + 1);
            value = inner.hash;
        } else {
            kind = UINT64_MAX;
        }
        sum.shape += mix(key.name_hash ^ kind);
        sum.hash += mix(key.name_hash ^ value);
        return true;
    });
    return sum;
}

bool keys_embed(const Instance* a, const Instance* b) {
    return all_keys(a, [&](const Key& key) {
        const Meta_Feature* other = matching_key(key.feature, key.index, b);
        if (!other)
            return false;
        if (key.feature->flags & FLAG_PROPERTY)
            return true;
        const Instance* ra = reference(a, as_reference(key.feature));
        const Instance* rb = reference(b, as_reference(other));
        return ra && rb ? keys_embed(ra, rb) : ra == rb;
    });
}

} // namespace detail

bool keys_all_set(const Instance* instance) {
    return all_keys(instance, [&](const Key& key) { return !is_null(instance, key.feature); });
}

bool key_eq(const Instance* a, const Instance* b) {
    if (a == b)
        return true;
    return all_keys(a, [&](const Key& key) {
        const Meta_Feature* other = matching_key(key.feature, key.index, b);
        if (!other)
            return false;
        if (key.feature->flags & FLAG_PROPERTY)
            return equal_values(a, as_property(key.feature), b, as_property(other));
        return equal_key_references(reference(a, as_reference(key.feature)),
                                    reference(b, as_reference(other)));
    });
}

std::size_t key_hash(const Instance* instance) {
    return static_cast<std::size_t>(mix(key_signature(instance).hash));
}

bool identical(const Instance* a, const Instance* b) {
    if (a == b)
        return true;
    if (!a || !b || a->__meta_class != b->__meta_class || !(a->__name_space == b->__name_space))
        return false;
    for (const Meta_Feature* feature : features(a)) {
        if (feature->flags & FLAG_METHOD)
            continue;
        const bool null = is_null(a, feature);
        if (null != is_null(b, feature))
            return false;
        if (null)
            continue;
        if (feature->flags & FLAG_PROPERTY
                ? !equal_values(a, as_property(feature), b, as_property(feature))
                : !identical_references(a, b, as_reference(feature)))
            return false;
    }
    return true;
}

bool is_reference_to(const Instance* association, const Instance* instance, const char* role) {
    for (const Meta_Feature* feature : features(association)) {
        if (!(feature->flags & FLAG_REFERENCE) || as_reference(feature)->subscript != 0)
            continue;
        if (role && *role && !name_equal(role, feature->name))
            continue;
        const Meta_Reference* r = as_reference(feature);
        const Instance* target = reference(association, r);
        if (target && is_subclass(r->meta_class, instance->__meta_class) &&
            key_eq(instance, target))
            return true;
    }
    return false;
}

} // namespace cimple
