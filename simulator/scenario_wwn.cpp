// What can be done to a port's names, and the virtual ports that it carries.
#include "simulator/scenario.h"

#include <algorithm>
#include <iterator>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_virtual_ports = 65536;

constexpr std::string_view words[] = {"nonVolatile", "volatile", "reboot", "reset", "readOnly"};
constexpr std::uint32_t bits[] = {AX_WWN_CAN_CHANGE_NON_VOLATILE, AX_WWN_CAN_CHANGE_VOLATILE,
                                  AX_WWN_NEEDS_REBOOT, AX_WWN_NEEDS_RESET, AX_WWN_READ_ONLY};

std::uint32_t read_capability(const Node& values) {
    std::uint32_t capability = 0;
    for (const Node& node : values.items_or_self()) {
        const std::string word = node.text();
        const auto found = std::find(std::begin(words), std::end(words), word);
        if (found == std::end(words))
            node.fail("unknown capability \"" + word + "\"; " + known_list(words));
        capability |= bits[found - std::begin(words)];
    }
    return capability;
}

Name_Pair read_pair(const Node& values, const Name_Pair& otherwise) {
    values.expect_object({"wwpn", "wwnn"});
    const auto wwpn = values.member("wwpn");
    const auto wwnn = values.member("wwnn");
    return {wwpn ? wwpn->wwn() : otherwise.wwpn, wwnn ? wwnn->wwn() : otherwise.wwnn};
}

} // namespace

void read_name_management(const Node& values, Function& function) {
    values.expect_object({"can", "factory", "nonVolatile", "volatile", "busy"});
    const Name_Pair current{function.wwpn, function.wwnn};
    Name_Management management;
    if (const auto can = values.member("can"))
        management.capability = read_capability(*can);
    management.busy = values.number32("busy", 0);
    const auto factory = values.member("factory");
    management.factory = factory ? read_pair(*factory, current) : current;
    const auto non_volatile = values.member("nonVolatile");
    function.non_volatile_names = non_volatile ? read_pair(*non_volatile, current) : current;
    if (const auto node = values.member("volatile"))
        function.volatile_names = read_pair(*node, current);
    function.name_management = management;
}

std::vector<AX_VPort> read_virtual_ports(const Node& values) {
    std::vector<AX_VPort> ports;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "wwpn", "wwnn"});
        const std::uint64_t count = row.number("count", 1, max_virtual_ports);
        for (std::uint64_t i = 0; i < count; ++i) {
            const Scope scope = row.scope().with("vport", ports.size());
            const Node port(row.value(), scope);
            const auto wwpn = port.member("wwpn");
            if (!wwpn)
                row.fail("\"wwpn\" is wanted: the port name, 16 hexadecimal digits");
            const auto wwnn = port.member("wwnn");
            AX_VPort entry{};
            put_name(wwpn->wwn(), entry.wwpn.byte);
            put_name((wwnn ? wwnn : wwpn)->wwn(), entry.wwnn.byte);
            ports.push_back(entry);
        }
    }
    return ports;
}

} // namespace vlnsim
