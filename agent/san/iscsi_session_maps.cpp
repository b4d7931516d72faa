#include "agent/san/iscsi_session_maps.h"

#include "agent/associations.h"
#include "agent/san/iscsi_instances.h"
#include "agent/text.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_SCSIProtocolController.h"
#include "classes/VLNMPCA_TCPProtocolEndpoint.h"
#include "device/adapter.h"

#include <algorithm>

namespace cimple {

namespace {

unsigned long long isid_of(const AX_iSCSI_SessionInfo& info) {
    return info.isid;
}

// Whether commands go, or will go again, over the session.
bool is_usable(const AX_iSCSI_SessionInfo& info) {
    return info.state == AX_ISCSI_SESSION_OPEN || info.state == AX_ISCSI_SESSION_RECOVERY;
}

// An end of the adapter pass that is missing was told of there, and costs no more than the
// association.
bool join(Instance_Map_Base& store, const Instance* first, const Instance* second) {
    return !first || !second || associate(store, first, second);
}

} // namespace

void ISCSI_Session_Maps::createSession(uint32 session_id, const AX_iSCSI_SessionInfo& info) {
    if (info.closed)
        createClosedSession(session_id, info);
    else
        createOpenSession(session_id, info);
}

// Nothing is left of it but itself: no connection tells where it led, so the session does.
void ISCSI_Session_Maps::createClosedSession(uint32 session_id, const AX_iSCSI_SessionInfo& info) {
    const auto portal = portal_text(info.targetAddress);
    if (!portal)
        VLN_LOG(VLN_ERR, "Error retrieving information for iSNS Server");
    const String id =
        format_text("VLN:iSCSI Closed Session:%d:%d:%s:%s:%d",
                    static_cast<int>(_view.port.getAdapter()->getAdapterNumber()),
                    static_cast<int>(_view.port.getPortIndex()), _view.port_name.c_str(),
                    _target.name.c_str(), static_cast<int>(session_id));
    auto session = session_instance(id, _target.name, info);
    session->Description.set(format_text("Target portal %s", portal.value_or(NO_TEXT).c_str()));
    if (insert_instance(_agent.m_VLNMPCA_iSCSISession_map, session))
        VLN_LOG(VLN_DBG, "VLNMPCA_iSCSISession::create() SUCCESFUL");
}

void ISCSI_Session_Maps::createOpenSession(uint32 session_id, const AX_iSCSI_SessionInfo& info) {
    if (_view.ethernet_port)
        VLN_LOG(VLN_DBG, "Got VLNMPCA_EthernetPort in the map ");
    const auto* endpoint = findOrMakeEndpoint(info);
    if (!endpoint)
        return;
    noteTarget(info, endpoint);
    const String id = format_text("VLN:iSCSI Session:%s:%s:%d", _view.port_name.c_str(),
                                  _target.name.c_str(), static_cast<int>(session_id));
    const auto* session = insert_instance(_agent.m_VLNMPCA_iSCSISession_map,
                                          session_instance(id, _target.name, info));
    if (!session || !createStatistics(session_id, info))
        return;
    if (const auto* connection = createConnection(session_id, info))
        joinPipes(*endpoint, *session, *connection);
}

// What the second walk needs of the sessions. Sessions of one ISID share their endpoint.
void ISCSI_Session_Maps::noteTarget(const AX_iSCSI_SessionInfo& info,
                                    const VLNMPCA_iSCSIProtocolEndpoint* endpoint) {
    if (_target.portal_group.empty())
        _target.portal_group = format_text("0x%x", info.targetPortalGroup);
    auto& initiators = _target.initiators;
    if (is_usable(info) &&
        std::find(initiators.begin(), initiators.end(), endpoint) == initiators.end())
        initiators.push_back(endpoint);
}

const VLNMPCA_iSCSIProtocolEndpoint*
ISCSI_Session_Maps::findOrMakeEndpoint(const AX_iSCSI_SessionInfo& info) {
    auto& endpoints = _agent.m_VLNMPCA_iSCSIProtocolEndpoint_map;
    const String name = format_text("%s i 0x%llx", _view.port_name.c_str(), isid_of(info));
    auto endpoint = make_instance<VLNMPCA_iSCSIProtocolEndpoint>();
    describe_endpoint(*endpoint, *_view.system, name, format_text("0x%llx", isid_of(info)),
                      ISCSI_Role::INITIATOR);
    if (const auto* known = endpoints.lookup(endpoint.get()))
        return known;
    const auto* inserted = insert_instance(endpoints, endpoint);
    return inserted && joinEndpoint(*inserted) ? inserted : nullptr;
}

bool ISCSI_Session_Maps::joinEndpoint(const VLNMPCA_iSCSIProtocolEndpoint& endpoint) {
    return join(_agent.m_VLNMPCA_SAPAvailableForISCSIEndpoint_map, &endpoint, _view.controller) &&
           join(_agent.m_VLNMPCA_HostedISCSIAccesspoint_map, _view.system, &endpoint) &&
           join(_agent.m_VLNMPCA_SAPAvailableForEthernetPort_map, &endpoint, _view.ethernet_port) &&
           join(_agent.m_VLNMPCA_iSCSIProtocolEndpointSAPImplementation_map, _view.ethernet_port,
                &endpoint) &&
           join(_agent.m_VLNMPCA_iSCSIBindsToTCP_map, _view.tcp_endpoint, &endpoint);
}

// Sessions whose login is not through have no handle yet, so the library's number is part of the
// text.
bool ISCSI_Session_Maps::createStatistics(uint32 session_id, const AX_iSCSI_SessionInfo& info) {
    const String id = format_text("VLN:Session Statistics:%s:%s:i0x%llx:t%d:%d",
                                  _view.port_name.c_str(), _target.name.c_str(), isid_of(info),
                                  static_cast<int>(info.tsih), static_cast<int>(session_id));
    const auto* statistics =
        insert_instance(_agent.m_VLNMPCA_ISCSISessionStatistics_map, statistics_instance(id, info));
    if (!statistics)
        return false;
    if (!_view.controller) {
        VLN_LOG(VLN_CRIT, "m_VLNMPCA_SCSIProtocolController_map size 0");
        return true;
    }
    return join(_agent.m_VLNMPCA_ISCSISessionStatisticalData_map, _view.controller, statistics);
}

// The port's name is part of the text as well: two ports may talk to one target under one ISID.
const VLNMPCA_iSCSIConnection*
ISCSI_Session_Maps::createConnection(uint32 session_id, const AX_iSCSI_SessionInfo& info) {
    const String ends = format_text("%s:%s", _view.port_name.c_str(), _target.name.c_str());
    const String id =
        format_text("VLN:iSCSI Connection:i0x%llx:%s:t%d:%d:%d", isid_of(info), ends.c_str(),
                    static_cast<int>(info.tsih), static_cast<int>(info.connectionId),
                    static_cast<int>(session_id));
    const auto* connection =
        insert_instance(_agent.m_VLNMPCA_iSCSIConnection_map, connection_instance(id, info));
    if (connection)
        VLN_LOG(VLN_DBG, "VLNMPCA_iSCSIConnection::create() SUCCESFUL");
    return connection;
}

void ISCSI_Session_Maps::joinPipes(const VLNMPCA_iSCSIProtocolEndpoint& endpoint,
                                   const VLNMPCA_iSCSISession& session,
                                   const VLNMPCA_iSCSIConnection& connection) {
    join(_agent.m_VLNMPCA_iSCSISessionEndpointOfNetworkPipe_map, &endpoint, &session);
    if (_view.tcp_endpoint)
        VLN_LOG(VLN_DBG, "Got VLNMPCA_TCPProtocolEndpoint in the map ");
    join(_agent.m_VLNMPCA_iSCSIConnectionEndpointOfNetworkPipe_map, _view.tcp_endpoint,
         &connection);
    join(_agent.m_VLNMPCA_NetworkPipeComposition_map, &session, &connection);
}

} // namespace cimple
