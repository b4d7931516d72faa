// The service that installs firmware, in the picture of the host.
#ifndef VLN_SERVICES_FIRMWARE_INSTANCES_H
#define VLN_SERVICES_FIRMWARE_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// The service with its capabilities and what they hang on. MAP_OK or END_PASS.
uint32 StartSoftwareInstallationService(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_FIRMWARE_INSTANCES_H
