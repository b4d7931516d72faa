// The SAN as FC ports see it: targets, their logical units and the paths to them.
//
// A port lists units (device/target.h); those with one port name are one target, which the first of
// them describes. Runs in the SAN pass, with its gates and m_DataMutex held.
#ifndef VLN_AGENT_SAN_FC_SAN_MAPS_H
#define VLN_AGENT_SAN_FC_SAN_MAPS_H

#include "agent/provider_agent.h"

#include <vector>

namespace cimple {

class Logical_Unit_Maps;
class Port;
class Target;
struct Unit_Path;

// A target of a port, with its units in the order in which the port lists them.
using SCSI_Target = std::vector<const Target*>;

// The targets of a port in the order of their first units.
std::vector<SCSI_Target> group_units(Port& port);

class FC_SAN_Maps {
public:
    explicit FC_SAN_Maps(ProviderAgent& agent);

    // All that the port sees. A target that another port sees as well is not made again; the paths
    // lead to what stands there.
    void createTargets(Port& port);

private:
    struct FC_Initiator;
    FC_Initiator findInitiator(Port& port) const;
    const VLNMPCA_SCSIProtocolEndpoint* createTarget(const FC_Initiator& initiator,
                                                     const Target& first_unit);
    void createUnit(Logical_Unit_Maps& units, const Unit_Path& path, const FC_Initiator& initiator,
                    const Target& unit);

    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system; // in its store
};

} // namespace cimple

#endif // VLN_AGENT_SAN_FC_SAN_MAPS_H
