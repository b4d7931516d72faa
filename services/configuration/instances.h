// The tuning values of the provider, in the picture of the host.
#ifndef VLN_SERVICES_CONFIGURATION_INSTANCES_H
#define VLN_SERVICES_CONFIGURATION_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// Three settings, in the order in which the provider finds them. MAP_OK or END_PASS.
uint32 create_configuration_settings(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_CONFIGURATION_INSTANCES_H
