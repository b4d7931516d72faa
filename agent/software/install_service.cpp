#include "agent/software/install_service.h"

#include "classes/CIM_ServiceAffectsElement.h"
#include "classes/VLNMPCA_SoftwareInstallationService.h"

namespace cimple {

namespace {

constexpr uint16 EFFECT_MANAGES = 5; // CIM_ServiceAffectsElement.ElementEffects

} // namespace

void affect_by_install_service(ProviderAgent& agent, Instance_Map_Base& store,
                               const Instance* element, const Insert_Failure& failure) {
    const auto& services = agent.m_VLNMPCA_SoftwareInstallationService_map;
    if (services.size() == 0)
        return;
    associate(store, element, services[0], failure, [](Instance& affects) {
        cast<CIM_ServiceAffectsElement>(&affects)->ElementEffects.append(EFFECT_MANAGES);
    });
}

} // namespace cimple
