// The parameters of the FCoE driver: four settings of each, its value now and by default, its
// maximum and its minimum.
//
// Runs with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_DRIVER_PARAMETER_MAPS_H
#define VLN_AGENT_DRIVER_PARAMETER_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

enum class Parameter_Scope : uint8 {
    LOCAL,  // of one port
    GLOBAL, // of the driver
};

// Flags of CIM_ElementSettingData, in which way a setting is one of its element's.
inline constexpr uint16 SETTING_IS = 1;
inline constexpr uint16 SETTING_IS_NOT = 2;

class Driver_Parameter_Maps {
public:
    explicit Driver_Parameter_Maps(ProviderAgent& agent) : _agent(agent) {}

    // Makes the settings of one scope, as the port of that name tells them.
    void create(const String& port_name, Parameter_Scope scope);
    // Joins every setting with the service that sets it and, a local one, with its port.
    void join(const VLNMPCA_DriverParameterService* service);

private:
    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_DRIVER_PARAMETER_MAPS_H
