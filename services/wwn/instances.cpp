#include "services/wwn/instances.h"

#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/VLNMPCA_FCWWNService.h"
#include "services/service_instance.h"

namespace cimple {

namespace {

Ref<VLNMPCA_FCWWNService> wwn_service_instance(const CIM_ComputerSystem& system) {
    auto service = service_instance<VLNMPCA_FCWWNService>("Vorlan FCOE FC WWN Management Service",
                                                          "Ok", system);
    service->RequestedState.set(STATE_ENABLED);
    service->EnabledDefault.set(STATE_ENABLED);
    return service;
}

} // namespace

uint32 start_wwn_service(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* service =
        insert_instance(agent.m_VLNMPCA_FCWWNService_map, wwn_service_instance(*scope.system));
    if (!service)
        return SKIP_DEVICE;
    associate_as(agent.m_VLNMPCA_HostedFCWWNService_map,
                 "Hosted Service, Vorlan MPCA FC WWN Management Service", scope.system, service);
    associate_as(agent.m_VLNMPCA_FCWWNServiceAffectsSystem_map,
                 format_text("MPCA FC WWN Management Service Affects System: %s",
                             scope.system->Name.value.c_str()),
                 scope.system, service);
    return MAP_OK;
}

} // namespace cimple
