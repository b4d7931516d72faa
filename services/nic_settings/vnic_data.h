// Which channel of its link an Ethernet port is.
#ifndef VLN_SERVICES_NIC_SETTINGS_VNIC_DATA_H
#define VLN_SERVICES_NIC_SETTINGS_VNIC_DATA_H

#include "agent/class_groups.h"

namespace cimple {

// Adds the numbers of the physical port and of the channel to each port's identities. Reads the
// settings of the channels, and so comes behind what makes these.
uint32 update_vnic_data(const Map_Scope& scope);

} // namespace cimple

#endif // VLN_SERVICES_NIC_SETTINGS_VNIC_DATA_H
