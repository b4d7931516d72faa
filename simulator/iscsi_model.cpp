// Logging in and out as initiator and target see it.
#include "simulator/iscsi_model.h"

#include "simulator/call.h"
#include "simulator/host_model.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

template <std::size_t size>
std::string_view text_of(const char (&field)[size]) {
    return {field, strnlen(field, size)};
}

// A target takes the account that it was given, and nothing else.
bool is_let_in(const AX_iSCSI_Authentication& wanted, const AX_iSCSI_Authentication& offered) {
    if (wanted.method != offered.method)
        return false;
    if (wanted.method == AX_ISCSI_AUTH_NONE)
        return true;
    if (text_of(wanted.targetCHAPName) != text_of(offered.targetCHAPName) ||
        text_of(wanted.targetSecret) != text_of(offered.targetSecret))
        return false;
    return wanted.method == AX_ISCSI_AUTH_ONE_WAY_CHAP ||
           (text_of(wanted.initiatorCHAPName) == text_of(offered.initiatorCHAPName) &&
            text_of(wanted.initiatorSecret) == text_of(offered.initiatorSecret));
}

// The result functions of RFC 7143, section 13. What the initiator declares for itself stays.
AX_iSCSI_LoginOptions negotiated(const AX_iSCSI_LoginOptions& ours,
                                 const std::optional<AX_iSCSI_LoginOptions>& limits) {
    AX_iSCSI_LoginOptions agreed = ours;
    if (!limits)
        return agreed;
    const AX_iSCSI_LoginOptions& theirs = *limits;
    const auto smaller = [](auto& value, auto other) { value = std::min(value, other); };
    smaller(agreed.firstBurstLength, theirs.firstBurstLength);
    smaller(agreed.maxBurstLength, theirs.maxBurstLength);
    smaller(agreed.defaultTime2Retain, theirs.defaultTime2Retain);
    smaller(agreed.maxConnections, theirs.maxConnections);
    smaller(agreed.maxOutstandingR2T, theirs.maxOutstandingR2T);
    smaller(agreed.errorRecoveryLevel, theirs.errorRecoveryLevel);
    smaller(agreed.immediateData, theirs.immediateData);
    smaller(agreed.headerDigest, theirs.headerDigest);
    smaller(agreed.dataDigest, theirs.dataDigest);
    const auto larger = [](auto& value, auto other) { value = std::max(value, other); };
    larger(agreed.defaultTime2Wait, theirs.defaultTime2Wait);
    larger(agreed.initialR2T, theirs.initialR2T);
    larger(agreed.dataPDUInOrder, theirs.dataPDUInOrder);
    larger(agreed.dataSequenceInOrder, theirs.dataSequenceInOrder);
    return agreed;
}

const iSCSI_Portal* find_portal(const iSCSI_Network& network, const AX_IPAddress& address) {
    const auto found =
        std::find_if(network.portals.begin(), network.portals.end(),
                     [&](const auto& each) { return same_portal(each.address, address); });
    return found == network.portals.end() ? nullptr : &*found;
}

bool has_name(const iSCSI_Target& target, std::string_view name) {
    return text_of(target.entry.name) == name;
}

const iSCSI_Target* find_target(const std::vector<iSCSI_Target>& targets, std::string_view name) {
    const auto found = std::find_if(targets.begin(), targets.end(),
                                    [&](const auto& each) { return has_name(each, name); });
    return found == targets.end() ? nullptr : &*found;
}

bool is_usable(const iSCSI_Session& session) {
    return !session.info.closed && (session.info.state == AX_ISCSI_SESSION_OPEN ||
                                    session.info.state == AX_ISCSI_SESSION_RECOVERY);
}

// Who answers at the portal under the target's name; null with the status.
const iSCSI_Target* reach(const iSCSI_Network& network, const iSCSI_Target& target,
                          const AX_IPAddress& address, AX_STATUS& status) {
    if (same_address(target.portal, {}))
        return &target;
    const iSCSI_Portal* portal = find_portal(network, address);
    const iSCSI_Target* found =
        portal ? find_target(portal->targets, text_of(target.entry.name)) : nullptr;
    status = portal ? iscsi_unknown : AX_STATUS_NOT_ANSWERING;
    return found;
}

void add_session(Function& function, iSCSI_Target& target, const iSCSI_Target& peer,
                 const AX_IPAddress& portal, const AX_iSCSI_LoginProperties& login) {
    std::uint32_t id = 1, qualifier = 1;
    for (const iSCSI_Target& each : function.iscsi_targets)
        for (const iSCSI_Session& session : each.sessions)
            id = std::max(id, session.entry.sessionId + 1);
    for (const iSCSI_Session& session : target.sessions)
        qualifier = std::max(qualifier, session.info.isidQualifier + 1);
    iSCSI_Session session;
    AX_iSCSI_SessionInfo& info = session.info;
    info.isidQualifier = qualifier;
    info.isid = isid_base + qualifier;
    info.tsih = static_cast<std::uint16_t>(qualifier);
    info.connectionCount = 1;
    info.targetPortalGroup = 1;
    info.tcpMSS = 1460;
    info.maxSendDataSegmentLength = 65536;
    info.authenticationMethod = login.authentication.method;
    info.negotiated = negotiated(login.options, peer.limits);
    info.targetAddress = portal;
    if (function.network)
        info.initiatorAddress = function.network->address;
    info.initiatorAddress.tcpPort = static_cast<std::uint16_t>(first_dynamic_port + id);
    info.bootSession = (target.entry.flags & AX_ISCSI_TARGET_BOOT) != 0;
    copy_text(peer.alias, info.targetAlias, sizeof info.targetAlias);
    session.entry = session_entry(info, id);
    target.sessions.push_back(session);
}

} // namespace

std::string iSCSI_Target::name() const {
    return std::string(text_of(entry.name));
}

bool same_address(const AX_IPAddress& one, const AX_IPAddress& other) {
    return std::memcmp(one.address, other.address, sizeof one.address) == 0;
}

bool same_portal(const AX_IPAddress& one, const AX_IPAddress& other) {
    return same_address(one, other) && one.tcpPort == other.tcpPort;
}

iSCSI_Target* find_target(Function& function, std::string_view name) {
    return const_cast<iSCSI_Target*>(find_target(function.iscsi_targets, name));
}

AX_iSCSI_Session session_entry(const AX_iSCSI_SessionInfo& info, std::uint32_t id) {
    AX_iSCSI_Session entry;
    soil(&entry, 0, sizeof entry);
    entry.isid = info.isid;
    entry.isidQualifier = info.isidQualifier;
    entry.tsih = info.tsih;
    entry.closed = info.closed;
    entry.sessionId = id;
    return entry;
}

void update_flags(iSCSI_Target& target) {
    const bool has = !target.sessions.empty();
    target.entry.flags =
        static_cast<std::uint8_t>((target.entry.flags & ~AX_ISCSI_TARGET_HAS_SESSIONS) |
                                  (has ? AX_ISCSI_TARGET_HAS_SESSIONS : 0));
}

iSCSI_Target new_target(const iSCSI_Network& network, const Function& function,
                        std::string_view name, const AX_IPAddress& portal) {
    iSCSI_Target target;
    for (const iSCSI_Portal& each : network.portals)
        if (const iSCSI_Target* found = find_target(each.targets, name))
            target = *found;
    copy_text(std::string(name), target.entry.name, sizeof target.entry.name);
    target.portal = portal;
    target.lists_units = false;
    if (function.initiator)
        target.login.options = function.initiator->loginOptions;
    return target;
}

AX_STATUS discover(const iSCSI_Network& network, Function& function,
                   const Send_Target_Portal& portal) {
    const iSCSI_Portal* found = find_portal(network, portal.address);
    if (!found)
        return AX_STATUS_NOT_ANSWERING;
    if (!is_let_in(found->wanted, portal.login.authentication)) {
        ++function.iscsi_statistics.loginAuthenticateFails;
        return iscsi_login_refused;
    }
    for (const iSCSI_Target& each : found->targets) {
        if (find_target(function, text_of(each.entry.name)))
            continue;
        iSCSI_Target target =
            new_target(network, function, text_of(each.entry.name), portal.address);
        target.discovered = true;
        function.iscsi_targets.push_back(std::move(target));
    }
    return AX_STATUS_OK;
}

AX_STATUS log_in(const iSCSI_Network& network, Function& function, iSCSI_Target& target,
                 const AX_IPAddress& portal, const AX_iSCSI_LoginProperties& login) {
    AX_STATUS status = AX_STATUS_OK;
    const iSCSI_Target* peer = reach(network, target, portal, status);
    if (!peer) {
        ++function.iscsi_statistics.loginOtherFails;
        return status;
    }
    if (!is_let_in(peer->wanted, login.authentication)) {
        ++function.iscsi_statistics.loginAuthenticateFails;
        return iscsi_login_refused;
    }
    add_session(function, target, *peer, portal, login);
    target.login = login;
    target.lists_units = true;
    update_flags(target);
    ++function.iscsi_statistics.loginAccepts;
    return AX_STATUS_OK;
}

AX_STATUS log_out(Function& function, iSCSI_Target& target, const AX_IPAddress* portal,
                  std::uint32_t session_id) {
    const auto found =
        std::find_if(target.sessions.begin(), target.sessions.end(), [&](const auto& session) {
            return session.entry.sessionId == session_id &&
                   (!portal || same_address(session.info.targetAddress, *portal));
        });
    if (found == target.sessions.end())
        return iscsi_unknown;
    target.sessions.erase(found);
    target.lists_units = std::any_of(target.sessions.begin(), target.sessions.end(), is_usable);
    update_flags(target);
    ++function.iscsi_statistics.logoutNormals;
    return AX_STATUS_OK;
}

} // namespace vlnsim
