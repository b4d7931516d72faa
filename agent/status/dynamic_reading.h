// What the update routines and the status thread read of a port, without exceptions: a failed
// reading costs its port or its row, and is told in the log.
//
// m_DataMutex is held. `what` begins the line of a failure, which goes on " call failed" and has
// level 3.
#ifndef VLN_AGENT_STATUS_DYNAMIC_READING_H
#define VLN_AGENT_STATUS_DYNAMIC_READING_H

#include "device/library/attribute_buffer.h"

namespace cimple {

// Identifiers in the library's attributes.
enum Dynamic_Attribute : uint16 {
    BOARD_TEMPERATURE = 551,
    PORT_TYPE = 773,
    FUNCTIONAL_PORT_STATE = 774,
    PORT_SPEED = 779,
    PHYSICAL_PORT_STATE = 802,
    FUNCTIONAL_PORT_SPEED = 815,
    PHYSICAL_PORT_SPEED = 842,
    PHY_LINK_DOWN_REASON = 855,
};

// A name of 16 digits as the library takes it; a line at level 5 if it is none.
bool wwn_of_name(const char* name, AX_WWN& wwn);

bool fetch_port_attributes(AX_WWN wwn, Attribute_Buffer& buffer, const char* what);

// The first bytes of an attribute; the value stays as it was on failure.
bool read_bytes(Attribute_Buffer& buffer, uint16 identifier, const char* what, void* value,
                std::size_t count);

template <class Number>
bool read_number(Attribute_Buffer& buffer, uint16 identifier, const char* what, Number& value) {
    return read_bytes(buffer, identifier, what, &value, sizeof value);
}

} // namespace cimple

#endif // VLN_AGENT_STATUS_DYNAMIC_READING_H
