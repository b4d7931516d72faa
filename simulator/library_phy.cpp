// The PHY of a copper port and the speed of a physical port. What is set through one function is
// set for all that share the port.
#include "simulator/call.h"
#include "simulator/identifiers.h"
#include "simulator/physical_port.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint32_t feature_cable_diagnostics = 428;
constexpr std::uint32_t feature_line_rate = 429;
constexpr std::uint32_t max_percent = 100;

enum Speed_Mode : std::uint32_t { chosen = 1, named = 2, forced = 3 };

// The bits that each rate stands for.
constexpr std::uint32_t line_rates[] = {
    AX_LINE_RATE_100MB | AX_LINE_RATE_1G | AX_LINE_RATE_10G,
    AX_LINE_RATE_100MB,
    AX_LINE_RATE_1G,
    AX_LINE_RATE_10G,
};

std::string text_of(const Function& function, std::uint16_t identifier) {
    const auto found = function.port_attributes.find(identifier);
    return found == function.port_attributes.end() ? "" : found->second.text();
}

// Whether the speed is one of a list with commas between.
bool is_listed(const std::string& list, const std::string& speed) {
    return !speed.empty() && ("," + list + ",").find("," + speed + ",") != std::string::npos;
}

bool takes_speed(const Function& function, const std::string& speed, std::uint32_t mode) {
    switch (mode) {
    case chosen:
        return true;
    case named:
        return is_listed(text_of(function, AX_PA_AUTONEG_SUPPORTED_SPEEDS), speed) ||
               is_listed(text_of(function, AX_PA_FORCE_SUPPORTED_SPEEDS), speed);
    case forced:
        return is_listed(text_of(function, AX_PA_FORCE_SUPPORTED_SPEEDS), speed);
    default:
        return false;
    }
}

} // namespace

bool offers(const Function& function, std::uint32_t feature) {
    const auto found = function.features.find(feature);
    return found != function.features.end() && found->second.status == AX_STATUS_OK &&
           found->second.value != 0;
}

void set_on_port(Host& host, const Function& function, std::uint16_t identifier,
                 const Attribute& attribute) {
    for (Function& each : host.functions)
        if (each.shares_port(function) && each.port_attributes.count(identifier))
            each.port_attributes[identifier] = attribute;
}

AX_STATUS set_line_rate(Host& host, const Function& function, const Bytes& value) {
    if (!offers(function, feature_line_rate))
        return AX_STATUS_NOT_SUPPORTED;
    const std::uint32_t rate = Attribute::of_bytes(value).number();
    if (value.size() != sizeof rate || rate >= std::size(line_rates))
        return AX_STATUS_INVALID_ARGUMENT;
    set_on_port(host, function, AX_PA_LINE_RATE_ADVERTISED, Attribute::of_number(line_rates[rate]));
    return AX_STATUS_OK;
}

namespace library {

AX_STATUS AX_DiagSetNVP(AX_WWN wwn, uint32_t percent) {
    return answer<AX_STATUS>(
        Entry::AX_DiagSetNVP,
        [&](Call& call) -> AX_STATUS {
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!offers(*function, feature_cable_diagnostics))
                return AX_STATUS_NOT_SUPPORTED;
            if (percent == 0 || percent > max_percent)
                return AX_STATUS_INVALID_ARGUMENT;
            set_on_port(call.host, *function, AX_PA_CABLE_NVP, Attribute::of_number(percent));
            return AX_STATUS_OK;
        },
        wwn, percent);
}

AX_STATUS AX_SetPhyPortSpeedSettings(AX_WWN wwn, const char* speed, uint32_t mode,
                                     int32_t cableLength) {
    return answer<AX_STATUS>(
        Entry::AX_SetPhyPortSpeedSettings,
        [&](Call& call) -> AX_STATUS {
            if (call.null(speed, "speed"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!function->port_attributes.count(AX_PA_PORT_SPEED_MODE))
                return AX_STATUS_NOT_SUPPORTED;
            if (!takes_speed(*function, speed, mode) || cableLength < -1)
                return AX_STATUS_INVALID_ARGUMENT;
            const auto set = [&](std::uint16_t identifier, const Attribute& attribute) {
                set_on_port(call.host, *function, identifier, attribute);
            };
            set(AX_PA_PORT_SPEED_MODE, Attribute::of_number(mode));
            if (mode != chosen)
                set(AX_PA_CONFIGURED_PORT_SPEED, Attribute::of_text(speed));
            if (cableLength >= 0)
                set(AX_PA_DAC_CABLE_LENGTH,
                    Attribute::of_number(static_cast<std::uint32_t>(cableLength)));
            return AX_STATUS_OK;
        },
        wwn, speed, mode, cableLength);
}

} // namespace library
} // namespace vlnsim
