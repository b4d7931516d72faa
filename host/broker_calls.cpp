// The table of up-calls: what a provider may ask the object manager, and threads.

#include "host/broker.h"
#include "host/operations.h"
#include "host/value_check.h"

namespace host {

namespace {

CMPIStatus to_cmpi(Core& core, const Status& status) {
    return {status.rc, status.message.empty() ? nullptr : new_string(core, status.message)};
}

void put_status(Core& core, CMPIStatus* out, const Status& status) {
    if (out)
        *out = to_cmpi(core, status);
}

// An up-call as it begins: the core, and what the path that it is about says.
struct Up_Call {
    Core* core = nullptr;
    ObjectPath path;
    Status status;
    bool is_silent = false; // fails without a status

    Up_Call(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* op,
            const char* name) {
        core = core_of_broker(broker, name);
        const ObjectPathBody* body = nullptr;
        if (core && body_of<ContextBody>(context, name))
            body = body_of<ObjectPathBody>(op, name);
        if (!body) {
            status = {CMPI_RC_ERR_INVALID_HANDLE, ""};
            return;
        }
        path = body->path;
        ++core->up_calls;
        core->trace("up-call " + std::string(name) + " " + path_to_text(path, ""));
        CMPIrc code = CMPI_RC_OK;
        if (core->refuses(true, name, code)) {
            is_silent = code == CMPI_RC_OK;
            status = {is_silent ? CMPI_RC_ERR_FAILED : code, ""};
        }
    }

    bool ok() const { return core && status.ok(); }
    CMPIStatus answer() const {
        return core ? to_cmpi(*core, status) : CMPIStatus{status.rc, nullptr};
    }
    void put(CMPIStatus* out) const {
        if (out)
            *out = is_silent ? CMPIStatus{CMPI_RC_OK, nullptr} : answer();
    }
};

// The provider of a class that runs on this thread already would wait for itself.
Status refuse_recursion(Core& core, const Class& known) {
    if (!Call::is_running(core, known.name))
        return {};
    report(&core, FaultKind::recursion, "an up-call to " + known.name + " from its own provider");
    return {CMPI_RC_ERR_FAILED, known.name + " is the running provider"};
}

// As for a client, but a class of the module is reached in its own namespaces only.
Status find_up_target(Core& core, const ObjectPath& path, Target& target,
                      Interface kind = Interface::instance) {
    if (path.name_space.empty())
        return {CMPI_RC_ERR_INVALID_NAMESPACE, "an up-call without a namespace"};
    Status status = find_target(core, path.class_name, path.name_space, kind, target);
    if (!status.ok() || target.platform)
        return status;
    if (core.is_provider_name_space(path.name_space))
        return refuse_recursion(core, *target.known);
    if (!core.platform.has_name_space(path.name_space))
        return {CMPI_RC_ERR_INVALID_NAMESPACE, "unknown namespace " + path.name_space};
    target.platform = true;
    return {};
}

// The class and its subclasses, as up-calls to enumerate have it: the platform's instances, then
// those of the module's providers. What the visitor answers first that is not OK ends it.
template <class Visit>
Status for_each_target(Core& core, const ObjectPath& path, Visit visit) {
    const Class* known = core.classes.find(path.class_name);
    if (!known)
        return {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + path.class_name};
    const bool on_platform = core.platform.has_name_space(path.name_space);
    const bool in_module = core.is_provider_name_space(path.name_space);
    if (!on_platform && !in_module)
        return {CMPI_RC_ERR_INVALID_NAMESPACE, "unknown namespace " + path.name_space};
    Status status;
    bool asked = core.check_platform(*known, path.name_space).ok();
    if (asked)
        status = visit(Target{known, path.name_space, true});
    for (const auto& candidate : core.classes.classes()) {
        if (!in_module || !candidate->is_a(known) || !core.module.serves(*candidate) ||
            !core.registration.check(candidate->name, Interface::instance, path.name_space).ok())
            continue;
        asked = true;
        if (status.ok())
            status = refuse_recursion(core, *candidate);
        if (status.ok())
            status = visit(Target{candidate.get(), path.name_space, false});
    }
    if (!asked && !core.registration.is_empty())
        return class_not_found(known->name, path.name_space);
    return status;
}

Property_List to_list(const char** names) {
    if (!names)
        return std::nullopt;
    std::vector<std::string> list;
    for (; *names; ++names)
        list.emplace_back(*names);
    return list;
}

CMPIEnumeration* to_enumeration(Core& core, std::vector<Instance> instances) {
    EnumerationBody body;
    body.element_type = CMPI_instance;
    for (Instance& instance : instances)
        body.elements.push_back(Value::instance(std::move(instance)));
    return make(core, std::move(body));
}

CMPIEnumeration* to_enumeration(Core& core, std::vector<ObjectPath> paths) {
    EnumerationBody body;
    body.element_type = CMPI_ref;
    for (ObjectPath& path : paths)
        body.elements.push_back(Value::reference(std::move(path)));
    return make(core, std::move(body));
}

template <class T>
CMPIEnumeration* finish(Core& core, Reply<std::vector<T>> reply, CMPIStatus* status) {
    put_status(core, status, reply.status);
    return reply.ok() ? to_enumeration(core, std::move(reply.value)) : nullptr;
}

// ---- Instances ----

CMPIEnumeration* enumerate_names_up(const CMPIBroker* broker, const CMPIContext* context,
                                    const CMPIObjectPath* op, CMPIStatus* status) noexcept {
    const Up_Call call(broker, context, op, "enumerateInstanceNames");
    if (!call.ok()) {
        call.put(status);
        return nullptr;
    }
    Reply<std::vector<ObjectPath>> reply;
    reply.status = for_each_target(*call.core, call.path, [&](const Target& target) {
        auto part = enumerate_names(*call.core, target);
        std::move(part.value.begin(), part.value.end(), std::back_inserter(reply.value));
        return part.status;
    });
    return finish(*call.core, std::move(reply), status);
}

CMPIEnumeration* enumerate_up(const CMPIBroker* broker, const CMPIContext* context,
                              const CMPIObjectPath* op, const char** properties,
                              CMPIStatus* status) noexcept {
    const Up_Call call(broker, context, op, "enumerateInstances");
    if (!call.ok()) {
        call.put(status);
        return nullptr;
    }
    Reply<std::vector<Instance>> reply;
    reply.status = for_each_target(*call.core, call.path, [&](const Target& target) {
        auto part = enumerate(*call.core, target, to_list(properties));
        std::move(part.value.begin(), part.value.end(), std::back_inserter(reply.value));
        return part.status;
    });
    return finish(*call.core, std::move(reply), status);
}

// One object by its complete path. The path in the call is put into the order of the class.
Status prepare(Up_Call& call, Target& target) {
    Status status = call.status;
    if (status.ok())
        status = find_up_target(*call.core, call.path, target);
    if (!status.ok())
        return status;
    if (const Complaint wrong = check_path(call.core->classes, call.path)) {
        report(call.core, FaultKind::bad_path, "an up-call with a path: " + *wrong);
        return {CMPI_RC_ERR_INVALID_PARAMETER, *wrong};
    }
    return {};
}

Reply<Instance> get_for(Up_Call& call, const Property_List& properties) {
    Target target;
    Status status = prepare(call, target);
    return status.ok() ? get(*call.core, target, call.path, properties)
                       : Reply<Instance>{status, {}};
}

CMPIInstance* get_up(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* op,
                     const char** properties, CMPIStatus* status) noexcept {
    Up_Call call(broker, context, op, "getInstance");
    const Reply<Instance> reply = get_for(call, to_list(properties));
    call.status = reply.status;
    call.put(status);
    return reply.ok() ? make(*call.core, to_body(*call.core, reply.value)) : nullptr;
}

// The instance of a change, with the keys of the path that goes with it.
Status read_instance(Up_Call& call, const CMPIInstance* inst, const char* use, bool exists,
                     Instance& instance) {
    const InstanceBody* body = call.ok() ? body_of<InstanceBody>(inst, use) : nullptr;
    if (!body)
        return {CMPI_RC_ERR_INVALID_HANDLE, ""};
    instance = to_instance(*body);
    for (const Named_Value& key : call.path.keys)
        set(instance.path.keys, key.name, key.value);
    instance.path.name_space = call.path.name_space;
    return check_instance(*call.core, instance, exists);
}

CMPIObjectPath* create_up(const CMPIBroker* broker, const CMPIContext* context,
                          const CMPIObjectPath* op, const CMPIInstance* inst,
                          CMPIStatus* status) noexcept {
    Up_Call call(broker, context, op, "createInstance");
    Target target;
    Instance instance;
    Reply<ObjectPath> reply;
    reply.status = read_instance(call, inst, "createInstance", false, instance);
    if (reply.ok())
        reply.status = find_up_target(*call.core, call.path, target);
    if (reply.ok())
        reply = create(*call.core, target, instance);
    call.status = reply.status;
    call.put(status);
    return reply.ok() ? make(*call.core, to_body(*call.core, std::move(reply.value))) : nullptr;
}

CMPIStatus modify_up(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* op,
                     const CMPIInstance* inst, const char** properties) noexcept {
    Up_Call call(broker, context, op, "modifyInstance");
    Target target;
    Instance instance;
    Status status = prepare(call, target);
    if (status.ok())
        status = read_instance(call, inst, "modifyInstance", true, instance);
    call.status = status.ok() ? modify(*call.core, target, instance, to_list(properties)) : status;
    return call.answer();
}

CMPIStatus delete_up(const CMPIBroker* broker, const CMPIContext* context,
                     const CMPIObjectPath* op) noexcept {
    Up_Call call(broker, context, op, "deleteInstance");
    Target target;
    Status status = prepare(call, target);
    call.status = status.ok() ? remove(*call.core, target, call.path) : status;
    return call.answer();
}

CMPIEnumeration* query_up(const CMPIBroker* broker, const CMPIContext*, const CMPIObjectPath*,
                          const char*, const char*, CMPIStatus* status) noexcept {
    put(status, core_of_broker(broker, "execQuery") ? CMPI_RC_ERR_NOT_SUPPORTED
                                                    : CMPI_RC_ERR_INVALID_HANDLE);
    return nullptr;
}

// ---- Associations ----

std::string or_empty(const char* text) {
    return text ? text : "";
}

CMPIEnumeration* walk_up(const CMPIBroker* broker, const CMPIContext* context,
                         const CMPIObjectPath* op, const char* name, Walk what,
                         const Association_Filter& filter, const char** properties, bool names,
                         CMPIStatus* status) {
    Up_Call call(broker, context, op, name);
    if (!call.ok()) {
        call.put(status);
        return nullptr;
    }
    Core& core = *call.core;
    if (names)
        return finish(core, walk_names(core, call.path, what, filter), status);
    return finish(core, walk(core, call.path, what, filter, to_list(properties)), status);
}

CMPIEnumeration* associators_up(const CMPIBroker* broker, const CMPIContext* context,
                                const CMPIObjectPath* op, const char* via, const char* result_class,
                                const char* role, const char* result_role, const char** properties,
                                CMPIStatus* status) noexcept {
    return walk_up(broker, context, op, "associators", Walk::associators,
                   {or_empty(via), or_empty(result_class), or_empty(role), or_empty(result_role)},
                   properties, false, status);
}

CMPIEnumeration* associator_names_up(const CMPIBroker* broker, const CMPIContext* context,
                                     const CMPIObjectPath* op, const char* via,
                                     const char* result_class, const char* role,
                                     const char* result_role, CMPIStatus* status) noexcept {
    return walk_up(broker, context, op, "associatorNames", Walk::associators,
                   {or_empty(via), or_empty(result_class), or_empty(role), or_empty(result_role)},
                   nullptr, true, status);
}

CMPIEnumeration* references_up(const CMPIBroker* broker, const CMPIContext* context,
                               const CMPIObjectPath* op, const char* via, const char* role,
                               const char** properties, CMPIStatus* status) noexcept {
    return walk_up(broker, context, op, "references", Walk::references,
                   {or_empty(via), "", or_empty(role), ""}, properties, false, status);
}

CMPIEnumeration* reference_names_up(const CMPIBroker* broker, const CMPIContext* context,
                                    const CMPIObjectPath* op, const char* via, const char* role,
                                    CMPIStatus* status) noexcept {
    return walk_up(broker, context, op, "referenceNames", Walk::references,
                   {or_empty(via), "", or_empty(role), ""}, nullptr, true, status);
}

// ---- Methods and properties ----

CMPIData invoke_up(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* op,
                   const char* method, const CMPIArgs* in, CMPIArgs* out,
                   CMPIStatus* status) noexcept {
    Up_Call call(broker, context, op, "invokeMethod");
    const ArgsBody* inputs = call.ok() ? body_of<ArgsBody>(in, "invokeMethod") : nullptr;
    ArgsBody* outputs = inputs && out ? body_of<ArgsBody>(out, "invokeMethod") : nullptr;
    if (!inputs || !method || (out && !outputs)) {
        put(status, CMPI_RC_ERR_INVALID_PARAMETER);
        return missing_data();
    }
    Target target;
    Named_Values fitted = inputs->values;
    Reply<Method_Result> reply;
    reply.status = find_up_target(*call.core, call.path, target, Interface::method);
    if (reply.ok())
        reply.status = check_inputs(*call.core, *target.known, method, fitted);
    if (reply.ok())
        reply = invoke(*call.core, target, call.path, method, fitted);
    call.status = reply.status;
    call.put(status);
    if (!reply.ok())
        return missing_data();
    if (outputs)
        outputs->values = std::move(reply.value.outputs);
    return to_data(*call.core, reply.value.value);
}

CMPIStatus set_property_up(const CMPIBroker* broker, const CMPIContext* context,
                           const CMPIObjectPath* op, const char* name, const CMPIValue* value,
                           CMPIType type) noexcept {
    Up_Call call(broker, context, op, "setProperty");
    Target target;
    call.status = prepare(call, target);
    if (!call.status.ok() || !name)
        return call.status.ok() ? answer(CMPI_RC_ERR_INVALID_PARAMETER) : call.answer();
    std::optional<Value> given = from_cmpi(*call.core, value, type, "setProperty");
    if (!given)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    Instance instance{call.path, {{name, std::move(*given)}}};
    call.status = check_instance(*call.core, instance, true);
    if (call.status.ok())
        call.status = modify(*call.core, target, instance, std::vector<std::string>{name});
    return call.answer();
}

CMPIData get_property_up(const CMPIBroker* broker, const CMPIContext* context,
                         const CMPIObjectPath* op, const char* name, CMPIStatus* status) noexcept {
    Up_Call call(broker, context, op, "getProperty");
    const Reply<Instance> reply = get_for(call, std::nullopt);
    call.status = reply.status;
    const Class* known = reply.ok() ? call.core->classes.find(call.path.class_name) : nullptr;
    const Property* property = known && name ? known->find_property(name) : nullptr;
    if (known && !property)
        call.status = {CMPI_RC_ERR_NO_SUCH_PROPERTY, ""};
    call.put(status);
    if (!property)
        return missing_data();
    const Value* value = reply.value.property(name);
    return to_data(*call.core, value ? *value : Value::null(property->type));
}

// ---- Threads and indications ----

CMPIContext* prepare_thread(const CMPIBroker* broker, const CMPIContext* context) noexcept {
    Core* core = core_of_broker(broker, "prepareAttachThread");
    const ContextBody* body = core ? body_of<ContextBody>(context, "prepareAttachThread") : nullptr;
    if (!body)
        return nullptr;
    auto copy = std::make_unique<ContextBody>(*body);
    copy->for_thread = true;
    copy->attached = false;
    Object* object =
        create_object(*core, Kind::context, &ContextBody::table, std::move(copy), core->contexts);
    return reinterpret_cast<CMPIContext*>(object);
}

CMPIStatus attachment_fault(Core* core, const char* text) {
    report(core, FaultKind::attachment, text);
    return answer(CMPI_RC_ERR_FAILED);
}

CMPIStatus attach_thread(const CMPIBroker* broker, const CMPIContext* context) noexcept {
    Core* core = core_of_broker(broker, "attachThread");
    ContextBody* body = core ? body_of<ContextBody>(context, "attachThread") : nullptr;
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (!body->for_thread || body->attached)
        return attachment_fault(core, "attachThread with a context that was not prepared for it");
    if (!Call::attach(*core, context))
        return attachment_fault(core, "attachThread on a thread that is known already");
    body->attached = true;
    // From now on it goes with detachThread, and not with release.
    reinterpret_cast<Object*>(const_cast<CMPIContext*>(context))->parameter = true;
    return answer(CMPI_RC_OK);
}

CMPIStatus detach_thread(const CMPIBroker* broker, const CMPIContext* context) noexcept {
    Core* core = core_of_broker(broker, "detachThread");
    if (!core || !body_of<ContextBody>(context, "detachThread"))
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    if (!Call::detach(*core, context))
        return attachment_fault(core, "detachThread on a thread that is not attached with it");
    destroy_object(*const_cast<Object*>(reinterpret_cast<const Object*>(context)));
    return answer(CMPI_RC_OK);
}

CMPIStatus deliver(const CMPIBroker* broker, const CMPIContext* context, const char* name_space,
                   const CMPIInstance* inst) noexcept {
    Core* core = core_of_broker(broker, "deliverIndication");
    const InstanceBody* body = nullptr;
    if (core && body_of<ContextBody>(context, "deliverIndication"))
        body = body_of<InstanceBody>(inst, "deliverIndication");
    if (!body)
        return answer(CMPI_RC_ERR_INVALID_HANDLE);
    core->trace("indication " + body->path.class_name);
    const std::lock_guard lock(core->records_mutex);
    core->indications.push_back({name_space ? name_space : "", to_instance(*body)});
    return answer(CMPI_RC_OK);
}

constexpr unsigned CAPABILITIES =
    CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal | CMPI_MB_OSEncapsulationSupport;

} // namespace

const CMPIBrokerFT broker_functions = {CAPABILITIES,
                                       CMPIVersion100,
                                       "in-process object manager",
                                       prepare_thread,
                                       attach_thread,
                                       detach_thread,
                                       deliver,
                                       enumerate_names_up,
                                       get_up,
                                       create_up,
                                       modify_up,
                                       delete_up,
                                       query_up,
                                       enumerate_up,
                                       associators_up,
                                       associator_names_up,
                                       references_up,
                                       reference_names_up,
                                       invoke_up,
                                       set_property_up,
                                       get_property_up};

} // namespace host
