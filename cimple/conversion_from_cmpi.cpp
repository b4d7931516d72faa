// CMPI objects to instances.
#include "cimple/conversion.h"

#include "cimple/cmpi_call.h"
#include "cimple/instance_detail.h"
#include "cimple/log.h"

#include <cstdlib>
#include <cstring>
#include <strings.h>

namespace cimple {

namespace {

bool usable(const CMPIData& data) {
    return !(data.state & cmpi::UNUSABLE);
}

bool is_integer(sint32 type) {
    return type >= TYPE_UINT8 && type <= TYPE_SINT64;
}

// Makes the value an integer of the type, by plain truncation.
void narrow(CMPIData& data, sint32 type, uint64 value) {
    data.type = to_cmpi_type(static_cast<uint32>(type));
    switch (type_size(static_cast<uint32>(type))) {
    case 1:
        data.value.uint8 = static_cast<uint8>(value);
        break;
    case 2:
        data.value.uint16 = static_cast<uint16>(value);
        break;
    case 4:
        data.value.uint32 = static_cast<uint32>(value);
        break;
    default:
        data.value.uint64 = value;
        break;
    }
}

// ---- Carriers: where a member comes from. adjust fits a value to the type its member has. ----

struct From_Instance {
    const CMPIInstance* source;
    bool count(CMPICount& count) const {
        CMPIStatus status = cmpi::GOOD_STATUS;
        count = source->ft->getPropertyCount(source, &status);
        return cmpi::good(status);
    }
    CMPIData at(CMPICount index, CMPIString*& name, CMPIStatus& status) const {
        return source->ft->getPropertyAt(source, index, &name, &status);
    }
    static void adjust(CMPIData&, sint32) {}
};

struct From_Path {
    const CMPIObjectPath* source;
    bool count(CMPICount& count) const {
        CMPIStatus status = cmpi::GOOD_STATUS;
        count = source->ft->getKeyCount(source, &status);
        return cmpi::good(status);
    }
    CMPIData at(CMPICount index, CMPIString*& name, CMPIStatus& status) const {
        return source->ft->getKeyAt(source, index, &name, &status);
    }
    // Key values arrive in the widest form: whoever parsed the path did not know the class.
    static void adjust(CMPIData& data, sint32 expected) {
        if (!usable(data))
            return;
        if (data.type == CMPI_uint64 && is_integer(expected))
            narrow(data, expected, data.value.uint64);
        else if (data.type == CMPI_sint64 && expected == TYPE_UINT32)
            narrow(data, expected, static_cast<uint64>(data.value.sint64));
    }
};

// A string in the type that the method's parameter has; clients send them so. What cannot be cast
// is left alone, and fails the type test that follows.
void cast_string_to_scalar(CMPIData& data, sint32 expected) {
    const char* text = cmpi::chars(data.value.string);
    if (!text)
        return;
    if (expected == TYPE_BOOLEAN) {
        const bool is_true = strncasecmp(text, "true", 4) == 0;
        if (!is_true && strncasecmp(text, "false", 5) != 0)
            return;
        data.type = CMPI_boolean;
        data.value.boolean = is_true;
    } else if (expected <= TYPE_SINT32) {
        narrow(data, expected, static_cast<uint64>(std::strtoll(text, nullptr, 10)));
    } else if (expected <= TYPE_REAL64) {
        CIMPLE_WARN("Default case - unsupported type");
        return;
    } else {
        CIMPLE_INFO("cast_cmpi_string_to_scalar(): Not supported");
        return;
    }
    CIMPLE_WARN("converting string to registered parameter type");
}

struct From_Args {
    const CMPIArgs* source;
    bool count(CMPICount& count) const {
        CMPIStatus status = cmpi::GOOD_STATUS;
        count = source->ft->getArgCount(source, &status);
        return cmpi::good(status);
    }
    CMPIData at(CMPICount index, CMPIString*& name, CMPIStatus& status) const {
        return source->ft->getArgAt(source, index, &name, &status);
    }
    static void adjust(CMPIData& data, sint32 expected) {
        if (from_cmpi_type(data.type) == TYPE_NONE && expected == TYPE_INSTANCE + TYPE_ARRAY) {
            data.type = CMPI_refA;
            data.state = CMPI_nullValue;
        } else if (usable(data) && data.type == CMPI_string && expected != TYPE_STRING &&
                   !(expected & TYPE_ARRAY)) {
            cast_string_to_scalar(data, expected);
        }
    }
};

// ---- Values ----

bool read_string(const CMPIString* string, String& out) {
    if (!string) {
        CIMPLE_INFO("ignored null CMPI string");
        out.clear();
        return true;
    }
    const char* text = cmpi::chars(string);
    if (!text) {
        CIMPLE_WARN("CMGetCharsPtr() failed");
        return false;
    }
    out = text;
    return true;
}

bool read_datetime(const CMPIDateTime* datetime, Datetime& out) {
    const cmpi::Scoped<CMPIString> string(cmpi::string_format(datetime));
    if (!string) {
        CIMPLE_WARN("CMGetStringFormat() failed");
        return false;
    }
    const char* text = cmpi::chars(string.get());
    if (!text) {
        CIMPLE_WARN("CMGetCharsPtr() failed");
        return false;
    }
    if (!out.set(text)) {
        CIMPLE_WARN("conversion error");
        return false;
    }
    return true;
}

// An instance of the class of the path, or of a class derived from the expected one that a path may
// have though the repository does not; null, with a warning, when the class cannot be told.
template <class Make>
Ref<Instance> read_object(const Converter& converter, const CMPIObjectPath* path,
                          const Meta_Class* foreign_base, Make make) {
    const String name = cmpi::class_name(path);
    if (name.empty()) {
        CIMPLE_WARN("CMGetClassName() failed");
        return {};
    }
    const Converter own = {converter.broker, converter.repository, cmpi::name_space(path)};
    if (const Meta_Class* meta_class = find_meta_class(converter.repository, name.c_str()))
        return make(own, meta_class);
    Ref<Instance> foreign;
    if (foreign_base)
        foreign = make_foreign_reference(own, foreign_base, path);
    if (!foreign)
        CIMPLE_WARN("failed to find meta class: %s", name.c_str());
    return foreign;
}

// A new instance of the object's own class, with its own namespace if it has one; null on failure.
Ref<Instance> read_instance(const Converter& converter, const Meta_Class* expected,
                            const CMPIValue& value, bool is_path) {
    if (is_path ? !value.ref : !value.inst) {
        CIMPLE_WARN("null instance");
        return {};
    }
    if (is_path)
        return read_object(converter, value.ref, expected,
                           [&](const Converter& own, const Meta_Class* meta_class) {
                               return make_cimple_reference(own, meta_class, value.ref);
                           });
    const cmpi::Scoped<CMPIObjectPath> path(cmpi::object_path(value.inst));
    if (!path) {
        CIMPLE_WARN("CMGetObjectPath() failed");
        return {};
    }
    return read_object(converter, path.get(), nullptr,
                       [&](const Converter& own, const Meta_Class* meta_class) {
                           return make_cimple_instance(own, meta_class, value.inst);
                       });
}

bool accepts(const Meta_Features* meta, const Meta_Reference* feature, const Instance* instance) {
    if (is_subclass(feature->meta_class, instance->__meta_class))
        return true;
    CIMPLE_WARN("failed to assign instance of %s to %s.%s", instance->__meta_class->name,
                meta->name, feature->name);
    return false;
}

// The elements of an array, each read by read_element(element); false for the first that fails.
template <class Read>
bool read_elements(const CMPIArray* array, Read read_element) {
    CMPICount size = 0;
    if (!cmpi::array_size(array, size)) {
        CIMPLE_WARN("CMGetArrayCount() failed");
        return false;
    }
    for (CMPICount i = 0; i < size; i++) {
        CMPIData element;
        if (!cmpi::get_element(array, i, element)) {
            CIMPLE_WARN("CMGetArrayElementAt() failed");
            return false;
        }
        if (!read_element(element))
            return false;
    }
    return true;
}

// Numbers on their way into an array, many at a time: an image of firmware has millions.
class Number_Batch {
public:
    explicit Number_Batch(Array_Base& out) : _out(out), _width(out.traits()->size) {}

    // Every member of the union starts at its first byte; what is behind it is overwritten by the
    // next number.
    void append(const CMPIValue& value) {
        std::memcpy(_bytes + _used, &value, sizeof value);
        _used += _width;
        if (_used >= SIZE)
            flush();
    }
    void flush() {
        _out.append(_bytes, _used / _width);
        _used = 0;
    }

private:
    static constexpr uint32 SIZE = 1024;

    Array_Base& _out;
    const uint32 _width;
    uint32 _used = 0;
    char _bytes[SIZE + sizeof(CMPIValue)];
};

bool read_scalar_array(const CMPIArray* array, CMPIType element_type, uint32 type,
                       Array_Base& out) {
    CMPICount size = 0;
    if (cmpi::array_size(array, size))
        out.reserve(size); // else the blocks before would stand beside the last, large one
    Number_Batch numbers(out);
    const bool complete = read_elements(array, [&](const CMPIData& element) {
        if (element.type != element_type) {
            CIMPLE_WARN("type mismatch");
            return false;
        }
        if (!usable(element)) {
            CIMPLE_WARN("encountered null array element");
            return false;
        }
        if (type == TYPE_STRING) {
            String text;
            if (!read_string(element.value.string, text))
                return false;
            out.append(&text, 1);
        } else if (type == TYPE_DATETIME) {
            Datetime datetime;
            if (!read_datetime(element.value.dateTime, datetime))
                return false;
            out.append(&datetime, 1);
        } else if (type == TYPE_BOOLEAN) {
            const boolean flag = element.value.boolean != 0;
            out.append(&flag, 1);
        } else {
            numbers.append(element.value);
        }
        return true;
    });
    if (complete)
        numbers.flush();
    return complete;
}

// Instances on their way into an array; freed unless taken.
struct Instance_List {
    Array<Instance*> items;
    ~Instance_List() {
        for (Instance* instance : items)
            unref(instance);
    }
};

bool read_instance_array(const Converter& converter, const Meta_Features* meta,
                         const Meta_Reference* feature, const CMPIData& data, Array_Base& out) {
    const CMPIType element_type = data.type & static_cast<CMPIType>(~CMPI_ARRAY);
    Instance_List list;
    const bool complete = read_elements(data.value.array, [&](const CMPIData& element) {
        list.items.append(nullptr); // stays null for a null element
        if (!usable(element)) {
            CIMPLE_WARN("encountered null instance element");
            return true;
        }
        if (element.type != element_type) {
            CIMPLE_WARN("array element type mismatch");
            return false;
        }
        Ref<Instance> instance =
            read_instance(converter, feature->meta_class, element.value, element_type == CMPI_ref);
        if (!instance || !accepts(meta, feature, instance.get()))
            return false;
        list.items[list.items.size() - 1] = instance.release();
        return true;
    });
    if (complete)
        out.swap(list.items);
    return complete;
}

// ---- Members ----

bool assign_property(const Meta_Property* property, const CMPIData& data, Instance* instance) {
    void* to = member(instance, property->offset);
    bool read = true;
    if (property->subscript != 0) {
        Array_Base items(array_traits(property->type));
        read = read_scalar_array(data.value.array, to_cmpi_type(property->type), property->type,
                                 items);
        if (read)
            static_cast<Array_Base*>(to)->swap(items);
    } else if (property->type == TYPE_STRING) {
        read = read_string(data.value.string, *static_cast<String*>(to));
    } else if (property->type == TYPE_DATETIME) {
        read = read_datetime(data.value.dateTime, *static_cast<Datetime*>(to));
    } else if (property->type == TYPE_BOOLEAN) {
        *static_cast<boolean*>(to) = data.value.boolean != 0;
    } else {
        std::memcpy(to, &data.value, type_size(property->type));
    }
    if (read)
        *null_flag(instance, property) = 0;
    return read;
}

bool assign_reference(const Converter& converter, const Meta_Features* meta,
                      const Meta_Reference* feature, const CMPIData& data, Instance* instance) {
    if (feature->subscript != 0) {
        auto* items = static_cast<Array_Base*>(member(instance, feature->offset));
        if (!read_instance_array(converter, meta, feature, data, *items))
            return false;
        *null_flag(instance, feature) = 0;
        return true;
    }
    Ref<Instance> target =
        read_instance(converter, feature->meta_class, data.value, data.type == CMPI_ref);
    if (!target || !accepts(meta, feature, target.get()))
        return false;
    Instance*& slot = reference(instance, feature);
    unref(slot);
    slot = target.release();
    return true;
}

// The type a member takes; TYPE_NONE for what is neither property nor reference.
sint32 expected_type(const Meta_Feature* feature) {
    if (feature->flags & FLAG_PROPERTY) {
        const auto* property = static_cast<const Meta_Property*>(feature);
        return property->type + (property->subscript != 0 ? TYPE_ARRAY : 0);
    }
    if (feature->flags & FLAG_REFERENCE)
        return TYPE_INSTANCE +
               (static_cast<const Meta_Reference*>(feature)->subscript != 0 ? TYPE_ARRAY : 0);
    return TYPE_NONE;
}

// Assigns a value to a member that is null so far; a null value leaves it so.
bool assign(const Converter& converter, const Meta_Features* meta, const Meta_Feature* feature,
            const CMPIData& data, Instance* instance) {
    const sint32 expected = expected_type(feature);
    const sint32 actual = from_cmpi_type(data.type);
    if (actual != expected) {
        CIMPLE_WARN("type mismatch on %s: %s/%s", feature->name, type_word(actual),
                    type_word(expected));
        return false;
    }
    if (!usable(data))
        return true;
    if (feature->flags & FLAG_PROPERTY)
        return assign_property(static_cast<const Meta_Property*>(feature), data, instance);
    return assign_reference(converter, meta, static_cast<const Meta_Reference*>(feature), data,
                            instance);
}

// Reads the members that share a bit with flags (0: all) from the carrier. Everything else is null
// afterwards. meta is the class, or the method, whose structure out has. Names that it does not
// have are ignored: other subclasses of a common base may have them.
template <class Carrier>
void convert_to_instance(const Converter& converter, const Meta_Features* meta, uint32 flags,
                         Carrier carrier, Instance* out) {
    nullify(out, true, true);
    CMPICount count = 0;
    if (!carrier.source || !carrier.count(count))
        return;
    for (CMPICount i = 0; i < count; i++) {
        cmpi::Scoped<CMPIString> name;
        CMPIStatus status = cmpi::GOOD_STATUS;
        CMPIData data = carrier.at(i, name.out(), status);
        const char* text = cmpi::good(status) ? cmpi::chars(name.get()) : nullptr;
        if (!text) {
            CIMPLE_WARN("get_name() failed: class=%s, index=%u", meta->name, i);
            continue;
        }
        const Meta_Feature* feature = find_feature(meta, text, FLAG_PROPERTY | FLAG_REFERENCE);
        if (!feature) {
            CIMPLE_WARN("unknown feature: %s.%s", meta->name, text);
            continue;
        }
        if (flags && !(feature->flags & flags))
            continue;
        Carrier::adjust(data, expected_type(feature));
        if (!assign(converter, meta, feature, data, out))
            CIMPLE_WARN("conversion error: %s.%s", meta->name, text);
    }
}

template <class Carrier>
Ref<Instance> make_instance(const Converter& converter, const Meta_Class* meta_class, uint32 flags,
                            Carrier carrier) {
    Ref<Instance> instance(create(meta_class));
    convert_to_instance(converter, meta_class, flags, carrier, instance.get());
    set_name_space_recursive(instance.get(), converter.name_space.c_str(), false);
    return instance;
}

} // namespace

// The keys of a path that has those of the class under their names, as most do: then no name has
// to be asked for. False, and something of the instance may be set, for any other path.
bool read_keys_by_name(const Converter& converter, const Meta_Class* meta_class,
                       const CMPIObjectPath* path, Instance* out) {
    CMPICount count = 0;
    if (!path || !From_Path{path}.count(count) || count != meta_class->num_keys)
        return false;
    return detail::each_key(meta_class, [&](const Meta_Key& listed) {
        const Meta_Feature* key = meta_class->meta_features[listed.feature];
        CMPIStatus status = cmpi::GOOD_STATUS;
        CMPIData data = path->ft->getKey(path, key->name, &status);
        if (!cmpi::good(status) || (data.state & CMPI_notFound))
            return false;
        From_Path::adjust(data, expected_type(key));
        if (!assign(converter, meta_class, key, data, out))
            CIMPLE_WARN("conversion error: %s.%s", meta_class->name, key->name);
        return true;
    });
}

// ---- Entry points ----

Ref<Instance> make_cimple_reference(const Converter& converter, const Meta_Class* meta_class,
                                    const CMPIObjectPath* path) {
    Ref<Instance> instance(create_null(meta_class));
    if (!read_keys_by_name(converter, meta_class, path, instance.get()))
        return make_instance(converter, meta_class, FLAG_KEY, From_Path{path});
    set_name_space_recursive(instance.get(), converter.name_space.c_str(), false);
    return instance;
}

Ref<Instance> make_foreign_reference(const Converter& converter, const Meta_Class* base,
                                     const CMPIObjectPath* path) {
    CMPICount count = 0;
    if (base->num_keys == 0 || !From_Path{path}.count(count) || count != base->num_keys)
        return {};
    const String name = cmpi::class_name(path);
    if (name.empty())
        return {};
    const Class_Handle foreign(create_meta_class(name.c_str(), base, 0));
    Ref<Instance> instance = make_cimple_reference(converter, foreign.get(), path);
    return keys_all_set(instance.get()) ? instance : Ref<Instance>();
}

Ref<Instance> make_cimple_instance(const Converter& converter, const Meta_Class* meta_class,
                                   const CMPIInstance* instance) {
    return make_instance(converter, meta_class, 0, From_Instance{instance});
}

Ref<Instance> make_method_instance(const Converter& converter, const Meta_Method* method,
                                   const CMPIArgs* args) {
    return make_instance(converter, as_class(method), FLAG_IN, From_Args{args});
}

int read_method_out(const Converter& converter, const CMPIArgs* args, const CMPIData& return_value,
                    Instance* method) {
    const Meta_Features* meta = method->__meta_class;
    convert_to_instance(converter, meta, FLAG_OUT, From_Args{args}, method);
    set_name_space_recursive(method, converter.name_space.c_str(), false);
    const Meta_Feature* feature = find_feature(meta, "return_value", FLAG_PROPERTY);
    if (!usable(return_value))
        return CMPI_RC_OK;
    return feature && assign(converter, meta, feature, return_value, method) ? CMPI_RC_OK
                                                                             : CMPI_RC_ERR_FAILED;
}

} // namespace cimple
