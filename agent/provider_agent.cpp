// Life of the agent: the one instance, its references, construction and destruction.

#include "agent/provider_agent.h"

#include "agent/lock_order.h"
#include "agent/signal_handler.h"
#include "agent/version.h"
#include "cimple/guard.h"
#include "device/library/bound_functions.h"
#include "device/library/runtime_loader.h"
#include "foundation/common.h"
#include "foundation/host_paths.h"

#include <atomic>

#include <unistd.h>

namespace cimple {

namespace {

// The pointer is published after the constructor has returned, and read without the lock.
constinit std::atomic<ProviderAgent*> s_Agent{nullptr};
// Loaded class providers. Written under s_AgentMutex; the log lines read it outside.
constinit std::atomic<sint32> s_AgentRefCount{0};
// Classes whose load failed and which have not been unloaded. Guarded by s_AgentMutex.
constinit sint32 s_FailedLoads = 0;

constinit Process_Wide<Mutex> s_AgentMutex(false, RANK_AGENT, "s_AgentMutex");

} // namespace

// ---- The one agent ----

ProviderAgent* ProviderAgent::current() noexcept {
    return s_Agent.load(std::memory_order_acquire);
}

ProviderAgent* ProviderAgent::instanceLocked() {
    ProviderAgent* agent = s_Agent.load(std::memory_order_relaxed);
    if (!agent) {
        agent = new ProviderAgent;
        s_Agent.store(agent, std::memory_order_release);
    }
    return agent;
}

ProviderAgent* ProviderAgent::instance() {
    if (ProviderAgent* agent = current())
        return agent;
    const No_Cancellation whole_agent;
    Auto_Mutex lock(*s_AgentMutex);
    return instanceLocked();
}

bool ProviderAgent::acquire() {
    const No_Cancellation whole_agent;
    Auto_Mutex lock(*s_AgentMutex);
    ProviderAgent* agent = instanceLocked();
    if (!agent->m_bLibraryLoaded) {
        ++s_FailedLoads;
        return false;
    }
    VLN_LOG(VLN_DBG, "ProviderAgent::addRef[%d]", s_AgentRefCount.load());
    ++s_AgentRefCount;
    return true;
}

void ProviderAgent::release() {
    const No_Cancellation whole_agent;
    ProviderAgent* agent = current();
    if (!agent)
        return;
    if (agent->m_bLibraryLoaded) {
        agent->releaseRef();
        return;
    }
    // The half-built agent has no references, but it may have a refresh thread, and the library may
    // be unmapped once its last class is gone.
    Auto_Mutex lock(*s_AgentMutex);
    if (--s_FailedLoads == 0)
        destroyLocked();
}

void ProviderAgent::destroyLocked() {
    delete s_Agent.load(std::memory_order_relaxed);
    s_Agent.store(nullptr, std::memory_order_release);
}

void ProviderAgent::addRef() {
    VLN_LOG(VLN_DBG, "ProviderAgent::addRef[%d]", s_AgentRefCount.load());
    Auto_Mutex lock(*s_AgentMutex);
    ++s_AgentRefCount;
}

void ProviderAgent::releaseRef() {
    VLN_LOG(VLN_DBG, "ProviderAgent::releaseRef[%d]", s_AgentRefCount.load());
    Auto_Mutex lock(*s_AgentMutex);
    if (--s_AgentRefCount == 0)
        destroyLocked();
}

// ---- Construction ----

ProviderAgent::ProviderAgent()
    : m_DataMutex(false, RANK_DATA, "m_DataMutex"),
      m_AdapterDataReadyMutex(false, RANK_ADAPTER_DATA_READY, "m_AdapterDataReadyMutex"),
      m_AdapterMapsReadyMutex(false, RANK_ADAPTER_MAPS_READY, "m_AdapterMapsReadyMutex"),
      m_SANMapsReadyMutex(false, RANK_SAN_MAPS_READY, "m_SANMapsReadyMutex"),
      m_DynamicPortStatusMutex(false, RANK_DYNAMIC_PORT_STATUS, "m_DynamicPortStatusMutex"),
      m_DataFetchMutex(false, RANK_DATA_FETCH, "m_DataFetchMutex") {
    const bool complete = run_guarded([this] {
        m_ConfigFile.load(host_path(Host_File::TUNING).c_str());
        prepareSignalAction();
        m_Loggers.start();
        copyConfiguration();
        if (VLN_Common::getOSInformation(m_OSName, m_OSVersion) != 0)
            VLN_LOG(VLN_ERR, "getOSInformation() failed");
        m_LoadedTime = Datetime();
        loadLibraries();
        VLN_LOG(VLN_INFO, "Vorlan Provider v%d.%d.%d-%d Loaded[%d]", VLN_PROVIDER_VERSION_NUMBERS,
                static_cast<int>(getpid()));
        m_bLibraryLoaded = true;
    });
    if (complete)
        return;
    // A half-built agent stays: every load fails from now on and takes no reference.
    VLN_LOG(VLN_ERR, "Vorlan CIM Provider load failure");
    m_bLibraryLoaded = false;
}

void ProviderAgent::copyConfiguration() {
    m_CacheTimeout = m_ConfigFile.get_cache_timeout();
    m_bRefreshAdapterData = m_ConfigFile.get_refresh_adapter();
    m_bRefreshSANData = m_ConfigFile.get_refresh_san();
}

// Throws when the management library can't be initialised.
void ProviderAgent::loadLibraries() {
    VLN_LOG(VLN_DBG, "Initializing AX API ");
    m_pMethodWrapper.reset();
    if (loadRuntimeLibraries() == 1)
        VLN_LOG(VLN_ERR, "Error : In Loading Library ");
    m_pMethodWrapper = std::make_unique<VLN_MethodWrapper>();
    m_pData = std::make_unique<VLN_Data>();
}

// ---- Destruction ----

ProviderAgent::~ProviderAgent() {
    VLN_LOG(VLN_DBG, "Entering dtor ~ProviderAgent()");
    if (!run_guarded([this] { shutDown(); }))
        VLN_LOG(VLN_ERR, "Error in ProviderAgent unload. Just continue");
}

void ProviderAgent::shutDown() {
    stopDynamicThread();
    stopDataFetch();
    destroyDeviceModel();
    CPQFC_FreeLibrary();
    ClearMaps();
    CLogger& logger = CLogger::instance();
    // The small default log is nobody's setting, and is not saved as one.
    if (!logger.is_ffdc())
        logger.save_config();
    VLN_LOG(VLN_INFO, "Vorlan Provider Unloaded");
    unloadRuntimeLibraries();
}

// Waits for one port's poll at most: a sleeping thread is woken.
void ProviderAgent::stopDynamicThread() {
    if (!m_DynamicPortThreadInitialized)
        return;
    raise_flag(m_bStopDynamicThread);
    Time::wake();
    void* value = nullptr;
    Thread::join(m_DynamicPortThread, value);
    m_pDynamicPortStatus.reset();
    m_DynamicPortThreadInitialized = false;
}

// The cleared library flag makes a running refresh skip what it has not begun. A thread that has
// ended is joined as well: its last instructions are this library's code, which goes away next.
void ProviderAgent::stopDataFetch() {
    bool running = false;
    {
        Auto_Mutex lock(m_DataFetchMutex);
        m_bLibraryLoaded = false;
        running = m_bDataFetchRunning;
    }
    if (running)
        VLN_LOG(VLN_DBG, "PERF: Clearing the previous thread...with join");
    joinDataFetch();
}

void ProviderAgent::destroyDeviceModel() {
    VLN_LOG(VLN_DBG, "Deleting Data pointer");
    Auto_Mutex data_gate(m_AdapterDataReadyMutex);
    if (m_bIsAdapterDataBuilding) {
        VLN_LOG(VLN_DBG, "PERF: Waiting for m_bIsAdapterDataReady");
        m_AdapterDataReadyCond.wait(m_AdapterDataReadyMutex);
        VLN_LOG(VLN_DBG, "PERF: Woken up from wait for m_bIsAdapterDataReady");
    }
    Auto_Mutex maps_gate(m_AdapterMapsReadyMutex);
    if (m_bIsAdapterMapsBuilding)
        m_AdapterMapsReadyCond.wait(m_AdapterMapsReadyMutex);
    Auto_Mutex data(m_DataMutex);
    m_pData.reset();
    VLN_LOG(VLN_DBG, "MethodWrapper");
    m_pMethodWrapper.reset();
    clearRecords();
}

// What outlives every refresh ends here.
void ProviderAgent::clearRecords() {
    VLN_LOG(VLN_DBG, "Clearing the ConcreteJob objects related to CDM");
    VLN_LOG(VLN_DBG, "Clearing all the record logs");
    m_VLNMPCA_DiagnosticServiceRecord_map.clear();
    m_VLNMPCA_DiagnosticCompletionRecord_map.clear();
    m_VLNMPCA_RecordAppliesToElement_map.clear();
    m_VLNMPCA_LogManagesRecord_map.clear();
}

} // namespace cimple
