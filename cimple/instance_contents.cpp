// Copying, emptying and narrowing what an instance holds.
#include "cimple/instance.h"

#include "cimple/instance_detail.h"

#include <cstring>

namespace cimple {

using namespace detail;

namespace {

void copy_reference(Instance* dest, const Instance* src, const Meta_Reference* r) {
    if (r->subscript != 0) {
        Array<Instance*> clones = clone_all(references(src, r));
        references(dest, r).swap(clones);
        unref_all(clones);
        *null_flag(dest, r) = *null_flag(src, r);
        return;
    }
    const Instance* target = reference(src, r);
    Instance* copied = target ? clone(target) : nullptr;
    unref(reference(dest, r));
    reference(dest, r) = copied;
}

void copy_features(Instance* dest, const Instance* src, const Instance* model, uint32 mask) {
    if (dest == src || dest->__meta_class != src->__meta_class ||
        (model && model->__meta_class != src->__meta_class))
        return;
    expect_unshared(dest);
    for (const Meta_Feature* feature : features(src)) {
        if ((feature->flags & mask) != mask || (model && is_null(model, feature)))
            continue;
        if (feature->flags & FLAG_PROPERTY)
            copy_value(dest, as_property(feature), src, as_property(feature));
        else if (feature->flags & FLAG_REFERENCE)
            copy_reference(dest, src, as_reference(feature));
    }
}

void clear_property(Instance* instance, const Meta_Property* p) {
    if (p->subscript != 0)
        member_as<Array_Base>(instance, p->offset).clear();
    else if (p->type == TYPE_STRING)
        member_as<String>(instance, p->offset).clear();
    else if (p->type == TYPE_DATETIME)
        member_as<Datetime>(instance, p->offset).clear();
    else
        std::memset(member(instance, p->offset), 0, type_size(p->type));
    *null_flag(instance, p) = 1;
}

void clear_reference(Instance* instance, const Meta_Reference* r) {
    if (r->subscript != 0) {
        unref_all(references(instance, r));
        references(instance, r).clear();
        *null_flag(instance, r) = 1;
    } else {
        unref(reference(instance, r));
        reference(instance, r) = nullptr;
    }
}

bool is_scalar_reference(const Meta_Feature* feature) {
    return (feature->flags & FLAG_REFERENCE) && as_reference(feature)->subscript == 0;
}

void set_name_space(Instance* instance, const String& name_space, bool overwrite) {
    if (overwrite || instance->__name_space.empty()) {
        expect_unshared(instance);
        instance->__name_space = name_space;
    }
    for (const Meta_Feature* feature : features(instance)) {
        if (!(feature->flags & FLAG_REFERENCE))
            continue;
        if (is_scalar_reference(feature)) {
            if (Instance* target = reference(instance, as_reference(feature)))
                set_name_space(target, name_space, overwrite);
            continue;
        }
        for (Instance* target : references(instance, as_reference(feature))) {
            if (target)
                set_name_space(target, name_space, overwrite);
        }
    }
}

} // namespace

void detail::copy_value(Instance* to, const Meta_Property* in_to, const Instance* from,
                        const Meta_Property* in_from) {
    if (in_to->subscript != 0)
        member_as<Array_Base>(to, in_to->offset) = member_as<Array_Base>(from, in_from->offset);
    else if (in_to->type == TYPE_STRING)
        member_as<String>(to, in_to->offset) = member_as<String>(from, in_from->offset);
    else if (in_to->type == TYPE_DATETIME)
        member_as<Datetime>(to, in_to->offset) = member_as<Datetime>(from, in_from->offset);
    else
        std::memcpy(member(to, in_to->offset), member(from, in_from->offset),
                    type_size(in_to->type));
    *null_flag(to, in_to) = *null_flag(from, in_from);
}

void copy(Instance* dest, const Instance* src, const Instance* model) {
    copy_features(dest, src, model, 0);
}

void copy_keys(Instance* dest, const Instance* src) {
    copy_features(dest, src, nullptr, FLAG_KEY);
}

void nullify(Instance* instance, bool keys, bool non_keys, uint8 value) {
    if (!keys && !non_keys)
        return;
    expect_unshared(instance);
    const bool all = keys && non_keys;
    for (const Meta_Feature* feature : features(instance)) {
        if (!all && is_key(feature) != keys)
            continue;
        const bool has_flag = (feature->flags & FLAG_PROPERTY) ||
                              ((feature->flags & FLAG_REFERENCE) && !is_scalar_reference(feature));
        if (has_flag)
            *null_flag(instance, feature) = value;
    }
}

void nullify_keys(Instance* instance) {
    nullify(instance, true, false);
}

void nullify_non_keys(Instance* instance) {
    nullify(instance, false, true);
}

void clear(Instance* instance) {
    expect_unshared(instance);
    instance->__name_space.clear();
    for (const Meta_Feature* feature : features(instance)) {
        if (feature->flags & FLAG_PROPERTY)
            clear_property(instance, as_property(feature));
        else if (feature->flags & FLAG_REFERENCE)
            clear_reference(instance, as_reference(feature));
    }
}

void set_name_space_recursive(Instance* instance, const char* name_space, bool overwrite) {
    if (instance)
        set_name_space(instance, String(name_space), overwrite);
}

int filter_properties(Instance* instance, const char* const* names, bool keep_keys) {
    if (!names) {
        nullify(instance, true, true, 0);
        return 0;
    }
    nullify(instance, !keep_keys, true);
    for (; *names; ++names) {
        const Meta_Feature* feature = find_feature(instance->__meta_class, *names, FLAG_FEATURE);
        if (!feature || is_key(feature))
            continue;
        if (feature->flags & FLAG_METHOD)
            return -1;
        if (!is_scalar_reference(feature)) {
            *null_flag(instance, feature) = 0;
        } else {
            Instance*& target = reference(instance, as_reference(feature));
            if (!target)
                target = create(as_reference(feature)->meta_class);
        }
    }
    return 0;
}

Instance* create_model(const Meta_Class* meta_class, const Instance* source) {
    Ref<Instance> model(create_null(meta_class));
    if (source)
        copy_keys(model.get(), source);
    return model.release();
}

} // namespace cimple
