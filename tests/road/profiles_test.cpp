// From profiles to elements as a client walks, on the provider's own system and on a platform's,
// and the tuning values that a client may change.
#include "tests/road/properties.h"

#include <fstream>
#include <sstream>

using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

constexpr const char* BASE_SERVER = R"({
  "classes": [{"name": "OMC_RegisteredBaseServerProfile", "superclass": "PG_RegisteredProfile"}],
  "instances": [
    {"namespace": "root/pg_interop", "class": "OMC_RegisteredBaseServerProfile",
     "properties": {"InstanceID": "OMC:Fan", "RegisteredName": "Fan"}},
    {"namespace": "root/pg_interop", "class": "OMC_RegisteredBaseServerProfile",
     "properties": {"InstanceID": "OMC:Server", "RegisteredName": "Base Server"}}
  ]})";

constexpr const char* PLATFORM_SYSTEM = R"([
  {"namespace": "root/ibmse", "class": "IBMSD_ComputerSystem",
   "properties": {"CreationClassName": "IBMSD_ComputerSystem", "Name": "rack7-node3"}}
])";

TEST(Profiles, AClientWalksFromTheProfileToTheCard) {
    Road road;
    host::ObjectPath profile{"root/pg_interop", "VLNMPCA_RegisteredProfile", {}};
    host::set(profile.keys, "InstanceID", host::Value::text("VLN:Physical Asset"));
    const auto got = road.manager().get(profile);
    ASSERT_TRUE(got.ok());
    expect_properties(got.value, {{"Description", "Vorlan Physical Asset"},
                                  {"ElementName", "Vorlan Registered Physical Asset"},
                                  {"RegisteredOrganization", "2"},
                                  {"RegisteredVersion", "1.0.2"},
                                  {"AdvertiseTypes", "{3}"},
                                  {"AdvertiseTypeDescriptions", "{SLP}"}});
    const auto cards =
        road.manager().associators(profile, {"VLNMPCA_CardConformsToProfile", "", "", ""});
    ASSERT_TRUE(cards.ok());
    ASSERT_EQ(cards.value.size(), 1u);
    EXPECT_EQ(text_of(cards.value[0], "VLNSerialNumber"), "VR10420117");
    const auto base =
        road.manager().associators(profile, {"VLNMPCA_ReferencedProfile", "", "", "Antecedent"});
    ASSERT_EQ(base.value.size(), 1u);
    EXPECT_EQ(text_of(base.value[0], "RegisteredName"), "Profile Registration");
}

TEST(Profiles, APlatformsSystemIsLeftToThePlatform) {
    Road road({.platform = PLATFORM_SYSTEM});
    EXPECT_TRUE(road.enumerate("VLNMPCA_ComputerSystemConformsToProfile").empty());
    EXPECT_EQ(road.enumerate("VLNMPCA_CardConformsToProfile").size(), 3u);
    EXPECT_EQ(road.enumerate("VLNMPCA_PortControllerConformsToProfile").size(), 2u);
}

TEST(Profiles, ThePlatformsBaseServerIsAskedForAtEachCall) {
    Road road({.platform = BASE_SERVER});
    const auto profiles =
        road.manager()
            .enumerate("VLNMPCA_RegisteredProfile", std::nullopt, "root/pg_interop")
            .value;
    const auto references = road.enumerate("VLNMPCA_BaseServerReferencedProfile");
    ASSERT_GT(profiles.size(), 10u);
    ASSERT_EQ(references.size(), profiles.size());
    for (std::size_t i = 0; i < references.size(); ++i) {
        const host::ObjectPath* server = references[i].property("Antecedent")->as_reference();
        EXPECT_EQ(server->name_space, "root/pg_interop");
        EXPECT_EQ(server->class_name, "OMC_RegisteredBaseServerProfile");
        EXPECT_EQ(server->key("InstanceID")->as_text(), "OMC:Server");
        EXPECT_EQ(*references[i].property("Dependent")->as_reference(), profiles[i].path);
        const auto got = road.manager().get(references[i].path);
        ASSERT_TRUE(got.ok());
        EXPECT_EQ(got.value, references[i]);
    }
    host::ObjectPath other = references[0].path;
    host::ObjectPath nobody = profiles[0].path;
    host::set(nobody.keys, "InstanceID", host::Value::text("VLN:Fan"));
    host::set(other.keys, "Dependent", host::Value::reference(nobody));
    EXPECT_EQ(road.manager().get(other).status.rc, CMPI_RC_ERR_NOT_FOUND);
    const host::ObjectPath server = *references[0].property("Antecedent")->as_reference();
    host::ObjectPath fan = server;
    host::set(fan.keys, "InstanceID", host::Value::text("OMC:Fan"));
    other = references[0].path;
    host::set(other.keys, "Antecedent", host::Value::reference(fan));
    EXPECT_EQ(road.manager().get(other).status.rc, CMPI_RC_ERR_NOT_FOUND);

    // From the platform's profile, which is of no class of ours: the way that consoles walk.
    const host::Association_Filter via{"VLNMPCA_BaseServerReferencedProfile", "", "", ""};
    EXPECT_EQ(road.manager().associators(server, via).value.size(), profiles.size());
    EXPECT_EQ(road.manager().references(server).value.size(), profiles.size());
    EXPECT_TRUE(road.manager().associator_names(fan, via).value.empty());
    EXPECT_TRUE(
        road.manager().associator_names(server, {via.via, "", "Dependent", ""}).value.empty());
    const auto servers = road.manager().associator_names(
        profiles[0].path, {"VLNMPCA_BaseServerReferencedProfile", "", "", ""});
    ASSERT_EQ(servers.value.size(), 1u);
    EXPECT_EQ(servers.value[0].class_name, "OMC_RegisteredBaseServerProfile");
}

// No such class, no such profile, and a platform that fails: nothing is delivered, and it is no
// error.
TEST(Profiles, WithoutABaseServerThereAreNoReferences) {
    EXPECT_TRUE(Road().enumerate("VLNMPCA_BaseServerReferencedProfile").empty());
    std::string other = BASE_SERVER;
    other.replace(other.find("Base Server"), 11, "Rack Server");
    EXPECT_TRUE(Road({.platform = other}).enumerate("VLNMPCA_BaseServerReferencedProfile").empty());
}

// Four cards with two ports each: a firmware for every card, one image for their one version.
TEST(Software, CardsOfOneVersionShareTheImageAndNotTheFirmware) {
    Road road({.scenario = "blade-16-functions.json"});
    EXPECT_EQ(road.enumerate("VLNMPCA_InstallServiceAffectsFirmwareIdentity").size(), 4u);
    EXPECT_EQ(road.enumerate("VLNMPCA_FirmwareElementSoftwareIdentity").size(), 4u);
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPortSoftwareIdentity").size(), 8u);
    EXPECT_EQ(road.enumerate("VLNMPCA_FlashImageSoftwareIdentity").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_MPCAPortFlashImageSoftwareIdentity").size(), 8u);
    EXPECT_EQ(road.enumerate("VLNMPCA_ProviderElementSoftwareIdentity").size(), 4u);
}

class Tuning : public testing::Test {
protected:
    Road road{{.log = true}};

    host::Status modify(std::size_t setting, std::uint32_t value) {
        host::Instance instance = road.enumerate("VLNMPCA_ProviderConfigSetting")[setting];
        host::set(instance.properties, "current", host::Value::unsigned_number(CMPI_uint32, value));
        return road.manager().modify(instance);
    }
    std::string current(std::size_t setting) {
        return text_of(road.enumerate("VLNMPCA_ProviderConfigSetting")[setting], "current");
    }
    std::string file() const {
        std::ifstream in(road.root() / "etc/vorlan_mpca_provider.conf");
        std::stringstream text;
        text << in.rdbuf();
        return text.str();
    }
};

TEST_F(Tuning, TheThreeValuesAreOnDiskAfterTheModuleIsUnloaded) {
    EXPECT_EQ(current(0), "10");
    EXPECT_TRUE(modify(0, 4).ok()); // below the range that is advertised
    EXPECT_TRUE(modify(1, 1).ok());
    EXPECT_TRUE(modify(2, 0).ok());
    EXPECT_EQ(current(0), "4");
    EXPECT_EQ(current(1), "1");
    EXPECT_EQ(current(2), "0");
    EXPECT_EQ(file(), "");
    road.close();
    const std::string text = file();
    EXPECT_NE(text.find("VLN_PROVIDER_CACHE_TIMEOUT = 4\n"), std::string::npos) << text;
    EXPECT_NE(text.find("VLN_PROVIDER_REFRESH_ADAPTERDATA = TRUE\n"), std::string::npos) << text;
    EXPECT_NE(text.find("VLN_PROVIDER_REFRESH_SANDATA = FALSE\n"), std::string::npos) << text;
    EXPECT_EQ(road.count_in_log("Cache time-out is modified successfully"), 1u);
}

TEST_F(Tuning, EachValueTellsItsRange) {
    const struct {
        const char* name;
        const char* low;
        const char* high;
        const char* by_default;
    } rows[] = {{"cachetimeout", "5", "30", "10"},
                {"adapterrefresh", "0", "1", "0"},
                {"sanrefresh", "0", "1", "1"}};
    const auto settings = road.enumerate("VLNMPCA_ProviderConfigSetting");
    ASSERT_EQ(settings.size(), std::size(rows));
    for (std::size_t i = 0; i < std::size(rows); ++i)
        expect_properties(
            settings[i],
            {{"InstanceID", ("Vorlan MPCA Provider:" + std::string(rows[i].name)).c_str()},
             {"paramname", rows[i].name},
             {"lowRange", rows[i].low},
             {"highRange", rows[i].high},
             {"def", rows[i].by_default},
             {"current", rows[i].by_default},
             {"ConfigurationName", "-"}});
}

TEST_F(Tuning, WhatIsOutOfRangeChangesNothing) {
    const struct {
        std::size_t setting;
        std::uint32_t value;
        const char* kept;
    } rows[] = {{0, 0, "10"}, {0, 31, "10"}, {0, 0xFFFFFFFF, "10"}, {1, 3, "0"}, {2, 2, "1"}};
    for (const auto& row : rows) {
        EXPECT_EQ(modify(row.setting, row.value).rc, CMPI_RC_ERR_INVALID_PARAMETER)
            << row.setting << " " << row.value;
        EXPECT_EQ(current(row.setting), row.kept);
    }
}

TEST_F(Tuning, WhoDoesNotNameTheValueOrTheSettingFails) {
    host::Instance setting = road.enumerate("VLNMPCA_ProviderConfigSetting")[0];
    EXPECT_EQ(road.manager().modify(setting, {{"Description"}}).rc, CMPI_RC_ERR_FAILED);
    host::set(setting.path.keys, "InstanceID", host::Value::text("nobody"));
    host::set(setting.properties, "InstanceID", host::Value::text("nobody"));
    EXPECT_EQ(road.manager().modify(setting).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(current(0), "10");
}

// The time-out counts from the next refresh decision on.
TEST_F(Tuning, AShorterTimeOutBringsTheRefreshForward) {
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(1);
    EXPECT_TRUE(modify(0, 1).ok());
    const unsigned long scans = vlnsim_calls("AX_GetLocalHBAInfoV4");
    vlnsim_advance(61ull * 1000000);
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(2);
    EXPECT_GT(vlnsim_calls("AX_GetLocalHBAInfoV4"), scans);
}

} // namespace
