// Modifying how much bandwidth a NIC may use.
#include "services/method_call.h"
#include "services/nic_settings/instances.h"
#include "services/nic_settings/provider.h"

namespace cimple {

namespace {

using Data = VLNMPCA_NICQOSData;

constexpr uint32 FLAG_SET = 1;

// The line of the first rule that the arguments break, or null. No library and no lock beside it.
const char* check_wanted(const Data& model, const Data& stored) {
    if (model.Value.is_null())
        return "Error: No parameter specified";
    const Property<uint16>& type = model.ChangeableType;
    const bool same = type.is_null() || (!stored.ChangeableType.is_null() &&
                                         type.value == stored.ChangeableType.value);
    return same ? nullptr : "Error:Invalid Input parameter, Modifiable parameter is Value only";
}

sint32 set_qos(ProviderAgent& agent, const Data& stored, const HBA_WWN& name, uint32 value) {
    AX_QoS qos{};
    qos.kind = AX_QOS_NIC;
    qos.flag = FLAG_SET;
    qos.maxBytesPerSecond = value;
    if (VLN_MethodWrapper::SetQOSParams(&name, &qos) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Failed to set the QoS Element setting data");
    if (VLN_MethodWrapper::GetQosInfo(&name, &qos) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the modified NIC Qos Info for InstanceID %s",
                stored.InstanceID.value.c_str());
        return MODIFY_INSTANCE_FAILED;
    }
    change(agent.m_VLNMPCA_NICQOSData_map, &stored,
           [&](Data& data) { data.Value.set(qos.maxBytesPerSecond); });
    VLN_LOG(VLN_DBG, "Successfully modified the QoS parameters");
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const Data* model, const Data* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "VLNMPCA_NICQOSData::modify_instance invalid parameter");
    const Data* stored = agent.m_VLNMPCA_NICQOSData_map.lookup(instance);
    if (!stored)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Invalid instance of VLNMPCA_NICQOSData Data");
    HBA_WWN name{};
    if (!port_of_setting(*stored, name))
        return MODIFY_INSTANCE_FAILED;
    if (const char* broken = check_wanted(*model, *stored))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, broken);
    return set_qos(agent, *stored, name, model->Value.value);
}

} // namespace

sint32 NIC_QoS_Provider::modify_instance(const Data* model, const Data* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
