// The order of the adapter pass.

#include "agent/adapter_map_builder.h"
#include "agent/vpd_maps.h"

namespace cimple {

uint32 ProviderAgent::updateAdapterMaps() {
    return Adapter_Map_Builder(*this).run();
}

uint32 Adapter_Map_Builder::run() {
    VLN_LOG(VLN_DBG, " updateAdapterMaps: Entry");
    _agent.clearAdapterMaps();
    if (createComputerSystem() != MAP_OK) {
        VLN_LOG(VLN_CRIT, "Could not create the Computer System Instance");
        return END_PASS;
    }
    findChassis();
    if (const uint32 status = createConfigurationSettings())
        return status;
    if (const uint32 status = createChassis())
        return status;
    if (_agent.m_pData->hasNICAdapter)
        createNICCards();
    else
        VLN_LOG(VLN_DBG, "No NIC card found");
    updateSoftwareIdentities();
    VLN_LOG(VLN_DBG, "PERF: updateAdapterMaps: cleanExit");
    return MAP_OK;
}

// A closing step: what fails here leaves the identities as they are.
void Adapter_Map_Builder::updateSoftwareIdentities() {
    try {
        VLN_LOG(VLN_DBG, "Updating FRU information to Softwareidentity Class");
        if (VPD_Maps(_agent).UpdateFRUToSoftwareInstance() != 0)
            VLN_LOG(VLN_DBG, "Failed to update FRU VPD data to cim_softwareidentity instances");
    } catch (...) {
        VLN_LOG(VLN_DBG, "UpdateFRUToSoftwareInstance failed");
    }
}

} // namespace cimple
