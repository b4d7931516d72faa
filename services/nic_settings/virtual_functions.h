// The virtual functions of single root I/O virtualization: of each the PCI function, and the
// Ethernet port that a guest has of it.
#ifndef VLN_SERVICES_NIC_SETTINGS_VIRTUAL_FUNCTIONS_H
#define VLN_SERVICES_NIC_SETTINGS_VIRTUAL_FUNCTIONS_H

#include "agent/class_groups.h"

namespace cimple {

// For each Ethernet port with SRIOVState on.
uint32 create_virtual_functions(const Map_Scope& scope);
// The stores that nothing else fills.
void clear_virtual_functions(ProviderAgent& agent);

} // namespace cimple

#endif // VLN_SERVICES_NIC_SETTINGS_VIRTUAL_FUNCTIONS_H
