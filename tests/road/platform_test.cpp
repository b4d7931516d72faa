// The platform's own computer system and chassis, fetched by up-calls, and the provider's when
// there are none.
#include "host/path_text.h"
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

using road::PLATFORM;
using road::Road;
using road::text_of;

namespace {

// Every SystemName of every instance, keys of references included.
void collect(const host::ObjectPath& path, std::vector<std::string>& names) {
    for (const host::Named_Value& key : path.keys) {
        if (key.name == "SystemName")
            names.push_back(key.value.as_text());
        if (const host::ObjectPath* end = key.value.as_reference()) {
            collect(*end, names);
            if (end->class_name.ends_with("ComputerSystem"))
                names.push_back(end->key("Name")->as_text());
        }
    }
}

std::vector<std::string> system_names(Road& road) {
    std::vector<std::string> names;
    for (const host::Class* known : road.manager().provider_classes())
        for (const host::Instance& instance : road.enumerate(known->name))
            collect(instance.path, names);
    return names;
}

TEST(Platform, ItsComputerSystemIsTheOneEverythingHangsOnAndItsChassisHoldsTheCard) {
    for (const bool elements_marked_null : {false, true}) {
        Road road({.platform = PLATFORM, .elements_marked_null = elements_marked_null});
        const auto names = system_names(road);
        EXPECT_GT(names.size(), 10u);
        for (const std::string& name : names)
            EXPECT_EQ(name, "rack7-node3");
        for (const host::Instance& port : road.enumerate("VLNMPCA_EthernetPort"))
            EXPECT_EQ(text_of(port, "SystemCreationClassName"), "IBMSD_ComputerSystem");
        const auto links = road.enumerate("VLNMPCA_ChassisContainsCard");
        ASSERT_EQ(links.size(), 1u);
        const host::ObjectPath* chassis = links[0].property("GroupComponent")->as_reference();
        EXPECT_EQ(host::path_to_text(*chassis, ""), "root/ibmse:IBMSD_Chassis.Tag=\"chassis 12\","
                                                    "CreationClassName=\"IBMSD_Chassis\"");
    }
}

TEST(Platform, WithoutOneTheProviderMakesItsOwn) {
    Road road({.log = true});
    const auto names = system_names(road);
    EXPECT_GT(names.size(), 10u);
    for (const std::string& name : names)
        EXPECT_EQ(name, names.front());
    const auto links = road.enumerate("VLNMPCA_ChassisContainsCard");
    ASSERT_EQ(links.size(), 1u);
    const host::ObjectPath* chassis = links[0].property("GroupComponent")->as_reference();
    EXPECT_EQ(chassis->class_name, "CIM_Chassis");
    EXPECT_EQ(chassis->key("Tag")->as_text(), "VLN MPCA:Chassis");
    EXPECT_GE(road.count_in_log("up-call method failed"), 1u);

    // Nobody serves it: it is named as an end, and whoever asks for it whole gets nothing.
    EXPECT_EQ(road.manager().get(*chassis).status.rc, CMPI_RC_ERR_INVALID_CLASS);
    const host::ObjectPath card = *links[0].property("PartComponent")->as_reference();
    const host::Association_Filter via{"VLNMPCA_ChassisContainsCard", "", "", ""};
    EXPECT_EQ(road.manager().associator_names(card, via).value.size(), 1u);
    const auto whole = road.manager().associators(card, via);
    EXPECT_TRUE(whole.ok() && whole.value.empty());
}

// Keys are made of the host's name, or of "unknown" where it has none: they lead back to their
// instances all the same.
TEST(Platform, AHostThatCannotBeResolvedHasUsableKeys) {
    const struct {
        const char* server;
        const char* name;
        const char* line;
    } rows[] = {
        {R"({"hostName": "box-9", "address": ""})", "box-9",
         "Error! gethostbyname() failed, using 'unknown' for IP address."},
        {R"({"hostName": ""})", "unknown", "Error! gethostname() failed err : "},
        {R"({"hostName": "box-9"})", "box-9", "Host ipAddress : 192.0.2.10"},
    };
    for (const auto& row : rows) {
        std::string host = road::card(R"({"use": "nic"})");
        host.insert(1, R"("server": )" + std::string(row.server) + ", ");
        Road road({.scenario = host, .log = true});
        const auto names = system_names(road);
        EXPECT_GT(names.size(), 10u);
        for (const std::string& name : names)
            EXPECT_EQ(name, row.name);
        const auto hosted = road.enumerate("VLNMPCA_EthernetPortSystemDevice");
        ASSERT_EQ(hosted.size(), 1u);
        EXPECT_TRUE(road.manager().get(hosted[0].path).ok());
        const auto ports =
            road.manager().associators(*hosted[0].property("GroupComponent")->as_reference(),
                                       {"VLNMPCA_EthernetPortSystemDevice", "", "", ""});
        ASSERT_EQ(ports.value.size(), 1u);
        EXPECT_TRUE(road.manager().get(ports.value[0].path).ok());
        road.close();
        EXPECT_EQ(road.count_in_log(row.line), 1u) << row.line;
    }
}

} // namespace
