#include "simulator/state_iscsi.h"

#include "simulator/call.h"
#include "simulator/state.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

using Json = nlohmann::ordered_json;

constexpr std::string_view enabled_key = "enabled";

template <class Record>
Json record_to_json(const Record& record) {
    return hexadecimal(&record, sizeof record);
}

template <class Record>
void read_record(const Node& node, Record& record) {
    std::memcpy(&record, node.bytes(sizeof record).data(), sizeof record);
}

template <class Record>
void read_record(const Node& values, std::string_view key, Record& record) {
    if (const auto node = values.member(key))
        read_record(*node, record);
}

std::string portal_key(const AX_IPAddress& portal) {
    return hexadecimal(&portal, sizeof portal);
}

AX_IPAddress read_portal_key(const std::string& key, const Node& value) {
    AX_IPAddress portal{};
    std::vector<std::uint8_t> bytes;
    for (std::size_t i = 0; i + 1 < key.size(); i += 2)
        bytes.push_back(
            static_cast<std::uint8_t>(parse_number("0x" + key.substr(i, 2)).value_or(0)));
    if (bytes.size() != sizeof portal)
        value.fail("a portal is wanted as a key, " + std::to_string(sizeof portal) +
                   " bytes in hexadecimal");
    std::memcpy(&portal, bytes.data(), sizeof portal);
    return portal;
}

Json target_to_json(const iSCSI_Target& target) {
    Json sessions = Json::array();
    for (const iSCSI_Session& session : target.sessions)
        sessions.push_back(
            {{"id", session.entry.sessionId}, {"info", record_to_json(session.info)}});
    return {{"flags", target.entry.flags},
            {"login", record_to_json(target.login)},
            {"portal", record_to_json(target.portal)},
            {"discovered", target.discovered},
            {"listsUnits", target.lists_units},
            {"eto", target.eto},
            {"sessions", std::move(sessions)}};
}

void read_target(const Node& values, iSCSI_Target& target) {
    values.expect_object(
        {"flags", "login", "portal", "discovered", "listsUnits", "eto", "sessions"});
    target.entry.flags =
        static_cast<std::uint8_t>(values.number("flags", target.entry.flags, 0xFF));
    read_record(values, "login", target.login);
    read_record(values, "portal", target.portal);
    target.discovered = values.boolean("discovered", target.discovered);
    target.lists_units = values.boolean("listsUnits", target.lists_units);
    target.eto = values.number32("eto", target.eto);
    const auto sessions = values.member("sessions");
    if (!sessions)
        return;
    target.sessions.clear();
    for (const Node& row : sessions->items()) {
        row.expect_object({"id", "info"});
        iSCSI_Session session;
        read_record(row, "info", session.info);
        session.entry = session_entry(session.info, row.number32("id", 0));
        target.sessions.push_back(session);
    }
}

} // namespace

Json list_iscsi_targets(const Function& function) {
    Json values = Json::object();
    for (const iSCSI_Target& target : function.iscsi_targets)
        values[target.name()] = target_to_json(target);
    return values;
}

// The network of the running host tells what a target is that came since.
void set_iscsi_target(Function& function, const std::string& name, const Node& value) {
    auto& targets = function.iscsi_targets;
    if (value.is(Value::Kind::null)) {
        std::erase_if(targets, [&](const iSCSI_Target& each) { return each.name() == name; });
        return;
    }
    iSCSI_Target* target = find_target(function, name);
    if (!target)
        target = &targets.emplace_back(
            new_target(Simulator::instance().host.iscsi_network, function, name, {}));
    read_target(value, *target);
}

Json list_send_target_portals(const Function& function) {
    Json values = Json::object();
    for (const Send_Target_Portal& portal : function.send_target_portals)
        values[portal_key(portal.address)] = record_to_json(portal.login);
    return values;
}

void set_send_target_portal(Function& function, const std::string& key, const Node& value) {
    Send_Target_Portal portal{read_portal_key(key, value), {}};
    auto& portals = function.send_target_portals;
    std::erase_if(portals,
                  [&](const auto& each) { return same_portal(each.address, portal.address); });
    if (value.is(Value::Kind::null))
        return;
    read_record(value, portal.login);
    portals.push_back(portal);
}

Json list_name_servers(const Function& function) {
    Json values = Json::object();
    for (const AX_IPAddress& server : function.name_servers.list)
        values[portal_key(server)] = true;
    values[std::string(enabled_key)] = function.name_servers.enabled;
    return values;
}

void set_name_server(Function& function, const std::string& key, const Node& value) {
    Name_Servers& servers = function.name_servers;
    if (key == enabled_key) {
        servers.enabled = value.number32();
        return;
    }
    const AX_IPAddress server = read_portal_key(key, value);
    std::erase_if(servers.list, [&](const auto& each) { return same_portal(each, server); });
    if (!value.is(Value::Kind::null) && value.boolean())
        servers.list.push_back(server);
}

} // namespace vlnsim
