#include "agent/associations.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Container.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_EthernetPortSystemDevice.h"
#include "classes/VLNMPCA_InstallServiceAffectsSystem.h"
#include "classes/VLNMPCA_PhysicalConnector.h"
#include "classes/VLNMPCA_SoftwareInstallationService.h"
#include "tests/agent/agent_fixture.h"

namespace cimple {

namespace {

Ref<VLNMPCA_Card> card(const char* tag) {
    auto instance = make_instance<VLNMPCA_Card>();
    instance->CreationClassName.set("VLNMPCA_Card");
    instance->Tag.set(tag);
    return instance;
}

Ref<VLNMPCA_PhysicalConnector> connector(const char* tag) {
    auto instance = make_instance<VLNMPCA_PhysicalConnector>();
    instance->CreationClassName.set("VLNMPCA_PhysicalConnector");
    instance->Tag.set(tag);
    return instance;
}

const Instance* end_of(const Instance* association, const char* role) {
    return reference(association, find_reference(association->__meta_class, role));
}

} // namespace

TEST(Associations, EndsAreSharedInTheOrderOfTheClass) {
    Instance_Map<VLNMPCA_Container> store;
    auto whole = card("S1");
    auto part = connector("P1");
    const Instance* made = associate(store, whole.get(), part.get());
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(store.at(0), made);
    EXPECT_STREQ(made->__name_space.c_str(), "root/vorlan");

    EXPECT_EQ(end_of(made, "GroupComponent"), whole.get());
    EXPECT_EQ(end_of(made, "PartComponent"), part.get());
    EXPECT_TRUE(is_shared(whole.get()));
    EXPECT_TRUE(is_null(made, find_property(made->__meta_class, "LocationWithinContainer")));
}

// Where the class names the affected element first, so does the caller.
TEST(Associations, BaseClassOrderHolds) {
    Instance_Map<VLNMPCA_InstallServiceAffectsSystem> store;
    auto system = make_instance<CIM_ComputerSystem>();
    auto service = make_instance<VLNMPCA_SoftwareInstallationService>();
    EXPECT_NE(associate(store, system.get(), service.get()), nullptr);
    Log_Capture log;
    EXPECT_EQ(associate(store, service.get(), system.get()), nullptr);
    EXPECT_EQ(log.count(VLN_CRIT, "Wrong input for VLNMPCA_InstallServiceAffectsSystem"), 1);
}

TEST(Associations, MissingOrWrongEndMakesNothing) {
    Instance_Map<VLNMPCA_Container> store;
    auto whole = card("S1");
    auto part = connector("P1");
    Log_Capture log;
    EXPECT_EQ(associate(store, nullptr, part.get()), nullptr);
    EXPECT_EQ(associate(store, whole.get(), nullptr), nullptr);
    EXPECT_EQ(associate(store, whole.get(), whole.get()), nullptr);
    EXPECT_EQ(log.count(VLN_CRIT, "Wrong input for VLNMPCA_Container"), 3);
    EXPECT_EQ(store.size(), 0u);
}

TEST(Associations, DuplicateIsLoggedAndDropped) {
    Instance_Map<VLNMPCA_Container> store;
    auto whole = card("S1");
    auto part = connector("P1");
    ASSERT_NE(associate(store, whole.get(), part.get()), nullptr);
    Log_Capture log;
    EXPECT_EQ(associate(store, whole.get(), part.get(), "Insert Failed (CNA): VLNMPCA_Container"),
              nullptr);
    EXPECT_EQ(associate(store, whole.get(), part.get(), {"quiet", VLN_DBG}), nullptr);
    EXPECT_EQ(associate(store, whole.get(), part.get()), nullptr);
    EXPECT_EQ(log.count(VLN_CRIT, "Insert Failed (CNA): VLNMPCA_Container"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "quiet"), 1);
    EXPECT_EQ(log.count(VLN_CRIT, "Insert Failed : m_VLNMPCA_Container_map"), 1);
    EXPECT_EQ(store.size(), 1u);
}

} // namespace cimple
