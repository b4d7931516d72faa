// Classes made at run time: deep copies of meta records, their counts and their end.
#include "cimple/meta.h"

#include "cimple/instance.h"

#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint8 POISON = 0xDD;

// Overwrites every field, so that a use of a freed record shows at once. Volatile, because nobody
// reads these bytes again and the compiler would drop the writes.
template <class T>
void release_record(const T* record) {
    auto* bytes = reinterpret_cast<volatile uint8*>(const_cast<T*>(record));
    for (std::size_t i = 0; i < sizeof(T); ++i)
        bytes[i] = POISON;
    ::operator delete(const_cast<T*>(record));
}

// Only heap records are counted: a static one is never written to.
template <class T>
bool is_counted(const T* record) {
    return record && record->refs.load(std::memory_order_relaxed) != 0;
}

template <class T>
Atomic& count_of(const T* record) {
    return const_cast<T*>(record)->refs;
}

template <class T>
bool drop_count(const T* record) {
    return is_counted(record) && count_of(record).fetch_sub(1, std::memory_order_acq_rel) == 1;
}

// Makes a record with fill(record). The free functions take records that are filled in part, so a
// failed allocation in the middle leaves nothing behind.
template <class T, class Fill, class Free>
T* make_record(Fill fill, Free free) {
    T* record = new T{};
    record->refs.store(1, std::memory_order_relaxed);
    try {
        fill(record);
    } catch (...) {
        free(record);
        throw;
    }
    return record;
}

char* copy_text(const char* text) {
    if (!text)
        return nullptr;
    const std::size_t size = std::strlen(text) + 1;
    return static_cast<char*>(std::memcpy(::operator new(size), text, size));
}

void free_text(const char* text) {
    ::operator delete(const_cast<char*>(text));
}

template <class T>
T** make_table(uint32 count) {
    const std::size_t bytes = count * sizeof(T*);
    return static_cast<T**>(std::memset(::operator new(bytes), 0, bytes));
}

// The tables of heap records are written through this: they are constant to all who read them.
template <class T>
const T*& slot(const T* const* table, uint32 index) {
    return const_cast<const T**>(table)[index];
}

template <class T>
void free_table(const T* const* table) {
    ::operator delete(const_cast<const T**>(table));
}

// ---- Values ----

bool holds_text(uint32 type) {
    return type == TYPE_STRING || type == TYPE_DATETIME;
}

// Bytes of an element in a Meta_Value, where texts are char pointers.
std::size_t element_size(uint32 type) {
    return holds_text(type) ? sizeof(char*) : type_size(type);
}

void free_value(const Meta_Value* value, uint32 type, bool array) {
    if (!value)
        return;
    if (array) {
        auto* elements = value->array_value.elements;
        for (uint32 i = 0; holds_text(type) && i < value->array_value.num_elements; ++i)
            free_text(static_cast<const char* const*>(elements)[i]);
        ::operator delete(const_cast<void*>(elements));
    } else if (holds_text(type)) {
        free_text(value->string_value);
    }
    release_record(value);
}

void fill_array_value(Meta_Value* to, const Meta_Array_Value& from, uint32 type) {
    const std::size_t bytes = from.num_elements * element_size(type);
    void* elements = std::memset(::operator new(bytes), 0, bytes);
    to->array_value = {elements, from.num_elements};
    if (holds_text(type)) {
        for (uint32 i = 0; i < from.num_elements; ++i)
            static_cast<char**>(elements)[i] =
                copy_text(static_cast<const char* const*>(from.elements)[i]);
    } else if (bytes) {
        std::memcpy(elements, from.elements, bytes);
    }
}

const Meta_Value* copy_value(const Meta_Value* value, uint32 type, bool array) {
    if (!value)
        return nullptr;
    auto* copy = new Meta_Value;
    std::memset(copy, 0, sizeof *copy);
    try {
        if (array)
            fill_array_value(copy, value->array_value, type);
        else if (holds_text(type))
            copy->string_value = copy_text(value->string_value);
        else
            std::memcpy(copy, value, type_size(type));
    } catch (...) {
        free_value(copy, type, array);
        throw;
    }
    return copy;
}

// ---- Qualifiers ----

void unref_qualifier(const Meta_Qualifier* qualifier) {
    if (!drop_count(qualifier))
        return;
    free_text(qualifier->name);
    free_value(qualifier->value, qualifier->type, qualifier->array != 0);
    release_record(qualifier);
}

const Meta_Qualifier* copy_qualifier(const Meta_Qualifier* from) {
    return make_record<Meta_Qualifier>(
        [from](Meta_Qualifier* to) {
            to->type = from->type;
            to->array = from->array;
            to->name = copy_text(from->name);
            to->value = copy_value(from->value, from->type, from->array != 0);
        },
        unref_qualifier);
}

void free_head(const Meta_Feature* feature) {
    free_text(feature->name);
    for (uint32 i = 0; i < feature->num_meta_qualifiers; ++i)
        unref_qualifier(feature->meta_qualifiers[i]);
    free_table(feature->meta_qualifiers);
}

void copy_head(Meta_Feature* to, const Meta_Feature* from) {
    to->flags = from->flags;
    to->name = copy_text(from->name);
    if (from->num_meta_qualifiers == 0)
        return;
    to->meta_qualifiers = make_table<const Meta_Qualifier>(from->num_meta_qualifiers);
    to->num_meta_qualifiers = from->num_meta_qualifiers;
    for (uint32 i = 0; i < from->num_meta_qualifiers; ++i)
        slot(to->meta_qualifiers, i) = copy_qualifier(from->meta_qualifiers[i]);
}

// ---- Features ----

void unref_feature(const Meta_Feature* feature);

void free_features(const Meta_Features* features) {
    free_head(features);
    for (uint32 i = 0; i < features->num_meta_features; ++i)
        unref_feature(features->meta_features[i]);
    free_table(features->meta_features);
}

void free_property(const Meta_Property* property) {
    free_head(property);
    free_value(property->value, property->type, property->subscript != 0);
    release_record(property);
}

void free_reference(const Meta_Reference* reference) {
    free_head(reference);
    unref(reference->meta_class);
    release_record(reference);
}

void free_method(const Meta_Method* method) {
    free_features(method);
    release_record(method);
}

void unref_feature(const Meta_Feature* feature) {
    if (!drop_count(feature))
        return;
    if (feature->flags & FLAG_PROPERTY)
        free_property(static_cast<const Meta_Property*>(feature));
    else if (feature->flags & FLAG_REFERENCE)
        free_reference(static_cast<const Meta_Reference*>(feature));
    else
        free_method(static_cast<const Meta_Method*>(feature));
}

const Meta_Feature* copy_feature(const Meta_Feature* from);

// One routine for classes and methods.
void copy_features(Meta_Features* to, const Meta_Features* from) {
    copy_head(to, from);
    to->size = from->size;
    if (from->num_meta_features == 0)
        return;
    to->meta_features = make_table<const Meta_Feature>(from->num_meta_features);
    to->num_meta_features = from->num_meta_features;
    for (uint32 i = 0; i < from->num_meta_features; ++i)
        slot(to->meta_features, i) = copy_feature(from->meta_features[i]);
}

const Meta_Feature* copy_property(const Meta_Property* from) {
    return make_record<Meta_Property>(
        [from](Meta_Property* to) {
            to->type = from->type;
            to->subscript = from->subscript;
            to->offset = from->offset;
            copy_head(to, from);
            to->value = copy_value(from->value, from->type, from->subscript != 0);
        },
        free_property);
}

const Meta_Feature* copy_reference(const Meta_Reference* from) {
    return make_record<Meta_Reference>(
        [from](Meta_Reference* to) {
            to->subscript = from->subscript;
            to->offset = from->offset;
            to->meta_class = from->meta_class;
            ref(to->meta_class);
            copy_head(to, from);
        },
        free_reference);
}

const Meta_Feature* copy_method(const Meta_Method* from) {
    return make_record<Meta_Method>(
        [from](Meta_Method* to) {
            to->return_type = from->return_type;
            copy_features(to, from);
        },
        free_method);
}

const Meta_Feature* copy_feature(const Meta_Feature* from) {
    if (from->flags & FLAG_PROPERTY)
        return copy_property(static_cast<const Meta_Property*>(from));
    if (from->flags & FLAG_REFERENCE)
        return copy_reference(static_cast<const Meta_Reference*>(from));
    return copy_method(static_cast<const Meta_Method*>(from));
}

// ---- Classes ----

void free_class(const Meta_Class* meta_class) {
    free_features(meta_class);
    ::operator delete(const_cast<uint8*>(meta_class->locals));
    unref(meta_class->super_meta_class);
    release_record(meta_class);
}

void derive(Meta_Class* to, const Meta_Class* base) {
    copy_features(to, base);
    to->num_keys = base->num_keys;
    to->keys = base->keys;
    to->meta_repository = base->meta_repository;
    to->super_meta_class = base;
    ref(base);
    const uint32 count = base->num_meta_features;
    to->locals = static_cast<uint8*>(std::memset(::operator new(count), 0, count));
    to->flags &= ~FLAG_ABSTRACT;
    const char* const abstract = flag_name(4);
    remove_qualifiers(to, &abstract, 1);
}

bool is_named(const Meta_Qualifier* qualifier, const char* const* names, uint32 count) {
    for (uint32 i = 0; names && i < count; ++i) {
        if (name_equal(qualifier->name, names[i]))
            return true;
    }
    return names == nullptr;
}

void remove_from(Meta_Feature* feature, const char* const* names, uint32 count) {
    uint32 kept = 0;
    for (uint32 i = 0; i < feature->num_meta_qualifiers; ++i) {
        const Meta_Qualifier* qualifier = feature->meta_qualifiers[i];
        if (is_named(qualifier, names, count))
            unref_qualifier(qualifier);
        else
            slot(feature->meta_qualifiers, kept++) = qualifier;
    }
    feature->num_meta_qualifiers = kept;
    if (kept == 0) {
        free_table(feature->meta_qualifiers);
        feature->meta_qualifiers = nullptr;
    }
}

void remove_recursively(Meta_Features* features, const char* const* names, uint32 count) {
    remove_from(features, names, count);
    for (uint32 i = 0; i < features->num_meta_features; ++i) {
        // All features of a heap copy are heap records of its own.
        auto* feature = const_cast<Meta_Feature*>(features->meta_features[i]);
        if (feature->flags & FLAG_METHOD)
            remove_recursively(static_cast<Meta_Method*>(feature), names, count);
        else
            remove_from(feature, names, count);
    }
}

} // namespace

void ref(const Meta_Class* meta_class) {
    if (is_counted(meta_class))
        count_of(meta_class).fetch_add(1, std::memory_order_relaxed);
}

void unref(const Meta_Class* meta_class) {
    if (!drop_count(meta_class))
        return;
    if (meta_class->flags & FLAG_METHOD)
        free_method(static_cast<const Meta_Method*>(static_cast<const Meta_Features*>(meta_class)));
    else
        free_class(meta_class);
}

Meta_Class* create_meta_class(const char* name, const Meta_Class* base, uint32 flags) {
    return make_record<Meta_Class>(
        [=](Meta_Class* to) {
            if (base) {
                derive(to, base);
            } else {
                to->flags = flags;
                to->size = sizeof(Instance);
            }
            const char* inherited = to->name;
            to->name = copy_text(name);
            free_text(inherited);
        },
        free_class);
}

void remove_qualifiers(Meta_Class* meta_class, const char* const* names, uint32 count) {
    if (is_counted(meta_class))
        remove_recursively(meta_class, names, count);
}

} // namespace cimple
