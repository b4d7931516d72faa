// The iSCSI SAN as one iSCSI port sees it: targets, sessions, connections and logical units.
//
// The library's tables become instances directly; the device model has no objects for them. Runs
// in the SAN pass, with the gates of adapter data, adapter maps and SAN maps and m_DataMutex held.
#ifndef VLN_AGENT_SAN_ISCSI_SAN_MAPS_H
#define VLN_AGENT_SAN_ISCSI_SAN_MAPS_H

#include "agent/provider_agent.h"

#include <string>
#include <vector>

namespace cimple {

class Port;

// The port that looks, with the instances that what it sees is tied to. Those of the adapter pass
// are null where that made none.
struct ISCSI_View {
    Port& port;
    String port_name; // 16 digits
    HBA_WWN wwn;
    const CIM_ComputerSystem* system;
    const VLNMPCA_EthernetPort* ethernet_port;
    const VLNMPCA_TCPProtocolEndpoint* tcp_endpoint;
    const VLNMPCA_SCSIProtocolController* controller;
};

struct ISCSI_Target {
    std::size_t index;    // in the library's table
    std::string raw_name; // as the library wants it back
    String name;          // the same as a text
    String portal_group;  // of its sessions, empty without one
    std::vector<const VLNMPCA_iSCSIProtocolEndpoint*> initiators; // of its usable sessions
};

class ISCSI_SAN_Maps {
public:
    explicit ISCSI_SAN_Maps(ProviderAgent& agent) : _agent(agent) {}

    // 0; a status of the library; 8 when out of memory; 1 when a target was refused. What was
    // inserted before stays.
    uint32 GetiSCSITargets(Port& port);

private:
    uint32 walkTargets(const ISCSI_View& view);
    uint32 createSessions(const ISCSI_View& view, ISCSI_Target& target);
    void findEnds(ISCSI_View& view) const;

    // iscsi_unit_maps.cpp
    uint32 createTarget(const ISCSI_View& view, const ISCSI_Target& target);
    void createUnits(const ISCSI_View& view, const ISCSI_Target& target,
                     const AX_iSCSI_LunList& luns,
                     const VLNMPCA_iSCSITargetProtocolEndpoint* target_endpoint);

    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_SAN_ISCSI_SAN_MAPS_H
