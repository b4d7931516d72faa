// The hub of the provider: owns the device model, the operations on the library, the loggers, the
// configuration and all instance stores, and keeps the stores fresh.
//
// A refresh happens only as a side effect of a client's call: BuildCimpleInfo starts at most one
// DataFetch_Handler thread, which rebuilds the model and the stores and ends. Readers wait at a
// gate (gates.h) while what they need is being built. The flags are plain bytes without atomics:
// the locks around them, or the harmlessness of a late reading, are what they rely on. Lock order:
// lock_order.h.
#ifndef VLN_AGENT_PROVIDER_AGENT_H
#define VLN_AGENT_PROVIDER_AGENT_H

#include "agent/agent_thread.h"
#include "agent/driver_logs.h"
#include "agent/plain_flag.h"
#include "agent/status/dynamic_port_status.h"
#include "agent/status/dynamic_status.h"
#include "agent/stores.h"
#include "cimple/thread.h"
#include "device/data.h"
#include "foundation/config_file.h"
#include "foundation/logger.h"
#include "operations/method_wrapper.h"

#include <atomic>
#include <memory>
#include <string>
#include <sys/types.h>

namespace cimple {

struct Platform_Objects;

// What the loads of one class took and its unloads have not given back. Guarded by s_AgentMutex.
struct Class_Loads {
    uint16 references = 0;
    uint16 failures = 0; // of loads while the libraries were not usable
};

// What a call on a class makes of refreshes that services have asked for. A service whose changes
// the stores show leaves them to whoever looks at the stores: its next call would wait for a
// refresh that nobody has looked at, and a row of a thousand changes would take a thousand.
enum class Pending_Requests : uint8 { SERVED, LEFT };

class ProviderAgent : public Instance_Stores {
public:
    // ---- The one agent of the process ----

    // The agent, built on first use under s_AgentMutex. Counts no reference. The constructor does
    // not fail when the libraries do: then m_bLibraryLoaded stays false.
    static ProviderAgent* instance();
    // The agent, or null when there is none; builds nothing.
    static ProviderAgent* current() noexcept;
    // Loads a class provider: builds the agent if there is none, and counts a reference. False, and
    // no reference, when the libraries are not usable. What was taken is noted in the record.
    static bool addRef(Class_Loads& loads);
    // Undoes one addRef of the record: ends the threads that the calls of this provider started,
    // then gives back what was taken, if anything. With the last of all the agent goes, also one
    // whose libraries are not usable, so that a later load tries again. Holds no lock while it
    // waits for a thread, which may be in an up-call that leads to a load.
    static void releaseRef(Class_Loads& loads);
    // At the end of the process: ends the threads without destroying anything.
    static void endThreadsAtExit() noexcept;

    // ---- Refresh ----

    // Every class operation calls this before it reads anything: decides whether a refresh is due
    // and starts it. Takes m_DataFetchMutex; answers 0 always and waits for no refresh.
    int BuildCimpleInfo(Pending_Requests requests = Pending_Requests::SERVED);
    // A service has changed what iSCSI ports see: the next look at the SAN waits for a refresh of
    // all. m_DataMutex is held.
    void requestSANRefresh();
    // Asks for new adapter data, starts the refresh that brings them, and waits until their maps
    // are ready; no longer than to the end of that refresh, or of one that was under way, whatever
    // became of it. No lock is held.
    void refreshAdapterMaps();
    // Whether this thread is the refresh: a request that its up-calls lead to. It finds the stores
    // as they are, since the refresh cannot go on before it is answered.
    static bool isRefreshThread() noexcept;

    // Clears the stores of both refresh passes, each under its ready mutex. For the destructor
    // only.
    void ClearMaps();
    // The caller holds the group's ready mutex and, on the refresh thread, m_DataMutex.
    void clearAdapterMaps();
    void clearSANMaps();
    // Jobs and diagnostic records, which go with the tests and with the agent. m_DataMutex is held.
    void clearRecords();

    // ---- Members ----

    // The tuning values, which a client may change at any time.
    std::atomic<bool> m_bRefreshAdapterData = false; // every refresh runs the adapter pass
    std::atomic<bool> m_bRefreshSANData = true;      // every refresh runs the SAN pass
    std::atomic<uint32> m_CacheTimeout = 10;         // minutes

    // One-shot: the first refresh always has adapter data.
    Plain_Flag<flag::m_bAdapterRefreshRequested> m_bAdapterRefreshRequested = true;
    // One-shot: a service has changed the SAN.
    Plain_Flag<flag::m_bSANRefreshRequested> m_bSANRefreshRequested = false;
    // A client waits for the SAN stores: a request that is met by the stores of any pass.
    Plain_Flag<flag::m_bSANMapsAsked> m_bSANMapsAsked = false;
    Plain_Flag<flag::m_bLibraryLoaded> m_bLibraryLoaded = false; // the device layer may be used

    std::unique_ptr<VLN_Data> m_pData;
    std::unique_ptr<VLN_MethodWrapper> m_pMethodWrapper;
    Provider_Loggers m_Loggers; // file, ring and system log, in this order
    VlnConfigFile m_ConfigFile; // saved when the agent goes

    Mutex m_DataMutex; // guards m_pData, every store and what is told of logs below

    Driver_Log m_DriverLogs[NUM_DRIVER_KINDS];
    uint16 m_NIMALogLevel = 3; // as a console has set it, or as the library begins

    bool m_bIsAdapterDataReady = false;
    bool m_bIsAdapterDataBuilding = false;
    Mutex m_AdapterDataReadyMutex;
    Cond m_AdapterDataReadyCond;

    Plain_Flag<flag::m_bIsAdapterMapsReady> m_bIsAdapterMapsReady = false;
    bool m_bIsAdapterMapsBuilding = false;
    Mutex m_AdapterMapsReadyMutex;
    Cond m_AdapterMapsReadyCond;

    Plain_Flag<flag::m_bIsSANMapsReady> m_bIsSANMapsReady = false;
    bool m_bIsSANMapsBuilding = false;
    Mutex m_SANMapsReadyMutex;
    Cond m_SANMapsReadyCond;

    // Holds the refresh back. Nothing sets it today: the test in BuildCimpleInfo is the one place
    // that a future writer has to reach.
    bool m_bDiagnosticsRunning = false;

    Datetime m_LastUpdates[NUM_DYNAMIC_UPDATES]; // all zero: not yet

    bool m_DynamicPortThreadInitialized = false;
    bool m_bStopDynamicThread = false;
    std::unique_ptr<Dynamic_Port_Status> m_pDynamicPortStatus;
    Mutex m_DynamicPortStatusMutex;
    Agent_Thread m_DynamicPortThread;

    bool m_bFirstAdapterPass = true;
    std::string m_OSName;
    std::string m_OSVersion;

    Datetime m_LoadedTime; // end of the last refresh; all zero before the first
    Agent_Thread m_DataFetchThread;
    Mutex m_DataFetchMutex; // guards the refresh decision and the members around it
    // A start that failed leaves it set: the stores stay as they are.
    bool m_bDataFetchRunning = false;
    std::atomic<bool> m_bNoMoreRefreshes = false; // after such a start
    // Whether a refresh thread is at work. Its end is told at the gate of the adapter maps.
    std::atomic<bool> m_bRefreshAtWork = false;
    std::atomic<bool> m_bProcessEnds = false; // no refresh starts any more
    // How many refreshes were told to end before they were done. Those whom such a refresh would
    // have let through the gates start another.
    std::atomic<uint32> m_CutRefreshes = 0;
    bool m_bOwnComputerSystem = false;
    const pid_t m_Process; // in which the agent was built, and its threads are

private:
    ProviderAgent();
    ~ProviderAgent();

    // provider_agent.cpp: steps of construction and destruction
    void copyConfiguration();
    void loadLibraries();
    void shutDown();
    void endThreadsOf(const void* provider);
    void endRefreshOf(const void* provider);
    void stopDynamicThread();
    void stopDataFetch();
    void destroyDeviceModel();
    static ProviderAgent* instanceLocked();
    static ProviderAgent* holder(const Class_Loads& loads);
    static void destroyLocked();

    // refresh.cpp
    static void* DataFetch_Handler(void* agent);
    bool isCacheTimedOut();
    bool claimRefresh(Pending_Requests requests);
    void openGates();
    bool isSANPassWanted() const;
    void runAdapterPass();
    void rebuildAdapterData();
    void leaveAdapterMaps();
    void rebuildAdapterMaps(const Platform_Objects& platform);
    void runSANPass();
    void rebuildSANMaps();
    bool finishRefresh();
    void wakeWaiters();
    void tellEnd();

    // The two map builders, on the refresh thread, under m_DataMutex. 0 or 32769.
    uint32 updateAdapterMaps(const Platform_Objects& platform);
    uint32 updateSANMaps();
};

} // namespace cimple

#endif // VLN_AGENT_PROVIDER_AGENT_H
