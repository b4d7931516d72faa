// The table of instances.

#include "host/core.h"
#include "host/value_check.h"

namespace host {

namespace {

InstanceBody* use(const CMPIInstance* inst, const char* function, CMPIStatus* status) {
    InstanceBody* body = body_of<InstanceBody>(inst, function);
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body;
}

CMPIData value_data(const CMPIInstance* inst, const Property& property,
                    const std::optional<Value>& value) {
    CMPIData data = to_data_in(inst, value ? *value : Value::null(property.type));
    if (property.key)
        data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    return data;
}

CMPIData instance_property(const CMPIInstance* inst, const char* name,
                           CMPIStatus* status) noexcept {
    const InstanceBody* body = use(inst, "getProperty", status);
    if (!body)
        return missing_data();
    const std::size_t at = name && body->known ? body->known->index_of(name) : Class::npos;
    if (at == Class::npos) {
        put(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
        return missing_data();
    }
    return value_data(inst, body->known->properties[at], body->values[at]);
}

// Indices count the properties that were set.
CMPIData instance_property_at(const CMPIInstance* inst, CMPICount index, CMPIString** name,
                              CMPIStatus* status) noexcept {
    const InstanceBody* body = use(inst, "getPropertyAt", status);
    if (name)
        *name = nullptr;
    if (!body)
        return missing_data();
    for (std::size_t at = 0; at < body->values.size(); ++at) {
        if (!body->values[at] || index-- > 0)
            continue;
        const Property& property = body->known->properties[at];
        if (name)
            *name = new_string(core_of(inst), property.name);
        return value_data(inst, property, body->values[at]);
    }
    put(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return missing_data();
}

CMPICount instance_property_count(const CMPIInstance* inst, CMPIStatus* status) noexcept {
    const InstanceBody* body = use(inst, "getPropertyCount", status);
    CMPICount count = 0;
    if (body)
        for (const std::optional<Value>& value : body->values)
            count += value.has_value();
    return count;
}

CMPIStatus instance_set_property(const CMPIInstance* inst, const char* name, const CMPIValue* value,
                                 CMPIType type) noexcept {
    InstanceBody* body = use(inst, "setProperty", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    Core& core = core_of(inst);
    const std::string& class_name = body->path.class_name;
    const std::size_t at = name && body->known ? body->known->index_of(name) : Class::npos;
    if (at == Class::npos) {
        report(&core, FaultKind::unknown_property,
               "setProperty: " + class_name + " has no property " + (name ? name : "(null)"));
        return answer(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    const Property& property = body->known->properties[at];
    std::optional<Value> given = from_cmpi(core, value, type, "setProperty");
    if (!given)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (Complaint wrong = check_value(core.classes, property, *given)) {
        report(&core, FaultKind::type_mismatch,
               "setProperty: " + class_name + "." + property.name + ": " + *wrong);
        return answer(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    if (!body->wanted || (*body->wanted)[at])
        body->values[at] = std::move(given);
    return answer(CMPI_RC_OK);
}

CMPIObjectPath* instance_path(const CMPIInstance* inst, CMPIStatus* status) noexcept {
    const InstanceBody* body = use(inst, "getObjectPath", status);
    return body ? make(core_of(inst), to_body(core_of(inst), to_instance(*body).path)) : nullptr;
}

void want(const Class& known, const char** names, std::vector<bool>& wanted) {
    for (; names && *names; ++names)
        if (const std::size_t at = known.index_of(*names); at != Class::npos)
            wanted[at] = true;
}

CMPIStatus instance_filter(CMPIInstance* inst, const char** properties,
                           const char** keys) noexcept {
    InstanceBody* body = use(inst, "setPropertyFilter", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    body->wanted.reset();
    if (properties && body->known) {
        body->wanted.emplace(body->values.size(), false);
        want(*body->known, properties, *body->wanted);
        want(*body->known, keys, *body->wanted);
    }
    return answer(CMPI_RC_OK);
}

CMPIStatus instance_set_path(CMPIInstance* inst, const CMPIObjectPath* op) noexcept {
    InstanceBody* body = use(inst, "setObjectPath", nullptr);
    const ObjectPathBody* path = body_of<ObjectPathBody>(op, "setObjectPath");
    if (!body || !path)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (path->known != body->known) {
        report(&core_of(inst), FaultKind::bad_argument,
               "setObjectPath: a path of " + path->path.class_name + " for an instance of " +
                   body->path.class_name);
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    body->path = path->path;
    return answer(CMPI_RC_OK);
}

} // namespace

const CMPIInstanceFT InstanceBody::table = {
    CMPIVersion100,       release<InstanceBody>,   clone<InstanceBody>,   instance_property,
    instance_property_at, instance_property_count, instance_set_property, instance_path,
    instance_filter,      instance_set_path};

} // namespace host
