#include "cimple/meta.h"

#include "cimple/fold.h"
#include "cimple/instance.h"

#include <cstring>

namespace cimple {

namespace {

constexpr const char* FLAG_WORDS[32] = {
    "Property",
    "Reference",
    "Method",
    "Class", //
    "Abstract",
    "Aggregate",
    "Aggregation",
    "Association", //
    "Composition",
    "Counter",
    "Delete",
    "DN", //
    "EmbeddedObject",
    "Exception",
    "Expensive",
    "Experimental", //
    "Gauge",
    "IfDeleted",
    "In",
    "Indication", //
    "Invisible",
    "Key",
    "Large",
    "OctetString", //
    "Out",
    "Read",
    "Required",
    "Static", //
    "Terminal",
    "Weak",
    "Write",
    "EmbeddedInstance", //
};

constexpr const char* TYPE_WORDS[NUM_TYPES] = {
    "boolean", "uint8",  "sint8",  "uint16", "sint16", "uint32", "sint32",
    "uint64",  "sint64", "real32", "real64", "char16", "string", "datetime",
};
static_assert(sizeof(String) == sizeof(void*) && sizeof(Datetime) == sizeof(void*));
static_assert(sizeof(Array_Base) == sizeof(void*));

constexpr const char* PSEUDO_CLASS_NAME = "Instance";

// The pairs of classes under comparison, innermost first. Associations may lead back to a class
// that is being compared already; that pair is taken as equal then, and decided further out.
struct Compared_Pair {
    const Meta_Features* a;
    const Meta_Features* b;
    const Compared_Pair* outer;
};

bool identical_features(const Meta_Features* a, const Meta_Features* b, const Compared_Pair* outer);

bool identical_feature(const Meta_Feature* a, const Meta_Feature* b, const Compared_Pair* outer) {
    if (a->flags != b->flags || !name_equal(a->name, b->name))
        return false;
    if (a->flags & FLAG_PROPERTY) {
        auto* pa = static_cast<const Meta_Property*>(a);
        auto* pb = static_cast<const Meta_Property*>(b);
        return pa->type == pb->type && pa->subscript == pb->subscript && pa->offset == pb->offset;
    }
    if (a->flags & FLAG_REFERENCE) {
        auto* ra = static_cast<const Meta_Reference*>(a);
        auto* rb = static_cast<const Meta_Reference*>(b);
        return ra->offset == rb->offset &&
               identical_features(ra->meta_class, rb->meta_class, outer);
    }
    if (a->flags & FLAG_METHOD)
        return identical_features(static_cast<const Meta_Method*>(a),
                                  static_cast<const Meta_Method*>(b), outer);
    return true;
}

bool identical_features(const Meta_Features* a, const Meta_Features* b,
                        const Compared_Pair* outer) {
    if (a == b)
        return true;
    if (!a || !b)
        return false;
    for (const Compared_Pair* pair = outer; pair; pair = pair->outer) {
        if (pair->a == a && pair->b == b)
            return true;
    }
    if (a->flags != b->flags || !name_equal(a->name, b->name) ||
        a->num_meta_features != b->num_meta_features)
        return false;
    const Compared_Pair here{a, b, outer};
    for (uint32 i = 0; i < a->num_meta_features; ++i) {
        if (!identical_feature(a->meta_features[i], b->meta_features[i], &here))
            return false;
    }
    return a->size == b->size;
}

bool identical_locals(const Meta_Class* a, const Meta_Class* b) {
    if (a->locals == b->locals || a->num_meta_features == 0)
        return true;
    return a->locals && b->locals && std::memcmp(a->locals, b->locals, a->num_meta_features) == 0;
}

} // namespace

constinit const Meta_Class Instance::static_meta_class{
    {{{0}, FLAG_CLASS, PSEUDO_CLASS_NAME, nullptr, 0}, nullptr, 0, sizeof(Instance)},
    nullptr,
    nullptr,
    0,
    nullptr,
};

bool name_equal(const char* a, const char* b) {
    if (!a || !b)
        return a == b;
    if (fold(*a) != fold(*b))
        return false;
    for (; *a && fold(*a) == fold(*b); ++a, ++b) {
    }
    return fold(*a) == fold(*b);
}

const Meta_Class* find_meta_class(const Meta_Repository* repository, const char* name) {
    if (!repository || !name)
        return nullptr;
    const uint32 count = repository->num_name_slots;
    for (uint32 i = name_slot(name, count); count > 0; i = (i + 1) & (count - 1)) {
        if (repository->name_slots[i] == 0)
            return nullptr;
        const Meta_Class* meta_class = repository->meta_classes[repository->name_slots[i] - 1];
        if (name_equal(meta_class->name, name))
            return meta_class;
    }
    for (uint32 i = 0; i < repository->num_meta_classes; ++i) {
        if (name_equal(repository->meta_classes[i]->name, name))
            return repository->meta_classes[i];
    }
    return nullptr;
}

const Meta_Class* find_class_in_tree(const Meta_Class* meta_class, const char* name) {
    if (!meta_class || !name)
        return nullptr;
    for (const Meta_Class* c = meta_class; c; c = c->super_meta_class) {
        if (name_equal(c->name, name))
            return c;
    }
    return find_meta_class(meta_class->meta_repository, name);
}

const Meta_Feature* find_feature(const Meta_Features* features, const char* name, uint32 mask) {
    if (!features || !name)
        return nullptr;
    for (uint32 i = 0; i < features->num_meta_features; ++i) {
        const Meta_Feature* feature = features->meta_features[i];
        if ((feature->flags & mask) && name_equal(feature->name, name))
            return feature;
    }
    return nullptr;
}

const Meta_Property* find_property(const Meta_Features* features, const char* name) {
    return static_cast<const Meta_Property*>(find_feature(features, name, FLAG_PROPERTY));
}

const Meta_Reference* find_reference(const Meta_Features* features, const char* name) {
    return static_cast<const Meta_Reference*>(find_feature(features, name, FLAG_REFERENCE));
}

const Meta_Method* find_method(const Meta_Class* meta_class, const char* name) {
    return static_cast<const Meta_Method*>(find_feature(meta_class, name, FLAG_METHOD));
}

bool has_feature_flag(const Meta_Features* features, uint32 mask) {
    for (uint32 i = 0; features && i < features->num_meta_features; ++i) {
        if (features->meta_features[i]->flags & mask)
            return true;
    }
    return false;
}

bool is_subclass(const Meta_Class* ancestor, const Meta_Class* descendant) {
    if (ancestor == &Instance::static_meta_class)
        return true;
    if (!ancestor || !descendant)
        return false;
    if (name_equal(ancestor->name, PSEUDO_CLASS_NAME))
        return true;
    if (descendant->flags & FLAG_METHOD) // a method has no super class to walk to
        return ancestor == descendant || name_equal(ancestor->name, descendant->name);
    for (const Meta_Class* c = descendant; c; c = c->super_meta_class) {
        if (c == ancestor)
            return true;
        // Of one repository's own records no two have the same name.
        if ((c->meta_repository != ancestor->meta_repository || c->refs != 0 ||
             ancestor->refs != 0) &&
            name_equal(c->name, ancestor->name))
            return true;
    }
    return false;
}

int is_subclass_by_name(const Meta_Repository* repository, const char* ancestor_name,
                        const char* descendant_name) {
    const Meta_Class* ancestor = find_meta_class(repository, ancestor_name);
    const Meta_Class* descendant = find_meta_class(repository, descendant_name);
    if (!ancestor || !descendant)
        return -1;
    return is_subclass(ancestor, descendant) ? 0 : 1;
}

bool identical(const Meta_Class* a, const Meta_Class* b, bool deep) {
    if (!identical_features(a, b, nullptr))
        return false;
    if (!deep || a == b)
        return true;
    return identical_locals(a, b) && a->num_keys == b->num_keys &&
           identical(a->super_meta_class, b->super_meta_class, true);
}

Type type_name_to_code(const char* text) {
    for (uint32 code = 0; code < NUM_TYPES; ++code) {
        if (name_equal(TYPE_WORDS[code], text))
            return static_cast<Type>(code);
    }
    return TYPE_NONE;
}

const char* type_name(uint32 type) {
    return type < NUM_TYPES ? TYPE_WORDS[type] : type == TYPE_INSTANCE ? "instance" : "unknown";
}

const char* flag_name(uint32 bit) {
    return bit < 32 ? FLAG_WORDS[bit] : "";
}

uint32 flag_by_name(const char* word) {
    for (uint32 bit = 0; bit < 32; ++bit) {
        if (name_equal(FLAG_WORDS[bit], word))
            return 1u << bit;
    }
    return 0;
}

} // namespace cimple
