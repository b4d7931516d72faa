// The tables of what goes with a call: arguments, results, enumerations, contexts, select
// expressions.

#include "host/core.h"
#include "host/value_check.h"

namespace host {

// ---- Named values, which arguments and contexts are ----

namespace {

// The values of an object that has them as a member; `call` is what its caller calls.
template <class Body, class Object>
const Named_Values* values_of(const Object* object, Named_Values Body::*values, const char* call,
                              CMPIStatus* status) {
    const Body* body = body_of<Body>(object, call);
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? &(body->*values) : nullptr;
}

template <class Body, class Object>
CMPIData get_named(const Object* object, Named_Values Body::*values, const char* call,
                   const char* name, CMPIStatus* status) {
    const Named_Values* known = values_of(object, values, call, status);
    const Value* value = known && name ? find(*known, name) : nullptr;
    if (value)
        return to_data_in(object, *value);
    if (known)
        put(status, CMPI_RC_ERR_NOT_FOUND);
    return missing_data();
}

template <class Body, class Object>
CMPIData get_at(const Object* object, Named_Values Body::*values, const char* call, CMPICount index,
                CMPIString** name, CMPIStatus* status) {
    if (name)
        *name = nullptr;
    const Named_Values* known = values_of(object, values, call, status);
    if (!known || index >= known->size()) {
        if (known)
            put(status, CMPI_RC_ERR_NOT_FOUND);
        return missing_data();
    }
    if (name)
        *name = new_string(core_of(object), (*known)[index].name);
    return to_data_in(object, (*known)[index].value);
}

template <class Body, class Object>
CMPICount count_named(const Object* object, Named_Values Body::*values, const char* call,
                      CMPIStatus* status) {
    const Named_Values* known = values_of(object, values, call, status);
    return known ? static_cast<CMPICount>(known->size()) : 0;
}

} // namespace

// ---- CMPIArgs ----

namespace {

// Outputs of a method must be what the class declares.
CMPIrc check_output(Core& core, const Method& method, const char* name, Value& value) {
    const Parameter* parameter = method.find(name);
    if (!parameter || !parameter->out) {
        report(&core, FaultKind::bad_output, "addArg: " + method.name + " has no output " + name);
        return CMPI_RC_ERR_INVALID_PARAMETER;
    }
    if (Complaint wrong = check_value(core.classes, *parameter, value)) {
        report(&core, FaultKind::bad_output,
               "addArg: " + method.name + "." + parameter->name + ": " + *wrong);
        return CMPI_RC_ERR_TYPE_MISMATCH;
    }
    return CMPI_RC_OK;
}

CMPIStatus args_add(const CMPIArgs* args, const char* name, const CMPIValue* value,
                    CMPIType type) noexcept {
    ArgsBody* body = body_of<ArgsBody>(args, "addArg");
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    Core& core = core_of(args);
    if (!name) {
        report(&core, FaultKind::bad_argument, "addArg without a name");
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    std::optional<Value> given = from_cmpi(core, value, type, "addArg");
    if (!given)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (body->outputs_of)
        if (const CMPIrc rc = check_output(core, *body->outputs_of, name, *given); rc != CMPI_RC_OK)
            return answer(rc);
    set(body->values, name, std::move(*given));
    return answer(CMPI_RC_OK);
}

CMPIData args_get(const CMPIArgs* args, const char* name, CMPIStatus* status) noexcept {
    return get_named(args, &ArgsBody::values, "getArg", name, status);
}

CMPIData args_get_at(const CMPIArgs* args, CMPICount index, CMPIString** name,
                     CMPIStatus* status) noexcept {
    return get_at(args, &ArgsBody::values, "getArgAt", index, name, status);
}

CMPICount args_count(const CMPIArgs* args, CMPIStatus* status) noexcept {
    return count_named(args, &ArgsBody::values, "getArgCount", status);
}

} // namespace

const CMPIArgsFT ArgsBody::table = {CMPIVersion100, release<ArgsBody>, clone<ArgsBody>, args_add,
                                    args_get,       args_get_at,       args_count};

// ---- CMPIResult ----

namespace {

ResultBody* use_result(const CMPIResult* result, Answer answer, const char* function) {
    ResultBody* body = body_of<ResultBody>(result, function);
    if (!body)
        return nullptr;
    const char* wrong = body->done               ? " after returnDone"
                        : body->answer != answer ? " in a call that answers something else"
                                                 : nullptr;
    if (wrong)
        report(&core_of(result), FaultKind::wrong_result, std::string(function) + wrong);
    return wrong ? nullptr : body;
}

// What may be answered: a complete path of a class that fits the question.
CMPIrc check_answer(Core& core, const ResultBody& body, ObjectPath& path, const char* function) {
    if (path.name_space.empty())
        path.name_space = body.name_space;
    const Class* known = core.classes.find(path.class_name);
    if (!known) {
        report(&core, FaultKind::unknown_class, std::string(function) + ": " + path.class_name);
        return CMPI_RC_ERR_INVALID_CLASS;
    }
    if (body.of_class && !known->is_a(body.of_class)) {
        report(&core, FaultKind::wrong_result,
               std::string(function) + ": a " + known->name + " where a " + body.of_class->name +
                   " was asked for");
        return CMPI_RC_ERR_INVALID_CLASS;
    }
    if (Complaint wrong = check_path(core.classes, path)) {
        report(&core, FaultKind::bad_path, std::string(function) + ": " + *wrong);
        return CMPI_RC_ERR_INVALID_PARAMETER;
    }
    return CMPI_RC_OK;
}

// References among the properties name objects completely, too.
CMPIrc check_references(Core& core, const Instance& instance) {
    for (const Named_Value& named : instance.properties) {
        const ObjectPath* target = named.value.as_reference();
        if (!target)
            continue;
        ObjectPath copy = *target;
        if (Complaint wrong = check_path(core.classes, copy)) {
            report(&core, FaultKind::bad_path,
                   "returnInstance: " + instance.class_name() + "." + named.name + ": " + *wrong);
            return CMPI_RC_ERR_INVALID_PARAMETER;
        }
    }
    return CMPI_RC_OK;
}

CMPIStatus result_data(const CMPIResult* result, const CMPIValue* value, CMPIType type) noexcept {
    ResultBody* body = use_result(result, Answer::data, "returnData");
    if (!body)
        return answer(CMPI_RC_ERR_FAILED);
    Core& core = core_of(result);
    std::optional<Value> given = from_cmpi(core, value, type, "returnData");
    if (!given)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (!value || body->data) {
        report(&core, FaultKind::wrong_result, value ? "returnData twice" : "returnData of a null");
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    if (body->data_type) {
        if (Complaint wrong = check_value(core.classes, *body->data_type, *given)) {
            report(&core, FaultKind::wrong_result, "returnData: " + *wrong);
            return answer(CMPI_RC_ERR_TYPE_MISMATCH);
        }
    }
    body->data = std::move(given);
    return answer(CMPI_RC_OK);
}

CMPIStatus result_instance(const CMPIResult* result, const CMPIInstance* inst) noexcept {
    ResultBody* body = use_result(result, Answer::instances, "returnInstance");
    const InstanceBody* given = body_of<InstanceBody>(inst, "returnInstance");
    if (!body || !given)
        return answer(CMPI_RC_ERR_FAILED);
    Core& core = core_of(result);
    const bool with_defaults = core.options.strict && core.options.class_defaults;
    Instance instance = to_instance(*given, with_defaults);
    CMPIrc rc = check_answer(core, *body, instance.path, "returnInstance");
    if (rc == CMPI_RC_OK)
        rc = check_references(core, instance);
    if (rc == CMPI_RC_OK)
        body->instances.push_back(std::move(instance));
    return answer(rc);
}

CMPIStatus result_path(const CMPIResult* result, const CMPIObjectPath* op) noexcept {
    ResultBody* body = use_result(result, Answer::paths, "returnObjectPath");
    const ObjectPathBody* given = body_of<ObjectPathBody>(op, "returnObjectPath");
    if (!body || !given)
        return answer(CMPI_RC_ERR_FAILED);
    ObjectPath path = given->path;
    const CMPIrc rc = check_answer(core_of(result), *body, path, "returnObjectPath");
    if (rc == CMPI_RC_OK)
        body->paths.push_back(std::move(path));
    return answer(rc);
}

CMPIStatus result_done(const CMPIResult* result) noexcept {
    ResultBody* body = body_of<ResultBody>(result, "returnDone");
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (body->done)
        report(&core_of(result), FaultKind::wrong_result, "returnDone twice");
    body->done = true;
    return answer(CMPI_RC_OK);
}

// A second handle to one answer makes no sense.
CMPIResult* result_clone(const CMPIResult* result, CMPIStatus* status) noexcept {
    const bool usable = body_of<ResultBody>(result, "clone") != nullptr;
    put(status, usable ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_ERR_INVALID_HANDLE);
    return nullptr;
}

} // namespace

const CMPIResultFT ResultBody::table = {CMPIVersion100, release<ResultBody>, result_clone,
                                        result_data,    result_instance,     result_path,
                                        result_done};

// ---- CMPIEnumeration ----

namespace {

CMPIData enumeration_next(const CMPIEnumeration* enumeration, CMPIStatus* status) noexcept {
    EnumerationBody* body = body_of<EnumerationBody>(enumeration, "getNext");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    if (!body)
        return missing_data();
    if (body->next >= body->elements.size()) {
        put(status, CMPI_RC_ERR_NOT_FOUND);
        return missing_data(body->element_type);
    }
    CMPIData data = to_data_in(enumeration, body->elements[body->next++]);
    if (core_of(enumeration).options.elements_marked_null)
        data.state = static_cast<CMPIValueState>(data.state | CMPI_nullValue);
    return data;
}

CMPIBoolean enumeration_has_next(const CMPIEnumeration* enumeration, CMPIStatus* status) noexcept {
    const EnumerationBody* body = body_of<EnumerationBody>(enumeration, "hasNext");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body && body->next < body->elements.size();
}

CMPIArray* enumeration_array(const CMPIEnumeration* enumeration, CMPIStatus* status) noexcept {
    const EnumerationBody* body = body_of<EnumerationBody>(enumeration, "toArray");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    if (!body)
        return nullptr;
    return to_data(core_of(enumeration), Value::array(body->element_type, body->elements))
        .value.array;
}

} // namespace

const CMPIEnumerationFT EnumerationBody::table = {CMPIVersion100,         release<EnumerationBody>,
                                                  clone<EnumerationBody>, enumeration_next,
                                                  enumeration_has_next,   enumeration_array};

// ---- CMPIContext ----

namespace {

CMPIData context_entry(const CMPIContext* context, const char* name, CMPIStatus* status) noexcept {
    return get_named(context, &ContextBody::entries, "getEntry", name, status);
}

CMPIData context_entry_at(const CMPIContext* context, CMPICount index, CMPIString** name,
                          CMPIStatus* status) noexcept {
    return get_at(context, &ContextBody::entries, "getEntryAt", index, name, status);
}

CMPICount context_count(const CMPIContext* context, CMPIStatus* status) noexcept {
    return count_named(context, &ContextBody::entries, "getEntryCount", status);
}

CMPIStatus context_add(const CMPIContext* context, const char* name, const CMPIValue* value,
                       CMPIType type) noexcept {
    ContextBody* body = body_of<ContextBody>(context, "addEntry");
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    std::optional<Value> given = from_cmpi(core_of(context), value, type, "addEntry");
    if (!given || !name)
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    set(body->entries, name, std::move(*given));
    return answer(CMPI_RC_OK);
}

} // namespace

const CMPIContextFT ContextBody::table = {CMPIVersion100, release<ContextBody>, clone<ContextBody>,
                                          context_entry,  context_entry_at,     context_count,
                                          context_add};

// ---- CMPISelectExp: carries its text; conditions are not evaluated here ----

namespace {

CMPIBoolean select_evaluate(const CMPISelectExp* exp, const CMPIInstance*,
                            CMPIStatus* status) noexcept {
    const bool usable = body_of<SelectExpBody>(exp, "evaluate") != nullptr;
    put(status, usable ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_ERR_INVALID_HANDLE);
    return 0;
}

CMPIString* select_text(const CMPISelectExp* exp, CMPIStatus* status) noexcept {
    const SelectExpBody* body = body_of<SelectExpBody>(exp, "getString");
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body ? new_string(core_of(exp), body->query) : nullptr;
}

CMPISelectCond* select_condition(const CMPISelectExp* exp, CMPIStatus* status) noexcept {
    const bool usable = body_of<SelectExpBody>(exp, "getDOC or getCOD") != nullptr;
    put(status, usable ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_ERR_INVALID_HANDLE);
    return nullptr;
}

CMPIBoolean select_evaluate_accessor(const CMPISelectExp* exp, CMPIAccessor*, void*,
                                     CMPIStatus* status) noexcept {
    return select_evaluate(exp, nullptr, status);
}

} // namespace

const CMPISelectExpFT SelectExpBody::table = {
    CMPIVersion100, release<SelectExpBody>, clone<SelectExpBody>, select_evaluate,
    select_text,    select_condition,       select_condition,     select_evaluate_accessor};

} // namespace host
