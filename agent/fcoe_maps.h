// The FCoE stretch of the adapter pass: FC ports, their services, endpoints and parameters.
//
// Runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_FCOE_MAPS_H
#define VLN_AGENT_FCOE_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

class FCoE_Map_Builder {
public:
    FCoE_Map_Builder(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // What throws in here ends the FCoE stretch alone, with a line in the log.
    void run();

private:
    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
};

} // namespace cimple

#endif // VLN_AGENT_FCOE_MAPS_H
