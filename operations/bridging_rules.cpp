#include "operations/bridging_rules.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <string_view>
#include <utility>

namespace cimple {

namespace {

constexpr std::size_t MAX_NAME = 63;
constexpr uint32 KIND_ETHERTYPE = 0;
constexpr uint32 KIND_TCP_PORT = 1;
constexpr int MAX_GROUPS_OF_A_MOVE = 2;

__attribute__((format(printf, 2, 3))) Refusal refuse(AX_STATUS status, const char* format, ...) {
    Refusal refusal;
    refusal.status = status;
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(refusal.line, sizeof refusal.line, format, arguments);
    va_end(arguments);
    return refusal;
}

template <class Request, std::size_t N>
Refusal first_broken(const Request& request, Refusal (*const (&rules)[N])(const Request&)) {
    for (const auto& rule : rules)
        if (const Refusal refusal = rule(request))
            return refusal;
    return {};
}

// Priorities under flow control: two on some ports, one on others, none on any.
Refusal check_flow_control(uint32 bitmap, bool takes_two) {
    const int priorities = std::popcount(bitmap);
    if (priorities > 1 && !takes_two)
        return refuse(AX_STATUS_INVALID_ARGUMENT,
                      "ERROR: Only one PFC priority can be configured on this adapter.");
    if (priorities > 2)
        return refuse(AX_STATUS_INVALID_ARGUMENT,
                      "ERROR: Only two PFC priorities can be configured on this adapter.");
    return {};
}

// ---- Applications ----

struct Application_Row {
    uint32 kind;
    uint32 protocol;
    uint32 protocolToo; // traffic that shares the priority
};

const Application_Row& row_of(Application application) {
    static constexpr Application_Row ROWS[] = {
        {KIND_TCP_PORT, AX_APP_ISCSI, AX_APP_ISCSI},
        {KIND_ETHERTYPE, AX_APP_FCOE, AX_APP_FIP},
        {KIND_ETHERTYPE, AX_APP_ROCE, AX_APP_ROCE},
    };
    return ROWS[static_cast<std::size_t>(application)];
}

// Ethernet types and ports are numbers of their own, and only iSCSI's is small enough to be both.
bool is_of(const AX_Application& slot, const Application_Row& row, uint32 protocol) {
    return slot.protocol == protocol && (row.kind == KIND_ETHERTYPE || slot.kind == row.kind);
}

// ---- Values ----

bool parse_decimal(std::string_view text, uint32 limit, uint32& value) {
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, value);
    return !text.empty() && error == std::errc() && stop == end && value < limit;
}

bool parse_priorities(std::string_view text, uint32& bitmap) {
    constexpr char SEPARATORS[] = ", ";
    constexpr char NONE[] = " - ";
    bitmap = 0;
    if (text == NONE)
        return true;
    for (std::size_t at = 0; (at = text.find_first_not_of(SEPARATORS, at)) != text.npos;) {
        const std::size_t end = std::min(text.find_first_of(SEPARATORS, at), text.size());
        uint32 priority = 0;
        if (!parse_decimal(text.substr(at, end - at), NUM_PRIORITIES, priority))
            return false;
        bitmap |= 1U << priority;
        at = end;
    }
    return bitmap != 0;
}

Refusal parse_priority(const char* text, uint32 limit, const Refusal& otherwise, uint32& bitmap) {
    uint32 priority = 0;
    if (!parse_decimal(text, limit, priority))
        return otherwise;
    bitmap = 1U << priority;
    return {};
}

// ---- One parameter ----

using Parameter_Rule = Refusal (*)(const Parameter_Request& request);

bool transmits(const Parameter_Request& request) {
    return request.record.lldp.txState != 0;
}

uint32 configured(const Parameter_Request& request, Application application) {
    return application_bitmap(request.record.configured.application, application);
}

uint32 value_in_force(const Parameter_Request& request) {
    return configured(request, bridging_parameter(request.name).application);
}

Refusal port_takes_bridging(const Parameter_Request& request) {
    if (request.port.takesBridging())
        return {};
    return refuse(AX_STATUS_ERROR, "ERROR: Cannot set DCB parameters on a NIC adapter.");
}

Refusal port_takes_flow_control(const Parameter_Request& request) {
    if (request.kind() != Bridging_Kind::PFC || request.port.takesFlowControl())
        return {};
    return refuse(AX_STATUS_ERROR, "ERROR: Cannot set PFC parameters on a NIC or iSCSI port.");
}

Refusal port_has_application(const Parameter_Request& request) {
    const Port_Functions& port = request.port;
    if (request.name == "fcoepriority" && !port.fcoe)
        return refuse(AX_STATUS_ERROR, "ERROR: Cannot set fcoepriority on iSCSI or NIC port.");
    if (request.name == "iscsipriority" && !port.iscsi)
        return refuse(AX_STATUS_ERROR, "ERROR: Cannot set iscsipriority on FCoE or NIC port.");
    if (request.name == "nicpriority" && !port.nicOnly)
        return refuse(AX_STATUS_ERROR, "ERROR: Cannot set nicpriority on FCoE or iSCSI port.");
    return {};
}

// DCBX travels in LLDP frames, in both directions.
Refusal exchange_has_lldp(const Parameter_Request& request) {
    if (request.name == "dcbxstate" && request.value != 0 && !transmits(request))
        return refuse(AX_STATUS_ERROR,
                      "ERROR: Cannot enable dcbxstate when transmit(txstate) is disabled.");
    if ((request.name == "rxstate" || request.name == "txstate") && request.value == 0 &&
        request.record.dcbx.state != 0)
        return refuse(AX_STATUS_ERROR,
                      "ERROR: Cannot (disable or be disabled) %s when DCBX is enabled.",
                      request.name.c_str());
    return {};
}

Refusal flow_control_fits(const Parameter_Request& request) {
    if (request.name != "pfcpriority")
        return {};
    if (request.record.configured.pfc.enabled == 0)
        return refuse(AX_STATUS_ERROR, "ERROR: Cannot set pfcpriority when PFC is disabled.");
    const uint32 fcoe = request.port.fcoe ? configured(request, Application::FCOE) : 0;
    if ((request.value & fcoe) != fcoe)
        return refuse(AX_STATUS_ERROR, "ERROR: Fcoepriority is not enabled in new pfcpriority.");
    return check_flow_control(request.value, request.port.bridging);
}

Refusal transmit_is_on(const Parameter_Request& request) {
    if (request.kind() != Bridging_Kind::LLDP || request.name == "txstate" ||
        request.name == "rxstate" || transmits(request))
        return {};
    return refuse(AX_STATUS_ERROR,
                  "ERROR: Cannot set transmit properties when transmit state is disabled.");
}

Refusal value_is_new(const Parameter_Request& request) {
    if (value_in_force(request) != request.value)
        return {};
    return refuse(AX_STATUS_ERROR, "ERROR: Same %s. No change made to %s.", request.name.c_str(),
                  request.name.c_str());
}

// A priority of an application moves between two groups; with more of them nobody knows which.
Refusal groups_are_few(const Parameter_Request& request) {
    const auto& groups = request.record.configured.groupBitmap;
    const auto used = std::count_if(groups, groups + AX_PRIORITY_GROUPS,
                                    [](uint32 bitmap) { return bitmap != 0; });
    if (used <= MAX_GROUPS_OF_A_MOVE)
        return {};
    Refusal refusal =
        refuse(AX_STATUS_ERROR, "ERROR: More than %d priority groups have priorities.",
               MAX_GROUPS_OF_A_MOVE);
    refusal.advice = "Use 'Setceepriority' command to correct the priority group information.";
    return refusal;
}

constexpr Parameter_Rule PARAMETER_RULES[] = {
    port_takes_bridging, port_takes_flow_control, port_has_application,
    exchange_has_lldp,   flow_control_fits,       transmit_is_on,
};
constexpr Parameter_Rule MOVE_RULES[] = {value_is_new, groups_are_few};

// ---- Groups and flow control together ----

uint32 bitmap_of(const Priority_Groups::Group& group) {
    uint32 bitmap = 0;
    for (const uint8 priority : group)
        if (priority < NUM_PRIORITIES)
            bitmap |= 1U << priority;
    return bitmap;
}

int number_of_group(std::size_t index) {
    return index < AX_PRIORITY_GROUPS ? static_cast<int>(index) : int{AX_UNLIMITED_GROUP};
}

Refusal groups_are_supported(const Priority_Request& request) {
    const auto& groups = request.groups.group;
    const auto is_filler = [](uint8 byte) { return byte == Priority_Groups::FILLER; };
    const auto used =
        std::count_if(groups.begin(), groups.begin() + AX_PRIORITY_GROUPS, [&](const auto& group) {
            return !std::all_of(group.begin(), group.end(), is_filler);
        });
    const uint32 most = request.record.maxSupportedPG;
    if (static_cast<uint32>(used) <= most)
        return {};
    return refuse(AX_STATUS_ERROR,
                  "ERROR: Only %d priority groups can be configured on this adapter.",
                  static_cast<int>(most));
}

Refusal priorities_under_flow_control_are_few(const Priority_Request& request) {
    const Port_Functions& port = request.port;
    if (!port.takesFlowControl())
        return {};
    if (request.pfcBitmap == NO_PRIORITY_BITMAP) {
        Refusal refusal = refuse(AX_STATUS_INVALID_ARGUMENT,
                                 "\nERROR: Invalid PFC priority. Valid range is 0 to 7");
        refusal.console = true;
        return refusal;
    }
    return check_flow_control(request.pfcBitmap, port.bridging && !port.nicOnly);
}

Refusal priorities_are_known(const Priority_Request& request) {
    const auto& groups = request.groups.group;
    for (std::size_t i = 0; i < groups.size(); ++i)
        for (const uint8 priority : groups[i])
            if (priority >= NUM_PRIORITIES && priority != Priority_Groups::FILLER)
                return refuse(AX_STATUS_INVALID_ARGUMENT,
                              "ERROR: Invalid priority in priority group %d. Valid range is 0 to 7",
                              number_of_group(i));
    return {};
}

// All groups with their bitmaps, the one without a limit last.
using Bitmaps = std::array<uint32, Priority_Groups::GROUPS>;

Bitmaps bitmaps_of(const Priority_Request& request) {
    Bitmaps bitmaps{};
    std::transform(request.groups.group.begin(), request.groups.group.end(), bitmaps.begin(),
                   bitmap_of);
    return bitmaps;
}

// Storage traffic has a group for itself. A port that has not been told its priority has no such
// traffic yet.
Refusal application_is_alone(const Priority_Request& request) {
    const bool fcoe = request.port.fcoe;
    const uint32 bitmap = application_bitmap(request.record.configured.application,
                                             fcoe ? Application::FCOE : Application::ISCSI);
    if (request.port.nicOnly || bitmap == 0)
        return {};
    const Bitmaps bitmaps = bitmaps_of(request);
    if (std::count(bitmaps.begin(), bitmaps.begin() + AX_PRIORITY_GROUPS, bitmap) == 1)
        return {};
    return refuse(AX_STATUS_INVALID_ARGUMENT, "%s",
                  fcoe ? "ERROR: Invalid Priority. \nFCoE Priority and non-FCoE Priorities cannot "
                         "be assigned to the same priority group."
                       : "ERROR: Invalid Priority. \niSCSI Priority and non-iSCSI Priorities "
                         "cannot be assigned to the same priority group.");
}

Refusal groups_are_not_mixed(const Priority_Request& request) {
    if (!request.port.fcoe)
        return {};
    for (const uint32 bitmap : bitmaps_of(request))
        if ((bitmap & request.pfcBitmap) != 0 && (bitmap & ~request.pfcBitmap) != 0)
            return refuse(AX_STATUS_INVALID_ARGUMENT,
                          "ERROR: A PGID's priorities must be PFC priority or non-PFC priorities");
    return {};
}

Refusal groups_are_disjoint(const Priority_Request& request) {
    const Bitmaps bitmaps = bitmaps_of(request);
    for (std::size_t i = 0; i < bitmaps.size(); ++i)
        for (std::size_t j = i + 1; j < bitmaps.size(); ++j)
            if (bitmaps[i] & bitmaps[j])
                return refuse(AX_STATUS_INVALID_ARGUMENT,
                              "ERROR: Priority groups %d and %d have same priority",
                              number_of_group(i), number_of_group(j));
    return {};
}

using Priority_Rule = Refusal (*)(const Priority_Request& request);

constexpr Priority_Rule PRIORITY_RULES[] = {
    groups_are_supported, priorities_under_flow_control_are_few, priorities_are_known};
constexpr Priority_Rule VALIDATED_PRIORITY_RULES[] = {application_is_alone, groups_are_not_mixed,
                                                      groups_are_disjoint};

} // namespace

// ---- Applications ----

uint32 application_bitmap(const AX_ApplicationTable& table, Application application) {
    const Application_Row& row = row_of(application);
    for (const uint32 protocol : {row.protocol, row.protocolToo})
        for (const AX_Application& slot : table.slot)
            if (is_of(slot, row, protocol))
                return slot.priority < 1U << NUM_PRIORITIES ? slot.priority & (~slot.priority + 1)
                                                            : 0;
    return 0;
}

bool place_application(AX_ApplicationTable& table, Application application, uint32 bitmap) {
    const Application_Row& row = row_of(application);
    bool placed = false;
    for (AX_Application& slot : table.slot)
        if (is_of(slot, row, row.protocol) || is_of(slot, row, row.protocolToo)) {
            slot.priority = bitmap;
            placed = true;
        }
    if (placed)
        return true;
    for (AX_Application& slot : table.slot)
        if (slot.protocol == 0) {
            slot = {row.kind, row.protocol, 0, bitmap};
            return true;
        }
    return false;
}

// ---- One parameter, by name ----

std::string bridging_parameter_name(const char* given) {
    std::string name(given, strnlen(given, MAX_NAME));
    for (char& c : name)
        if (c >= 'A' && c <= 'Z')
            c = static_cast<char>(c - 'A' + 'a');
    if (name == "pfcenable" || name == "pgenable" || name == "tlvenable")
        name += 'd';
    return name;
}

const Bridging_Parameter& bridging_parameter(const std::string& name) {
    using enum Bridging_Kind;
    static constexpr Bridging_Parameter PARAMETERS[] = {
        {"dcbxstate", DCBX, offsetof(AX_DcbxPortVars, state)},
        {"dcbxmode", DCBX, offsetof(AX_DcbxPortVars, mode)},
        {"txstate", LLDP, offsetof(AX_Lldp, txState)},
        {"rxstate", LLDP, offsetof(AX_Lldp, rxState)},
        {"txportdesc", LLDP, offsetof(AX_Lldp, txPortDesc)},
        {"txsysdesc", LLDP, offsetof(AX_Lldp, txSysDesc)},
        {"txsysname", LLDP, offsetof(AX_Lldp, txSysName)},
        {"txsyscap", LLDP, offsetof(AX_Lldp, txSysCap)},
        {"pfcenabled", PFC, offsetof(AX_PFC, enabled)},
        {"pfcwilling", PFC, offsetof(AX_PFC, willing)},
        {"pfcadvertise", PFC, offsetof(AX_PFC, advertise)},
        {"pfcpriority", PFC, offsetof(AX_PFC, priorityBitmap)},
        {"pgenabled", GROUPS},
        {"pgwilling", GROUPS},
        {"pgadvertise", GROUPS},
        {"fcoepriority", APP, 0, Application::FCOE},
        {"iscsipriority", APP, 0, Application::ISCSI},
        {"rocepriority", APP, 0, Application::ROCE},
    };
    static constexpr Bridging_Parameter UNKNOWN = {"", NONE};
    const auto* found = std::find_if(std::begin(PARAMETERS), std::end(PARAMETERS),
                                     [&](const auto& each) { return name == each.name; });
    return found == std::end(PARAMETERS) ? UNKNOWN : *found;
}

Refusal parse_bridging_value(const std::string& name, const char* text, uint32& value) {
    static const Refusal FCOE_RANGE =
        refuse(AX_STATUS_ERROR, "\nERROR: FCoE priority valid range is 0 to 7\n");
    static const Refusal ISCSI_RANGE =
        refuse(AX_STATUS_ERROR, "\nERROR: iSCSI priority valid range is 0 to 7\n");
    static const Refusal OTHERWISE = refuse(AX_STATUS_INVALID_ARGUMENT, "%s", "");
    if (name == "fcoepriority")
        return parse_priority(text, NUM_PRIORITIES, FCOE_RANGE, value);
    if (name == "iscsipriority")
        return parse_priority(text, NUM_PRIORITIES, ISCSI_RANGE, value);
    if (name == "rocepriority")
        return parse_priority(text, 2, OTHERWISE, value);
    const bool valid =
        name == "pfcpriority" ? parse_priorities(text, value) : parse_decimal(text, 2, value);
    return valid ? Refusal() : OTHERWISE;
}

Refusal check_parameter_name(const Parameter_Request& request) {
    struct Storage_Row {
        const char* name;
        bool Port_Functions::*function;
        const char* line;
    };
    static constexpr Storage_Row ROWS[] = {
        {"fcoepriority", &Port_Functions::fcoe,
         "ERROR:- Setting FCoE Priority on NON FCoE Port not allowed"},
        {"iscsipriority", &Port_Functions::iscsi,
         "ERROR:- Setting iSCSI Priority on NON iSCSI Port not allowed"},
        {"rocepriority", &Port_Functions::roce,
         "ERROR:- Setting RoCE Priority on NON ROCE Port not allowed"},
    };
    for (const Storage_Row& row : ROWS)
        if (request.name == row.name && !(request.port.*row.function))
            return refuse(AX_STATUS_INVALID_ARGUMENT, "%s", row.line);
    const auto contains = [&](const char* word) {
        return request.name.find(word) != request.name.npos;
    };
    const bool kept_back = contains("advertise") || contains("willing") || contains("enable");
    if (request.kind() == Bridging_Kind::NONE || (kept_back && request.name != "pfcenabled"))
        return refuse(AX_STATUS_INVALID_ARGUMENT, "Invalid parameter name");
    return {};
}

Refusal check_parameter(const Parameter_Request& request) {
    const Refusal refusal = first_broken(request, PARAMETER_RULES);
    return refusal || !moves_priority(request) ? refusal : first_broken(request, MOVE_RULES);
}

bool moves_priority(const Parameter_Request& request) {
    return request.validate && (request.name == "fcoepriority" || request.name == "iscsipriority");
}

bool needs_flow_control(const Parameter_Request& request) {
    return moves_priority(request) && (request.name == "fcoepriority" || request.port.bridging) &&
           (request.record.configured.pfcBitmap & request.value) == 0;
}

Group_Move plan_group_move(const AX_CEE_Settings& settings, uint32 newBitmap, uint32 oldBitmap) {
    Group_Move move;
    AX_PGPriorityBitmaps groups;
    std::copy_n(settings.groupBitmap, AX_PRIORITY_GROUPS, groups.group);
    const auto holder =
        std::find_if(std::begin(groups.group), std::end(groups.group),
                     [oldBitmap](uint32 bitmap) { return (bitmap & oldBitmap) != 0; });
    for (uint32& group : groups.group) {
        if ((group & newBitmap) == 0)
            continue;
        if (group == newBitmap)
            return move;
        if (holder == std::end(groups.group))
            continue;
        if (&group != holder) {
            group = (group & ~newBitmap) | oldBitmap;
            *holder = (*holder & ~oldBitmap) | newBitmap;
        }
        move.swap = true;
        move.writes.push_back({groups, static_cast<uint32>(holder - groups.group)});
        return move;
    }
    bool placed = false;
    for (uint32 i = 0; i < AX_PRIORITY_GROUPS; ++i) {
        uint32& group = groups.group[i];
        if ((group & oldBitmap) != 0)
            group = (group & ~oldBitmap) | newBitmap;
        else if (!std::exchange(placed, true))
            group |= oldBitmap;
        else
            continue;
        move.writes.push_back({groups, i});
    }
    return move;
}

// ---- Priority groups and flow control together ----

AX_PGPriorityBitmapsExt group_bitmaps(const Priority_Groups& groups) {
    AX_PGPriorityBitmapsExt bitmaps{};
    for (std::size_t i = 0; i < AX_PRIORITY_GROUPS; ++i)
        bitmaps.group[i] = bitmap_of(groups.group[i]);
    bitmaps.groupFifteen = bitmap_of(groups.group[AX_PRIORITY_GROUPS]);
    return bitmaps;
}

Refusal check_priorities(const Priority_Request& request) {
    const Refusal refusal = first_broken(request, PRIORITY_RULES);
    return refusal || !request.validate ? refusal : first_broken(request, VALIDATED_PRIORITY_RULES);
}

// ---- Bandwidths ----

Refusal check_bandwidths(const Group_Bandwidths& bandwidths) {
    uint64 sum = 0;
    for (const uint32 each : bandwidths)
        sum += each;
    if (sum == 100)
        return {};
    return refuse(AX_STATUS_INVALID_ARGUMENT,
                  "ERROR: Invalid bandwidth values. All bandwidths must add up to 100");
}

} // namespace cimple
