// The ARP and route tables of an iSCSI port, in the picture of the host.
#ifndef VLN_SERVICES_IP_TABLES_INSTANCES_H
#define VLN_SERVICES_IP_TABLES_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// Both tables of a port with their entries, those as far as the library tells them. MAP_OK always:
// a table that cannot be read leaves the other one and the port alone.
uint32 create_ip_tables(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_IP_TABLES_INSTANCES_H
