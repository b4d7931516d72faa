#include "services/configuration/settings.h"

namespace cimple {

// The published low bound of the time-out is 5 although the setter takes 1: that is meant.
constexpr Tuning_Setting tuning_settings[NUM_TUNING_SETTINGS] = {
    {"Vorlan MPCA Provider:cachetimeout", "cachetimeout",
     "This setting defines the timeout value of Vorlan CIM Provider's internal cache", 5, 30, 10,
     [](const VlnConfigFile& file) { return file.get_cache_timeout(); },
     &VlnConfigFile::set_cache_timeout,
     [](ProviderAgent& agent, uint32 value) { agent.m_CacheTimeout = value; },
     "Cache time-out is modified successfully",
     "The value provided for cache time-out is out of range"},
    {"Vorlan MPCA Provider:adapterrefresh", "adapterrefresh",
     "This setting represents the Adapter data refresh setting value of Vorlan CIM Provider's "
     "internal cache",
     0, 1, 0, [](const VlnConfigFile& file) { return uint32{file.get_refresh_adapter()}; },
     &VlnConfigFile::set_refresh_adapter,
     [](ProviderAgent& agent, uint32 value) { agent.m_bRefreshAdapterData = value != 0; },
     "Adapter refresh is modified successfully",
     "The value provided for adapter refresh out is out of range"},
    {"Vorlan MPCA Provider:sanrefresh", "sanrefresh",
     "This setting represents the SAN data refresh setting value of Vorlan CIM Provider's internal "
     "cache",
     0, 1, 1, [](const VlnConfigFile& file) { return uint32{file.get_refresh_san()}; },
     &VlnConfigFile::set_refresh_san,
     [](ProviderAgent& agent, uint32 value) { agent.m_bRefreshSANData = value != 0; },
     "SAN refresh is modified successfully",
     "The value provided for SAN refresh out is out of range"},
};

} // namespace cimple
