// How the diagnostic tests of a function go: numbers by name, which may be changed at run time.
#include "simulator/scenario.h"

#include <algorithm>

namespace vlnsim {
namespace {

struct Row {
    std::string_view name;
    std::uint32_t& (*value)(Diagnostics& diagnostics);
};

template <auto member>
std::uint32_t& value_of(Diagnostics& diagnostics) {
    return diagnostics.*member;
}

template <auto member, std::size_t pair>
std::uint32_t& pair_value(Diagnostics& diagnostics) {
    return (diagnostics.*member)[pair];
}

constexpr Row rows[] = {
    {"pendingTime", value_of<&Diagnostics::pending_time>},
    {"cycleTime", value_of<&Diagnostics::cycle_time>},
    {"endless", value_of<&Diagnostics::endless>},
    {"busy", value_of<&Diagnostics::busy>},
    {"plug", value_of<&Diagnostics::plug>},
    {"result", value_of<&Diagnostics::result>},
    {"failsAt", value_of<&Diagnostics::fails_at>},
    {"errorCycles", value_of<&Diagnostics::error_cycles>},
    {"transmitErrors", value_of<&Diagnostics::transmit_errors>},
    {"receiveErrors", value_of<&Diagnostics::receive_errors>},
    {"runningStatus", value_of<&Diagnostics::running_status>},
    {"endState", value_of<&Diagnostics::end_state>},
    {"cancelStatus", value_of<&Diagnostics::cancel_status>},
    {"cancelTime", value_of<&Diagnostics::cancel_time>},
    {"pairAState", pair_value<&Diagnostics::pair_state, 0>},
    {"pairALength", pair_value<&Diagnostics::pair_length, 0>},
    {"pairBState", pair_value<&Diagnostics::pair_state, 1>},
    {"pairBLength", pair_value<&Diagnostics::pair_length, 1>},
    {"pairCState", pair_value<&Diagnostics::pair_state, 2>},
    {"pairCLength", pair_value<&Diagnostics::pair_length, 2>},
    {"pairDState", pair_value<&Diagnostics::pair_state, 3>},
    {"pairDLength", pair_value<&Diagnostics::pair_length, 3>},
};

} // namespace

Diagnostics read_diagnostics(const Node& values) {
    Diagnostics diagnostics;
    values.expect_any_object();
    for (const auto& [name, value] : values.value().members)
        set_diagnostic(diagnostics, name, Node(value, values.scope()));
    return diagnostics;
}

void set_diagnostic(Diagnostics& diagnostics, const std::string& name, const Node& value) {
    std::vector<std::string_view> known;
    for (const Row& row : rows) {
        if (row.name == name) {
            row.value(diagnostics) =
                value.is(Value::Kind::boolean) ? value.boolean() : value.number32();
            return;
        }
        known.push_back(row.name);
    }
    value.fail("unknown name; " + known_list(known));
}

std::vector<std::pair<std::string_view, std::uint32_t>> list_diagnostics(Diagnostics diagnostics) {
    std::vector<std::pair<std::string_view, std::uint32_t>> values;
    for (const Row& row : rows)
        values.emplace_back(row.name, row.value(diagnostics));
    return values;
}

} // namespace vlnsim
