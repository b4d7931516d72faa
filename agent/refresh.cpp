// When a refresh is due, and what the refresh thread does.

#include "agent/platform/platform_objects.h"
#include "agent/provider_agent.h"
#include "cimple/guard.h"
#include "device/scan_end.h"

namespace cimple {

namespace {

constexpr uint32 USEC_PER_MINUTE = 60000000;

thread_local bool is_refresh_thread = false;

// A builder that throws must cost its stores or its model, never the object manager's process.
template <class Build>
void guarded(const char* what, Build build) {
    if (!run_guarded(build))
        VLN_LOG(VLN_ERR, "Exception in %s", what);
}

} // namespace

bool ProviderAgent::isRefreshThread() noexcept {
    return is_refresh_thread;
}

// ---- The decision ----

bool ProviderAgent::isCacheTimedOut() {
    VLN_LOG(VLN_DBG, "Checking if TimeOut...");
    const Datetime now = Datetime::now();
    VLN_LOG(VLN_DBG, "loadedtime = %s; currenttime = %s; cache timeout = %d",
            m_LoadedTime.ascii().c_str(), now.ascii().c_str(), static_cast<int>(m_CacheTimeout));
    const uint64 difference = now.usec() - m_LoadedTime.usec();
    // The product is meant to be 32 bits wide, and so wraps from 72 minutes on; a difference that
    // needs more bits is a time-out whatever the limit.
    const uint32 limit = m_CacheTimeout * USEC_PER_MINUTE;
    if (difference <= 0xFFFFFFFFu && difference < limit) {
        VLN_LOG(VLN_DBG, "PERF: Refresh Not yet required");
        return false;
    }
    VLN_LOG(VLN_DBG, "PERF: TimeOut");
    return true;
}

// Whether the caller has to start the refresh thread. It then owns m_bDataFetchRunning: no other
// call comes past this test until that thread has ended, so the thread's handle needs no lock.
bool ProviderAgent::claimRefresh(Pending_Requests requests) {
    Auto_Mutex lock(m_DataFetchMutex);
    const bool is_requested =
        m_bAdapterRefreshRequested || m_bSANRefreshRequested || m_bSANMapsAsked;
    if (!isCacheTimedOut() && !(is_requested && requests == Pending_Requests::SERVED)) {
        VLN_LOG(VLN_DBG, "PERF: ---No timeout BuildCimpleInfo END---");
        return false;
    }
    if (m_bDiagnosticsRunning) {
        VLN_LOG(VLN_DBG, "Diagnostics is running.. Skip the internal refresh till it ends");
        return false;
    }
    if (m_bDataFetchRunning || m_bProcessEnds) {
        VLN_LOG(VLN_DBG, "DataFetch_Handler thread already running-BuildCimpleInfo");
        return false;
    }
    m_bDataFetchRunning = true;
    if (!(m_LoadedTime == Datetime()))
        VLN_LOG(VLN_DBG, "PERF: Clearing the previous thread...with join");
    // The previous thread has cleared the running flag in a late step and waits for nobody since:
    // this join is prompt.
    m_DataFetchThread.join();
    scan_is_to_end = false;
    return true;
}

int ProviderAgent::BuildCimpleInfo(Pending_Requests requests) {
    const No_Cancellation claimed_and_started;
    VLN_LOG(VLN_INFO, " Entering BuildCimpleInfo()");
    // Without the libraries the refresh still runs: it raises the ready flags over empty stores, so
    // that no client hangs at a gate.
    if (!m_bLibraryLoaded)
        VLN_LOG(VLN_DBG,
                "Vorlan Provider dependent library load has failed..do nothing is the only "
                "option");
    if (!claimRefresh(requests))
        return 0;
    // Only a pending SAN request alone may leave the adapter data as they are.
    if (!m_bSANRefreshRequested && !m_bSANMapsAsked)
        m_bAdapterRefreshRequested = true;
    // After a start that fails the running flag stays up: the stores keep what they hold.
    m_bRefreshAtWork = true;
    if (const int error = m_DataFetchThread.start(DataFetch_Handler, this)) {
        m_bRefreshAtWork = false;
        VLN_LOG(VLN_ERR, "Error : DataFetch_Handler thread could not be started (%d)", error);
        openGates();
    }
    VLN_LOG(VLN_DBG, "PERF: ---Created DataFetch_Handler thread -- BuildCimpleInfo END---");
    return 0;
}

// The gate's flag is lowered as well, so that whoever looks at the SAN next waits for what the
// change has brought. m_DataMutex, under which a pass raises the flag, keeps the two apart: a pass
// that has read the library before the change has raised it before.
void ProviderAgent::requestSANRefresh() {
    m_bAdapterRefreshRequested = true;
    m_bSANRefreshRequested = true;
    m_bIsSANMapsReady = false;
    if (m_bNoMoreRefreshes)
        m_bIsSANMapsReady = true;
}

// Where no refresh will come, the stores as they stand are what there is, empty ones included:
// nobody waits for more.
void ProviderAgent::openGates() {
    m_bNoMoreRefreshes = true;
    const auto open = [](Mutex& mutex, Cond& cond, auto& ready) {
        Auto_Mutex gate(mutex);
        ready = true;
        cond.broadcast();
    };
    open(m_AdapterDataReadyMutex, m_AdapterDataReadyCond, m_bIsAdapterDataReady);
    open(m_AdapterMapsReadyMutex, m_AdapterMapsReadyCond, m_bIsAdapterMapsReady);
    open(m_SANMapsReadyMutex, m_SANMapsReadyCond, m_bIsSANMapsReady);
}

// The refresh's own thread, in a request that an up-call leads to, would wait for itself.
void ProviderAgent::refreshAdapterMaps() {
    m_bAdapterRefreshRequested = true;
    BuildCimpleInfo();
    if (isRefreshThread())
        return;
    Auto_Mutex gate(m_AdapterMapsReadyMutex);
    while (m_bRefreshAtWork && (m_bAdapterRefreshRequested || !m_bIsAdapterMapsReady))
        m_AdapterMapsReadyCond.wait(m_AdapterMapsReadyMutex);
}

// ---- The thread ----

void* ProviderAgent::DataFetch_Handler(void* argument) {
    VLN_LOG(VLN_DBG, "PERF: DataFetch_Handler Thread BEGIN");
    auto* agent = static_cast<ProviderAgent*>(argument);
    is_refresh_thread = true;
    if (agent->m_bRefreshAdapterData || agent->m_bAdapterRefreshRequested)
        agent->runAdapterPass();
    do {
        if (agent->isSANPassWanted())
            agent->runSANPass();
    } while (!agent->finishRefresh());
    agent->wakeWaiters();
    agent->tellEnd();
    VLN_LOG(VLN_DBG, "PERF: DataFetch_Handler Thread END");
    return nullptr;
}

bool ProviderAgent::isSANPassWanted() const {
    return m_bRefreshSANData || m_bSANRefreshRequested || m_bSANMapsAsked;
}

void ProviderAgent::runAdapterPass() {
    Platform_Objects platform;
    if (m_bLibraryLoaded && !scan_is_to_end)
        guarded("up-calls", [&platform] { platform = find_platform_objects(); });
    if (scan_is_to_end) {
        m_bAdapterRefreshRequested = true; // nothing is begun: the stores stay readable
        return;
    }
    rebuildAdapterData();
    {
        // New adapter data always make the SAN stores stale.
        Auto_Mutex lock(m_SANMapsReadyMutex);
        m_bIsSANMapsReady = false;
    }
    rebuildAdapterMaps(platform);
}

void ProviderAgent::rebuildAdapterData() {
    VLN_LOG(VLN_DBG, "PERF: Building Adapter Data...");
    Auto_Mutex gate(m_AdapterDataReadyMutex);
    m_bAdapterRefreshRequested = false;
    m_bIsAdapterDataReady = false;
    // Without its own mutex: a reader may see the old value for a moment and read the old stores,
    // which are still whole.
    m_bIsAdapterMapsReady = false;
    m_bIsAdapterDataBuilding = true;
    if (m_bLibraryLoaded) {
        Auto_Mutex data(m_DataMutex);
        guarded("buildAdapterData", [this] { m_pData->buildAdapterData(); });
    }
    m_bIsAdapterDataBuilding = false;
    if (scan_is_to_end) {
        m_bAdapterRefreshRequested = true;
        return;
    }
    m_bIsAdapterDataReady = true;
    m_AdapterDataReadyCond.broadcast();
}

// A part of the maps is nobody's picture. Whoever came by the first gate now would wait at the
// second, with the mutex that the next refresh needs: so the first one is shut as well.
void ProviderAgent::leaveAdapterMaps() {
    m_bAdapterRefreshRequested = true;
    m_bIsAdapterDataReady = false;
}

void ProviderAgent::rebuildAdapterMaps(const Platform_Objects& platform) {
    Auto_Mutex gate(m_AdapterMapsReadyMutex);
    if (scan_is_to_end) {
        leaveAdapterMaps();
        return;
    }
    m_bIsAdapterMapsBuilding = true;
    if (m_bLibraryLoaded) {
        VLN_LOG(VLN_DBG, "PERF: Updating Adapter Maps...");
        Auto_Mutex data(m_DataMutex);
        guarded("updateAdapterMaps", [&] { updateAdapterMaps(platform); });
    }
    m_bIsAdapterMapsBuilding = false;
    if (scan_is_to_end && m_bAdapterRefreshRequested) { // by a group that was cut short
        leaveAdapterMaps();
        return;
    }
    m_bIsAdapterMapsReady = true;
    m_AdapterMapsReadyCond.broadcast();
}

// Holds the gates of the adapter data and maps for its whole length, so operations and adapter
// class clients wait for it as well.
void ProviderAgent::runSANPass() {
    Auto_Mutex data_gate(m_AdapterDataReadyMutex);
    if (scan_is_to_end) {
        m_bSANRefreshRequested = true;
        return;
    }
    m_bSANRefreshRequested = false;
    m_bSANMapsAsked = false;
    m_bIsSANMapsReady = false; // without its own mutex, as above
    if (!m_bIsAdapterDataReady)
        m_AdapterDataReadyCond.wait(m_AdapterDataReadyMutex);
    if (m_bLibraryLoaded) {
        Auto_Mutex data(m_DataMutex);
        VLN_LOG(VLN_DBG, "PERF: Building SAN Data...");
        guarded("buildSANData", [this] { m_pData->buildSANData(); });
    }
    Auto_Mutex maps_gate(m_AdapterMapsReadyMutex);
    if (!m_bIsAdapterMapsReady)
        m_AdapterMapsReadyCond.wait(m_AdapterMapsReadyMutex);
    rebuildSANMaps();
}

void ProviderAgent::rebuildSANMaps() {
    Auto_Mutex gate(m_SANMapsReadyMutex);
    m_bIsSANMapsBuilding = true;
    if (m_bLibraryLoaded) {
        Auto_Mutex data(m_DataMutex);
        VLN_LOG(VLN_DBG, "PERF: Updating SAN Maps...");
        guarded("updateSANMaps", [this] { updateSANMaps(); });
        // A part of the SAN is nobody's picture.
        if (scan_is_to_end)
            clearSANMaps();
        m_bIsSANMapsReady = !scan_is_to_end; // see requestSANRefresh
    } else {
        m_bIsSANMapsReady = true;
    }
    m_bIsSANMapsBuilding = false;
    if (scan_is_to_end) {
        m_bIsSANMapsReady = false;
        m_bSANRefreshRequested = true;
        return;
    }
    // Whoever has asked meanwhile has what it asked for. Clients ask under this mutex.
    m_bSANMapsAsked = false;
    m_SANMapsReadyCond.broadcast();
}

// The time-out counts from here: from the end of a refresh, not from its start. False, and no end,
// if a client waits for SAN stores that no pass of this refresh will make otherwise.
bool ProviderAgent::finishRefresh() {
    Auto_Mutex lock(m_DataFetchMutex);
    if (m_bSANMapsAsked && !m_bIsSANMapsReady && !scan_is_to_end)
        return false;
    m_bDataFetchRunning = false;
    m_LoadedTime = Datetime::now();
    if (scan_is_to_end)
        ++m_CutRefreshes;
    return true;
}

// After a refresh that has ended early. Those who wait see that by the count, and start another.
void ProviderAgent::wakeWaiters() {
    if (!scan_is_to_end)
        return;
    const auto wake = [](Mutex& mutex, Cond& cond) {
        Auto_Mutex lock(mutex);
        cond.broadcast();
    };
    wake(m_AdapterDataReadyMutex, m_AdapterDataReadyCond);
    wake(m_AdapterMapsReadyMutex, m_AdapterMapsReadyCond);
    wake(m_SANMapsReadyMutex, m_SANMapsReadyCond);
}

// The next refresh joins this thread before it lowers a flag, so nobody passes a gate by this who
// should not.
void ProviderAgent::tellEnd() {
    Auto_Mutex gate(m_AdapterMapsReadyMutex);
    m_bRefreshAtWork = false;
    m_AdapterMapsReadyCond.broadcast();
}

} // namespace cimple
