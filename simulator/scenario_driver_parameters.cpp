// The parameters of a driver: rows, each of which may stand for several.
#include "simulator/scenario.h"

#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint64_t max_parameters = 4096;

// The text may fill the field to its last byte, as the library's may.
template <std::size_t size>
void read_field(const Node& values, std::string_view key, char (&field)[size]) {
    const std::string text = values.wild_text(key, "");
    if (text.size() > size)
        values.member(key)->fail("longer than " + std::to_string(size) + " bytes");
    std::memcpy(field, text.data(), text.size());
}

AX_DriverParam read_parameter(const Node& values) {
    AX_DriverParam parameter{};
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
    return parameter;
}

} // namespace

Driver_Parameters read_driver_parameters(const Node& values) {
    Driver_Parameters parameters;
    for (const Node& row : values.items()) {
        row.expect_object({"count", "name", "help", "minimum", "maximum", "default", "current",
                           "exportFlag", "changeableType"});
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
        for (AX_DriverParam& parameter : *parameters)
            if (name ==
                std::string_view(parameter.name, strnlen(parameter.name, sizeof parameter.name))) {
                parameter.current = value.number32();
                return;
            }
    value.fail("the driver has no such parameter");
}

} // namespace vlnsim
