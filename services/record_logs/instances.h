// The logs that a console can read, in the picture of the host.
#ifndef VLN_SERVICES_RECORD_LOGS_INSTANCES_H
#define VLN_SERVICES_RECORD_LOGS_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// The provider's log and the management library's. MAP_OK or END_PASS.
uint32 create_record_logs(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_RECORD_LOGS_INSTANCES_H
