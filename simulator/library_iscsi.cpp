// What an iSCSI function sees: its targets, the sessions with them and their logical units.
#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim::library {
namespace {

const std::vector<iSCSI_Unit> no_units;

bool is_iscsi(const Function& function) {
    return function.special_features & AX_FEATURE_ISCSI_FUNCTION;
}

// A target as callers name it. A record's text may fill it without a NUL.
bool has_name(const iSCSI_Target& target, std::string_view name) {
    const char* own = target.entry.name;
    return name == std::string_view(own, strnlen(own, sizeof target.entry.name));
}

// The target, or null with the status of what is wrong.
const iSCSI_Target* find_target(Call& call, AX_WWN wwn, const char* name, AX_STATUS& status) {
    status = AX_STATUS_INVALID_ARGUMENT;
    if (call.null(name, "targetName"))
        return nullptr;
    status = AX_STATUS_ILLEGAL_WWN;
    const Function* function = call.function(wwn);
    if (!function)
        return nullptr;
    status = AX_STATUS_NOT_SUPPORTED;
    if (!is_iscsi(*function))
        return nullptr;
    const auto& targets = function->iscsi_targets;
    const auto it = std::find_if(targets.begin(), targets.end(), [&](const iSCSI_Target& target) {
        return has_name(target, name);
    });
    if (it != targets.end())
        return &*it;
    call.violation("unknown target " + shown(name));
    status = AX_STATUS_ERROR;
    return nullptr;
}

// The entry records of a vector of the model as a list with its count at the head.
template <class List, class Item>
AX_STATUS answer_list(Call& call, const std::vector<Item>& items, List* list) {
    constexpr std::size_t entry_size = sizeof list->entry[0];
    const std::uint32_t room = list->count;
    if (call.list_too_small(list->count, items.size()))
        return AX_STATUS_MORE_DATA;
    for (std::size_t i = 0; i < items.size(); ++i)
        list->entry[i] = items[i].entry;
    soil(list->entry, items.size() * entry_size, room * entry_size);
    return AX_STATUS_OK;
}

bool is_zeroed(const AX_iSCSI_SessionInfo& info) {
    const auto* bytes = reinterpret_cast<const std::uint8_t*>(&info);
    return std::all_of(bytes, bytes + sizeof info, [](std::uint8_t byte) { return byte == 0; });
}

AX_STATUS answer_info(Call& call, const iSCSI_Target& target, const AX_iSCSI_Session& entry,
                      AX_iSCSI_SessionInfo& info) {
    for (const iSCSI_Session& session : target.sessions) {
        if (session.entry.sessionId != entry.sessionId || session.entry.isid != entry.isid)
            continue;
        info = session.info;
        return AX_STATUS_OK;
    }
    call.violation("unknown session " + std::to_string(entry.sessionId));
    return AX_STATUS_ERROR;
}

} // namespace

AX_STATUS AX_iSCSI_GetTargets(AX_WWN wwn, AX_iSCSI_TargetList* list) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetTargets,
        [&](Call& call) -> AX_STATUS {
            if (call.null(list, "list"))
                return AX_STATUS_INVALID_ARGUMENT;
            const Function* function = call.function(wwn);
            if (!function)
                return AX_STATUS_ILLEGAL_WWN;
            if (!is_iscsi(*function))
                return AX_STATUS_NOT_SUPPORTED;
            return answer_list(call, function->iscsi_targets, list);
        },
        wwn);
}

AX_STATUS AX_iSCSI_GetLuns(AX_WWN wwn, const char* targetName, AX_iSCSI_LunList* list) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetLuns,
        [&](Call& call) -> AX_STATUS {
            AX_STATUS status = AX_STATUS_INVALID_ARGUMENT;
            if (call.null(list, "list"))
                return status;
            const iSCSI_Target* target = find_target(call, wwn, targetName, status);
            if (!target)
                return status;
            return answer_list(call, target->lists_units ? target->units : no_units, list);
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_GetLunProperties(AX_WWN wwn, const char* targetName, uint32_t lun,
                                    AX_iSCSI_LunProperties* properties) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetLunProperties,
        [&](Call& call) -> AX_STATUS {
            AX_STATUS status = AX_STATUS_INVALID_ARGUMENT;
            if (call.null(properties, "properties"))
                return status;
            const iSCSI_Target* target = find_target(call, wwn, targetName, status);
            if (!target)
                return status;
            for (const iSCSI_Unit& unit : target->units) {
                if (unit.entry.number != lun)
                    continue;
                if (unit.silent)
                    return AX_STATUS_NOT_ANSWERING;
                *properties = unit.properties;
                return AX_STATUS_OK;
            }
            call.violation("unknown logical unit " + std::to_string(lun));
            return AX_STATUS_ERROR;
        },
        wwn, targetName, lun);
}

AX_STATUS AX_iSCSI_GetSessions(AX_WWN wwn, const char* targetName, AX_iSCSI_SessionList* list) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetSessions,
        [&](Call& call) -> AX_STATUS {
            AX_STATUS status = AX_STATUS_INVALID_ARGUMENT;
            if (call.null(list, "list"))
                return status;
            const iSCSI_Target* target = find_target(call, wwn, targetName, status);
            return target ? answer_list(call, target->sessions, list) : status;
        },
        wwn, targetName);
}

AX_STATUS AX_iSCSI_GetSessionInfo(AX_WWN wwn, const char* targetName,
                                  const AX_iSCSI_Session* session, AX_iSCSI_SessionInfo* info) {
    return answer<AX_STATUS>(
        Entry::AX_iSCSI_GetSessionInfo,
        [&](Call& call) -> AX_STATUS {
            AX_STATUS status = AX_STATUS_INVALID_ARGUMENT;
            if (call.null(session, "session") || call.null(info, "info"))
                return status;
            const iSCSI_Target* target = find_target(call, wwn, targetName, status);
            if (!target)
                return status;
            if (!is_zeroed(*info))
                call.violation("info is not zeroed");
            return answer_info(call, *target, *session, *info);
        },
        wwn, targetName, session ? session->sessionId : 0);
}

} // namespace vlnsim::library
