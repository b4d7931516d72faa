// The order of the adapter pass.

#include "agent/adapter_map_builder.h"
#include "agent/fcoe/fcoe_maps.h"
#include "agent/hardware/vpd_maps.h"
#include "agent/iscsi/iscsi_maps.h"
#include "agent/profiles/profile_maps.h"
#include "cimple/guard.h"

namespace cimple {

uint32 ProviderAgent::updateAdapterMaps(const Platform_Objects& platform) {
    return Adapter_Map_Builder(*this, platform).run();
}

uint32 Adapter_Map_Builder::run() {
    VLN_LOG(VLN_DBG, " updateAdapterMaps: Entry");
    _agent.clearAdapterMaps();
    if (createComputerSystem() != MAP_OK) {
        VLN_LOG(VLN_CRIT, "Could not create the Computer System Instance");
        return END_PASS;
    }
    registerBaseProfiles();
    if (const uint32 status = makeGroups(Group_Place::PLATFORM))
        return status;
    if (const uint32 status = createChassis())
        return status;
    Profile_Maps(_agent).registerForSystem(PROFILE_SOFTWARE_UPDATE);
    if (const uint32 status = createNICPart())
        return status;
    if (const uint32 status = makeGroups(Group_Place::LOGS))
        return status;
    registerStorageProfiles();
    if (const uint32 status = FCoE_Map_Builder(_agent, _system).run())
        return status;
    if (ISCSI_Map_Builder(_agent, _system).CreateISCSIClasses() != MAP_OK) {
        VLN_LOG(VLN_ERR, "iSCSI discovery failed");
        return END_PASS;
    }
    if (const uint32 status = makeGroups(Group_Place::ALL_PORTS))
        return status;
    updateSoftwareIdentities();
    if (const uint32 status = makeGroups(Group_Place::CLOSING))
        return status;
    VLN_LOG(VLN_DBG, "PERF: updateAdapterMaps: cleanExit");
    return MAP_OK;
}

void Adapter_Map_Builder::registerBaseProfiles() {
    constexpr Profile BASE_PROFILES[] = {
        PROFILE_REGISTRATION, PROFILE_ETHERNET_PORT,  PROFILE_HOST_LAN_NETWORK_PORT,
        PROFILE_PCI_DEVICE,   PROFILE_PHYSICAL_ASSET, PROFILE_SOFTWARE_INVENTORY,
        PROFILE_SOFTWARE,
    };
    for (Profile profile : BASE_PROFILES)
        Profile_Maps(_agent).registerForSystem(profile);
}

// What the storage stretches conform to.
void Adapter_Map_Builder::registerStorageProfiles() {
    VLN_LOG(VLN_DBG, "create VLNMPCA_RegisteredProfile");
    Profile_Maps profiles(_agent);
    profiles.registerForSystem(PROFILE_FCOE_INITIATOR_PORTS);
    profiles.registerForSystem(PROFILE_STORAGE_HBA);
}

uint32 Adapter_Map_Builder::createNICPart() {
    if (!_agent.m_pData->hasNICAdapter) {
        VLN_LOG(VLN_DBG, "No NIC card found");
        return MAP_OK;
    }
    if (const uint32 status = createNICSoftware())
        return status;
    return createNICClasses();
}

// What the NIC cards are tied to beside the platform: the installation service, the identities of
// provider and driver, and the profiles of storage hosts.
uint32 Adapter_Map_Builder::createNICSoftware() {
    VLN_LOG(VLN_DBG, "Ethernet Port Profile");
    if (const uint32 status = makeGroups(Group_Place::NIC_CARDS))
        return status;
    createProviderIdentity();
    if (createDriverIdentity() != MAP_OK) {
        VLN_LOG(VLN_CRIT, "CreateDriverIdentity failed");
        return END_PASS;
    }
    VLN_LOG(VLN_DBG, "create VLNMPCA_RegisteredProfile (Host Discovered Resources)");
    Profile_Maps profiles(_agent);
    profiles.registerForSystem(PROFILE_HOST_DISCOVERED_RESOURCES);
    profiles.registerForSystem(PROFILE_ACCESS_POINTS);
    return MAP_OK;
}

// What throws in here ends all that is made of NIC adapters, and nothing else.
uint32 Adapter_Map_Builder::createNICClasses() {
    uint32 status = MAP_OK;
    const bool complete = run_guarded([&] {
        status = createNICCards();
        if (status == MAP_OK)
            status = makeGroups(Group_Place::NIC_PORTS);
        if (status == MAP_OK)
            status = createIPClasses();
        if (status == MAP_OK)
            status = makeGroups(Group_Place::NIC);
    });
    if (complete)
        return status;
    VLN_LOG(VLN_DBG, "Unknown exception in  NIC card discovery");
    return MAP_OK;
}

// A closing step: what fails here leaves the identities as they are.
void Adapter_Map_Builder::updateSoftwareIdentities() {
    const bool complete = run_guarded([this] {
        VLN_LOG(VLN_DBG, "Updating FRU information to Softwareidentity Class");
        if (VPD_Maps(_agent).UpdateFRUToSoftwareInstance() != 0)
            VLN_LOG(VLN_DBG, "Failed to update FRU VPD data to cim_softwareidentity instances");
    });
    if (!complete)
        VLN_LOG(VLN_DBG, "UpdateFRUToSoftwareInstance failed");
}

} // namespace cimple
