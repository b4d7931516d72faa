// What a client sees of the SAN behind FC ports: targets, logical units and the paths to them.
#include "tests/road/properties.h"

#include <algorithm>
#include <fstream>
#include <set>

using road::end_of;
using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

// A card with one port, or more, whose FCoE function sees the targets.
std::string san(const std::string& targets, const std::string& more = "", int ports = 1) {
    return R"({"include": ")" VLN_SCENARIOS
           R"(/parts/cna.json", "cards": [{"use": "cna", "ports": )" +
           std::to_string(ports) + R"(, "functions": [{"use": "nic"}, {"use": "fcoe", )" + more +
           R"("targets": )" + targets + "}]}]}";
}

struct Unit_Class {
    const char* name;
    const char* system_device;
    const char* path;
};

constexpr Unit_Class CLASSES[] = {
    {"VLNMPCA_StorageVolume", "VLNMPCA_StorageVolumeSystemDevice",
     "VLNMPCA_SCSIInitiatorTargetStorageVolumePath"},
    {"VLNMPCA_TapeDrive", "VLNMPCA_TapeDriveSystemDevice",
     "VLNMPCA_SCSIInitiatorTargetTapeDrivePath"},
    {"VLNMPCA_SCSIArbitraryLogicalUnit", "VLNMPCA_SCSIArbitraryLogicalUnitSystemDevice",
     "VLNMPCA_SCSIInitiatorTargetArbitraryLogicalUnitPath"},
    {"VLNMPCA_LogicalDisk", "VLNMPCA_LogicalDiskSystemDevice",
     "VLNMPCA_SCSIInitiatorTargetLogicalDiskPath"},
    {"VLNMPCA_StorageExtent", "VLNMPCA_StorageExtentSystemDevice",
     "VLNMPCA_SCSIInitiatorTargetStorageExtentPath"},
};

constexpr const char* INITIATOR = "100002564C000001"; // of the card's first port
constexpr const char* TARGET = "502564C000000001";

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
constexpr unsigned TYPES = 32; // a unit each, whose number is its type

std::string units_of_all_types() {
    std::string units;
    for (unsigned type = 0; type < TYPES; ++type)
        units += (type ? "," : "") + std::string(R"({"type": )") + std::to_string(type) + "}";
    return R"({"wwpn": "50:25:64:C0:00:00:00:01", "luns": [)" + units + "]}";
}

TEST(San, ThePeripheralTypeDecidesTheClassAndTheName) {
    Road road({.scenario = san(units_of_all_types())});
    std::set<std::pair<std::string, std::string>> seen;
    for (const Unit_Class& each : CLASSES) {
        const auto units = road.enumerate(each.name);
        std::set<std::string> ids;
        for (const auto& unit : units) {
            seen.emplace(text_of(unit, "Name"), each.name);
            ids.insert(text_of(unit, "DeviceID"));
        }
        // Each has its place in the system and its path.
        std::set<std::string> parts, ends;
        for (const auto& device : road.enumerate(each.system_device))
            parts.insert(end_of(device, "PartComponent", "DeviceID"));
        for (const auto& path : road.enumerate(each.path)) {
            ends.insert(end_of(path, "LogicalUnit", "DeviceID"));
            EXPECT_EQ(end_of(path, "Initiator", "Name"), std::string("Initiator:") + INITIATOR);
            EXPECT_EQ(end_of(path, "Target", "Name"), TARGET);
        }
        EXPECT_EQ(parts, ids) << each.name;
        EXPECT_EQ(ends, ids) << each.name;
    }
    std::set<std::pair<std::string, std::string>> expected;
    for (unsigned type = 0; type < TYPES; ++type) {
        const auto* row =
            std::find_if(std::begin(KNOWN_TYPES), std::end(KNOWN_TYPES),
                         [type](const Type_Row& known) { return known.type == type; });
        const bool known = row != std::end(KNOWN_TYPES);
        expected.emplace((known ? row->name : "Unknown device ") + std::to_string(type),
                         known ? row->class_name : "VLNMPCA_StorageExtent");
    }
    EXPECT_EQ(seen, expected);
}

TEST(San, AUnitIsWhatItTellsOfItself) {
    Road road({.scenario = san(R"({"wwpn": "50:25:64:C0:00:00:00:01", "luns": [
        {"number": 3, "vendor": "VORLAN", "product": "ARRAY", "revision": "1.2", "serial": "S3",
         "osDeviceName": "/dev/sdc", "lastLBA": "0xFFFFFFFF", "blockLength": 4096,
         "identifier": {"type": 2, "bytes": "0001020304050607"}},
        {"number": 260, "type": "tape"}, {"number": 7, "type": 17}, {"number": 8, "type": 13}]})")});
    const auto volumes = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(volumes.size(), 1u);
    expect_properties(
        volumes[0],
        {{"DeviceID", "100002564C000001_502564C000000001_3_0001020304050607"},
         {"CreationClassName", "VLNMPCA_StorageVolume"},
         {"SystemCreationClassName", "CIM_ComputerSystem"},
         {"Description", "VORLAN   ARRAY            Revision 1.2 "},
         {"Capacity", "17592186044416"},
         {"CapacityUnit", "Byte"},
         {"BlockSize", "4096"},
         {"NumberOfBlocks", "4294967296"},
         {"DeviceType", "0"},
         {"OtherIdentifyingInfo", "{/dev/sdc, VORLAN   ARRAY            Revision 1.2  Serial "
                                  "Number S3}"},
         {"IdentifyingDescriptions", "{OS Device Name, Standard SCSI inquiry data}"}});
    const auto paths = road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath");
    ASSERT_EQ(paths.size(), 1u);
    expect_properties(paths[0], {{"OSDeviceName", "/dev/sdc"}, {"LogicalUnitNumber", "3"}});
    expect_properties(
        road.enumerate("VLNMPCA_TapeDrive").at(0),
        {{"Name", "Tape Drive 260"},
         {"Capacity", "-"},
         {"OtherIdentifyingInfo", "{n/a, VORLAN   SIMULATED UNIT   Revision 1.00 Serial "
                                  "Number T0L260}"},
         {"IdentifyingDescriptions", "{OS Device Name, standard SCSI Inquery data}"}});
    expect_properties(road.enumerate("VLNMPCA_LogicalDisk").at(0),
                      {{"DataOrganization", "1"}, {"BlockSize", "-"}, {"NumberOfBlocks", "-"}});
    expect_properties(
        road.enumerate("VLNMPCA_SCSIArbitraryLogicalUnit").at(0),
        {{"DeviceType", "1"}, {"OtherDeviceType", "Peripheral devices type is 0x0D"}});
}

TEST(San, AVolumeSaysWhereItsIdentifierComesFrom) {
    const struct {
        const char* format;
        const char* name_space;
        const char* other_format;
        const char* other_name_space;
    } rows[] = {
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
    Road road({.scenario = san(R"({"wwpn": "50:25:64:C0:00:00:00:01", "luns": [)" + units + "]}")});
    const auto volumes = road.enumerate("VLNMPCA_StorageVolume");
    ASSERT_EQ(volumes.size(), std::size(rows));
    for (std::size_t i = 0; i < volumes.size(); ++i) {
        SCOPED_TRACE(i);
        expect_properties(volumes[i], {{"NameFormat", rows[i].format},
                                       {"NameNamespace", rows[i].name_space},
                                       {"OtherNameFormat", rows[i].other_format},
                                       {"OtherNameNamespace", rows[i].other_name_space}});
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
                       {"CreationClassName", "VLNMPCA_SCSIProtocolEndpoint"},
                       {"ElementName", "Target:502564C00000000A"},
                       {"Description", "FIRST    SIMULATED UNIT   Revision 1.00 Serial Number S0"},
                       {"OtherIdentifyingInfo", "{/dev/sd0}"},
                       {"IdentifyingDescriptions", "{OS Device Name}"},
                       {"FCID", "68096"},
                       {"SCSIBusNumber", "2"},
                       {"SCSITargetNumber", "5"},
                       {"TargetWWPN", "502564C00000000A"},
                       {"TargetWWNN", "502564CF0000000A"}});
    EXPECT_EQ(text_of(targets[1], "Name"), "502564C00000000B");
    const auto hosted = road.enumerate("VLNMPCA_LocalHostedAccessPoint");
    ASSERT_EQ(hosted.size(), 2u);
    EXPECT_EQ(end_of(hosted[1], "Dependent", "Name"), "502564C00000000B");
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
    EXPECT_EQ(road.enumerate("VLNMPCA_LocalHostedAccessPoint").size(), 1u);
    EXPECT_EQ(road.enumerate("VLNMPCA_StorageVolume").size(), 4u);
    std::set<std::string> initiators;
    for (const auto& path : road.enumerate("VLNMPCA_SCSIInitiatorTargetStorageVolumePath")) {
        initiators.insert(end_of(path, "Initiator", "Name") + " " +
                          text_of(path, "LogicalUnitNumber"));
        EXPECT_EQ(end_of(path, "Target", "Name"), TARGET);
    }
    EXPECT_EQ(initiators.size(), 4u);
    // A client goes from the one target to the units of both ports.
    EXPECT_EQ(road.manager()
                  .associators(targets[0].path, {"VLNMPCA_SCSIInitiatorTargetStorageVolumePath",
                                                 "VLNMPCA_StorageVolume", "", ""})
                  .value.size(),
              4u);
    road.close();
    EXPECT_EQ(road.faults_in_log(), "");
}

TEST(San, APortWithoutTargetsIsNoError) {
    Road road({.scenario = "two-port-cna.json", .log = true});
    const auto counts = road.census();
    for (const Unit_Class& each : CLASSES)
        EXPECT_FALSE(counts.contains(each.name)) << each.name;
    EXPECT_FALSE(counts.contains("VLNMPCA_SCSIProtocolEndpoint"));
    road.close();
    EXPECT_EQ(road.count_in_log("PERF: updateSANMaps: cleanExit"), 1u);
    EXPECT_EQ(road.count_in_log("FCoE SAN refresh failed"), 0u);
}

TEST(San, FourThousandUnitsOfAllClasses) {
    Road road({.scenario = "san-4096-luns.json"});
    const std::size_t counts[] = {1280, 256, 512, 256, 1792};
    for (std::size_t i = 0; i < std::size(CLASSES); ++i) {
        EXPECT_EQ(road.enumerate(CLASSES[i].name).size(), counts[i]);
        EXPECT_EQ(road.enumerate(CLASSES[i].system_device).size(), counts[i]);
        EXPECT_EQ(road.enumerate(CLASSES[i].path).size(), counts[i]);
    }
    EXPECT_EQ(road.enumerate("VLNMPCA_SCSIProtocolEndpoint").size(), 16u);
}

// ---- Refresh ----

constexpr std::uint64_t MINUTE = 60000000;
constexpr unsigned long UNITS = 2;

unsigned long adapter_calls() {
    return vlnsim_calls("AX_GetAllLocalHBAInstances") + vlnsim_calls("AX_GetHBAAttributes");
}

// With the SAN left out of refreshes, whoever asks for it gets it, from the adapters as they are.
TEST(San, AClientOfTheSanGetsItWithoutANewScanOfTheAdapters) {
    Road road({.scenario = san(R"({"wwpn": "50:25:64:C0:00:00:00:01", "luns": 2})"), .log = true});
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
