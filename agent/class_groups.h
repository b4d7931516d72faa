// The groups of classes that the services bring to the picture of the host.
//
// The adapter pass knows no service. It comes by certain places, and at each it makes the groups
// that the table below has for that place; services/class_groups.cpp fills the table. Everything
// here runs on the refresh thread, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_CLASS_GROUPS_H
#define VLN_AGENT_CLASS_GROUPS_H

#include "agent/map_status.h"

#include <span>

namespace cimple {

class Port;
class ProviderAgent;
struct CIM_ComputerSystem;
struct Instance;

// The places of the adapter pass, in its order. Those of the NIC and iSCSI stretches are reached
// only where there is such an adapter, those of the FCoE stretch likewise.
enum class Group_Place : uint8 {
    PLATFORM,    // after the computer system and the base profiles, before the chassis
    NIC_CARDS,   // before the first NIC card
    NIC_PORTS,   // after the NIC cards and their ports
    NIC,         // after all else of the NIC stretch
    LOGS,        // after the NIC stretch, also on a host without one
    FCOE,        // before the first FC port
    FC_PORT,     // once for each FC port that is complete
    FC_PORTS,    // after the last one
    ISCSI,       // before the first iSCSI port
    ISCSI_PORT,  // once for each iSCSI port
    ISCSI_PORTS, // after the last one
    ALL_PORTS,   // after the last port of any kind
    CLOSING,     // at the end
};

// What a group is made from.
struct Map_Scope {
    ProviderAgent& agent;
    const CIM_ComputerSystem* system;  // in its store
    Port* port = nullptr;              // FC_PORT, ISCSI_PORT: of the device model
    const Instance* element = nullptr; // FC_PORT, ISCSI_PORT: the port's instance, in its store
    bool first_adapter = false;        // FC_PORT: no adapter's first port came by before
};

// A line of the log, or none.
struct Group_Line {
    int level = 0;
    const char* text = nullptr;
};

struct Class_Group {
    Group_Place place;
    // Answers a Map_Status. END_PASS ends the pass, all others let it go on. One that leaves its
    // work since scan_is_to_end asks for another adapter refresh: nobody is shown what it has made.
    uint32 (*create)(const Map_Scope& scope);
    // Empties what create fills: before it, and when it throws. Null where the pass has emptied it.
    void (*clear)(ProviderAgent& agent) = nullptr;
    Group_Line before = {}; // ahead of create
    Group_Line done = {};   // it answered MAP_OK
    Group_Line failed = {}; // it answered anything else
    Group_Line thrown = {}; // without this one an exception passes on to the stretch of the place
};

// Filled by the services; the groups of one place stand in the order in which they are made.
extern const std::span<const Class_Group> class_groups;

// Makes the groups of a place. MAP_OK, or END_PASS.
uint32 make_class_groups(Group_Place place, const Map_Scope& scope);

} // namespace cimple

#endif // VLN_AGENT_CLASS_GROUPS_H
