// The three tuning values as the console sees them.

#include "services/configuration/instances.h"

#include "agent/associations.h"
#include "agent/provider_agent.h"
#include "classes/VLNMPCA_ProviderConfigSetting.h"

namespace cimple {

namespace {

struct Setting_Row {
    const char* instance_id;
    const char* name;
    const char* description;
    uint32 low;
    uint32 high;
    uint32 default_value;
};

enum Setting { CACHE_TIMEOUT, ADAPTER_REFRESH, SAN_REFRESH, NUM_SETTINGS };

// In the order in which the console's changes find them, by position. The published low bound of
// the time-out is 5 although the setter takes 1: that is meant.
constexpr Setting_Row SETTINGS[NUM_SETTINGS] = {
    {"Vorlan MPCA Provider:cachetimeout", "cachetimeout",
     "This setting defines the timeout value of Vorlan CIM Provider's internal cache", 5, 30, 10},
    {"Vorlan MPCA Provider:adapterrefresh", "adapterrefresh",
     "This setting represents the Adapter data refresh setting value of Vorlan CIM Provider's "
     "internal cache",
     0, 1, 0},
    {"Vorlan MPCA Provider:sanrefresh", "sanrefresh",
     "This setting represents the SAN data refresh setting value of Vorlan CIM Provider's internal "
     "cache",
     0, 1, 1},
};

Ref<VLNMPCA_ProviderConfigSetting> configuration_setting(const Setting_Row& row, uint32 current) {
    auto setting = make_instance<VLNMPCA_ProviderConfigSetting>();
    setting->InstanceID.set(row.instance_id);
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
    const uint32 current[NUM_SETTINGS] = {
        agent.m_ConfigFile.get_cache_timeout(),
        agent.m_ConfigFile.get_refresh_adapter() ? 1u : 0u,
        agent.m_ConfigFile.get_refresh_san() ? 1u : 0u,
    };
    for (int i = 0; i < NUM_SETTINGS; ++i)
        if (!insert_instance(agent.m_VLNMPCA_ProviderConfigSetting_map,
                             configuration_setting(SETTINGS[i], current[i]),
                             "Insert Failed : m_VLNMPCA_ProviderConfigSetting_map"))
            return END_PASS;
    return MAP_OK;
}

} // namespace cimple
