// How the stores are emptied: tables of groups with their log lines, in the order of the lines.

#include "agent/provider_agent.h"
#include "cimple/guard.h"

namespace cimple {

namespace {

struct Clearing_Step {
    const char* before;
    Store_Group group;
    const char* after; // or null
};

constexpr Clearing_Step ADAPTER_STEPS[] = {
    {"PERF: Entered clearAdapterMaps()", Store_Group::PLATFORM, nullptr},
    {"Clearing Record Log maps", Store_Group::RECORD_LOG, nullptr},
    {"Clearing NIC maps", Store_Group::NIC, nullptr},
    {"Clearing SoftwareUpdate maps", Store_Group::SOFTWARE_UPDATE_SERVICE, nullptr},
    {"Clearing Software Update maps", Store_Group::SOFTWARE_UPDATE, nullptr},
    {"Clearing VLN CDM maps", Store_Group::DIAGNOSTICS, "Done with Clearing CDM maps"},
    {"Clearing VLNMPCA FCOE maps", Store_Group::FCOE, "Done with Clearing FCOE maps"},
    {"Clearing VLNMPCA iSCSI maps", Store_Group::ISCSI, "Done with Clearing iSCSI maps"},
};

// Both parts of the SAN stores report a failure with the first one's words.
constexpr Clearing_Step SAN_STEPS[] = {
    {"PERF: Entered FCoE clearSANMaps()", Store_Group::SAN_FCOE, nullptr},
    {"PERF: Entered iSCSI clearSANMaps()", Store_Group::SAN_ISCSI, nullptr},
};

void run_step(Instance_Stores& stores, const Clearing_Step& step) {
    VLN_LOG(VLN_DBG, "%s", step.before);
    clear_group(stores, step.group);
    if (step.after)
        VLN_LOG(VLN_DBG, "%s", step.after);
}

} // namespace

void ProviderAgent::clearAdapterMaps() {
    const bool complete = run_guarded([this] {
        for (const Clearing_Step& step : ADAPTER_STEPS)
            run_step(*this, step);
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "Error in clearAdapterMaps()");
    VLN_LOG(VLN_DBG, "Exiting clearAdapterMaps()");
}

void ProviderAgent::clearSANMaps() {
    for (const Clearing_Step& step : SAN_STEPS)
        if (!run_guarded([&] { run_step(*this, step); }))
            VLN_LOG(VLN_ERR, "Error in FCoE clearSANMaps()");
    VLN_LOG(VLN_DBG, "Exiting clearSANMaps()");
}

void ProviderAgent::ClearMaps() {
    {
        Auto_Mutex lock(m_AdapterMapsReadyMutex);
        clearAdapterMaps();
    }
    {
        Auto_Mutex lock(m_SANMapsReadyMutex);
        clearSANMaps();
    }
}

} // namespace cimple
