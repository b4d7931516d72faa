// The management profiles that the provider implements, and what conforms to them.
//
// A client finds a profile first, in the interop namespace, and walks from it to the elements. Runs
// in the adapter pass, with the adapter maps' ready mutex and m_DataMutex held. What is answered is
// owned by its store; null means that the store refused it, which the log tells.
#ifndef VLN_AGENT_PROFILES_PROFILE_MAPS_H
#define VLN_AGENT_PROFILES_PROFILE_MAPS_H

#include "agent/provider_agent.h"

namespace cimple {

// In the order in which a full pass registers them.
enum Profile : uint8 {
    PROFILE_REGISTRATION,
    PROFILE_ETHERNET_PORT,
    PROFILE_HOST_LAN_NETWORK_PORT,
    PROFILE_PCI_DEVICE,
    PROFILE_PHYSICAL_ASSET,
    PROFILE_SOFTWARE_INVENTORY,
    PROFILE_SOFTWARE,
    PROFILE_SOFTWARE_UPDATE,
    PROFILE_HOST_DISCOVERED_RESOURCES,
    PROFILE_ACCESS_POINTS,
    PROFILE_IP_INTERFACE,
    PROFILE_DIAGNOSTICS,
    PROFILE_RECORD_LOG,
    PROFILE_FCOE_INITIATOR_PORTS,
    PROFILE_STORAGE_HBA,
    PROFILE_ISCSI_INITIATOR,
    PROFILE_ISCSI_INITIATOR_PORTS,
    NUM_PROFILES
};

struct Profile_Row {
    const char* name;
    uint16 organization; // CIM_RegisteredSpecification.RegisteredOrganization
    const char* version;
};

// Row n describes the profile with the number n.
extern const Profile_Row profile_table[NUM_PROFILES];

class Profile_Maps {
public:
    explicit Profile_Maps(ProviderAgent& agent) : _agent(agent) {}

    // The stored profile of that name, whatever its version, else a new one, tied to the stored
    // profiles that its standard refers to and that refer to it.
    const VLNMPCA_RegisteredProfile* createRegisteredProfile(const char* name, uint16 organization,
                                                             const char* version);
    const VLNMPCA_RegisteredProfile* createRegisteredProfile(Profile profile);
    // The same for a profile to which the computer system conforms.
    const VLNMPCA_RegisteredProfile* registerForSystem(Profile profile);
    // The stored one, or null.
    const VLNMPCA_RegisteredProfile* find(Profile profile) const;

    // Only the provider's own computer system conforms: what a platform's conforms to is left to
    // the platform's interop data.
    void createComputerSystemConforms(const VLNMPCA_RegisteredProfile* profile);
    void createCardConforms(const String& text, Profile profile, const VLNMPCA_Card* card);
    void createFCPortConforms(const String& text, Profile profile, const VLNMPCA_FCPort* port);
    void createSoftwareConforms(const String& text, Profile profile,
                                const VLNMPCA_SoftwareIdentity* software);
    void createRecordLogConforms(const String& text, Profile profile, const VLNMPCA_RecordLog* log);
    void createInstalledSoftware(const String& text, const VLNMPCA_SoftwareIdentity* software,
                                 const CIM_ComputerSystem* system);

private:
    const VLNMPCA_RegisteredProfile* find(const char* name) const;
    void joinReferencedProfiles(const char* name);

    ProviderAgent& _agent;
};

} // namespace cimple

#endif // VLN_AGENT_PROFILES_PROFILE_MAPS_H
