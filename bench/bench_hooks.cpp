#include "bench/bench_hooks.h"

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "device/library/bound_functions.h"
#include "simulator/vlnsim.h"

#include <dlfcn.h>

#include <sched.h>

#include <cstdio>

using namespace cimple;

unsigned vln_bench_fill(unsigned count) {
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return 0;
    Auto_Mutex lock(agent->m_DataMutex);
    auto& store = agent->m_VLNMPCA_EthernetPort_map;
    for (unsigned number = 0; store.size() != 0 && store.size() < count; ++number) {
        auto* port = static_cast<VLNMPCA_EthernetPort*>(clone(store.at(0)));
        char name[32];
        std::snprintf(name, sizeof name, "10000090FA%06X", number);
        port->DeviceID.set(name);
        if (store.insert(port) < 0)
            unref(port);
    }
    return store.size();
}

void vln_bench_bound_calls() {
    for (unsigned i = 0; i < VLN_BENCH_CALLS; ++i)
        AX_GetNumberOfLocalAdapters();
}

void vln_bench_direct_calls() {
    void* library = dlopen("liblaxapi.so", RTLD_NOW);
    const auto entry = reinterpret_cast<decltype(&AX_GetNumberOfLocalAdapters)>(
        library ? dlsym(library, "AX_GetNumberOfLocalAdapters") : nullptr);
    for (unsigned i = 0; entry && i < VLN_BENCH_CALLS; ++i)
        entry();
    if (library)
        dlclose(library);
}

namespace {

constexpr uint64 HOUR = 3600ull * 1000000; // more than the data may be old

bool refresh_running(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_DataFetchMutex);
    return agent.m_bDataFetchRunning;
}

void wait_for_refresh(ProviderAgent& agent) {
    while (refresh_running(agent))
        sched_yield();
}

} // namespace

bool vln_bench_refresh() {
    ProviderAgent* agent = ProviderAgent::current();
    wait_for_refresh(*agent);
    agent->m_bRefreshSANData = false;
    const Datetime last = agent->m_LoadedTime;
    vlnsim_advance(HOUR);
    agent->BuildCimpleInfo();
    wait_for_refresh(*agent);
    return !(agent->m_LoadedTime == last);
}

void vln_bench_san_refresh() {
    ProviderAgent* agent = ProviderAgent::current();
    wait_for_refresh(*agent);
    agent->m_bSANRefreshRequested = true;
    agent->BuildCimpleInfo();
    wait_for_refresh(*agent);
}

void vln_bench_settle() {
    ProviderAgent::current()->m_DataFetchThread.join();
}

bool vln_bench_whole_refresh() {
    ProviderAgent* agent = ProviderAgent::current();
    const Datetime last = agent->m_LoadedTime;
    vlnsim_advance(HOUR);
    agent->BuildCimpleInfo();
    vln_bench_settle();
    return !(agent->m_LoadedTime == last);
}

// A second later, so that the time tells whether there was one.
bool vln_bench_san_pass() {
    constexpr uint64 SECOND = 1000000;
    ProviderAgent* agent = ProviderAgent::current();
    const Datetime last = agent->m_LoadedTime;
    vlnsim_advance(SECOND);
    agent->m_bSANRefreshRequested = true;
    agent->BuildCimpleInfo();
    vln_bench_settle();
    return !(agent->m_LoadedTime == last);
}

unsigned vln_bench_instances(bool san) {
    ProviderAgent* agent = ProviderAgent::current();
    Auto_Mutex lock(agent->m_DataMutex);
    unsigned count = 0;
    for (const Store_Row& row : store_table)
        if (san || (row.group != Store_Group::SAN_FCOE && row.group != Store_Group::SAN_ISCSI))
            count += row.store(*agent).size();
    return count;
}
