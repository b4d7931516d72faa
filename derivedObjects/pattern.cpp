#include "derivedObjects/pattern.h"

#include "agent/gates.h"
#include "agent/provider_agent.h"
#include "cimple/guard.h"

#include <optional>
#include <vector>

namespace cimple {

namespace {

// What an enumeration makes under the locks, to be delivered without them.
struct Copying {
    const Pattern_Row& row;
    const Enumeration_Focus* focus; // null: everything is wanted
    Instance_Map_Base copies;
};

// False, with a line in the log, when a copy has an equal key.
bool copy_member(const Instance_Map_Base& store, uint32 index, Instance_Map_Base& copies) {
    Ref<Instance> copy(clone(store.at(index)));
    if (copies.insert(copy.get()) < 0) {
        VLN_LOG(VLN_CRIT, "Insert failed for %zu", static_cast<std::size_t>(index));
        return false;
    }
    copy.release();
    return true;
}

// The members that the receiver will look at, if the store can tell them. Only a store by itself
// knows its members' keys to be distinct: several stores of one class are copied whole.
std::optional<std::vector<uint32>> wanted_members(Instance_Map_Base& store,
                                                  const Copying& copying) {
    if (!copying.focus || copying.row.stores[1] != NO_STORE)
        return std::nullopt;
    return store.narrow(*copying.focus);
}

// Clones the row's stores. False when two of their instances have equal keys.
bool copy_stores(ProviderAgent& agent, Copying& copying) {
    for (Store_Id id : copying.row.stores) {
        if (id == NO_STORE)
            return true;
        Instance_Map_Base& store = agent.store(id);
        if (const auto wanted = wanted_members(store, copying)) {
            for (uint32 index : *wanted)
                if (!copy_member(store, index, copying.copies))
                    return false;
            continue;
        }
        for (uint32 i = 0; i < store.size(); ++i)
            if (!copy_member(store, i, copying.copies))
                return false;
    }
    return true;
}

bool copy_adapter_group(ProviderAgent& agent, Copying& copying) {
    return behind(agent, adapter_maps_gate, [&] { return copy_stores(agent, copying); });
}

bool copy_san_group(ProviderAgent& agent, Copying& copying) {
    request_stale_san_maps(agent);
    return behind(agent, san_maps_gate, [&] { return copy_stores(agent, copying); });
}

bool copy_active(ProviderAgent& agent, Copying& copying) {
    for (;;) {
        const Visit visit(agent);
        const Gate adapters = adapter_data_gate(visit);
        const Gate maps = adapter_maps_gate(visit);
        if (!adapters.is_open || !maps.is_open)
            continue;
        Auto_Mutex data(agent.m_DataMutex);
        const No_Cancellation in_the_library;
        {
            Auto_Mutex update(copying.row.update_mutex());
            if (copying.row.update)
                copying.row.update(agent);
        }
        return copy_stores(agent, copying);
    }
}

struct Shape_Steps {
    bool (*copy)(ProviderAgent& agent, Copying& copying);
    const char* exception; // the line of the guard
};

// What each class's loads took.
constinit Class_Loads loads[NUM_PATTERNS];

Class_Loads& loads_of(const Pattern_Row& row) {
    return loads[&row - pattern_table];
}

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
    const bool complete = run_guarded([&] {
        Copying copying = {row, handler.focus(), Instance_Map_Base(row.meta_class)};
        if (shape.copy(agent, copying))
            deliver(copying.copies, handler);
    });
    if (!complete)
        VLN_LOG(VLN_CRIT, "%s", shape.exception);
}

} // namespace

sint32 pattern_load(const Pattern_Row& row) {
    bool loaded = false;
    run_guarded([&] { loaded = ProviderAgent::addRef(loads_of(row)); });
    return loaded ? PROVIDER_OK : LOAD_FAILED;
}

sint32 pattern_unload(const Pattern_Row& row) {
    VLN_LOG(VLN_DBG, "%s_Provider::unload()", row.meta_class->name);
    if (!run_guarded([&] { ProviderAgent::releaseRef(loads_of(row)); }))
        VLN_LOG(VLN_ERR, "Error in ProviderAgent unload. Just continue");
    return PROVIDER_OK;
}

sint32 pattern_enum_instances(const Pattern_Row& row, const Enum_Instances_Handler& handler) {
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
