// What an iSCSI function is told: portals, targets, logins, name servers; and what it counts.
#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

constexpr std::uint32_t max_eto = 3200; // seconds
constexpr std::size_t min_secret = 12;
constexpr std::size_t max_secret = 16;
constexpr std::size_t max_name_servers = 8;
constexpr std::size_t max_portals = 64;

template <class Body>
AX_STATUS with_iscsi(Call& call, AX_WWN wwn, Body body) {
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return function->special_features & AX_FEATURE_ISCSI_FUNCTION ? body(*function)
                                                                  : AX_STATUS_NOT_SUPPORTED;
}

// A target by the name that a client gave, which may be any.
template <class Body>
AX_STATUS with_target(Call& call, AX_WWN wwn, const char* name, Body body) {
    if (call.null(name, "targetName"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
        iSCSI_Target* target = find_target(function, name);
        return target ? body(function, *target) : iscsi_unknown;
    });
}

template <class Body>
AX_STATUS with_portal(Call& call, AX_WWN wwn, const AX_IPAddress* address, Body body) {
    if (call.null(address, "portal"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
        auto& portals = function.send_target_portals;
        const auto found = std::find_if(portals.begin(), portals.end(), [&](const auto& each) {
            return same_portal(each.address, *address);
        });
        return body(function, portals, found);
    });
}

// ---- Login properties ----

template <std::size_t size>
bool ends(Call& call, const char (&text)[size], const char* what) {
    if (strnlen(text, size) < size)
        return true;
    call.violation(std::string(what) + " has no end");
    return false;
}

template <std::size_t name_size, std::size_t secret_size>
bool is_account(Call& call, const char (&name)[name_size], const char (&secret)[secret_size]) {
    if (!ends(call, name, "a CHAP name") || !ends(call, secret, "a CHAP secret"))
        return false;
    const std::size_t length = strnlen(secret, secret_size);
    return name[0] && length >= min_secret && length <= max_secret;
}

// Whether an adapter would take them.
bool are_usable(Call& call, const AX_iSCSI_LoginProperties& login) {
    const AX_iSCSI_LoginOptions& options = login.options;
    const AX_iSCSI_Authentication& account = login.authentication;
    if (options.headerDigest > 1 || options.dataDigest > 1 || options.immediateData > 1 ||
        account.method > AX_ISCSI_AUTH_MUTUAL_CHAP)
        return false;
    if (account.method == AX_ISCSI_AUTH_NONE)
        return true;
    if (!is_account(call, account.targetCHAPName, account.targetSecret))
        return false;
    return account.method == AX_ISCSI_AUTH_ONE_WAY_CHAP ||
           is_account(call, account.initiatorCHAPName, account.initiatorSecret);
}

bool are_same(const AX_iSCSI_LoginProperties& one, const AX_iSCSI_LoginProperties& other) {
    const auto same = [](const auto& text, const auto& as) {
        return std::strncmp(text, as, sizeof text) == 0;
    };
    const AX_iSCSI_Authentication &a = one.authentication, &b = other.authentication;
    return std::memcmp(&one.options, &other.options, sizeof one.options) == 0 &&
           a.method == b.method && same(a.targetCHAPName, b.targetCHAPName) &&
           same(a.targetSecret, b.targetSecret) && same(a.initiatorCHAPName, b.initiatorCHAPName) &&
           same(a.initiatorSecret, b.initiatorSecret);
}

// ---- Targets ----

AX_STATUS add_target(Call& call, AX_WWN wwn, const char* name, const AX_IPAddress* portal,
                     const AX_iSCSI_LoginProperties* login, std::uint32_t and_log_in, bool boot) {
    if (call.null(name, "targetName") || call.null(portal, "portal") ||
        call.null(login, "properties"))
        return AX_STATUS_INVALID_ARGUMENT;
    return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
        const iSCSI_Network& network = call.host.iscsi_network;
        if (!are_usable(call, *login) || std::strlen(name) >= AX_ISCSI_NAME_SIZE)
            return AX_STATUS_INVALID_ARGUMENT;
        iSCSI_Target* known = find_target(function, name);
        if (known && !known->discovered)
            return iscsi_exists;
        iSCSI_Target target = known ? *known : new_target(network, function, name, *portal);
        target.discovered = false;
        target.login = *login;
        if (boot)
            target.entry.flags |= AX_ISCSI_TARGET_BOOT;
        if (and_log_in)
            if (const AX_STATUS status = log_in(network, function, target, *portal, *login))
                return status;
        if (known)
            *known = std::move(target);
        else
            function.iscsi_targets.push_back(std::move(target));
        return AX_STATUS_OK;
    });
}

// A target with a session outlives the portal that it came from.
void drop_targets_of(Function& function, const AX_IPAddress& portal) {
    std::erase_if(function.iscsi_targets, [&](const iSCSI_Target& target) {
        return target.discovered && target.sessions.empty() && same_portal(target.portal, portal);
    });
    for (iSCSI_Target& target : function.iscsi_targets)
        if (same_portal(target.portal, portal))
            target.discovered = false;
}

bool answers_ping(const Host& host, const Function& function, const AX_IPAddress& address,
                  bool& is_there) {
    const auto is_it = [&](const AX_IPAddress& other) { return same_address(address, other); };
    const auto& [portals, hosts] = host.iscsi_network;
    is_there = true;
    if (function.network && (is_it(function.network->address) || is_it(function.network->gateway)))
        return true;
    for (const iSCSI_Portal& portal : portals)
        if (is_it(portal.address))
            return true;
    for (const auto& [known, answers] : hosts)
        if (is_it(known))
            return answers;
    is_there = false;
    return false;
}

} // namespace

// ---- Portals ----

AX_STATUS AX_iSCSI_AddSendTargetPortal(AX_WWN wwn, const AX_IPAddress* portal,
                                       AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_AddSendTargetPortal,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_portal(
                call, wwn, portal, [&](Function& function, auto& portals, auto found) -> AX_STATUS {
                    if (!are_usable(call, *properties))
                        return AX_STATUS_INVALID_ARGUMENT;
                    const bool is_new = found == portals.end();
                    if (is_new && portals.size() >= max_portals)
                        return iscsi_full;
                    if (!is_new && !are_same(found->login, *properties)) {
                        *properties = found->login;
                        return AX_STATUS_PORTAL_EXISTS;
                    }
                    const Send_Target_Portal wanted{*portal, *properties};
                    const AX_STATUS status = discover(call.host.iscsi_network, function, wanted);
                    if (status == AX_STATUS_OK && is_new)
                        portals.push_back(wanted);
                    return status;
                });
        },
        wwn);
}

AX_STATUS AX_iSCSI_RemoveSendTargetPortal(AX_WWN wwn, const AX_IPAddress* portal) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_RemoveSendTargetPortal,
        [&](Call& call) {
            return with_portal(call, wwn, portal,
                               [&](Function& function, auto& portals, auto found) -> AX_STATUS {
                                   if (found == portals.end())
                                       return iscsi_unknown;
                                   portals.erase(found);
                                   drop_targets_of(function, *portal);
                                   return AX_STATUS_OK;
                               });
        },
        wwn);
}

AX_STATUS AX_iSCSI_GetSendTargetPortalProperties(AX_WWN wwn, const AX_IPAddress* portal,
                                                 AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetSendTargetPortalProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_portal(call, wwn, portal,
                               [&](Function&, auto& portals, auto found) -> AX_STATUS {
                                   if (found == portals.end())
                                       return iscsi_unknown;
                                   *properties = found->login;
                                   return AX_STATUS_OK;
                               });
        },
        wwn);
}

AX_STATUS AX_iSCSI_SetSendTargetPortalProperties(AX_WWN wwn, const AX_IPAddress* portal,
                                                 const AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetSendTargetPortalProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_portal(call, wwn, portal,
                               [&](Function&, auto& portals, auto found) -> AX_STATUS {
                                   if (found == portals.end())
                                       return iscsi_unknown;
                                   if (!are_usable(call, *properties))
                                       return AX_STATUS_INVALID_ARGUMENT;
                                   found->login = *properties;
                                   return AX_STATUS_OK;
                               });
        },
        wwn);
}

// ---- Targets ----

AX_STATUS AX_iSCSI_AddTarget(AX_WWN wwn, const char* targetName, const AX_IPAddress* portal,
                             const AX_iSCSI_LoginProperties* properties, uint32_t login) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_AddTarget,
        [&](Call& call) {
            return add_target(call, wwn, targetName, portal, properties, login, false);
        },
        wwn, targetName, login);
}

AX_STATUS AX_iSCSI_AddBootTarget(AX_WWN wwn, const char* targetName, const AX_IPAddress* portal,
                                 const AX_iSCSI_LoginProperties* properties, uint32_t login) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_AddBootTarget,
        [&](Call& call) {
            return add_target(call, wwn, targetName, portal, properties, login, true);
        },
        wwn, targetName, login);
}

AX_STATUS AX_iSCSI_RemoveTarget(AX_WWN wwn, const char* targetName) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_RemoveTarget,
        [&](Call& call) {
            return with_target(call, wwn, targetName,
                               [&](Function& function, iSCSI_Target& target) -> AX_STATUS {
                                   if (!target.sessions.empty())
                                       return AX_STATUS_TARGET_IN_USE;
                                   auto& all = function.iscsi_targets;
                                   all.erase(all.begin() + (&target - all.data()));
                                   return AX_STATUS_OK;
                               });
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_TargetLogin(AX_WWN wwn, const char* targetName, const AX_IPAddress* portal,
                               const AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_TargetLogin,
        [&](Call& call) -> AX_STATUS {
            if (call.null(portal, "portal") || call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_target(
                call, wwn, targetName, [&](Function& function, iSCSI_Target& target) -> AX_STATUS {
                    if (!are_usable(call, *properties))
                        return AX_STATUS_INVALID_ARGUMENT;
                    return log_in(call.host.iscsi_network, function, target, *portal, *properties);
                });
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_TargetLogout(AX_WWN wwn, const char* targetName, const AX_IPAddress* portal,
                                uint32_t sessionId) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_TargetLogout,
        [&](Call& call) {
            return with_target(call, wwn, targetName,
                               [&](Function& function, iSCSI_Target& target) {
                                   return log_out(function, target, portal, sessionId);
                               });
        },
        wwn, targetName, sessionId);
}

AX_STATUS AX_iSCSI_GetTargetLoginAuthProperties(AX_WWN wwn, const char* targetName,
                                                AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetTargetLoginAuthProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_target(call, wwn, targetName,
                               [&](Function&, iSCSI_Target& target) -> AX_STATUS {
                                   *properties = target.login;
                                   return AX_STATUS_OK;
                               });
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_SetTargetLoginAuthProperties(AX_WWN wwn, const char* targetName,
                                                const AX_iSCSI_LoginProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetTargetLoginAuthProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_target(call, wwn, targetName,
                               [&](Function&, iSCSI_Target& target) -> AX_STATUS {
                                   if (!are_usable(call, *properties))
                                       return AX_STATUS_INVALID_ARGUMENT;
                                   target.login = *properties;
                                   return AX_STATUS_OK;
                               });
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_SetTargetProperties(AX_WWN wwn, const char* targetName, uint32_t eto,
                                       uint32_t* etoRefused) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetTargetProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(etoRefused, "etoRefused"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_target(call, wwn, targetName,
                               [&](Function& function, iSCSI_Target& target) -> AX_STATUS {
                                   if (eto > max_eto)
                                       return AX_STATUS_INVALID_ARGUMENT;
                                   *etoRefused = !function.takes_eto;
                                   if (*etoRefused)
                                       return AX_STATUS_NOT_SUPPORTED;
                                   target.eto = eto;
                                   return AX_STATUS_OK;
                               });
        },
        wwn, targetName, eto);
}

// The sessions of the target at the address, or all of them.
AX_STATUS AX_iSCSI_SetBootSession(AX_WWN wwn, const char* targetName, const AX_IPAddress* address,
                                  uint32_t enable) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetBootSession,
        [&](Call& call) {
            return with_target(
                call, wwn, targetName, [&](Function&, iSCSI_Target& target) -> AX_STATUS {
                    if (enable > 1)
                        return AX_STATUS_INVALID_ARGUMENT;
                    bool found = false;
                    for (iSCSI_Session& session : target.sessions) {
                        if (address && !same_address(session.info.targetAddress, *address))
                            continue;
                        session.info.bootSession = enable;
                        found = true;
                    }
                    return found ? AX_STATUS_OK : iscsi_unknown;
                });
        },
        wwn, targetName, enable);
}

// ---- Name servers, counters, the network ----

AX_STATUS AX_iSCSI_GetiSNSServers(AX_WWN wwn, AX_iSCSI_iSNSServerList* list) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetiSNSServers,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                const auto& servers = function.name_servers.list;
                const std::size_t room = list->count;
                if (call.list_too_small(list->count, servers.size()))
                    return AX_STATUS_MORE_DATA;
                list->enabled = function.name_servers.enabled;
                std::copy(servers.begin(), servers.end(), list->server);
                soil(list->server, servers.size() * sizeof *list->server,
                     room * sizeof *list->server);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_iSCSI_AddiSNSServer(AX_WWN wwn, const AX_IPAddress* server) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_AddiSNSServer,
        [&](Call& call) -> AX_STATUS {
            if (call.null(server, "server"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                auto& servers = function.name_servers.list;
                if (server->tcpPort == 0 || same_address(*server, {}))
                    return AX_STATUS_INVALID_ARGUMENT;
                if (std::any_of(servers.begin(), servers.end(),
                                [&](const auto& each) { return same_portal(each, *server); }))
                    return AX_STATUS_OK;
                if (servers.size() >= max_name_servers)
                    return iscsi_full;
                servers.push_back(*server);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_iSCSI_RemoveiSNSServer(AX_WWN wwn, const AX_IPAddress* server) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_RemoveiSNSServer,
        [&](Call& call) -> AX_STATUS {
            if (call.null(server, "server"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                const auto gone = std::erase_if(function.name_servers.list, [&](const auto& each) {
                    return same_portal(each, *server);
                });
                return gone ? AX_STATUS_OK : iscsi_unknown;
            });
        },
        wwn);
}

AX_STATUS AX_iSCSI_SetiSNSState(AX_WWN wwn, uint32_t enabled) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_SetiSNSState,
        [&](Call& call) {
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                if (enabled > 1)
                    return AX_STATUS_INVALID_ARGUMENT;
                function.name_servers.enabled = enabled;
                return AX_STATUS_OK;
            });
        },
        wwn, enabled);
}

AX_STATUS AX_iSCSI_GetPortStatistics(AX_WWN wwn, AX_iSCSI_PortStatistics* statistics) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetPortStatistics,
        [&](Call& call) -> AX_STATUS {
            if (call.null(statistics, "statistics"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                *statistics = function.iscsi_statistics;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_Ping(AX_WWN wwn, const AX_IPAddress* address, int32_t* reply) {
    return answer<AX_STATUS>(
        Entry::AX_Ping,
        [&](Call& call) -> AX_STATUS {
            if (call.null(address, "address") || call.null(reply, "reply"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_iscsi(call, wwn, [&](Function& function) -> AX_STATUS {
                bool is_there = false;
                *reply = answers_ping(call.host, function, *address, is_there);
                call.out("reply", *reply);
                return is_there ? AX_STATUS_OK : AX_STATUS_NOT_ANSWERING;
            });
        },
        wwn);
}

} // namespace vlnsim::library
