#include "agent/gates.h"

namespace cimple {

namespace {

void pass_adapter_data(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_AdapterDataReadyMutex);
    if (agent.m_bIsAdapterDataReady)
        return;
    VLN_LOG(VLN_DBG, "PERF: Waiting for m_AdapterDataReadyMutex");
    agent.m_AdapterDataReadyCond.wait(agent.m_AdapterDataReadyMutex);
    VLN_LOG(VLN_DBG, "PERF: Woken up from wait for m_AdapterDataReadyMutex");
}

void pass_adapter_maps(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_AdapterMapsReadyMutex);
    if (agent.m_bIsAdapterMapsReady)
        return;
    VLN_LOG(VLN_DBG, "PERF: Waiting for m_AdapterMapsReadyMutex");
    agent.m_AdapterMapsReadyCond.wait(agent.m_AdapterMapsReadyMutex);
    VLN_LOG(VLN_DBG, "PERF: Woken up from wait for m_AdapterMapsReadyMutex");
}

Mutex& data_mutex_behind_gates(ProviderAgent& agent) {
    agent.BuildCimpleInfo();
    pass_adapter_data(agent);
    pass_adapter_maps(agent);
    return agent.m_DataMutex;
}

} // namespace

void request_stale_san_maps(ProviderAgent& agent) {
    Auto_Mutex lock(agent.m_SANMapsReadyMutex);
    if (!agent.m_bIsSANMapsReady)
        agent.m_bSANRefreshRequested = true;
}

Operation_Prologue::Operation_Prologue(ProviderAgent& agent)
    : _data_lock(data_mutex_behind_gates(agent)) {}

} // namespace cimple
