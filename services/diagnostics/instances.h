// The diagnostics model in the picture of the host: each test with its settings, its help and its
// log, and the ports that it serves.
#ifndef VLN_SERVICES_DIAGNOSTICS_INSTANCES_H
#define VLN_SERVICES_DIAGNOSTICS_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// A host without a NIC adapter has no tests. MAP_OK in any case.
uint32 createDiagnosticClasses(const Map_Scope& scope);
// Empties all that it fills, and with the tests go the jobs and records of their runs.
void clear_diagnostic_classes(ProviderAgent& agent);

} // namespace cimple

#endif // VLN_SERVICES_DIAGNOSTICS_INSTANCES_H
