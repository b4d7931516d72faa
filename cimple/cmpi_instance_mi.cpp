// The instance interface.
#include "cimple/cmpi_frame.h"

namespace cimple {

namespace {

constexpr Status_Row ENUM_INSTANCES_STATUS[] = {
    {ENUM_INSTANCES_FAILED, CMPI_RC_ERR_FAILED},
    {ENUM_INSTANCES_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
};

constexpr Status_Row GET_INSTANCE_STATUS[] = {
    {GET_INSTANCE_NOT_FOUND, CMPI_RC_ERR_NOT_FOUND},
    {GET_INSTANCE_UNSUPPORTED, CMPI_RC_ERR_FAILED},
    {GET_INSTANCE_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER},
    {GET_INSTANCE_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
    {GET_INSTANCE_FAILED, CMPI_RC_ERR_FAILED},
};

constexpr Status_Row CREATE_INSTANCE_STATUS[] = {
    {CREATE_INSTANCE_DUPLICATE, CMPI_RC_ERR_ALREADY_EXISTS},
    {CREATE_INSTANCE_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {CREATE_INSTANCE_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER},
    {CREATE_INSTANCE_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
    {CREATE_INSTANCE_FAILED, CMPI_RC_ERR_FAILED},
};

constexpr Status_Row DELETE_INSTANCE_STATUS[] = {
    {DELETE_INSTANCE_NOT_FOUND, CMPI_RC_ERR_NOT_FOUND},
    {DELETE_INSTANCE_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {DELETE_INSTANCE_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
    {DELETE_INSTANCE_FAILED, CMPI_RC_ERR_FAILED},
};

constexpr Status_Row MODIFY_INSTANCE_STATUS[] = {
    {MODIFY_INSTANCE_NOT_FOUND, CMPI_RC_ERR_NOT_FOUND},
    {MODIFY_INSTANCE_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {MODIFY_INSTANCE_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER},
    {MODIFY_INSTANCE_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
    {MODIFY_INSTANCE_FAILED, CMPI_RC_ERR_FAILED},
};

// CMReturnDone: enumInstances and deleteInstance call it for every status that ends in OK;
// enumInstanceNames, createInstance and modifyInstance for 0 only, so that an unforeseen status
// answers OK without it. The difference is meant.

// An instance of the path's class with its keys. Fails for a class that the library does not know.
int make_keys(const Call& call, const CMPIObjectPath* path, const String& name_space,
              Ref<Instance>& keys) {
    const Meta_Class* meta_class = call.find_class(path);
    if (!meta_class)
        return CMPI_RC_ERR_FAILED;
    keys = make_cimple_reference(call.converter(name_space), meta_class, path);
    return CMPI_RC_OK;
}

int make_instance(const Call& call, const CMPIObjectPath* path, const String& name_space,
                  const CMPIInstance* source, Ref<Instance>& instance) {
    const Meta_Class* meta_class = call.find_class(path);
    if (!meta_class)
        return CMPI_RC_ERR_FAILED;
    instance = make_cimple_instance(call.converter(name_space), meta_class, source);
    return CMPI_RC_OK;
}

// ---- enumInstanceNames, enumInstances ----

bool deliver_enumerated_path(Delivery& delivery, const Instance* instance) {
    return deliver_path(delivery, instance, delivery.name_space.c_str());
}

bool deliver_enumerated_instance(Delivery& delivery, const Instance* instance) {
    return deliver_instance(delivery, instance, delivery.name_space.c_str());
}

sint32 enumerate(const Call& call, const Instance* model, Instance_Proc handler,
                 Delivery& delivery) {
    return call.provider(OP_ENUM_INSTANCES, model, handler, &delivery);
}

CMPIStatus enum_instance_names(CMPIInstanceMI* mi, const CMPIContext* context,
                               const CMPIResult* result, const CMPIObjectPath* path) {
    return run_call(mi, context, "enumInstanceNames", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> model;
        if (const int rc = make_keys(call, path, name_space, model); rc != CMPI_RC_OK)
            return rc;
        nullify_non_keys(model.get());
        Delivery delivery = {call, result, nullptr, name_space};
        const sint32 status =
            enumerate(call, model.get(), delivery_handler<deliver_enumerated_path>, delivery);
        if (status == ENUM_INSTANCES_OK)
            cmpi::return_done(result);
        return map_status(ENUM_INSTANCES_STATUS, status);
    });
}

CMPIStatus enum_instances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                          const CMPIObjectPath* path, const char** properties) {
    return run_call(mi, context, "enumInstances", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> model;
        if (const int rc = make_keys(call, path, name_space, model); rc != CMPI_RC_OK)
            return rc;
        if (properties)
            filter_properties(model.get(), properties, true);
        Delivery delivery = {call, result, properties, name_space};
        const sint32 status =
            enumerate(call, model.get(), delivery_handler<deliver_enumerated_instance>, delivery);
        const int rc = map_status(ENUM_INSTANCES_STATUS, status);
        if (rc == CMPI_RC_OK)
            cmpi::return_done(result);
        return rc;
    });
}

// ---- getInstance ----

struct Key_Search {
    const Instance* model;
    Ref<const Instance> found;
};

bool keep_match(const Instance* instance, sint32, void* client_data) {
    const Ref<const Instance> owner(instance);
    auto* search = static_cast<Key_Search*>(client_data);
    if (!instance || search->found)
        return false;
    if (!key_eq(search->model, instance))
        return true;
    search->found = owner;
    return false;
}

// A provider that cannot look up a single instance is enumerated instead: most providers write no
// more than their enumeration.
sint32 get_instance_with_fallback(const Call& call, const Instance* model,
                                  Ref<const Instance>& found) {
    Instance* instance = nullptr;
    const sint32 status = call.provider(OP_GET_INSTANCE, model, &instance);
    found.reset(instance);
    if (status != GET_INSTANCE_UNSUPPORTED)
        return status;
    Key_Search search = {model, {}};
    const Enumeration_Focus focus = {Enumeration_Focus::KEYS, model};
    call.provider(OP_ENUM_INSTANCES, model, &keep_match, &search, &focus);
    found = search.found;
    return found ? GET_INSTANCE_OK : GET_INSTANCE_NOT_FOUND;
}

CMPIStatus get_instance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                        const CMPIObjectPath* path, const char** properties) {
    return run_call(mi, context, "getInstance", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> model;
        if (const int rc = make_keys(call, path, name_space, model); rc != CMPI_RC_OK)
            return rc;
        nullify(model.get(), true, true, 0); // not null: wanted
        if (properties)
            filter_properties(model.get(), properties, true);

        Ref<const Instance> found;
        const sint32 status = get_instance_with_fallback(call, model.get(), found);
        if (status != GET_INSTANCE_OK)
            return map_status(GET_INSTANCE_STATUS, status);
        Delivery delivery = {call, result, properties, name_space};
        if (!deliver_instance(delivery, found.get(), delivery.name_space.c_str()))
            return delivery.error;
        cmpi::return_done(result);
        return CMPI_RC_OK;
    });
}

// ---- createInstance, modifyInstance, deleteInstance ----

CMPIStatus create_instance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const CMPIInstance* source) {
    return run_call(mi, context, "createInstance", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> instance;
        if (const int rc = make_instance(call, path, name_space, source, instance);
            rc != CMPI_RC_OK)
            return rc;
        const sint32 status = call.provider(OP_CREATE_INSTANCE, instance.get());
        if (status != CREATE_INSTANCE_OK)
            return map_status(CREATE_INSTANCE_STATUS, status);
        Delivery delivery = {call, result, nullptr, name_space};
        if (!deliver_path(delivery, instance.get(), delivery.name_space.c_str()))
            return delivery.error;
        cmpi::return_done(result);
        return CMPI_RC_OK;
    });
}

CMPIStatus modify_instance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const CMPIInstance* source,
                           const char** properties) {
    return run_call(mi, context, "modifyInstance", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> instance;
        if (const int rc = make_instance(call, path, name_space, source, instance);
            rc != CMPI_RC_OK)
            return rc;
        const Ref<Instance> model(clone(instance.get()));
        filter_properties(model.get(), properties, true);
        const sint32 status = call.provider(OP_MODIFY_INSTANCE, model.get(), instance.get());
        if (status != MODIFY_INSTANCE_OK)
            return map_status(MODIFY_INSTANCE_STATUS, status);
        cmpi::return_path(result, path);
        cmpi::return_done(result);
        return CMPI_RC_OK;
    });
}

CMPIStatus delete_instance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path) {
    return run_call(mi, context, "deleteInstance", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(path);
        Ref<Instance> keys;
        if (const int rc = make_keys(call, path, name_space, keys); rc != CMPI_RC_OK)
            return rc;
        const int rc =
            map_status(DELETE_INSTANCE_STATUS, call.provider(OP_DELETE_INSTANCE, keys.get()));
        if (rc == CMPI_RC_OK)
            cmpi::return_done(result);
        return rc;
    });
}

CMPIStatus exec_query(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult*,
                      const CMPIObjectPath*, const char*, const char*) {
    return run_call(mi, context, "execQuery",
                    [](const Call&) -> int { return CMPI_RC_ERR_NOT_SUPPORTED; });
}

} // namespace

const CMPIInstanceMIFT INSTANCE_FUNCTIONS = {
    CMPICurrentVersion,  CMPICurrentVersion, nullptr,      cleanup<CMPIInstanceMI>,
    enum_instance_names, enum_instances,     get_instance, create_instance,
    modify_instance,     delete_instance,    exec_query,
};

} // namespace cimple
