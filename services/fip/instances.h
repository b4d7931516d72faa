// The FIP service, what each FCoE port is set to look for, and the forwarders that it has found, in
// the picture of the host.
#ifndef VLN_SERVICES_FIP_INSTANCES_H
#define VLN_SERVICES_FIP_INSTANCES_H

#include "agent/class_groups.h"
#include "classes/VLNMPCA_FIPData.h"
#include "operations/method_wrapper.h"

namespace cimple {

// Everything of FIP on a host with FC ports. A port that cannot be read lacks its instances.
// MAP_OK, or SKIP_DEVICE when there is no service.
uint32 create_fip_classes(const Map_Scope& scope);
// Empties all that it fills.
void clear_fip_classes(ProviderAgent& agent);

// Writes what the library tells of a port.
void fill_fip_data(VLNMPCA_FIPData& data, const VLN_FIPParams& params);

} // namespace cimple

#endif // VLN_SERVICES_FIP_INSTANCES_H
