// The service that changes World Wide Names, in the picture of the host.
#ifndef VLN_SERVICES_WWN_INSTANCES_H
#define VLN_SERVICES_WWN_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// The service, which the FC ports are joined with afterwards. MAP_OK or SKIP_DEVICE.
uint32 start_wwn_service(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_WWN_INSTANCES_H
