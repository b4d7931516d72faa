// The table of object paths.

#include "host/core.h"
#include "host/value_check.h"

namespace host {

namespace {

ObjectPathBody* use(const CMPIObjectPath* op, const char* function, CMPIStatus* status) {
    ObjectPathBody* body = body_of<ObjectPathBody>(op, function);
    put(status, body ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
    return body;
}

CMPIStatus path_set_name_space(CMPIObjectPath* op, const char* name_space) noexcept {
    ObjectPathBody* body = use(op, "setNameSpace", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    body->path.name_space = name_space ? name_space : "";
    return answer(CMPI_RC_OK);
}

CMPIString* path_name_space(const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getNameSpace", status);
    return body ? new_string(core_of(op), body->path.name_space) : nullptr;
}

CMPIStatus path_set_host_name(CMPIObjectPath* op, const char* host) noexcept {
    ObjectPathBody* body = use(op, "setHostname", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    body->host_name = host ? host : "";
    return answer(CMPI_RC_OK);
}

CMPIString* path_host_name(const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getHostname", status);
    return body ? new_string(core_of(op), body->host_name) : nullptr;
}

CMPIStatus path_set_class_name(CMPIObjectPath* op, const char* class_name) noexcept {
    ObjectPathBody* body = use(op, "setClassName", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    body->path.class_name = class_name ? class_name : "";
    body->known = core_of(op).classes.find(body->path.class_name);
    return answer(CMPI_RC_OK);
}

CMPIString* path_class_name(const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getClassName", status);
    return body ? new_string(core_of(op), body->path.class_name) : nullptr;
}

CMPIStatus path_add_key(CMPIObjectPath* op, const char* name, const CMPIValue* value,
                        CMPIType type) noexcept {
    ObjectPathBody* body = use(op, "addKey", nullptr);
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    Core& core = core_of(op);
    if (!name) {
        report(&core, FaultKind::bad_argument, "addKey without a name");
        return answer(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    std::optional<Value> key = from_cmpi(core, value, type, "addKey");
    if (!key)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    const Property* property = body->known ? body->known->find_property(name) : nullptr;
    if (body->known && (!property || !property->key)) {
        report(&core, FaultKind::unknown_property,
               "addKey: " + body->known->name + " has no key " + name);
        return answer(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    if (property && !key->is_null()) {
        if (Complaint wrong = check_key(core.classes, *property, *key)) {
            report(&core, FaultKind::type_mismatch,
                   "addKey: " + body->known->name + "." + property->name + ": " + *wrong);
            return answer(CMPI_RC_ERR_TYPE_MISMATCH);
        }
    }
    set(body->path.keys, property ? property->name : name, std::move(*key));
    return answer(CMPI_RC_OK);
}

CMPIData path_key(const CMPIObjectPath* op, const char* name, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getKey", status);
    const Value* key = body && name ? body->path.key(name) : nullptr;
    if (key)
        return to_key_data_in(op, *key);
    if (body)
        put(status, CMPI_RC_ERR_NOT_FOUND);
    return missing_data();
}

CMPIData path_key_at(const CMPIObjectPath* op, CMPICount index, CMPIString** name,
                     CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getKeyAt", status);
    if (name)
        *name = nullptr;
    if (!body)
        return missing_data();
    if (index >= body->path.keys.size()) {
        put(status, CMPI_RC_ERR_NOT_FOUND);
        return missing_data();
    }
    const Named_Value& key = body->path.keys[index];
    if (name)
        *name = new_string(core_of(op), key.name);
    return to_key_data_in(op, key.value);
}

CMPICount path_key_count(const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "getKeyCount", status);
    return body ? static_cast<CMPICount>(body->path.keys.size()) : 0;
}

CMPIStatus copy_place(CMPIObjectPath* op, const CMPIObjectPath* source, bool host,
                      const char* function) {
    ObjectPathBody* body = use(op, function, nullptr);
    const ObjectPathBody* from = use(source, function, nullptr);
    if (!body || !from)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    body->path.name_space = from->path.name_space;
    if (host)
        body->host_name = from->host_name;
    return answer(CMPI_RC_OK);
}

CMPIStatus path_copy_name_space(CMPIObjectPath* op, const CMPIObjectPath* source) noexcept {
    return copy_place(op, source, false, "setNameSpaceFromObjectPath");
}

CMPIStatus path_copy_host(CMPIObjectPath* op, const CMPIObjectPath* source) noexcept {
    return copy_place(op, source, true, "setHostAndNameSpaceFromObjectPath");
}

CMPIString* path_text(const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const ObjectPathBody* body = use(op, "toString", status);
    return body ? new_string(core_of(op), path_to_text(body->path, "")) : nullptr;
}

} // namespace

// The functions for qualifiers are optional in the interface, and real object managers leave them
// out.
const CMPIObjectPathFT ObjectPathBody::table = {CMPIVersion100,
                                                release<ObjectPathBody>,
                                                clone<ObjectPathBody>,
                                                path_set_name_space,
                                                path_name_space,
                                                path_set_host_name,
                                                path_host_name,
                                                path_set_class_name,
                                                path_class_name,
                                                path_add_key,
                                                path_key,
                                                path_key_at,
                                                path_key_count,
                                                path_copy_name_space,
                                                path_copy_host,
                                                nullptr,
                                                nullptr,
                                                nullptr,
                                                nullptr,
                                                path_text};

} // namespace host
