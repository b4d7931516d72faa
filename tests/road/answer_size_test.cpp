// Answers over 4,096 units, in an object manager that sends no more than 10 MB at once.
#include "tests/road/hosts.h"
#include "tests/road/road.h"

using road::Road;

namespace {

TEST(Answer_Size, EveryClassCanBeSentAndSoCanWhatOneAssociationLeadsTo) {
    Road road({.scenario = "san-4096-luns.json", .class_defaults = true});
    host::Manager& manager = road.manager();
    for (const host::Class* known : manager.provider_classes()) {
        EXPECT_TRUE(manager.enumerate(known->name).ok()) << known->name;
        EXPECT_TRUE(manager.enumerate_names(known->name).ok()) << known->name;
    }
    EXPECT_GT(manager.statistics().answer_peak, 9'000'000u) << "the extents, 1,792 of them";

    const auto ports = manager.enumerate_names("VLNMPCA_SCSIProtocolInitiatorEndpoint").value;
    ASSERT_EQ(ports.size(), 2u);
    const host::ObjectPath& port = ports[0]; // sees half of the units
    EXPECT_GT(manager.associator_names(port).value.size(), 2048u);
    EXPECT_GT(manager.reference_names(port).value.size(), 2048u);
    // Without a word on what is wanted of them it is everything.
    EXPECT_EQ(manager.associators(port).status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(manager.references(port).status.rc, CMPI_RC_ERR_FAILED);
    const char* path = "VLNMPCA_SCSIInitiatorTargetStorageVolumePath";
    EXPECT_EQ(manager.associators(port, {path, "VLNMPCA_StorageVolume", "", ""}).value.size(),
              640u);
    EXPECT_EQ(manager.references(port, {path, "", "", ""}).value.size(), 640u);
}

// What is made while answering is given back as it is handed over.
TEST(Answer_Size, ALargeAnswerHoldsNoMoreObjectsThanASmallOne) {
    Road road({.scenario = road::card(R"({"use": "nic"}, {"use": "fcoe",
        "targets": {"luns": 200, "wwpn": "50:25:64:C0:00:00:00:01"}})")});
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 200u);
    host::Manager& manager = road.manager();
    manager.restart_peak();
    EXPECT_EQ(manager.enumerate_names("VLNMPCA_StorageVolume").value.size(), 200u);
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 200u);
    const auto initiators = road.enumerate("VLNMPCA_SCSIProtocolEndpoint");
    ASSERT_FALSE(initiators.empty());
    EXPECT_GE(manager.associators(initiators[0].path).value.size(), 200u);
    EXPECT_LT(manager.statistics().objects_peak, 50u);
}

} // namespace
