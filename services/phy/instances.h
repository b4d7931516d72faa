// The PHYs of copper ports and their settings, one of each for a port controller that has one.
#ifndef VLN_SERVICES_PHY_INSTANCES_H
#define VLN_SERVICES_PHY_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// SKIP_DEVICE unless the last port controller has a PHY and each instance found its place.
uint32 create_phys(const Map_Scope& scope);
void clear_phys(ProviderAgent& agent);

} // namespace cimple

#endif // VLN_SERVICES_PHY_INSTANCES_H
