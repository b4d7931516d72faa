// What can be done to a port's names.
#include "simulator/scenario.h"

#include <algorithm>
#include <iterator>

namespace vlnsim {
namespace {

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

} // namespace vlnsim
