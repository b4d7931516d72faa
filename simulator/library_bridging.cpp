// Data centre bridging. What is set through one function is set for all of its physical port.
//
// The adapter keeps what is configured and what is in force apart. With a switch that provides
// settings a willing port has those in force; otherwise what is configured is in force at once.
#include "simulator/call.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace vlnsim::library {
namespace {

constexpr std::uint32_t feature_bridging = 440;
constexpr std::uint32_t all_priorities = 0xFF;
constexpr auto unchanged = static_cast<std::uint32_t>(AX_UNCHANGED);

// Statuses of an adapter that can't do what it is told.
enum : AX_STATUS {
    bandwidths_not_full = 231,
    priority_not_in_one_group = 232,
    too_many_groups = 233,
    too_much_flow_control = 234,
    applications_unclear = 235,
};

// ---- In force ----

bool keeps(const Function& function, const AX_CEE_State& state) {
    return function.bridging_switch && state.willing == 1;
}

void follow_state(AX_CEE_State& active, const AX_CEE_State& configured) {
    active.enabled = configured.enabled;
    active.willing = configured.willing;
    active.advertise = configured.advertise;
}

void settle(const Function& function, AX_CEE_Params& record) {
    const AX_CEE_Settings& configured = record.configured;
    AX_CEE_Settings& active = record.active;
    follow_state(active.pg, configured.pg);
    follow_state(active.pfc, configured.pfc);
    if (!keeps(function, configured.pg)) {
        std::copy(std::begin(configured.groupBitmap), std::end(configured.groupBitmap),
                  active.groupBitmap);
        std::copy(std::begin(configured.bandwidth), std::end(configured.bandwidth),
                  active.bandwidth);
    }
    if (!keeps(function, configured.pfc))
        active.pfcBitmap = configured.pfcBitmap;
    if (!keeps(function, configured.fcoe) && !keeps(function, configured.iscsi))
        active.application = configured.application;
}

// ---- Calls ----

// Answers from the record, or changes a copy that becomes the port's if body answers 0.
template <class Argument, class Body>
AX_STATUS with_record(Call& call, AX_WWN wwn, Argument* argument, Body body) {
    if (call.null(argument, "record"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!function->bridging)
        return AX_STATUS_NOT_SUPPORTED;
    AX_CEE_Params record = *function->bridging;
    const AX_STATUS status = body(*function, record);
    if (status != AX_STATUS_OK || !std::is_const_v<Argument>)
        return status;
    settle(*function, record);
    for (Function& each : call.host.functions)
        if (each.bridging && each.shares_port(*function))
            each.bridging = record;
    return status;
}

// A word of 0, of 1, or one that stays; all else is the caller's mistake.
bool set_word(Call& call, std::uint32_t& word, std::uint32_t value) {
    if (value == unchanged)
        return true;
    if (value > 1) {
        call.violation("a switch is " + std::to_string(value));
        return false;
    }
    word = value;
    return true;
}

template <class Record>
AX_STATUS set_words(Call& call, Record& record, const Record& change) {
    constexpr std::size_t count = sizeof(Record) / sizeof(std::uint32_t);
    std::uint32_t words[count], changes[count];
    std::memcpy(words, &record, sizeof record);
    std::memcpy(changes, &change, sizeof change);
    for (std::size_t i = 0; i < count; ++i)
        if (!set_word(call, words[i], changes[i]))
            return AX_STATUS_INVALID_ARGUMENT;
    std::memcpy(&record, words, sizeof record);
    return AX_STATUS_OK;
}

AX_STATUS set_groups(AX_CEE_Params& record, const std::uint32_t (&groups)[AX_PRIORITY_GROUPS],
                     std::uint32_t unlimited) {
    auto& bitmaps = record.configured.groupBitmap;
    std::fill(std::begin(bitmaps), std::end(bitmaps), 0);
    std::copy(std::begin(groups), std::end(groups), bitmaps);
    bitmaps[AX_UNLIMITED_GROUP] = unlimited;
    std::uint32_t seen = 0;
    for (const std::uint32_t bitmap : bitmaps) {
        if (bitmap > all_priorities || (bitmap & seen) != 0)
            return priority_not_in_one_group;
        seen |= bitmap;
    }
    if (seen != all_priorities)
        return priority_not_in_one_group;
    const auto used = std::count_if(std::begin(groups), std::end(groups),
                                    [](std::uint32_t bitmap) { return bitmap != 0; });
    return static_cast<std::uint32_t>(used) > record.maxSupportedPG ? AX_STATUS{too_many_groups}
                                                                    : AX_STATUS_OK;
}

AX_STATUS set_flow_control(Call& call, const Function& function, AX_CEE_Settings& settings,
                           const AX_PFC& change) {
    AX_CEE_State& state = settings.pfc;
    if (!set_word(call, state.enabled, static_cast<std::uint32_t>(change.enabled)) ||
        !set_word(call, state.willing, static_cast<std::uint32_t>(change.willing)) ||
        !set_word(call, state.advertise, static_cast<std::uint32_t>(change.advertise)))
        return AX_STATUS_INVALID_ARGUMENT;
    const auto bitmap = static_cast<std::uint32_t>(change.priorityBitmap);
    if (bitmap == unchanged)
        return AX_STATUS_OK;
    const auto feature = function.features.find(feature_bridging);
    const int most = feature != function.features.end() && feature->second.value != 0 ? 2 : 1;
    if (bitmap > all_priorities || std::popcount(bitmap) > most)
        return too_much_flow_control;
    settings.pfcBitmap = bitmap;
    return AX_STATUS_OK;
}

bool applications_are_clear(const AX_ApplicationTable& table) {
    for (const AX_Application& slot : table.slot) {
        const auto same = [&](const AX_Application& other) {
            return other.kind == slot.kind && other.protocol == slot.protocol;
        };
        if (slot.protocol != 0 &&
            (slot.kind > 1 || slot.priority > all_priorities || slot.priority == 0 ||
             std::count_if(std::begin(table.slot), std::end(table.slot), same) != 1))
            return false;
    }
    return true;
}

} // namespace

AX_STATUS AX_CNA_GetCEE_Params(AX_WWN wwn, AX_CEE_Params* params) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_GetCEE_Params,
        [&](Call& call) {
            return with_record(call, wwn, params,
                               [&](const Function&, const AX_CEE_Params& record) {
                                   *params = record;
                                   soil(params->reserved, 0, sizeof params->reserved);
                                   return AX_STATUS_OK;
                               });
        },
        wwn);
}

AX_STATUS AX_CNA_GetPGPriorityBitmaps(AX_WWN wwn, AX_PGPriorityBitmaps* bitmaps) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_GetPGPriorityBitmaps,
        [&](Call& call) {
            return with_record(
                call, wwn, bitmaps, [&](const Function&, const AX_CEE_Params& record) {
                    std::copy_n(record.configured.groupBitmap, AX_PRIORITY_GROUPS, bitmaps->group);
                    return AX_STATUS_OK;
                });
        },
        wwn);
}

// What goes into a group of these leaves the one without a limit.
AX_STATUS AX_CNA_SetPGPriorityBitmaps(AX_WWN wwn, const AX_PGPriorityBitmaps* bitmaps) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetPGPriorityBitmaps,
        [&](Call& call) {
            return with_record(call, wwn, bitmaps, [&](const Function&, AX_CEE_Params& record) {
                std::uint32_t unlimited = record.configured.groupBitmap[AX_UNLIMITED_GROUP];
                for (const std::uint32_t bitmap : bitmaps->group)
                    unlimited &= ~bitmap;
                return set_groups(record, bitmaps->group, unlimited);
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetPGPriorityBitmapsExt(AX_WWN wwn, const AX_PGPriorityBitmapsExt* bitmaps) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetPGPriorityBitmapsExt,
        [&](Call& call) {
            return with_record(call, wwn, bitmaps, [&](const Function&, AX_CEE_Params& record) {
                return set_groups(record, bitmaps->group, bitmaps->groupFifteen);
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetPGBandwidth(AX_WWN wwn, const AX_PGBandwidth* bandwidth) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetPGBandwidth,
        [&](Call& call) {
            return with_record(
                call, wwn, bandwidth, [&](const Function&, AX_CEE_Params& record) -> AX_STATUS {
                    std::uint64_t sum = 0;
                    for (const std::uint32_t percent : bandwidth->percent)
                        sum += percent;
                    if (sum != 100)
                        return bandwidths_not_full;
                    std::copy(std::begin(bandwidth->percent), std::end(bandwidth->percent),
                              record.configured.bandwidth);
                    return AX_STATUS_OK;
                });
        },
        wwn);
}

AX_STATUS AX_CNA_SetPFC(AX_WWN wwn, const AX_PFC* pfc) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetPFC,
        [&](Call& call) {
            return with_record(call, wwn, pfc, [&](const Function& function, auto& record) {
                return set_flow_control(call, function, record.configured, *pfc);
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetDcbxPortVars(AX_WWN wwn, const AX_DcbxPortVars* vars) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetDcbxPortVars,
        [&](Call& call) {
            return with_record(call, wwn, vars, [&](const Function&, AX_CEE_Params& record) {
                return set_words(call, record.dcbx, *vars);
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetLldp(AX_WWN wwn, const AX_Lldp* lldp) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetLldp,
        [&](Call& call) {
            return with_record(call, wwn, lldp, [&](const Function&, AX_CEE_Params& record) {
                return set_words(call, record.lldp, *lldp);
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetPGSetting(AX_WWN wwn, const AX_PGSetting* setting) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetPGSetting,
        [&](Call& call) {
            return with_record(call, wwn, setting, [&](const Function&, AX_CEE_Params& record) {
                AX_CEE_State& pg = record.configured.pg;
                AX_PGSetting now = {pg.enabled, pg.willing, pg.advertise};
                const AX_STATUS status = set_words(call, now, *setting);
                pg.enabled = now.enabled;
                pg.willing = now.willing;
                pg.advertise = now.advertise;
                return status;
            });
        },
        wwn);
}

AX_STATUS AX_CNA_GetTLV(AX_WWN wwn, AX_ApplicationTable* table) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_GetTLV,
        [&](Call& call) {
            return with_record(call, wwn, table, [&](const Function&, const AX_CEE_Params& record) {
                *table = record.configured.application;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_CNA_SetTLV(AX_WWN wwn, const AX_ApplicationTable* table) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_SetTLV,
        [&](Call& call) {
            return with_record(call, wwn, table,
                               [&](const Function&, AX_CEE_Params& record) -> AX_STATUS {
                                   if (!applications_are_clear(*table))
                                       return applications_unclear;
                                   record.configured.application = *table;
                                   return AX_STATUS_OK;
                               });
        },
        wwn);
}

} // namespace vlnsim::library
