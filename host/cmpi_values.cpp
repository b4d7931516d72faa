// The tables of strings, datetimes and arrays.

#include "host/core.h"
#include "host/datetime.h"

namespace host {

// ---- CMPIString ----

void StringBody::poison() {
    text.assign(text.size(), '\xDD');
}

namespace {

const char* string_chars(const CMPIString* string, CMPIStatus* status) noexcept {
    const StringBody* body = body_of<StringBody>(string, "getCharPtr");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? body->text.c_str() : nullptr;
}

} // namespace

const CMPIStringFT StringBody::table = {CMPIVersion100, release<StringBody>, clone<StringBody>,
                                        string_chars};

// ---- CMPIDateTime ----

namespace {

CMPIUint64 datetime_binary(const CMPIDateTime* datetime, CMPIStatus* status) noexcept {
    const DateTimeBody* body = body_of<DateTimeBody>(datetime, "getBinaryFormat");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? parse_datetime(body->text).value_or(DateTime{}).microseconds : 0;
}

CMPIString* datetime_text(const CMPIDateTime* datetime, CMPIStatus* status) noexcept {
    const DateTimeBody* body = body_of<DateTimeBody>(datetime, "getStringFormat");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? new_string(core_of(datetime), body->text) : nullptr;
}

CMPIBoolean datetime_is_interval(const CMPIDateTime* datetime, CMPIStatus* status) noexcept {
    const DateTimeBody* body = body_of<DateTimeBody>(datetime, "isInterval");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body && parse_datetime(body->text).value_or(DateTime{}).interval;
}

} // namespace

const CMPIDateTimeFT DateTimeBody::table = {CMPIVersion100,      release<DateTimeBody>,
                                            clone<DateTimeBody>, datetime_binary,
                                            datetime_text,       datetime_is_interval};

// ---- CMPIArray ----

namespace {

CMPICount array_size(const CMPIArray* array, CMPIStatus* status) noexcept {
    const ArrayBody* body = body_of<ArrayBody>(array, "getSize");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? static_cast<CMPICount>(body->elements.size()) : 0;
}

CMPIType array_type(const CMPIArray* array, CMPIStatus* status) noexcept {
    const ArrayBody* body = body_of<ArrayBody>(array, "getSimpleType");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? body->element_type : CMPI_null;
}

CMPIData array_element(const CMPIArray* array, CMPICount index, CMPIStatus* status) noexcept {
    const ArrayBody* body = body_of<ArrayBody>(array, "getElementAt");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    if (!body)
        return missing_data();
    if (index >= body->elements.size()) {
        put(status, CMPI_RC_ERR_INVALID_PARAMETER);
        return missing_data(body->element_type);
    }
    return to_data_in(array, body->elements[index]);
}

bool is_text_type(CMPIType type) {
    return type == CMPI_string || type == CMPI_chars || type == CMPI_charsptr;
}

CMPIStatus array_set(CMPIArray* array, CMPICount index, const CMPIValue* value,
                     CMPIType type) noexcept {
    ArrayBody* body = body_of<ArrayBody>(array, "setElementAt");
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    Core& core = core_of(array);
    if (index >= body->elements.size()) {
        report(&core, FaultKind::bad_argument,
               "setElementAt: index " + std::to_string(index) + " of an array of " +
                   std::to_string(body->elements.size()));
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    const bool same = type == body->element_type || type == CMPI_null ||
                      (is_text_type(type) && body->element_type == CMPI_string);
    if (!same) {
        report(&core, FaultKind::type_mismatch,
               "setElementAt: " + type_name(body->element_type) + " expected, got " +
                   type_name(type));
        return answer(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    std::optional<Value> element = from_cmpi(core, value, type, "setElementAt");
    if (!element)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (element->is_null())
        element->type = body->element_type;
    ArrayBody::Held held;
    if (!element->is_null() && (type & CMPI_ENC) != 0 && !(type == CMPI_chars) &&
        type != CMPI_charsptr) {
        auto* object = reinterpret_cast<Object*>(value->string);
        held = {object, object->serial};
        // It goes with the array, unless it has another owner already.
        if (!object->parameter && object->arena != &core.clones)
            adopt(*object, body->contents);
    }
    body->elements[index] = std::move(*element);
    body->held[index] = held;
    return answer(CMPI_RC_OK);
}

} // namespace

const CMPIArrayFT ArrayBody::table = {CMPIVersion100, release<ArrayBody>, clone<ArrayBody>,
                                      array_size,     array_type,         array_element,
                                      array_set};

} // namespace host
