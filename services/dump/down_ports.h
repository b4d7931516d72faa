// The ports whose firmware has failed, in the picture of the host.
#ifndef VLN_SERVICES_DUMP_DOWN_PORTS_H
#define VLN_SERVICES_DUMP_DOWN_PORTS_H

#include "agent/class_groups.h"

namespace cimple {

// MAP_OK, or SKIP_DEVICE when the library does not tell them. It is asked on a host with Ethernet
// ports, and on any host until it has failed once.
uint32 retrieve_down_ports(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_DUMP_DOWN_PORTS_H
