#include "operations/fip_texts.h"

#include <algorithm>
#include <cstdlib>
#include <limits>
#include <strings.h>

namespace cimple {

std::optional<uint32> numberOfText(const char* text) {
    char* end = nullptr;
    const unsigned long number = std::strtoul(text, &end, 0);
    if (end == text || *end != '\0')
        return std::nullopt;
    return static_cast<uint32>(std::min<unsigned long>(number, std::numeric_limits<uint32>::max()));
}

Read_Vlan readVlan(const char* text) {
    if (strcasecmp(text, "any") == 0)
        return {.any = true};
    const std::optional<uint32> number = numberOfText(text);
    if (!number)
        return {.refusal = "Invalid VLAN ID value"};
    if (*number > MAX_VLAN_ID)
        return {.refusal = "VLAN ID value must be between 0 and 4095"};
    return {.id = static_cast<uint16>(*number)};
}

} // namespace cimple
