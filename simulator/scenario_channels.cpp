// How an adapter of a scenario is split, how its links are divided, and how that is managed.
#include "simulator/call.h"
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

struct Word {
    std::string_view text;
    std::uint32_t value;
};

template <std::size_t N>
std::uint32_t read_word(const Node& node, const Word (&words)[N]) {
    if (node.is(Value::Kind::number))
        return node.number32();
    const std::string given = node.text();
    std::string_view names[N];
    for (std::size_t i = 0; i < N; ++i) {
        names[i] = words[i].text;
        if (names[i] == given)
            return words[i].value;
    }
    node.fail("unknown word \"" + given + "\"; " + known_list(names));
}

template <std::size_t N>
std::uint32_t read_word(const Node& values, std::string_view name, const Word (&words)[N],
                        std::uint32_t otherwise) {
    const auto node = values.member(name);
    return node ? read_word(*node, words) : otherwise;
}

// The values of a word, or of a list of them, together.
template <std::size_t N>
std::uint32_t read_words(const Node& values, std::string_view name, const Word (&words)[N],
                         std::uint32_t otherwise) {
    const auto node = values.member(name);
    if (!node)
        return otherwise;
    std::uint32_t all = 0;
    for (const Node& each : node->items_or_self())
        all |= read_word(each, words);
    return all;
}

// Calls add(row, scope) for each row of a list, count times if it says so; place is the placeholder
// of its number.
template <class Add>
void read_rows(const Node& list, std::string_view place, std::size_t room, Add add) {
    std::size_t number = 0;
    for (const Node& row : list.items())
        for (std::uint64_t left = row.number("count", 1, room); left != 0; --left, ++number) {
            if (number == room)
                row.fail("more than " + std::to_string(room) + " of them");
            const Scope scope = row.scope().with(place, number);
            add(Node(row.value(), scope), number);
        }
}

void read_mac(const Node& values, std::uint8_t (&mac)[6]) {
    if (const auto node = values.member("mac")) {
        const Bytes bytes = node->bytes(sizeof mac);
        std::copy(bytes.begin(), bytes.end(), mac);
    }
}

// ---- Ports and functions ----

constexpr Word protocols[] = {{"NONE", AX_PROTOCOL_NONE},
                              {"NIC", AX_PROTOCOL_NIC},
                              {"ISCSI", AX_PROTOCOL_ISCSI},
                              {"FCOE", AX_PROTOCOL_FCOE},
                              {"NIC+ROCE", AX_PROTOCOL_ROCE}};
constexpr Word abilities[] = {{"NIC", AX_FUNCTION_NIC},
                              {"NIC+ROCE", AX_FUNCTION_ROCE},
                              {"ISCSI", AX_FUNCTION_ISCSI},
                              {"FCOE", AX_FUNCTION_FCOE},
                              {"NONE", AX_FUNCTION_NONE}};
constexpr Word adapter_flags[] = {{"mixed", AX_ADAPTER_MIXED_MODE},
                                  {"ganged", AX_ADAPTER_GANGED_MODE},
                                  {"concurrent", AX_ADAPTER_CONCURRENT_MODE},
                                  {"SRIOV", AX_ADAPTER_SRIOV},
                                  {"T10DIF", AX_ADAPTER_T10DIF}};

AX_FunctionConfig read_function_config(const Node& values) {
    values.expect_object({"count", "protocol", "can", "number", "mac"});
    AX_FunctionConfig function{};
    function.protocol = read_word(values, "protocol", protocols, AX_PROTOCOL_NIC);
    function.pendingProtocol = function.protocol;
    function.flags = read_words(values, "can", abilities, AX_FUNCTION_NIC);
    function.functionNumber = values.number32("number", 0);
    read_mac(values, function.mac);
    return function;
}

AX_PortConfig read_port_config(const Node& values) {
    values.expect_object({"count", "maxFunctions", "functions"});
    AX_PortConfig port{};
    port.maxFunctionCount = values.number32("maxFunctions", AX_CONFIG_FUNCTIONS);
    if (const auto functions = values.member("functions"))
        read_rows(*functions, "function", AX_CONFIG_FUNCTIONS,
                  [&](const Node& row, std::size_t number) {
                      port.function[number] = read_function_config(row);
                      ++port.functionCount;
                  });
    return port;
}

AX_AdapterPortConfig read_port_configs(const Node& values, const Function& function) {
    values.expect_object({"ports", "maxFCoEFunctions", "maxiSCSIFunctions", "flags",
                          "profileVersion", "minPorts", "maxPorts", "functionCount"});
    AX_AdapterPortConfig config{};
    if (const auto ports = values.member("ports"))
        read_rows(*ports, "port", AX_CONFIG_PORTS, [&](const Node& row, std::size_t number) {
            config.port[number] = read_port_config(row);
            ++config.portCount;
        });
    config.maxFCoEFunctions = values.number32("maxFCoEFunctions", config.portCount);
    config.maxiSCSIFunctions = values.number32("maxiSCSIFunctions", config.portCount);
    config.adapterFlags = read_words(values, "flags", adapter_flags, 0);
    config.activeProfileId = function.profiles ? function.profiles->active : 0;
    config.configuredProfileId = config.activeProfileId;
    config.pid = static_cast<std::uint8_t>(config.activeProfileId);
    config.mcType = static_cast<std::int32_t>(function.multichannel);
    config.configuredMCType = config.mcType;
    const auto small = [&](std::string_view name, std::uint32_t otherwise) {
        return static_cast<std::uint8_t>(values.number(name, otherwise, 0xFF));
    };
    config.profileVersion = small("profileVersion", 1);
    config.minPorts = small("minPorts", config.portCount);
    config.maxPorts = small("maxPorts", config.portCount);
    config.ariFunctionCount4 = small("functionCount", 0) * std::uint32_t{4};
    config.iplMaxFunctionCount = config.ariFunctionCount4 / 4;
    return config;
}

// ---- Channels ----

constexpr Word types[] = {{"nic", AX_CHANNEL_NIC},
                          {"iscsi", AX_CHANNEL_ISCSI},
                          {"fcoe", AX_CHANNEL_FCOE},
                          {"nic+roce", AX_CHANNEL_NIC_ROCE}};
constexpr Word changes[] = {{"lpvid", AX_CHANNEL_MASK_LPVID},
                            {"bandwidth", AX_CHANNEL_MASK_BANDWIDTH},
                            {"type", AX_CHANNEL_MASK_TYPE},
                            {"innerLPVID", AX_CHANNEL_MASK_INNER_LPVID}};

AX_Channel read_channel(const Node& values) {
    values.expect_object({"count", "type", "lpvid", "innerLPVID", "minBandwidth", "maxBandwidth",
                          "mac", "up", "number", "name"});
    AX_Channel channel{};
    channel.type = read_word(values, "type", types, AX_CHANNEL_NIC);
    channel.lpvid = values.number32("lpvid", 0);
    channel.innerLPVID = values.number32("innerLPVID", 0);
    channel.minBandwidth = values.number32("minBandwidth", 0);
    channel.maxBandwidth = values.number32("maxBandwidth", 100);
    channel.state = values.boolean("up", true);
    channel.functionNumber = values.number32("number", 0);
    read_mac(values, channel.mac);
    const std::string name = values.wild_text("name", "");
    if (name.size() > sizeof channel.name)
        values.member("name")->fail("longer than " + std::to_string(sizeof channel.name) +
                                    " bytes");
    name.copy(channel.name, sizeof channel.name);
    return channel;
}

AX_ChannelMgmtPortInfo read_channels(const Node& values) {
    values.expect_object({"changeable", "list"});
    AX_ChannelMgmtPortInfo info{};
    info.mask = read_words(values, "changeable", changes, 0);
    if (const auto list = values.member("list"))
        read_rows(*list, "channel", AX_CHANNELS, [&](const Node& row, std::size_t number) {
            info.channel[number] = read_channel(row);
            ++info.count;
        });
    return info;
}

AX_ChannelMgmtCNAInfo read_channel_management(const Node& values) {
    values.expect_object({"version", "canPartition", "on", "type", "modes"});
    AX_ChannelMgmtCNAInfo info{};
    info.version = values.number32("version", 1);
    info.capabilities = values.boolean("canPartition", false) ? 16 : 0;
    info.currentState = values.boolean("on", true);
    info.configuredState = info.currentState;
    info.mgmtType = values.number32("type", 0);
    info.configuredMgmtType = info.mgmtType;
    if (const auto modes = values.member("modes"))
        for (const Node& mode : modes->items()) {
            const std::uint64_t number = mode.number(32);
            if (number == 0)
                mode.fail("a number from 1 to 32 is wanted");
            info.availableModes |= 1U << (number - 1);
        }
    return info;
}

// ---- Personalities ----

constexpr Word personalities[] = {{"nic", AX_PERSONALITY_NIC},
                                  {"iscsi", AX_PERSONALITY_ISCSI},
                                  {"fcoe", AX_PERSONALITY_FCOE},
                                  {"nic+roce", AX_PERSONALITY_ROCE}};

AX_AdapterPersonalityInfo read_personality(const Node& values) {
    values.expect_object({"current", "available"});
    AX_AdapterPersonalityInfo info{};
    info.current = read_word(values, "current", personalities, AX_PERSONALITY_NIC);
    info.configured = info.current;
    if (const auto available = values.member("available"))
        for (const Node& each : available->items()) {
            if (info.availableCount == AX_PERSONALITIES)
                each.fail("more than " + std::to_string(AX_PERSONALITIES) + " of them");
            info.available[info.availableCount++] = read_word(each, personalities);
        }
    return info;
}

} // namespace

void read_channel_values(const Node& values, Function& function) {
    if (const auto node = values.member("portConfig"))
        function.port_config = read_port_configs(*node, function);
    function.factory_port_config = function.port_config;
    if (const auto node = values.member("channelManagement"))
        function.channel_management = read_channel_management(*node);
    if (const auto node = values.member("channels"))
        function.channels = read_channels(*node);
    if (const auto node = values.member("personality"))
        function.personality = read_personality(*node);
}

} // namespace vlnsim
