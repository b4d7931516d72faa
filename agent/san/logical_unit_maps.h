// The logical units of the SAN as CIM shows them, whichever kind of port sees them.
//
// The peripheral device type of a unit (SPC-3, 6.4.2) decides its class, and with that the store
// it goes to, the association with the computer system and the one with the path to it. Runs in the
// SAN pass, with the SAN maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_SAN_LOGICAL_UNIT_MAPS_H
#define VLN_AGENT_SAN_LOGICAL_UNIT_MAPS_H

#include "agent/provider_agent.h"

#include <optional>

namespace cimple {

// What a port's discovery knows of a unit. Texts are valid UTF-8 already.
struct Logical_Unit {
    uint32 peripheral_type;
    uint64 number;
    String device_id; // the key
    String name;
    String description;
    String os_device_name; // empty for none
    String inquiry;        // what the unit told of itself, as one text
    uint64 capacity = 0;   // bytes
    uint64 block_size = 0; // bytes; 0 for a unit without blocks, or that does not tell of them
    uint64 number_of_blocks = 0;
    // The type of the first descriptor of its device identification page (SPC-3, 7.6.3.1).
    std::optional<uint32> identifier_type = {};
};

// Name of a unit after its type: "Tape Drive 5".
String logical_unit_name(uint32 peripheral_type, uint64 number);

enum class Unit_Transport : uint8 { FC, ISCSI };

// The way from an initiator to a target, which the paths to all units of the target share.
struct Unit_Path {
    Unit_Transport transport;
    const Instance* initiator; // in its store; null for a missing one
    const Instance* target;
    String ends; // "initiator:target", for the log
};

// One serves any number of units.
class Logical_Unit_Maps {
public:
    // The system stands in its store: no unit can be named without it.
    Logical_Unit_Maps(ProviderAgent& agent, const CIM_ComputerSystem* system);

    // Puts the unit into the store of its class and ties it to the computer system. A unit that two
    // ports see under one key stands once.
    const Instance* findOrMake(const Logical_Unit& unit);

    // The path to a unit that findOrMake answered. False, with a line in the log, if an end is
    // missing or the path stands already.
    bool joinPath(const Unit_Path& path, const Logical_Unit& unit, const Instance* device);

private:
    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
};

} // namespace cimple

#endif // VLN_AGENT_SAN_LOGICAL_UNIT_MAPS_H
