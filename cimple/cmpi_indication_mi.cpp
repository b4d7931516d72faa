// The indication interface. No class of this module exports it; the engine has it all the same, for
// a provider whose procedure handles operations 11 and 12.
#include "cimple/cmpi_frame.h"
#include "cimple/cmpi_thread_context.h"
#include "cimple/log.h"

#include <algorithm>

namespace cimple {

namespace {

constexpr Status_Row ENABLE_INDICATIONS_STATUS[] = {
    {ENABLE_INDICATIONS_FAILED, CMPI_RC_ERR_FAILED},
};
constexpr Status_Row DISABLE_INDICATIONS_STATUS[] = {
    {DISABLE_INDICATIONS_FAILED, CMPI_RC_ERR_FAILED},
};

void deliver_indication(const CMPI_Thread_Context& context, const Instance* indication,
                        const char* name_space) {
    const CMPIBroker* broker = context.broker();
    cmpi::Scoped<CMPIObjectPath> path;
    cmpi::Scoped<CMPIInstance> object;
    if (make_cmpi_object_path(broker, indication, name_space, path.out()) != CMPI_RC_OK ||
        make_CMPI_instance(broker, indication, name_space, path.get(), nullptr, object.out()) !=
            CMPI_RC_OK)
        return;
    broker->bft->deliverIndication(broker, context.context(), name_space, object.get());
}

// Called by the provider on a thread that has a context; takes over the indication.
bool _indication_proc(Instance* instance, void* client_data) {
    auto* adapter = static_cast<CMPI_Adapter*>(client_data);
    const Auto_Mutex guard(adapter->lock);
    const Ref<Instance> indication(instance);
    if (!instance)
        return false;
    const auto* thread_context = dynamic_cast<CMPI_Thread_Context*>(Thread_Context::top());
    CIMPLE_ASSERT(thread_context != 0);
    for (const Indication_Filter& filter : adapter->filters)
        deliver_indication(*thread_context, instance, filter.name_space.c_str());
    return true;
}

std::vector<Indication_Filter>::iterator find_filter(CMPI_Adapter& adapter,
                                                     const String& name_space) {
    return std::find_if(
        adapter.filters.begin(), adapter.filters.end(),
        [&](const Indication_Filter& filter) { return filter.name_space == name_space; });
}

CMPIStatus authorize_filter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp*,
                            const char*, const CMPIObjectPath*, const char*) {
    return run_call(mi, context, "authorizeFilter", [](const Call&) -> int { return CMPI_RC_OK; });
}

CMPIStatus must_poll(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp*,
                     const char*, const CMPIObjectPath*) {
    return run_call(mi, context, "mustPoll", [](const Call&) -> int { return CMPI_RC_OK; });
}

CMPIStatus activate_filter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp*,
                           const char*, const CMPIObjectPath* class_path, CMPIBoolean) {
    return run_call(mi, context, "activateFilter", [&](const Call& call) -> int {
        const String name_space = cmpi::name_space(class_path);
        const auto filter = find_filter(call.adapter, name_space);
        if (filter != call.adapter.filters.end())
            filter->count++;
        else
            call.adapter.filters.push_back({name_space, 1});
        return CMPI_RC_OK;
    });
}

CMPIStatus deactivate_filter(CMPIIndicationMI* mi, const CMPIContext* context, const CMPISelectExp*,
                             const char*, const CMPIObjectPath* class_path, CMPIBoolean) {
    return run_call(mi, context, "deactivateFilter", [&](const Call& call) -> int {
        const auto filter = find_filter(call.adapter, cmpi::name_space(class_path));
        if (filter == call.adapter.filters.end())
            return CMPI_RC_OK;
        if (filter->count == 1)
            call.adapter.filters.erase(filter);
        else
            filter->count--;
        return CMPI_RC_OK;
    });
}

CMPIStatus enable_indications(CMPIIndicationMI* mi, const CMPIContext* context) {
    return run_call(mi, context, "enableIndications", [](const Call& call) -> int {
        if (call.adapter.indications_enabled)
            return CMPI_RC_OK;
        call.adapter.indications_enabled = true;
        return map_status(ENABLE_INDICATIONS_STATUS,
                          call.provider(OP_ENABLE_INDICATIONS, &_indication_proc, &call.adapter));
    });
}

CMPIStatus disable_indications(CMPIIndicationMI* mi, const CMPIContext* context) {
    return run_call(mi, context, "disableIndications", [](const Call& call) -> int {
        if (!call.adapter.indications_enabled)
            return CMPI_RC_OK;
        const sint32 status = call.provider(OP_DISABLE_INDICATIONS);
        call.adapter.indications_enabled = false;
        return map_status(DISABLE_INDICATIONS_STATUS, status);
    });
}

CMPIStatus indication_cleanup(CMPIIndicationMI* mi, const CMPIContext* context,
                              CMPIBoolean terminating) {
    CIMPLE_DBG("enter: %s()", "indicationCleanup");
    return cleanup(mi, context, terminating);
}

} // namespace

const CMPIIndicationMIFT INDICATION_FUNCTIONS = {
    CMPICurrentVersion, CMPICurrentVersion,  nullptr,         indication_cleanup,
    authorize_filter,   must_poll,           activate_filter, deactivate_filter,
    enable_indications, disable_indications,
};

} // namespace cimple
