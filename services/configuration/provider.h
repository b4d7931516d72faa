// The class through which a console tunes the provider: its only instances that can be modified.
#ifndef VLN_SERVICES_CONFIGURATION_PROVIDER_H
#define VLN_SERVICES_CONFIGURATION_PROVIDER_H

#include "classes/VLNMPCA_ProviderConfigSetting.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Configuration_Setting_Provider : Pattern_Provider<VLNMPCA_ProviderConfigSetting> {
    // Sets the value `current`; a model without it answers MODIFY_INSTANCE_FAILED. The value counts
    // from the next refresh decision on, and is written to the tuning file when the agent goes.
    sint32 modify_instance(const VLNMPCA_ProviderConfigSetting* model,
                           const VLNMPCA_ProviderConfigSetting* instance);
};

template <>
struct Provider_For<VLNMPCA_ProviderConfigSetting> {
    using type = Configuration_Setting_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_CONFIGURATION_PROVIDER_H
