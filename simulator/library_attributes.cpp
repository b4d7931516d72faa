// Attributes, statistics and features.
#include "simulator/attribute_buffer.h"
#include "simulator/call.h"
#include "simulator/identifiers.h"
#include "simulator/physical_port.h"

#include <cstring>

namespace vlnsim::library {
namespace {

std::vector<Tagged_Value> tagged(const Attribute_Map& map) {
    std::vector<Tagged_Value> values;
    for (const auto& [identifier, attribute] : map)
        values.push_back({identifier, attribute.length, attribute.bytes});
    return values;
}

// Lays values out in a caller's buffer of that size; *filled, unless null, is told the bytes used
// or, when the buffer is too small, needed.
AX_STATUS answer_values(Call& call, std::span<const Tagged_Value> values, void* buffer,
                        std::uint32_t size, uint32_t* filled) {
    std::uint32_t needed = buffer_size(values);
    call.out("room", size);
    const bool too_small = call.too_small(size, needed);
    if (!too_small) {
        fill_buffer(values, buffer);
        soil(buffer, needed, size);
    }
    if (filled)
        *filled = needed;
    call.out("size", needed);
    return too_small ? AX_STATUS_BUFFER_TOO_SMALL : AX_STATUS_OK;
}

AX_STATUS answer_attributes(Call& call, AX_WWN wwn, void* buffer, uint32_t* size,
                            Attribute_Map Function::*map) {
    if (call.null(buffer, "buffer") || call.null(size, "size"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return answer_values(call, tagged(function->*map), buffer, *size, size);
}

// The throttle is written as 0 or 1 and read as these.
enum : std::uint32_t { throttle_off = 1, throttle_on = 2 };

void set_attribute(Function& function, std::uint16_t identifier, Attribute attribute) {
    if (identifier == port_pfc_throttle && attribute.length == sizeof(std::uint32_t))
        attribute = Attribute::of_number(attribute.number() ? throttle_on : throttle_off);
    auto& map = identifier < port_first ? function.adapter_attributes : function.port_attributes;
    map[identifier] = std::move(attribute);
}

} // namespace

AX_STATUS AX_GetHBAAttributes(AX_WWN wwn, void* buffer, uint32_t* size) {
    return answer<AX_STATUS>(
        Entry::AX_GetHBAAttributes,
        [&](Call& call) {
            return answer_attributes(call, wwn, buffer, size, &Function::adapter_attributes);
        },
        wwn);
}

AX_STATUS AX_GetPortAttributes(AX_WWN wwn, void* buffer, uint32_t* size) {
    return answer<AX_STATUS>(
        Entry::AX_GetPortAttributes,
        [&](Call& call) {
            return answer_attributes(call, wwn, buffer, size, &Function::port_attributes);
        },
        wwn);
}

AX_STATUS AX_GetPortState(AX_WWN wwn, void* buffer, uint32_t* size) {
    return answer<AX_STATUS>(
        Entry::AX_GetPortState,
        [&](Call& call) -> AX_STATUS {
            if (call.null(buffer, "buffer") || call.null(size, "size"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            Attribute_Map states;
            for (const auto& [identifier, attribute] : function->port_attributes)
                if (identifier == port_functional_state || identifier == port_physical_state)
                    states[identifier] = attribute;
            return answer_values(call, tagged(states), buffer, *size, size);
        },
        wwn);
}

void* AX_GetAttributeValue(void* buffer, uint16_t identifier, uint16_t* length, AX_STATUS* status) {
    return answer<void*>(
        Entry::AX_GetAttributeValue,
        [&](Call& call) -> void* {
            if (call.null(buffer, "buffer") || call.null(length, "length") ||
                call.null(status, "status"))
                return nullptr;
            *length = 0;
            *status = AX_STATUS_NOT_SUPPORTED;
            if (call.forced_status) {
                *status = static_cast<AX_STATUS>(*call.forced_status);
                return nullptr;
            }
            if (call.missing && (*call.missing == 0 || *call.missing == identifier))
                return nullptr;
            const Found_Value found = find_value(buffer, identifier);
            switch (found.result) {
            case Found_Value::Result::found:
                *length = found.length;
                *status = AX_STATUS_OK;
                return found.value;
            case Found_Value::Result::missing:
                return nullptr;
            case Found_Value::Result::no_buffer:
                call.violation("the buffer was not filled by this library");
                break;
            case Found_Value::Result::damaged:
                call.violation("the buffer was written to behind the library's back");
                break;
            }
            *status = AX_STATUS_INVALID_ARGUMENT;
            return nullptr;
        },
        identifier);
}

AX_STATUS AX_GetPortStatistics(AX_WWN wwn, void* buffer, uint32_t size) {
    return answer<AX_STATUS>(
        Entry::AX_GetPortStatistics,
        [&](Call& call) -> AX_STATUS {
            if (call.null(buffer, "buffer"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            std::vector<Tagged_Value> values;
            for (const auto& [identifier, counter] : function->statistics)
                values.push_back(
                    {identifier,
                     sizeof counter,
                     {reinterpret_cast<const std::uint8_t*>(&counter), sizeof counter}});
            return answer_values(call, values, buffer, size, nullptr);
        },
        wwn);
}

AX_STATUS AX_GetHBAFeature(AX_WWN wwn, uint32_t identifier, uint32_t* value) {
    return answer<AX_STATUS>(
        Entry::AX_GetHBAFeature,
        [&](Call& call) -> AX_STATUS {
            if (call.null(value, "value"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function_or_dead_port(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            const auto it = function->features.find(identifier);
            const Feature feature = it == function->features.end() ? Feature{} : it->second;
            if (feature.status == AX_STATUS_OK) {
                *value = feature.value;
                call.out("value", *value);
            }
            return feature.status;
        },
        wwn, identifier);
}

AX_STATUS AX_GetHBAFeatureList(AX_WWN wwn, uint32_t size, uint8_t* list) {
    return answer<AX_STATUS>(
        Entry::AX_GetHBAFeatureList,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            std::uint32_t needed = AX_FEATURE_LIST_SIZE;
            if (call.too_small(size, needed))
                return AX_STATUS_BUFFER_TOO_SMALL;
            std::memset(list, 0, AX_FEATURE_LIST_SIZE);
            for (const auto& [identifier, feature] : function->features)
                if (identifier < AX_FEATURE_LIST_SIZE && feature.status == AX_STATUS_OK)
                    list[identifier] = feature.value != 0;
            soil(list, AX_FEATURE_LIST_SIZE, size);
            return AX_STATUS_OK;
        },
        wwn, size);
}

AX_STATUS AX_SetAdapterAttribute(AX_WWN wwn, uint32_t identifier, const void* value,
                                 uint32_t length) {
    return answer<AX_STATUS>(
        Entry::AX_SetAdapterAttribute,
        [&](Call& call) -> AX_STATUS {
            if (call.null(value, "value"))
                return AX_STATUS_INVALID_ARGUMENT;
            Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            const auto* bytes = static_cast<const std::uint8_t*>(value);
            if (identifier > 0xFFFF || length >= 0xFFFF)
                return AX_STATUS_INVALID_ARGUMENT;
            if (identifier == AX_PA_LINE_RATE_ADVERTISED)
                return set_line_rate(call.host, *function, Bytes(bytes, bytes + length));
            Attribute attribute = Attribute::of_bytes(Bytes(bytes, bytes + length));
            if (length != sizeof(std::uint32_t))
                attribute.bytes.push_back(0); // whoever reads a text back may look for its end
            set_attribute(*function, static_cast<std::uint16_t>(identifier), std::move(attribute));
            return AX_STATUS_OK;
        },
        wwn, identifier, length);
}

AX_STATUS AX_GetDriverType(AX_WWN wwn, uint32_t* type) {
    return answer<AX_STATUS>(
        Entry::AX_GetDriverType,
        [&](Call& call) -> AX_STATUS {
            if (call.null(type, "type"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!function->driver_type)
                return AX_STATUS_NOT_SUPPORTED;
            *type = *function->driver_type;
            call.out("type", *type);
            return AX_STATUS_OK;
        },
        wwn);
}

} // namespace vlnsim::library
