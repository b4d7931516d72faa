// Modifying the settings of a PHY.
#include "classes/VLNMPCA_PHYPhysicalComponent.h"
#include "services/method_call.h"
#include "services/phy/functional_port.h"
#include "services/phy/provider.h"

namespace cimple {

namespace {

using Data = VLNMPCA_PHYPhysicalComponentData;

constexpr uint32 MIN_NVP = 1; // percent
constexpr uint32 MAX_NVP = 100;
constexpr uint32 ALL_LINE_RATES = 0;

// The name by which the library knows the PHY's port, or the status that ends the call.
sint32 find_port_name(const ProviderAgent& agent, const String& physical_port, HBA_WWN& name) {
    const auto* port = find_functional_port(agent, physical_port);
    if (!port)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "Unable to find the functional port for this instance");
    VLN_LOG(VLN_DBG, "Found Functional port for adapter : %s", physical_port.c_str());
    return nameOfDeviceId(port->DeviceID.value.c_str(), name,
                          "VLNMPCA_PHYPhysicalComponentData_Provider::", VLN_ERR)
               ? MODIFY_INSTANCE_OK
               : MODIFY_INSTANCE_INVALID_PARAMETER;
}

// The physical port is told by the description, which a client may leave out of what it sends.
String physical_port_of(const Data& instance, const Data* stored) {
    const bool told = !instance.Description.is_null() || !stored;
    return told ? instance.Description.value : stored->Description.value;
}

// Whether a velocity is given that a cable can have.
bool wants_nvp(const Data& model) {
    if (model.CableNVP.is_null())
        return false;
    VLN_LOG(VLN_DBG, "CableNVP data is passed");
    const bool valid = model.CableNVP.value >= MIN_NVP && model.CableNVP.value <= MAX_NVP;
    if (!valid)
        VLN_LOG(VLN_ERR, "Invalid CableNVP value, Vaild values range 1 - 100");
    return valid;
}

bool wants_line_rates(const Data& model) {
    return !model.LineRateAdvertised_10G.is_null() || !model.LineRateAdvertised_1G.is_null() ||
           !model.LineRateAdvertised_100MB.is_null();
}

sint32 set_nvp(ProviderAgent& agent, const Data& model, const HBA_WWN& name,
               const String& physical_port) {
    const uint32 percent = model.CableNVP.value;
    if (VLN_MethodWrapper::SetCableNVP(&name, percent) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, "Unable to Set the CableNVP");
    change(agent.m_VLNMPCA_PHYPhysicalComponentData_map, &model,
           [percent](Data& data) { data.CableNVP.set(percent); });
    auto& phys = agent.m_VLNMPCA_PHYPhysicalComponent_map;
    const auto* phy = find_first(phys, [&](const VLNMPCA_PHYPhysicalComponent& each) {
        return each.Description.value == physical_port;
    });
    if (phy)
        change(phys, phy,
               [percent](VLNMPCA_PHYPhysicalComponent& each) { each.CableNVP.set(percent); });
    VLN_LOG(VLN_DBG, "Successfully set the CableNVP");
    return MODIFY_INSTANCE_OK;
}

// The adapter is told to advertise, and not what.
sint32 set_line_rates(ProviderAgent& agent, const Data& instance, const HBA_WWN& name) {
    if (VLN_MethodWrapper::SetLineRateAdvertised(&name, ALL_LINE_RATES) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Failed to set the LineRateAdvertised");
    change(agent.m_VLNMPCA_PHYPhysicalComponentData_map, &instance, [&](Data& data) {
        for (const auto rate : {&Data::LineRateAdvertised_10G, &Data::LineRateAdvertised_1G,
                                &Data::LineRateAdvertised_100MB})
            if (!(instance.*rate).is_null())
                (data.*rate).set((instance.*rate).value);
    });
    VLN_LOG(VLN_DBG, "Successfully set the LineRateAdvertised");
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const Data* model, const Data* instance) {
    if (!model || !instance)
        return refuse_modify(
            MODIFY_INSTANCE_INVALID_PARAMETER,
            "VLNMPCA_PHYPhysicalComponentData_Provider::modify_instance invalid parameter");
    const auto& store = agent.m_VLNMPCA_PHYPhysicalComponentData_map;
    const Data* stored = store.lookup(instance);
    if (!stored && store.size() != 0)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid instance of VLNMPCA_PHYPhysicalComponentData_Provider");
    const String physical_port = physical_port_of(*instance, stored);
    HBA_WWN name{};
    if (const sint32 status = find_port_name(agent, physical_port, name))
        return status;
    const bool nvp = wants_nvp(*model);
    if (!stored)
        return MODIFY_INSTANCE_FAILED;
    if (nvp)
        if (const sint32 status = set_nvp(agent, *model, name, physical_port))
            return status;
    if (wants_line_rates(*model))
        return set_line_rates(agent, *instance, name);
    return nvp ? MODIFY_INSTANCE_OK
               : refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                               "No Modifiable parameter specified/Invalid Value passed");
}

} // namespace

sint32 Phy_Data_Provider::modify_instance(const Data* model, const Data* instance) {
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
