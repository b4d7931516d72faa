// The channels of ports, and the service that sets them, in the picture of the host.
#ifndef VLN_SERVICES_CHANNELS_INSTANCES_H
#define VLN_SERVICES_CHANNELS_INSTANCES_H

#include "agent/class_groups.h"
#include "cimple/string.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The service, what it acts on, and the settings of each channel. MAP_OK, or SKIP_DEVICE when a
// port does not tell its channels; those of the other ports are there all the same.
uint32 create_channel_service(const Map_Scope& scope);
// Empties all that it fills.
void clear_channel_service(ProviderAgent& agent);

// Reads the channels of all ports anew. Answers the status of the adapter with that name, or of the
// first that fails for an empty one. m_DataMutex is held.
AX_STATUS rebuild_channel_settings(ProviderAgent& agent, const String& adapter);

String mac_of_channel(const AX_Channel& channel);

} // namespace cimple

#endif // VLN_SERVICES_CHANNELS_INSTANCES_H
