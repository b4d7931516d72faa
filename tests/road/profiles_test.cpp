// Profiles on the provider's own system and on a platform's.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::PLATFORM;
using road::Road;

namespace {

TEST(Profiles, APlatformsSystemIsLeftToThePlatform) {
    Road road({.platform = PLATFORM});
    road::expect_counts(road, {{"VLNMPCA_ComputerSystemConformsToProfile", 0},
                               {"VLNMPCA_CardConformsToProfile", 3},
                               {"VLNMPCA_PortControllerConformsToProfile", 2}});
}

TEST(Profiles, ThePlatformsBaseServerIsAskedForAtEachCall) {
    Road road({.platform = PLATFORM});
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
    std::string other = PLATFORM;
    other.replace(other.find("Base Server"), 11, "Rack Server");
    EXPECT_TRUE(Road({.platform = other}).enumerate("VLNMPCA_BaseServerReferencedProfile").empty());
}

} // namespace
