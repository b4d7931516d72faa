#include "operations/orrigan_rules.h"

#include "device/library/axapi.h"

#include <strings.h>

namespace cimple {

namespace {

constexpr int32_t VNIC = 2; // multichannel type
constexpr int32_t LAST_MULTICHANNEL_TYPE = 5;
constexpr uint32 VNIC_FUNCTIONS = 4; // of a port
constexpr uint32 FIRST_ROCE_PID = 16, LAST_ROCE_PID = 99;
constexpr uint32 CAN_PARTITION = 16;        // of the capabilities of channel management
constexpr uint32 STORAGE_FUNCTIONS_END = 4; // functions 1 to 3 are those that storage may have
constexpr uint32 PROFILE_ROCE = 1, PROFILE_NIC_ONLY = 2;

bool isStorage(uint32 protocol) {
    return protocol == AX_PROTOCOL_ISCSI || protocol == AX_PROTOCOL_FCOE;
}
bool isEthernet(uint32 protocol) {
    return protocol == AX_PROTOCOL_NIC || protocol == AX_PROTOCOL_ROCE;
}

template <class Predicate>
bool anyFunction(const AX_AdapterPortConfig& config, Predicate wanted) {
    for (const AX_PortConfig& port : portsOf(config))
        for (const AX_FunctionConfig& function : functionsOf(port))
            if (wanted(function))
                return true;
    return false;
}

uint32 functionsWith(const AX_PortConfig& port, uint32 protocol) {
    const auto functions = functionsOf(port);
    return static_cast<uint32>(
        std::count_if(functions.begin(), functions.end(),
                      [protocol](const auto& function) { return function.protocol == protocol; }));
}

// The first port for which broken(port) holds gives the refusal.
template <class Broken>
Refused refuseIfAnyPort(const AX_AdapterPortConfig& config, Broken broken, const char* line) {
    const auto ports = portsOf(config);
    if (std::any_of(ports.begin(), ports.end(), broken))
        return refusal(0, "%s", line);
    return std::nullopt;
}

// ---- The rules, in their order ----

Refused functionZeroIsEthernet(const Orrigan_Request& request) {
    uint32 number = 0;
    for (const AX_PortConfig& port : portsOf(request.config)) {
        const uint32 protocol =
            port.functionCount == 0 ? uint32{AX_PROTOCOL_NONE} : port.function[0].protocol;
        if (number == 0 && !isEthernet(protocol))
            return refusal(0, "Invalid f0 parameter for port %u. Must be NIC or RoCE.", number);
        if (!isEthernet(protocol) && protocol != AX_PROTOCOL_NONE)
            return refusal(0,
                           "Invalid f0 parameter for port %u. Must be NIC, RoCE, or none. "
                           "Port type: %u",
                           number, protocol);
        ++number;
    }
    return std::nullopt;
}

Refused roceHasNoStorageAndAProfile(const Orrigan_Request& request) {
    if (!request.facts.roce)
        return std::nullopt;
    for (const AX_PortConfig& port : portsOf(request.config))
        for (uint32 i = 1; i < std::min(port.functionCount, STORAGE_FUNCTIONS_END); ++i)
            if (isStorage(port.function[i].protocol))
                return refusal(0, "No storage functions can be specified on NIC+RoCE "
                                  "configuration");
    const uint32 pid = request.config.pid;
    if (pid < FIRST_ROCE_PID || pid > LAST_ROCE_PID)
        return refusal(0, "For NIC+RoCE configuration, valid PID must be specified. :%u", pid);
    return std::nullopt;
}

Refused profileFitsWithoutRoce(const Orrigan_Request& request) {
    const uint32 pid = request.config.pid;
    if (request.facts.roce)
        return std::nullopt;
    if (request.facts.nicOnly && pid == 0 && request.sriovSupported)
        return refusal(0,
                       " For NIC only configuration, valid PID must be specified when SRIOV is "
                       "supported, Profile Id:%u",
                       pid);
    if (!request.facts.nicOnly && pid != 0)
        return refusal(0, "For storage configurations, PID must not be specified: %u", pid);
    return std::nullopt;
}

Refused storageIsNotGanged(const Orrigan_Request& request) {
    return refuseIfAnyPort(
        request.config,
        [](const AX_PortConfig& port) {
            return functionsWith(port, AX_PROTOCOL_ISCSI) > 1 ||
                   functionsWith(port, AX_PROTOCOL_FCOE) > 1;
        },
        "ERROR: Ganged storage is not supported.");
}

Refused vnicHasFewFunctions(const Orrigan_Request& request) {
    if (request.facts.mcType != VNIC)
        return std::nullopt;
    return refuseIfAnyPort(
        request.config,
        [](const AX_PortConfig& port) { return port.functionCount > VNIC_FUNCTIONS; },
        "For multichannel type = vNIC, the maximum functions per port = 4.");
}

Refused undividedPortsAreEthernet(const Orrigan_Request& request) {
    if (!(request.capabilities & CAN_PARTITION) || request.facts.multichannel() ||
        !anyFunction(request.config,
                     [](const auto& function) { return !isEthernet(function.protocol); }))
        return std::nullopt;
    return refusal(0, "For NPAR adapters, if NPAR is disabled, the only supported protocols are "
                      "NIC and NIC+ROCE");
}

Refused vnicHasSeveralPorts(const Orrigan_Request& request) {
    if (request.facts.mcType != VNIC || request.config.portCount != 1)
        return std::nullopt;
    return refusal(0, "For single port adapters, multichannel type cannot be vNIC.");
}

struct Protocol_Row {
    uint32 protocol;
    uint32 flag; // of a function that can have it
    const char* line;
};
constexpr Protocol_Row PROTOCOLS[] = {
    {AX_PROTOCOL_NIC, AX_FUNCTION_NIC,
     " The NIC protocol is not supported on the specified function."},
    {AX_PROTOCOL_ROCE, AX_FUNCTION_ROCE,
     " The RoCE protocol is not supported on the specified function."},
    {AX_PROTOCOL_ISCSI, AX_FUNCTION_ISCSI,
     " The iSCSI protocol is not supported on the specified function."},
    {AX_PROTOCOL_FCOE, AX_FUNCTION_FCOE,
     " The FCoE protocol is not supported on the specified function."},
    {AX_PROTOCOL_NONE, AX_FUNCTION_NONE,
     " The NONE protocol is not supported on the specified function."},
};

// A function may be without a protocol where a port is divided by a type that leaves some idle, or
// not divided at all.
bool functionsMayBeIdle(const Orrigan_Request& request) {
    return (request.facts.mcType >= 1 && request.facts.mcType <= 4) ||
           request.config.configuredMCType == 0;
}

Refused functionsHaveTheirProtocols(const Orrigan_Request& request) {
    for (const AX_PortConfig& port : portsOf(request.config))
        for (const AX_FunctionConfig& function : functionsOf(port)) {
            const auto* row = std::find_if(
                std::begin(PROTOCOLS), std::end(PROTOCOLS) - 1,
                [&](const Protocol_Row& each) { return each.protocol == function.protocol; });
            const bool idle = function.protocol == AX_PROTOCOL_NONE && functionsMayBeIdle(request);
            if (!(function.flags & row->flag) && !idle)
                return refusal(0, "%s", row->line);
        }
    return std::nullopt;
}

Refused bothStoragesWantConcurrency(const Orrigan_Request& request) {
    if (request.config.adapterFlags & AX_ADAPTER_CONCURRENT_MODE)
        return std::nullopt;
    return refuseIfAnyPort(
        request.config,
        [](const AX_PortConfig& port) {
            return functionsWith(port, AX_PROTOCOL_ISCSI) != 0 &&
                   functionsWith(port, AX_PROTOCOL_FCOE) != 0;
        },
        " Concurrent mode not supported.");
}

Refused roceIsNotDivided(const Orrigan_Request& request) {
    if (!request.facts.roce || !request.facts.multichannel())
        return std::nullopt;
    return refusal(0, " NIC+RoCE is not suported when multi channel is enabled.");
}

Refused undividedPortsHaveEachProtocolOnce(const Orrigan_Request& request) {
    if (request.config.configuredMCType != 0)
        return std::nullopt;
    return refuseIfAnyPort(
        request.config,
        [](const AX_PortConfig& port) {
            return std::any_of(std::begin(PROTOCOLS), std::end(PROTOCOLS),
                               [&](const Protocol_Row& row) {
                                   return row.protocol != AX_PROTOCOL_NONE &&
                                          functionsWith(port, row.protocol) > 1;
                               });
        },
        "Multichannel is disabled. Cannot configure more than one protocol in each port.");
}

constexpr Refused (*RULES[])(const Orrigan_Request&) = {
    functionZeroIsEthernet,
    roceHasNoStorageAndAProfile,
    profileFitsWithoutRoce,
    storageIsNotGanged,
    vnicHasFewFunctions,
    undividedPortsAreEthernet,
    vnicHasSeveralPorts,
    functionsHaveTheirProtocols,
    bothStoragesWantConcurrency,
    roceIsNotDivided,
    undividedPortsHaveEachProtocolOnce,
};

} // namespace

Orrigan_Facts orriganFacts(const AX_AdapterPortConfig& config) {
    Orrigan_Facts facts;
    const int32_t type = config.configuredMCType != -1 ? config.configuredMCType : config.mcType;
    if (type >= 1 && type <= LAST_MULTICHANNEL_TYPE)
        facts.mcType = type;
    facts.roce = anyFunction(
        config, [](const auto& function) { return function.protocol == AX_PROTOCOL_ROCE; });
    facts.nicOnly = !facts.roce && !anyFunction(config, [](const auto& function) {
        return isStorage(function.protocol);
    });
    return facts;
}

Refused firstBrokenRule(const Orrigan_Request& request) {
    uint32 number = 1;
    for (const auto& rule : RULES) {
        if (Refused refused = rule(request)) {
            refused->number = number;
            return refused;
        }
        ++number;
    }
    return std::nullopt;
}

bool isEtsDisabled(const AX_Profile& profile) {
    return strncasecmp(profile.name, "NIC - ETS Disabled", sizeof profile.name) == 0;
}

Profile_Choice chooseProfile(const Orrigan_Request& request, std::span<const AX_Profile> profiles) {
    Profile_Choice choice;
    choice.pid = request.config.pid;
    if (choice.pid == 0) {
        if (!request.sriovSupported)
            for (const AX_Profile& profile : profiles)
                if ((profile.flags & PROFILE_NIC_ONLY) && !isEtsDisabled(profile))
                    choice.pid = static_cast<uint8>(profile.id);
        return choice;
    }
    const auto found =
        std::find_if(profiles.begin(), profiles.end(), [&](const AX_Profile& profile) {
            return profile.id == choice.pid && (profile.flags & (PROFILE_ROCE | PROFILE_NIC_ONLY));
        });
    if (found == profiles.end()) {
        choice.refused = refusal(AX_STATUS_INVALID_ARGUMENT,
                                 "Invalid PID. Does not support RoCE nor NIC only. ");
        return choice;
    }
    choice.etsDisabled = isEtsDisabled(*found);
    if (choice.etsDisabled && request.facts.multichannel())
        choice.refused = refusal(AX_STATUS_INVALID_ARGUMENT, "%s", "");
    else if (choice.etsDisabled && !request.sriovSupported)
        choice.refused = refusal(AX_STATUS_INVALID_ARGUMENT,
                                 "NIC ETS Disabled profile cannot be configured on operating "
                                 "systems that do not support SRIOV");
    return choice;
}

} // namespace cimple
