// The registered profiles of simulated hosts, and what conforms to them.

#include "agent/profiles/profile_maps.h"

#include "agent/associations.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "tests/agent/maps_fixture.h"

namespace cimple {

namespace {

using Profiles_Test = Maps_Test;

} // namespace

TEST_F(Profiles_Test, EachIsMadeOnceWithTheReferencesOfItsStandard) {
    load(R"({"use": "nic"})");
    Loaded_Agent agent;
    EXPECT_EQ(refreshes_started(*agent), 1);
    const auto& profiles = agent->m_VLNMPCA_RegisteredProfile_map;
    const uint32 count = profiles.size();
    EXPECT_EQ(value_of(profiles.at(4), "InstanceID"), "\"VLN:Physical Asset\"");
    EXPECT_EQ(value_of(profiles.at(4), "Description"), "\"Vorlan Physical Asset\"");
    EXPECT_EQ(value_of(profiles.at(4), "ElementName"), "\"Vorlan Registered Physical Asset\"");
    EXPECT_EQ(value_of(profiles.at(4), "RegisteredOrganization"), "2");
    EXPECT_EQ(value_of(profiles.at(4), "RegisteredVersion"), "\"1.0.2\"");
    EXPECT_EQ(value_of(profiles.at(4), "AdvertiseTypes"), "{ 3 }");
    EXPECT_EQ(value_of(profiles.at(4), "AdvertiseTypeDescriptions"), "{ \"SLP\" }");
    EXPECT_STREQ(profiles.at(4)->__name_space.c_str(), "root/pg_interop");

    // A second request answers the first one's instance, whatever the version.
    Auto_Mutex lock(agent->m_DataMutex);
    Profile_Maps maps(*agent);
    auto* again = maps.createRegisteredProfile("Physical Asset", 2, "9.9");
    EXPECT_EQ(again, profiles.at(4));
    EXPECT_EQ(value_of(again, "RegisteredVersion"), "\"1.0.2\"");
    EXPECT_EQ(profiles.size(), count);
    // One that nothing refers to, then one with two references: to what was there, and to what
    // comes later.
    auto& references = agent->m_VLNMPCA_ReferencedProfile_map;
    agent->m_VLNMPCA_RegisteredProfile_map.clear();
    references.clear();
    maps.createRegisteredProfile(PROFILE_SOFTWARE);
    maps.createRegisteredProfile("Fan", 2, "1.0.0");
    EXPECT_EQ(references.size(), 0u);
    maps.createRegisteredProfile(PROFILE_ISCSI_INITIATOR);
    EXPECT_EQ(references.size(), 1u);
    maps.createRegisteredProfile(PROFILE_ISCSI_INITIATOR_PORTS);
    EXPECT_EQ(references.size(), 2u);
}

// Without a NIC the pass goes on to the records all the same.
TEST_F(Profiles_Test, AHostWithoutANicHasTheProfilesOfItsStorage) {
    load(R"({"use": "fcoe"})");
    Loaded_Agent agent;
    Log_Capture log;
    EXPECT_EQ(refreshes_started(*agent), 1);
    expect_counts(*agent, {{STORE_VLNMPCA_SoftwareIdentity, 0},
                           {STORE_VLNMPCA_SoftwareInstallationService, 0},
                           {STORE_VLNMPCA_RecordLog, 2},
                           {STORE_VLNMPCA_ProviderUseOfLog, 0},
                           {STORE_VLNMPCA_RegisteredProfile, 13}});
    EXPECT_EQ(log.count(VLN_DBG, "Missing Provider Software Identity"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: updateAdapterMaps: cleanExit"), 1);
}

} // namespace cimple
