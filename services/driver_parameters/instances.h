// The parameters of the FCoE driver: four settings of each, its value now and by default, its
// maximum and its minimum, and the service that sets them.
//
// Everything here runs with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H
#define VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H

#include "agent/class_groups.h"

namespace cimple {

// The service, before the first FC port.
uint32 create_driver_parameter_service(const Map_Scope& scope);
// The parameters as a complete FC port tells them: those of an adapter at its first port, and with
// the first of these those of the driver, which has them once for all adapters.
uint32 create_driver_parameters(const Map_Scope& scope);
// Joins every setting with the service that sets it and, one of a port, with its port.
uint32 join_driver_parameters(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H
