// The service that installs firmware: its instance, its capabilities, and what they hang on.

#include "services/firmware/instances.h"

#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/provider_agent.h"
#include "agent/software/install_service.h"
#include "agent/text.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_SoftwareInstallationService.h"
#include "classes/VLNMPCA_SoftwareInstallationServiceCapabilities.h"
#include "foundation/common.h"
#include "operations/curl_library.h"

namespace cimple {

namespace {

constexpr char SERVICE_NAME[] = "Vorlan MPCA Software Installation Service";
constexpr char CAPABILITIES_NAME[] = "Vorlan MPCA Software Installation Service Capabilities";

constexpr uint16 STATE_ENABLED = 2;
constexpr uint16 OPERATIONAL_STATUS_OK = 2;
constexpr uint16 HEALTH_STATE_OK = 5;

// CIM_SoftwareInstallationServiceCapabilities
constexpr uint16 ASYNCHRONOUS_ACTIONS[] = {2};
constexpr uint16 SYNCHRONOUS_ACTIONS[] = {4, 5};
constexpr uint16 EXTENDED_RESOURCE_TYPES[] = {2};
// 3 stands here although the service turns it away: that is meant, consoles ask for the list.
constexpr uint16 INSTALL_OPTIONS[] = {2, 3, 4, 5, 6, 7, 11};
constexpr uint16 URI_SCHEME_FILE = 3;
constexpr uint16 URI_SCHEMES_OF_CURL[] = {4, 5, 6, 8}; // ftp, http, https, tftp

template <std::size_t N>
void append_all(Property<Array<uint16>>& property, const uint16 (&values)[N]) {
    for (uint16 value : values)
        property.append(value);
}

Ref<VLNMPCA_SoftwareInstallationService> service_instance(const CIM_ComputerSystem& system) {
    auto service = make_instance<VLNMPCA_SoftwareInstallationService>();
    name_in_system(*service, system);
    service->Name.set(SERVICE_NAME);
    service->Description.set(SERVICE_NAME);
    service->ElementName.set(SERVICE_NAME);
    service->StartMode.set("Automatic");
    service->Started.set(true);
    service->EnabledState.set(STATE_ENABLED);
    service->RequestedState.set(STATE_ENABLED);
    service->EnabledDefault.set(STATE_ENABLED);
    service->TimeOfLastStateChange.set(Datetime());
    service->InstallDate.set(Datetime());
    service->OperationalStatus.append(OPERATIONAL_STATUS_OK);
    service->StatusDescriptions.append(String("ok"));
    service->Status.set("ok");
    service->HealthState.set(HEALTH_STATE_OK);
    return service;
}

// A host that can't store what it fetches is not offered the schemes of libcurl.
void UpdateCURLCapabilities(VLNMPCA_SoftwareInstallationServiceCapabilities& capabilities) {
    if (!VLN_Common::IsReadOnlyFS() && curl_is_present())
        append_all(capabilities.SupportedURISchemes, URI_SCHEMES_OF_CURL);
}

Ref<VLNMPCA_SoftwareInstallationServiceCapabilities> capabilities_instance() {
    auto capabilities = make_instance<VLNMPCA_SoftwareInstallationServiceCapabilities>();
    capabilities->Description.set(CAPABILITIES_NAME);
    capabilities->ElementName.set(CAPABILITIES_NAME);
    capabilities->InstanceID.set("VLN:MPCASoftwareInstallationServiceCapabilities");
    capabilities->SupportedURISchemes.append(URI_SCHEME_FILE);
    UpdateCURLCapabilities(*capabilities);
    capabilities->SupportedTargetTypes.append(String("MPCA"));
    append_all(capabilities->SupportedAsynchronousActions, ASYNCHRONOUS_ACTIONS);
    append_all(capabilities->SupportedSynchronousActions, SYNCHRONOUS_ACTIONS);
    append_all(capabilities->SupportedExtendedResourceTypes, EXTENDED_RESOURCE_TYPES);
    capabilities->CanAddToCollection.set(false);
    append_all(capabilities->SupportedInstallOptions, INSTALL_OPTIONS);
    capabilities->OtherSupportedExtendedResourceTypeDescriptions.append(
        String("Vorlan firmware files"));
    capabilities->SupportedExtendedResourceTypesMajorVersions.append(uint16{0});
    capabilities->SupportedExtendedResourceTypesMinorVersions.append(uint16{0});
    capabilities->SupportedExtendedResourceTypesRevisionNumbers.append(uint16{0});
    capabilities->SupportedExtendedResourceTypesBuildNumbers.append(uint16{0});
    return capabilities;
}

void join(ProviderAgent& agent, const CIM_ComputerSystem* system,
          const VLNMPCA_SoftwareInstallationService* service) {
    associate_as(agent.m_VLNMPCA_HostedInstallationService_map, "Computer System, Update Profile",
                 system, service);
    affect_by_install_service(agent, agent.m_VLNMPCA_InstallServiceAffectsSystem_map, system);
    associate(agent.m_VLNMPCA_InstallServiceConformsToProfile_map,
              Profile_Maps(agent).find(PROFILE_SOFTWARE_UPDATE), service);
}

} // namespace

uint32 StartSoftwareInstallationService(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* service = insert_instance(agent.m_VLNMPCA_SoftwareInstallationService_map,
                                          service_instance(*scope.system));
    const auto* capabilities = insert_instance(
        agent.m_VLNMPCA_SoftwareInstallationServiceCapabilities_map, capabilities_instance());
    if (!service || !capabilities)
        return END_PASS;
    join(agent, scope.system, service);
    associate_as(agent.m_VLNMPCA_ElementCapabilities_map,
                 "Element Capabilities, Vorlan MPCA Firmware Installation Service", service,
                 capabilities);
    return MAP_OK;
}

} // namespace cimple
