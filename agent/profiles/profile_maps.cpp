#include "agent/profiles/profile_maps.h"

#include "agent/associations.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_RecordLog.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"

#include <cstring>

namespace cimple {

namespace {

constexpr uint16 DMTF = 2;
constexpr uint16 SNIA = 11;
constexpr uint16 ADVERTISED_BY_SLP = 3; // CIM_RegisteredSpecification.AdvertiseTypes

struct Profile_Reference {
    Profile dependent; // the profile that refers
    Profile antecedent;
};

// Which standard builds on which. DSP1033 is what every profile of the DMTF is registered by; the
// ports of a host LAN (DSP1035) are Ethernet ports (DSP1014), and what is updated (DSP1025) is in
// the inventory (DSP1023). In SMI-S the initiators build on their ports and on Software.
constexpr Profile_Reference REFERENCES[] = {
    {PROFILE_ETHERNET_PORT, PROFILE_REGISTRATION},
    {PROFILE_HOST_LAN_NETWORK_PORT, PROFILE_REGISTRATION},
    {PROFILE_PCI_DEVICE, PROFILE_REGISTRATION},
    {PROFILE_PHYSICAL_ASSET, PROFILE_REGISTRATION},
    {PROFILE_SOFTWARE_INVENTORY, PROFILE_REGISTRATION},
    {PROFILE_SOFTWARE_UPDATE, PROFILE_REGISTRATION},
    {PROFILE_IP_INTERFACE, PROFILE_REGISTRATION},
    {PROFILE_DIAGNOSTICS, PROFILE_REGISTRATION},
    {PROFILE_RECORD_LOG, PROFILE_REGISTRATION},
    {PROFILE_HOST_LAN_NETWORK_PORT, PROFILE_ETHERNET_PORT},
    {PROFILE_SOFTWARE_UPDATE, PROFILE_SOFTWARE_INVENTORY},
    {PROFILE_STORAGE_HBA, PROFILE_SOFTWARE},
    {PROFILE_STORAGE_HBA, PROFILE_FCOE_INITIATOR_PORTS},
    {PROFILE_ISCSI_INITIATOR, PROFILE_SOFTWARE},
    {PROFILE_ISCSI_INITIATOR, PROFILE_ISCSI_INITIATOR_PORTS},
};

// Fixed texts, so that a client's path to a profile survives every refresh.
String profile_key(const char* name) {
    return format_text("VLN:%s", name);
}

Ref<VLNMPCA_RegisteredProfile> profile_instance(const char* name, uint16 organization,
                                                const char* version) {
    auto profile = make_instance<VLNMPCA_RegisteredProfile>();
    profile->InstanceID.set(profile_key(name));
    profile->Description.set(format_text("Vorlan %s", name));
    profile->ElementName.set(format_text("Vorlan Registered %s", name));
    profile->RegisteredOrganization.set(organization);
    profile->RegisteredName.set(name);
    profile->RegisteredVersion.set(version);
    profile->AdvertiseTypes.append(ADVERTISED_BY_SLP);
    profile->AdvertiseTypeDescriptions.append(String("SLP"));
    profile->__name_space = INTEROP_NAME_SPACE;
    return profile;
}

} // namespace

constinit const Profile_Row profile_table[NUM_PROFILES] = {
    {"Profile Registration", DMTF, "1.0.0"},
    {"Ethernet Port", DMTF, "1.0.0"},
    {"Host LAN Network Port", DMTF, "1.0.0"},
    {"PCI Device", DMTF, "1.0.0"},
    {"Physical Asset", DMTF, "1.0.2"},
    {"Software Inventory", DMTF, "1.0.2"},
    {"Software", SNIA, "1.2.0"},
    {"Software Update", DMTF, "1.0.0"},
    {"Host Discovered Resources", SNIA, "1.2.0"},
    {"Access Points", SNIA, "1.3.0"},
    {"IP Interface", DMTF, "1.0.1"},
    {"Diagnostics", DMTF, "2.0"},
    {"Record Log", DMTF, "1.0.1"},
    {"FCoE Initiator Ports", SNIA, "1.0.0"},
    {"Storage HBA", SNIA, "1.4.0"},
    {"iSCSI Initiator", SNIA, "1.2.0"},
    {"iSCSI Initiator Ports", SNIA, "1.5.0"},
};

const VLNMPCA_RegisteredProfile*
Profile_Maps::createRegisteredProfile(const char* name, uint16 organization, const char* version) {
    VLN_LOG(VLN_DBG, "Generating VLNMPCA_RegisteredProfile (%s)", name);
    if (auto* stored = find(name)) {
        VLN_LOG(VLN_DBG, "Got VLNMPCA_RegisteredProfile in the map (%s)", name);
        return stored;
    }
    auto* profile = insert_instance(_agent.m_VLNMPCA_RegisteredProfile_map,
                                    profile_instance(name, organization, version));
    if (!profile)
        return nullptr;
    VLN_LOG(VLN_DBG, "Created VLNMPCA_RegisteredProfile in the map (%s)", name);
    joinReferencedProfiles(name);
    return profile;
}

const VLNMPCA_RegisteredProfile* Profile_Maps::createRegisteredProfile(Profile profile) {
    const Profile_Row& row = profile_table[profile];
    return createRegisteredProfile(row.name, row.organization, row.version);
}

const VLNMPCA_RegisteredProfile* Profile_Maps::registerForSystem(Profile profile) {
    auto* registered = createRegisteredProfile(profile);
    if (registered)
        createComputerSystemConforms(registered);
    return registered;
}

const VLNMPCA_RegisteredProfile* Profile_Maps::find(Profile profile) const {
    return find(profile_table[profile].name);
}

const VLNMPCA_RegisteredProfile* Profile_Maps::find(const char* name) const {
    const String key = profile_key(name);
    return find_by_key(_agent.m_VLNMPCA_RegisteredProfile_map,
                       &VLNMPCA_RegisteredProfile::InstanceID, key);
}

// Called for each new profile, so that a reference is made with the later of its two ends.
void Profile_Maps::joinReferencedProfiles(const char* name) {
    for (const Profile_Reference& row : REFERENCES) {
        if (std::strcmp(profile_table[row.dependent].name, name) != 0 &&
            std::strcmp(profile_table[row.antecedent].name, name) != 0)
            continue;
        const auto* dependent = find(row.dependent);
        const auto* antecedent = find(row.antecedent);
        if (dependent && antecedent)
            associate(_agent.m_VLNMPCA_ReferencedProfile_map, antecedent, dependent);
    }
}

void Profile_Maps::createComputerSystemConforms(const VLNMPCA_RegisteredProfile* profile) {
    if (!_agent.m_bOwnComputerSystem) {
        VLN_LOG(VLN_DBG, "This is IBM/VMWare comp Sys - do nothing");
        return;
    }
    associate_as(_agent.m_VLNMPCA_ComputerSystemConformsToProfile_map,
                 format_text("Computer System,%s", profile->InstanceID.value.c_str()), profile,
                 _agent.m_CIM_ComputerSystem_map[0]);
}

void Profile_Maps::createCardConforms(const String& text, Profile profile,
                                      const VLNMPCA_Card* card) {
    associate_as(_agent.m_VLNMPCA_CardConformsToProfile_map, text, find(profile), card);
}

void Profile_Maps::createFCPortConforms(const String& text, Profile profile,
                                        const VLNMPCA_FCPort* port) {
    associate_as(_agent.m_VLNMPCA_FCPortConformsToProfile_map, text, find(profile), port);
}

void Profile_Maps::createSoftwareConforms(const String& text, Profile profile,
                                          const VLNMPCA_SoftwareIdentity* software) {
    associate_as(_agent.m_VLNMPCA_SoftwareConformsToProfile_map, text, find(profile), software);
}

void Profile_Maps::createRecordLogConforms(const String& text, Profile profile,
                                           const VLNMPCA_RecordLog* log) {
    associate_as(_agent.m_VLNMPCA_RecordLogConformsToProfile_map, text, find(profile), log);
}

void Profile_Maps::createInstalledSoftware(const String& text,
                                           const VLNMPCA_SoftwareIdentity* software,
                                           const CIM_ComputerSystem* system) {
    associate_as(_agent.m_VLNMPCA_InstalledSoftwareIdentity_map, text, system, software);
}

} // namespace cimple
