// Parameters are modified; what is created and deleted is the priority of a logical unit.
#include "services/driver_parameters/provider.h"

#include "classes/VLNMPCA_VPortHostedDependency.h"
#include "services/driver_parameters/instances.h"
#include "services/driver_parameters/lun_priorities.h"
#include "services/method_call.h"

#include <cstdio>
#include <cstring>

namespace cimple {

namespace {

using Setting = VLNMPCA_DriverParameterSettingData;

constexpr uint16 CHANGEABLE_AT_ONCE = 1; // ChangeableType

sint32 refuse(sint32 status, sint32 level, const char* line) {
    VLN_LOG(level, "%s", line);
    return status;
}

// ---- Modify ----

// The port through which a parameter is set: the setting's own. A client may name it too.
bool port_of(const Setting& setting, const String& named, HBA_WWN& port) {
    constexpr char STEP[] = "VLNMPCA_DriverParameterSettingData::modify_instance::";
    const String& own = setting.ElementName.value;
    if (!nameOfDeviceId((named.empty() ? own : named).c_str(), port, STEP, VLN_ERR))
        return false;
    HBA_WWN expected{};
    if (VLN_MethodWrapper::string2HBAName(&expected, own.c_str()) == 1 &&
        std::memcmp(&expected, &port, sizeof port) == 0)
        return true;
    VLN_LOG(VLN_ERR, "The driver parameter is not set through the port %s", named.c_str());
    return false;
}

bool set_parameter(const Setting& setting, const HBA_WWN& port, uint32 value) {
    using W = VLN_MethodWrapper;
    const bool local = setting.ConfigurationName.value == LOCAL_CONFIGURATION;
    const bool temporary = setting.ChangeableType.value == CHANGEABLE_AT_ONCE;
    char text[12]; // signed, whatever the parameter means
    std::snprintf(text, sizeof text, "%d", static_cast<int>(value));
    return W::vlncimSetDriverParam(setting.ElementName.value.c_str(), &port,
                                   local ? W::PARAMETER_LOCAL : W::PARAMETER_GLOBAL,
                                   temporary ? W::PARAMETER_TEMPORARY : W::PARAMETER_PERSISTENT,
                                   setting.ParameterName.value.c_str(), text) == AX_STATUS_OK;
}

sint32 modify_parameter(ProviderAgent& agent, const Setting* model, const Setting* instance) {
    if (!model || !instance)
        return refuse(
            MODIFY_INSTANCE_INVALID_PARAMETER, VLN_INFO,
            "VLNMPCA_DriverParameterSettingData_Provider::modify_instance invalid parameter");
    auto& store = agent.m_VLNMPCA_DriverParameterSettingData_map;
    const Setting* found = store.lookup(model);
    if (!found)
        return refuse(MODIFY_INSTANCE_FAILED, VLN_ERR,
                      "Invalid instance of VLNMPCA_DriverParameterSettingData");
    if (std::strncmp(found->InstanceID.value.c_str(), CURRENT_SETTING_HEAD,
                     std::strlen(CURRENT_SETTING_HEAD)) != 0)
        return refuse(MODIFY_INSTANCE_INVALID_PARAMETER, VLN_DBG,
                      "Modify instance is supported only on the current instance.");
    // The model tells what is to change, the instance what it is to be.
    const Property<uint32>& value = instance->Value;
    if (model->Value.is_null() || value.is_null())
        return refuse(MODIFY_INSTANCE_INVALID_PARAMETER, VLN_ERR, "No Value specified");
    HBA_WWN port{};
    if (!port_of(*found, instance->ElementName.value, port))
        return MODIFY_INSTANCE_FAILED;
    if (!set_parameter(*found, port, value.value))
        return refuse(
            MODIFY_INSTANCE_FAILED, VLN_ERR,
            "VLNMPCA_DriverParameterSettingData_Provider::vlncimFCoESetDriverParam failed");
    VLN_LOG(VLN_DBG,
            "VLNMPCA_DriverParameterSettingData_Provider::vlncimFCoESetDriverParam succeded");
    change(store, model, [&](Setting& setting) { setting.Value.set(value.value); });
    return MODIFY_INSTANCE_OK;
}

// ---- Create and delete ----

// The port of the identifier; with a line for each place that does not have it.
Initiator find_named_initiator(const ProviderAgent& agent, const Priority_Name& name) {
    const Initiator initiator = find_initiator(agent, name.initiator);
    if (!initiator.physical)
        VLN_LOG(VLN_WARN, "Could not find the corresponding FC Port instance from initiator. "
                          "Checking for virtual FC Port");
    if (!initiator.known())
        VLN_LOG(VLN_WARN, "Also could not find the corresponding virtual FC port instance from "
                          "initiator.");
    return initiator;
}

// The port that carries a virtual one.
const VLNMPCA_FCPort* carrier_of(const ProviderAgent& agent, const VLNMPCA_VirtualFCPort& port) {
    const auto* link = find_first(agent.m_VLNMPCA_VPortHostedDependency_map,
                                  [&](const VLNMPCA_VPortHostedDependency& each) {
                                      return each.Dependent && key_eq(each.Dependent, &port);
                                  });
    return link ? cast<VLNMPCA_FCPort>(link->Antecedent) : nullptr;
}

// False, with a line, when the adapter does not do it.
bool set_priority(const ProviderAgent& agent, const Priority_Name& name, const Initiator& initiator,
                  uint32 state) {
    const auto option = name.option();
    if (!option) {
        VLN_LOG(VLN_ERR, "VLNMPCA_DriverParameterSettingData_Provider::Invalid option");
        return false;
    }
    VLN_LOG(VLN_DBG, "Option: %d", static_cast<int>(*option));
    const VLNMPCA_FCPort* port =
        initiator.physical ? initiator.physical : carrier_of(agent, *initiator.virtual_port);
    const String& through = port ? port->DeviceID.value : name.initiator;
    if (VLN_MethodWrapper::SetOASLunState(through.c_str(), name.initiator.c_str(),
                                          name.target.c_str(), name.lun.c_str(), state,
                                          *option) == AX_STATUS_OK)
        return true;
    VLN_LOG(VLN_ERR, "VLNMPCA_DriverParameterSettingData_Provider::SetOASLunState failed");
    return false;
}

bool hide_priority(ProviderAgent& agent, const String& instance_id) {
    return hide_priorities(agent, [&instance_id](const Setting& setting) {
        return setting.InstanceID.value == instance_id;
    });
}

sint32 create_priority(ProviderAgent& agent, const Setting* instance) {
    VLN_LOG(VLN_DBG, "VLNMPCA_DriverParameterSettingData_Provider::create_instance()");
    if (!instance)
        return refuse(CREATE_INSTANCE_FAILED, VLN_ERR,
                      "Invalid(NULL) VLNMPCA_DriverParameterSettingData_Provider instance passed");
    if (agent.m_VLNMPCA_DriverParameterSettingData_map.lookup(instance))
        return refuse(CREATE_INSTANCE_DUPLICATE, VLN_ERR,
                      "VLNMPCA_DriverParameterSettingData_Provider::Duplicate instance found.");
    const String& id = instance->InstanceID.value;
    if (id.find(PRIORITY_PARAMETER) < 0) {
        VLN_LOG(VLN_ERR, "InstanceID size = 0, PrioVia parameter not found in InstanceID: %s",
                id.c_str());
        return CREATE_INSTANCE_INVALID_PARAMETER;
    }
    VLN_LOG(VLN_DBG, "Input InstanceID: %s", id.c_str());
    const Priority_Name name(id);
    const Initiator initiator = find_named_initiator(agent, name);
    if (!initiator.known())
        return CREATE_INSTANCE_FAILED;
    auto setting = priority_setting(id, "Prio Via", name.option().value_or(0), 1);
    if (!set_priority(agent, name, initiator, 1))
        return CREATE_INSTANCE_FAILED;
    bool shown = false;
    if (!run_guarded([&] { shown = show_priority(agent, std::move(setting), initiator); }))
        hide_priority(agent, id);
    if (!shown)
        return CREATE_INSTANCE_FAILED;
    VLN_LOG(VLN_DBG, "VLNMPCA_DriverParameterSettingData_Provider::create_instance() Succesful");
    return CREATE_INSTANCE_OK;
}

sint32 delete_priority(ProviderAgent& agent, const Setting* instance) {
    VLN_LOG(VLN_DBG, "VLNMPCA_DriverParameterSettingData_Provider::delete_instance()");
    if (!instance)
        return refuse(DELETE_INSTANCE_FAILED, VLN_ERR,
                      "Invalid VLNMPCA_DriverParameterSettingData_Provider instance passed");
    if (!agent.m_VLNMPCA_DriverParameterSettingData_map.lookup(instance))
        return refuse(DELETE_INSTANCE_NOT_FOUND, VLN_ERR, "Instance Not found ");
    const String& id = instance->InstanceID.value;
    const Priority_Name name(id);
    const Initiator initiator = find_named_initiator(agent, name);
    if (!initiator.known() || !set_priority(agent, name, initiator, 0))
        return DELETE_INSTANCE_FAILED;
    if (!hide_priority(agent, id))
        VLN_LOG(VLN_ERR, "VLNMPCA_DriverParameterSettingData:: Invalid associations ");
    return DELETE_INSTANCE_OK;
}

} // namespace

sint32 Driver_Parameter_Provider::modify_instance(const Setting* model, const Setting* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_parameter(agent, model, instance); });
}

sint32 Driver_Parameter_Provider::create_instance(Setting* instance) {
    return answer_change(CREATE_INSTANCE_FAILED,
                         [&](ProviderAgent& agent) { return create_priority(agent, instance); });
}

sint32 Driver_Parameter_Provider::delete_instance(const Setting* instance) {
    return answer_change(DELETE_INSTANCE_FAILED,
                         [&](ProviderAgent& agent) { return delete_priority(agent, instance); });
}

} // namespace cimple
