// World Wide Names: five sets of them for a port, and when they come into force. The virtual ports
// that have names of their own.
#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

Name_Pair current_names(const Function& function) {
    return {function.wwpn, function.wwnn};
}

Name_Pair configured_names(const Function& function) {
    return function.volatile_names.value_or(function.non_volatile_names);
}

// How the configured names stand: in force, or what they wait for.
std::uint32_t activation_of(const Function& function) {
    const bool is_volatile = function.volatile_names.has_value();
    const std::uint32_t capability = function.name_management->capability;
    if (configured_names(function) == current_names(function))
        return is_volatile ? AX_WWN_ACTIVATION_VOLATILE : AX_WWN_ACTIVATION_NON_VOLATILE;
    if (capability & AX_WWN_NEEDS_REBOOT)
        return is_volatile ? AX_WWN_ACTIVATION_VOLATILE_REBOOT
                           : AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT;
    return is_volatile ? AX_WWN_ACTIVATION_VOLATILE_RESET : AX_WWN_ACTIVATION_NON_VOLATILE_RESET;
}

bool is_in_force(std::uint32_t activation) {
    return activation == AX_WWN_ACTIVATION_VOLATILE || activation == AX_WWN_ACTIVATION_NON_VOLATILE;
}

// Without a requirement a change is in force at once.
void settle(Function& function) {
    if (!(function.name_management->capability & (AX_WWN_NEEDS_REBOOT | AX_WWN_NEEDS_RESET)))
        activate_names(function);
}

std::uint64_t number_of(AX_WWN wwn) {
    std::uint8_t bytes[8];
    std::memcpy(bytes, &wwn, sizeof bytes);
    return get_name(bytes);
}

bool is_in_use(const Host& host, const Function& by, std::uint64_t wwpn) {
    return std::any_of(host.functions.begin(), host.functions.end(), [&](const Function& each) {
        return &each != &by &&
               (each.wwpn == wwpn || (each.name_management && configured_names(each).wwpn == wwpn));
    });
}

// As FC-FS registers them.
bool is_valid(std::uint64_t name) {
    const std::uint64_t authority = name >> 60;
    return authority == 1 || authority == 2 || authority == 5 || authority == 6;
}

} // namespace

void activate_names(Function& function) {
    if (!function.name_management)
        return;
    const Name_Pair names = configured_names(function);
    if (names.wwpn != function.wwpn)
        function.former_wwpns.push_back(function.wwpn);
    function.wwpn = names.wwpn;
    function.wwnn = names.wwnn;
}

namespace library {
namespace {

// The other type makes the non-volatile names those that are configured.
constexpr std::uint32_t restore_factory_default = 0;

// The body for a function with name management; the argument is not null.
template <class Body>
AX_STATUS with_names(Call& call, AX_WWN wwn, const void* argument, const char* name, Body body) {
    if (call.null(argument, name))
        return AX_STATUS_INVALID_ARGUMENT;
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return function->name_management ? body(*function) : AX_STATUS{AX_STATUS_WWN_NOT_AVAILABLE};
}

AX_STATUS may_change(const Name_Management& management, std::uint32_t bit) {
    const bool may = !(management.capability & AX_WWN_READ_ONLY) && management.capability & bit;
    return may ? AX_STATUS_OK : AX_STATUS_WWN_NOT_SUPPORTED;
}

bool still_busy(Name_Management& management) {
    if (management.busy == 0)
        return false;
    --management.busy;
    return true;
}

AX_STATUS check_change(const Call& call, const Function& function, std::uint64_t wwpn,
                       std::uint64_t wwnn, std::uint32_t type) {
    if (type > AX_WWN_NON_VOLATILE)
        return AX_STATUS_INVALID_ARGUMENT;
    if (!is_valid(wwpn) || !is_valid(wwnn))
        return AX_STATUS_ILLEGAL_WWN;
    const AX_STATUS status = may_change(*function.name_management,
                                        type == AX_WWN_VOLATILE ? AX_WWN_CAN_CHANGE_VOLATILE
                                                                : AX_WWN_CAN_CHANGE_NON_VOLATILE);
    if (status != AX_STATUS_OK)
        return status;
    return is_in_use(call.host, function, wwpn) ? AX_STATUS{name_in_use} : AX_STATUS{AX_STATUS_OK};
}

// Null: there are no such names.
std::optional<Name_Pair> names_of_type(const Function& function, std::uint32_t type,
                                       std::uint32_t& activation) {
    const std::uint32_t configured = activation_of(function);
    switch (type) {
    case AX_WWN_VOLATILE:
        activation = configured;
        if (!function.volatile_names)
            activation = AX_WWN_ACTIVATION_NO_NAMES;
        else if (is_in_force(configured))
            activation = AX_WWN_ACTIVATION_NONE;
        return function.volatile_names;
    case AX_WWN_NON_VOLATILE:
        return function.non_volatile_names;
    case AX_WWN_FACTORY_DEFAULT:
        return function.name_management->factory;
    case AX_WWN_CURRENT:
        activation = function.volatile_names == current_names(function)
                         ? AX_WWN_ACTIVATION_VOLATILE
                         : AX_WWN_ACTIVATION_NON_VOLATILE;
        return current_names(function);
    default:
        if (is_in_force(configured)) {
            activation = AX_WWN_ACTIVATION_NO_NAMES;
            return std::nullopt;
        }
        activation = configured;
        return configured_names(function);
    }
}

} // namespace

AX_STATUS AX_GetWWNCapability(AX_WWN wwn, uint32_t* capability) {
    return answer<AX_STATUS>(
        Entry::AX_GetWWNCapability,
        [&](Call& call) {
            return with_names(call, wwn, capability, "capability",
                              [&](const Function& function) -> AX_STATUS {
                                  *capability = function.name_management->capability;
                                  call.out("capability", *capability);
                                  return AX_STATUS_OK;
                              });
        },
        wwn);
}

AX_STATUS AX_ReadWWN(AX_WWN wwn, uint32_t type, AX_NAME* wwpn, AX_NAME* wwnn,
                     uint32_t* activation) {
    return answer<AX_STATUS>(
        Entry::AX_ReadWWN,
        [&](Call& call) -> AX_STATUS {
            if (call.null(wwpn, "wwpn") || call.null(wwnn, "wwnn"))
                return AX_STATUS_INVALID_ARGUMENT;
            return with_names(
                call, wwn, activation, "activation", [&](const Function& function) -> AX_STATUS {
                    if (type > AX_WWN_CONFIGURED) {
                        call.violation("unknown type " + std::to_string(type));
                        return AX_STATUS_INVALID_ARGUMENT;
                    }
                    const Name_Pair names =
                        names_of_type(function, type, *activation).value_or(Name_Pair{});
                    put_name(names.wwpn, wwpn->byte);
                    put_name(names.wwnn, wwnn->byte);
                    return AX_STATUS_OK;
                });
        },
        wwn, type);
}

AX_STATUS AX_ChangeWWN(AX_WWN wwn, AX_WWN newWWPN, AX_WWN newWWNN, uint32_t type,
                       uint32_t* activation) {
    return answer<AX_STATUS>(
        Entry::AX_ChangeWWN,
        [&](Call& call) -> AX_STATUS {
            return with_names(call, wwn, activation, "activation", [&](Function& function) {
                const Name_Pair names{number_of(newWWPN), number_of(newWWNN)};
                if (const AX_STATUS status =
                        check_change(call, function, names.wwpn, names.wwnn, type))
                    return status;
                if (still_busy(*function.name_management))
                    return AX_STATUS{AX_STATUS_WWN_IN_PROGRESS};
                if (type == AX_WWN_VOLATILE)
                    function.volatile_names = names;
                else
                    function.non_volatile_names = names;
                settle(function);
                *activation = activation_of(function);
                return AX_STATUS{AX_STATUS_OK};
            });
        },
        wwn, newWWPN, newWWNN, type);
}

AX_STATUS AX_RestoreWWN(AX_WWN wwn, uint32_t type, uint32_t* activation) {
    return answer<AX_STATUS>(
        Entry::AX_RestoreWWN,
        [&](Call& call) -> AX_STATUS {
            return with_names(call, wwn, activation, "activation", [&](Function& function) {
                if (type > AX_WWN_NON_VOLATILE)
                    return AX_STATUS{AX_STATUS_INVALID_ARGUMENT};
                if (const AX_STATUS status =
                        may_change(*function.name_management, type == restore_factory_default
                                                                  ? AX_WWN_CAN_CHANGE_NON_VOLATILE
                                                                  : AX_WWN_CAN_CHANGE_VOLATILE))
                    return status;
                if (still_busy(*function.name_management))
                    return AX_STATUS{AX_STATUS_WWN_IN_PROGRESS};
                if (type == restore_factory_default)
                    function.non_volatile_names = function.name_management->factory;
                else
                    function.volatile_names.reset();
                settle(function);
                *activation = activation_of(function);
                if (is_in_force(*activation))
                    *activation = AX_WWN_ACTIVATION_NONE;
                return AX_STATUS{AX_STATUS_OK};
            });
        },
        wwn, type);
}

} // namespace library
} // namespace vlnsim
