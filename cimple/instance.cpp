// The life of instances: raw memory that is built, cloned and torn down by the description of its
// class.
#include "cimple/instance.h"

#include "cimple/instance_detail.h"

#include <cstdlib>
#include <cstring>
#include <new>
#include <utility>

namespace cimple {

using namespace detail;

namespace {

// The bytes behind the head: generated members start there.
static_assert(sizeof(Instance) == 2 * sizeof(uint32) + 2 * sizeof(void*));

void* allocate(const Meta_Class* meta_class) {
    void* block = std::malloc(meta_class->size);
    if (!block)
        throw std::bad_alloc();
    return block;
}

Instance* construct_head(void* block, const Meta_Class* meta_class) noexcept {
    auto* instance = static_cast<Instance*>(block);
    instance->__magic = INSTANCE_MAGIC;
    new (&instance->__refs) Atomic(1);
    instance->__meta_class = meta_class;
    new (&instance->__name_space) String();
    return instance;
}

// Tears down the members of the first count features, and the head.
void release(Instance* instance, std::size_t count) noexcept {
    for (const Meta_Feature* feature : features(instance).first(count)) {
        if (feature->flags & FLAG_PROPERTY) {
            const Meta_Property* p = as_property(feature);
            if (p->subscript != 0)
                member_as<Array_Base>(instance, p->offset).~Array_Base();
            else if (p->type == TYPE_STRING)
                member_as<String>(instance, p->offset).~String();
            else if (p->type == TYPE_DATETIME)
                member_as<Datetime>(instance, p->offset).~Datetime();
        } else if (feature->flags & FLAG_REFERENCE) {
            const Meta_Reference* r = as_reference(feature);
            if (r->subscript == 0) {
                unref(reference(instance, r));
            } else {
                unref_all(references(instance, r));
                references(instance, r).~Array();
            }
        }
    }
    instance->__name_space.~String();
    std::free(instance);
}

// What is more than zeroed memory in an empty member.
void construct_member(Instance* instance, const Meta_Feature* feature, bool null) noexcept {
    if (feature->flags & FLAG_PROPERTY) {
        const Meta_Property* p = as_property(feature);
        void* value = member(instance, p->offset);
        if (null)
            *null_flag(instance, p) = 1;
        if (p->subscript != 0)
            new (value) Array_Base(array_traits(p->type));
        else if (p->type == TYPE_STRING)
            new (value) String();
        else if (p->type == TYPE_DATETIME)
            new (value) Datetime();
    } else if ((feature->flags & FLAG_REFERENCE) && as_reference(feature)->subscript != 0) {
        new (member(instance, as_reference(feature)->offset)) Array<Instance*>();
        if (null)
            *null_flag(instance, feature) = 1;
    }
}

Instance* create_empty(const Meta_Class* meta_class, bool null) {
    void* block = allocate(meta_class);
    std::memset(block, 0, meta_class->size);
    ref(meta_class);
    Instance* instance = construct_head(block, meta_class);
    for (const Meta_Feature* feature : features(instance))
        construct_member(instance, feature, null);
    return instance;
}

// ---- Defaults ----

void set_text(Instance* instance, const Meta_Property* p, const char* text) {
    if (p->type == TYPE_STRING)
        member_as<String>(instance, p->offset) = text;
    else if (!member_as<Datetime>(instance, p->offset).set(text))
        *null_flag(instance, p) = 1;
}

void set_array(Instance* instance, const Meta_Property* p, const Meta_Array_Value& value) {
    Array_Base& array = member_as<Array_Base>(instance, p->offset);
    if (p->type != TYPE_STRING && p->type != TYPE_DATETIME) {
        array.assign(value.elements, value.num_elements);
        return;
    }
    for (uint32 i = 0; i < value.num_elements; ++i) {
        const char* text = static_cast<const char* const*>(value.elements)[i];
        if (p->type == TYPE_STRING) {
            const String element(text);
            array.append(&element, 1);
        } else {
            Datetime element;
            element.set(text);
            array.append(&element, 1);
        }
    }
}

void set_default(Instance* instance, const Meta_Property* p) {
    if (!p->value)
        *null_flag(instance, p) = 1;
    else if (p->subscript != 0)
        set_array(instance, p, p->value->array_value);
    else if (p->type == TYPE_STRING || p->type == TYPE_DATETIME)
        set_text(instance, p, p->value->string_value);
    else
        std::memcpy(member(instance, p->offset), p->value, type_size(p->type));
}

// ---- Cloning ----

// Replaces the bits that were copied from the source by a value of the copy's own. Until then they
// belong to the source.
void clone_member(Instance* copy, const Instance* source, const Meta_Feature* feature) {
    if (feature->flags & FLAG_PROPERTY) {
        const Meta_Property* p = as_property(feature);
        void* value = member(copy, p->offset);
        if (p->subscript != 0)
            new (value) Array_Base(member_as<Array_Base>(source, p->offset));
        else if (p->type == TYPE_STRING)
            new (value) String(member_as<String>(source, p->offset));
        else if (p->type == TYPE_DATETIME)
            new (value) Datetime(member_as<Datetime>(source, p->offset));
    } else if (feature->flags & FLAG_REFERENCE) {
        const Meta_Reference* r = as_reference(feature);
        if (r->subscript != 0)
            new (member(copy, r->offset)) Array<Instance*>(clone_all(references(source, r)));
        else if (const Instance* target = reference(source, r))
            reference(copy, r) = clone(target);
    }
}

} // namespace

namespace detail {

Array<Instance*> clone_all(const Array<Instance*>& instances) {
    Array<Instance*> clones;
    clones.resize(instances.size(), nullptr);
    try {
        for (uint32 i = 0; i < instances.size(); ++i) {
            if (instances[i])
                clones[i] = clone(instances[i]);
        }
    } catch (...) {
        unref_all(clones);
        throw;
    }
    return clones;
}

void unref_all(Array<Instance*>& instances) noexcept {
    for (Instance* instance : instances)
        unref(instance);
}

} // namespace detail

Instance* create(const Meta_Class* meta_class, bool defaults) {
    Instance* instance = create_empty(meta_class, false);
    if (!defaults)
        return instance;
    try {
        for (const Meta_Feature* feature : features(instance)) {
            if (feature->flags & FLAG_PROPERTY)
                set_default(instance, as_property(feature));
        }
    } catch (...) {
        destroy(instance);
        throw;
    }
    return instance;
}

Instance* create_null(const Meta_Class* meta_class) {
    return create_empty(meta_class, true);
}

Instance* clone(const Instance* instance) {
    const Meta_Class* meta_class = instance->__meta_class;
    void* block = allocate(meta_class);
    std::memcpy(static_cast<char*>(block) + sizeof(Instance),
                reinterpret_cast<const char*>(instance) + sizeof(Instance),
                meta_class->size - sizeof(Instance));
    Instance* copy = construct_head(block, meta_class);
    copy->__name_space = instance->__name_space;
    std::size_t done = 0;
    try {
        for (const Meta_Feature* feature : features(instance)) {
            clone_member(copy, instance, feature);
            ++done;
        }
    } catch (...) {
        release(copy, done);
        throw;
    }
    ref(meta_class); // last, as nothing can fail any more
    return copy;
}

void ref(const Instance* instance) noexcept {
    if (instance)
        instance->__refs.fetch_add(1, std::memory_order_relaxed);
}

void unref(const Instance* instance) noexcept {
    if (!instance)
        return;
    // The last owner needs no locked decrement.
    if (instance->__refs.load(std::memory_order_acquire) == 1 ||
        instance->__refs.fetch_sub(1, std::memory_order_acq_rel) == 1)
        destroy(const_cast<Instance*>(instance));
}

void destroy(Instance* instance) noexcept {
    if (!instance)
        return;
    const Meta_Class* meta_class = instance->__meta_class;
    release(instance, meta_class->num_meta_features);
    unref(meta_class);
}

// ---- Members by description ----

bool is_null(const Instance* instance, const Meta_Feature* feature) {
    if (feature->flags & FLAG_METHOD)
        return true;
    if ((feature->flags & FLAG_REFERENCE) && as_reference(feature)->subscript == 0)
        return !reference(instance, as_reference(feature));
    return *null_flag(instance, feature) != 0;
}

Instance*& reference(Instance* instance, const Meta_Reference* feature) {
    return member_as<Instance*>(instance, feature->offset);
}

Instance* reference(const Instance* instance, const Meta_Reference* feature) {
    return member_as<Instance*>(instance, feature->offset);
}

} // namespace cimple
