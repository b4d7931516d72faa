// How each adapter is split into ports and functions, in the picture of the host.
#ifndef VLN_SERVICES_CHANNELS_PORT_CONFIG_H
#define VLN_SERVICES_CHANNELS_PORT_CONFIG_H

#include "agent/class_groups.h"
#include "classes/VLNMPCA_Chip.h"
#include "classes/VLNMPCA_PortConfigData.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The configurations of a chip: in force, after the next reboot, and what can be.
enum Config_Kind : uint8 { CONFIG_CURRENT, CONFIG_PENDING, CONFIG_AVAILABLE, CONFIG_KINDS };

// For each chip its configurations, its profiles and its personalities, as far as it has them.
// MAP_OK, or SKIP_DEVICE when one does not tell them; those of the others are there all the same.
uint32 create_adapter_configurations(const Map_Scope& scope);
// Empties all that it fills.
void clear_adapter_configurations(ProviderAgent& agent);

// The members of VLNMPCA_PortConfigData that stand once for each port, in the order of the ports.
extern Property<Array<String>> VLNMPCA_PortConfigData::*const CONFIG_PORT[AX_CONFIG_PORTS];

// Whether the identifier is that of a configuration in force.
bool is_current_configuration(const String& instance_id);
// Writes the configuration of a chip into its stored instance of that kind, if it has one.
void change_configuration(ProviderAgent& agent, const String& chip, Config_Kind kind,
                          const AX_AdapterPortConfig& config);

// The profiles and the personalities of a chip, which the library knows by that name. A failure is
// told in the log.
AX_STATUS create_profiles(ProviderAgent& agent, const VLNMPCA_Chip& chip, const HBA_WWN& name);
AX_STATUS create_personalities(ProviderAgent& agent, const VLNMPCA_Chip& chip, const HBA_WWN& name);

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_PORT_CONFIG_H
