#include "services/fip/provider.h"

#include "services/fip/instances.h"
#include "services/method_call.h"

namespace cimple {

namespace {

// Takes over what is given; an array counts by its first element, and as a text without one.
bool take(const Property<Array<String>>& property, std::string& value) {
    if (property.is_null())
        return false;
    if (property.value.size() != 0)
        value = property.value[0].c_str();
    return true;
}

bool take(const Property<String>& property, std::string& value) {
    if (property.is_null())
        return false;
    value = property.value.c_str();
    return true;
}

// False when nothing is given.
bool read_wanted(const VLNMPCA_FIPData& model, VLN_FIPParams& wanted) {
    bool given = take(model.PrimaryFabricName, wanted.primaryFabricName);
    given |= take(model.PrimarySwitchName, wanted.primarySwitchName);
    given |= take(model.VlanID, wanted.vlanId);
    given |= take(model.FCMap, wanted.fcMap);
    if (!model.CinVlanID.is_null())
        wanted.cinVlanId = model.CinVlanID.value;
    return given || wanted.cinVlanId;
}

// When the adapter does not tell what it has, the next look at the hardware does.
bool read_back(ProviderAgent& agent, const VLNMPCA_FIPData* model, const String& port,
               const HBA_WWN& name) {
    VLN_FIPParams params;
    if (VLN_MethodWrapper::vlnGetFIPParams(&name, &params) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the modified FIP Params from AXAPI for deviceID %s",
                port.c_str());
        agent.m_bAdapterRefreshRequested = true;
        return false;
    }
    change(agent.m_VLNMPCA_FIPData_map, model,
           [&params](VLNMPCA_FIPData& data) { fill_fip_data(data, params); });
    return true;
}

sint32 modify(ProviderAgent& agent, const VLNMPCA_FIPData* model, const VLNMPCA_FIPData* instance) {
    if (!model || !instance) {
        VLN_LOG(VLN_INFO, "VLNMPCA_Fip::modify_instance invalid parameter");
        return MODIFY_INSTANCE_INVALID_PARAMETER;
    }
    const auto* found = agent.m_VLNMPCA_FIPData_map.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "Invalid instance of VLNMPCA_FIPData");
    const String port = found->ElementName.value;
    HBA_WWN name{};
    if (!nameOfDeviceId(port.c_str(), name, "VLNMPCA_Fip::modify_instance::", VLN_ERR))
        return MODIFY_INSTANCE_FAILED;
    VLN_FIPParams wanted;
    if (!read_wanted(*model, wanted))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, "Error: No parameter specified");
    const AX_STATUS status = VLN_MethodWrapper::vlnSetFIPParams(&name, wanted);
    const bool shown = read_back(agent, model, port, name);
    if (status != AX_STATUS_OK)
        return status == AX_STATUS_INVALID_ARGUMENT ? MODIFY_INSTANCE_INVALID_PARAMETER
                                                    : MODIFY_INSTANCE_FAILED;
    if (shown)
        VLN_LOG(VLN_WARN,
                "Successfully modified the FIP parameters, need a port reset to take affect");
    return MODIFY_INSTANCE_OK;
}

} // namespace

sint32 FIP_Data_Provider::modify_instance(const VLNMPCA_FIPData* model,
                                          const VLNMPCA_FIPData* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
