#include "agent/associations.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Container.h"
#include "classes/VLNMPCA_PhysicalConnector.h"
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

} // namespace

TEST(Associations, MissingOrWrongEndMakesNothing) {
    Instance_Map<VLNMPCA_Container> store;
    auto whole = card("S1");
    auto part = connector("P1");
    Agent_Log log;
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
    EXPECT_TRUE(is_shared(whole.get()) && is_shared(part.get())) << "ends are not copied";
    Agent_Log log;
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
