// The class catalogue as a whole: how many classes, in which order, with which keys and flags.
#include "schema/generator/generator.h"

#include <gtest/gtest.h>

#include <set>

namespace {

const generator::Catalogue& catalogue() {
    static const generator::Catalogue loaded =
        generator::load_catalogue(MOF_FOLDER "/catalogue.mof");
    return loaded;
}

std::string keys(const char* name) {
    std::string list;
    for (const mof::Schema_Feature& feature : catalogue().schema.find(name)->features)
        if (feature.key)
            list += (list.empty() ? "" : ",") + feature.name();
    return list;
}

TEST(Catalogue, Counts) {
    const auto& classes = catalogue().schema.classes();
    EXPECT_EQ(classes.size(), 441u);
    EXPECT_EQ(catalogue().providers.size(), 299u);
    std::size_t associations = 0;
    for (const mof::Schema_Class* each : catalogue().providers)
        associations += each->is_association;
    EXPECT_EQ(associations, 197u);
    // Base classes, other parties' classes and ours come in this order.
    EXPECT_EQ(classes[0]->name(), "CIM_ManagedElement");
    EXPECT_EQ(classes[138]->name(), "CIM_MemberOfCollection");
    EXPECT_EQ(classes[141]->name(), "PG_RegisteredProfile");
    EXPECT_EQ(classes[142].get(), catalogue().providers.front());
}

TEST(Catalogue, ChainOrder) {
    const auto& chain = catalogue().providers;
    const std::pair<std::size_t, const char*> places[] = {
        {0, "VLNMPCA_SoftwareInstallationService"}, // the first of each domain
        {22, "VLNMPCA_RegisteredProfile"},
        {65, "VLNMPCA_RecordLog"},
        {102, "VLNMPCA_DumpService"},
        {109, "VLNMPCA_DiagnosticTest"},
        {115, "VLNMPCA_LANEndpoint"},
        {171, "VLNMPCA_CollectedRoute"},
        {172, "VLNMPCA_PortController"},
        {201, "VLNMPCA_CEEService"},
        {211, "VLNMPCA_FCPort"},
        {240, "VLNMPCA_SCSIProtocolInitiatorEndpoint"},
        {255, "VLNMPCA_VFActiveConnection"},
        {298, "VLNMPCA_CollectedARP"}, // out of its domain: the head of the chain
    };
    for (const auto& [place, name] : places)
        EXPECT_EQ(chain.at(place)->name(), name);
}

TEST(Catalogue, EveryProvidedClassHasKeys) {
    for (const mof::Schema_Class* each : catalogue().providers)
        EXPECT_GT(each->num_keys, 0u) << each->name();
    EXPECT_EQ(keys("VLNMPCA_ARPEntry"), "MACAddress,DesMACAddress,DesIPAddress");
    EXPECT_EQ(keys("VLNMPCA_ARPTable"), "MACAddress");
    EXPECT_EQ(keys("VLNMPCA_RouteTable"), "MACAddress");
    EXPECT_EQ(keys("VLNMPCA_Card"), "Tag,CreationClassName");
    EXPECT_EQ(keys("VLNMPCA_SystemDevice"), "GroupComponent,PartComponent");
    EXPECT_EQ(keys("VLNMPCA_EthernetPort"),
              "SystemCreationClassName,SystemName,CreationClassName,DeviceID");
}

TEST(Catalogue, ClassFlagsAreTheBasesWithoutAbstract) {
    for (const mof::Schema_Class* each : catalogue().providers) {
        std::set<std::string> own, base;
        for (const mof::Qualifier& qualifier : each->qualifiers())
            own.insert(qualifier.name);
        for (const mof::Qualifier& qualifier : each->superclass->qualifiers())
            if (qualifier.name != "Abstract")
                base.insert(qualifier.name);
        EXPECT_EQ(own, base) << each->name();
    }
}

TEST(Catalogue, AssociationsNarrowTheReferencesOfTheirBase) {
    for (const mof::Schema_Class* each : catalogue().providers) {
        std::size_t joined = 0;
        for (const mof::Schema_Feature& feature : each->features)
            if (feature.kind() == mof::Feature_Kind::reference && feature.local) {
                EXPECT_NE(feature.origin, each) << each->name() << "." << feature.name();
                EXPECT_TRUE(feature.key) << each->name() << "." << feature.name();
                joined++;
            }
        EXPECT_EQ(joined >= 2, each->is_association) << each->name();
    }
    const mof::Schema_Class* path =
        catalogue().schema.find("VLNMPCA_iSCSIInitiatorTargetTapeDrivePath");
    EXPECT_EQ(path->find("Initiator")->feature->target, "VLNMPCA_iSCSIProtocolEndpoint");
    EXPECT_EQ(path->find("Target")->feature->target, "VLNMPCA_iSCSITargetProtocolEndpoint");
    EXPECT_EQ(path->find("LogicalUnit")->feature->target, "VLNMPCA_TapeDrive");
}

// Names that only C++ or the engine minds.
TEST(Catalogue, RefusesWhatTheTablesCannotHold) {
    const struct {
        const char* text;
        const char* reason;
    } cases[] = {
        {"class A { uint8 default; };", ":1:17: 'default' is a word of C++"},
        {"class A { uint8 f(uint8 Return_Value); };",
         ":1:25: 'Return_Value' is a name of the engine"},
        {"class A { uint8 A; };", ":1:17: 'A' cannot be the name of a member"},
        {"class A { uint8 a[3]; };", ":1:17: an array of fixed length is not supported"},
        {"class A { uint8 a[] = {1, null}; };", ":1:27: null inside an array"},
        {"class A { a ref x; };", ":1:17: 'a' is spelled 'A' elsewhere"},
        {"class A { uint8 x; }; class B : A { [Override(\"x\")] uint8 X; };",
         ":1:59: 'X' is spelled 'x' elsewhere"},
        {"[Abstract] class VLNMPCA_A {};", ":1:18: a provided class cannot be abstract"},
        {"class Instance {};", ":1:7: 'Instance' cannot be the name of a class"},
    };
    const std::string path = "bad.mof";
    for (const auto& bad : cases) {
        generator::Output(".").write(path, bad.text);
        try {
            generator::load_catalogue(path);
            ADD_FAILURE() << "accepted: " << bad.text;
        } catch (const mof::Error& error) {
            EXPECT_EQ(error.what(), path + bad.reason) << bad.text;
        }
    }
}

} // namespace
