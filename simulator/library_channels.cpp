// How adapters are split into ports and functions, how links are divided into channels, and the
// profiles and personalities that go with it.
#include "simulator/call.h"
#include "simulator/same_hardware.h"

#include <algorithm>
#include <vector>

namespace vlnsim {
namespace {

constexpr std::uint32_t fewer_functions = 8, more_functions = 16; // that ARI can show
constexpr std::uint32_t max_mc_type = 5, max_percent = 100, max_vlan = 4094;
constexpr std::uint32_t max_management_type = 5;
constexpr std::uint32_t channel_types =
    AX_CHANNEL_NIC | AX_CHANNEL_ISCSI | AX_CHANNEL_FCOE | AX_CHANNEL_NIC_ROCE;

// The flag of a function that can have the protocol; 0 for none that there is.
std::uint32_t flag_of(std::uint32_t protocol) {
    constexpr std::uint32_t flags[] = {AX_FUNCTION_NONE, AX_FUNCTION_NIC, AX_FUNCTION_ISCSI,
                                       AX_FUNCTION_FCOE, AX_FUNCTION_ROCE};
    return protocol < std::size(flags) ? flags[protocol] : 0;
}

// What an adapter without a configuration of its own tells.
AX_AdapterPortConfig plain_config(Host& host, const Function& asked) {
    AX_AdapterPortConfig config{};
    std::vector<const Function*> ports; // one function of each
    each_of_adapter(host, asked, [&](Function& function) {
        if (std::none_of(ports.begin(), ports.end(),
                         [&](const Function* port) { return port->shares_port(function); }))
            ports.push_back(&function);
    });
    config.portCount = static_cast<std::uint32_t>(ports.size());
    config.activeProfileId = asked.profiles ? asked.profiles->active : 0;
    config.configuredProfileId = config.activeProfileId;
    config.mcType = static_cast<std::int32_t>(asked.multichannel);
    config.configuredMCType = config.mcType;
    return config;
}

bool has_profile(const Function& function, std::uint32_t id) {
    if (id == 0)
        return true;
    if (!function.profiles)
        return false;
    const auto& list = function.profiles->list;
    return std::any_of(list.begin(), list.end(),
                       [id](const AX_Profile& profile) { return profile.id == id; });
}

bool is_possible(const AX_PortConfig& port, const AX_PortConfig& wanted) {
    if (wanted.functionCount > AX_CONFIG_FUNCTIONS ||
        (port.maxFunctionCount != 0 && wanted.functionCount > port.maxFunctionCount))
        return false;
    for (std::uint32_t i = 0; i < wanted.functionCount; ++i) {
        const std::uint32_t protocol = wanted.function[i].protocol;
        // An idle function needs no ability.
        if (flag_of(protocol) == 0 ||
            (protocol != AX_PROTOCOL_NONE && !(port.function[i].flags & flag_of(protocol))))
            return false;
    }
    return true;
}

bool is_possible(const Function& function, const AX_AdapterPortConfig& wanted) {
    const AX_AdapterPortConfig& config = *function.port_config;
    if (wanted.portCount != config.portCount || wanted.configuredMCType < -1 ||
        wanted.configuredMCType > static_cast<std::int32_t>(max_mc_type) ||
        !has_profile(function, wanted.pid))
        return false;
    for (std::uint32_t i = 0; i < config.portCount; ++i)
        if (!is_possible(config.port[i], wanted.port[i]))
            return false;
    return true;
}

// What is written of a port; what it can do and its addresses are its own.
void take(AX_PortConfig& port, const AX_PortConfig& wanted) {
    port.functionCount = std::max(port.functionCount, wanted.functionCount);
    for (std::uint32_t i = 0; i < AX_CONFIG_FUNCTIONS; ++i) {
        AX_FunctionConfig& function = port.function[i];
        function.pendingProtocol = i < wanted.functionCount ? wanted.function[i].protocol
                                                            : std::uint32_t{AX_PROTOCOL_NONE};
        function.flags &= ~std::uint32_t{AX_FUNCTION_ETS_DISABLED};
        function.flags |= wanted.function[i].flags & AX_FUNCTION_ETS_DISABLED;
    }
}

void take(AX_AdapterPortConfig& config, const AX_AdapterPortConfig& wanted) {
    config.configuredMCType = wanted.configuredMCType;
    config.pid = wanted.pid;
    config.configuredProfileId = wanted.pid;
    config.adapterFlags |= AX_ADAPTER_REBOOT_REQUIRED;
    for (std::uint32_t i = 0; i < config.portCount; ++i)
        take(config.port[i], wanted.port[i]);
}

// A channel that a port can have.
bool is_possible(const AX_ChannelMgmtPortInfo& port, const AX_ChannelMgmtPortInfo& wanted) {
    if (wanted.count != port.count || (wanted.mask & ~port.mask) != 0 || wanted.mask == 0)
        return false;
    return std::all_of(wanted.channel, wanted.channel + wanted.count, [](const AX_Channel& each) {
        const std::uint32_t type = each.type & channel_types;
        return type == each.type && type != 0 && (type & (type - 1)) == 0 &&
               each.minBandwidth <= each.maxBandwidth && each.maxBandwidth <= max_percent &&
               each.lpvid <= max_vlan && each.innerLPVID <= max_vlan;
    });
}

void take(AX_Channel& channel, const AX_Channel& wanted, std::uint32_t mask) {
    if (mask & AX_CHANNEL_MASK_TYPE)
        channel.type = wanted.type;
    if (mask & AX_CHANNEL_MASK_LPVID)
        channel.lpvid = wanted.lpvid;
    if (mask & AX_CHANNEL_MASK_INNER_LPVID)
        channel.innerLPVID = wanted.innerLPVID;
    if (mask & AX_CHANNEL_MASK_BANDWIDTH) {
        channel.minBandwidth = wanted.minBandwidth;
        channel.maxBandwidth = wanted.maxBandwidth;
    }
}

// Runs body(function) for the function with that name that has the member.
template <auto member, class Body>
AX_STATUS with(Call& call, AX_WWN wwn, Body body) {
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return function->*member ? body(*function) : AX_STATUS_NOT_SUPPORTED;
}

// Answers a whole record.
template <auto member, class Record>
AX_STATUS get_record(Call& call, AX_WWN wwn, Record* record, const char* name) {
    if (call.null(record, name))
        return AX_STATUS_INVALID_ARGUMENT;
    return with<member>(call, wwn, [record](Function& function) {
        *record = *(function.*member);
        return AX_STATUS_OK;
    });
}

} // namespace

void start_configuration(Function& function) {
    if (function.port_config) {
        AX_AdapterPortConfig& config = *function.port_config;
        if (config.configuredMCType != -1)
            config.mcType = config.configuredMCType;
        config.activeProfileId = config.configuredProfileId;
        config.iplMaxFunctionCount = config.ariFunctionCount4 / 4;
        config.adapterFlags &= ~std::uint32_t{AX_ADAPTER_REBOOT_REQUIRED};
        for (AX_PortConfig& port : config.port)
            for (AX_FunctionConfig& each : port.function)
                each.protocol = each.pendingProtocol;
    }
    if (function.channel_management) {
        function.channel_management->currentState = function.channel_management->configuredState;
        function.channel_management->mgmtType = function.channel_management->configuredMgmtType;
    }
    if (function.personality)
        function.personality->current = function.personality->configured;
}

namespace library {

AX_STATUS AX_ListProfiles(AX_WWN wwn, AX_ProfileList* list) {
    return answer<AX_STATUS>(
        Entry::AX_ListProfiles,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!function->profiles)
                return AX_STATUS_NOT_SUPPORTED;
            const auto& profiles = function->profiles->list;
            if (call.list_too_small(list->count, profiles.size()))
                return AX_STATUS_MORE_DATA;
            const AX_AdapterPortConfig config =
                function->port_config ? *function->port_config : plain_config(call.host, *function);
            list->activeProfileId = config.activeProfileId;
            list->configuredProfileId = config.configuredProfileId;
            AX_Profile* entry = list->profile;
            for (const AX_Profile& profile : profiles)
                *entry++ = profile;
            return AX_STATUS_OK;
        },
        wwn);
}

AX_STATUS AX_GetAdapterPortConfig(AX_WWN wwn, AX_AdapterPortConfig* config) {
    return answer<AX_STATUS>(
        Entry::AX_GetAdapterPortConfig,
        [&](Call& call) -> AX_STATUS {
            if (call.null(config, "config"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* asked = call.function(wwn);
            if (!asked)
                return AX_STATUS_ILLEGAL_WWN;
            *config = asked->port_config ? *asked->port_config : plain_config(call.host, *asked);
            return AX_STATUS_OK;
        },
        wwn);
}

AX_STATUS AX_SetAdapterPortConfig(AX_WWN wwn, const AX_AdapterPortConfig* config) {
    return answer<AX_STATUS>(
        Entry::AX_SetAdapterPortConfig,
        [&](Call& call) -> AX_STATUS {
            if (call.null(config, "config"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with<&Function::port_config>(call, wwn, [&](Function& asked) -> AX_STATUS {
                if (!is_possible(asked, *config))
                    return configuration_refused;
                each_of_adapter(call.host, asked, [&](Function& function) {
                    if (function.port_config)
                        take(*function.port_config, *config);
                });
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_SetAdapterPortConfigDefaults(AX_WWN wwn) {
    return answer<AX_STATUS>(
        Entry::AX_SetAdapterPortConfigDefaults,
        [&](Call& call) -> AX_STATUS {
            return with<&Function::port_config>(call, wwn, [&](Function& asked) {
                each_of_adapter(call.host, asked, [](Function& function) {
                    if (function.port_config)
                        take(*function.port_config, *function.factory_port_config);
                });
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_SetAriFuncs(AX_WWN wwn, uint32_t functionCount) {
    return answer<AX_STATUS>(
        Entry::AX_SetAriFuncs,
        [&](Call& call) -> AX_STATUS {
            return with<&Function::port_config>(call, wwn, [&](Function& asked) -> AX_STATUS {
                if (asked.port_config->ariFunctionCount4 == 0)
                    return AX_STATUS_NOT_SUPPORTED;
                if (functionCount != fewer_functions && functionCount != more_functions)
                    return configuration_refused;
                each_of_adapter(call.host, asked, [&](Function& function) {
                    if (!function.port_config)
                        return;
                    function.port_config->ariFunctionCount4 = functionCount * 4;
                    function.port_config->adapterFlags |= AX_ADAPTER_REBOOT_REQUIRED;
                });
                return AX_STATUS_OK;
            });
        },
        wwn, functionCount);
}

AX_STATUS AX_GetAdapterPersonalityInfo(AX_WWN wwn, AX_AdapterPersonalityInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetAdapterPersonalityInfo,
        [&](Call& call) { return get_record<&Function::personality>(call, wwn, info, "info"); },
        wwn);
}

AX_STATUS AX_ChangeAdapterPersonality(AX_WWN wwn, uint32_t personality) {
    return answer<AX_STATUS>(
        Entry::AX_ChangeAdapterPersonality,
        [&](Call& call) -> AX_STATUS {
            return with<&Function::personality>(call, wwn, [&](Function& asked) -> AX_STATUS {
                const auto* available = asked.personality->available;
                if (!std::count(available, available + asked.personality->availableCount,
                                personality))
                    return configuration_refused;
                each_of_adapter(call.host, asked, [personality](Function& function) {
                    if (function.personality)
                        function.personality->configured = personality;
                });
                return AX_STATUS_OK;
            });
        },
        wwn, personality);
}

AX_STATUS AX_GetChannelMgmtCNAInfo(AX_WWN wwn, AX_ChannelMgmtCNAInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetChannelMgmtCNAInfo,
        [&](Call& call) {
            return get_record<&Function::channel_management>(call, wwn, info, "info");
        },
        wwn);
}

AX_STATUS AX_SetChannelMgmtCNAInfo(AX_WWN wwn, const AX_ChannelMgmtCNAInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_SetChannelMgmtCNAInfo,
        [&](Call& call) -> AX_STATUS {
            if (call.null(info, "info"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with<&Function::channel_management>(
                call, wwn, [&](Function& asked) -> AX_STATUS {
                    if (info->configuredState > 1 || info->configuredMgmtType > max_management_type)
                        return configuration_refused;
                    each_of_adapter(call.host, asked, [&](Function& function) {
                        if (!function.channel_management)
                            return;
                        function.channel_management->configuredState = info->configuredState;
                        function.channel_management->configuredMgmtType = info->configuredMgmtType;
                    });
                    return AX_STATUS_OK;
                });
        },
        wwn);
}

AX_STATUS AX_GetChannelMgmtPortInfo(AX_WWN wwn, AX_ChannelMgmtPortInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_GetChannelMgmtPortInfo,
        [&](Call& call) { return get_record<&Function::channels>(call, wwn, info, "info"); }, wwn);
}

AX_STATUS AX_SetChannelMgmtPortInfo(AX_WWN wwn, const AX_ChannelMgmtPortInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_SetChannelMgmtPortInfo,
        [&](Call& call) -> AX_STATUS {
            if (call.null(info, "info"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with<&Function::channels>(call, wwn, [&](Function& asked) -> AX_STATUS {
                if (!is_possible(*asked.channels, *info))
                    return configuration_refused;
                for (Function& function : call.host.functions)
                    if (function.shares_port(asked) && function.channels)
                        for (std::uint32_t i = 0; i < info->count; ++i)
                            take(function.channels->channel[i], info->channel[i], info->mask);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

} // namespace library
} // namespace vlnsim
