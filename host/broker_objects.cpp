// The table with which a provider makes objects, asks about them, and reports.

#include "host/broker.h"
#include "host/core.h"
#include "host/datetime.h"
#include "host/path_text.h"

#include <cstdarg>
#include <cstdio>

namespace host {

namespace {

Core* use(const CMPIBroker* broker, const char* function, CMPIStatus* status) {
    Core* core = core_of_broker(broker, function);
    CMPIrc code = core ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE;
    if (core && core->refuses(false, function, code))
        core = nullptr;
    put(status, code);
    return core;
}

std::nullptr_t refuse(Core* core, CMPIStatus* status, CMPIrc rc, FaultKind kind, std::string text) {
    report(core, kind, std::move(text));
    put(status, rc);
    return nullptr;
}

CMPIInstance* new_instance(const CMPIBroker* broker, const CMPIObjectPath* op,
                           CMPIStatus* status) noexcept {
    Core* core = use(broker, "newInstance", status);
    const ObjectPathBody* path = core ? body_of<ObjectPathBody>(op, "newInstance") : nullptr;
    if (!path) {
        put(status, CMPI_RC_ERR_INVALID_HANDLE);
        return nullptr;
    }
    if (!path->known)
        return refuse(core, status, CMPI_RC_ERR_INVALID_CLASS, FaultKind::unknown_class,
                      "newInstance of " + path->path.class_name);
    InstanceBody body;
    body.path = path->path;
    body.path.class_name = path->known->name;
    body.known = path->known;
    body.values.resize(path->known->properties.size());
    return make(*core, std::move(body));
}

// A path may be made of any class: only its use needs one that exists.
CMPIObjectPath* new_path(const CMPIBroker* broker, const char* name_space, const char* class_name,
                         CMPIStatus* status) noexcept {
    Core* core = use(broker, "newObjectPath", status);
    if (!core)
        return nullptr;
    if (!class_name)
        return refuse(core, status, CMPI_RC_ERR_INVALID_PARAMETER, FaultKind::bad_argument,
                      "newObjectPath without a class");
    return make(*core, to_body(*core, ObjectPath{name_space ? name_space : "", class_name, {}}));
}

CMPIArgs* new_args(const CMPIBroker* broker, CMPIStatus* status) noexcept {
    Core* core = use(broker, "newArgs", status);
    return core ? make(*core, ArgsBody()) : nullptr;
}

CMPIString* new_text(const CMPIBroker* broker, const char* text, CMPIStatus* status) noexcept {
    Core* core = use(broker, "newString", status);
    if (!core)
        return nullptr;
    if (!text)
        return refuse(core, status, CMPI_RC_ERR_INVALID_PARAMETER, FaultKind::bad_argument,
                      "newString of a null");
    return new_string(*core, text);
}

bool can_be_element(CMPIType type) {
    return (type & CMPI_ARRAY) == 0 && type_name(type).rfind("type ", 0) != 0 && type != CMPI_null;
}

CMPIArray* new_array(const CMPIBroker* broker, CMPICount size, CMPIType type,
                     CMPIStatus* status) noexcept {
    constexpr CMPICount most = 1 << 24;
    Core* core = use(broker, "newArray", status);
    if (!core)
        return nullptr;
    if (size > most || !can_be_element(type))
        return refuse(core, status, CMPI_RC_ERR_INVALID_PARAMETER, FaultKind::bad_argument,
                      "newArray of " + std::to_string(size) + " elements of " + type_name(type));
    ArrayBody body;
    body.element_type = type == CMPI_chars || type == CMPI_charsptr ? CMPI_string : type;
    body.elements.assign(size, Value::null(body.element_type));
    body.held.resize(size);
    return make(*core, std::move(body));
}

CMPIDateTime* new_datetime_text(Core& core, std::string text) {
    DateTimeBody body;
    body.text = std::move(text);
    return make(core, std::move(body));
}

CMPIDateTime* new_datetime(const CMPIBroker* broker, CMPIStatus* status) noexcept {
    Core* core = use(broker, "newDateTime", status);
    return core ? new_datetime_text(*core, format_datetime({false, core->now()})) : nullptr;
}

CMPIDateTime* new_datetime_binary(const CMPIBroker* broker, CMPIUint64 microseconds,
                                  CMPIBoolean interval, CMPIStatus* status) noexcept {
    Core* core = use(broker, "newDateTimeFromBinary", status);
    return core ? new_datetime_text(*core, format_datetime({interval != 0, microseconds}))
                : nullptr;
}

CMPIDateTime* new_datetime_chars(const CMPIBroker* broker, const char* text,
                                 CMPIStatus* status) noexcept {
    Core* core = use(broker, "newDateTimeFromChars", status);
    if (!core)
        return nullptr;
    if (!text || !parse_datetime(text))
        return refuse(core, status, CMPI_RC_ERR_INVALID_PARAMETER, FaultKind::bad_argument,
                      "newDateTimeFromChars of " + (text ? quote(text) : "a null"));
    return new_datetime_text(*core, text);
}

CMPISelectExp* new_select(const CMPIBroker* broker, const char* query, const char* language,
                          CMPIArray** projection, CMPIStatus* status) noexcept {
    Core* core = use(broker, "newSelectExp", status);
    if (projection)
        *projection = nullptr;
    if (!core)
        return nullptr;
    SelectExpBody body;
    body.query = query ? query : "";
    body.language = language ? language : "";
    return make(*core, std::move(body));
}

CMPIBoolean class_path_is_a(const CMPIBroker* broker, const CMPIObjectPath* op,
                            const char* class_name, CMPIStatus* status) noexcept {
    Core* core = use(broker, "classPathIsA", status);
    const ObjectPathBody* path = core ? body_of<ObjectPathBody>(op, "classPathIsA") : nullptr;
    if (!path) {
        put(status, CMPI_RC_ERR_INVALID_HANDLE);
        return 0;
    }
    const Class* ancestor = class_name ? core->classes.find(class_name) : nullptr;
    if (!ancestor || !path->known) {
        put(status, CMPI_RC_ERR_INVALID_CLASS);
        return 0;
    }
    return path->known->is_a(ancestor);
}

// ---- About any object ----

const Object* any_object(const void* pointer, const char* function, CMPIStatus* status) {
    const bool live = pointer && examine(pointer) == Verdict::live;
    if (live)
        return static_cast<const Object*>(pointer);
    // The examination for a kind has the words for what is wrong.
    examine_use(pointer, Kind::string, function);
    put(status, CMPI_RC_ERR_INVALID_HANDLE);
    return nullptr;
}

CMPIString* object_text(const CMPIBroker* broker, const void* pointer,
                        CMPIStatus* status) noexcept {
    Core* core = use(broker, "toString", status);
    const Object* object = core ? any_object(pointer, "toString", status) : nullptr;
    if (!object)
        return nullptr;
    switch (object->kind) {
    case Kind::string:
        return new_string(*core, static_cast<const StringBody*>(object->body)->text);
    case Kind::datetime:
        return new_string(*core, static_cast<const DateTimeBody*>(object->body)->text);
    case Kind::object_path:
        return new_string(*core,
                          path_to_text(static_cast<const ObjectPathBody*>(object->body)->path, ""));
    case Kind::instance:
        return new_string(
            *core,
            path_to_text(to_instance(*static_cast<const InstanceBody*>(object->body)).path, ""));
    default:
        return new_string(*core, to_string(object->kind));
    }
}

CMPIBoolean is_of_type(const CMPIBroker* broker, const void* pointer, const char* type,
                       CMPIStatus* status) noexcept {
    Core* core = use(broker, "isOfType", status);
    const Object* object = core ? any_object(pointer, "isOfType", status) : nullptr;
    return object && type && same_name(type, to_string(object->kind));
}

CMPIString* object_type(const CMPIBroker* broker, const void* pointer,
                        CMPIStatus* status) noexcept {
    Core* core = use(broker, "getType", status);
    const Object* object = core ? any_object(pointer, "getType", status) : nullptr;
    return object ? new_string(*core, to_string(object->kind)) : nullptr;
}

// ---- Messages ----

// The variable arguments of getMessage: a type as an int, then the value.
std::string message_argument(std::va_list& arguments) {
    const auto type = static_cast<CMPIType>(va_arg(arguments, int));
    switch (type) {
    case CMPI_sint32:
        return std::to_string(va_arg(arguments, int));
    case CMPI_uint32:
        return std::to_string(va_arg(arguments, unsigned));
    case CMPI_sint64:
        return std::to_string(va_arg(arguments, long long));
    case CMPI_uint64:
        return std::to_string(va_arg(arguments, unsigned long long));
    case CMPI_real64:
        return std::to_string(va_arg(arguments, double));
    case CMPI_boolean:
        return va_arg(arguments, int) != 0 ? "true" : "false";
    case CMPI_chars: {
        const char* text = va_arg(arguments, const char*);
        return text ? text : "";
    }
    default: {
        const StringBody* text =
            body_of<StringBody>(va_arg(arguments, const CMPIString*), "getMessage");
        return text ? text->text : "";
    }
    }
}

// There is no catalogue of messages: the default text, $0, $1 and so on replaced by the arguments.
CMPIString* message(const CMPIBroker* broker, const char*, const char* text, CMPIStatus* status,
                    CMPICount count, ...) noexcept {
    Core* core = use(broker, "getMessage", status);
    if (!core)
        return nullptr;
    std::string result = text ? text : "";
    std::va_list arguments;
    va_start(arguments, count);
    for (CMPICount i = 0; i < count; ++i) {
        const std::string mark = "$" + std::to_string(i), value = message_argument(arguments);
        if (const std::size_t at = result.find(mark); at != std::string::npos)
            result.replace(at, mark.size(), value);
    }
    va_end(arguments);
    return new_string(*core, std::move(result));
}

CMPIStatus keep_message(const CMPIBroker* broker, const char* function, int severity,
                        const char* id, const char* text, const CMPIString* string) {
    Core* core = use(broker, function, nullptr);
    if (!core)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    std::string line = text ? text : "";
    if (!text && string)
        if (const StringBody* body = body_of<StringBody>(string, function))
            line = body->text;
    core->trace(std::string(function) + " " + (id ? id : "") + ": " + line);
    constexpr std::size_t kept = 10'000;
    const std::lock_guard lock(core->records_mutex);
    if (core->messages.size() < kept)
        core->messages.push_back({severity, id ? id : "", std::move(line)});
    return answer(CMPI_RC_OK);
}

CMPIStatus log_message(const CMPIBroker* broker, int severity, const char* id, const char* text,
                       const CMPIString* string) noexcept {
    return keep_message(broker, "logMessage", severity, id, text, string);
}

CMPIStatus trace_message(const CMPIBroker* broker, int, const char* component, const char* text,
                         const CMPIString* string) noexcept {
    return keep_message(broker, "trace", 0, component, text, string);
}

} // namespace

const CMPIBrokerEncFT object_functions = {
    CMPIVersion100,     new_instance, new_path,        new_args,
    new_text,           new_array,    new_datetime,    new_datetime_binary,
    new_datetime_chars, new_select,   class_path_is_a, object_text,
    is_of_type,         object_type,  message,         log_message,
    trace_message};

} // namespace host
