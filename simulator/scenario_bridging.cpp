// Data centre bridging of a port: what is configured, and what its switch provides.
#include "simulator/scenario.h"

namespace vlnsim {
namespace {

constexpr std::uint64_t max_priority = 7;

// A list of priorities, or the bitmap itself, which may be any.
std::uint32_t read_bitmap(const Node& value) {
    if (value.is(Value::Kind::null))
        return 0;
    if (value.is(Value::Kind::number))
        return value.number32();
    std::uint32_t bitmap = 0;
    for (const Node& priority : value.items())
        bitmap |= 1U << priority.number(max_priority);
    return bitmap;
}

void read_state(const Node& values, std::string_view key, AX_CEE_State& state) {
    const auto node = values.member(key);
    if (!node)
        return;
    node->expect_object({"enabled", "syncd", "error", "willing", "advertise"});
    state.enabled = node->number32("enabled", state.enabled);
    state.syncd = node->number32("syncd", state.syncd);
    state.error = node->number32("error", state.error);
    state.willing = node->number32("willing", state.willing);
    state.advertise = node->number32("advertise", state.advertise);
}

void read_groups(const Node& groups, std::uint32_t (&bitmaps)[AX_PRIORITY_GROUP_IDS]) {
    groups.expect_any_object();
    std::fill(std::begin(bitmaps), std::end(bitmaps), 0);
    for (const auto& [name, value] : groups.value().members) {
        const auto id = parse_number(name);
        if (!id || *id >= AX_PRIORITY_GROUP_IDS)
            value.fail("unknown group; known are: 0 to 15");
        bitmaps[*id] = read_bitmap(Node(value, groups.scope()));
    }
}

void read_bandwidths(const Node& list, std::uint32_t (&bandwidths)[AX_PRIORITY_GROUPS]) {
    const std::vector<Node> items = list.items();
    if (items.size() > AX_PRIORITY_GROUPS)
        list.fail("more than 8 groups");
    std::fill(std::begin(bandwidths), std::end(bandwidths), 0);
    for (std::size_t i = 0; i < items.size(); ++i)
        bandwidths[i] = items[i].number32();
}

AX_ApplicationTable read_applications(const Node& list) {
    AX_ApplicationTable table{};
    const std::vector<Node> items = list.items();
    if (items.size() > AX_APPLICATION_SLOTS)
        list.fail("more than 15 applications");
    for (std::size_t i = 0; i < items.size(); ++i) {
        const Node& row = items[i];
        row.expect_object({"kind", "protocol", "priority"});
        const auto priority = row.member("priority");
        table.slot[i] = {row.number32("kind", 0), row.number32("protocol", 0), 0,
                         priority ? read_bitmap(*priority) : 0};
    }
    return table;
}

void read_settings(const Node& values, AX_CEE_Settings& settings) {
    values.expect_object(
        {"pg", "pfc", "fcoe", "iscsi", "flowControl", "groups", "bandwidth", "applications"});
    read_state(values, "pg", settings.pg);
    read_state(values, "pfc", settings.pfc);
    read_state(values, "fcoe", settings.fcoe);
    read_state(values, "iscsi", settings.iscsi);
    if (const auto node = values.member("flowControl"))
        settings.pfcBitmap = read_bitmap(*node);
    if (const auto node = values.member("groups"))
        read_groups(*node, settings.groupBitmap);
    if (const auto node = values.member("bandwidth"))
        read_bandwidths(*node, settings.bandwidth);
    if (const auto node = values.member("applications"))
        settings.application = read_applications(*node);
}

// All priorities in one group that has the whole link.
AX_CEE_Settings plain_settings() {
    constexpr AX_CEE_State on = {1, 1, 0, 1, 1};
    AX_CEE_Settings settings{};
    settings.pg = settings.pfc = settings.fcoe = settings.iscsi = on;
    settings.groupBitmap[0] = 0xFF;
    settings.bandwidth[0] = 100;
    return settings;
}

void read_exchange(const Node& values, AX_CEE_Params& record) {
    record.dcbx = {1, 1};
    record.lldp = {1, 1, 1, 1, 1, 1};
    if (const auto node = values.member("dcbx")) {
        node->expect_object({"state", "mode", "operatingVersion", "maximumVersion"});
        record.dcbx = {node->number32("state", 1), node->number32("mode", 1)};
        record.dcbxOperatingVersion = node->number32("operatingVersion", 0);
        record.dcbxMaximumVersion = node->number32("maximumVersion", 0);
    }
    if (const auto node = values.member("lldp")) {
        node->expect_object(
            {"txState", "rxState", "txPortDesc", "txSysDesc", "txSysName", "txSysCap"});
        record.lldp = {node->number32("txState", 1),    node->number32("rxState", 1),
                       node->number32("txPortDesc", 1), node->number32("txSysDesc", 1),
                       node->number32("txSysName", 1),  node->number32("txSysCap", 1)};
    }
}

} // namespace

void read_bridging(const Node& values, Function& function) {
    values.expect_object({"maxGroups", "dcbx", "lldp", "configured", "switch"});
    AX_CEE_Params& record = function.bridging.emplace();
    record.maxSupportedPG = values.number32("maxGroups", AX_PRIORITY_GROUPS);
    read_exchange(values, record);
    record.configured = plain_settings();
    if (const auto node = values.member("configured"))
        read_settings(*node, record.configured);
    record.active = record.configured;
    if (const auto node = values.member("switch")) {
        read_settings(*node, record.active);
        function.bridging_switch = true;
    }
}

} // namespace vlnsim
