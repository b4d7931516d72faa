// Network boot, bandwidth limits and virtual functions of NICs.
#include "simulator/call.h"
#include "simulator/identifiers.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

enum Boot_Method : std::uint32_t { method_none, method_pxe, method_ibft };
constexpr const char* method_texts[] = {nullptr, "PXE", "iBFT"};

constexpr std::uint32_t sriov_on = 1;

// What a kind of function takes.
struct Limits {
    std::uint32_t kind;
    std::uint32_t function; // bit of the special features
    std::uint32_t max_bytes;
    std::uint32_t max_ios;
};
constexpr Limits limits_of_kinds[] = {
    {AX_QOS_NIC, AX_FEATURE_NIC_FUNCTION, 1000, 0xFFFFFFFF},
    {AX_QOS_ISCSI, AX_FEATURE_ISCSI_FUNCTION, 1280, 150},
};

template <class Body>
AX_STATUS with_function(Call& call, AX_WWN wwn, Body body) {
    Function* function = call.function(wwn);
    return function ? body(*function) : AX_STATUS_ILLEGAL_WWN;
}

const Limits* find_limits(const Function& function, std::uint32_t kind) {
    for (const Limits& row : limits_of_kinds)
        if (row.kind == kind && (function.special_features & row.function) != 0)
            return &row;
    return nullptr;
}

// Whether an adapter can be told to boot so.
bool takes_boot(const Function& function, std::uint32_t enable, std::uint32_t method) {
    if (enable == 0)
        return method == method_none;
    const auto available = function.adapter_attributes.find(AX_HA_BOOT_METHODS_AVAILABLE);
    return enable == 1 && (method == method_pxe || method == method_ibft) &&
           available != function.adapter_attributes.end() &&
           available->second.text().find(method_texts[method]) != std::string::npos;
}

const Virtual_Function* find_virtual_function(const Function& function, AX_WWN wwn) {
    std::uint8_t bytes[8];
    std::memcpy(bytes, &wwn, sizeof bytes);
    const auto found =
        std::find_if(function.virtual_functions.begin(), function.virtual_functions.end(),
                     [&](const Virtual_Function& each) { return each.name == get_name(bytes); });
    return found == function.virtual_functions.end() ? nullptr : &*found;
}

} // namespace

// ---- Network boot ----

AX_STATUS AX_SetNetbootParams(AX_WWN wwn, uint32_t enable, uint32_t method) {
    return answer<AX_STATUS>(
        Entry::AX_SetNetbootParams,
        [&](Call& call) {
            return with_function(call, wwn, [&](Function& function) -> AX_STATUS {
                if (!function.adapter_attributes.count(AX_HA_BOOT_METHOD))
                    return AX_STATUS_NOT_SUPPORTED;
                if (!takes_boot(function, enable, method))
                    return AX_STATUS_INVALID_ARGUMENT;
                function.adapter_attributes[AX_HA_BOOT_CODE_ENABLED] = Attribute::of_number(enable);
                if (enable)
                    function.adapter_attributes[AX_HA_BOOT_METHOD] =
                        Attribute::of_text(method_texts[method]);
                return AX_STATUS_OK;
            });
        },
        wwn, enable, method);
}

AX_STATUS AX_SetBootBiosState(AX_WWN wwn, uint32_t enable) {
    return answer<AX_STATUS>(
        Entry::AX_SetBootBiosState,
        [&](Call& call) {
            return with_function(call, wwn, [&](Function& function) -> AX_STATUS {
                if (!function.adapter_attributes.count(AX_HA_BOOT_CODE_ENABLED))
                    return AX_STATUS_NOT_SUPPORTED;
                if (enable > 1)
                    return AX_STATUS_INVALID_ARGUMENT;
                function.adapter_attributes[AX_HA_BOOT_CODE_ENABLED] = Attribute::of_number(enable);
                return AX_STATUS_OK;
            });
        },
        wwn, enable);
}

// ---- Bandwidth ----

AX_STATUS AX_GetQoS(AX_WWN wwn, AX_QoS* qos) {
    return answer<AX_STATUS>(
        Entry::AX_GetQoS,
        [&](Call& call) -> AX_STATUS {
            if (call.null(qos, "qos"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_function(call, wwn, [&](const Function& function) -> AX_STATUS {
                if (!function.qos || !find_limits(function, qos->kind))
                    return AX_STATUS_NOT_SUPPORTED;
                const std::uint32_t kind = qos->kind;
                *qos = *function.qos;
                qos->kind = kind;
                call.out("maxBytesPerSecond", qos->maxBytesPerSecond);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_SetQoS(AX_WWN wwn, const AX_QoS* qos) {
    return answer<AX_STATUS>(
        Entry::AX_SetQoS,
        [&](Call& call) -> AX_STATUS {
            if (call.null(qos, "qos"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_function(call, wwn, [&](Function& function) -> AX_STATUS {
                const Limits* limits = find_limits(function, qos->kind);
                if (!function.qos || !limits)
                    return AX_STATUS_NOT_SUPPORTED;
                if (qos->flag != 1 || qos->maxBytesPerSecond > limits->max_bytes ||
                    qos->maxIOsPerSecond > limits->max_ios)
                    return AX_STATUS_INVALID_ARGUMENT;
                function.qos = *qos;
                return AX_STATUS_OK;
            });
        },
        wwn, qos ? qos->kind : 0, qos ? qos->maxBytesPerSecond : 0);
}

// ---- Virtual functions ----

AX_STATUS AX_GetVirtualFunctionList(AX_WWN wwn, AX_VirtualFunctionList* list) {
    return answer<AX_STATUS>(
        Entry::AX_GetVirtualFunctionList,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_function(call, wwn, [&](const Function& function) -> AX_STATUS {
                const auto state = function.port_attributes.find(AX_PA_SRIOV_STATE);
                const bool on =
                    state != function.port_attributes.end() && state->second.number() == sriov_on;
                const std::size_t count = on ? function.virtual_functions.size() : 0;
                const std::size_t room = list->count;
                if (call.list_too_small(list->count, count))
                    return AX_STATUS_MORE_DATA;
                for (std::size_t i = 0; i < count; ++i)
                    put_name(function.virtual_functions[i].name, list->entry[i].byte);
                soil(list->entry, count * sizeof *list->entry, room * sizeof *list->entry);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_GetVirtualFunctionProperties(AX_WWN wwn, AX_WWN function,
                                          AX_VirtualFunctionProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_GetVirtualFunctionProperties,
        [&](Call& call) -> AX_STATUS {
            if (call.null(properties, "properties"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_function(call, wwn, [&](const Function& owner) -> AX_STATUS {
                const Virtual_Function* found = find_virtual_function(owner, function);
                if (!found) {
                    call.violation("unknown virtual function " + shown(function));
                    return AX_STATUS_ERROR;
                }
                *properties = found->properties;
                return AX_STATUS_OK;
            });
        },
        wwn, function);
}

} // namespace vlnsim::library
