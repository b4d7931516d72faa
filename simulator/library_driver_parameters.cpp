// The parameters of drivers, and the logical units that a driver serves before others.
//
// A change is refused as an adapter would: a parameter that is not known or is fixed, a value out
// of its range, a change for now alone of what the driver reads only as it starts.
#include "simulator/call.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <string_view>

namespace vlnsim {

void restart_driver(Function& function) {
    for (auto parameters : {&Function::driver_parameters, &Function::global_driver_parameters})
        if (function.*parameters)
            for (Driver_Parameter& each : *(function.*parameters))
                each.record.current = each.kept;
}

namespace library {
namespace {

enum : std::uint32_t { control_persistent = 1, control_global = 2, controls = 3 };
constexpr std::uint16_t changeable_fixed = 0;
constexpr std::uint16_t changeable_at_once = 1;
constexpr std::size_t max_text = 255; // "name=value"

using Parameters = std::optional<Driver_Parameters> Function::*;

AX_STATUS answer_parameters(Call& call, AX_WWN wwn, AX_DriverParam* table, uint32_t* count,
                            Parameters parameters) {
    if (call.null(table, "table") || call.null(count, "count"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!(function->*parameters))
        return AX_STATUS_NOT_SUPPORTED;
    const Driver_Parameters& all = *(function->*parameters);
    auto needed = static_cast<std::uint32_t>(all.size());
    call.out("room", *count);
    const bool too_small = call.too_small(*count, needed);
    if (!too_small) {
        std::transform(all.begin(), all.end(), table,
                       [](const Driver_Parameter& each) { return each.record; });
        soil(table, needed * sizeof *table, *count * sizeof *table);
    }
    *count = needed;
    call.out("count", *count);
    return too_small ? AX_STATUS_LIST_TOO_SMALL : AX_STATUS_OK;
}

// ---- Changes of parameters ----

Driver_Parameter* find_parameter(Function& function, Parameters parameters, std::string_view name) {
    if (function.*parameters)
        for (Driver_Parameter& each : *(function.*parameters))
            if (each.name() == name)
                return &each;
    return nullptr;
}

// A decimal number that fits in 32 bits, with or without a sign.
std::optional<std::uint32_t> read_value(std::string_view text) {
    std::int64_t value = 0;
    const char* const end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, value);
    if (text.empty() || read.ec != std::errc() || read.ptr != end || value < INT32_MIN ||
        value > UINT32_MAX)
        return std::nullopt;
    return static_cast<std::uint32_t>(value);
}

AX_STATUS check_change(const Driver_Parameter& parameter, std::optional<std::uint32_t> value,
                       bool persistent) {
    const AX_DriverParam& record = parameter.record;
    if (record.changeableType == changeable_fixed)
        return parameter_fixed;
    if (!persistent && record.changeableType != changeable_at_once)
        return parameter_not_while_running;
    if (!value || *value < record.minimum || *value > record.maximum)
        return parameter_out_of_range;
    return parameter.status;
}

void set(Driver_Parameter* parameter, std::uint32_t value, bool persistent) {
    if (!parameter)
        return;
    parameter->record.current = value;
    if (persistent)
        parameter->kept = value;
}

AX_STATUS change_parameter(Call& call, AX_WWN wwn, std::string_view text, std::uint32_t control) {
    const std::size_t mark = text.find('=');
    if (mark == std::string_view::npos || text.size() > max_text || control > controls) {
        call.violation("\"name=value\" is no such text, or the control no such number");
        return AX_STATUS_INVALID_ARGUMENT;
    }
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    const bool global = control & control_global, persistent = control & control_persistent;
    const Parameters parameters =
        global ? &Function::global_driver_parameters : &Function::driver_parameters;
    if (!(function->*parameters))
        return AX_STATUS_NOT_SUPPORTED;
    const std::string_view name = text.substr(0, mark);
    Driver_Parameter* parameter = find_parameter(*function, parameters, name);
    if (!parameter)
        return parameter_unknown;
    const auto value = read_value(text.substr(mark + 1));
    if (const AX_STATUS status = check_change(*parameter, value, persistent))
        return status;
    if (!global)
        set(parameter, *value, persistent);
    else // all adapters have one driver
        for (Function& each : call.host.functions)
            set(find_parameter(each, parameters, name), *value, persistent);
    return AX_STATUS_OK;
}

// ---- Priority of logical units ----

AX_NAME name_of(AX_WWN wwn) {
    AX_NAME name;
    std::memcpy(&name, &wwn, sizeof name);
    return name;
}

bool same(const AX_NAME& one, const AX_NAME& other) {
    return std::memcmp(&one, &other, sizeof one) == 0;
}

// What the port of that name sees through the function: its own or a virtual one; else null.
const std::vector<Target>* targets_of(const Function& function, const AX_NAME& port) {
    if (get_name(port.byte) == function.wwpn)
        return &function.targets;
    for (const Virtual_Port& each : function.virtual_ports)
        if (same(each.names.wwpn, port))
            return &each.targets;
    return nullptr;
}

// The function that has the name, or carries the virtual port that has it.
Function* find_carrier(Call& call, AX_WWN wwn) {
    for (Function& function : call.host.functions)
        if (targets_of(function, name_of(wwn)))
            return &function;
    return call.function(wwn);
}

// All units of a target stand for one.
bool see(const std::vector<Target>& targets, const AX_OASLun& unit) {
    for (const Target& target : targets)
        if (target.port_wwn == get_name(unit.target.byte))
            return (unit.lun == AX_OAS_ALL_LUNS && unit.state == 0) ||
                   std::any_of(target.units.begin(), target.units.end(),
                               [&](const Unit& each) { return each.os_lun == unit.lun; });
    return false;
}

void set_priority(Unit_Priorities& units, const AX_OASLun& wanted) {
    std::erase_if(units, [&](const AX_OASLun& each) {
        return same(each.initiator, wanted.initiator) && same(each.target, wanted.target) &&
               each.option == wanted.option &&
               (each.lun == wanted.lun || wanted.lun == AX_OAS_ALL_LUNS);
    });
    if (wanted.state != 0)
        units.push_back(wanted);
}

} // namespace

AX_STATUS AX_GetDriverParams(AX_WWN wwn, AX_DriverParam* table, uint32_t* count) {
    return answer<AX_STATUS>(
        Entry::AX_GetDriverParams,
        [&](Call& call) {
            return answer_parameters(call, wwn, table, count, &Function::driver_parameters);
        },
        wwn);
}

AX_STATUS AX_GetDriverParamsGlobal(AX_WWN wwn, AX_DriverParam* table, uint32_t* count) {
    return answer<AX_STATUS>(
        Entry::AX_GetDriverParamsGlobal,
        [&](Call& call) {
            return answer_parameters(call, wwn, table, count, &Function::global_driver_parameters);
        },
        wwn);
}

AX_STATUS AX_SetDriverParam(AX_WWN wwn, const char* text, uint32_t control) {
    return answer<AX_STATUS>(
        Entry::AX_SetDriverParam,
        [&](Call& call) {
            return call.null(text, "text") ? AX_STATUS_INVALID_ARGUMENT
                                           : change_parameter(call, wwn, text, control);
        },
        wwn, text, control);
}

AX_STATUS AX_GetOASLunList(AX_WWN wwn, uint32_t option, AX_OASLunList* list) {
    return answer<AX_STATUS>(
        Entry::AX_GetOASLunList,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!function->unit_priorities)
                return AX_STATUS_NOT_SUPPORTED;
            Unit_Priorities units = *function->unit_priorities;
            std::erase_if(units, [&](const AX_OASLun& each) { return each.option != option; });
            if (call.list_too_small(list->count, units.size()))
                return AX_STATUS_MORE_DATA;
            std::copy(units.begin(), units.end(), list->entry);
            return AX_STATUS_OK;
        },
        wwn, option);
}

AX_STATUS AX_SetOASLunState(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint32_t lun, uint32_t state,
                            uint32_t option) {
    return answer<AX_STATUS>(
        Entry::AX_SetOASLunState,
        [&](Call& call) -> AX_STATUS {
            if (state > 1 || option > AX_OAS_CONFIG) {
                call.violation("a state or an option is neither 0 nor 1");
                return AX_STATUS_INVALID_ARGUMENT;
            }
            Function* function = find_carrier(call, wwn);
            const auto* targets = function ? targets_of(*function, name_of(vport)) : nullptr;
            if (!targets)
                return AX_STATUS_ILLEGAL_WWN;
            if (!function->unit_priorities)
                return AX_STATUS_NOT_SUPPORTED;
            const AX_OASLun unit{name_of(vport), name_of(target), lun, state, option, 0};
            if (!see(*targets, unit))
                return unit_not_seen;
            set_priority(*function->unit_priorities, unit);
            return AX_STATUS_OK;
        },
        wwn, vport, target, lun, state, option);
}

} // namespace library
} // namespace vlnsim
