// What one virtual port sees: its targets, their logical units, and the paths to these.
//
// Runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_SERVICES_VIRTUAL_PORTS_UNIT_MAPS_H
#define VLN_SERVICES_VIRTUAL_PORTS_UNIT_MAPS_H

#include "agent/provider_agent.h"
#include "classes/VLNMPCA_VirtualFCPort.h"

#include <optional>

namespace cimple {

struct VLNMPCA_SCSIProtocolInitiatorEndpoint;
struct VLNMPCA_VirtualSCSIProtocolTargetEndpoint;

// A virtual port on its way into the stores. Names have 16 digits.
struct Virtual_Port {
    String carrier; // the FC port's name
    String id;
    HBA_WWN carrier_name{};
    HBA_WWN name{};
    const VLNMPCA_VirtualFCPort* shown = nullptr; // in its store
};

class Virtual_Unit_Maps {
public:
    Virtual_Unit_Maps(ProviderAgent& agent, const CIM_ComputerSystem& system)
        : _agent(agent), _system(system) {}

    // The port's own endpoint, and all that it sees; what cannot be read is left out.
    void CreateVPortTargets(const Virtual_Port& port);

private:
    using Initiator = VLNMPCA_SCSIProtocolInitiatorEndpoint;
    struct Seen_Target;

    const Initiator* createInitiator(const Virtual_Port& port);
    void createTarget(const Virtual_Port& port, const Initiator& initiator,
                      const std::vector<const AX_VPortTarget*>& units);
    void createUnit(const Seen_Target& target, const AX_VPortTarget& unit);

    ProviderAgent& _agent;
    const CIM_ComputerSystem& _system;
};

} // namespace cimple

#endif // VLN_SERVICES_VIRTUAL_PORTS_UNIT_MAPS_H
