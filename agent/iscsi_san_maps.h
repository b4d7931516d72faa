// The iSCSI SAN as one iSCSI port sees it: targets, sessions, connections and logical units.
//
// The library's tables become instances directly; the device model has no objects for them. Runs
// in the SAN pass, with the gates of adapter data, adapter maps and SAN maps and m_DataMutex held.
#ifndef VLN_AGENT_ISCSI_SAN_MAPS_H
#define VLN_AGENT_ISCSI_SAN_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

class Port;

class ISCSI_SAN_Maps {
public:
    explicit ISCSI_SAN_Maps(ProviderAgent& agent) : _agent(agent) {}

    // 0; a status of the library; 8 when out of memory; 1 when an insertion failed. What was
    // inserted before stays.
    uint32 GetiSCSITargets(Port& port);

private:
    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_ISCSI_SAN_MAPS_H
