// The service that installs firmware: its instance, its capabilities, and what they hang on.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profile_maps.h"
#include "agent/text.h"
#include "classes/CIM_ServiceAffectsElement.h"
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
constexpr uint16 EFFECT_MANAGES = 5; // CIM_ServiceAffectsElement.ElementEffects

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

} // namespace

uint32 Adapter_Map_Builder::StartSoftwareInstallationService() {
    const auto* service = insert_instance(_agent.m_VLNMPCA_SoftwareInstallationService_map,
                                          service_instance(*_system));
    const auto* capabilities = insert_instance(
        _agent.m_VLNMPCA_SoftwareInstallationServiceCapabilities_map, capabilities_instance());
    if (!service || !capabilities)
        return END_PASS;
    joinInstallService(service);
    associate_as(_agent.m_VLNMPCA_ElementCapabilities_map,
                 "Element Capabilities, Vorlan MPCA Firmware Installation Service", service,
                 capabilities);
    return MAP_OK;
}

void Adapter_Map_Builder::joinInstallService(const VLNMPCA_SoftwareInstallationService* service) {
    associate_as(_agent.m_VLNMPCA_HostedInstallationService_map, "Computer System, Update Profile",
                 _system, service);
    affectByInstallService(_agent.m_VLNMPCA_InstallServiceAffectsSystem_map, _system);
    associate(_agent.m_VLNMPCA_InstallServiceConformsToProfile_map,
              Profile_Maps(_agent).find(PROFILE_SOFTWARE_UPDATE), service);
}

// For the stores of the classes that tell what the service has an effect on.
void Adapter_Map_Builder::affectByInstallService(Instance_Map_Base& store, const Instance* element,
                                                 const Insert_Failure& failure) {
    const auto& services = _agent.m_VLNMPCA_SoftwareInstallationService_map;
    if (services.size() == 0)
        return;
    if (auto* affects =
            cast<CIM_ServiceAffectsElement>(associate(store, element, services[0], failure)))
        affects->ElementEffects.append(EFFECT_MANAGES);
}

} // namespace cimple
