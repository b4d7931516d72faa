// What a client sees of software: the identities of provider, driver, firmware and flash memory,
// the service that installs them, and the record logs.
#include "tests/road/properties.h"

#include <fstream>

using road::expect_properties;
using road::Road;
using road::text_of;

namespace {

TEST(Software, IdentitiesOfProviderDriverAndFirmware) {
    Road road;
    const auto software = road.enumerate("VLNMPCA_SoftwareIdentity");
    ASSERT_GE(software.size(), 3u);
    expect_properties(software[0], {{"InstanceID", "Vorlan CMPI MPCA Provider v10.2.261-13"},
                                    {"ElementName", "Vorlan CMPI MPCA Provider v10.2.261-13"},
                                    {"VersionString", "10.2.261-13"},
                                    {"IdentityInfoValue", "{10.2.261-13, 2}"},
                                    {"TargetOSTypes", "{36, 80}"},
                                    {"Classifications", "{1}"},
                                    {"IsEntity", "TRUE"}});
    EXPECT_EQ(text_of(software[0], "LibQDCVersion"), text_of(software[0], "LibAXAPIVersion"));
    EXPECT_NE(text_of(software[0], "LibAXAPIVersion"), "-");
    EXPECT_NE(text_of(software[0], "LibNIMAVersion"), "-");
    expect_properties(software[1],
                      {{"InstanceID", "VLN CNA: Driver vlnnet v10.2.261.5"},
                       {"Description", "Vorlan CNA Driver"},
                       {"ElementName", "vlnnet v10.2.261.5"},
                       {"VersionString", "10.2.261.5"},
                       {"Classifications", "{2}"},
                       {"ClassificationDescriptions", "{CNA Driver}"},
                       {"IdentityInfoValue", "{vlnnet, 10.2.261.5, 0}"},
                       {"IdentityInfoType", "{VORLAN:DRIVER_NAME, VORLAN:DRIVER_VERSION, "
                                            "VORLAN:VNICD_DRIVER_TYPE}"}});
    expect_properties(software[2],
                      {{"InstanceID", "VLN CNA:OperationalFirmware:v10.2.261.13 VR10420117:00 "
                                      "UpdatedFirmware:v10.2.261.13"},
                       {"ElementName", "CNA Firmware v10.2.261.13 VR10420117:00"},
                       {"Name", "Vorlan Ethernet Adapter VMC-2210 Firmware"},
                       {"VersionString", "10.2.261.13"},
                       {"MajorVersion", "-"},
                       {"Manufacturer", "Vorlan Corporation"},
                       {"Classifications", "{10}"},
                       {"SerialNumber", "VR10420117"},
                       {"IdentityInfoValue", "{VR10420117:00}"},
                       {"IdentityInfoType", "{SerialNumber + Sub-AdapterID}"},
                       {"TargetOSTypes", "{36, 80}"},
                       {"ReleaseDate", "\"20140315000000.000000+360\""},
                       {"FirmwareOnFlash", "10.2.261.13"},
                       {"OptROMVersion", "10.2.261.8"}});
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_EthernetPortSoftwareIdentity").at(0),
                      "ElementSoftwareStatus"),
              "{2, 3, 9}");
}

// The firmware's card tells its release date, if it has one of this form.
TEST(Software, AFirmwareOfAnotherForm) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "vpd": {"FW": "D:031520145"},
         "adapterAttributes": {"OperationalFirmwareVersion": "4.01A5"},
         "functions": [{"use": "nic"}]}]})"});
    expect_properties(road.enumerate("VLNMPCA_SoftwareIdentity").at(2), {{"ReleaseDate", "-"},
                                                                         {"MajorVersion", "4"},
                                                                         {"RevisionNumber", "1"},
                                                                         {"BuildNumber", "5"},
                                                                         {"ReleaseType", "A"}});
}

TEST(Software, TheFlashImage) {
    Road road;
    expect_properties(road.enumerate("VLNMPCA_FlashImageSoftwareIdentity").at(0),
                      {{"InstanceID", "VLN CNA Flash Contents:10.2.261.13"},
                       {"SerialNumber", "10.2.261.13"},
                       {"MajorVersion", "10"},
                       {"MinorVersion", "2"},
                       {"RevisionNumber", "261"},
                       {"BuildNumber", "13"},
                       {"IPLFilename", "VLN-10.2.261.13.img"},
                       {"NCSIVersion", "10.2.261.1"},
                       {"FCOEUniversalVersion", "10.2.261.2"},
                       {"FCOE_X86_BIOSVersion", "10.2.261.3"},
                       {"FCOE_EFIVersion", "10.2.261.4"},
                       {"FCOE_FCODEVersion", "10.2.261.6"},
                       {"UEFI_BIOSVersion", "10.2.261.7"},
                       {"UEFI_NICVersion", "10.2.261.9"},
                       {"UEFI_FCODEVersion", "10.2.261.10"},
                       {"UEFI_ISCSIVersion", "10.2.261.11"},
                       {"PCI_Express_LinkSpeed", "5.0 GT/s"},
                       {"PCI_Express_BusWidth", "x8"},
                       {"IdentityInfoValue", "{VR10420117, VLN-10.2.261.13.img}"}});
}

// Only the machine's own libcurl fetches from further places than files.
TEST(Software, TheInstallationService) {
    Road road({.log = true});
    const auto capabilities = road.enumerate("VLNMPCA_SoftwareInstallationServiceCapabilities");
    const auto service = road.enumerate("VLNMPCA_SoftwareInstallationService");
    expect_properties(service.at(0), {{"Name", "Vorlan MPCA Software Installation Service"},
                                      {"InstallDate", "\"00000000000000.000000:000\""},
                                      {"OperationalStatus", "{2}"}});
    EXPECT_EQ(
        text_of(road.enumerate("VLNMPCA_InstallServiceAffectsSystem").at(0), "ElementEffects"),
        "{5}");
    road.close();
    expect_properties(capabilities.at(0),
                      {{"SupportedInstallOptions", "{2, 3, 4, 5, 6, 7, 11}"},
                       {"SupportedURISchemes",
                        road.count_in_log("libcurl is not present") ? "{3}" : "{3, 4, 5, 6, 8}"}});
}

TEST(Software, RecordLogsShowTheLogger) {
    const struct {
        const char* settings; // mode, level and whether it is enabled
        const char* level;
        const char* requested;
        const char* enabled;
    } rows[] = {{"2,5,1\n", "5", "5", "3"}, {"2,2,0\n", "2", "2", "2"}};
    for (const auto& row : rows) {
        Road road;
        std::ofstream(road.root() / "etc/vorlan_mpca_provider.dmp") << row.settings;
        const auto logs = road.enumerate("VLNMPCA_RecordLog");
        ASSERT_EQ(logs.size(), 5u) << "and three of drivers";
        expect_properties(logs[0], {{"ElementName", "Record logs for Vorlan CIM Provider"},
                                    {"LogLevel", row.level},
                                    {"RequestedState", row.requested},
                                    {"EnabledState", row.enabled}});
        expect_properties(logs[1], {{"RequestedState", "2"},
                                    {"LogLevel", "3"},
                                    {"TracePath", (road.root() / "tmp/nima2d.log").c_str()},
                                    {"MaxNumberOfRecords", "1024"}});
    }
}

} // namespace
