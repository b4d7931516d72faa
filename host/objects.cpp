#include "host/objects.h"

#include "host/core.h"
#include "host/text.h"

#include <cstring>

namespace host {

Arena& arena_for(Core& core, Owner owner) {
    if (owner == Owner::caller)
        return core.clones;
    Call* call = Call::top();
    if (call && &call->core == &core)
        return call->arena;
    report(&core, FaultKind::unattached_thread,
           "the object manager was called from a thread that it does not know");
    return core.strays;
}

namespace {

// A dead object has forgotten its maker.
Core* maker_of(const void* pointer, Verdict verdict) {
    return verdict == Verdict::live ? &core_of(pointer) : nullptr;
}

std::string describe(const char* use, Kind kind) {
    return std::string(use) + " of a " + to_string(kind);
}

} // namespace

Object* examine_use(const void* pointer, Kind kind, const char* use) {
    if (!pointer) {
        report(nullptr, FaultKind::bad_argument, describe(use, kind) + " that is null");
        return nullptr;
    }
    const Verdict verdict = examine(pointer);
    if (verdict == Verdict::released) {
        report(nullptr, FaultKind::use_after_release,
               describe(use, kind) + " that was released or ended with its call");
        return nullptr;
    }
    auto* object = static_cast<Object*>(const_cast<void*>(pointer));
    if (verdict == Verdict::foreign || object->kind != kind) {
        report(maker_of(pointer, verdict), FaultKind::foreign_object,
               describe(use, kind) +
                   (verdict == Verdict::foreign
                        ? " that the object manager did not make, or that was overwritten"
                        : std::string(" that is a ") + to_string(object->kind)));
        return nullptr;
    }
    CMPIrc code = CMPI_RC_OK; // the caller's own is answered
    return core_of(object).refuses(false, use, code) ? nullptr : object;
}

CMPIStatus release_object(void* pointer, Kind kind) noexcept {
    if (pointer && examine(pointer) == Verdict::released) {
        report(nullptr, FaultKind::double_release,
               std::string(to_string(kind)) + " that was released or ended with its call");
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    }
    Object* object = examine_use(pointer, kind, "release");
    if (!object)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (object->parameter) {
        report(object->core, FaultKind::released_parameter, to_string(kind));
        return answer(CMPI_RC_ERR_FAILED);
    }
    destroy_object(*object);
    return answer(CMPI_RC_OK);
}

CMPIString* new_string(Core& core, std::string text) {
    return make(core, StringBody(std::move(text)));
}

// ---- Out ----

namespace {

// Where the objects of a value are made: in a container, or for the call.
struct Place {
    Core& core;
    Arena* container;

    template <class B>
    typename B::Cmpi* make(B body) const {
        if (!container)
            return host::make(core, std::move(body));
        Object* object = create_object(core, B::kind, &B::table,
                                       std::make_unique<B>(std::move(body)), *container);
        object->parameter = true;
        return reinterpret_cast<typename B::Cmpi*>(object);
    }
};

CMPIArray* new_array(const Place& place, const Value& value) {
    ArrayBody body;
    body.element_type = value.element_type();
    body.elements = value.as_array();
    body.held.resize(body.elements.size());
    return place.make(std::move(body));
}

void put_integer(CMPIValue& out, CMPIType type, const Value& value) {
    if (is_signed(type)) {
        const std::int64_t number = value.as_signed();
        switch (type) {
        case CMPI_sint8:
            out.sint8 = static_cast<CMPISint8>(number);
            return;
        case CMPI_sint16:
            out.sint16 = static_cast<CMPISint16>(number);
            return;
        case CMPI_sint32:
            out.sint32 = static_cast<CMPISint32>(number);
            return;
        default:
            out.sint64 = number;
            return;
        }
    }
    const std::uint64_t number = value.as_unsigned();
    switch (type) {
    case CMPI_uint8:
        out.uint8 = static_cast<CMPIUint8>(number);
        return;
    case CMPI_uint16:
        out.uint16 = static_cast<CMPIUint16>(number);
        return;
    case CMPI_char16:
        out.char16 = static_cast<CMPIChar16>(number);
        return;
    case CMPI_uint32:
        out.uint32 = static_cast<CMPIUint32>(number);
        return;
    default:
        out.uint64 = number;
        return;
    }
}

void put_value(const Place& place, CMPIValue& out, const Value& value) {
    if (value.is_array()) {
        out.array = new_array(place, value);
        return;
    }
    switch (value.type) {
    case CMPI_boolean:
        out.boolean = value.as_boolean() ? 1 : 0;
        return;
    case CMPI_real32:
        out.real32 = static_cast<float>(value.as_real());
        return;
    case CMPI_real64:
        out.real64 = value.as_real();
        return;
    case CMPI_string:
        out.string = place.make(StringBody(value.as_text()));
        return;
    case CMPI_dateTime: {
        DateTimeBody body;
        body.text = value.as_text();
        out.dateTime = place.make(std::move(body));
        return;
    }
    case CMPI_ref:
        out.ref = place.make(to_body(place.core, *value.as_reference()));
        return;
    case CMPI_instance:
        out.inst = place.make(to_body(place.core, *value.as_instance()));
        return;
    default:
        put_integer(out, value.type, value);
    }
}

CMPIData data_of(const Place& place, const Value& value) {
    CMPIData data{};
    data.type = value.type;
    if (value.is_null())
        data.state = CMPI_nullValue;
    else
        put_value(place, data.value, value);
    return data;
}

} // namespace

CMPIData to_data(Core& core, const Value& value) {
    return data_of({core, nullptr}, value);
}

CMPIData to_data_in(const void* container, const Value& value) {
    return data_of({core_of(container), &contents_of(container)}, value);
}

CMPIData to_key_data_in(const void* container, const Value& value) {
    CMPIData data{};
    if (is_unsigned(value.type))
        data = to_data_in(container, Value::unsigned_number(CMPI_uint64, value.as_unsigned()));
    else if (is_signed(value.type))
        data = to_data_in(container, Value::signed_number(CMPI_sint64, value.as_signed()));
    else
        data = to_data_in(container, value);
    data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    return data;
}

CMPIData missing_data(CMPIType type) {
    CMPIData data{};
    data.type = type;
    data.state = CMPI_nullValue | CMPI_notFound;
    return data;
}

// ---- In ----

namespace {

std::optional<Value> read_array(const CMPIArray* pointer, const char* use) {
    const ArrayBody* body = body_of<ArrayBody>(pointer, use);
    if (!body)
        return std::nullopt;
    for (const ArrayBody::Held& held : body->held) {
        if (held.object &&
            (held.object->state.load() != Object::live || held.object->serial != held.serial)) {
            report(&core_of(pointer), FaultKind::stale_element,
                   "an element was released before the array was used");
            break;
        }
    }
    return Value::array(body->element_type, body->elements);
}

std::optional<Value> read_integer(const CMPIValue& value, CMPIType type) {
    switch (type) {
    case CMPI_uint8:
        return Value::unsigned_number(type, value.uint8);
    case CMPI_uint16:
        return Value::unsigned_number(type, value.uint16);
    case CMPI_char16:
        return Value::unsigned_number(type, value.char16);
    case CMPI_uint32:
        return Value::unsigned_number(type, value.uint32);
    case CMPI_uint64:
        return Value::unsigned_number(type, value.uint64);
    case CMPI_sint8:
        return Value::signed_number(type, value.sint8);
    case CMPI_sint16:
        return Value::signed_number(type, value.sint16);
    case CMPI_sint32:
        return Value::signed_number(type, value.sint32);
    case CMPI_sint64:
        return Value::signed_number(type, value.sint64);
    default:
        return std::nullopt;
    }
}

std::optional<Value> read_text(const char* text) {
    return text ? Value::text(text) : Value::null(CMPI_string);
}

// Objects by pointer; a null one is a null value.
std::optional<Value> read_object(const CMPIValue& value, CMPIType type, const char* use) {
    if (!value.string)
        return Value::null(type);
    switch (type) {
    case CMPI_string: {
        const StringBody* body = body_of<StringBody>(value.string, use);
        return body ? std::optional(Value::text(body->text)) : std::nullopt;
    }
    case CMPI_dateTime: {
        const DateTimeBody* body = body_of<DateTimeBody>(value.dateTime, use);
        return body ? std::optional(Value::datetime(body->text)) : std::nullopt;
    }
    case CMPI_ref: {
        const ObjectPathBody* body = body_of<ObjectPathBody>(value.ref, use);
        return body ? std::optional(Value::reference(body->path)) : std::nullopt;
    }
    default: {
        const InstanceBody* body = body_of<InstanceBody>(value.inst, use);
        return body ? std::optional(Value::instance(to_instance(*body))) : std::nullopt;
    }
    }
}

// A text goes on to clients that take nothing but UTF-8.
std::optional<Value> checked_text(Core& core, std::optional<Value> value, const char* use) {
    if (value && value->type == CMPI_string && !value->is_null() && !is_utf8(value->as_text()))
        report(&core, FaultKind::bad_text, use);
    return value;
}

bool is_chars(CMPIType type) {
    return type == CMPI_chars || type == CMPI_charsptr;
}

} // namespace

std::optional<Value> from_cmpi(Core& core, const CMPIValue* value, CMPIType type, const char* use) {
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (!value) // a null of the type meant
        return Value::null(
            is_chars(element) ? static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY)) : type);
    if ((type & CMPI_ARRAY) != 0)
        return value->array ? read_array(value->array, use) : Value::null(type);
    switch (type) {
    case CMPI_null:
        return Value::null(CMPI_null);
    case CMPI_boolean:
        return Value::boolean(value->boolean != 0);
    case CMPI_real32:
        return Value::real(type, value->real32);
    case CMPI_real64:
        return Value::real(type, value->real64);
    case CMPI_chars:
        return checked_text(core, read_text(reinterpret_cast<const char*>(value)), use);
    case CMPI_charsptr:
        return checked_text(core, read_text(value->chars), use);
    case CMPI_string:
    case CMPI_dateTime:
    case CMPI_ref:
    case CMPI_instance:
        return checked_text(core, read_object(*value, type, use), use);
    default:
        break;
    }
    std::optional<Value> number = read_integer(*value, type);
    if (!number)
        report(&core, FaultKind::bad_argument,
               std::string(use) + ": " + type_name(type) + " cannot be given");
    return number;
}

// ---- Paths and instances ----

ObjectPathBody to_body(Core& core, ObjectPath path) {
    ObjectPathBody body;
    body.known = core.classes.find(path.class_name);
    body.path = std::move(path);
    return body;
}

InstanceBody to_body(Core& core, const Instance& instance) {
    InstanceBody body;
    body.path = instance.path;
    body.known = core.classes.find(instance.class_name());
    body.values.resize(body.known ? body.known->properties.size() : 0);
    for (const Named_Value& named : instance.properties) {
        const std::size_t at = body.known ? body.known->index_of(named.name) : Class::npos;
        if (at != Class::npos)
            body.values[at] = named.value;
    }
    return body;
}

Instance to_instance(const InstanceBody& body, bool with_defaults) {
    Instance instance;
    instance.path.name_space = body.path.name_space;
    instance.path.class_name = body.path.class_name;
    for (std::size_t i = 0; i < body.values.size(); ++i) {
        const Property& property = body.known->properties[i];
        const bool left_null = !body.values[i] || body.values[i]->is_null();
        if (with_defaults && left_null && !property.default_value.is_null() &&
            (!body.wanted || (*body.wanted)[i]))
            instance.properties.push_back({property.name, property.default_value});
        else if (body.values[i])
            instance.properties.push_back({property.name, *body.values[i]});
        if (!property.key)
            continue;
        if (body.values[i] && !body.values[i]->is_null())
            instance.path.keys.push_back({property.name, *body.values[i]});
        else if (const Value* given = body.path.key(property.name))
            instance.path.keys.push_back({property.name, *given});
    }
    return instance;
}

} // namespace host
