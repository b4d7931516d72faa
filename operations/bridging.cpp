// Data centre bridging: priority groups, flow control, the priorities of applications, and what is
// exchanged with the switch.
#include "cimple/guard.h"
#include "operations/bridging_rules.h"
#include "operations/operation_frame.h"

#include <cstdio>
#include <cstring>

namespace cimple {

namespace {

constexpr uint32 FEATURE_PRIORITY_GROUPS = 400;
constexpr uint32 FEATURE_BRIDGING = 440;
constexpr char UNKNOWN_PORT[] = "ERROR: Unable to determine port type.";

// What a card that can't be asked for does not have.
bool hasFeature(AX_WWN wwn, uint32 feature) {
    uint32 value = 0;
    return AX_GetHBAFeature(wwn, feature, &value) == AX_STATUS_OK && value != 0;
}

AX_STATUS readFunctions(const HBA_WWN* name, Port_Functions& port) {
    const AX_STATUS status =
        VLN_MethodWrapper::GetCNAType(name, port.nicOnly, port.iscsi, port.fcoe, port.roce);
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, "%s", UNKNOWN_PORT);
    else
        port.bridging = hasFeature(wwnOf(name), FEATURE_BRIDGING);
    return status;
}

// Tells the refusal, if it is one; answers its status.
AX_STATUS told(const Refusal& refusal) {
    if (refusal.console) {
        std::fputs(refusal.line, stdout);
        std::fflush(stdout);
    } else if (refusal.line[0] != '\0') {
        VLN_LOG(VLN_ERR, "%s", refusal.line);
    }
    if (refusal.advice)
        VLN_LOG(VLN_ERR, "%s", refusal.advice);
    return refusal.status;
}

constexpr uint32 UNCHANGED = static_cast<uint32>(AX_UNCHANGED);

AX_PFC flowControlOf(uint32 bitmap) {
    return {AX_UNCHANGED, AX_UNCHANGED, AX_UNCHANGED, static_cast<sint32>(bitmap)};
}

// A record that changes one word.
template <class Record>
Record changeOf(const Bridging_Parameter& parameter, uint32 value) {
    Record record;
    std::memset(&record, 0xFF, sizeof record);
    static_assert(UNCHANGED == 0xFFFFFFFF);
    std::memcpy(reinterpret_cast<char*>(&record) + parameter.offset, &value, sizeof value);
    return record;
}

// ---- One parameter ----

AX_STATUS enableFlowControl(AX_WWN wwn, const Parameter_Request& request) {
    const AX_PFC change = flowControlOf(request.value);
    const AX_STATUS status = AX_CNA_SetPFC(wwn, &change);
    if (status == AX_STATUS_OK)
        VLN_LOG(VLN_DBG, "New %s is PFC enabled.", request.name.c_str());
    else
        VLN_OPERATION_FAILED(status, "ERROR: Failed to enable pfcpriority, required for new %s.\n",
                             request.name.c_str());
    return status;
}

void tellOfGroups() {
    VLN_LOG(VLN_DBG, "Use 'getpginfo' command to see the new settings.");
}

AX_STATUS swapGroups(AX_WWN wwn, const Group_Write& write, const char* name) {
    const AX_STATUS status = AX_CNA_SetPGPriorityBitmaps(wwn, &write.bitmaps);
    if (status != AX_STATUS_OK) {
        VLN_MethodWrapper::logStatus(status);
        return status;
    }
    VLN_LOG(VLN_DBG, "New %s is assigned to priority group %d.\n", name,
            static_cast<int>(write.group));
    tellOfGroups();
    return AX_STATUS_OK;
}

// On the way a priority may be in two groups or in none, and an adapter may refuse that: the last
// write tells.
AX_STATUS rewriteGroups(AX_WWN wwn, const std::vector<Group_Write>& writes, const char* name) {
    AX_STATUS status = AX_STATUS_OK;
    for (const Group_Write& write : writes) {
        status = AX_CNA_SetPGPriorityBitmaps(wwn, &write.bitmaps);
        if (status == AX_STATUS_OK) {
            VLN_LOG(VLN_DBG, "New %s is assigned to priority group %d.", name,
                    static_cast<int>(write.group));
            tellOfGroups();
        } else {
            VLN_OPERATION_FAILED(
                status, "ERROR: Unable to modify priority group information required for new %s.",
                name);
        }
    }
    return status;
}

// Flow control and groups follow the application to its new priority.
AX_STATUS movePriority(AX_WWN wwn, const Parameter_Request& request) {
    const AX_STATUS status =
        needs_flow_control(request) ? enableFlowControl(wwn, request) : AX_STATUS_OK;
    const AX_CEE_Settings& settings = request.record.configured;
    const uint32 old =
        application_bitmap(settings.application, bridging_parameter(request.name).application);
    const Group_Move move = plan_group_move(settings, request.value, old);
    if (move.writes.empty())
        return status;
    const char* name = request.name.c_str();
    return move.swap ? swapGroups(wwn, move.writes[0], name)
                     : rewriteGroups(wwn, move.writes, name);
}

AX_STATUS validate(const HBA_WWN* name, Parameter_Request& request) {
    if (readFunctions(name, request.port) != AX_STATUS_OK)
        return AX_STATUS_ERROR;
    if (const AX_STATUS status = told(check_parameter(request)))
        return status;
    return moves_priority(request) ? movePriority(wwnOf(name), request) : AX_STATUS_OK;
}

// The table is read just before it is written, so that no other application is lost.
AX_STATUS writeApplication(AX_WWN wwn, Application application, uint32 bitmap) {
    AX_ApplicationTable table{};
    if (const AX_STATUS status = AX_CNA_GetTLV(wwn, &table))
        return status;
    return place_application(table, application, bitmap) ? AX_CNA_SetTLV(wwn, &table)
                                                         : AX_STATUS_ERROR;
}

AX_STATUS write(AX_WWN wwn, const Parameter_Request& request) {
    const Bridging_Parameter& parameter = bridging_parameter(request.name);
    switch (parameter.kind) {
    case Bridging_Kind::DCBX: {
        const auto change = changeOf<AX_DcbxPortVars>(parameter, request.value);
        return AX_CNA_SetDcbxPortVars(wwn, &change);
    }
    case Bridging_Kind::LLDP: {
        const auto change = changeOf<AX_Lldp>(parameter, request.value);
        return AX_CNA_SetLldp(wwn, &change);
    }
    case Bridging_Kind::PFC: {
        const auto change = changeOf<AX_PFC>(parameter, request.value);
        return AX_CNA_SetPFC(wwn, &change);
    }
    case Bridging_Kind::APP:
        return writeApplication(wwn, parameter.application, request.value);
    case Bridging_Kind::GROUPS: // their names are refused before
    case Bridging_Kind::NONE:
        break;
    }
    return AX_STATUS_INVALID_ARGUMENT;
}

void tellOfSuccess(const Parameter_Request& request) {
    VLN_LOG(VLN_DBG, "DCB parameter successfully set.");
    if (request.name == "dcbxmode" && request.value != request.record.dcbx.mode)
        VLN_LOG(VLN_WARN, "Please reboot to activate the new setting.");
    if (request.kind() != Bridging_Kind::APP)
        return;
    VLN_LOG(VLN_DBG, "Note: This setting will only be used when not provided by the switch.");
    if (request.port.fcoe)
        VLN_LOG(VLN_DBG, "Update PFC and priority group priorities, if necessary.\n");
    else
        VLN_LOG(VLN_DBG, "Warning: Update priority group priorities, if necessary.\n");
}

AX_STATUS setParameter(const HBA_WWN* name, const char* given, const char* text, bool rules) {
    Port_Functions port;
    if (const AX_STATUS status = readFunctions(name, port))
        return status;
    if (!port.takesBridging()) {
        VLN_LOG(VLN_ERR, "ERROR: Cannot set DCB parameters on NIC adapters.");
        return BRIDGING_NOT_OFFERED;
    }
    const std::string parameter = bridging_parameter_name(given);
    uint32 value = 0;
    if (const AX_STATUS status = told(parse_bridging_value(parameter, text, value)))
        return status;
    AX_CEE_Params record{};
    AX_STATUS unread = AX_CNA_GetCEE_Params(wwnOf(name), &record);
    if (unread != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(unread, "ERROR: SetCeeParam failed: Unable to get DCBX state");
        record = {};
        unread = AX_STATUS_ERROR;
    }
    Parameter_Request request{parameter, value, rules, port, record};
    if (const AX_STATUS status = told(check_parameter_name(request)))
        return status;
    if (const AX_STATUS status = validate(name, request))
        return status;
    if (const AX_STATUS status = write(wwnOf(name), request)) {
        VLN_OPERATION_FAILED(status, "Setting DCB Params failed with code %d", status);
        return status;
    }
    tellOfSuccess(request);
    return unread;
}

// ---- Priority groups and flow control together ----

AX_STATUS setPriorities(const HBA_WWN* name, uint32 pfcBitmap, const Priority_Groups& groups,
                        bool rules) {
    Port_Functions port;
    if (const AX_STATUS status = readFunctions(name, port))
        return status;
    if (!port.takesBridging()) {
        VLN_LOG(VLN_ERR, "ERROR: Priority groups not supported on NIC adapters.");
        return BRIDGING_NOT_OFFERED;
    }
    AX_CEE_Params record{};
    if (const AX_STATUS status = AX_CNA_GetCEE_Params(wwnOf(name), &record)) {
        VLN_OPERATION_FAILED(status, "ERROR: Unable to get PG settings.");
        return status;
    }
    if (const AX_STATUS status = told(check_priorities({pfcBitmap, groups, rules, port, record})))
        return status;
    const AX_PGPriorityBitmapsExt bitmaps = group_bitmaps(groups);
    if (const AX_STATUS status = AX_CNA_SetPGPriorityBitmapsExt(wwnOf(name), &bitmaps)) {
        VLN_OPERATION_FAILED(status, "ERROR: Unable to set priority group priorities.");
        return status;
    }
    if (!port.takesFlowControl())
        return AX_STATUS_OK;
    const AX_PFC change = flowControlOf(pfcBitmap);
    const AX_STATUS status = AX_CNA_SetPFC(wwnOf(name), &change);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "ERROR: Unable to set pfcpriority.");
    return status;
}

AX_STATUS writeBandwidths(AX_WWN wwn, const Group_Bandwidths& bandwidths) {
    AX_PGPriorityBitmaps groups{};
    if (const AX_STATUS status = AX_CNA_GetPGPriorityBitmaps(wwn, &groups))
        return status;
    AX_PGBandwidth change{};
    std::memcpy(change.percent, bandwidths.data(), sizeof change.percent);
    return AX_CNA_SetPGBandwidth(wwn, &change);
}

} // namespace

AX_STATUS VLN_MethodWrapper::vlncimSetCEEParams(const HBA_WWN* name, const char* parameter,
                                                const char* value, bool validate) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimSetCEEParams()");
    if (!name || !parameter || !value)
        return AX_STATUS_INVALID_ARGUMENT;
    AX_STATUS status = AX_STATUS_ERROR;
    if (!run_guarded([&] { status = setParameter(name, parameter, value, validate); }))
        VLN_LOG(VLN_ERR, "Unable to allocate the memory for a DCB parameter");
    return status;
}

AX_STATUS VLN_MethodWrapper::vlncimSetCeePriority(const HBA_WWN* name, uint32 pfcBitmap,
                                                  const Priority_Groups& groups, bool validate) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimSetCeePriority()");
    return setPriorities(name, pfcBitmap, groups, validate);
}

AX_STATUS VLN_MethodWrapper::vlncimSetPgBW(const HBA_WWN* name,
                                           const Group_Bandwidths& bandwidths) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimSetPgBW()");
    uint32 value = 0;
    const AX_STATUS asked = AX_GetHBAFeature(wwnOf(name), FEATURE_PRIORITY_GROUPS, &value);
    if (asked == AX_STATUS_NOT_ANSWERING)
        return asked;
    if (asked != AX_STATUS_OK || value == 0) {
        VLN_LOG(VLN_ERR, "ERROR: Priority groups are not supported on the specified adapter.");
        return BRIDGING_NOT_OFFERED;
    }
    if (const AX_STATUS status = told(check_bandwidths(bandwidths)))
        return status;
    if (const AX_STATUS status = writeBandwidths(wwnOf(name), bandwidths)) {
        VLN_OPERATION_FAILED(status, "ERROR: Setting of bandwidth failed");
        return AX_STATUS_ERROR;
    }
    VLN_LOG(VLN_DBG, "Successfully set priority group bandwidths.");
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::vlncimGetCEEParams(const HBA_WWN* name, AX_CEE_Params* record) {
    Operation_Frame frame("Entering VLN_MethodWrapper::vlncimGetCEEParams()");
    if (!frame.given(record))
        return frame.status();
    *record = {};
    const AX_STATUS status = AX_CNA_GetCEE_Params(wwnOf(name), record);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_CNA_GetCEE_Params exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetPfcThrottle(const HBA_WWN* name, uint32 value) {
    Operation_Frame frame("Entering VLN_MethodWrapper::SetPfcThrottle()");
    if (value > 1) {
        VLN_LOG(VLN_ERR, "ERROR: Bad value for PFC Throttle!");
        return AX_STATUS_ERROR;
    }
    const AX_STATUS status =
        AX_SetAdapterAttribute(wwnOf(name), AX_PA_PFC_THROTTLE, &value, sizeof value);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "ERROR: Failed to set PFC throttle.");
    else
        VLN_LOG(VLN_DBG, "PFC throttle has been set");
    return status;
}

} // namespace cimple
