// The three tuning values as the console sees them.

#include "services/configuration/instances.h"

#include "agent/associations.h"
#include "classes/VLNMPCA_ProviderConfigSetting.h"
#include "services/configuration/settings.h"

namespace cimple {

namespace {

Ref<VLNMPCA_ProviderConfigSetting> configuration_setting(const Tuning_Setting& row,
                                                         uint32 current) {
    auto setting = make_instance<VLNMPCA_ProviderConfigSetting>();
    setting->InstanceID.set(row.instance_id);
    setting->ElementName.set(row.name);
    setting->paramname.set(row.name);
    setting->Description.set(row.description);
    setting->lowRange.set(row.low);
    setting->highRange.set(row.high);
    setting->def.set(row.default_value);
    setting->current.set(current);
    return setting;
}

} // namespace

uint32 create_configuration_settings(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    for (const Tuning_Setting& row : tuning_settings)
        if (!insert_instance(agent.m_VLNMPCA_ProviderConfigSetting_map,
                             configuration_setting(row, row.current(agent.m_ConfigFile)),
                             "Insert Failed : m_VLNMPCA_ProviderConfigSetting_map"))
            return END_PASS;
    return MAP_OK;
}

} // namespace cimple
