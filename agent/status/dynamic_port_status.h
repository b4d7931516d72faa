// The table that the status thread and the status updates share: what each logical port last
// reported.
#ifndef VLN_AGENT_STATUS_DYNAMIC_PORT_STATUS_H
#define VLN_AGENT_STATUS_DYNAMIC_PORT_STATUS_H

#include "cimple/types.h"

#include <vector>

namespace cimple {

struct Dynamic_Port_Row {
    static constexpr std::size_t NAME_LENGTH = 20; // at most

    uint32 functional_state;
    uint32 physical_state;
    uint32 scan_number; // of the device model that stood when the states were read; 0: not yet read
    char name[24];      // of the port, with its end mark
};

struct Dynamic_Port_Status {
    std::vector<Dynamic_Port_Row> rows;
};

// Both states of the row's port as the library has them now, in one call or, from a library that
// does not know that one, in two. Throws std::exception, and leaves the row, unless both can be
// read.
void read_states(Dynamic_Port_Row& row);

} // namespace cimple

#endif // VLN_AGENT_STATUS_DYNAMIC_PORT_STATUS_H
