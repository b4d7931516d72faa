#include "derivedObjects/pattern.h"

#include "agent/gates.h"
#include "agent/provider_agent.h"
#include "cimple/guard.h"
#include "cimple/shared_instances.h"

#include <optional>
#include <vector>

namespace cimple {

namespace {

// What an enumeration takes under the locks, to be delivered without them.
struct Taking {
    const Pattern_Row& row;
    const Enumeration_Focus* focus; // null: everything is wanted
    Shared_Instances instances;
};

// The first of the row's n-th store with keys that another of the row's instances before it has, or
// -1.
sint32 first_equal(ProviderAgent& agent, const Pattern_Row& row, std::size_t n) {
    const Instance_Map_Base& store = agent.store(row.stores[n]);
    if (n == 0)
        return store.first_equal();
    for (uint32 i = 0; i < store.size(); ++i)
        for (std::size_t before = 0; before < n; ++before)
            if (agent.store(row.stores[before]).find(store.at(i)) >= 0)
                return static_cast<sint32>(i);
    return store.first_equal();
}

// The members that the receiver will look at, if the store can tell them. Several stores of one
// class are taken whole.
std::optional<std::vector<uint32>> wanted_members(Instance_Map_Base& store, const Taking& taking) {
    if (!taking.focus || taking.row.stores[1] != NO_STORE)
        return std::nullopt;
    return store.narrow(*taking.focus);
}

void take_members(Instance_Map_Base& store, Taking& taking) {
    if (const auto wanted = wanted_members(store, taking)) {
        for (uint32 index : *wanted)
            taking.instances.add(store.at(index));
        return;
    }
    taking.instances.reserve(taking.instances.size() + store.size());
    for (uint32 i = 0; i < store.size(); ++i)
        taking.instances.add(store.at(i));
}

// Takes a count of what the row's stores hold. False, with a line in the log, when two of their
// instances have equal keys.
bool take_stores(ProviderAgent& agent, Taking& taking) {
    const auto& stores = taking.row.stores;
    for (std::size_t n = 0; n < stores.size() && stores[n] != NO_STORE; ++n) {
        if (const sint32 equal = first_equal(agent, taking.row, n); equal >= 0) {
            VLN_LOG(VLN_CRIT, "Insert failed for %zu", static_cast<std::size_t>(equal));
            return false;
        }
        take_members(agent.store(stores[n]), taking);
    }
    return true;
}

bool take_adapter_group(ProviderAgent& agent, Taking& taking) {
    return behind(agent, adapter_maps_gate, [&] { return take_stores(agent, taking); });
}

bool take_san_group(ProviderAgent& agent, Taking& taking) {
    request_stale_san_maps(agent);
    return behind(agent, san_maps_gate, [&] { return take_stores(agent, taking); });
}

bool take_active(ProviderAgent& agent, Taking& taking) {
    for (;;) {
        const Visit visit(agent);
        const Gate adapters = adapter_data_gate(visit);
        const Gate maps = adapter_maps_gate(visit);
        if (!adapters.is_open || !maps.is_open)
            continue;
        Auto_Mutex data(agent.m_DataMutex);
        const No_Cancellation in_the_library;
        {
            Auto_Mutex update(taking.row.update_mutex());
            if (taking.row.update)
                taking.row.update(agent);
        }
        return take_stores(agent, taking);
    }
}

struct Shape_Steps {
    bool (*take)(ProviderAgent& agent, Taking& taking);
    const char* exception; // the line of the guard
};

// What each class's loads took.
constinit Class_Loads loads[NUM_PATTERNS];

Class_Loads& loads_of(const Pattern_Row& row) {
    return loads[&row - pattern_table];
}

// By Pattern_Shape.
constexpr Shape_Steps SHAPES[] = {
    {take_adapter_group, "Exception in CIM Provider Enumeration - do nothing"},
    {take_san_group, "Exception in SAN CIM Provider Enumeration - do nothing"},
    {take_active, "Exception in Active CIM Provider Enumeration - do nothing"},
};

void deliver(Shared_Instances& instances, const Enum_Instances_Handler& handler) {
    for (std::size_t i = 0; i < instances.size(); ++i)
        if (!handler.handle(instances.take(i)))
            return;
}

void enumerate(ProviderAgent& agent, const Pattern_Row& row,
               const Enum_Instances_Handler& handler) {
    const Shape_Steps& shape = SHAPES[static_cast<std::size_t>(row.shape)];
    const bool complete = run_guarded([&] {
        Taking taking = {row, handler.focus(), {}};
        if (shape.take(agent, taking))
            deliver(taking.instances, handler);
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
