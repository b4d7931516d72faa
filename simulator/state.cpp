#include "simulator/state.h"

#include "simulator/scenario.h"
#include "simulator/state_iscsi.h"

#include <algorithm>
#include <concepts>
#include <cstdio>
#include <cstring>
#include <nlohmann/json.hpp>

namespace vlnsim {
namespace {

using Json = nlohmann::ordered_json;

// ---- A value as JSON, and back ----

template <class Record>
concept Library_Record = std::is_class_v<Record> && std::is_trivially_copyable_v<Record>;

Json to_json(const std::string& text) {
    return text;
}

template <std::unsigned_integral Number>
Json to_json(Number number) {
    return number;
}

// The records have fixed widths, so their bytes mean the same to both word sizes.
template <Library_Record Record>
Json to_json(const Record& record) {
    return hexadecimal(&record, sizeof record);
}

template <Library_Record Record>
Json to_json(const std::vector<Record>& records) {
    Json list = Json::array();
    for (const Record& record : records)
        list.push_back(to_json(record));
    return list;
}

template <class Value>
Json to_json(const std::optional<Value>& value) {
    return value ? to_json(*value) : Json(nullptr);
}

template <std::unsigned_integral Number>
void from_json(const Node& node, Number& number) {
    number = static_cast<Number>(node.number(std::numeric_limits<Number>::max()));
}

void from_json(const Node& node, std::string& text) {
    text = node.text();
}

template <Library_Record Record>
void from_json(const Node& node, Record& record) {
    std::memcpy(&record, node.bytes(sizeof record).data(), sizeof record);
}

template <Library_Record Record>
void from_json(const Node& node, std::vector<Record>& records) {
    records.clear();
    for (const Node& each : node.items())
        from_json(each, records.emplace_back());
}

template <class Value>
void from_json(const Node& node, std::optional<Value>& value) {
    if (node.is(vlnsim::Value::Kind::null))
        value.reset();
    else
        from_json(node, value.emplace());
}

// ---- Pieces of a function's state ----

// One key of a function in a state.
struct Piece {
    std::string_view name;
    // Nothing: as described.
    std::optional<Json> (*change)(const Function& now, const Function& described);
    void (*apply)(Function& function, const Node& value);
    // One value of a table; null for a piece that has no parts.
    void (*set)(Function& function, const std::string& name, const Node& value);
};

// A member as a whole: a number, a record, either of them where it may be missing, or a list of
// records.
template <auto member>
constexpr Piece whole(std::string_view name) {
    return {name,
            [](const Function& now, const Function& described) -> std::optional<Json> {
                Json value = to_json(now.*member);
                if (value == to_json(described.*member))
                    return std::nullopt;
                return value;
            },
            [](Function& function, const Node& value) { from_json(value, function.*member); },
            nullptr};
}

// The same of a part that a function may lack; one without it has nothing to change.
template <auto part, auto member>
constexpr Piece of_part(std::string_view name) {
    return {name,
            [](const Function& now, const Function& described) -> std::optional<Json> {
                if (!(now.*part) || !(described.*part))
                    return std::nullopt;
                Json value = to_json((*(now.*part)).*member);
                if (value == to_json((*(described.*part)).*member))
                    return std::nullopt;
                return value;
            },
            [](Function& function, const Node& value) {
                if (!(function.*part))
                    value.fail("the function has no such part");
                from_json(value, (*(function.*part)).*member);
            },
            nullptr};
}

// Values by name, each of which changes by itself. list(function) gives them as a JSON object.
template <Json (*list)(const Function&), void (*set)(Function&, const std::string&, const Node&)>
constexpr Piece table(std::string_view name) {
    return {name,
            [](const Function& now, const Function& described) -> std::optional<Json> {
                const Json values = list(now), before = list(described);
                Json changed = Json::object();
                for (const auto& [key, value] : values.items())
                    if (!before.contains(key) || before[key] != value)
                        changed[key] = value;
                for (const auto& [key, value] : before.items())
                    if (!values.contains(key))
                        changed[key] = nullptr;
                return changed.empty() ? std::nullopt : std::optional(changed);
            },
            [](Function& function, const Node& values) {
                values.expect_any_object();
                for (const auto& [key, value] : values.value().members)
                    set(function, key, Node(value, values.scope()));
            },
            set};
}

using Identifiers = std::span<const Identifier> (*)();

std::string key_of(Identifiers identifiers, std::uint32_t number) {
    const Identifier* known = find_identifier(identifiers(), number);
    return known ? std::string(known->name) : std::to_string(number);
}

// A text of plain characters as such, all else as bytes.
Json text_or_bytes(const std::string& text, const Bytes& bytes) {
    std::string escaped;
    for (const char c : text) {
        if (c < ' ' || c > '~')
            return {{"bytes", hexadecimal(bytes.data(), bytes.size())}};
        escaped += c == '{' ? "{{" : std::string(1, c); // a brace begins a placeholder
    }
    return escaped;
}

// As read_attribute takes it: what is of the kind of its identifier as such, all else as bytes.
Json attribute_to_json(const Attribute& attribute, const Identifier* identifier) {
    const bool ends_with_nul = attribute.bytes.size() == attribute.length + std::size_t{1};
    const Attribute_Kind kind = identifier      ? identifier->kind
                                : ends_with_nul ? Attribute_Kind::text
                                                : Attribute_Kind::bytes;
    if (kind == Attribute_Kind::number && attribute.bytes.size() == sizeof(std::uint32_t))
        return attribute.number();
    if (kind == Attribute_Kind::wide && attribute.bytes.size() == sizeof(std::uint64_t))
        return attribute.wide();
    if (kind == Attribute_Kind::text && ends_with_nul)
        return text_or_bytes({attribute.bytes.begin(), attribute.bytes.end() - 1}, attribute.bytes);
    return {{"bytes", hexadecimal(attribute.bytes.data(), attribute.bytes.size())}};
}

template <auto map, Identifiers identifiers>
Json list_attributes(const Function& function) {
    Json values = Json::object();
    for (const auto& [number, attribute] : function.*map)
        values[key_of(identifiers, number)] =
            attribute_to_json(attribute, find_identifier(identifiers(), number));
    return values;
}

template <auto map, Identifiers identifiers>
void set_attribute(Function& function, const std::string& name, const Node& value) {
    const std::uint32_t number = read_identifier(value, name, identifiers());
    const auto identifier = static_cast<std::uint16_t>(number);
    if (value.is(Value::Kind::null))
        (function.*map).erase(identifier);
    else
        (function.*map)[identifier] = read_attribute(value, find_identifier(identifiers(), number));
}

Json list_statistics(const Function& function) {
    Json values = Json::object();
    for (const auto& [number, value] : function.statistics)
        values[key_of(statistic_identifiers, number)] = value;
    return values;
}

void set_statistic(Function& function, const std::string& name, const Node& value) {
    const auto number =
        static_cast<std::uint16_t>(read_identifier(value, name, statistic_identifiers()));
    if (value.is(Value::Kind::null))
        function.statistics.erase(number);
    else
        function.statistics[number] = value.number();
}

Json list_features(const Function& function) {
    Json values = Json::object();
    for (const auto& [number, feature] : function.features)
        values[key_of(feature_identifiers, number)] =
            feature.status == AX_STATUS_OK ? Json(feature.value) : Json{{"status", feature.status}};
    return values;
}

void set_feature(Function& function, const std::string& name, const Node& value) {
    const std::uint32_t number = read_identifier(value, name, feature_identifiers());
    if (value.is(Value::Kind::null))
        function.features.erase(number);
    else
        function.features[number] = read_feature(value);
}

Json list_vpd(const Function& function) {
    Json values = Json::object();
    for (const auto& [tag, bytes] : function.fru_vpd)
        values[tag] = text_or_bytes({bytes.begin(), bytes.end()}, bytes);
    return values;
}

void set_vpd(Function& function, const std::string& tag, const Node& value) {
    const Bytes bytes = read_vpd_value(value);
    for (auto& [known, entry] : function.fru_vpd)
        if (known == tag) {
            entry = bytes;
            return;
        }
    value.fail("the function has no such entry");
}

template <auto parameters>
Json list_parameters(const Function& function) {
    Json values = Json::object();
    if (function.*parameters)
        for (const Driver_Parameter& each : *(function.*parameters)) {
            const std::uint32_t current = each.record.current;
            values[each.name()] = current == each.kept
                                      ? Json(current)
                                      : Json{{"current", current}, {"kept", each.kept}};
        }
    return values;
}

template <auto parameters>
void set_parameter(Function& function, const std::string& name, const Node& value) {
    set_driver_parameter(function.*parameters, name, value);
}

Json list_unit_priorities(const Function& function) {
    Json values = Json::object();
    if (function.unit_priorities)
        for (const AX_OASLun& each : *function.unit_priorities)
            values[unit_priority_name(each)] = each.state;
    return values;
}

Json list_trace_settings(const Function& function) {
    Json values = Json::object();
    if (function.dumps)
        for (const AX_EventLogModule& each : function.dumps->modules)
            values[std::string(each.name, strnlen(each.name, sizeof each.name))] = to_json(each);
    return values;
}

void set_trace_setting(Function& function, const std::string& name, const Node& value) {
    if (function.dumps)
        for (AX_EventLogModule& each : function.dumps->modules)
            if (name == std::string_view(each.name, strnlen(each.name, sizeof each.name)))
                return from_json(value, each);
    value.fail("the firmware has no such module");
}

Json list_diagnostic_values(const Function& function) {
    Json values = Json::object();
    if (function.diagnostics)
        for (const auto& [name, value] : list_diagnostics(*function.diagnostics))
            values[std::string(name)] = value;
    return values;
}

void set_diagnostic_value(Function& function, const std::string& name, const Node& value) {
    if (!function.diagnostics)
        value.fail("the function has no diagnostics");
    set_diagnostic(*function.diagnostics, name, value);
}

// All that calls can change. A topic that lets callers set something adds its row here.
constexpr Piece PIECES[] = {
    table<list_attributes<&Function::adapter_attributes, adapter_attribute_identifiers>,
          set_attribute<&Function::adapter_attributes, adapter_attribute_identifiers>>(
        "adapterAttributes"),
    table<list_attributes<&Function::port_attributes, port_attribute_identifiers>,
          set_attribute<&Function::port_attributes, port_attribute_identifiers>>("portAttributes"),
    table<list_statistics, set_statistic>("statistics"),
    table<list_features, set_feature>("features"),
    table<list_vpd, set_vpd>("vpd"),
    table<list_parameters<&Function::driver_parameters>,
          set_parameter<&Function::driver_parameters>>("driverParameters"),
    table<list_parameters<&Function::global_driver_parameters>,
          set_parameter<&Function::global_driver_parameters>>("globalDriverParameters"),
    table<list_unit_priorities, set_unit_priority>("unitPriorities"),
    of_part<&Function::dumps, &Dumps::directory>("dumpDirectory"),
    of_part<&Function::dumps, &Dumps::retention>("dumpRetention"),
    of_part<&Function::dumps, &Dumps::stored>("storedDumps"),
    table<list_trace_settings, set_trace_setting>("traceSettings"),
    table<list_diagnostic_values, set_diagnostic_value>("diagnostics"),
    whole<&Function::bridging>("bridging"),
    of_part<&Function::fip, &Fip::connect>("fcfConnectList"),
    of_part<&Function::fip, &Fip::params>("fipParameters"),
    whole<&Function::wwpn>("wwpn"),
    whole<&Function::wwnn>("wwnn"),
    whole<&Function::non_volatile_names>("nonVolatileNames"),
    whole<&Function::volatile_names>("volatileNames"),
    whole<&Function::port_config>("portConfig"),
    whole<&Function::channel_management>("channelManagement"),
    whole<&Function::channels>("channels"),
    whole<&Function::personality>("personality"),
    whole<&Function::beacon>("beacon"),
    whole<&Function::resets>("resets"),
    whole<&Function::initiator>("initiator"),
    whole<&Function::network>("network"),
    whole<&Function::qos>("qos"),
    whole<&Function::arp_table>("arpTable"),
    whole<&Function::route_table>("routeTable"),
    table<list_iscsi_targets, set_iscsi_target>("iscsiTargets"),
    table<list_send_target_portals, set_send_target_portal>("sendTargetPortals"),
    table<list_name_servers, set_name_server>("isns"),
    whole<&Function::iscsi_statistics>("iscsiStatistics"),
};

void apply_pieces(Function& function, const Node& values) {
    std::vector<std::string_view> names;
    for (const Piece& piece : PIECES)
        names.push_back(piece.name);
    values.expect_object(names);
    for (const auto& [name, value] : values.value().members)
        for (const Piece& piece : PIECES)
            if (piece.name == name)
                piece.apply(function, Node(value, values.scope()));
}

// Folders may differ from call to call, the scenario's file may not.
std::string file_name(const std::string& path) {
    return path.substr(path.rfind('/') + 1);
}

} // namespace

std::string hexadecimal(const void* data, std::size_t size) {
    std::string text;
    char pair[4];
    for (std::size_t i = 0; i < size; ++i) {
        std::snprintf(pair, sizeof pair, "%02X", static_cast<const std::uint8_t*>(data)[i]);
        text += pair;
    }
    return text;
}

std::string state_text(const Host& now, const Host& described, const std::string& scenario) {
    Json functions = Json::object();
    for (std::size_t i = 0; i < now.functions.size(); ++i) {
        Json changes = Json::object();
        for (const Piece& piece : PIECES)
            if (auto change = piece.change(now.functions[i], described.functions.at(i)))
                changes[std::string(piece.name)] = std::move(*change);
        if (!changes.empty())
            functions[std::to_string(now.functions[i].instance)] = std::move(changes);
    }
    const Json state = {{"scenario", file_name(scenario)}, {"functions", std::move(functions)}};
    return state.dump(2, ' ', true, Json::error_handler_t::replace) + "\n";
}

void apply_state(Host& host, const std::string& text, const std::string& name,
                 const std::string& scenario) {
    const Value source = parse_source(text, name);
    const Scope scope;
    const Node top(source, scope);
    top.expect_object({"scenario", "functions"});
    const std::string of = top.text("scenario", "");
    if (of != file_name(scenario))
        top.fail("the state of scenario \"" + of + "\" does not go with \"" + file_name(scenario) +
                 "\"");
    const auto functions = top.member("functions");
    if (!functions)
        return;
    functions->expect_any_object();
    for (const auto& [key, value] : functions->value().members) {
        const auto number = parse_number(key);
        const auto found =
            std::find_if(host.functions.begin(), host.functions.end(),
                         [&](const Function& function) { return function.instance == number; });
        if (found == host.functions.end())
            value.fail("the scenario has no function with this instance number");
        apply_pieces(*found, Node(value, scope));
    }
}

void set_value(Function& function, const std::string& table, const std::string& name,
               const Node& value) {
    std::vector<std::string_view> known;
    for (const Piece& piece : PIECES) {
        if (!piece.set)
            continue;
        if (piece.name == table)
            return piece.set(function, name, value);
        known.push_back(piece.name);
    }
    value.fail("unknown table \"" + table + "\"; " + known_list(known));
}

} // namespace vlnsim
