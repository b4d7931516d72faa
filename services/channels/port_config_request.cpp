#include "services/channels/port_config_request.h"

#include "cimple/meta.h"
#include "cimple/registration.h"
#include "services/channels/port_config.h"
#include "services/channels/protocol_words.h"

#include <algorithm>

namespace cimple {

namespace {

constexpr uint8 LAST_MULTICHANNEL_TYPE = 5;
constexpr uint32 FEWER_FUNCTIONS = 8, MORE_FUNCTIONS = 16; // without NPAR EP and with it

Refused invalid(const char* line) {
    return refusal(MODIFY_INSTANCE_NOT_FOUND, "%s", line);
}

Refused ports_are_the_adapters(const VLNMPCA_PortConfigData& model,
                               const AX_AdapterPortConfig& present) {
    if (model.NumOfPorts.is_null() || model.NumOfPorts.value == present.portCount)
        return std::nullopt;
    return refusal(MODIFY_INSTANCE_NOT_FOUND,
                   "Invalid MaxPorts passed: %u, The adapter doesnt support passed no of ports.",
                   model.NumOfPorts.value);
}

Refused read_multichannel_type(const VLNMPCA_PortConfigData& model,
                               const AX_AdapterPortConfig& present, AX_AdapterPortConfig& next) {
    const int32_t type = present.configuredMCType != -1 ? present.configuredMCType : present.mcType;
    const uint8 wanted = model.MCType.value;
    if (model.MCType.is_null() || wanted == static_cast<uint8>(type))
        return std::nullopt;
    if (wanted > LAST_MULTICHANNEL_TYPE)
        return invalid("Invalid MC type passed.");
    next.configuredMCType = wanted;
    return std::nullopt;
}

Refused read_function_count(const VLNMPCA_PortConfigData& model,
                            const AX_AdapterPortConfig& present, AX_AdapterPortConfig& next,
                            Function_Count_Change& change) {
    const uint32 count = present.ariFunctionCount4 / 4;
    const uint32 wanted = model.MaxFunctionCount.value;
    if (model.MaxFunctionCount.is_null())
        return std::nullopt;
    if (wanted == count) {
        change.line = "No changes required in NPAR Ep mode";
        return std::nullopt;
    }
    if (count == 0)
        return invalid("NPAR Ep is not supported on this adapter. MaxFunctionCount = 0 ");
    if (wanted == MORE_FUNCTIONS && count == FEWER_FUNCTIONS)
        change = {VLN_MethodWrapper::NPAR_GOES_ON, "Enabling NPAR Ep mode"};
    else if (wanted == FEWER_FUNCTIONS && count == MORE_FUNCTIONS)
        change = {VLN_MethodWrapper::NPAR_GOES_OFF, "Disabling NPAR Ep mode"};
    else
        return refusal(MODIFY_INSTANCE_NOT_FOUND, "Invalid MaxFunctionCount passed: %u", wanted);
    next.ariFunctionCount4 = wanted * 4;
    return std::nullopt;
}

Refused read_port(const Property<Array<String>>& words, uint32 number, AX_PortConfig& port) {
    if (words.is_null() || words.value.size() > AX_CONFIG_FUNCTIONS)
        return invalid("Invalid mi params ");
    port.functionCount = words.value.size();
    for (uint32 i = 0; i < port.functionCount; ++i) {
        const auto* row = std::find_if(std::begin(PROTOCOL_WORDS), std::end(PROTOCOL_WORDS),
                                       [&](const Protocol_Word& each) {
                                           return name_equal(each.word, words.value[i].c_str());
                                       });
        if (row == std::end(PROTOCOL_WORDS))
            return refusal(MODIFY_INSTANCE_NOT_FOUND,
                           "Invalid Protocol type for function[%u] of p%u ", i, number);
        port.function[i].protocol = row->protocol;
    }
    return std::nullopt;
}

Refused read_ports(const VLNMPCA_PortConfigData& model, const AX_AdapterPortConfig& present,
                   AX_AdapterPortConfig& next) {
    const uint32 ports = present.portCount;
    if (ports != 1 && ports != 2 && ports != 4)
        return invalid("Invalid maxPorts value params ");
    for (uint32 i = 0; i < ports; ++i)
        if (Refused refused = read_port(model.*CONFIG_PORT[i], i, next.port[i]))
            return refused;
    return std::nullopt;
}

} // namespace

Refused read_port_config(const VLNMPCA_PortConfigData& model, const AX_AdapterPortConfig& present,
                         AX_AdapterPortConfig& next, Function_Count_Change& count) {
    next.pid = model.PID.is_null() ? uint8{0} : model.PID.value;
    if (Refused refused = ports_are_the_adapters(model, present))
        return refused;
    if (Refused refused = read_multichannel_type(model, present, next))
        return refused;
    if (Refused refused = read_function_count(model, present, next, count))
        return refused;
    return read_ports(model, present, next);
}

} // namespace cimple
