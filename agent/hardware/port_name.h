// Names by which ports, their connectors and ASICs are known.
#ifndef VLN_AGENT_HARDWARE_PORT_NAME_H
#define VLN_AGENT_HARDWARE_PORT_NAME_H

#include "cimple/string.h"
#include "device/adapter_attributes.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The port's name in binary. False, with the line of the step that failed, when it is no name.
bool port_name_to_wwn(const String& port_name, HBA_WWN& wwn);

// The ASIC of a function: the card's serial number, and the number of the sub-adapter behind a
// colon if it has one.
String asic_name(const AdapterAttributes& adapter);

// The physical port of a function, which functions of all kinds on it share: "serial:port number".
String physical_port_name(const AdapterAttributes& adapter);

inline constexpr uint16 ISCSI_TCP_PORT = 3260; // RFC 7143

// The TCP endpoint of an iSCSI port.
String tcp_endpoint_name(const String& port_name);

// The key of an FC port's statistics.
String fc_statistics_name(const String& port_name);

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_PORT_NAME_H
