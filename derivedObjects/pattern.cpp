#include "derivedObjects/pattern.h"

#include "agent/gates.h"
#include "agent/provider_agent.h"

namespace cimple {

namespace {

// Clones the row's stores. False, with a line in the log, when two of their instances have equal
// keys.
bool copy_stores(ProviderAgent& agent, const Pattern_Row& row, Instance_Map_Base& copies) {
    for (Store_Id id : row.stores) {
        if (id == NO_STORE)
            return true;
        const Instance_Map_Base& store = agent.store(id);
        for (uint32 i = 0; i < store.size(); ++i) {
            Ref<Instance> copy(clone(store.at(i)));
            if (copies.insert(copy.get()) < 0) {
                VLN_LOG(VLN_CRIT, "Insert failed for %zu", static_cast<std::size_t>(i));
                return false;
            }
            copy.release();
        }
    }
    return true;
}

bool copy_adapter_group(ProviderAgent& agent, const Pattern_Row& row, Instance_Map_Base& copies) {
    agent.BuildCimpleInfo();
    const Gate maps = adapter_maps_gate(agent);
    Auto_Mutex data(agent.m_DataMutex);
    return copy_stores(agent, row, copies);
}

bool copy_san_group(ProviderAgent& agent, const Pattern_Row& row, Instance_Map_Base& copies) {
    request_stale_san_maps(agent);
    agent.BuildCimpleInfo();
    const Gate maps = san_maps_gate(agent);
    Auto_Mutex data(agent.m_DataMutex);
    return copy_stores(agent, row, copies);
}

bool copy_active(ProviderAgent& agent, const Pattern_Row& row, Instance_Map_Base& copies) {
    agent.BuildCimpleInfo();
    const Gate adapters = adapter_data_gate(agent);
    const Gate maps = adapter_maps_gate(agent);
    Auto_Mutex data(agent.m_DataMutex);
    {
        Auto_Mutex update(row.update_mutex());
        if (row.update)
            row.update(agent);
    }
    return copy_stores(agent, row, copies);
}

struct Shape_Steps {
    bool (*copy)(ProviderAgent& agent, const Pattern_Row& row, Instance_Map_Base& copies);
    const char* exception; // the line of the guard
};

// By Pattern_Shape.
constexpr Shape_Steps SHAPES[] = {
    {copy_adapter_group, "Exception in CIM Provider Enumeration - do nothing"},
    {copy_san_group, "Exception in SAN CIM Provider Enumeration - do nothing"},
    {copy_active, "Exception in Active CIM Provider Enumeration - do nothing"},
};

// The local map keeps its clones and the handler gets clones of those, so that no lock is held
// while a slow client takes them.
void deliver(const Instance_Map_Base& copies, const Enum_Instances_Handler& handler) {
    for (uint32 i = 0; i < copies.size(); ++i)
        if (!handler.handle(clone(copies.at(i))))
            return;
}

void enumerate(ProviderAgent& agent, const Pattern_Row& row,
               const Enum_Instances_Handler& handler) {
    const Shape_Steps& shape = SHAPES[static_cast<std::size_t>(row.shape)];
    try {
        Instance_Map_Base copies(row.meta_class);
        if (shape.copy(agent, row, copies))
            deliver(copies, handler);
    } catch (...) {
        VLN_LOG(VLN_CRIT, "%s", shape.exception);
    }
}

} // namespace

sint32 pattern_load() noexcept {
    try {
        return ProviderAgent::acquire() ? PROVIDER_OK : LOAD_FAILED;
    } catch (...) {
        return LOAD_FAILED;
    }
}

sint32 pattern_unload(const Pattern_Row& row) noexcept {
    VLN_LOG(VLN_DBG, "%s_Provider::unload()", row.meta_class->name);
    try {
        ProviderAgent::release();
    } catch (...) {
        VLN_LOG(VLN_ERR, "Error in ProviderAgent unload. Just continue");
    }
    return PROVIDER_OK;
}

sint32 pattern_enum_instances(const Pattern_Row& row,
                              const Enum_Instances_Handler& handler) noexcept {
    // Without an agent nobody has loaded the class: the caller breaks the contract, and gets
    // nothing.
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return ENUM_INSTANCES_OK;
    const char* class_name = row.meta_class->name;
    if (row.shape == Pattern_Shape::ACTIVE && !agent->m_bLibraryLoaded) {
        VLN_LOG(VLN_DBG, "AX Init failed for %s_Provider.cpp", class_name);
        return ENUM_INSTANCES_OK;
    }
    enumerate(*agent, row, handler);
    VLN_LOG(VLN_DBG, "%s_Provider::enum_instances()", class_name);
    return ENUM_INSTANCES_OK;
}

} // namespace cimple
