// What an adapter of the Orrigan generation can be configured to, as rules over the configuration
// that is asked for. They look at the record alone: refusal.h.
#ifndef OPERATIONS_ORRIGAN_RULES_H
#define OPERATIONS_ORRIGAN_RULES_H

#include "device/library/axapi_channels.h"
#include "operations/refusal.h"

#include <algorithm>
#include <span>

namespace cimple {

// The ports and functions of a record, however many it claims to have.
inline std::span<const AX_PortConfig> portsOf(const AX_AdapterPortConfig& config) {
    return {config.port, std::min<std::size_t>(config.portCount, AX_CONFIG_PORTS)};
}
inline std::span<const AX_FunctionConfig> functionsOf(const AX_PortConfig& port) {
    return {port.function, std::min<std::size_t>(port.functionCount, AX_CONFIG_FUNCTIONS)};
}

// What several rules want to know of a configuration.
struct Orrigan_Facts {
    int32_t mcType = -1; // 1 to 5, the type that will be in force; -1 without multichannel
    bool roce = false;
    bool nicOnly = true;

    bool multichannel() const { return mcType != -1; }
};
Orrigan_Facts orriganFacts(const AX_AdapterPortConfig& config);

struct Orrigan_Request {
    const AX_AdapterPortConfig& config;
    Orrigan_Facts facts;
    bool sriovSupported;
    uint32 capabilities; // of the channel management
};

// The first rule that the request breaks; its number is the rule's, from 1.
Refused firstBrokenRule(const Orrigan_Request& request);

bool isEtsDisabled(const AX_Profile& profile);

// The profile that a configuration will have. refused: none fits, and then the number is 4.
struct Profile_Choice {
    uint8 pid = 0;
    bool etsDisabled = false; // it is the profile without ETS
    Refused refused;
};
Profile_Choice chooseProfile(const Orrigan_Request& request, std::span<const AX_Profile> profiles);

} // namespace cimple

#endif // OPERATIONS_ORRIGAN_RULES_H
