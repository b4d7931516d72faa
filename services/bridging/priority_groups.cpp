// What a console changes of priority groups, flow control and the priorities of applications.
#include "services/bridging/instances.h"
#include "services/bridging/provider.h"
#include "services/method_call.h"

#include <algorithm>
#include <cstring>
#include <string>

namespace cimple {

namespace {

constexpr uint32 MAX_FLOW_CONTROL_PRIORITIES = 2;

// A step answers the status of the modification.
class Group_Change {
public:
    Group_Change(ProviderAgent& agent, const VLNMPCA_PGData& model)
        : _agent(agent), _model(model) {}

    sint32 run();

private:
    sint32 apply();
    sint32 setApplications();
    sint32 setApplication(const Property<uint32>& wanted, const Property<uint32>& had,
                          const char* parameter, bool validate, const char* failed);
    sint32 setPriorities();
    sint32 setBandwidths();
    sint32 setFlowControl();
    // The instance as it stands: a step that writes has it read back.
    const VLNMPCA_PGData& stored() const { return *_agent.m_VLNMPCA_PGData_map.lookup(&_model); }

    ProviderAgent& _agent;
    const VLNMPCA_PGData& _model;
    String _device_id;
    HBA_WWN _name{};
    bool _validate = true;
    bool _asked = false; // the library, for a change
};

bool differs(const Property<Array<uint32>>& wanted, const Property<Array<uint32>>& had) {
    return !wanted.is_null() && !(wanted.value == had.value);
}

// ---- Priorities of applications ----

sint32 Group_Change::setApplication(const Property<uint32>& wanted, const Property<uint32>& had,
                                    const char* parameter, bool validate, const char* failed) {
    if (wanted.is_null() || (!had.is_null() && wanted.value == had.value))
        return MODIFY_INSTANCE_OK;
    _asked = true;
    const std::string value = std::to_string(wanted.value);
    if (VLN_MethodWrapper::vlncimSetCEEParams(&_name, parameter, value.c_str(), validate) !=
        AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED, failed);
    // Groups and flow control may have followed, and what is not given of them is to stay.
    read_groups_back(_agent, _device_id, _name);
    return MODIFY_INSTANCE_OK;
}

sint32 Group_Change::setApplications() {
    using D = VLNMPCA_PGData;
    const struct {
        Property<uint32> D::*priority;
        const char* parameter;
        bool validate;
        const char* failed;
    } ROWS[] = {
        {&D::FCoEPriority, "fcoepriority", _validate,
         "VLN_MethodWrapper::vlncimSetCEEParams call for FCoEPriority failed"},
        {&D::iSCSIPriority, "iscsipriority", true,
         "VLN_MethodWrapper::vlncimSetCEEParams call for iSCSIPriority failed"},
        {&D::RoCePriority, "rocepriority", _validate,
         "vlncimSetCEEParams call for RoCePriority failed"},
    };
    for (const auto& row : ROWS)
        if (const sint32 status = setApplication(_model.*row.priority, stored().*row.priority,
                                                 row.parameter, row.validate, row.failed))
            return status;
    return MODIFY_INSTANCE_OK;
}

// ---- Groups and flow control ----

// A priority that no byte can hold stays one that there is not, and does not become the filler.
uint8 priority_byte(uint32 priority) {
    return static_cast<uint8>(std::min<uint32>(priority, Priority_Groups::FILLER - 1));
}

// Of the first two: a switch may have put more of them under flow control.
uint32 flow_control_bitmap(const Array<uint32>& priorities) {
    uint32 bitmap = 0;
    for (uint32 i = 0; i < std::min(priorities.size(), MAX_FLOW_CONTROL_PRIORITIES); ++i) {
        if (priorities[i] >= NUM_PRIORITIES)
            return NO_PRIORITY_BITMAP;
        bitmap |= 1U << priorities[i];
    }
    return bitmap;
}

// False for a list that is longer than an adapter takes.
bool fill_group(Priority_Groups::Group& group, const Array<uint32>& priorities) {
    if (priorities.size() > group.size())
        return false;
    std::transform(priorities.begin(), priorities.end(), group.begin(), priority_byte);
    return true;
}

void log_priorities(const Priority_Groups& groups, uint32 pfc_bitmap) {
    for (std::size_t i = 0; i < Priority_Groups::GROUPS; ++i) {
        std::string list;
        for (const uint8 priority : groups.group[i])
            if (priority != Priority_Groups::FILLER)
                list += (list.empty() ? "" : ",") + std::to_string(priority);
        const auto number = i < AX_PRIORITY_GROUPS ? i : std::size_t{AX_UNLIMITED_GROUP};
        VLN_LOG(VLN_DBG, "PriorityGroup %zu: %s", number, list.c_str());
    }
    VLN_LOG(VLN_DBG, "PFC priority bitmap: 0x%X", pfc_bitmap);
}

sint32 Group_Change::setPriorities() {
    const VLNMPCA_PGData& had = stored();
    const auto wanted = [&](Priority_List list) -> const Property<Array<uint32>>& {
        return (_model.*list).is_null() ? had.*list : _model.*list;
    };
    if (_model.PFCPriority.value.size() > MAX_FLOW_CONTROL_PRIORITIES)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Max two pfc priority are supported");
    Priority_Groups groups;
    bool changed = differs(_model.PFCPriority, had.PFCPriority);
    for (std::size_t i = 0; i < Priority_Groups::GROUPS; ++i) {
        const Priority_List list = PRIORITY_LISTS[i];
        changed = changed || differs(_model.*list, had.*list);
        if (!fill_group(groups.group[i], wanted(list).value))
            return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                                 "Invalid PriorityGroup, too many priorities are given");
    }
    if (!changed) {
        VLN_LOG(VLN_DBG, "PriorityGroup and pfc are not modified.");
        return MODIFY_INSTANCE_OK;
    }
    const uint32 bitmap = flow_control_bitmap(wanted(&VLNMPCA_PGData::PFCPriority).value);
    log_priorities(groups, bitmap);
    _asked = true;
    if (VLN_MethodWrapper::vlncimSetCeePriority(&_name, bitmap, groups, _validate) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_PGData_Provider::vlncimSetCeePriority call failed");
    return MODIFY_INSTANCE_OK;
}

// ---- Bandwidths ----

sint32 Group_Change::setBandwidths() {
    const Property<Array<uint32>>& had = stored().PriorityBandwidth;
    if (_model.PriorityBandwidth.is_null())
        return MODIFY_INSTANCE_OK;
    const Array<uint32>& wanted = _model.PriorityBandwidth.value;
    Group_Bandwidths bandwidths{};
    if (wanted.size() != had.value.size() || wanted.size() != bandwidths.size())
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid PriorityBandwidth data, Should be array of 8 elements");
    if (std::any_of(wanted.begin(), wanted.end(), [](uint32 percent) { return percent > 100; }))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid PriorityBandwidth, Element Value Should be b/w 0 - 100");
    if (!differs(_model.PriorityBandwidth, had))
        return MODIFY_INSTANCE_OK;
    std::copy(wanted.begin(), wanted.end(), bandwidths.begin());
    _asked = true;
    if (VLN_MethodWrapper::vlncimSetPgBW(&_name, bandwidths) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_PGData_Provider::vlncimSetPgBW call failed");
    return MODIFY_INSTANCE_OK;
}

// ---- Flow control as a whole ----

sint32 Group_Change::setFlowControl() {
    const Property<String>& wanted = _model.PFCEnabled;
    if (wanted.is_null() || wanted.value == stored().PFCEnabled.value)
        return MODIFY_INSTANCE_OK;
    const bool enabled = wanted.value == "Yes";
    if (!enabled && wanted.value != "No")
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid PFCEnabled, supported values are Yes and No");
    _asked = true;
    if (VLN_MethodWrapper::vlncimSetCEEParams(&_name, "pfcenabled", enabled ? "1" : "0", true) !=
        AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLN_MethodWrapper::vlncimSetCEEParams call for PFCEnabled failed");
    return MODIFY_INSTANCE_OK;
}

sint32 Group_Change::apply() {
    for (const auto step : {&Group_Change::setApplications, &Group_Change::setPriorities,
                            &Group_Change::setBandwidths, &Group_Change::setFlowControl})
        if (const sint32 status = (this->*step)())
            return status;
    return MODIFY_INSTANCE_OK;
}

sint32 Group_Change::run() {
    const auto* found = _agent.m_VLNMPCA_PGData_map.lookup(&_model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid instance of VLNMPCA_PGData Data");
    if (std::strncmp(found->InstanceID.value.c_str(), CONFIGURED_SETTINGS,
                     std::strlen(CONFIGURED_SETTINGS)) != 0)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "modify_instance is supported only on Configured instance");
    _device_id = found->ElementName.value;
    if (!nameOfDeviceId(_device_id.c_str(), _name, "VLNMPCA_PGData::modify_instance::", VLN_ERR))
        return MODIFY_INSTANCE_FAILED;
    _validate = _model.ValidateRule.is_null() || _model.ValidateRule.value != 0;
    VLN_LOG(VLN_DBG, "ValidateRule = %d", static_cast<int>(_validate));
    const sint32 status = apply();
    if (status == MODIFY_INSTANCE_OK || _asked)
        rebuild_bridging(_agent);
    return status;
}

} // namespace

sint32 Priority_Group_Provider::modify_instance(const VLNMPCA_PGData* model,
                                                const VLNMPCA_PGData* instance) {
    return answer_modify([&](ProviderAgent& agent) {
        if (!model || !instance)
            return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                                 "VLNMPCA_PGData::modify_instance invalid parameter");
        return Group_Change(agent, *model).run();
    });
}

} // namespace cimple
