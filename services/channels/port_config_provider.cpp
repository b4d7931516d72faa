#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"
#include "services/channels/adapters.h"
#include "services/channels/instances.h"
#include "services/channels/port_config.h"
#include "services/channels/port_config_request.h"
#include "services/channels/provider.h"
#include "services/dump/instances.h"
#include "services/method_call.h"

#include <memory>

namespace cimple {

namespace {

#define OF_PROVIDER "VLNMPCA_PortConfigData_Provider"

sint32 obey(const Refused& refused) {
    return refused ? refuse_modify(static_cast<sint32>(refused->number), refused->line)
                   : MODIFY_INSTANCE_OK;
}

// The chip whose configuration it is, and how the library knows its adapter.
sint32 find_adapter(const ProviderAgent& agent, const VLNMPCA_PortConfigData& found, String& chip,
                    HBA_WWN& name) {
    chip = chip_of_setting(agent.m_VLNMPCA_ElementPortConfigData_map, found);
    if (chip.empty())
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND, "No chip instance found ");
    const auto* port = ethernet_port_of_chip(agent, chip);
    if (!port)
        return refuse_modify(MODIFY_INSTANCE_NOT_FOUND, "No ethernet port instance found ");
    return port_name_to_wwn(port->DeviceID.value, name) ? MODIFY_INSTANCE_OK
                                                        : MODIFY_INSTANCE_NOT_FOUND;
}

// SR-IOV goes with the profile without ETS.
void update_sriov_states(ProviderAgent& agent, const String& chip) {
    auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    for (uint32 i = 0; i < ports.size(); ++i) {
        const String* asic = port_identity(*ports[i], IDENTITY_ASIC);
        HBA_WWN name{};
        uint32 state = 0;
        if (!asic || *asic != chip || is_virtual_function(*ports[i]) ||
            !port_name_to_wwn(ports[i]->DeviceID.value, name) ||
            VLN_MethodWrapper::GetSRIOVState(&name, &state) != AX_STATUS_OK)
            continue;
        change(ports, i, [state](VLNMPCA_EthernetPort& port) {
            port.SRIOVState.set(static_cast<uint16>(state));
        });
    }
}

// Shows what the adapter has now. The change is made, whatever becomes of this.
void show_change(ProviderAgent& agent, const String& chip, const HBA_WWN& name,
                 const Function_Count_Change& count, bool ets_disabled) {
    const auto config = std::make_unique<AX_AdapterPortConfig>();
    if (VLN_MethodWrapper::GetAdpaterPortConfig(&name, config.get()) == AX_STATUS_OK) {
        change_configuration(agent, chip, CONFIG_PENDING, *config);
        if (count.npar != VLN_MethodWrapper::NPAR_STAYS)
            change_configuration(agent, chip, CONFIG_AVAILABLE, *config);
        change_configuration(agent, chip, CONFIG_CURRENT, *config);
    } else {
        VLN_LOG(VLN_ERR, OF_PROVIDER "::The pending configuration could not be read");
    }
    if (rebuild_channel_settings(agent, {}) != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, OF_PROVIDER "::The channels could not be read anew");
    if (ets_disabled)
        update_sriov_states(agent, chip);
}

sint32 modify_port_config(ProviderAgent& agent, const VLNMPCA_PortConfigData& model,
                          const VLNMPCA_PortConfigData& found) {
    const String& id = found.InstanceID.value;
    if (!is_current_configuration(id)) {
        VLN_LOG(VLN_ERR,
                "Passed instance is: %s, Need to invoke mi on 'Current Configuration' instances.",
                id.c_str());
        return MODIFY_INSTANCE_NOT_FOUND;
    }
    String chip;
    HBA_WWN name{};
    if (const sint32 status = find_adapter(agent, found, chip, name))
        return status;
    const auto present = std::make_unique<AX_AdapterPortConfig>();
    const auto next = std::make_unique<AX_AdapterPortConfig>();
    if (VLN_MethodWrapper::GetAdpaterPortConfig(&name, present.get()) != AX_STATUS_OK ||
        VLN_MethodWrapper::GetAdpaterPortConfig(&name, next.get()) != AX_STATUS_OK)
        return MODIFY_INSTANCE_NOT_FOUND;
    Function_Count_Change count;
    if (const sint32 status = obey(read_port_config(model, *present, *next, count)))
        return status;
    VLN_LOG(VLN_DBG, "%s", count.line);
    VLN_LOG(VLN_DBG, "Profie Id: %d", next->pid);
    bool ets_disabled = false;
    if (const AX_STATUS status =
            VLN_MethodWrapper::SetAdpaterPortConfig(&name, next.get(), &ets_disabled, count.npar)) {
        VLN_LOG(VLN_ERR, OF_PROVIDER "::Set Adapter port config failure. Ax Error: [ %u ]", status);
        return MODIFY_INSTANCE_NOT_FOUND;
    }
    show_change(agent, chip, name, count, ets_disabled);
    return MODIFY_INSTANCE_OK;
}

} // namespace

sint32 Port_Config_Provider::modify_instance(const VLNMPCA_PortConfigData* model,
                                             const VLNMPCA_PortConfigData* instance) {
    return answer_modify([&](ProviderAgent& agent) {
        if (!model || !instance)
            return refuse_modify(MODIFY_INSTANCE_FAILED,
                                 OF_PROVIDER "::modify_instance invalid parameter");
        const auto* found = agent.m_VLNMPCA_PortConfigData_map.lookup(model);
        if (!found)
            return refuse_modify(MODIFY_INSTANCE_NOT_FOUND,
                                 "Invalid instance of VLNMPCA_PortConfigData ");
        return modify_port_config(agent, *model, *found);
    });
}

} // namespace cimple
