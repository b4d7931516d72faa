// The gates that hold readers back while the refresh thread builds what they want to read.
//
// A gate is a ready flag with a mutex and a condition. A waiter tests the flag once and waits at
// most once: whoever wakes up proceeds, as every wake-up means that a build has just ended. There
// is no time-out. Order of the gates: adapter data, adapter maps or SAN maps, then m_DataMutex.
#ifndef VLN_AGENT_GATES_H
#define VLN_AGENT_GATES_H

#include "agent/provider_agent.h"

namespace cimple {

// Takes the gate's mutex, waits once if the flag is down, and holds the mutex to the end of its
// scope.
class Gate {
public:
    template <class Flag>
    Gate(Mutex& mutex, Cond& cond, const Flag& ready) : _lock(mutex) {
        if (!ready)
            cond.wait(mutex);
    }

private:
    Auto_Mutex _lock;
};

inline Gate adapter_data_gate(ProviderAgent& agent) {
    return Gate(agent.m_AdapterDataReadyMutex, agent.m_AdapterDataReadyCond,
                agent.m_bIsAdapterDataReady);
}

inline Gate adapter_maps_gate(ProviderAgent& agent) {
    return Gate(agent.m_AdapterMapsReadyMutex, agent.m_AdapterMapsReadyCond,
                agent.m_bIsAdapterMapsReady);
}

inline Gate san_maps_gate(ProviderAgent& agent) {
    return Gate(agent.m_SANMapsReadyMutex, agent.m_SANMapsReadyCond, agent.m_bIsSANMapsReady);
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
    explicit Operation_Prologue(ProviderAgent& agent);

private:
    Auto_Mutex _data_lock;
    No_Cancellation _in_the_library;
};

} // namespace cimple

#endif // VLN_AGENT_GATES_H
