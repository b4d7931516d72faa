// The sessions that an iSCSI port has, or had, with one target: each with its endpoint, its
// statistics and its connection.
//
// Runs in the SAN pass, as iscsi_san_maps.h tells.
#ifndef VLN_AGENT_SAN_ISCSI_SESSION_MAPS_H
#define VLN_AGENT_SAN_ISCSI_SESSION_MAPS_H

#include "agent/san/iscsi_san_maps.h"

namespace cimple {

class ISCSI_Session_Maps {
public:
    ISCSI_Session_Maps(ProviderAgent& agent, const ISCSI_View& view, ISCSI_Target& target)
        : _agent(agent), _view(view), _target(target) {}

    // session_id: the library's number of the session on the port. What a store refuses costs the
    // rest of this session; what was inserted before stays.
    void createSession(uint32 session_id, const AX_iSCSI_SessionInfo& info);

private:
    void createClosedSession(uint32 session_id, const AX_iSCSI_SessionInfo& info);
    void createOpenSession(uint32 session_id, const AX_iSCSI_SessionInfo& info);
    void noteTarget(const AX_iSCSI_SessionInfo& info,
                    const VLNMPCA_iSCSIProtocolEndpoint* endpoint);

    const VLNMPCA_iSCSIProtocolEndpoint* findOrMakeEndpoint(const AX_iSCSI_SessionInfo& info);
    bool joinEndpoint(const VLNMPCA_iSCSIProtocolEndpoint& endpoint);
    bool createStatistics(uint32 session_id, const AX_iSCSI_SessionInfo& info);
    const VLNMPCA_iSCSIConnection* createConnection(uint32 session_id,
                                                    const AX_iSCSI_SessionInfo& info);
    void joinPipes(const VLNMPCA_iSCSIProtocolEndpoint& endpoint,
                   const VLNMPCA_iSCSISession& session, const VLNMPCA_iSCSIConnection& connection);

    ProviderAgent& _agent;
    const ISCSI_View& _view;
    ISCSI_Target& _target;
};

} // namespace cimple

#endif // VLN_AGENT_SAN_ISCSI_SESSION_MAPS_H
