#include "host/operations.h"

#include "host/request.h"
#include "host/value_check.h"

namespace host {

Status find_target(Core& core, const std::string& class_name, const std::string& name_space,
                   Interface kind, Target& target) {
    target.name_space = name_space.empty() ? core.options.name_space : name_space;
    target.known = core.classes.find(class_name);
    if (!target.known)
        return {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + class_name};
    if (core.module.serves(*target.known) || core.registration.has(target.known->name))
        return core.registration.check(target.known->name, kind, target.name_space);
    target.platform = true;
    return core.check_platform(*target.known, target.name_space);
}

// ---- Checks ----

Status check_complete(Core& core, ObjectPath& path) {
    if (!core.classes.find(path.class_name))
        return {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + path.class_name};
    if (const Complaint wrong = check_path(core.classes, path))
        return {CMPI_RC_ERR_INVALID_PARAMETER, *wrong};
    return {};
}

Status check_instance(Core& core, Instance& instance, bool exists) {
    const Class* known = core.classes.find(instance.class_name());
    if (!known)
        return {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + instance.class_name()};
    if (exists)
        if (Status status = check_complete(core, instance.path); !status.ok())
            return status;
    for (Named_Value& named : instance.properties) {
        const Property* property = known->find_property(named.name);
        if (!property)
            return {CMPI_RC_ERR_NO_SUCH_PROPERTY, known->name + " has no property " + named.name};
        if (const Complaint wrong = check_value(core.classes, *property, named.value))
            return {CMPI_RC_ERR_TYPE_MISMATCH, property->name + ": " + *wrong};
        named.name = property->name;
    }
    return {};
}

Status check_inputs(Core& core, const Class& known, const std::string& method,
                    Named_Values& inputs) {
    const Method* called = known.find_method(method);
    if (!called)
        return {CMPI_RC_ERR_METHOD_NOT_FOUND, known.name + " has no method " + method};
    for (Named_Value& input : inputs) {
        const Parameter* parameter = called->find(input.name);
        if (!parameter || !parameter->in)
            return {CMPI_RC_ERR_INVALID_PARAMETER, called->name + " has no input " + input.name};
        if (const Complaint wrong = check_value(core.classes, *parameter, input.value))
            return {CMPI_RC_ERR_TYPE_MISMATCH, parameter->name + ": " + *wrong};
        input.name = parameter->name;
    }
    return {};
}

// ---- Instances ----

namespace {

Status not_for_platform() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, "the instances of the platform cannot be changed"};
}

// A filter as the platform's own providers would apply it; keys stay.
Instance filtered(const Class& known, Instance instance, const Property_List& properties) {
    if (!properties)
        return instance;
    std::erase_if(instance.properties, [&](const Named_Value& named) {
        for (const std::string& wanted : *properties)
            if (same_name(wanted, named.name))
                return false;
        return !known.find_property(named.name)->key;
    });
    return instance;
}

} // namespace

Reply<std::vector<Instance>> enumerate(Core& core, const Target& target,
                                       const Property_List& properties) {
    Reply<std::vector<Instance>> reply;
    if (target.platform) {
        for (const Instance& found :
             core.platform.instances(target.name_space, *target.known, core.classes))
            reply.value.push_back(
                filtered(*core.classes.find(found.class_name()), found, properties));
        return reply;
    }
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, reply.status);
    if (!mi)
        return reply;
    Request request(core, *target.known, "enumerateInstances", target.name_space);
    reply.status = request.finish(mi->ft->enumerateInstances(
        mi, request.context(), request.result(Answer::instances, target.known),
        request.path({target.name_space, target.known->name, {}}),
        request.property_list(properties)));
    reply.value = std::move(request.answered().instances);
    return reply;
}

Reply<std::vector<ObjectPath>> enumerate_names(Core& core, const Target& target) {
    Reply<std::vector<ObjectPath>> reply;
    if (target.platform) {
        for (Instance& found :
             core.platform.instances(target.name_space, *target.known, core.classes))
            reply.value.push_back(std::move(found.path));
        return reply;
    }
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, reply.status);
    if (!mi)
        return reply;
    Request request(core, *target.known, "enumerateInstanceNames", target.name_space);
    reply.status = request.finish(mi->ft->enumerateInstanceNames(
        mi, request.context(), request.result(Answer::paths, target.known),
        request.path({target.name_space, target.known->name, {}})));
    reply.value = std::move(request.answered().paths);
    return reply;
}

Reply<Instance> get(Core& core, const Target& target, const ObjectPath& path,
                    const Property_List& properties) {
    Reply<Instance> reply;
    const Status missing{CMPI_RC_ERR_NOT_FOUND,
                         path_to_text(path, core.options.name_space) + " does not exist"};
    if (target.platform) {
        const Instance* found = core.platform.find(path);
        if (found)
            reply.value = filtered(*target.known, *found, properties);
        else
            reply.status = missing;
        return reply;
    }
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, reply.status);
    if (!mi)
        return reply;
    Request request(core, *target.known, "getInstance", target.name_space);
    reply.status = request.finish(
        mi->ft->getInstance(mi, request.context(), request.result(Answer::instances, target.known),
                            request.path(path), request.property_list(properties)));
    std::vector<Instance>& found = request.answered().instances;
    if (reply.ok() && found.size() != 1) {
        if (!found.empty())
            report(&core, FaultKind::wrong_result, "getInstance answered more than one instance");
        reply.status = missing;
    }
    if (reply.ok())
        reply.value = std::move(found.front());
    return reply;
}

Reply<ObjectPath> create(Core& core, const Target& target, const Instance& instance) {
    Reply<ObjectPath> reply;
    if (target.platform)
        return {not_for_platform(), {}};
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, reply.status);
    if (!mi)
        return reply;
    Request request(core, *target.known, "createInstance", target.name_space);
    reply.status = request.finish(
        mi->ft->createInstance(mi, request.context(), request.result(Answer::paths, target.known),
                               request.path(instance.path), request.instance(instance)));
    if (reply.ok() && !request.answered().paths.empty())
        reply.value = std::move(request.answered().paths.front());
    return reply;
}

Status modify(Core& core, const Target& target, const Instance& instance,
              const Property_List& properties) {
    if (target.platform)
        return not_for_platform();
    Status status;
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, status);
    if (!mi)
        return status;
    Request request(core, *target.known, "modifyInstance", target.name_space);
    return request.finish(
        mi->ft->modifyInstance(mi, request.context(), request.result(Answer::paths, target.known),
                               request.path(instance.path), request.instance(instance),
                               request.property_list(properties)));
}

Status remove(Core& core, const Target& target, const ObjectPath& path) {
    if (target.platform)
        return not_for_platform();
    Status status;
    CMPIInstanceMI* mi = core.module.instance(core, *target.known, status);
    if (!mi)
        return status;
    Request request(core, *target.known, "deleteInstance", target.name_space);
    return request.finish(mi->ft->deleteInstance(
        mi, request.context(), request.result(Answer::nothing, nullptr), request.path(path)));
}

// ---- Methods ----

Reply<Method_Result> invoke(Core& core, const Target& target, const ObjectPath& path,
                            const std::string& method, const Named_Values& inputs) {
    Reply<Method_Result> reply;
    if (target.platform)
        return {{CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "the platform offers no methods"}, {}};
    const Method* called = target.known->find_method(method);
    if (!called) // known to the caller's checks; kept for up-calls
        return {{CMPI_RC_ERR_METHOD_NOT_FOUND, target.known->name + " has no method " + method},
                {}};
    CMPIMethodMI* mi = core.module.method(core, *target.known, reply.status);
    if (!mi)
        return reply;
    Request request(core, *target.known, "invokeMethod", target.name_space);
    CMPIArgs* in = request.args(inputs);
    CMPIArgs* out = request.args({}, called);
    reply.status = request.finish(mi->ft->invokeMethod(
        mi, request.context(), request.result(Answer::data, nullptr, &called->result),
        request.path(path), called->name.c_str(), in, out));
    const ResultBody& answered = request.answered();
    reply.value.value = answered.data ? *answered.data : Value::null(called->result.type);
    reply.value.outputs = request.outputs().values;
    return reply;
}

} // namespace host
