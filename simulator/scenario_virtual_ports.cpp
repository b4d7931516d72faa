// The virtual ports that a function carries: rows, each of which may stand for several.
#include "simulator/scenario.h"

#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_virtual_ports = 65536;
constexpr std::uint32_t port_is_up = 2;

std::uint64_t read_name(const Node& values, std::string_view key, std::uint64_t otherwise) {
    const auto name = values.member(key);
    return name ? name->wwn() : otherwise;
}

Virtual_Machine read_machine(const Node& values) {
    values.expect_object({"id", "name", "operatingSystem"});
    Virtual_Machine machine;
    machine.name = values.wild_text("name", "");
    machine.id = values.text("id", machine.name).substr(0, sizeof AX_VM::id - 1);
    machine.operating_system = values.wild_text("operatingSystem", "");
    return machine;
}

Virtual_Port read_virtual_port(const Node& values) {
    const auto wwpn = values.member("wwpn");
    if (!wwpn)
        values.fail("\"wwpn\" is wanted: the port name, 16 hexadecimal digits");
    Virtual_Port port;
    put_name(wwpn->wwn(), port.names.wwpn.byte);
    put_name(read_name(values, "wwnn", wwpn->wwn()), port.names.wwnn.byte);
    AX_VPortAttributes& attributes = port.attributes;
    attributes.wwpn = port.names.wwpn;
    attributes.wwnn = port.names.wwnn;
    put_name(read_name(values, "fabric", 0), attributes.fabricName.byte);
    attributes.fcId = values.number32("fcId", 0);
    attributes.state = values.number32("state", port_is_up);
    const std::string name = values.wild_text("name", "");
    if (name.size() > sizeof attributes.name)
        values.member("name")->fail("longer than " + std::to_string(sizeof attributes.name) +
                                    " bytes");
    std::memcpy(attributes.name, name.data(), name.size()); // needs no NUL
    if (const auto machine = values.member("machine"))
        port.machine = read_machine(*machine);
    if (const auto targets = values.member("targets"))
        port.targets = read_targets(*targets);
    return port;
}

} // namespace

std::vector<Virtual_Port> read_virtual_ports(const Node& values) {
    std::vector<Virtual_Port> ports;
    for (const Node& row : values.items()) {
        row.expect_object(
            {"count", "wwpn", "wwnn", "fabric", "fcId", "state", "name", "machine", "targets"});
        const std::uint64_t count = row.number("count", 1, max_virtual_ports);
        for (std::uint64_t i = 0; i < count; ++i) {
            const Scope scope = row.scope().with("vport", ports.size());
            ports.push_back(read_virtual_port(Node(row.value(), scope)));
        }
    }
    return ports;
}

} // namespace vlnsim
