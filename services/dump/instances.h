// The dump service and its settings, in the picture of the host.
#ifndef VLN_SERVICES_DUMP_INSTANCES_H
#define VLN_SERVICES_DUMP_INSTANCES_H

#include "agent/class_groups.h"
#include "cimple/instance_map.h"
#include "classes/VLNMPCA_ExtFATDumpAdvancedData.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The service, what it acts on, and the settings of each chip. MAP_OK, or SKIP_DEVICE when there is
// nothing to dump.
uint32 create_dump_service(const Map_Scope& scope);
// Empties all that it fills.
void clear_dump_service(ProviderAgent& agent);

// Reads the settings of all chips anew; a chip that cannot be read has none. Answers the status of
// the chip with that tag, 0 for a tag that no chip has. m_DataMutex is held.
AX_STATUS rebuild_dump_settings(ProviderAgent& agent, const String& chip);

// A port through which the library knows the chip: one whose link works, if there is one. Its
// device identifier; empty for a chip without a port.
String port_of_chip(const ProviderAgent& agent, const String& chip);
// The tag of the chip behind a port that the agent shows; empty for any other.
String chip_of_port(const ProviderAgent& agent, const String& device_id);

// The tag of the chip that the setting in its store belongs to; empty for one that belongs to none.
String chip_of_setting(const Instance_Map_Base& links, const CIM_SettingData& setting);
// The firmware module that a setting of the chip is about.
String module_of(const VLNMPCA_ExtFATDumpAdvancedData& data, const String& chip);

// Writes what the library tells of a module.
void fill_advanced_data(VLNMPCA_ExtFATDumpAdvancedData& data, const AX_EventLogModule& module);

} // namespace cimple

#endif // VLN_SERVICES_DUMP_INSTANCES_H
