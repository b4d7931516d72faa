// The order of the SAN pass.

#include "agent/san/san_maps.h"

#include "agent/san/fc_san_maps.h"
#include "agent/san/iscsi_san_maps.h"
#include "cimple/guard.h"
#include "classes/CIM_ComputerSystem.h"

namespace cimple {

namespace {

constexpr uint32 PASS_FAILED = 32769;

} // namespace

uint32 ProviderAgent::updateSANMaps() {
    return SAN_Map_Builder(*this).run();
}

uint32 SAN_Map_Builder::run() {
    VLN_LOG(VLN_DBG, "PERF: updateSANMaps: Entry");
    const bool complete = run_guarded([this] {
        _agent.clearSANMaps();
        createISCSIClasses();
        createFCClasses();
    });
    if (!complete) {
        VLN_LOG(VLN_ERR, "Error updating SAN maps");
        return PASS_FAILED;
    }
    VLN_LOG(VLN_DBG, "PERF: updateSANMaps: cleanExit");
    return 0;
}

void SAN_Map_Builder::createISCSIClasses() {
    for (const auto& adapter : _agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_ISCSI) {
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an iSCSI Adapter",
                    adapter->getAdapterName().c_str());
            continue;
        }
        for (const auto& port : adapter->getPorts()) {
            VLN_LOG(VLN_DBG, "Creating classes for adapter %d and port %d.",
                    static_cast<int>(adapter->getAdapterNumber()),
                    static_cast<int>(port->getPortIndex()));
            if (ISCSI_SAN_Maps(_agent).GetiSCSITargets(*port) != AX_STATUS_OK)
                VLN_LOG(VLN_ERR, "GetiSCSITargets failed");
            else
                VLN_LOG(VLN_DBG, "GetiSCSITargets succesful");
        }
    }
}

// What throws in here ends the FC part of the SAN, and nothing else.
void SAN_Map_Builder::createFCClasses() {
    VLN_LOG(VLN_DBG, "Entering update SAN maps for FCoE ifdef");
    const bool complete = run_guarded([this] {
        FC_SAN_Maps maps(_agent);
        for (const auto& adapter : _agent.m_pData->adapters) {
            if (adapter->getAdapterType() != ADAPTER_FCOE) {
                VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an FC Adapter",
                        adapter->getAdapterName().c_str());
                continue;
            }
            for (const auto& port : adapter->getPorts())
                maps.createTargets(*port);
        }
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "FCoE SAN refresh failed");
}

} // namespace cimple
