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

// Number of keys still to be met on a walk, so that it ends with the last one: keys come early.
// Only a class knows it; a method instance is walked to its end.
uint32 count_keys(const Instance* instance) {
    const Meta_Class* meta_class = instance->__meta_class;
    return meta_class->flags & FLAG_METHOD ? UINT32_MAX : meta_class->num_keys;
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

// Calls visit(key, index) for each key that key_eq compares, until one answers false.
template <class Visit>
bool all_keys(const Instance* instance, Visit visit) {
    const auto all = features(instance);
    uint32 left = count_keys(instance);
    for (std::size_t i = 0; i < all.size() && left > 0; ++i) {
        if (!is_key(all[i]) || (all[i]->flags & FLAG_METHOD))
            continue;
        --left;
        if (!is_reference_array(all[i]) && !visit(all[i], i))
            return false;
    }
    return true;
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

// The same for names that differ in case only, eight characters at a time: names are long, and each
// key of each instance has one. It takes a few other characters for equal as well, as a hash may.
uint64 key_name_hash(const char* name) {
    constexpr uint64 LOWER = 0x2020202020202020u;
    uint64 hash = 0;
    for (std::size_t left = std::strlen(name); left != 0;) {
        uint64 word = 0;
        const std::size_t taken = std::min(left, sizeof word);
        if (taken == sizeof word)
            std::memcpy(&word, name, sizeof word);
        else
            std::memcpy(&word, name, taken);
        hash = (hash ^ (word | LOWER)) * 0x9E3779B97F4A7C15u;
        hash ^= hash >> 32;
        name += taken;
        left -= taken;
    }
    return hash;
}

uint64 hash_bytes(const void* bytes, std::size_t size) {
    return std::hash<std::string_view>{}({static_cast<const char*>(bytes), size});
}

uint64 hash_text(const String& text) {
    return hash_bytes(text.c_str(), text.size());
}

uint64 hash_array(const Array_Base& array, uint32 type) {
    uint64 hash = array.size();
    if (type != TYPE_STRING && type != TYPE_DATETIME)
        return mix(hash ^ hash_bytes(array.data(), std::size_t{array.size()} * type_size(type)));
    for (uint32 i = 0; i < array.size(); ++i) {
        hash = mix(hash + (type == TYPE_STRING
                               ? hash_text(static_cast<const String*>(array.data())[i])
                               : static_cast<const Datetime*>(array.data())[i].usec()));
    }
    return hash;
}

uint64 hash_value(const Instance* instance, const Meta_Property* p) {
    if (p->subscript != 0)
        return hash_array(member_as<Array_Base>(instance, p->offset), p->type);
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
    all_keys(instance, [&](const Meta_Feature* key, std::size_t) {
        const uint64 name = key_name_hash(key->name);
        uint64 kind;
        uint64 value = 0;
        if (key->flags & FLAG_PROPERTY) {
            const Meta_Property* p = as_property(key);
            kind = (uint64{p->type} << 16) + static_cast<uint16>(p->subscript);
            value = hash_value(instance, p);
        } else if (const Instance* target = reference(instance, as_reference(key))) {
            const Key_Signature inner = key_signature(target);
            kind = mix(inner.shape + 1);
            value = inner.hash;
        } else {
            kind = UINT64_MAX;
        }
        sum.shape += mix(name ^ kind);
        sum.hash += mix(name ^ value);
        return true;
    });
    return sum;
}

bool keys_embed(const Instance* a, const Instance* b) {
    return all_keys(a, [&](const Meta_Feature* key, std::size_t index) {
        const Meta_Feature* other = matching_key(key, index, b);
        if (!other)
            return false;
        if (key->flags & FLAG_PROPERTY)
            return true;
        const Instance* ra = reference(a, as_reference(key));
        const Instance* rb = reference(b, as_reference(other));
        return ra && rb ? keys_embed(ra, rb) : ra == rb;
    });
}

} // namespace detail

bool keys_all_set(const Instance* instance) {
    return all_keys(instance,
                    [&](const Meta_Feature* key, std::size_t) { return !is_null(instance, key); });
}

bool key_eq(const Instance* a, const Instance* b) {
    if (a == b)
        return true;
    return all_keys(a, [&](const Meta_Feature* key, std::size_t index) {
        const Meta_Feature* other = matching_key(key, index, b);
        if (!other)
            return false;
        if (key->flags & FLAG_PROPERTY)
            return equal_values(a, as_property(key), b, as_property(other));
        return equal_key_references(reference(a, as_reference(key)),
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
