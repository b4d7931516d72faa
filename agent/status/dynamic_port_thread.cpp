// The background thread that polls the state of the logical ports.

#include "agent/provider_agent.h"
#include "agent/status/dynamic_status.h"
#include "cimple/guard.h"
#include "device/library/attribute_buffer.h"
#include "device/library/identifiers.h"

#include <algorithm>
#include <exception>

#include <unistd.h>

namespace cimple {

namespace {

constexpr uint64 SLEEP = 6 * Datetime::SECOND;
constexpr unsigned SLEEPS_PER_POLL = 20;
constexpr uint64 SLEEP_BETWEEN_PORTS = 2 * Datetime::SECOND;
constexpr useconds_t LOCK_TRIAL_USEC = 10000; // of the machine's time

using Port_Rows = std::vector<Dynamic_Port_Row>;

bool stopped(const ProviderAgent& agent) {
    return load_flag(agent.m_bStopDynamicThread);
}

// The two states alone, or all attributes from a library that does not know that call.
Attribute_Buffer fetch_states(AX_WWN wwn) {
    Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
    uint32 size = buffer.size();
    if (AX_GetPortState(wwn, buffer.data(), &size) == AX_STATUS_OK)
        return buffer;
    return fetchPortAttributes(wwn);
}

// Takes a lock that a refresh may hold for long; false, and no lock, if the thread is stopped
// first.
bool lock_or_stop(const ProviderAgent& agent, Mutex& mutex) {
    while (!stopped(agent)) {
        if (mutex.try_lock() == 0)
            return true;
        usleep(LOCK_TRIAL_USEC);
    }
    return false;
}

// One port at a time under the data lock, with a rest between, so that no client waits for more
// than one call of the library. False when the thread was stopped meanwhile.
bool poll(ProviderAgent& agent, Port_Rows& rows) {
    // Held while the maps are being built: lets a refresh end first.
    if (!lock_or_stop(agent, agent.m_AdapterMapsReadyMutex))
        return false;
    agent.m_AdapterMapsReadyMutex.unlock();
    for (Dynamic_Port_Row& row : rows) {
        if (!lock_or_stop(agent, agent.m_DataMutex))
            return false;
        const bool complete = run_guarded([&] {
            read_states(row);
            row.scan_number = agent.m_pData->scanNumber;
        });
        agent.m_DataMutex.unlock();
        if (!complete)
            VLN_LOG(VLN_DBG, "Error occurred while retrieving NicPort status...");
        Time::pause(SLEEP_BETWEEN_PORTS, agent.m_bStopDynamicThread);
    }
    return !stopped(agent);
}

// The table keeps its size as long as the thread lives.
void publish(ProviderAgent& agent, const Port_Rows& rows) {
    Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
    std::copy(rows.begin(), rows.end(), agent.m_pDynamicPortStatus->rows.begin());
}

void run(ProviderAgent& agent, Port_Rows rows) {
    for (unsigned sleeps = 1;; ++sleeps) {
        Time::pause(SLEEP, agent.m_bStopDynamicThread);
        if (stopped(agent))
            return;
        if (sleeps % SLEEPS_PER_POLL != 0)
            continue;
        if (!poll(agent, rows))
            return;
        publish(agent, rows);
    }
}

} // namespace

void read_states(Dynamic_Port_Row& row) {
    AX_WWN wwn{};
    if (!wwnOfName(row.name, wwn, VLN_DBG))
        throw std::exception();
    Attribute_Buffer buffer = fetch_states(wwn);
    uint32 functional_state = 0;
    uint32 physical_state = 0;
    if (!getStatusNumber(buffer, AX_PA_FUNCTIONAL_PORT_STATE,
                         "ERROR: AX_GetttributeValue for PortState", functional_state) ||
        !getStatusNumber(buffer, AX_PA_PHYSICAL_PORT_STATE,
                         "ERROR: AX_GetttributeValue for PhysicalPortState", physical_state))
        throw std::exception();
    row.functional_state = functional_state;
    row.physical_state = physical_state;
}

void* DynamicDataFetch_Handler(void* argument) {
    VLN_LOG(VLN_DBG, "PERF: DynamicDataFetch_Handler Thread BEGIN");
    auto& agent = *static_cast<ProviderAgent*>(argument);
    Port_Rows rows;
    try {
        Auto_Mutex lock(agent.m_DynamicPortStatusMutex);
        rows = agent.m_pDynamicPortStatus->rows;
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "ERROR: DynamicDataFetch_Handler: Unable to allocate buffer");
        return nullptr;
    }
    run(agent, std::move(rows));
    VLN_LOG(VLN_DBG, "PERF: DynamicDataFetch_Handler Thread END ");
    return nullptr;
}

} // namespace cimple
