#include "agent/gates.h"

namespace cimple {

namespace {

bool pass_adapter_data(const Visit& visit) {
    ProviderAgent& agent = visit.agent;
    Auto_Mutex lock(agent.m_AdapterDataReadyMutex);
    if (agent.m_bIsAdapterDataReady || ProviderAgent::isRefreshThread())
        return true;
    VLN_LOG(VLN_DBG, "PERF: Waiting for m_AdapterDataReadyMutex");
    if (!visit.was_cut())
        agent.m_AdapterDataReadyCond.wait(agent.m_AdapterDataReadyMutex);
    VLN_LOG(VLN_DBG, "PERF: Woken up from wait for m_AdapterDataReadyMutex");
    return agent.m_bIsAdapterDataReady || !visit.was_cut();
}

bool pass_adapter_maps(const Visit& visit) {
    ProviderAgent& agent = visit.agent;
    Auto_Mutex lock(agent.m_AdapterMapsReadyMutex);
    if (agent.m_bIsAdapterMapsReady || ProviderAgent::isRefreshThread())
        return true;
    VLN_LOG(VLN_DBG, "PERF: Waiting for m_AdapterMapsReadyMutex");
    if (!visit.was_cut())
        agent.m_AdapterMapsReadyCond.wait(agent.m_AdapterMapsReadyMutex);
    VLN_LOG(VLN_DBG, "PERF: Woken up from wait for m_AdapterMapsReadyMutex");
    return agent.m_bIsAdapterMapsReady || !visit.was_cut();
}

Mutex& data_mutex_behind_gates(ProviderAgent& agent, Pending_Requests requests) {
    for (;;) {
        const Visit visit(agent, requests);
        if (pass_adapter_data(visit) && pass_adapter_maps(visit))
            return agent.m_DataMutex;
    }
}

} // namespace

void request_stale_san_maps(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_SANMapsReadyMutex);
    if (!agent.m_bIsSANMapsReady)
        agent.m_bSANMapsAsked = true;
}

Operation_Prologue::Operation_Prologue(ProviderAgent& agent, Pending_Requests requests)
    : _agent(agent), _data_lock(data_mutex_behind_gates(agent, requests)) {}

void Operation_Prologue::refreshAdapterMaps() {
    struct Given_Up {
        explicit Given_Up(Mutex& mutex) : mutex(mutex) { mutex.unlock(); }
        ~Given_Up() { mutex.lock(); }
        Mutex& mutex;
    };
    const Given_Up data(_agent.m_DataMutex);
    _agent.refreshAdapterMaps();
}

} // namespace cimple
