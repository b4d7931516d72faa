// The gates that hold readers back while the refresh thread builds what they want to read.
//
// A gate is a ready flag with a mutex and a condition. A waiter tests the flag once and waits at
// most once: whoever wakes up proceeds, as every wake-up means that a build has just ended. There
// is no time-out. Order of the gates: adapter data, adapter maps or SAN maps, then m_DataMutex.
// One wake-up is none: when a refresh was told to end before it was done. Its waiters begin anew,
// and the first of them starts the next refresh; `behind` does that.
#ifndef VLN_AGENT_GATES_H
#define VLN_AGENT_GATES_H

#include "agent/provider_agent.h"

namespace cimple {

// A look at the data: BuildCimpleInfo, and which refreshes had been cut before it.
class Visit {
public:
    explicit Visit(ProviderAgent& agent, Pending_Requests requests = Pending_Requests::SERVED)
        : agent(agent), _cuts(agent.m_CutRefreshes) {
        agent.BuildCimpleInfo(requests);
    }
    bool was_cut() const { return _cuts != agent.m_CutRefreshes; }

    ProviderAgent& agent;

private:
    const uint32 _cuts;
};

// Takes the gate's mutex, waits once if the flag is down, and holds the mutex to the end of its
// scope. Nobody would raise the flag for the refresh's own thread.
class Gate {
public:
    template <class Flag>
    Gate(const Visit& visit, Mutex& mutex, Cond& cond, const Flag& ready) : _lock(mutex) {
        if (!ready && !visit.was_cut() && !ProviderAgent::isRefreshThread())
            cond.wait(mutex);
        is_open = ready || !visit.was_cut();
    }

    bool is_open = false; // else the visit has to begin anew

private:
    Auto_Mutex _lock;
};

inline Gate adapter_data_gate(const Visit& visit) {
    ProviderAgent& agent = visit.agent;
    return Gate(visit, agent.m_AdapterDataReadyMutex, agent.m_AdapterDataReadyCond,
                agent.m_bIsAdapterDataReady);
}

inline Gate adapter_maps_gate(const Visit& visit) {
    ProviderAgent& agent = visit.agent;
    return Gate(visit, agent.m_AdapterMapsReadyMutex, agent.m_AdapterMapsReadyCond,
                agent.m_bIsAdapterMapsReady);
}

inline Gate san_maps_gate(const Visit& visit) {
    ProviderAgent& agent = visit.agent;
    return Gate(visit, agent.m_SANMapsReadyMutex, agent.m_SANMapsReadyCond,
                agent.m_bIsSANMapsReady);
}

// Checks the age of the data, then answers what read answers behind the gate, with m_DataMutex held
// as well:
//     return behind(agent, adapter_maps_gate, [&] { return copy(agent.m_VLNMPCA_Card_map); });
template <class Read>
auto behind(ProviderAgent& agent, Gate (*gate)(const Visit& visit), Read read) {
    for (;;) {
        const Visit visit(agent);
        const Gate passed = gate(visit);
        if (!passed.is_open)
            continue;
        Auto_Mutex data(agent.m_DataMutex);
        return read();
    }
}

// Asks for a SAN pass if the SAN stores are stale, so that one runs even with the SAN refresh
// turned off. To be called before BuildCimpleInfo, with no lock held.
void request_stale_san_maps(ProviderAgent& agent);

// What every method and every writing operation of a class provider begins with: the refresh check,
// the gates of the adapter data and of the adapter maps, each let go again, then m_DataMutex, held
// to the end of the scope and so through every call into the management library. A client may be
// cancelled at the gates, but not in the library, whose own locks nobody would release.
class Operation_Prologue {
public:
    explicit Operation_Prologue(ProviderAgent& agent,
                                Pending_Requests requests = Pending_Requests::SERVED);

    // Has the adapter maps built anew and waits for them, with m_DataMutex, which the refresh
    // needs, given up meanwhile. What was read of the stores before is not to be trusted
    // afterwards.
    void refreshAdapterMaps();

    // Gives m_DataMutex up for the rest of the scope, for a call that may take minutes. The stores
    // are out of reach from then on.
    void letDataGo() { _data_lock.unlock(); }

private:
    ProviderAgent& _agent;
    Auto_Mutex _data_lock;
    No_Cancellation _in_the_library;
};

} // namespace cimple

#endif // VLN_AGENT_GATES_H
