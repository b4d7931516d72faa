// What the instances of all services have in common.
#ifndef VLN_SERVICES_SERVICE_INSTANCE_H
#define VLN_SERVICES_SERVICE_INSTANCE_H

#include "agent/associations.h"

namespace cimple {

inline constexpr uint16 STATE_ENABLED = 2; // EnabledState, RequestedState and EnabledDefault
inline constexpr uint16 HEALTH_OK = 5;     // CIM_ManagedSystemElement.HealthState

// A service that runs from the start.
template <class Service>
Ref<Service> service_instance(const char* description, const char* status,
                              const CIM_ComputerSystem& system) {
    auto service = make_instance<Service>();
    name_in_system(*service, system);
    service->Name.set(Service::static_meta_class.name);
    service->Description.set(description);
    service->StartMode.set("Automatic");
    service->Started.set(true);
    service->EnabledState.set(STATE_ENABLED);
    service->Status.set(status);
    service->HealthState.set(HEALTH_OK);
    return service;
}

} // namespace cimple

#endif // VLN_SERVICES_SERVICE_INSTANCE_H
