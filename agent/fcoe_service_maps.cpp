// What stands once for all FC ports: services, the driver's identity, the way to the console.

#include "agent/fcoe_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profile_maps.h"
#include "agent/software_identity.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_RemoteServiceAccessPoint.h"
#include "foundation/config_file.h"
#include "foundation/host_paths.h"

namespace cimple {

namespace {

constexpr uint16 STATE_ENABLED = 2;     // EnabledState, RequestedState and EnabledDefault
constexpr uint16 HEALTH_OK = 5;         // CIM_ManagedSystemElement.HealthState
constexpr uint16 INFO_FORMAT_URL = 200; // CIM_RemoteServiceAccessPoint.InfoFormat
constexpr uint16 ACCESS_CONTEXT_OTHER = 1;

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

Ref<VLNMPCA_FCWWNService> wwn_service_instance(const CIM_ComputerSystem& system) {
    auto service = service_instance<VLNMPCA_FCWWNService>("Vorlan FCOE FC WWN Management Service",
                                                          "Ok", system);
    service->RequestedState.set(STATE_ENABLED);
    service->EnabledDefault.set(STATE_ENABLED);
    return service;
}

Ref<VLNMPCA_DriverParameterService> parameter_service_instance(const CIM_ComputerSystem& system) {
    constexpr char DESCRIPTION[] = "Vorlan FCoE MPCA Set Driver Parameters Service";
    auto service = service_instance<VLNMPCA_DriverParameterService>(DESCRIPTION, "OK", system);
    service->ElementName.set(DESCRIPTION);
    return service;
}

Ref<VLNMPCA_RemoteServiceAccessPoint> web_launch_instance(const std::string& url,
                                                          const CIM_ComputerSystem& system) {
    auto point = make_instance<VLNMPCA_RemoteServiceAccessPoint>();
    point->Name.set("Portvista WebLaunch URL");
    point->ElementName.set("Portvista");
    point->Description.set("VLN FCoE HBA:Portvista Management Interface");
    name_in_system(*point, system);
    point->AccessInfo.set(text(url));
    point->InfoFormat.set(INFO_FORMAT_URL);
    point->AccessContext.set(ACCESS_CONTEXT_OTHER);
    point->OtherInfoFormatDescription.set("Netquill remote connection");
    return point;
}

// All FCoE functions run under one driver: the first one's.
const FCoEAdapterAttributes* first_adapter(VLN_Data& data) {
    for (const auto& adapter : data.adapters)
        if (adapter->getAdapterType() == ADAPTER_FCOE)
            return static_cast<const FCoEAdapterAttributes*>(adapter->getAdapterAttributes());
    return nullptr;
}

} // namespace

void FCoE_Map_Builder::startWWNService() {
    _wwn_service =
        insert_instance(_agent.m_VLNMPCA_FCWWNService_map, wwn_service_instance(*_system));
    if (!_wwn_service) {
        VLN_LOG(VLN_CRIT, "Failed to create WWN Services class");
        return;
    }
    associate_as(_agent.m_VLNMPCA_HostedFCWWNService_map,
                 "Hosted Service, Vorlan MPCA FC WWN Management Service", _system, _wwn_service);
    associate_as(_agent.m_VLNMPCA_FCWWNServiceAffectsSystem_map,
                 format_text("MPCA FC WWN Management Service Affects System: %s",
                             _system->Name.value.c_str()),
                 _system, _wwn_service);
}

// A host whose ports have a gateway shows that access point alone.
void FCoE_Map_Builder::createWebLaunch() {
    auto& points = _agent.m_VLNMPCA_RemoteServiceAccessPoint_map;
    const std::string url = readWebLaunchURL(host_path(Host_File::WEB_LAUNCH).c_str());
    if (url.empty() || points.size() != 0)
        return;
    const auto* point = insert_instance(points, web_launch_instance(url, *_system));
    if (!point)
        return;
    VLN_LOG(VLN_DBG, "Remote Hosted Service Access Point");
    associate(_agent.m_VLNMPCA_RemoteHostedAccessPoint_map, _system, point);
    const auto& cards = _agent.m_VLNMPCA_Card_map;
    for (uint32 i = 0; i < cards.size(); ++i)
        associate(_agent.m_VLNMPCA_SAPAvailableForElement_map, point, cards[i]);
}

void FCoE_Map_Builder::createDriverParameterService() {
    _parameter_service = insert_instance(_agent.m_VLNMPCA_DriverParameterService_map,
                                         parameter_service_instance(*_system));
    if (_parameter_service)
        associate(_agent.m_VLNMPCA_HostedDriverParameterService_map, _system, _parameter_service);
}

// Without the profile that software conforms to the pass ends.
uint32 FCoE_Map_Builder::createDriverIdentity() {
    const FCoEAdapterAttributes* adapter = first_adapter(*_agent.m_pData);
    if (!adapter)
        return MAP_OK;
    VLN_LOG(VLN_DBG, "FCoE DriverName: %s, driverVersion: %s, driverManufacturer: %s",
            adapter->DriverName.c_str(), adapter->DriverVersion.c_str(),
            adapter->Manufacturer.c_str());
    const auto* identity = insert_instance(
        _agent.m_VLNMPCA_SoftwareIdentity_map,
        driver_identity_instance({"FCoE Driver", "Vorlan FCoE Driver", "VLN FCoE"}, *adapter));
    if (!identity) {
        VLN_LOG(VLN_DBG, "CreateDriverIdentity failed");
        return MAP_OK;
    }
    Profile_Maps profiles(_agent);
    profiles.createInstalledSoftware(_system->Name.value, identity, _system);
    if (!profiles.find(PROFILE_SOFTWARE_INVENTORY)) {
        VLN_LOG(VLN_CRIT, "Missing Software Inventory Profile instance");
        return END_PASS;
    }
    profiles.createSoftwareConforms("Driver, Software Inventory", PROFILE_SOFTWARE_INVENTORY,
                                    identity);
    return MAP_OK;
}

} // namespace cimple
