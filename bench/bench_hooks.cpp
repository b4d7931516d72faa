#include "bench/bench_hooks.h"

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_EthernetPort.h"

#include <cstdio>

using namespace cimple;

unsigned vln_bench_fill(unsigned count) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return 0;
    Auto_Mutex lock(agent->m_DataMutex);
    auto& store = agent->m_VLNMPCA_EthernetPort_map;
    for (unsigned number = 0; store.size() != 0 && store.size() < count; ++number) {
        auto* port = static_cast<VLNMPCA_EthernetPort*>(clone(store[0]));
        char name[32];
        std::snprintf(name, sizeof name, "10000090FA%06X", number);
        port->DeviceID.set(name);
        if (store.insert(port) < 0)
            unref(port);
    }
    return store.size();
}

void vln_bench_clones() {
    ProviderAgent* agent = ProviderAgent::current();
    auto& store = agent->m_VLNMPCA_EthernetPort_map;
    Instance_Map_Base copies(store.meta_class());
    for (uint32 i = 0; i < store.size(); ++i)
        copies.insert(clone(store.at(i)));
    for (uint32 i = 0; i < copies.size(); ++i)
        destroy(clone(copies.at(i)));
}
