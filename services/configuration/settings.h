// The tuning values of the provider: what the console sees of each, and how it is changed.
#ifndef VLN_SERVICES_CONFIGURATION_SETTINGS_H
#define VLN_SERVICES_CONFIGURATION_SETTINGS_H

#include "agent/provider_agent.h"

namespace cimple {

struct Tuning_Setting {
    const char* instance_id;
    const char* name;
    const char* description;
    uint32 low;
    uint32 high;
    uint32 default_value;
    uint32 (*current)(const VlnConfigFile& file);
    sint32 (VlnConfigFile::*set)(sint32 value);
    void (*update)(ProviderAgent& agent, uint32 value); // the agent's copy
    const char* done;                                   // the lines of both outcomes
    const char* refused;
};

inline constexpr std::size_t NUM_TUNING_SETTINGS = 3;

// By the place of the instance in its store.
extern const Tuning_Setting tuning_settings[NUM_TUNING_SETTINGS];

} // namespace cimple

#endif // VLN_SERVICES_CONFIGURATION_SETTINGS_H
