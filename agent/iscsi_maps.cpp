#include "agent/iscsi_maps.h"

namespace cimple {

uint32 ISCSI_Map_Builder::CreateISCSIClasses() {
    if (!_agent.m_pData->hasISCSIAdapter)
        VLN_LOG(VLN_DBG, "No iSCSI Card found");
    return 0;
}

} // namespace cimple
