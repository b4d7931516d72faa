// The parameters of the FCoE driver: four settings of each, its value now and by default, its
// maximum and its minimum, and the service that sets them.
//
// Everything here runs with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H
#define VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H

#include "agent/associations.h"
#include "agent/class_groups.h"
#include "classes/CIM_ElementSettingData.h"

namespace cimple {

struct VLNMPCA_DriverParameterService;

// The identifiers of current settings begin with it, and no others do.
inline constexpr char CURRENT_SETTING_HEAD[] = "VLN:FCoE C";
// ConfigurationName of a parameter that each port has for itself.
inline constexpr char LOCAL_CONFIGURATION[] = "local";

// The service, before the first FC port.
uint32 create_driver_parameter_service(const Map_Scope& scope);
// The parameters as a complete FC port tells them: those of an adapter at its first port, and with
// the first of these those of the driver, which has them once for all adapters.
uint32 create_driver_parameters(const Map_Scope& scope);
// Joins every setting with the service that sets it and, one of a port, with its port.
uint32 join_driver_parameters(const Map_Scope& scope);

// In its store, or null on a host without one.
const VLNMPCA_DriverParameterService* parameter_service(const ProviderAgent& agent);

// What an association with a setting tells: the one flag that holds, and that all others do not;
// null for none that holds.
using Setting_Flag = Property<uint16> CIM_ElementSettingData::*;
Association_Details setting_flags(Setting_Flag one);

} // namespace cimple

#endif // VLN_SERVICES_DRIVER_PARAMETERS_INSTANCES_H
