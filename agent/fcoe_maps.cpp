#include "agent/fcoe_maps.h"

namespace cimple {

void FCoE_Map_Builder::run() {
    if (!_agent.m_pData->hasFCoEAdapter)
        VLN_LOG(VLN_DBG, "No FCoE Card found");
}

} // namespace cimple
