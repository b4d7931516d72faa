// Walking associations: which association classes are asked, and the calls to each of them.

#include "host/operations.h"
#include "host/request.h"

namespace host {

namespace {

// Whether an instance of the class can stand at an end of the association, in the role if one is
// given, with something of the result class at another end if one is given.
bool can_reach(const Class& association, const Class& source, const Association_Filter& filter,
               const Class* result_class) {
    for (const Property& near : association.properties) {
        if (!near.is_reference() || (near.target && !source.is_a(near.target)) ||
            (!filter.role.empty() && !same_name(near.name, filter.role)))
            continue;
        if (!result_class && filter.result_role.empty())
            return true;
        for (const Property& far : association.properties) {
            const bool related = !result_class || !far.target || result_class->is_a(far.target) ||
                                 far.target->is_a(result_class);
            if (&far != &near && far.is_reference() && related &&
                (filter.result_role.empty() || same_name(far.name, filter.result_role)))
                return true;
        }
    }
    return false;
}

struct Plan {
    Status status;
    ObjectPath path;
    const Class* source = nullptr;
    const Class* result_class = nullptr;
    std::vector<const Class*> associations; // to ask, in this order
};

Plan make_plan(Core& core, const ObjectPath& path, const Association_Filter& filter) {
    Plan plan;
    plan.path = path;
    if (plan.path.name_space.empty())
        plan.path.name_space = core.options.name_space;
    plan.status = check_complete(core, plan.path);
    if (!plan.status.ok())
        return plan;
    if (!core.registration.is_empty() && !core.is_provider_name_space(plan.path.name_space) &&
        !core.platform.has_name_space(plan.path.name_space)) {
        plan.status = core.registration.unknown_name_space(plan.path.name_space);
        return plan;
    }
    plan.source = core.classes.find(path.class_name);
    const Class* via = core.classes.find(filter.via);
    plan.result_class = core.classes.find(filter.result_class);
    for (const auto& [given, found] :
         {std::pair(&filter.via, via), std::pair(&filter.result_class, plan.result_class)})
        if (!given->empty() && !found)
            plan.status = {CMPI_RC_ERR_INVALID_CLASS, "unknown class " + *given};
    if (plan.status.ok() && via && !via->is_association)
        plan.status = {CMPI_RC_ERR_INVALID_PARAMETER, via->name + " is no association"};
    if (!plan.status.ok())
        return plan;
    for (const auto& known : core.classes.classes()) {
        // An association that was named is asked in any case: what it answers is the provider's
        // part.
        const bool asked =
            via ? known->is_a(via) && (known.get() == via ||
                                       can_reach(*known, *plan.source, filter, plan.result_class))
                : can_reach(*known, *plan.source, filter, plan.result_class);
        if (asked && core.module.serves_association(*known) &&
            core.registration.check(known->name, Interface::association, plan.path.name_space).ok())
            plan.associations.push_back(known.get());
    }
    if (via && plan.associations.empty())
        plan.status = {CMPI_RC_ERR_NOT_SUPPORTED, "no provider serves " + via->name};
    return plan;
}

const char* or_null(const std::string& text) {
    return text.empty() ? nullptr : text.c_str();
}

// One association class; answers go to the request.
Status ask(Core& core, const Plan& plan, const Class& association, Walk what, bool names,
           const Association_Filter& filter, const Property_List& properties,
           std::vector<Instance>& instances, std::vector<ObjectPath>& paths) {
    Status status;
    CMPIAssociationMI* mi = core.module.association(core, association, status);
    if (!mi)
        return status;
    constexpr const char* operations[2][2] = {{"associators", "associatorNames"},
                                              {"references", "referenceNames"}};
    const bool references = what == Walk::references;
    Request request(core, association, operations[references][names], plan.path.name_space);
    const CMPIContext* context = request.context();
    const CMPIResult* result = request.result(names ? Answer::paths : Answer::instances,
                                              references ? &association : plan.result_class);
    const CMPIObjectPath* path = request.path(plan.path);
    const char** list = request.property_list(properties);
    const char* role = or_null(filter.role);
    const char* via = association.name.c_str();
    const char* result_class = or_null(filter.result_class);
    const char* result_role = or_null(filter.result_role);
    const CMPIAssociationMIFT& ft = *mi->ft;
    CMPIStatus cmpi_status;
    if (references && names)
        cmpi_status = ft.referenceNames(mi, context, result, path, via, role);
    else if (references)
        cmpi_status = ft.references(mi, context, result, path, via, role, list);
    else if (names)
        cmpi_status =
            ft.associatorNames(mi, context, result, path, via, result_class, role, result_role);
    else
        cmpi_status =
            ft.associators(mi, context, result, path, via, result_class, role, result_role, list);
    status = request.finish(cmpi_status);
    ResultBody& answered = request.answered();
    std::move(answered.instances.begin(), answered.instances.end(), std::back_inserter(instances));
    std::move(answered.paths.begin(), answered.paths.end(), std::back_inserter(paths));
    return status;
}

// All associations of the plan are asked, also after one has failed; the first failure is told.
Status ask_all(Core& core, const ObjectPath& path, Walk what, bool names,
               const Association_Filter& filter, const Property_List& properties,
               std::vector<Instance>& instances, std::vector<ObjectPath>& paths) {
    const Plan plan = make_plan(core, path, filter);
    Status first = plan.status;
    for (const Class* association : plan.associations) {
        Status status =
            ask(core, plan, *association, what, names, filter, properties, instances, paths);
        if (first.ok() && !status.ok())
            first = {status.rc,
                     association->name + ": " +
                         (status.message.empty() ? rc_sentence(status.rc) : status.message)};
    }
    return first;
}

} // namespace

Reply<std::vector<Instance>> walk(Core& core, const ObjectPath& path, Walk what,
                                  const Association_Filter& filter,
                                  const Property_List& properties) {
    Reply<std::vector<Instance>> reply;
    std::vector<ObjectPath> none;
    reply.status = ask_all(core, path, what, false, filter, properties, reply.value, none);
    return reply;
}

Reply<std::vector<ObjectPath>> walk_names(Core& core, const ObjectPath& path, Walk what,
                                          const Association_Filter& filter) {
    Reply<std::vector<ObjectPath>> reply;
    std::vector<Instance> none;
    reply.status = ask_all(core, path, what, true, filter, std::nullopt, none, reply.value);
    return reply;
}

} // namespace host
