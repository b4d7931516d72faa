// How much an iSCSI port may move.
#include "agent/element_setting.h"
#include "classes/CIM_ElementSettingData.h"
#include "services/iscsi_settings/provider.h"
#include "services/method_call.h"

namespace cimple {

namespace {

using Data = VLNMPCA_ISCSIQOSData;

constexpr uint32 FLAG_SET = 1;

// The line of the first rule that the arguments break, or null. No library and no lock beside it.
const char* check_wanted(const Data& model, const Data& stored) {
    if (model.MaxBytesPerSecond.is_null() && model.MaxIOsPerSecond.is_null())
        return "Error: No parameter specified";
    const bool same =
        model.ChangeableType.is_null() || model.ChangeableType.value == stored.ChangeableType.value;
    return same ? nullptr
                : "Error:Invalid Input parameter, Modifiable parameters are MaxBytesPerSecond and "
                  "MaxIOsPerSecond";
}

bool set_limits(const HBA_WWN& name, AX_QoS& qos) {
    return VLN_MethodWrapper::SetQOSParams(&name, &qos) == AX_STATUS_OK &&
           VLN_MethodWrapper::GetQosInfo(&name, &qos) == AX_STATUS_OK;
}

// What was read from the port at the last refresh is no longer what it is set to.
void mark_changed(Instance_Map_Base& ties, const Data& stored) {
    for (uint32 i = 0; i < ties.size(); ++i)
        if (key_eq(cast<CIM_ElementSettingData>(ties.at(i))->SettingData, &stored))
            change(ties, i, [](Instance& tie) {
                cast<CIM_ElementSettingData>(&tie)->IsCurrent.set(SETTING_IS_NOT);
            });
}

sint32 modify(ProviderAgent& agent, const Data* model, const Data* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "VLNMPCA_ISCSIQOSData_Provider::modify_instance invalid parameter");
    const Data* stored = agent.m_VLNMPCA_ISCSIQOSData_map.lookup(instance);
    HBA_WWN name{};
    if (!stored || !VLN_MethodWrapper::string2HBAName(&name, stored->Description.value.c_str()))
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND, "Invalid instance of VLNMPCA_ISCSIQOSData");
    if (const char* broken = check_wanted(*model, *stored))
        return refuse_modify(MODIFY_INSTANCE_FAILED, broken);
    const auto limit = [](const Property<uint32>& given, const Property<uint32>& now) {
        return given.is_null() ? now.value : given.value;
    };
    AX_QoS qos{};
    qos.kind = AX_QOS_ISCSI;
    qos.flag = FLAG_SET;
    qos.maxBytesPerSecond = limit(model->MaxBytesPerSecond, stored->MaxBytesPerSecond);
    qos.maxIOsPerSecond = limit(model->MaxIOsPerSecond, stored->MaxIOsPerSecond);
    if (!set_limits(name, qos))
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                             "Failed to set the QoS Element setting data");
    stored = change(agent.m_VLNMPCA_ISCSIQOSData_map, stored, [&](Data& data) {
        data.MaxBytesPerSecond.set(qos.maxBytesPerSecond);
        data.MaxIOsPerSecond.set(qos.maxIOsPerSecond);
    });
    mark_changed(agent.m_VLNMPCA_PortISCSIQOSSettingData_map, *stored);
    mark_changed(agent.m_VLNMPCA_ServiceiSCSIQOSSettingData_map, *stored);
    VLN_LOG(VLN_DBG, "Successfully modified the QoS parameters");
    return MODIFY_INSTANCE_OK;
}

} // namespace

sint32 ISCSI_QoS_Provider::modify_instance(const Data* model, const Data* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
