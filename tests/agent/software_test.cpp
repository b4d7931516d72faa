// The software identities, the installation service and the record logs of simulated hosts.

#include "agent/software/software_identity.h"
#include "foundation/common.h"
#include "operations/curl_library.h"
#include "tests/agent/maps_fixture.h"

#include <cstring>
#include <stdexcept>
#include <sys/statvfs.h>

namespace cimple {

namespace {

// A host with or without libcurl, under the one name that all distributions know.
bool curl_installed = false;
int curl_open = 0;

constexpr Loader_Calls CURL_LOADER = {
    [](const char* file, int) -> void* {
        if (!curl_installed || std::strcmp(file, "libcurl.so") != 0)
            return nullptr;
        ++curl_open;
        return &curl_open;
    },
    [](void*, const char*) -> void* { return nullptr; },
    [](void*) {
        --curl_open;
        return 0;
    },
    []() -> char* { return nullptr; },
};

unsigned long root_flags = 0;

int root_file_system(const char*, struct statvfs* out) {
    out->f_flag = root_flags;
    return 0;
}

class Software_Test : public Maps_Test {
protected:
    void SetUp() override {
        Maps_Test::SetUp();
        curl_installed = true;
        root_flags = 0;
        replace_curl_loader(&CURL_LOADER);
        VLN_Common::replace_statvfs(&root_file_system);
    }
    void TearDown() override {
        EXPECT_EQ(curl_open, 0);
        replace_curl_loader(nullptr);
        VLN_Common::replace_statvfs(nullptr);
        Maps_Test::TearDown();
    }

    // What a card tells of its firmware as a replaceable unit is another test's matter.
    static void load_nic(const std::string& attributes = "{}") {
        load(R"({"use": "nic", "adapterAttributes": )" + attributes + "}");
        ASSERT_EQ(vlnsim_fault("AX_GetVPDV2", VLNSIM_EVERY, VLNSIM_STATUS, 1), 0);
    }
    // The properties of an instance, but for those that the host decides.
    static std::string properties(ProviderAgent& agent, Store_Id store, uint32 index) {
        std::string text = "\n";
        for (const std::string& line : lines_of(agent.store(store).at(index)))
            if (line.find("Version = \"AX") == std::string::npos &&
                line.find("SystemName") == std::string::npos &&
                line.find("TracePath") == std::string::npos)
                text += line + "\n";
        return text;
    }
};

std::string codes(const CIM_SoftwareIdentity& software) {
    std::string text;
    for (uint16 code : software.TargetOSTypes.value)
        text += std::to_string(code) + " ";
    for (const String& name : software.TargetOperatingSystems.value)
        text += name.c_str();
    return text;
}

} // namespace

// A word that is missing counts as not being the first one.
TEST(Target_System, CodesFollowTheWordsOfTheText) {
    const struct {
        const char* system;
        const char* codes;
    } rows[] = {
        {"Linux 2.6 x86_64 RH", "36 80 "},
        {"Linux", "36 80 "},
        {"x86_64 Linux", "36 79 "},
        {"RH Linux 6", "36 85 "},
        {"SL Linux", "36 80 "},
        {"VMware ESX", "104 "},
        {"Linux on VMware", "36 80 "},
        {"Windows 2008 x64 R2", "103 "},
        {"R2 Windows 2008", "77 "},
        {"2008 Windows R2", "1 2008 Windows R2"},
        {"Solaris", "1 Solaris"},
        {"", "1 "},
    };
    for (const auto& row : rows) {
        const Ref<CIM_SoftwareIdentity> software(create_null<CIM_SoftwareIdentity>());
        append_target_system(*software, row.system);
        EXPECT_EQ(codes(*software), row.codes) << row.system;
    }
}

TEST(Dotted_Version, NeedsThreeDots) {
    const std::array<uint16, 4> good = {10, 2, 261, 13};
    EXPECT_EQ(dotted_version("10.2.261.13"), good);
    EXPECT_EQ(dotted_version("10.2.261.13.7"), good);
    const std::array<uint16, 4> empty{};
    EXPECT_EQ(dotted_version("..."), empty);
    for (const char* text : {"", "10", "10.2", "10.2.261"})
        EXPECT_THROW(dotted_version(text), std::out_of_range) << text;
}

TEST_F(Software_Test, IdentitiesOfProviderDriverAndFirmware) {
    load_nic();
    ASSERT_EQ(vlnsim_fault("AX_NimaVersion", VLNSIM_EVERY, VLNSIM_STATUS, 1), 0);
    Loaded_Agent agent;
    Log_Capture log;
    EXPECT_EQ(refreshes_started(*agent), 1);
    const auto& software = agent->store(STORE_VLNMPCA_SoftwareIdentity);
    ASSERT_EQ(software.size(), 3u);
    EXPECT_EQ(value_of(software.at(0), "ElementName"),
              "\"Vorlan CMPI MPCA Provider v10.2.261-13\"");
    EXPECT_EQ(value_of(software.at(0), "VersionString"), "\"10.2.261-13\"");
    EXPECT_EQ(value_of(software.at(0), "IdentityInfoValue"), "{ \"10.2.261-13\", \"2\" }");
    EXPECT_EQ(value_of(software.at(0), "TargetOSTypes"), "{ 36, 80 }");
    EXPECT_EQ(value_of(software.at(0), "LibNIMAVersion"), "");
    EXPECT_NE(value_of(software.at(0), "LibAXAPIVersion"), "");
    EXPECT_EQ(value_of(software.at(0), "LibQDCVersion"),
              value_of(software.at(0), "LibAXAPIVersion"));
    EXPECT_EQ(log.count(VLN_DBG, "Failed to get GetNIMALibVersion: returned with error - 1"), 1);
    EXPECT_EQ(properties(*agent, STORE_VLNMPCA_SoftwareIdentity, 1), R"(
string __name_space = "root/vorlan";
string InstanceID = "VLN CNA: Driver vlnnet v10.2.261.5";
string Description = "Vorlan CNA Driver";
string ElementName = "vlnnet v10.2.261.5";
string Name = "vlnnet v10.2.261.5";
string VersionString = "10.2.261.5";
string Manufacturer = "Vorlan Corporation";
uint16 Classifications = { 2 };
string ClassificationDescriptions = { "CNA Driver" };
string IdentityInfoValue = { "vlnnet", "10.2.261.5", "0" };
string IdentityInfoType = { "VORLAN:DRIVER_NAME", "VORLAN:DRIVER_VERSION", "VORLAN:VNICD_DRIVER_TYPE" };
boolean IsEntity = true;
)");
    EXPECT_EQ(properties(*agent, STORE_VLNMPCA_SoftwareIdentity, 2), R"(
string __name_space = "root/vorlan";
string InstanceID = "VLN CNA:OperationalFirmware:v10.2.261.13 VR10420117:00 UpdatedFirmware:v10.2.261.13";
string Description = "Vorlan CNA Firmware";
string ElementName = "CNA Firmware v10.2.261.13 VR10420117:00";
string Name = "Vorlan Ethernet Adapter VMC-2210 Firmware";
string VersionString = "10.2.261.13";
string Manufacturer = "Vorlan Corporation";
uint16 Classifications = { 10 };
string ClassificationDescriptions = { "CNA Firmware" };
string SerialNumber = "VR10420117";
string IdentityInfoValue = { "VR10420117:00" };
string IdentityInfoType = { "SerialNumber + Sub-AdapterID" };
boolean IsEntity = true;
uint16 TargetOSTypes = { 36, 80 };
string FirmwareOnFlash = "10.2.261.13";
string OptROMVersion = "10.2.261.8";
)");
    expect_counts(*agent, {{STORE_VLNMPCA_InstalledSoftwareIdentity, 2},
                           {STORE_VLNMPCA_SoftwareConformsToProfile, 3},
                           {STORE_VLNMPCA_ProviderElementSoftwareIdentity, 1},
                           {STORE_VLNMPCA_FirmwareElementSoftwareIdentity, 1},
                           {STORE_VLNMPCA_InstallServiceAffectsFirmwareIdentity, 1},
                           {STORE_VLNMPCA_EthernetPortSoftwareIdentity, 2},
                           {STORE_VLNMPCA_ElementSoftwareIdentity, 2}});
    EXPECT_EQ(value_of(agent->store(STORE_VLNMPCA_EthernetPortSoftwareIdentity).at(0),
                       "ElementSoftwareStatus"),
              "{ 2, 3, 9 }");
}

TEST_F(Software_Test, FlashImage) {
    load_nic();
    Loaded_Agent agent;
    EXPECT_EQ(refreshes_started(*agent), 1);
    const auto& images = agent->store(STORE_VLNMPCA_FlashImageSoftwareIdentity);
    ASSERT_EQ(images.size(), 1u);
    const struct {
        const char* property;
        const char* value;
    } rows[] = {
        {"InstanceID", "\"VLN CNA Flash Contents:10.2.261.13\""},
        {"SerialNumber", "\"10.2.261.13\""},
        {"MajorVersion", "10"},
        {"MinorVersion", "2"},
        {"RevisionNumber", "261"},
        {"BuildNumber", "13"},
        {"IPLFilename", "\"VLN-10.2.261.13.img\""},
        {"NCSIVersion", "\"10.2.261.1\""},
        {"FCOE_X86_BIOSVersion", "\"10.2.261.3\""},
        {"UEFI_ISCSIVersion", "\"10.2.261.11\""},
        {"PCI_Express_LinkSpeed", "\"5.0 GT/s\""},
        {"PCI_Express_BusWidth", "\"x8\""},
        {"IdentityInfoValue", "{ \"VR10420117\", \"VLN-10.2.261.13.img\" }"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(value_of(images.at(0), row.property), row.value) << row.property;
    expect_counts(*agent, {{STORE_VLNMPCA_MPCAPortFlashImageSoftwareIdentity, 2}});
}

// A version that is no dotted one ends what is made of NIC adapters, where it stands.
TEST_F(Software_Test, AFirmwareVersionWithTooFewDots) {
    load_nic(R"({"FirmwareVersion": "4.01", "OperationalFirmwareVersion": "4.01A5"})");
    Loaded_Agent agent;
    Log_Capture log;
    EXPECT_EQ(refreshes_started(*agent), 1);
    expect_counts(*agent, {{STORE_VLNMPCA_EthernetPort, 1},
                           {STORE_VLNMPCA_PortController, 1},
                           {STORE_VLNMPCA_FlashImageSoftwareIdentity, 0},
                           {STORE_VLNMPCA_ControlledBy, 0},
                           {STORE_VLNMPCA_RecordLog, 2}});
    EXPECT_EQ(log.count(VLN_DBG, "Unknown exception in  NIC card discovery"), 1);
    EXPECT_EQ(log.count(VLN_DBG, "PERF: updateAdapterMaps: cleanExit"), 1);
    // The form that this text does have.
    const Instance* firmware = agent->store(STORE_VLNMPCA_SoftwareIdentity).at(2);
    EXPECT_EQ(value_of(firmware, "MajorVersion"), "4");
    EXPECT_EQ(value_of(firmware, "RevisionNumber"), "1");
    EXPECT_EQ(value_of(firmware, "BuildNumber"), "5");
    EXPECT_EQ(value_of(firmware, "ReleaseType"), "\"A\"");
}

TEST_F(Software_Test, InstallationServiceAndTheSchemesOfCurl) {
    load_nic();
    Loaded_Agent agent;
    const struct {
        bool installed;
        unsigned long flags;
        const char* schemes;
    } rows[] = {{true, 0, "{ 3, 4, 5, 6, 8 }"}, {false, 0, "{ 3 }"}, {true, ST_RDONLY, "{ 3 }"}};
    for (const auto& row : rows) {
        curl_installed = row.installed;
        root_flags = row.flags;
        VLN_Common::replace_statvfs(&root_file_system); // forgets the former answer
        Log_Capture log;
        agent->m_bAdapterRefreshRequested = true;
        EXPECT_EQ(refreshes_started(*agent), 1);
        const auto& capabilities =
            agent->store(STORE_VLNMPCA_SoftwareInstallationServiceCapabilities);
        ASSERT_EQ(capabilities.size(), 1u);
        EXPECT_EQ(value_of(capabilities.at(0), "SupportedURISchemes"), row.schemes);
        EXPECT_EQ(value_of(capabilities.at(0), "SupportedInstallOptions"),
                  "{ 2, 3, 4, 5, 6, 7, 11 }");
        EXPECT_EQ(log.count(VLN_INFO, "libcurl is not present. only file type URIScheme will be "
                                      "supported"),
                  !row.installed);
    }
    expect_counts(*agent, {{STORE_VLNMPCA_SoftwareInstallationService, 1},
                           {STORE_VLNMPCA_HostedInstallationService, 1},
                           {STORE_VLNMPCA_InstallServiceAffectsSystem, 1},
                           {STORE_VLNMPCA_InstallServiceConformsToProfile, 1},
                           {STORE_VLNMPCA_ElementCapabilities, 1}});
    const Instance* service = agent->store(STORE_VLNMPCA_SoftwareInstallationService).at(0);
    EXPECT_EQ(value_of(service, "Name"), "\"Vorlan MPCA Software Installation Service\"");
    EXPECT_EQ(value_of(service, "InstallDate"), "\"00000000000000.000000:000\"");
    EXPECT_EQ(value_of(service, "OperationalStatus"), "{ 2 }");
    EXPECT_EQ(
        value_of(agent->store(STORE_VLNMPCA_InstallServiceAffectsSystem).at(0), "ElementEffects"),
        "{ 5 }");
}

TEST_F(Software_Test, RecordLogsShowTheLogger) {
    load_nic();
    Loaded_Agent agent;
    Log_Capture log; // turns the logger on
    EXPECT_EQ(refreshes_started(*agent), 1);
    const auto& logs = agent->store(STORE_VLNMPCA_RecordLog);
    ASSERT_EQ(logs.size(), 2u);
    EXPECT_EQ(value_of(logs.at(0), "RequestedState"), "5");
    EXPECT_EQ(value_of(logs.at(0), "EnabledState"), "3");
    EXPECT_EQ(value_of(logs.at(0), "ElementName"), "\"Record logs for Vorlan CIM Provider\"");
    EXPECT_EQ(value_of(logs.at(1), "RequestedState"), "2");
    EXPECT_EQ(value_of(logs.at(1), "LogLevel"), "3");
    EXPECT_EQ(value_of(logs.at(1), "TracePath"), "\"host/tmp/nima2d.log\"");
    EXPECT_EQ(value_of(logs.at(1), "MaxNumberOfRecords"), "1024");
    CLogger::instance().clear_enabled();
    agent->m_bAdapterRefreshRequested = true;
    settle(*agent);
    agent->BuildCimpleInfo();
    settle(*agent);
    EXPECT_EQ(value_of(logs.at(0), "RequestedState"), "2");
    EXPECT_EQ(value_of(logs.at(0), "EnabledState"), "2");
    expect_counts(*agent, {{STORE_VLNMPCA_EnabledRecordLogCapabilities, 1},
                           {STORE_VLNMPCA_RecordLogCapabilities, 1},
                           {STORE_VLNMPCA_ProviderUseOfLog, 2},
                           {STORE_VLNMPCA_RecordLogConformsToProfile, 2}});
}

} // namespace cimple
