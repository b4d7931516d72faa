// The iSCSI stretch of the adapter pass: the ports of iSCSI functions and the endpoints on them.
//
// Runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_ISCSI_MAPS_H
#define VLN_AGENT_ISCSI_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

class ISCSI_Map_Builder {
public:
    ISCSI_Map_Builder(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // 0, or a status that ends the pass.
    uint32 CreateISCSIClasses();

private:
    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
};

} // namespace cimple

#endif // VLN_AGENT_ISCSI_MAPS_H
