// The SAN behind FC ports: what units and targets become by what they tell, and who reads it when.
// How they are shown stands in shown/everything.md.
#include "tests/road/hosts.h"
#include "tests/road/properties.h"

#include <fstream>
#include <set>

using road::end_of;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

// A card with one port, or more, whose FCoE function sees the targets.
std::string san(const std::string& targets, const std::string& more = "", int ports = 1) {
    return road::card(R"({"use": "nic"}, {"use": "fcoe", )" + more + R"("targets": )" + targets +
                          "}",
                      R"("ports": )" + std::to_string(ports) + ", ");
}

std::string target(const std::string& units) {
    return R"({"wwpn": "50:25:64:C0:00:00:00:01", "luns": )" + units + "}";
}

// ---- Types ----

struct Type_Row {
    unsigned type;
    const char* name;
    const char* class_name;
};

// All other types are storage extents of an unknown kind.
constexpr Type_Row KNOWN_TYPES[] = {
    {0, "Storage Volume: ", "VLNMPCA_StorageVolume"},
    {1, "Tape Drive ", "VLNMPCA_TapeDrive"},
    {2, "Printer ", "VLNMPCA_StorageExtent"},
    {3, "Processor ", "VLNMPCA_StorageExtent"},
    {4, "Write-once device ", "VLNMPCA_StorageExtent"},
    {5, "CD/DVD ", "VLNMPCA_StorageExtent"},
    {6, "Scanner ", "VLNMPCA_StorageExtent"},
    {7, "Optical memory device ", "VLNMPCA_StorageExtent"},
    {8, "Jukebox ", "VLNMPCA_StorageExtent"},
    {9, "Communications device ", "VLNMPCA_StorageExtent"},
    {12, "Storage array controller ", "VLNMPCA_SCSIArbitraryLogicalUnit"},
    {13, "Enclosure services ", "VLNMPCA_SCSIArbitraryLogicalUnit"},
    {14, "Storage Volume: ", "VLNMPCA_StorageVolume"},
    {15, "Optical card reader/writer ", "VLNMPCA_StorageExtent"},
    {16, "Bridge controller ", "VLNMPCA_SCSIArbitraryLogicalUnit"},
    {17, "Object-based storage device: ", "VLNMPCA_LogicalDisk"},
};
constexpr unsigned TYPES = 32;

TEST(San, ThePeripheralTypeDecidesTheClassAndTheName) {
    std::string units; // one each, whose number is its type
    for (unsigned type = 0; type < TYPES; ++type)
        units += (type ? ",{\"type\": " : "{\"type\": ") + std::to_string(type) + "}";
    Road road({.scenario = san(target("[" + units + "]"))});
    std::set<std::pair<std::string, std::string>> seen, expected;
    for (const char* name :
         {"VLNMPCA_StorageVolume", "VLNMPCA_TapeDrive", "VLNMPCA_SCSIArbitraryLogicalUnit",
          "VLNMPCA_LogicalDisk", "VLNMPCA_StorageExtent"})
        for (const auto& unit : road.enumerate(name))
            seen.emplace(text_of(unit, "Name"), name);
    for (unsigned type = 0; type < TYPES; ++type)
        expected.emplace("Unknown device " + std::to_string(type), "VLNMPCA_StorageExtent");
    for (const Type_Row& row : KNOWN_TYPES) {
        expected.erase({"Unknown device " + std::to_string(row.type), "VLNMPCA_StorageExtent"});
        expected.emplace(row.name + std::to_string(row.type), row.class_name);
    }
    EXPECT_EQ(seen, expected);
}

TEST(San, AUnitIsWhatItTellsOfItself) {
    Road road({.scenario = san(target(R"([
        {"number": 3, "vendor": "VORLAN", "product": "ARRAY", "revision": "1.2", "serial": "S3",
         "osDeviceName": "/dev/sdc", "lastLBA": "0xFFFFFFFF", "blockLength": 4096,
         "identifier": {"type": 2, "bytes": "0001020304050607"}}, {"number": 260, "type": "tape"}])"))});
    expect_properties(
        road.enumerate("VLNMPCA_StorageVolume").at(0),
        {{"DeviceID", "100002564C000001_502564C000000001_3_0001020304050607"},
         {"Description", "VORLAN   ARRAY            Revision 1.2 "},
         {"Capacity", "17592186044416"},
         {"BlockSize", "4096"},
         {"NumberOfBlocks", "4294967296"},
         {"OtherIdentifyingInfo", "{/dev/sdc, VORLAN   ARRAY            Revision 1.2  Serial "
                                  "Number S3}"},
         {"IdentifyingDescriptions", "{OS Device Name, Standard SCSI inquiry data}"}});
    const auto paths = road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath");
    expect_properties(paths.at(0), {{"OSDeviceName", "/dev/sdc"}, {"LogicalUnitNumber", "3"}});
    EXPECT_EQ(road::first(road, "VLNMPCA_TapeDrive", "Name"), "Tape Drive 260");
}

TEST(San, AVolumeSaysWhereItsIdentifierComesFrom) {
    // Its format and namespace, and what they are where they are none that is known.
    const char* const rows[][4] = {
        {"6", "1", "-", "Vendor specific"},
        {"5", "4", "-", "-"},
        {"10", "3", "-", "-"},
        {"9", "2", "-", "-"},
        {"1", "1", "Relative target port identifier", "Relative target port idientifier"},
        {"1", "1", "Target port group", "Target port group"},
        {"1", "1", "Logical port group", "Logical unit group"},
        {"1", "1", "MD5 logical unit identifier", "MD5 logical unit identifier"},
        {"1", "1", "SCSI name std::string", "SCSI name std::string"},
        {"-", "-", "-", "-"}, // a type of a later standard
        {"-", "-", "-", "-"}, // no identification page
    };
    std::string units;
    for (std::size_t type = 0; type + 1 < std::size(rows); ++type)
        units += R"({"identifier": {"type": )" + std::to_string(type) + "}},";
    units += R"({"responses": {"identityPage": false}})";
    Road road({.scenario = san(target("[" + units + "]"))});
    const auto volumes = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(volumes.size(), std::size(rows));
    for (std::size_t i = 0; i < volumes.size(); ++i) {
        SCOPED_TRACE(i);
        expect_properties(volumes[i], {{"NameFormat", rows[i][0]},
                                       {"NameNamespace", rows[i][1]},
                                       {"OtherNameFormat", rows[i][2]},
                                       {"OtherNameNamespace", rows[i][3]}});
    }
}

// ---- Targets ----

// The mapping goes from target to target with each unit; the first unit of each describes it.
TEST(San, UnitsOfOneTargetAreOneEndpoint) {
    Road road({.scenario = san(R"([
        {"wwpn": "50:25:64:C0:00:00:00:0A", "wwnn": "50:25:64:CF:00:00:00:0A", "fcId": "0x010A00",
         "bus": 2, "number": 5, "osDeviceName": "/dev/sd{lun}",
         "luns": [{"vendor": "FIRST", "serial": "S{lun}"}, {"vendor": "SECOND"}, {}]},
        {"wwpn": "50:25:64:C0:00:00:00:0B", "luns": [{"number": 1}, {"number": 2}]}])",
                               R"("hba": {"order": "units"}, )")});
    const auto targets = road.enumerate("VLNMPCA_SCSIProtocolEndpoint");
    ASSERT_EQ(targets.size(), 2u);
    expect_properties(targets[0],
                      {{"Name", "502564C00000000A"},
                       {"Description", "FIRST    SIMULATED UNIT   Revision 1.00 Serial Number S0"},
                       {"OtherIdentifyingInfo", "{/dev/sd0}"},
                       {"FCID", "68096"},
                       {"SCSIBusNumber", "2"},
                       {"SCSITargetNumber", "5"},
                       {"TargetWWPN", "502564C00000000A"},
                       {"TargetWWNN", "502564CF0000000A"}});
    EXPECT_EQ(text_of(targets[1], "Name"), "502564C00000000B");
    road::expect_counts(road, {{"VLNMPCA_LocalHostedAccessPoint", 2}});
    // Units come target by target, in the order of the mapping.
    std::string order;
    for (const auto& path : road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath"))
        order +=
            end_of(path, "Target", "Name").substr(15) + text_of(path, "LogicalUnitNumber") + " ";
    EXPECT_EQ(order, "A0 A1 A2 B1 B2 ");
}

TEST(San, ATargetThatTwoPortsSeeStandsOnceWithThePathsOfBoth) {
    Road road({.scenario =
                   san(R"({"wwpn": "50:25:64:C0:00:00:00:01", "vendor": "PORT{port}", "luns": 2})",
                       "", 2),
               .log = true});
    const auto targets = road.enumerate("VLNMPCA_SCSIProtocolEndpoint");
    ASSERT_EQ(targets.size(), 1u);
    EXPECT_TRUE(text_of(targets[0], "Description").starts_with("PORT0"));
    road::expect_counts(road,
                        {{"VLNMPCA_LocalHostedAccessPoint", 1}, {"VLNMPCA_StorageVolume", 4}});
    std::set<std::string> initiators;
    for (const auto& path : road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath"))
        initiators.insert(end_of(path, "Initiator", "Name") + " " +
                          text_of(path, "LogicalUnitNumber"));
    EXPECT_EQ(initiators.size(), 4u);
    // A client goes from the one target to the units of both ports.
    EXPECT_EQ(walk(road, targets[0], "VLNMPCA_SCSIInitiatorTargetStorageVolumePath").size(), 8u)
        << "units and initiators";
    road.close();
    EXPECT_EQ(road.faults_in_log(), "");
}

// ---- Refresh ----

constexpr std::uint64_t MINUTE = 60000000;
constexpr unsigned long UNITS = 2;

unsigned long adapter_calls() {
    return vlnsim_calls("AX_GetAllLocalHBAInstances") + vlnsim_calls("AX_GetHBAAttributes");
}

// With the SAN left out of refreshes, whoever asks for it gets it, from the adapters as they are.
TEST(San, AClientOfTheSanGetsItWithoutANewScanOfTheAdapters) {
    Road road({.scenario = san(target("2")), .log = true});
    std::ofstream(road.root() / "etc/vorlan_mpca_provider.conf")
        << "VLN_PROVIDER_REFRESH_SANDATA = FALSE\n";
    std::size_t refreshes = 0;
    for (int round = 0; round < 2; ++round) {
        SCOPED_TRACE(round);
        vlnsim_clear_calls();
        road.enumerate("VLNMPCA_EthernetPort");
        road.wait_for_refreshes(++refreshes);
        EXPECT_GT(adapter_calls(), 0u);
        EXPECT_EQ(vlnsim_calls("HBA_SendScsiInquiry"), 0u);

        vlnsim_clear_calls();
        EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), UNITS);
        road.wait_for_refreshes(++refreshes);
        EXPECT_EQ(adapter_calls(), 0u);
        EXPECT_EQ(vlnsim_calls("HBA_GetFcpTargetMapping"), 1u);
        EXPECT_EQ(vlnsim_calls("HBA_SendScsiInquiry"), UNITS * 3);
        EXPECT_EQ(vlnsim_calls("HBA_SendReadCapacity"), UNITS);

        const unsigned long calls = vlnsim_calls(nullptr);
        EXPECT_EQ(road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath").size(), UNITS);
        EXPECT_EQ(vlnsim_calls(nullptr), calls) << "what was made for the first client is there";
        vlnsim_advance(11 * MINUTE);
    }
}

} // namespace
