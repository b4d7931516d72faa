// The NIC setting service, and the settings of each port of a NIC: network boot and bandwidth.
#ifndef VLN_SERVICES_NIC_SETTINGS_INSTANCES_H
#define VLN_SERVICES_NIC_SETTINGS_INSTANCES_H

#include "agent/class_groups.h"
#include "operations/method_wrapper.h"

namespace cimple {

struct CIM_SettingData;

uint32 create_nic_settings(const Map_Scope& scope);
void clear_nic_settings(ProviderAgent& agent);

// BootMethod for an adapter that boots so.
const char* boot_method_text(VLN_MethodWrapper::Boot_Method method);

// The name by which the library knows the port of a setting, which its identifier ends with. False,
// with a line, for an identifier without one.
bool port_of_setting(const CIM_SettingData& setting, HBA_WWN& name);

} // namespace cimple

#endif // VLN_SERVICES_NIC_SETTINGS_INSTANCES_H
