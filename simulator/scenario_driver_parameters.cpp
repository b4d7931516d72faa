// The parameters of a driver and the logical units that it prefers: rows, each of which may stand
// for several.
#include "simulator/scenario.h"

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <cstring>
#include <iterator>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_parameters = 4096;
constexpr std::uint64_t max_unit_priorities = 1 << 20;

// The text may fill the field to its last byte, as the library's may.
template <std::size_t size>
void read_field(const Node& values, std::string_view key, char (&field)[size]) {
    const std::string text = values.wild_text(key, "");
    if (text.size() > size)
        values.member(key)->fail("longer than " + std::to_string(size) + " bytes");
    std::memcpy(field, text.data(), text.size());
}

Driver_Parameter read_parameter(const Node& values) {
    Driver_Parameter result;
    AX_DriverParam& parameter = result.record;
    if (!values.member("name"))
        values.fail("\"name\" is wanted");
    read_field(values, "name", parameter.name);
    read_field(values, "help", parameter.help);
    parameter.minimum = values.number32("minimum", 0);
    parameter.maximum = values.number32("maximum", 1);
    parameter.defaultValue = values.number32("default", parameter.minimum);
    parameter.current = values.number32("current", parameter.defaultValue);
    parameter.exportFlag = static_cast<std::uint16_t>(values.number("exportFlag", 1, 0xFFFF));
    parameter.changeableType =
        static_cast<std::uint16_t>(values.number("changeableType", 0, 0xFFFF));
    result.kept = values.number32("kept", parameter.current);
    result.status = values.number32("status", AX_STATUS_OK);
    return result;
}

constexpr std::string_view options[] = {"driver", "config"};

std::uint32_t read_option(const Node& values) {
    const std::string word = values.text("option", std::string(options[AX_OAS_DRIVER]));
    const auto found = std::find(std::begin(options), std::end(options), word);
    if (found == std::end(options))
        values.member("option")->fail("unknown option \"" + word + "\"; " + known_list(options));
    return static_cast<std::uint32_t>(found - std::begin(options));
}

std::string name_text(const AX_NAME& name) {
    char text[2 * sizeof name.byte + 1];
    std::snprintf(text, sizeof text, "%016llX",
                  static_cast<unsigned long long>(get_name(name.byte)));
    return text;
}

} // namespace

std::string Driver_Parameter::name() const {
    return {record.name, strnlen(record.name, sizeof record.name)};
}

Driver_Parameters read_driver_parameters(const Node& values) {
    Driver_Parameters parameters;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "name", "help", "minimum", "maximum", "default", "current",
                           "exportFlag", "changeableType", "kept", "status"});
        const std::uint64_t count = row.number("count", 1, max_parameters);
        for (std::uint64_t i = 0; i < count; ++i) {
            const Scope scope = row.scope().with("parameter", parameters.size());
            parameters.push_back(read_parameter(Node(row.value(), scope)));
        }
    }
    return parameters;
}

void set_driver_parameter(std::optional<Driver_Parameters>& parameters, const std::string& name,
                          const Node& value) {
    if (parameters)
        for (Driver_Parameter& parameter : *parameters)
            if (name == parameter.name()) {
                const bool both = !value.is(Value::Kind::object);
                if (!both)
                    value.expect_object({"current", "kept"});
                std::uint32_t& current = parameter.record.current;
                current = both ? value.number32() : value.number32("current", current);
                parameter.kept = both ? current : value.number32("kept", parameter.kept);
                return;
            }
    value.fail("the driver has no such parameter");
}

Unit_Priorities read_unit_priorities(const Node& values, const Function& function) {
    Unit_Priorities units;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "initiator", "target", "lun", "state", "option"});
        const std::uint64_t count = row.number("count", 1, max_unit_priorities);
        const auto initiator = row.member("initiator");
        const auto target = row.member("target");
        if (!target)
            row.fail("\"target\" is wanted: its port name, 16 hexadecimal digits");
        for (std::uint64_t i = 0; i < count; ++i) {
            AX_OASLun unit{};
            put_name(initiator ? initiator->wwn() : function.wwpn, unit.initiator.byte);
            put_name(target->wwn(), unit.target.byte);
            unit.lun = row.number32("lun", 0) + static_cast<std::uint32_t>(i);
            unit.state = row.number32("state", 1);
            unit.option = read_option(row);
            units.push_back(unit);
        }
    }
    return units;
}

std::string unit_priority_name(const AX_OASLun& unit) {
    return name_text(unit.initiator) + ":" + name_text(unit.target) + ":" +
           std::to_string(unit.lun) + ":" + std::to_string(unit.option);
}

void set_unit_priority(Function& function, const std::string& name, const Node& value) {
    if (!function.unit_priorities)
        value.fail("the adapter has no priority of logical units");
    unsigned long long initiator = 0, target = 0;
    AX_OASLun unit{};
    int end = 0;
    if (std::sscanf(name.c_str(), "%16llx:%16llx:%" SCNu32 ":%" SCNu32 "%n", &initiator, &target,
                    &unit.lun, &unit.option, &end) != 4 ||
        static_cast<std::size_t>(end) != name.size())
        value.fail("the name of a unit is \"initiator:target:unit:option\"");
    put_name(initiator, unit.initiator.byte);
    put_name(target, unit.target.byte);
    std::erase_if(*function.unit_priorities, [&](const AX_OASLun& other) {
        return unit_priority_name(other) == unit_priority_name(unit);
    });
    if (value.is(Value::Kind::null))
        return;
    unit.state = value.number32();
    function.unit_priorities->push_back(unit);
}

} // namespace vlnsim
