#include "services/configuration/provider.h"

#include "agent/gates.h"
#include "cimple/guard.h"
#include "services/configuration/settings.h"

namespace cimple {

namespace {

sint32 apply(ProviderAgent& agent, const Tuning_Setting& setting, uint32 value) {
    // A value beyond the signed range turns negative, and is refused as such.
    if ((agent.m_ConfigFile.*setting.set)(static_cast<sint32>(value)) != 0) {
        VLN_LOG(VLN_ERR, "%s", setting.refused);
        return MODIFY_INSTANCE_INVALID_PARAMETER;
    }
    setting.update(agent, value);
    VLN_LOG(VLN_WARN, "%s", setting.done);
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const VLNMPCA_ProviderConfigSetting* model,
              const VLNMPCA_ProviderConfigSetting* instance) {
    const Operation_Prologue prologue(agent);
    if (!model || !instance) {
        VLN_LOG(VLN_ERR,
                "VLNMPCA_ProviderConfigSetting_Provider::modify_instance invalid parameter");
        return MODIFY_INSTANCE_INVALID_PARAMETER;
    }
    auto& settings = agent.m_VLNMPCA_ProviderConfigSetting_map;
    for (uint32 i = 0; i < settings.size(); ++i) {
        if (model->current.is_null() || !key_eq(settings[i], model))
            continue;
        const uint32 value = instance->current.value;
        if (i < NUM_TUNING_SETTINGS)
            if (const sint32 status = apply(agent, tuning_settings[i], value))
                return status;
        change(settings, i,
               [value](VLNMPCA_ProviderConfigSetting& setting) { setting.current.set(value); });
        return MODIFY_INSTANCE_OK;
    }
    VLN_LOG(VLN_ERR, "Instance does not exist");
    return MODIFY_INSTANCE_FAILED;
}

} // namespace

sint32
Configuration_Setting_Provider::modify_instance(const VLNMPCA_ProviderConfigSetting* model,
                                                const VLNMPCA_ProviderConfigSetting* instance) {
    VLN_LOG(VLN_DBG, "VLNMPCA_ProviderConfigSetting_Provider::modify_instance()");
    ProviderAgent* agent = ProviderAgent::current();
    if (!agent)
        return MODIFY_INSTANCE_FAILED;
    sint32 status = MODIFY_INSTANCE_FAILED;
    return run_guarded([&] { status = modify(*agent, model, instance); }) ? status
                                                                          : MODIFY_INSTANCE_FAILED;
}

} // namespace cimple
