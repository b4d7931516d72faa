// Instances to CMPI objects, and the table of types that both directions share.
#include "cimple/conversion.h"

#include "cimple/cmpi_call.h"
#include "cimple/instance_detail.h"
#include "cimple/log.h"

#include <cstring>

namespace cimple {

// ---- Types ----

namespace {

struct Type_Row {
    CMPIType cmpi_type;
    uint8 size; // of a value in an instance
    const char* word;
    const char* array_word;
};

// By type code.
constexpr Type_Row TYPES[] = {
    {CMPI_boolean, sizeof(boolean), "BOOLEAN", "BOOLEAN_ARRAY"},
    {CMPI_uint8, sizeof(uint8), "UINT8", "UINT8_ARRAY"},
    {CMPI_sint8, sizeof(sint8), "SINT8", "SINT8_ARRAY"},
    {CMPI_uint16, sizeof(uint16), "UINT16", "UINT16_ARRAY"},
    {CMPI_sint16, sizeof(sint16), "SINT16", "SINT16_ARRAY"},
    {CMPI_uint32, sizeof(uint32), "UINT32", "UINT32_ARRAY"},
    {CMPI_sint32, sizeof(sint32), "SINT32", "SINT32_ARRAY"},
    {CMPI_uint64, sizeof(uint64), "UINT64", "UINT64_ARRAY"},
    {CMPI_sint64, sizeof(sint64), "SINT64", "SINT64_ARRAY"},
    {CMPI_real32, sizeof(real32), "REAL32", "REAL32_ARRAY"},
    {CMPI_real64, sizeof(real64), "REAL64", "REAL64_ARRAY"},
    {CMPI_char16, sizeof(char16), "CHAR16", "CHAR16_ARRAY"},
    {CMPI_string, sizeof(String), "STRING", "STRING_ARRAY"},
    {CMPI_dateTime, sizeof(Datetime), "DATETIME", "DATETIME_ARRAY"},
    {CMPI_instance, sizeof(Instance*), "INSTANCE", "INSTANCE_ARRAY"},
};
static_assert(sizeof(TYPES) / sizeof(TYPES[0]) == TYPE_INSTANCE + 1);

} // namespace

CMPIType to_cmpi_type(uint32 type) {
    return type < NUM_TYPES ? TYPES[type].cmpi_type : CMPI_null;
}

sint32 from_cmpi_type(CMPIType type) {
    const sint32 array = type & CMPI_ARRAY ? TYPE_ARRAY : 0;
    const CMPIType element = type & static_cast<CMPIType>(~CMPI_ARRAY);
    if (element == CMPI_ref)
        return TYPE_INSTANCE + array;
    for (sint32 i = 0; i <= TYPE_INSTANCE; i++)
        if (TYPES[i].cmpi_type == element)
            return i + array;
    return TYPE_NONE;
}

const char* type_word(sint32 type) {
    const sint32 element = type & ~TYPE_ARRAY;
    if (type < 0 || element > TYPE_INSTANCE)
        return "NONE";
    return type & TYPE_ARRAY ? TYPES[element].array_word : TYPES[element].word;
}

// ---- Carriers: where a converted member goes. set copies what the value points to, or takes it
// over and leaves a null one. To those that say so a text goes as it is: CMPI_chars, for which the
// pointer is the text itself, spares the broker an object. ----

namespace {

struct To_Instance {
    static constexpr bool TAKES_CHARS = true;
    CMPIInstance* target;
    bool set(const char* name, const CMPIValue* value, CMPIType type) {
        if (cmpi::good(target->ft->setProperty(target, name, value, type)))
            return true;
        CIMPLE_WARN("CMSetProperty() failed: %s", name);
        return false;
    }
};

struct To_Path {
    static constexpr bool TAKES_CHARS = true;
    CMPIObjectPath* target;
    bool set(const char* name, const CMPIValue* value, CMPIType type) {
        if (cmpi::good(target->ft->addKey(target, name, value, type)))
            return true;
        CIMPLE_WARN("CMAddKey() failed");
        return false;
    }
};

struct To_Args {
    static constexpr bool TAKES_CHARS = false;
    CMPIArgs* target;
    CMPIValue* return_value; // the slot for the method's result
    CMPIType* return_type;
    bool set(const char* name, CMPIValue* value, CMPIType type) {
        if (return_value && name_equal(name, "return_value")) {
            *return_value = *value;
            *return_type = type;
            value->string = nullptr;
            return true;
        }
        if (target && cmpi::good(target->ft->addArg(target, name, value, type)))
            return true;
        CIMPLE_WARN("CMAddArg() failed");
        return false;
    }
};

// ---- Values ----

// Where values come from: the broker makes the objects among them.
struct Source {
    const CMPIBroker* broker;
    const char* name_space;
    End_Paths* ends = nullptr; // of the call's associations, if they are kept
};

bool all_members(const Meta_Feature*) {
    return true;
}

template <class Carrier, class Wanted>
void fill(const Source& source, const Instance* instance, Carrier carrier, Wanted wanted);
bool fill_keys(const Source& source, const Instance* instance, CMPIObjectPath* path);

// One value of a property's type, or one element of an array of them.
inline bool scalar_value(const Source& source, const void* from, uint32 type, CMPIValue& value) {
    if (type == TYPE_STRING) {
        value.string = cmpi::new_string(source.broker, static_cast<const String*>(from)->c_str());
        return value.string != nullptr;
    }
    if (type == TYPE_DATETIME) {
        value.dateTime =
            cmpi::new_datetime(source.broker, static_cast<const Datetime*>(from)->ascii().c_str());
        return value.dateTime != nullptr;
    }
    // Every member of the union starts at its first byte. The rest is zero: some brokers read it.
    value.uint64 = 0;
    switch (TYPES[type].size) {
    case 1:
        std::memcpy(&value, from, 1);
        break;
    case 2:
        std::memcpy(&value, from, 2);
        break;
    case 4:
        std::memcpy(&value, from, 4);
        break;
    default:
        std::memcpy(&value, from, 8);
        break;
    }
    return true;
}

// An array of count elements, each made by make_element(index, element). An element that was set
// goes with the array: some brokers keep the object itself.
template <class Make>
bool fill_array(const Source& source, uint32 count, CMPIType element_type, CMPIValue& value,
                Make make_element) {
    cmpi::Scoped<CMPIArray> array(cmpi::new_array(source.broker, count, element_type));
    if (!array)
        return false;
    for (uint32 i = 0; i < count; i++) {
        CMPIValue element;
        if (!make_element(i, element))
            return false;
        if (!cmpi::set_element(array.get(), i, element, element_type)) {
            CIMPLE_WARN("CMSetArrayElementAt() failed");
            cmpi::release(element, element_type);
            return false;
        }
    }
    value.array = array.keep();
    return true;
}

bool array_value(const Source& source, const Array_Base& items, uint32 type, CMPIValue& value) {
    const char* const first = static_cast<const char*>(items.data());
    const uint32 step = TYPES[type].size;
    return fill_array(source, items.size(), to_cmpi_type(type), value,
                      [&](uint32 i, CMPIValue& element) {
                          return scalar_value(source, first + std::size_t{i} * step, type, element);
                      });
}

// A reference becomes an object path, an embedded object an instance. Each lies in its own
// namespace, or in that of what contains it.
bool instance_value(const Source& source, const Instance* instance, bool embedded,
                    CMPIValue& value) {
    if (!instance) {
        CIMPLE_WARN("null instance argument");
        return false;
    }
    const Source own = {source.broker, own_name_space(instance, source.name_space)};
    if (!own.name_space || !instance->__meta_class->name) {
        CIMPLE_WARN(own.name_space ? "null classname" : "null namespace");
        return false;
    }
    cmpi::Scoped<CMPIObjectPath> path(
        cmpi::new_path(own.broker, own.name_space, instance->__meta_class->name));
    if (!path) {
        CIMPLE_WARN("CMNewObjectPath() failed");
        return false;
    }
    if (!fill_keys(own, instance, path.get()))
        return false;
    if (!embedded) {
        value.ref = path.keep();
        return true;
    }
    value.inst = cmpi::new_instance(own.broker, path.get());
    if (!value.inst) {
        CIMPLE_WARN("CMNewInstance() failed");
        return false;
    }
    fill(own, instance, To_Instance{value.inst}, all_members);
    return true;
}

bool instance_array_value(const Source& source, const Array_Base& items, bool embedded,
                          CMPIType element_type, CMPIValue& value) {
    const auto* item = static_cast<const Instance* const*>(items.data());
    return fill_array(source, items.size(), element_type, value, [&](uint32 i, CMPIValue& element) {
        const bool converted = instance_value(source, item[i], embedded, element);
        if (!converted)
            CIMPLE_WARN("element conversion failed");
        return converted;
    });
}

// The value of a property that is not null, with its CMPI type.
inline bool property_value(const Source& source, const void* from, const Meta_Property* property,
                           CMPIValue& value, CMPIType& type) {
    type = TYPES[property->type].cmpi_type;
    if (property->subscript == 0)
        return scalar_value(source, from, property->type, value);
    type |= CMPI_ARRAY;
    return array_value(source, *static_cast<const Array_Base*>(from), property->type, value);
}

bool reference_value(const Source& source, const Instance* instance, const Meta_Reference* feature,
                     CMPIValue& value, CMPIType& type) {
    const bool embedded = (feature->flags & FLAG_EMBEDDED) != 0;
    type = embedded ? CMPI_instance : CMPI_ref;
    if (feature->subscript == 0)
        return instance_value(source, reference(instance, feature), embedded, value);
    const auto* items = static_cast<const Array_Base*>(member(instance, feature->offset));
    const CMPIType element_type = type;
    type |= CMPI_ARRAY;
    return instance_array_value(source, *items, embedded, element_type, value);
}

// Passes a made value on and gives it back.
template <class Carrier>
bool hand_over(Carrier& carrier, const Meta_Feature* feature, bool converted, CMPIValue& value,
               CMPIType type) {
    if (!converted) {
        CIMPLE_WARN("_to_cmpi_data() failed: feature=%s", feature->name);
        return false;
    }
    const bool taken = carrier.set(feature->name, &value, type);
    cmpi::release(value, type);
    return taken;
}

template <class Carrier>
inline bool pass_property(const Source& source, const void* from, const Meta_Property* property,
                          Carrier& carrier) {
    if constexpr (Carrier::TAKES_CHARS) {
        if (property->type == TYPE_STRING && property->subscript == 0) {
            const char* text = static_cast<const String*>(from)->c_str();
            return carrier.set(property->name, reinterpret_cast<const CMPIValue*>(text),
                               CMPI_chars);
        }
    }
    CMPIValue value;
    CMPIType type;
    const bool converted = property_value(source, from, property, value, type);
    return hand_over(carrier, property, converted, value, type);
}

// The path of an end that is kept for the results to come.
template <class Carrier>
bool pass_end(const Source& source, const Instance* end, const Meta_Reference* feature,
              Carrier& carrier) {
    CMPIValue value;
    value.ref = source.ends->find(end);
    if (!value.ref) {
        if (!instance_value(source, end, false, value)) {
            CIMPLE_WARN("_to_cmpi_data() failed: feature=%s", feature->name);
            return false;
        }
        source.ends->keep(end, value.ref);
    }
    return carrier.set(feature->name, &value, CMPI_ref);
}

template <class Carrier>
bool pass_reference(const Source& source, const Instance* instance, const Meta_Reference* feature,
                    Carrier& carrier) {
    if (source.ends && feature->subscript == 0 && !(feature->flags & FLAG_EMBEDDED))
        return pass_end(source, reference(instance, feature), feature, carrier);
    CMPIValue value;
    CMPIType type;
    const bool converted = reference_value(source, instance, feature, value, type);
    return hand_over(carrier, feature, converted, value, type);
}

// Hands one member to the carrier unless it is null; false if it is not taken.
template <class Carrier>
inline bool pass_member(const Source& source, const Instance* instance, const Meta_Feature* feature,
                        Carrier& carrier) {
    bool passed;
    if (feature->flags & FLAG_PROPERTY) {
        const auto* property = static_cast<const Meta_Property*>(feature);
        const auto* from = static_cast<const uint8*>(member(instance, property->offset));
        // Most members of most instances are null: their flags are read here, without a call.
        if (from[property->subscript ? sizeof(Array_Base) : TYPES[property->type].size])
            return true;
        passed = pass_property(source, from, property, carrier);
    } else if ((feature->flags & FLAG_REFERENCE) && !is_null(instance, feature)) {
        passed =
            pass_reference(source, instance, static_cast<const Meta_Reference*>(feature), carrier);
    } else {
        return true;
    }
    if (!passed)
        CIMPLE_WARN("conversion error: %s.%s", instance->__meta_class->name, feature->name);
    return passed;
}

// Hands the members that are wanted and not null to the carrier.
template <class Carrier, class Wanted>
void fill(const Source& source, const Instance* instance, Carrier carrier, Wanted wanted) {
    const Meta_Features* meta = instance->__meta_class;
    for (uint32 i = 0; i < meta->num_meta_features; i++)
        if (wanted(meta->meta_features[i]))
            pass_member(source, instance, meta->meta_features[i], carrier);
}

// The parameters of a method instance that have the flag.
int fill_args(const Source& source, const Instance* method, uint32 flag, const To_Args& carrier) {
    if (!method) {
        CIMPLE_WARN("ignored null instance arg");
        return CMPI_RC_ERR_FAILED;
    }
    fill(source, method, carrier,
         [flag](const Meta_Feature* feature) { return (feature->flags & flag) != 0; });
    return CMPI_RC_OK;
}

// The keys only. False if one is missing for want of the broker's help: the path would name
// nothing.
bool fill_keys(const Source& source, const Instance* instance, CMPIObjectPath* path) {
    const Meta_Class* meta = instance->__meta_class;
    To_Path carrier{path};
    return detail::each_key(meta, [&](const Meta_Key& key) {
        return pass_member(source, instance, meta->meta_features[key.feature], carrier);
    });
}

// One broker needs the key names beside the list, or it would filter the keys out.
void set_property_filter(CMPIInstance* target, const Meta_Features* meta, const char** properties) {
    constexpr uint32 MAX_KEYS = 32;
    const char* keys[MAX_KEYS + 1];
    uint32 count = 0;
    for (uint32 i = 0; i < meta->num_meta_features && count < MAX_KEYS; i++)
        if (meta->meta_features[i]->flags & FLAG_KEY)
            keys[count++] = meta->meta_features[i]->name;
    keys[count] = nullptr;
    target->ft->setPropertyFilter(target, properties, keys);
}

bool is_listed(const char* const* names, const char* name) {
    for (; *names; ++names)
        if (name_equal(*names, name))
            return true;
    return false;
}

} // namespace

// ---- Paths of ends ----

End_Paths::~End_Paths() {
    for (Entry& entry : _entries)
        cmpi::release(entry.path);
}

CMPIObjectPath* End_Paths::find(const Instance* end) const noexcept {
    for (const Entry& entry : _entries)
        if (entry.end.get() == end)
            return entry.path;
    return nullptr;
}

void End_Paths::keep(const Instance* end, CMPIObjectPath* path) noexcept {
    Entry& entry = _entries[_oldest];
    _oldest = (_oldest + 1) % KEPT;
    cmpi::release(entry.path);
    entry.end = Ref<const Instance>::share(end);
    entry.path = path;
}

// ---- Entry points ----

int make_cmpi_object_path(const CMPIBroker* broker, const Instance* instance,
                          const char* name_space, CMPIObjectPath*& out, End_Paths* ends) {
    out = nullptr;
    if (!instance) {
        CIMPLE_WARN("ignored null instance arg");
        return CMPI_RC_ERR_FAILED;
    }
    CMPIObjectPath* path = cmpi::new_path(broker, name_space, instance->__meta_class->name);
    if (!path) {
        CIMPLE_WARN("CMNewObjectPath() failed");
        return CMPI_RC_ERR_FAILED;
    }
    if (!fill_keys({broker, name_space, ends}, instance, path)) {
        cmpi::release(path);
        return CMPI_RC_ERR_FAILED;
    }
    out = path;
    return CMPI_RC_OK;
}

int make_CMPI_instance(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                       CMPIObjectPath* path, const char** properties, CMPIInstance*& out,
                       End_Paths* ends) {
    out = nullptr;
    if (!instance) {
        CIMPLE_WARN("ignored null instance arg");
        return CMPI_RC_ERR_FAILED;
    }
    cmpi::Scoped<CMPIObjectPath> made;
    if (!path) {
        CIMPLE_WARN("No ObjectPath built before call to make_CMPI_instance");
        if (make_cmpi_object_path(broker, instance, name_space, made.out()) != CMPI_RC_OK)
            return CMPI_RC_ERR_FAILED;
        path = made.get();
    }
    CMPIInstance* target = cmpi::new_instance(broker, path);
    if (!target) {
        CIMPLE_WARN("CMNewInstance() failed");
        return CMPI_RC_ERR_FAILED;
    }
    out = target;
    const Source source = {broker, name_space, ends};
    if (!properties) {
        fill(source, instance, To_Instance{target}, all_members);
        return CMPI_RC_OK;
    }
    set_property_filter(target, instance->__meta_class, properties);
    fill(source, instance, To_Instance{target}, [properties](const Meta_Feature* feature) {
        return (feature->flags & FLAG_KEY) || is_listed(properties, feature->name);
    });
    return CMPI_RC_OK;
}

int make_method_args(const CMPIBroker* broker, const char* name_space, const Instance* method,
                     uint32 flag, CMPIArgs* args) {
    return fill_args({broker, name_space}, method, flag, To_Args{args, nullptr, nullptr});
}

int make_method_out(const CMPIBroker* broker, const char* name_space, const Instance* method,
                    CMPIArgs* args, CMPIValue& out_value, CMPIType& out_type) {
    out_type = CMPI_null;
    return fill_args({broker, name_space}, method, FLAG_OUT, To_Args{args, &out_value, &out_type});
}

} // namespace cimple
