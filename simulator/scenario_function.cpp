// The values of one function: identity, attributes, statistics, features and what else it answers.
#include "simulator/scenario.h"

#include "simulator/vlnsim.h"

#include <algorithm>
#include <array>
#include <cstdio>

namespace vlnsim {
namespace {

constexpr std::size_t max_attribute = 0xFFFF - 1;
constexpr std::size_t max_model = sizeof(LocalHBAInfoV4{}.model) - 1;

struct Type {
    std::string_view name;
    std::uint32_t special_features;
    bool in_hba_api;
};
constexpr Type types[] = {
    {"nic", AX_FEATURE_NIC_FUNCTION, false},
    {"iscsi", AX_FEATURE_ISCSI_FUNCTION, false},
    {"fcoe", AX_FEATURE_FCOE_FUNCTION, true},
    {"none", 0, false},
};

const Type& read_type(const Node& values) {
    const auto node = values.member("type");
    if (!node)
        values.fail("\"type\" is wanted: nic, iscsi, fcoe or none");
    const std::string name = node->text();
    for (const Type& type : types)
        if (type.name == name)
            return type;
    node->fail("unknown type \"" + name + "\"; known are: nic, iscsi, fcoe, none");
}

std::uint32_t placeholder_number(const Scope& scope, std::string_view name) {
    for (const auto& [known, number] : scope.numbers)
        if (known == name)
            return static_cast<std::uint32_t>(number);
    return 0;
}

std::string colon_text(const Bytes& bytes) {
    std::string text;
    char pair[4];
    for (const std::uint8_t byte : bytes) {
        std::snprintf(pair, sizeof pair, "%02x", byte);
        text += (text.empty() ? "" : ":") + std::string(pair);
    }
    return text;
}

void read_identity(const Node& values, Function& function) {
    const auto wwpn = values.member("wwpn");
    if (!wwpn)
        values.fail("\"wwpn\" is wanted: the port name, 16 hexadecimal digits");
    function.wwpn = wwpn->wwn();
    const auto wwnn = values.member("wwnn");
    function.wwnn = wwnn ? wwnn->wwn() : function.wwpn;
    if (const auto fabric = values.member("fabric"))
        function.fabric = fabric->wwn();
    function.instance = values.number32("instance", placeholder_number(values.scope(), "instance"));
    function.flags = values.number32("flags", 0);
    function.dead = values.boolean("dead", false);
    function.sub_adapter = static_cast<std::uint16_t>(values.number("subAdapter", 0, 0xFFFF));
    function.model = values.text("model", "");
    if (function.model.size() > max_model)
        values.member("model")->fail("longer than " + std::to_string(max_model) + " bytes");
    const std::string records = values.text("records", "v4");
    if (records != "v4" && records != "v3" && records != "none")
        values.member("records")->fail("unknown form \"" + records + "\"; known are: v4, v3, none");
    function.v4_record = records == "v4";
    function.v3_record = records != "none";
}

// Attributes that follow from other keys; a table of the scenario overrides each.
void derive_attributes(const Node& values, Function& function) {
    const Scope& scope = values.scope();
    Bytes mac(8);
    put_name(function.wwpn, mac.data());
    mac.erase(mac.begin(), mac.begin() + 2);
    if (const auto node = values.member("mac"))
        mac = node->bytes(6);
    auto& adapter = function.adapter_attributes;
    auto& port = function.port_attributes;
    adapter[adapter_serial_number] = Attribute::of_text(values.text("serial", ""));
    adapter[adapter_model] = Attribute::of_text(function.model);
    adapter[adapter_ieee_address] = Attribute::of_bytes(mac);
    adapter[adapter_port_number] =
        Attribute::of_number(values.number32("portNumber", placeholder_number(scope, "port")));
    adapter[adapter_pci_function] = Attribute::of_number(placeholder_number(scope, "function"));
    if (values.member("subAdapter")) {
        char text[8];
        std::snprintf(text, sizeof text, "%02X", function.sub_adapter);
        adapter[adapter_sub_adapter] = Attribute::of_text(text);
    }
    port[port_permanent_mac] = Attribute::of_text(colon_text(mac));
    port[port_current_mac] = port[port_permanent_mac];
}

void read_attributes(const Node& values, std::string_view key, std::span<const Identifier> table,
                     Attribute_Map& map) {
    const auto node = values.member(key);
    if (!node)
        return;
    node->expect_any_object();
    for (const auto& [name, source] : node->value().members) {
        const Node value(source, values.scope());
        const std::uint32_t number = read_identifier(value, name, table);
        const auto identifier = static_cast<std::uint16_t>(number);
        if (value.is(Value::Kind::null))
            map.erase(identifier);
        else
            map[identifier] = read_attribute(value, find_identifier(table, number));
    }
}

void read_statistics(const Node& values, Function& function) {
    const auto node = values.member("statistics");
    if (!node)
        return;
    node->expect_any_object();
    for (const auto& [name, source] : node->value().members) {
        const Node value(source, values.scope());
        const std::uint32_t number = read_identifier(value, name, statistic_identifiers());
        if (!value.is(Value::Kind::null))
            function.statistics[static_cast<std::uint16_t>(number)] = value.number();
    }
}

void read_features(const Node& values, Function& function) {
    const auto node = values.member("features");
    if (!node)
        return;
    node->expect_any_object();
    for (const auto& [name, source] : node->value().members) {
        const Node value(source, values.scope());
        const std::uint32_t number = read_identifier(value, name, feature_identifiers());
        if (!value.is(Value::Kind::null))
            function.features[number] = read_feature(value);
    }
}

void read_records(const Node& values, Function& function) {
    if (const auto node = values.member("driverType"))
        function.driver_type = node->number32();
    if (const auto node = values.member("beacon"))
        function.beacon = node->number32();
    if (const auto node = values.member("vpd"))
        function.fru_vpd = read_vpd(*node);
    if (const auto node = values.member("pciVpd"))
        function.pci_vpd = read_vpd(*node);
    if (const auto node = values.member("initiator"))
        function.initiator = read_initiator(*node);
    if (const auto node = values.member("network"))
        function.network = read_network(*node);
    if (const auto node = values.member("arpTable"))
        function.arp_table = read_arp_table(*node);
    if (const auto node = values.member("routeTable"))
        function.route_table = read_route_table(*node);
    if (const auto node = values.member("sff"))
        function.sff = read_sff(*node);
    if (const auto node = values.member("driverParameters"))
        function.driver_parameters = read_driver_parameters(*node);
    if (const auto node = values.member("globalDriverParameters"))
        function.global_driver_parameters = read_driver_parameters(*node);
    if (const auto node = values.member("unitPriorities"))
        function.unit_priorities = read_unit_priorities(*node, function);
    if (const auto node = values.member("dumps"))
        function.dumps = read_dumps(*node);
    if (const auto node = values.member("diagnostics"))
        function.diagnostics = read_diagnostics(*node);
    if (const auto node = values.member("bridging"))
        read_bridging(*node, function);
    if (const auto node = values.member("fip"))
        function.fip = read_fip(*node);
    if (const auto node = values.member("nameManagement"))
        read_name_management(*node, function);
    if (const auto node = values.member("virtualPorts"))
        function.virtual_ports = read_virtual_ports(*node);
    if (const auto node = values.member("qos"))
        function.qos = read_qos(*node);
    if (const auto node = values.member("pci")) {
        function.pci = read_pci(*node);
        if (!node->member("functionNumber"))
            function.pci->functionNumber =
                function.adapter_attributes[adapter_pci_function].number();
    }
}

Effect read_effect(const Node& values, std::string_view key,
                   std::initializer_list<std::string_view> known, Effect otherwise) {
    const auto node = values.member(key);
    if (!node)
        return otherwise;
    const std::string given = node->text();
    const auto found = std::find(known.begin(), known.end(), given);
    if (found == known.end())
        node->fail("unknown time \"" + given + "\"; " + known_list({known.begin(), known.size()}));
    return static_cast<Effect>(found - known.begin());
}

Profiles read_profiles(const Node& values) {
    values.expect_object({"active", "list"});
    Profiles profiles;
    profiles.active = values.number32("active", 0);
    const auto list = values.member("list");
    if (!list)
        return profiles;
    for (const Node& row : list->items()) {
        row.expect_object({"id", "flags", "name"});
        AX_Profile profile{};
        profile.id = row.number32("id", static_cast<std::uint32_t>(profiles.list.size()));
        profile.flags = row.number32("flags", 0);
        const std::string name = row.wild_text("name", "");
        if (name.size() > sizeof profile.name)
            row.member("name")->fail("longer than " + std::to_string(sizeof profile.name) +
                                     " bytes");
        name.copy(profile.name, sizeof profile.name);
        profiles.list.push_back(profile);
    }
    return profiles;
}

void read_changes(const Node& values, Function& function) {
    function.firmware_effect =
        read_effect(values, "firmwareTakesEffect", {"once", "reset", "reboot"}, Effect::reset);
    function.port_effect =
        read_effect(values, "portChangeTakesEffect", {"once", "reset"}, Effect::once);
    function.multichannel = values.number32("multichannel", 0);
    if (const auto node = values.member("virtualFunctions"))
        function.virtual_functions = read_virtual_functions(*node, function);
    if (const auto node = values.member("profiles"))
        function.profiles = read_profiles(*node);
    read_channel_values(values, function);
}

bool read_mapping_by_unit(const Node& hba) {
    const std::string order = hba.text("order", "targets");
    if (order != "targets" && order != "units")
        hba.member("order")->fail("unknown order \"" + order + "\"; known are: targets, units");
    return order == "units";
}

void read_san(const Node& values, bool in_hba_api, Function& function) {
    const auto hba = values.member("hba");
    if (hba && hba->is(Value::Kind::boolean))
        in_hba_api = hba->boolean();
    if (!in_hba_api)
        return;
    function.hba_name = "Vorlan-" + function.model + "-" + std::to_string(function.instance);
    if (hba && !hba->is(Value::Kind::boolean)) {
        hba->expect_object({"name", "ports", "stale", "order"});
        function.hba_name = hba->text("name", *function.hba_name);
        if (function.hba_name->size() > 255)
            hba->member("name")->fail("longer than 255 bytes");
        function.hba_ports = hba->number32("ports", 1);
        function.stale = hba->number32("stale", 0);
        function.mapping_by_unit = read_mapping_by_unit(*hba);
    }
    if (const auto targets = values.member("targets"))
        function.targets = read_targets(*targets);
}

void read_iscsi(const Node& values, Function& function) {
    if (const auto targets = values.member("iscsiTargets"))
        function.iscsi_targets = read_iscsi_targets(*targets, function);
    if (const auto statistics = values.member("iscsiStatistics"))
        function.iscsi_statistics = read_iscsi_statistics(*statistics);
    if (const auto servers = values.member("isns"))
        function.name_servers = read_name_servers(*servers);
    function.takes_eto = values.boolean("takesETO", true);
}

} // namespace

std::span<const std::string_view> function_keys() {
    static constexpr std::string_view keys[] = {"type",
                                                "instance",
                                                "model",
                                                "subAdapter",
                                                "serial",
                                                "portNumber",
                                                "wwpn",
                                                "wwnn",
                                                "fabric",
                                                "mac",
                                                "flags",
                                                "specialFeatures",
                                                "records",
                                                "features",
                                                "driverType",
                                                "beacon",
                                                "firmwareTakesEffect",
                                                "portChangeTakesEffect",
                                                "multichannel",
                                                "profiles",
                                                "portConfig",
                                                "channelManagement",
                                                "channels",
                                                "personality",
                                                "driverParameters",
                                                "globalDriverParameters",
                                                "unitPriorities",
                                                "dumps",
                                                "diagnostics",
                                                "bridging",
                                                "fip",
                                                "nameManagement",
                                                "virtualPorts",
                                                "qos",
                                                "virtualFunctions",
                                                "dead",
                                                "adapterAttributes",
                                                "portAttributes",
                                                "statistics",
                                                "vpd",
                                                "pciVpd",
                                                "pci",
                                                "sff",
                                                "initiator",
                                                "network",
                                                "arpTable",
                                                "routeTable",
                                                "hba",
                                                "targets",
                                                "iscsiTargets",
                                                "iscsiStatistics",
                                                "isns",
                                                "takesETO"};
    return keys;
}

std::uint32_t read_identifier(const Node& value, std::string_view key,
                              std::span<const Identifier> table) {
    if (const Identifier* identifier = find_identifier(table, key))
        return identifier->number;
    const auto number = parse_number(key);
    if (number && *number <= 0xFFFF)
        return static_cast<std::uint32_t>(*number);
    std::vector<std::string_view> names;
    for (const Identifier& row : table)
        names.push_back(row.name);
    value.fail("unknown name; a number below 65536 is known, and " + known_list(names));
}

Attribute read_attribute(const Node& value, const Identifier* identifier) {
    if (value.is(Value::Kind::object)) {
        value.expect_object({"bytes"});
        const auto bytes = value.member("bytes");
        if (!bytes)
            value.fail("\"bytes\" is wanted");
        return Attribute::of_bytes(bytes->bytes());
    }
    const Attribute_Kind kind = identifier                      ? identifier->kind
                                : value.is(Value::Kind::number) ? Attribute_Kind::number
                                                                : Attribute_Kind::text;
    if (kind == Attribute_Kind::number)
        return Attribute::of_number(value.number32());
    if (kind == Attribute_Kind::wide)
        return Attribute::of_wide(value.number());
    if (kind == Attribute_Kind::bytes)
        return Attribute::of_bytes(value.bytes());
    if (value.text().size() > max_attribute)
        value.fail("longer than " + std::to_string(max_attribute) + " bytes");
    return Attribute::of_text(value.text());
}

Feature read_feature(const Node& value) {
    Feature feature;
    if (value.is(Value::Kind::object)) {
        value.expect_object({"status"});
        feature.status = value.number32("status", AX_STATUS_ERROR);
    } else {
        feature.value = value.number32();
    }
    return feature;
}

Function read_function(const Node& values) {
    Function function;
    const Type& type = read_type(values);
    read_identity(values, function);
    function.special_features = values.number32("specialFeatures", type.special_features);
    derive_attributes(values, function);
    read_attributes(values, "adapterAttributes", adapter_attribute_identifiers(),
                    function.adapter_attributes);
    read_attributes(values, "portAttributes", port_attribute_identifiers(),
                    function.port_attributes);
    read_statistics(values, function);
    read_features(values, function);
    read_records(values, function);
    read_changes(values, function);
    read_san(values, type.in_hba_api, function);
    read_iscsi(values, function);
    return function;
}

} // namespace vlnsim
