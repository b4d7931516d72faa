// What an iSCSI function sees: targets with their logical units, and the sessions with them.
#include "simulator/scenario.h"

#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_targets = 4096;
constexpr std::uint64_t max_sessions = 1024;
constexpr std::uint16_t iscsi_port = 3260;
constexpr std::uint16_t isns_port = 3205;
constexpr std::uint64_t max_isid = 0xFFFFFFFFFFFF; // 48 bits
constexpr std::string_view default_target = "198.51.100.200";

// Keys of a unit; at a target they hold for all its units.
constexpr std::string_view unit_keys[] = {"type",         "types",      "vendor",   "product",
                                          "revision",     "serial",     "words",    "silent",
                                          "osDeviceName", "blockCount", "blockSize"};

// A text field of a record, from a text or from any bytes. The bytes may fill it to its end.
template <std::size_t size>
void put_field(const Node& values, std::string_view key, const std::string& otherwise,
               char (&field)[size]) {
    const auto node = values.member(key);
    if (node && node->is(Value::Kind::object)) {
        node->expect_object({"bytes"});
        const auto bytes = node->member("bytes");
        if (!bytes || bytes->bytes().size() > size)
            node->fail("\"bytes\" are wanted, " + std::to_string(size) + " of them at most");
        const Bytes content = bytes->bytes();
        std::memcpy(field, content.data(), content.size());
        if (content.size() < size)
            field[content.size()] = 0;
        return;
    }
    const std::string text = node ? node->text() : otherwise;
    if (text.size() >= size)
        values.fail("\"" + std::string(key) + "\" is longer than " + std::to_string(size - 1) +
                    " bytes");
    copy_text(text, field, size);
}

std::uint32_t name_or_number(const Node& node, std::span<const std::string_view> names) {
    if (node.is(Value::Kind::number))
        return node.number32();
    const std::string name = node.text();
    const auto it = std::find(names.begin(), names.end(), name);
    if (it == names.end())
        node.fail("unknown name \"" + name + "\"; " + known_list(names));
    return static_cast<std::uint32_t>(it - names.begin());
}

std::uint32_t name_or_number(const Node& values, std::string_view key,
                             std::span<const std::string_view> names) {
    const auto node = values.member(key);
    return node ? name_or_number(*node, names) : 0;
}

// "192.0.2.1", "192.0.2.1:3261", "2001:db8::1" or "[2001:db8::1]:3261".
void read_portal(const Node& node, std::uint16_t port, AX_IPAddress& portal) {
    const std::string text = node.text();
    std::string address = text;
    std::string number;
    const auto bracket = text.find(']');
    if (text.starts_with('[') && bracket != std::string::npos) {
        address = text.substr(1, bracket - 1);
        number = text.substr(std::min(bracket + 2, text.size()));
    } else if (std::count(text.begin(), text.end(), ':') == 1) {
        address = text.substr(0, text.find(':'));
        number = text.substr(text.find(':') + 1);
    }
    const auto parsed = number.empty() ? port : parse_number(number);
    if (!parse_address(address, portal) || !parsed || *parsed > 0xFFFF)
        node.fail("\"" + text + "\" is no address with or without a port");
    portal.tcpPort = static_cast<std::uint16_t>(*parsed);
}

iSCSI_Unit read_unit(const Node& values, std::uint64_t target, std::uint64_t lun) {
    iSCSI_Unit unit;
    const std::uint8_t type = read_device_type(values, lun);
    const bool blocks = has_capacity(type);
    const std::string number = std::to_string(lun);
    soil(&unit.entry, 0, sizeof unit.entry);
    unit.entry.number = static_cast<std::uint32_t>(lun);
    put_field(values, "words", number, unit.entry.text);
    AX_iSCSI_LunProperties& properties = unit.properties;
    soil(&properties, 0, sizeof properties);
    properties.number = unit.entry.number;
    properties.deviceType = type;
    properties.blockCount = values.number("blockCount", blocks ? 0x200000 : 0);
    properties.blockSize = values.number32("blockSize", blocks ? 512 : 0);
    put_field(values, "vendor", "VORLAN", properties.vendor);
    put_field(values, "product", "SIMULATED UNIT", properties.product);
    put_field(values, "revision", "1.00", properties.revision);
    put_field(values, "serial", "T" + std::to_string(target) + "L" + number,
              properties.serialNumber);
    put_field(values, "osDeviceName", "", properties.osDeviceName);
    unit.silent = values.boolean("silent", false);
    return unit;
}

// A session on its way from its row to the records.
struct Session_Row {
    const Node& values;
    const Function& function;
    std::uint32_t id;     // on the function
    std::uint32_t number; // with its target, from 1
};

void read_identity(const Session_Row& row, AX_iSCSI_SessionInfo& info) {
    static constexpr std::string_view states[] = {"open",        "closed",   "loginInProgress",
                                                  "loginFailed", "recovery", "deleted"};
    const Node& values = row.values;
    info.state = name_or_number(values, "state", states);
    const bool ended =
        info.state == AX_ISCSI_SESSION_CLOSED || info.state == AX_ISCSI_SESSION_DELETED;
    const bool logging_in = info.state == AX_ISCSI_SESSION_LOGIN_IN_PROGRESS ||
                            info.state == AX_ISCSI_SESSION_LOGIN_FAILED;
    info.closed = values.boolean("closed", ended);
    info.isidQualifier = values.number32("isidQualifier", row.number);
    info.isid = values.number("isid", isid_base + info.isidQualifier, max_isid);
    info.tsih =
        static_cast<std::uint16_t>(values.number("tsih", logging_in ? 0 : row.number, 0xFFFF));
}

void read_connection(const Session_Row& row, AX_iSCSI_SessionInfo& info) {
    static constexpr std::string_view states[] = {"connected", "closed"};
    const Node& values = row.values;
    info.connectionState = name_or_number(values, "connectionState", states);
    info.connectionId = values.number32("connectionId", 0);
    const bool connected = info.connectionState == AX_ISCSI_CONNECTION_CONNECTED && !info.closed;
    info.connectionCount = values.number32("connections", connected);
    info.authenticationMethod = read_authentication(values);
    info.tcpMSS = values.number32("tcpMSS", 1460);
    info.maxSendDataSegmentLength = values.number32("maxSendDataSegmentLength", 65536);
    const auto source_port = static_cast<std::uint16_t>(first_dynamic_port + row.id);
    if (const auto portal = values.member("initiatorPortal")) {
        read_portal(*portal, source_port, info.initiatorAddress);
    } else if (row.function.network) {
        info.initiatorAddress = row.function.network->address;
        info.initiatorAddress.tcpPort = source_port;
    }
    parse_address(std::string(default_target), info.targetAddress);
    info.targetAddress.tcpPort = iscsi_port;
    if (const auto portal = values.member("targetPortal")) {
        info.targetAddress = {};
        read_portal(*portal, iscsi_port, info.targetAddress);
    }
    if (const auto portal = values.member("redirectPortal"))
        read_portal(*portal, iscsi_port, info.redirectAddress);
}

void read_counters(const Node& values, AX_iSCSI_SessionInfo& info) {
    const auto counters = values.member("counters");
    if (!counters)
        return;
    counters->expect_object({"bytesTransferred", "bytesReceived", "commandPDUs", "responsePDUs",
                             "digestErrors", "connectionTimeoutErrors"});
    info.bytesTransferred = counters->number("bytesTransferred", 0);
    info.bytesReceived = counters->number("bytesReceived", 0);
    info.commandPDUs = counters->number("commandPDUs", 0);
    info.responsePDUs = counters->number("responsePDUs", 0);
    info.digestErrors = counters->number32("digestErrors", 0);
    info.connectionTimeoutErrors = counters->number32("connectionTimeoutErrors", 0);
}

iSCSI_Session read_session(const Session_Row& row) {
    static constexpr std::string_view types[] = {"normal", "discovery"};
    const Node& values = row.values;
    iSCSI_Session session;
    AX_iSCSI_SessionInfo& info = session.info;
    read_identity(row, info);
    read_connection(row, info);
    info.sessionType = name_or_number(values, "type", types);
    info.targetPortalGroup = values.number32("targetPortalGroup", 1);
    info.bootSession = values.boolean("boot", false);
    info.durationSeconds = values.number32("duration", 0);
    put_field(values, "targetAlias", "", info.targetAlias);
    if (row.function.initiator)
        info.negotiated = row.function.initiator->loginOptions;
    if (const auto negotiated = values.member("negotiated"))
        read_login_options(*negotiated, info.negotiated);
    read_counters(values, info);
    session.entry = session_entry(info, values.number32("id", row.id));
    return session;
}

void read_sessions(const Node& values, const Function& function, std::uint32_t& next_id,
                   iSCSI_Target& target) {
    const auto sessions = values.member("sessions");
    if (!sessions)
        return;
    for (const Node& row : sessions->items_or_self()) {
        row.expect_object({"count",
                           "id",
                           "state",
                           "closed",
                           "isid",
                           "isidQualifier",
                           "tsih",
                           "type",
                           "connectionState",
                           "connectionId",
                           "connections",
                           "authentication",
                           "tcpMSS",
                           "maxSendDataSegmentLength",
                           "initiatorPortal",
                           "targetPortal",
                           "redirectPortal",
                           "targetPortalGroup",
                           "boot",
                           "duration",
                           "targetAlias",
                           "negotiated",
                           "counters"});
        const std::uint64_t count = row.number("count", 1, max_sessions);
        for (std::uint64_t i = 0; i < count; ++i) {
            const auto number = static_cast<std::uint32_t>(target.sessions.size() + 1);
            target.sessions.push_back(read_session({row, function, next_id++, number}));
        }
    }
}

constexpr std::string_view account_keys[] = {"authentication", "targetCHAPName", "targetSecret",
                                             "initiatorCHAPName", "initiatorSecret"};

// What a target is wherever it stands.
iSCSI_Target read_target(const Node& values, std::uint64_t number) {
    iSCSI_Target target;
    soil(&target.entry, 0, sizeof target.entry);
    put_field(values, "name", "iqn.2010-04.com.example:target" + std::to_string(number),
              target.entry.name);
    read_unit_rows(values, unit_keys, [&](const Node&, const Node& unit, std::uint64_t lun) {
        target.units.push_back(read_unit(unit, number, lun));
    });
    target.wanted = read_account(values);
    target.alias = values.text("alias", "");
    if (const auto options = values.member("loginOptions")) {
        // What is not told is whatever is offered.
        target.limits.emplace();
        std::memset(&*target.limits, 0xFF, sizeof *target.limits);
        target.limits->defaultTime2Wait = 0;
        target.limits->initialR2T = 0;
        target.limits->dataPDUInOrder = 0;
        target.limits->dataSequenceInOrder = 0;
        read_login_options(*options, *target.limits);
    }
    target.entry.flags = 0;
    return target;
}

iSCSI_Target read_known_target(const Node& values, const Function& function, std::uint64_t number,
                               std::uint32_t& next_id) {
    iSCSI_Target target = read_target(values, number);
    read_sessions(values, function, next_id, target);
    std::uint64_t flags = target.sessions.empty() ? 0 : AX_ISCSI_TARGET_HAS_SESSIONS;
    if (values.boolean("boot", false))
        flags |= AX_ISCSI_TARGET_BOOT;
    target.entry.flags = static_cast<std::uint8_t>(values.number("flags", flags, 0xFF));
    if (function.initiator)
        target.login.options = function.initiator->loginOptions;
    return target;
}

// Calls add(values, number) for each target of a row of targets, or of a list of rows.
template <class Add>
void read_target_rows(const Node& rows, std::initializer_list<std::string_view> own, Add add) {
    std::uint64_t number = 0;
    for (const Node& row : rows.items_or_self()) {
        std::vector<std::string_view> known = joined_keys(unit_keys, own);
        known.insert(known.end(), std::begin(account_keys), std::end(account_keys));
        known.insert(known.end(), {"count", "name", "luns", "alias", "loginOptions"});
        row.expect_object(known);
        const std::uint64_t count = row.number("count", 1, max_targets);
        for (std::uint64_t i = 0; i < count; ++i, ++number) {
            const Scope scope = row.scope().with("target", number);
            add(Node(row.value(), scope), number);
        }
    }
}

iSCSI_Portal read_network_portal(const Node& values) {
    values.expect_object(joined_keys(account_keys, {"address", "targets"}));
    iSCSI_Portal portal;
    const auto address = values.member("address");
    if (!address)
        values.fail("\"address\" is wanted");
    read_portal(*address, iscsi_port, portal.address);
    portal.wanted = read_account(values);
    if (const auto targets = values.member("targets"))
        read_target_rows(*targets, {}, [&](const Node& target, std::uint64_t number) {
            portal.targets.push_back(read_target(target, number));
        });
    return portal;
}

} // namespace

iSCSI_Network read_iscsi_network(const Node& values) {
    values.expect_object({"portals", "hosts"});
    iSCSI_Network network;
    if (const auto portals = values.member("portals"))
        for (const Node& portal : portals->items_or_self())
            network.portals.push_back(read_network_portal(portal));
    if (const auto hosts = values.member("hosts"))
        for (const Node& host : hosts->items_or_self()) {
            host.expect_object({"address", "answers"});
            AX_IPAddress address{};
            if (!parse_address(host.text("address", ""), address))
                host.fail("\"address\" is wanted");
            network.hosts.emplace_back(address, host.boolean("answers", true));
        }
    return network;
}

Name_Servers read_name_servers(const Node& values) {
    values.expect_object({"enabled", "servers"});
    Name_Servers servers;
    servers.enabled = values.boolean("enabled", false);
    if (const auto list = values.member("servers"))
        for (const Node& server : list->items_or_self()) {
            AX_IPAddress address{};
            read_portal(server, isns_port, address);
            servers.list.push_back(address);
        }
    return servers;
}

std::vector<iSCSI_Target> read_iscsi_targets(const Node& values, const Function& function) {
    std::vector<iSCSI_Target> targets;
    std::uint32_t next_id = 1;
    read_target_rows(values, {"sessions", "boot", "flags"},
                     [&](const Node& target, std::uint64_t number) {
                         targets.push_back(read_known_target(target, function, number, next_id));
                     });
    return targets;
}

} // namespace vlnsim
