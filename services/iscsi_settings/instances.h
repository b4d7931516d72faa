// The iSCSI setting service and the settings of each iSCSI port, in the picture of the host.
#ifndef VLN_SERVICES_ISCSI_SETTINGS_INSTANCES_H
#define VLN_SERVICES_ISCSI_SETTINGS_INSTANCES_H

#include "agent/class_groups.h"
#include "classes/VLNMPCA_ISCSIInitiatorPropertiesData.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The service, what it acts on, and what each port is set to and has counted. MAP_OK, or
// SKIP_DEVICE on a host without the iSCSI driver. A port that the library does not tell something
// of is without that.
uint32 create_iscsi_settings(const Map_Scope& scope);
// Empties all that it fills.
void clear_iscsi_settings(ProviderAgent& agent);
// The same at the start of a pass, which on a host that has lost its iSCSI adapters makes none.
uint32 forget_iscsi_settings(const Map_Scope& scope);

// Reads the name servers of all ports anew. m_DataMutex is held, as for all below.
void rebuild_name_servers(ProviderAgent& agent);

// The key of a name server of the port with these 16 digits.
String name_server_id(const String& port, const AX_IPAddress& server);

// The iSCSI port that a client means: by the 16 digits of its name, or by its MAC address with "-",
// ":" or neither. False, with a line of the step that failed, for any other.
bool find_iscsi_port(const ProviderAgent& agent, const String& text, HBA_WWN& name);

// Writes what the library tells, but for the secrets: nobody reads those.
void fill_initiator_properties(VLNMPCA_ISCSIInitiatorPropertiesData& data,
                               const AX_iSCSI_InitiatorProperties& properties);

} // namespace cimple

#endif // VLN_SERVICES_ISCSI_SETTINGS_INSTANCES_H
