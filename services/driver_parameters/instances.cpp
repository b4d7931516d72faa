#include "services/driver_parameters/instances.h"

#include "agent/element_setting.h"
#include "agent/provider_agent.h"
#include "agent/status/dynamic_status.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_DriverParameterService.h"
#include "classes/VLNMPCA_DriverParameterSettingData.h"
#include "classes/VLNMPCA_FCPort.h"
#include "services/service_instance.h"

#include <cstring>

namespace cimple {

namespace {

using Setting = VLNMPCA_DriverParameterSettingData;

enum class Parameter_Scope : uint8 {
    LOCAL,  // of one port
    GLOBAL, // of the driver
};

struct Parameter_Kind {
    const char* word;     // of the identifier
    const char* key_head; // by which a setting's kind is known
    uint32_t AX_DriverParam::*value;
    Setting_Flag flag;
};

constexpr Parameter_Kind CURRENT = {"Current", CURRENT_SETTING_HEAD, &AX_DriverParam::current,
                                    &CIM_ElementSettingData::IsCurrent};
constexpr Parameter_Kind DEFAULT = {"Default", "VLN:FCoE D", &AX_DriverParam::defaultValue,
                                    &CIM_ElementSettingData::IsDefault};
constexpr Parameter_Kind MAXIMUM = {"Maximum", "VLN:FCoE Ma", &AX_DriverParam::maximum,
                                    &CIM_ElementSettingData::IsMaximum};
constexpr Parameter_Kind MINIMUM = {"Minimum", "VLN:FCoE Mi", &AX_DriverParam::minimum,
                                    &CIM_ElementSettingData::IsMinimum};

using Kind_Order = const Parameter_Kind* [4];

constexpr Kind_Order LOCAL_ORDER = {&CURRENT, &DEFAULT, &MAXIMUM, &MINIMUM};
constexpr Kind_Order GLOBAL_ORDER = {&CURRENT, &MAXIMUM, &MINIMUM, &DEFAULT};

constexpr Setting_Flag FLAGS[] = {
    &CIM_ElementSettingData::IsDefault, &CIM_ElementSettingData::IsCurrent,
    &CIM_ElementSettingData::IsNext,    &CIM_ElementSettingData::IsMinimum,
    &CIM_ElementSettingData::IsMaximum,
};

String setting_key(const char* word, Parameter_Scope scope, const String& port_name,
                   const String& parameter) {
    return scope == Parameter_Scope::GLOBAL
               ? format_text("VLN:FCoE %s Global Driver Parameter:%s", word, parameter.c_str())
               : format_text("VLN:FCoE %s Local Driver Parameter:%s:%s", word, port_name.c_str(),
                             parameter.c_str());
}

// A global setting bears a port's name as well: through it the driver is reached.
Ref<Setting> setting_instance(const AX_DriverParam& record, const Parameter_Kind& kind,
                              Parameter_Scope scope, const String& port_name) {
    auto setting = make_instance<Setting>();
    const String parameter = field_text(record.name);
    setting->InstanceID.set(setting_key(kind.word, scope, port_name, parameter));
    setting->ElementName.set(port_name);
    if (scope == Parameter_Scope::LOCAL)
        setting->ConfigurationName.set(LOCAL_CONFIGURATION);
    setting->ChangeableType.set(record.changeableType);
    setting->ParameterName.set(parameter);
    setting->Value.set(record.*kind.value);
    setting->help.set(field_text(record.help));
    setting->exportFlag.set(record.exportFlag);
    return setting;
}

AX_STATUS fetch(const String& port_name, Parameter_Scope scope,
                std::vector<AX_DriverParam>& records) {
    return VLN_MethodWrapper::FCoEGetDriverParam(port_name.c_str(),
                                                 scope == Parameter_Scope::GLOBAL, &records);
}

const Parameter_Kind* kind_of(const Setting& setting) {
    for (const Parameter_Kind* kind : LOCAL_ORDER)
        if (std::strncmp(setting.InstanceID.value.c_str(), kind->key_head,
                         std::strlen(kind->key_head)) == 0)
            return kind;
    return nullptr;
}

// What the library tells of one scope now, in the settings that stand for it. A setting that is not
// in the store is left to the next refresh.
void update_settings(ProviderAgent& agent, const String& port_name, Parameter_Scope scope) {
    std::vector<AX_DriverParam> records;
    if (fetch(port_name, scope, records) != AX_STATUS_OK)
        return;
    for (const AX_DriverParam& record : records)
        for (const Parameter_Kind* kind : LOCAL_ORDER) {
            const auto now = setting_instance(record, *kind, scope, port_name);
            change(agent.m_VLNMPCA_DriverParameterSettingData_map, now.get(),
                   [&](Setting& setting) { setting.Value.set(now->Value.value); });
        }
}

void create_settings(ProviderAgent& agent, const String& port_name, Parameter_Scope scope) {
    const bool global = scope == Parameter_Scope::GLOBAL;
    std::vector<AX_DriverParam> records;
    if (const AX_STATUS status = fetch(port_name, scope, records)) {
        VLN_LOG(VLN_ERR, "Call to FCoEGetDriverParam to retrieve %s Driver Parameters failed",
                global ? "Global" : "Local");
        VLN_LOG(VLN_ERR, "rmStatus = %d", static_cast<int>(status));
        return;
    }
    for (const AX_DriverParam& record : records)
        for (const Parameter_Kind* kind : global ? GLOBAL_ORDER : LOCAL_ORDER)
            insert_instance(agent.m_VLNMPCA_DriverParameterSettingData_map,
                            setting_instance(record, *kind, scope, port_name));
}

Ref<VLNMPCA_DriverParameterService> parameter_service_instance(const CIM_ComputerSystem& system) {
    constexpr char DESCRIPTION[] = "Vorlan FCoE MPCA Set Driver Parameters Service";
    auto service = service_instance<VLNMPCA_DriverParameterService>(DESCRIPTION, "OK", system);
    service->ElementName.set(DESCRIPTION);
    return service;
}

} // namespace

const VLNMPCA_DriverParameterService* parameter_service(const ProviderAgent& agent) {
    const auto& services = agent.m_VLNMPCA_DriverParameterService_map;
    return services.size() == 0 ? nullptr : services[0];
}

Association_Details setting_flags(Setting_Flag one) {
    return [one](Instance& association) {
        for (const auto flag : FLAGS)
            (cast<CIM_ElementSettingData>(&association)->*flag)
                .set(flag == one ? SETTING_IS : SETTING_IS_NOT);
    };
}

uint32 create_driver_parameter_service(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* service = insert_instance(agent.m_VLNMPCA_DriverParameterService_map,
                                          parameter_service_instance(*scope.system));
    if (service)
        associate(agent.m_VLNMPCA_HostedDriverParameterService_map, scope.system, service);
    return MAP_OK;
}

uint32 create_driver_parameters(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    if (!associate(agent.m_VLNMPCA_DriverServiceAffectsElement_map, scope.element,
                   parameter_service(agent)))
        VLN_LOG(VLN_DBG, "Failed to create VLNMPCA_DriverServiceAffectsElement for fc port");
    if (scope.port->getPortIndex() != 0)
        return MAP_OK;
    const String name = text(scope.port->getPortName());
    if (scope.first_adapter)
        create_settings(agent, name, Parameter_Scope::GLOBAL);
    create_settings(agent, name, Parameter_Scope::LOCAL);
    return MAP_OK;
}

uint32 join_driver_parameters(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* service = parameter_service(agent);
    const auto& settings = agent.m_VLNMPCA_DriverParameterSettingData_map;
    for (uint32 i = 0; i < settings.size(); ++i) {
        const Setting& setting = *settings[i];
        const Parameter_Kind* kind = kind_of(setting);
        if (!kind) {
            VLN_LOG(VLN_DBG,
                    "VLNMPCA_DriverElementSettingData no match found for InstanceID Is values");
            continue;
        }
        if (service)
            associate(agent.m_VLNMPCA_DriverElementSettingData_map, service, &setting, {},
                      setting_flags(kind->flag));
        if (setting.ConfigurationName.value != LOCAL_CONFIGURATION)
            continue;
        const auto* port = find_in_system(agent, agent.m_VLNMPCA_FCPort_map,
                                          &VLNMPCA_FCPort::DeviceID, setting.ElementName.value);
        if (port)
            associate(agent.m_VLNMPCA_LocalPortElementSettingData_map, port, &setting, {},
                      setting_flags(kind->flag));
    }
    return MAP_OK;
}

// The driver is asked through each adapter's first port, for its own parameters through the first
// adapter.
void UpdateDriverParameters(ProviderAgent& agent) {
    if (!update_due(agent, UPDATE_DRIVER_PARAMETERS))
        return;
    bool global_done = false;
    for (const auto& adapter : agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_FCOE || adapter->getPortCount() == 0)
            continue;
        const String name = text(adapter->getPort(0)->getPortName());
        if (!global_done)
            update_settings(agent, name, Parameter_Scope::GLOBAL);
        global_done = true;
        update_settings(agent, name, Parameter_Scope::LOCAL);
    }
}

} // namespace cimple
