// What stands once for all FC ports: the driver's identity, the way to the console.

#include "agent/fcoe/fcoe_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/software_identity.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_RemoteServiceAccessPoint.h"
#include "foundation/config_file.h"
#include "foundation/host_paths.h"

namespace cimple {

namespace {

constexpr uint16 INFO_FORMAT_URL = 200; // CIM_RemoteServiceAccessPoint.InfoFormat
constexpr uint16 ACCESS_CONTEXT_OTHER = 1;

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
