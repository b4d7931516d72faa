// The SAN pass: turns what the ports see into targets, logical units and the paths to them.
//
// One builder lives for one pass, on the refresh thread, with the gates of adapter data, adapter
// maps and SAN maps and m_DataMutex held.
#ifndef VLN_AGENT_SAN_SAN_MAPS_H
#define VLN_AGENT_SAN_SAN_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

class SAN_Map_Builder {
public:
    explicit SAN_Map_Builder(ProviderAgent& agent) : _agent(agent) {}

    // 0, or 32769 after an exception outside the FC part. What was made before it stays.
    uint32 run();

private:
    void createISCSIClasses();
    void createFCClasses();

    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_SAN_SAN_MAPS_H
