// Life of the agent: the one instance, its references, construction and destruction.

#include "agent/provider_agent.h"

#include "agent/lock_order.h"
#include "agent/signal_handler.h"
#include "agent/version.h"
#include "cimple/guard.h"
#include "cimple/thread_context.h"
#include "device/library/bound_functions.h"
#include "device/library/runtime_loader.h"
#include "device/scan_end.h"
#include "foundation/common.h"
#include "foundation/host_paths.h"

#include <atomic>
#include <cxxabi.h>

#include <unistd.h>

namespace cimple {

namespace {

// The pointer is published after the constructor has returned, and read without the lock.
constinit std::atomic<ProviderAgent*> s_Agent{nullptr};
// Loaded class providers. Written under s_AgentMutex; the log lines read it outside.
constinit std::atomic<sint32> s_AgentRefCount{0};
// Loads that failed and have not been undone. Guarded by s_AgentMutex.
constinit sint32 s_FailedLoads = 0;

constinit Process_Wide<Mutex> s_AgentMutex(false, RANK_AGENT, "s_AgentMutex");

// Registered anew with each agent, behind the libraries that it has opened: what a process has
// started last ends first, so that the threads are gone before the libraries are.
// The handler goes with its agent, since an object manager may load and unload without end: it is
// registered for an object of its own in place of the library (Itanium C++ ABI, 3.3.6).
char s_Registration;

void registerExit() {
    abi::__cxa_atexit([](void*) { ProviderAgent::endThreadsAtExit(); }, nullptr, &s_Registration);
}

// Runs the handler as well, which finds no agent.
void forgetExit() {
    abi::__cxa_finalize(&s_Registration);
}

// The provider whose call this thread is in.
const void* presentProvider() {
    const Thread_Context* context = Thread_Context::top();
    return context ? context->provider() : nullptr;
}

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
        registerExit();
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

bool ProviderAgent::addRef(Class_Loads& loads) {
    const No_Cancellation whole_agent;
    Auto_Mutex lock(*s_AgentMutex);
    ProviderAgent* agent = instanceLocked();
    if (!agent->m_bLibraryLoaded) {
        ++s_FailedLoads;
        ++loads.failures;
        return false;
    }
    VLN_LOG(VLN_DBG, "ProviderAgent::addRef[%d]", s_AgentRefCount.load());
    ++s_AgentRefCount;
    ++loads.references;
    return true;
}

// The agent, which what the record holds keeps alive; null if it holds nothing.
ProviderAgent* ProviderAgent::holder(const Class_Loads& loads) {
    Auto_Mutex lock(*s_AgentMutex);
    return loads.references || loads.failures ? current() : nullptr;
}

void ProviderAgent::releaseRef(Class_Loads& loads) {
    const No_Cancellation whole_agent;
    ProviderAgent* agent = holder(loads);
    if (!agent)
        return;
    agent->endThreadsOf(presentProvider());
    Auto_Mutex lock(*s_AgentMutex);
    if (loads.references) {
        VLN_LOG(VLN_DBG, "ProviderAgent::releaseRef[%d]", s_AgentRefCount.load());
        --loads.references;
        --s_AgentRefCount;
    } else if (loads.failures) {
        // The half-built agent has no references, but it may have had a refresh thread.
        --loads.failures;
        --s_FailedLoads;
    }
    if (s_AgentRefCount == 0 && s_FailedLoads == 0)
        destroyLocked();
}

void ProviderAgent::destroyLocked() {
    delete s_Agent.load(std::memory_order_relaxed);
    s_Agent.store(nullptr, std::memory_order_release);
    forgetExit();
}

// ---- Construction ----

ProviderAgent::ProviderAgent()
    : m_DataMutex(false, RANK_DATA, "m_DataMutex"),
      m_AdapterDataReadyMutex(false, RANK_ADAPTER_DATA_READY, "m_AdapterDataReadyMutex"),
      m_AdapterMapsReadyMutex(false, RANK_ADAPTER_MAPS_READY, "m_AdapterMapsReadyMutex"),
      m_SANMapsReadyMutex(false, RANK_SAN_MAPS_READY, "m_SANMapsReadyMutex"),
      m_DynamicPortStatusMutex(false, RANK_DYNAMIC_PORT_STATUS, "m_DynamicPortStatusMutex"),
      m_DataFetchMutex(false, RANK_DATA_FETCH, "m_DataFetchMutex"), m_Process(getpid()) {
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

// ---- The end of the threads ----

// Nothing is left over of them that uses the provider's broker.
void ProviderAgent::endThreadsOf(const void* provider) {
    if (m_DynamicPortThread.is_given_by(provider))
        stopDynamicThread();
    endRefreshOf(provider);
}

// The refresh ends as soon as it can. What it has not finished is asked for again, for the classes
// that stay.
void ProviderAgent::endRefreshOf(const void* provider) {
    {
        Auto_Mutex lock(m_DataFetchMutex);
        if (!m_DataFetchThread.is_given_by(provider) || isRefreshThread())
            return;
        if (m_bDataFetchRunning) {
            scan_is_to_end = true;
            VLN_LOG(VLN_DBG, "PERF: Clearing the previous thread...with join");
        }
    }
    m_DataFetchThread.join();
}

// Waits for one port's poll at most: a sleeping thread is woken. The next look at a port starts
// another thread.
void ProviderAgent::stopDynamicThread() {
    raise_flag(m_bStopDynamicThread);
    Time::wake();
    m_DynamicPortThread.join();
    Auto_Mutex lock(m_DynamicPortStatusMutex);
    m_pDynamicPortStatus.reset();
    m_DynamicPortThreadInitialized = false;
    m_bStopDynamicThread = false;
}

// The cleared library flag makes a running refresh skip what it has not begun. A thread that has
// ended is joined as well: its last instructions are this library's code.
void ProviderAgent::stopDataFetch() {
    bool running = false;
    {
        Auto_Mutex lock(m_DataFetchMutex);
        m_bLibraryLoaded = false;
        running = m_bDataFetchRunning;
    }
    if (running)
        VLN_LOG(VLN_DBG, "PERF: Clearing the previous thread...with join");
    m_DataFetchThread.join();
}

// No lock is taken that the process's last thread may hold itself. A child process that was forked
// has the agent but not its threads.
void ProviderAgent::endThreadsAtExit() noexcept {
    ProviderAgent* agent = current();
    if (!agent || agent->m_Process != getpid())
        return;
    raise_flag(agent->m_bStopDynamicThread);
    Time::wake();
    agent->m_bProcessEnds = true;
    agent->m_bLibraryLoaded = false;
    scan_is_to_end = true;
    constexpr uint64 LONGEST_WAIT = 5 * Datetime::SECOND; // for each
    agent->m_DynamicPortThread.join_within(LONGEST_WAIT);
    agent->m_DataFetchThread.join_within(LONGEST_WAIT);
    VLN_MethodWrapper::removeSemaphores();
}

// ---- The end of the rest ----

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

void ProviderAgent::clearRecords() {
    VLN_LOG(VLN_DBG, "Clearing the ConcreteJob objects related to CDM");
    m_VLNMPCA_OwningJobElement_map.clear();
    m_VLNMPCA_AffectedJobElement_map.clear();
    m_VLNMPCA_ConcreteJob_map.clear();
    VLN_LOG(VLN_DBG, "Clearing all the record logs");
    m_VLNMPCA_DiagnosticServiceRecord_map.clear();
    m_VLNMPCA_DiagnosticCompletionRecord_map.clear();
    m_VLNMPCA_RecordAppliesToElement_map.clear();
    m_VLNMPCA_LogManagesRecord_map.clear();
}

} // namespace cimple
