// The properties of what iSCSI sessions are made of: one function per class, from the library's
// record of a session.
#ifndef VLN_AGENT_SAN_ISCSI_INSTANCES_H
#define VLN_AGENT_SAN_ISCSI_INSTANCES_H

#include "agent/associations.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_ISCSISessionStatistics.h"
#include "classes/VLNMPCA_iSCSIConnection.h"
#include "classes/VLNMPCA_iSCSIProtocolEndpoint.h"
#include "classes/VLNMPCA_iSCSISession.h"
#include "device/library/axapi.h"

#include <optional>

namespace cimple {

enum class ISCSI_Role : uint16 { INITIATOR = 2, TARGET = 3 }; // CIM_iSCSIProtocolEndpoint.Role

// An endpoint of either role. identifier: an initiator's ISID, a target's portal group.
void describe_endpoint(CIM_iSCSIProtocolEndpoint& endpoint, const CIM_ComputerSystem& system,
                       const String& name, const String& identifier, ISCSI_Role role);

// The address as a text; none for an address of zeros.
std::optional<String> portal_text(const AX_IPAddress& portal);

Ref<VLNMPCA_iSCSISession> session_instance(const String& id, const String& target_name,
                                           const AX_iSCSI_SessionInfo& info);
Ref<VLNMPCA_ISCSISessionStatistics> statistics_instance(const String& id,
                                                        const AX_iSCSI_SessionInfo& info);
// A redirection whose address is missing is logged.
Ref<VLNMPCA_iSCSIConnection> connection_instance(const String& id,
                                                 const AX_iSCSI_SessionInfo& info);

} // namespace cimple

#endif // VLN_AGENT_SAN_ISCSI_INSTANCES_H
