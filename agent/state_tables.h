// What a port's numbers mean in CIM: states, enabled states and speeds, as tables.
#ifndef VLN_AGENT_STATE_TABLES_H
#define VLN_AGENT_STATE_TABLES_H

#include "cimple/instance.h"

namespace cimple {

struct Port_State {
    uint32 state; // as the library reports it
    uint16 operational_status;
    const char* description;
};

inline constexpr Port_State UNKNOWN_PORT_STATE = {0, 0, "Unknown"};

// Functional state of a port. 8 says the same as 5 in a number of the vendor's range; that is
// meant.
inline constexpr Port_State portStateMap[] = {
    {2, 2, "OK"},
    {3, 10, "Stopped"},
    {4, 1, "Other"},
    {5, 11, "InService"},
    {6, 3, "Link Down"},
    {7, 6, "Error"},
    {8, 32776, "InService"},
    {20, 32788, "Operational. Need RESET"},
    {21, 32789, "Link down. Need RESET"},
    {22, 32790, "Disable"},
};

// Functional state of the port as its controller shows it.
inline constexpr Port_State portControllerStateMap[] = {
    {2, 2, "OK"},         {3, 10, "Stopped"},   {4, 1, "Other"}, {6, 1, "Other"},
    {5, 11, "InService"}, {8, 11, "InService"}, {7, 6, "Error"},
};

struct Enabled_State {
    uint32 state;
    uint16 enabled_state;
};

inline constexpr uint16 OTHER_ENABLED_STATE = 1;
inline constexpr uint16 REQUESTED_STATE_NOT_APPLICABLE = 12; // nobody asks for another state
inline constexpr uint32 PHYSICAL_STATE_UP = 2;               // any other is a port without a speed

inline constexpr Enabled_State enabledStateMap[] = {
    {2, 2}, {5, 7}, {1, 0}, {3, 3}, {6, 3}, {21, 3}, {22, 3},
};

// Kind of a Fibre Channel port: the library's number, CIM_FCPort.PortType and its name.
struct Port_Type {
    uint32 type;
    uint16 port_type;
    const char* name;
};

inline constexpr Port_Type UNKNOWN_PORT_TYPE = {0, 0, "Unknown"};

// CIM has no numbers for the last two: they are "other" as well.
inline constexpr Port_Type portTypeMap[] = {
    {2, 1, "Other"},
    {5, 10, "N"},
    {6, 11, "NL"},
    {7, 16, "FL"},
    {8, 15, "F"},
    {9, 14, "E"},
    {10, 18, "G"},
    {20, 1, "Private Loop"},
    {21, 1, "Point to Point"},
};

struct Speed_Code {
    uint32 code; // a bit of the library's speed masks
    uint64 bits_per_second;
};

// In the order in which the highest supported speed is sought: 10 Gbit/s first, and 8 Gbit/s before
// 4 Gbit/s.
inline constexpr Speed_Code speedCodes[] = {
    {4, 10000000000}, {16, 8000000000}, {8, 4000000000}, {2, 2000000000}, {1, 1000000000},
};

template <uint32 N>
constexpr const Port_State& find_port_state(const Port_State (&map)[N], uint32 state) {
    for (const Port_State& row : map)
        if (row.state == state)
            return row;
    return UNKNOWN_PORT_STATE;
}

// State of an FCoE port between refreshes: a link that is down counts among the other states there.
inline constexpr Port_State FCOE_LINK_DOWN = {6, 1, "Other"};
constexpr const Port_State& find_fcoe_port_state(uint32 state) {
    return state == FCOE_LINK_DOWN.state ? FCOE_LINK_DOWN : find_port_state(portStateMap, state);
}

constexpr const Port_Type& find_port_type(uint32 type) {
    for (const Port_Type& row : portTypeMap)
        if (row.type == type)
            return row;
    return UNKNOWN_PORT_TYPE;
}

constexpr uint16 enabled_state(uint32 state) {
    for (const Enabled_State& row : enabledStateMap)
        if (row.state == state)
            return row.enabled_state;
    return OTHER_ENABLED_STATE;
}

inline constexpr uint16 ACCESS_STATE_ACTIVE = 1; // CIM_ControlledBy.AccessState
inline constexpr uint16 ACCESS_STATE_INACTIVE = 2;

// 1 and 2 of the functional states are as good as in use.
constexpr uint16 access_state(uint32 functional_state) {
    return functional_state == 1 || functional_state == 2 ? ACCESS_STATE_ACTIVE
                                                          : ACCESS_STATE_INACTIVE;
}

// Bits per second of one speed code, 0 for a code outside the table.
constexpr uint64 speed_of_code(uint32 code) {
    for (const Speed_Code& row : speedCodes)
        if (row.code == code)
            return row.bits_per_second;
    return 0;
}

// Bits per second of the first speed of the table that the mask supports, else 0.
constexpr uint64 max_speed_of_mask(uint32 mask) {
    for (const Speed_Code& row : speedCodes)
        if (mask & row.code)
            return row.bits_per_second;
    return 0;
}

// Appends the state's number and text to the two status properties that every device has.
template <class Device>
void append_port_state(Device* device, const Port_State& state) {
    device->OperationalStatus.append(state.operational_status);
    device->StatusDescriptions.append(String(state.description));
}

// The same in place of what the properties hold.
template <class Device>
void replace_port_state(Device* device, const Port_State& state) {
    device->OperationalStatus.clear();
    device->StatusDescriptions.clear();
    append_port_state(device, state);
}

} // namespace cimple

#endif // VLN_AGENT_STATE_TABLES_H
