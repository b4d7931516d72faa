#include "agent/san/iscsi_instances.h"

#include "agent/state_tables.h"
#include "agent/text.h"
#include "device/library/attribute_buffer.h"

#include <algorithm>

namespace cimple {

namespace {

constexpr uint16 CONNECTION_TYPE_ISCSI = 7;  // CIM_SCSIProtocolEndpoint.ConnectionType
constexpr uint16 IF_TYPE_OTHER = 1;          // CIM_ProtocolEndpoint.ProtocolIFType
constexpr uint16 STATE_NOT_APPLICABLE = 5;   // EnabledState of what a console can't switch
constexpr uint16 DIRECTIONALITY_BOTH = 2;    // CIM_NetworkPipe.Directionality
constexpr uint16 SESSION_TYPE_DISCOVERY = 2; // CIM_iSCSISession.SessionType
constexpr uint16 SESSION_TYPE_NORMAL = 3;    // the same
constexpr uint16 DIGEST_NONE = 2;            // CIM_iSCSIConnection.HeaderDigestMethod
constexpr uint16 DIGEST_CRC32C = 3;          // the same
constexpr uint16 AUTHENTICATION_OTHER = 1;   // CIM_iSCSIConnection.AuthenticationMethodUsed
constexpr uint16 AUTHENTICATION_NONE = 2;    // the same
constexpr uint16 AUTHENTICATION_CHAP = 3;    // the same

// A state of the library, CIM_ManagedSystemElement.OperationalStatus, and its name.
constexpr Port_State SESSION_STATES[] = {
    {AX_ISCSI_SESSION_OPEN, 2, "OPEN"},
    {AX_ISCSI_SESSION_CLOSED, 10, "CLOSED"},
    {AX_ISCSI_SESSION_LOGIN_IN_PROGRESS, 8, "LOGIN_IN_PROGRESS"},
    {AX_ISCSI_SESSION_LOGIN_FAILED, 6, "LOGIN_FAILED"},
    {AX_ISCSI_SESSION_RECOVERY, 3, "RECOVERY"},
    {AX_ISCSI_SESSION_DELETED, 10, "DELETED"},
};
constexpr Port_State UNKNOWN_SESSION_STATE = {0, 0, "UNKNOWN"};
constexpr Port_State CONNECTED = {AX_ISCSI_CONNECTION_CONNECTED, 2, "CONNECTED"};
constexpr Port_State NOT_CONNECTED = {AX_ISCSI_CONNECTION_CLOSED, 10, "CLOSED"};

const Port_State& session_state(uint32 state) {
    for (const Port_State& row : SESSION_STATES)
        if (row.state == state)
            return row;
    return UNKNOWN_SESSION_STATE;
}

constexpr uint16 digest_method(uint8 digest) {
    return digest ? DIGEST_CRC32C : DIGEST_NONE;
}

constexpr uint16 authentication_method(uint32 method) {
    switch (method) {
    case AX_ISCSI_AUTH_NONE:
        return AUTHENTICATION_NONE;
    case AX_ISCSI_AUTH_ONE_WAY_CHAP:
    case AX_ISCSI_AUTH_MUTUAL_CHAP:
        return AUTHENTICATION_CHAP;
    default:
        return AUTHENTICATION_OTHER;
    }
}

// What sessions and connections have in common.
void describe_pipe(CIM_NetworkPipe& pipe, const String& id, const Port_State& state) {
    pipe.InstanceID.set(id);
    pipe.ElementName.set(id);
    append_port_state(&pipe, state);
    pipe.EnabledState.set(STATE_NOT_APPLICABLE);
    pipe.RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
    pipe.Directionality.set(DIRECTIONALITY_BOTH);
}

// A connection that was not redirected has neither address nor port there.
void describe_redirection(VLNMPCA_iSCSIConnection& connection, const AX_IPAddress& redirect) {
    const auto address = portal_text(redirect);
    if (!address && redirect.tcpPort != 0)
        VLN_LOG(VLN_ERR, "Error retrieving information for RedirectDestination Address");
    connection.RedirectedDestination.set(address.value_or(NO_TEXT));
    connection.RedirectedDestinationPort.set(redirect.tcpPort);
}

} // namespace

std::optional<String> portal_text(const AX_IPAddress& portal) {
    if (std::all_of(std::begin(portal.address), std::end(portal.address),
                    [](uint8_t byte) { return byte == 0; }))
        return {};
    return text(addressText(portal));
}

void describe_endpoint(CIM_iSCSIProtocolEndpoint& endpoint, const CIM_ComputerSystem& system,
                       const String& name, const String& identifier, ISCSI_Role role) {
    name_in_system(endpoint, system);
    endpoint.Name.set(name);
    endpoint.ElementName.set(name);
    endpoint.Identifier.set(identifier);
    endpoint.Role.set(static_cast<uint16>(role));
    endpoint.ConnectionType.set(CONNECTION_TYPE_ISCSI);
    endpoint.ProtocolIFType.set(IF_TYPE_OTHER);
    endpoint.OtherTypeDescription.set("iSCSI");
    endpoint.EnabledState.set(STATE_NOT_APPLICABLE);
    endpoint.RequestedState.set(REQUESTED_STATE_NOT_APPLICABLE);
}

Ref<VLNMPCA_iSCSISession> session_instance(const String& id, const String& target_name,
                                           const AX_iSCSI_SessionInfo& info) {
    const AX_iSCSI_LoginOptions& negotiated = info.negotiated;
    auto session = make_instance<VLNMPCA_iSCSISession>();
    describe_pipe(*session, id, session_state(info.state));
    session->SessionType.set(info.sessionType == AX_ISCSI_SESSION_DISCOVERY ? SESSION_TYPE_DISCOVERY
                                                                            : SESSION_TYPE_NORMAL);
    session->TSIH.set(info.tsih);
    session->ISIDQualifier.set(info.isidQualifier);
    session->EndPointName.set(target_name);
    session->CurrentConnections.set(info.connectionCount);
    session->InitialR2T.set(negotiated.initialR2T != 0);
    session->ImmediateData.set(negotiated.immediateData != 0);
    session->MaxOutstandingR2T.set(negotiated.maxOutstandingR2T);
    session->MaxUnsolicitedFirstDataBurstLength.set(negotiated.firstBurstLength);
    session->MaxDataBurstLength.set(negotiated.maxBurstLength);
    session->DataSequenceInOrder.set(negotiated.dataSequenceInOrder != 0);
    session->DataPDUInOrder.set(negotiated.dataPDUInOrder != 0);
    session->ErrorRecoveryLevel.set(negotiated.errorRecoveryLevel);
    session->MaxConnectionsPerSession.set(negotiated.maxConnections);
    session->DefaultTimeToWait.set(negotiated.defaultTime2Wait);
    session->DefaultTimeToRetain.set(negotiated.defaultTime2Retain);
    session->iSCSIBoot.set(info.bootSession);
    return session;
}

Ref<VLNMPCA_ISCSISessionStatistics> statistics_instance(const String& id,
                                                        const AX_iSCSI_SessionInfo& info) {
    const String alias = field_text(info.targetAlias);
    auto statistics = make_instance<VLNMPCA_ISCSISessionStatistics>();
    statistics->InstanceID.set(id);
    statistics->ElementName.set(id);
    // By value: the library aligns its counters to four bytes only.
    statistics->CommandPDUsTransferred.set(uint64{info.commandPDUs});
    statistics->ResponsePDUsTransferred.set(uint64{info.responsePDUs});
    statistics->BytesTransmitted.set(uint64{info.bytesTransferred});
    statistics->BytesReceived.set(uint64{info.bytesReceived});
    statistics->DigestErrors.set(info.digestErrors);
    statistics->ConnectionTimeoutErrors.set(info.connectionTimeoutErrors);
    statistics->SessionTargetAlias.set(alias.empty() ? String(NO_TEXT) : alias);
    return statistics;
}

Ref<VLNMPCA_iSCSIConnection> connection_instance(const String& id,
                                                 const AX_iSCSI_SessionInfo& info) {
    auto connection = make_instance<VLNMPCA_iSCSIConnection>();
    describe_pipe(*connection, id,
                  info.connectionState == CONNECTED.state ? CONNECTED : NOT_CONNECTED);
    connection->ConnectionID.set(info.connectionId);
    connection->MaxReceiveDataSegmentLength.set(info.negotiated.maxRecvDataSegmentLength);
    connection->MaxTransmitDataSegmentLength.set(info.maxSendDataSegmentLength);
    connection->HeaderDigestMethod.set(digest_method(info.negotiated.headerDigest));
    connection->DataDigestMethod.set(digest_method(info.negotiated.dataDigest));
    connection->AuthenticationMethodUsed.set(authentication_method(info.authenticationMethod));
    connection->MutualAuthentication.set(info.authenticationMethod == AX_ISCSI_AUTH_MUTUAL_CHAP);
    connection->SourcePort.set(info.initiatorAddress.tcpPort);
    connection->DestinationPort.set(info.targetAddress.tcpPort);
    connection->TargetIPAddress.set(portal_text(info.targetAddress).value_or(NO_TEXT));
    connection->TCPMSS.set(info.tcpMSS);
    describe_redirection(*connection, info.redirectAddress);
    return connection;
}

} // namespace cimple
