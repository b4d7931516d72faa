// The virtual ports that FC ports carry, in the picture of the host: the pool that they are taken
// from, what each of them sees, and the paths there.
#ifndef VLN_SERVICES_VIRTUAL_PORTS_INSTANCES_H
#define VLN_SERVICES_VIRTUAL_PORTS_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// CreationClassName of virtual ports; consoles know them by it.
inline constexpr char VIRTUAL_PORT_CLASS[] = "VLN_VirtualFCPort";

// Those of all FC ports, which stand in their store. A virtual port, a target or a unit that cannot
// be read is left out. Anything but MAP_OK when a pool could not be made. When the refresh is to
// end early, so does this: then another one is asked for.
uint32 create_virtual_ports(const Map_Scope& scope);
void ClearPortVirtualizationMaps(ProviderAgent& agent);

} // namespace cimple

#endif // VLN_SERVICES_VIRTUAL_PORTS_INSTANCES_H
