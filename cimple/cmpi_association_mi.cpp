// The association interface.
//
// The provider that answers is the association's own, so the association class of a request is not
// looked at. Most association providers implement no association operation at all: the answer is
// then derived by enumerating the association and matching its references with the source. The
// enumeration is told what the matching will look for, so that a provider can spare itself the
// rest; docs/association-index.md says why that changes no answer.
//
// No function here calls CMReturnDone: the object manager closes the result at the end of the call.
#include "cimple/cmpi_frame.h"
#include "cimple/log.h"

namespace cimple {

namespace {

constexpr Status_Row ASSOCIATOR_NAMES_STATUS[] = {
    {ENUM_ASSOCIATOR_NAMES_FAILED, CMPI_RC_ERR_FAILED},
    {ENUM_ASSOCIATOR_NAMES_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
};

constexpr Status_Row REFERENCES_STATUS[] = {
    {ENUM_REFERENCES_FAILED, CMPI_RC_ERR_FAILED},
    {ENUM_REFERENCES_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {ENUM_REFERENCES_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
};

// What an association operation is asked for; absent texts are "".
struct Request {
    const Instance* source;
    const char* result_class;
    const char* role;
    const char* result_role;
};

const char* text(const char* argument) {
    return argument ? argument : "";
}

bool name_accepted(const char* wanted, const char* name) {
    return *wanted == '\0' || name_equal(wanted, name);
}

// ---- Matching ----

// An association in this library has far fewer references.
constexpr uint32 MAX_TARGETS = 16;

bool has_ancestor(const Meta_Class* meta_class, const char* name) {
    for (; meta_class; meta_class = meta_class->super_meta_class)
        if (name_equal(meta_class->name, name))
            return true;
    return false;
}

bool is_source(const Request& request, const Meta_Reference* feature, const Instance* end) {
    return is_subclass(feature->meta_class, request.source->__meta_class) &&
           key_eq(request.source, end) && name_accepted(request.role, feature->name);
}

bool is_result(const Request& request, const Meta_Reference* feature, const Instance* end) {
    return (*request.result_class == '\0' ||
            has_ancestor(end->__meta_class, request.result_class)) &&
           name_accepted(request.result_role, feature->name);
}

// Finds the ends of the association that answer the request, uncounted. The number of them, or -1
// if the association does not start from the request's source.
int collect_associators(const Request& request, const Instance* association,
                        const Instance* (&targets)[MAX_TARGETS]) {
    const Meta_Class* meta = association->__meta_class;
    bool source_found = false;
    uint32 count = 0;
    for (uint32 i = 0; i < meta->num_meta_features; i++) {
        if (!(meta->meta_features[i]->flags & FLAG_REFERENCE))
            continue;
        const auto* feature = static_cast<const Meta_Reference*>(meta->meta_features[i]);
        if (feature->subscript != 0)
            continue;
        const Instance* end = reference(association, feature);
        if (!end)
            continue;
        if (is_source(request, feature, end))
            source_found = true;
        else if (is_result(request, feature, end) && count < MAX_TARGETS)
            targets[count++] = end;
    }
    return source_found ? static_cast<int>(count) : -1;
}

// ---- Operations with their fallbacks ----

bool is_association(const Call& call) {
    return call.adapter.meta_class && (call.adapter.meta_class->flags & FLAG_ASSOCIATION);
}

// A model of the association class for an enumeration: the keys are wanted.
Ref<Instance> make_association_model(const Call& call) {
    Ref<Instance> model(create(call.adapter.meta_class));
    nullify_non_keys(model.get());
    return model;
}

struct Associator_Match {
    const Request& request;
    Instance_Proc handler;
    void* client_data;
};

bool pass_associators(const Instance* instance, sint32, void* client_data) {
    const Ref<const Instance> association(instance);
    if (!instance)
        return false;
    const auto* match = static_cast<Associator_Match*>(client_data);
    const Instance* targets[MAX_TARGETS];
    const int count = collect_associators(match->request, instance, targets);
    for (int i = 0; i < count; i++) {
        ref(targets[i]);
        match->handler(targets[i], 0, match->client_data);
    }
    return true; // whatever the handler says: it forwards nothing after an error
}

sint32 enum_associator_names_with_fallback(const Call& call, const Request& request,
                                           Instance_Proc handler, void* client_data) {
    if (!is_association(call))
        return ENUM_ASSOCIATOR_NAMES_FAILED;
    const sint32 status =
        call.provider(OP_ENUM_ASSOCIATOR_NAMES, request.source, request.result_class, request.role,
                      request.result_role, handler, client_data);
    // Denied access becomes a failure here, while the fallback tells the two apart: it is to stay
    // so.
    if (status == ENUM_ASSOCIATOR_NAMES_FAILED || status == ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED)
        return ENUM_ASSOCIATOR_NAMES_FAILED;
    if (status == ENUM_ASSOCIATOR_NAMES_OK)
        return status;

    const Ref<Instance> model = make_association_model(call);
    Associator_Match match = {request, handler, client_data};
    const Enumeration_Focus focus = {Enumeration_Focus::REFERENCES_TO, request.source};
    const sint32 enum_status =
        call.provider(OP_ENUM_INSTANCES, model.get(), &pass_associators, &match, &focus);
    const sint32 answer = enum_status == ENUM_INSTANCES_FAILED ? ENUM_ASSOCIATOR_NAMES_FAILED
                          : enum_status == ENUM_INSTANCES_ACCESS_DENIED
                              ? ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED
                              : ENUM_ASSOCIATOR_NAMES_OK;
    handler(nullptr, answer, client_data);
    return answer;
}

struct Reference_Match {
    const Instance* source;
    const char* role;
    Instance_Proc handler;
    void* client_data;
};

bool pass_reference(const Instance* instance, sint32, void* client_data) {
    Ref<const Instance> association(instance);
    if (!instance)
        return false;
    const auto* match = static_cast<Reference_Match*>(client_data);
    if (is_reference_to(instance, match->source, match->role))
        match->handler(association.release(), 0, match->client_data);
    return true;
}

sint32 enum_references_with_fallback(const Call& call, const Instance* source,
                                     const Instance* model, const char* role, Instance_Proc handler,
                                     void* client_data) {
    if (!is_association(call))
        return ENUM_REFERENCES_FAILED;
    const sint32 status =
        call.provider(OP_ENUM_REFERENCES, source, model, role, handler, client_data);
    if (status == ENUM_REFERENCES_FAILED || status == ENUM_REFERENCES_ACCESS_DENIED ||
        status == ENUM_REFERENCES_OK)
        return status;

    Reference_Match match = {source, role, handler, client_data};
    const Enumeration_Focus focus = {Enumeration_Focus::REFERENCES_TO, source};
    const sint32 enum_status =
        call.provider(OP_ENUM_INSTANCES, model, &pass_reference, &match, &focus);
    const sint32 answer = enum_status == ENUM_INSTANCES_FAILED ? ENUM_REFERENCES_FAILED
                          : enum_status == ENUM_INSTANCES_ACCESS_DENIED
                              ? ENUM_REFERENCES_ACCESS_DENIED
                              : ENUM_REFERENCES_OK;
    handler(nullptr, answer, client_data);
    return answer;
}

// ---- Delivery ----

bool deliver_associator_name(Delivery& delivery, const Instance* instance) {
    return deliver_path(delivery, instance, own_name_space(instance, delivery.name_space.c_str()));
}

bool deliver_associator(Delivery& delivery, const Instance* instance) {
    return deliver_instance(delivery, instance, delivery.name_space.c_str());
}

// An association holds no more of its ends than their keys are sure to be: the object manager is
// asked for the rest. One that is gone meanwhile is left out.
bool deliver_fetched_associator(Delivery& delivery, const Instance* instance) {
    const CMPIBroker* broker = delivery.call.broker;
    cmpi::Scoped<CMPIObjectPath> path;
    delivery.error = make_cmpi_object_path(
        broker, instance, own_name_space(instance, delivery.name_space.c_str()), path.out());
    if (delivery.error != CMPI_RC_OK)
        return false;
    cmpi::Status status;
    const cmpi::Scoped<CMPIInstance> found(broker->bft->getInstance(
        broker, delivery.call.context, path.get(), delivery.properties, status.out()));
    if (found && status)
        cmpi::return_instance(delivery.result, found.get());
    else
        CIMPLE_WARN("an associator of class %s was not found: %d", instance->__meta_class->name,
                    status.rc());
    return true;
}

bool deliver_reference(Delivery& delivery, const Instance* instance) {
    return deliver_instance(delivery, instance, delivery.name_space.c_str());
}

bool deliver_reference_name(Delivery& delivery, const Instance* instance) {
    return deliver_path(delivery, instance, delivery.name_space.c_str());
}

// ---- The functions ----

// Calls visit(reference) for each end of the association at which the source may stand, until one
// answers true: then true.
template <class Visit>
bool any_end(const Meta_Class* association, const char* role, Visit visit) {
    for (uint32 i = 0; association && i < association->num_meta_features; i++) {
        if (!(association->meta_features[i]->flags & FLAG_REFERENCE))
            continue;
        const auto* end = static_cast<const Meta_Reference*>(association->meta_features[i]);
        if (end->subscript == 0 && name_accepted(role, end->name) && visit(end))
            return true;
    }
    return false;
}

// The source of a request; null for one that stands at no end of the association, which has
// nothing to say about it: the answer is OK. For a class that nobody knows the trace of three of
// the functions shows 5 all the same, which is meant.
struct Request_Source {
    Ref<Instance> instance;
    String name_space = {}; // its path's
    Answer nothing = CMPI_RC_OK;
};

// The source by its path; keys that the path lacks are null. Most providers that an unfiltered
// query reaches have no end for it: they are done here, before anything is made of the path. A
// class that the library does not know is some platform's: it is taken as derived from the first
// end that it could stand at.
Request_Source make_source(const Call& call, const CMPIObjectPath* path, const char* role) {
    const Meta_Class* association = call.adapter.meta_class;
    Request_Source source;
    if (const Meta_Class* meta_class = call.find_class(path)) {
        const auto accepts = [meta_class](const Meta_Reference* end) {
            return is_subclass(end->meta_class, meta_class);
        };
        // A class that is no association is left to the operation, which fails for it.
        if (is_association(call) && !any_end(association, "", accepts))
            return source;
        source.name_space = cmpi::name_space(path);
        source.instance =
            make_cimple_reference(call.converter(source.name_space), meta_class, path);
        return source;
    }
    source.name_space = cmpi::name_space(path);
    source.nothing = Answer(CMPI_RC_OK, CMPI_RC_ERR_INVALID_CLASS);
    any_end(path ? association : nullptr, role, [&](const Meta_Reference* end) {
        source.instance =
            make_foreign_reference(call.converter(source.name_space), end->meta_class, path);
        return static_cast<bool>(source.instance);
    });
    return source;
}

CMPIStatus associator_names(CMPIAssociationMI* mi, const CMPIContext* context,
                            const CMPIResult* result, const CMPIObjectPath* path, const char*,
                            const char* result_class, const char* role, const char* result_role) {
    return run_call(mi, context, "associatorNames", [&](const Call& call) -> Answer {
        const Request_Source source = make_source(call, path, text(role));
        if (!source.instance)
            return source.nothing;
        Delivery delivery = {call, result, nullptr, source.name_space};
        const Request request = {source.instance.get(), text(result_class), text(role),
                                 text(result_role)};
        return map_status(ASSOCIATOR_NAMES_STATUS,
                          enum_associator_names_with_fallback(
                              call, request, delivery_handler<deliver_associator_name>, &delivery));
    });
}

CMPIStatus associators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char*, const char* result_class,
                       const char* role, const char* result_role, const char** properties) {
    return run_call(mi, context, "associators", [&](const Call& call) -> Answer {
        const Request_Source source = make_source(call, path, text(role));
        if (!source.instance)
            return CMPI_RC_OK; // here the trace shows the answer, unlike in the other functions
        Delivery delivery = {call, result, properties, source.name_space};
        const Request request = {source.instance.get(), text(result_class), text(role),
                                 text(result_role)};
        const sint32 status =
            call.provider(OP_ENUM_ASSOCIATORS, request.source, request.result_class, request.role,
                          request.result_role, &delivery_handler<deliver_associator>, &delivery);
        switch (status) {
        case ENUM_ASSOCIATORS_OK:
            return CMPI_RC_OK;
        case ENUM_ASSOCIATORS_FAILED:
            return CMPI_RC_ERR_FAILED;
        case ENUM_ASSOCIATORS_ACCESS_DENIED:
            return CMPI_RC_ERR_ACCESS_DENIED;
        default: // unsupported is one of these
            return map_status(
                ASSOCIATOR_NAMES_STATUS,
                enum_associator_names_with_fallback(
                    call, request, delivery_handler<deliver_fetched_associator>, &delivery));
        }
    });
}

// references and referenceNames differ in what they deliver only.
CMPIStatus run_references(CMPIAssociationMI* mi, const CMPIContext* context, const char* function,
                          const CMPIResult* result, const CMPIObjectPath* path, const char* role,
                          const char** properties, Instance_Proc handler) {
    return run_call(mi, context, function, [&](const Call& call) -> Answer {
        const Request_Source source = make_source(call, path, text(role));
        if (!source.instance)
            return source.nothing;
        const Ref<Instance> model = make_association_model(call);
        if (properties)
            filter_properties(model.get(), properties, true);
        Delivery delivery = {call, result, properties, source.name_space};
        return map_status(REFERENCES_STATUS,
                          enum_references_with_fallback(call, source.instance.get(), model.get(),
                                                        text(role), handler, &delivery));
    });
}

CMPIStatus references(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                      const CMPIObjectPath* path, const char*, const char* role,
                      const char** properties) {
    return run_references(mi, context, "references", result, path, role, properties,
                          delivery_handler<deliver_reference>);
}

CMPIStatus reference_names(CMPIAssociationMI* mi, const CMPIContext* context,
                           const CMPIResult* result, const CMPIObjectPath* path, const char*,
                           const char* role) {
    return run_references(mi, context, "referenceNames", result, path, role, nullptr,
                          delivery_handler<deliver_reference_name>);
}

} // namespace

const CMPIAssociationMIFT ASSOCIATION_FUNCTIONS = {
    CMPICurrentVersion, CMPICurrentVersion, nullptr,    cleanup<CMPIAssociationMI>,
    associators,        associator_names,   references, reference_names,
};

} // namespace cimple
