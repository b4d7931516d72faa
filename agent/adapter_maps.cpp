// The order of the adapter pass.

#include "agent/adapter_map_builder.h"

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
    VLN_LOG(VLN_DBG, "PERF: updateAdapterMaps: cleanExit");
    return MAP_OK;
}

} // namespace cimple
