// The service that installs firmware, as a client calls it.
#include "tests/operations/http_server.h"
#include "tests/road/properties.h"

#include <filesystem>
#include <fstream>
#include <thread>

using host::Value;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;

namespace {

constexpr const char* NIC_PORT = "100002564C000000";
constexpr const char* FCOE_PORT = "100002564C000001";
constexpr const char* VERSION = "10.4.255.3";

Value array(CMPIType type, std::initializer_list<std::uint64_t> numbers) {
    Value::Array elements;
    for (const std::uint64_t number : numbers)
        elements.push_back(Value::unsigned_number(type, number));
    return Value::array(type, std::move(elements));
}
Value options(std::initializer_list<std::uint64_t> numbers) {
    return array(CMPI_uint16, numbers);
}
Value texts(std::initializer_list<const char*> values) {
    Value::Array elements;
    for (const char* value : values)
        elements.push_back(Value::text(value));
    return Value::array(CMPI_string, std::move(elements));
}

std::string scenario(const std::string& values) {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [{"use": "cna", )" +
           values + R"("functions": [{"use": "nic"}, {"use": "fcoe"}]}]})";
}

class Installation : public testing::Test {
protected:
    explicit Installation(const std::string& values = "")
        : road({.scenario = scenario(values), .log = true}) {
        service = road.enumerate("VLNMPCA_SoftwareInstallationService").at(0).path;
        port = Value::reference(find(road, "VLNMPCA_EthernetPort", "DeviceID", NIC_PORT).path);
        fc_port = Value::reference(find(road, "VLNMPCA_FCPort", "DeviceID", FCOE_PORT).path);
        card = Value::reference(road.enumerate("VLNMPCA_Card").at(0).path);
        host::ObjectPath absent = *port.as_reference();
        host::set(absent.keys, "DeviceID", Value::text("100002564CFFFFFF"));
        unknown_port = Value::reference(absent);
        write("new.img", VERSION);
        road.wait_for_refreshes(1);
    }

    void write(const char* name, const char* version, const char* model = "VMC-2210") {
        char error[256] = "";
        ASSERT_EQ(vlnsim_write_firmware((road.root() / name).c_str(), model, version, 1000, error,
                                        sizeof error),
                  0)
            << error;
    }
    Value uri(const char* name) const { return Value::text((road.root() / name).string()); }
    Value bytes_of(const char* name) const {
        std::ifstream file(road.root() / name, std::ios::binary);
        Value::Array elements;
        for (char c = 0; file.get(c);)
            elements.push_back(Value::unsigned_number(CMPI_uint8, static_cast<unsigned char>(c)));
        return Value::array(CMPI_uint8, std::move(elements));
    }

    // Calls the method and expects its value, and each of the lines once among what it logs.
    host::Method_Result expect(std::uint64_t value, std::initializer_list<const char*> lines,
                               const char* method, const host::Named_Values& inputs) {
        const std::size_t before = road.log_text().size();
        auto reply = road.manager().invoke(service, method, inputs);
        EXPECT_TRUE(reply.ok()) << reply.status.message;
        const std::string log = road.log_text().substr(before);
        EXPECT_EQ(reply.value.value.as_unsigned(), value) << method << "\n" << log;
        for (const char* line : lines)
            EXPECT_NE(log.find(line), std::string::npos) << method << ": " << line << "\n" << log;
        const Value* job = host::find(reply.value.outputs, "Job");
        EXPECT_TRUE(!job || job->is_null());
        return std::move(reply.value);
    }
    void expect_faulty(const char* function, std::uint64_t status, std::uint64_t value,
                       std::initializer_list<const char*> lines, const char* method,
                       const host::Named_Values& inputs) {
        vlnsim_fault(function, 1, VLNSIM_STATUS, status);
        expect(value, lines, method, inputs);
        vlnsim_clear_faults();
    }

    std::string shown(const char* property) {
        return text_of(find(road, "VLNMPCA_EthernetPort", "DeviceID", NIC_PORT), property);
    }
    host::Instance firmware() {
        for (host::Instance& each : road.enumerate("VLNMPCA_SoftwareIdentity"))
            if (text_of(each, "Classifications") == "{10}")
                return std::move(each);
        ADD_FAILURE() << "no firmware";
        return {};
    }
    bool is_there(const char* name) const { return std::filesystem::exists(road.root() / name); }

    Road road;
    host::ObjectPath service;
    Value port, fc_port, card, unknown_port;
};

TEST_F(Installation, EachMethodWantsItsServiceAndItsPort) {
    const char* const methods[] = {"InstallFromURI", "InstallFromByteStream", "Reset",
                                   "SetPortEnabled", "SetSRIOVState",         "GetHBAFeatures"};
    const host::ObjectPath known = service;
    host::set(service.keys, "Name", Value::text("another"));
    for (const char* method : methods)
        expect(33068, {"Invalid instance of Software Installation Service"}, method,
               {{"Target", port}});
    service = known;
    constexpr const char* INVALID = "Invalid Port is passed";
    constexpr const char* UNKNOWN =
        "VLNMPCA_SoftwareInstallationService_Provider invalid port passed";
    const struct {
        const char* method;
        std::uint64_t value;
        const char* without; // a target
        const char* another; // that no port of the host is
    } rows[] = {
        {"InstallFromURI", 4097, "Target has a null pointer", UNKNOWN},
        {"InstallFromByteStream", 4097, "Target has a null pointer",
         "VLNMPCA_SoftwareInstallationService_Provider::Wrong DeviceID passed"},
        {"Reset", 32968, INVALID, UNKNOWN},
        {"SetPortEnabled", 32968, UNKNOWN, UNKNOWN},
        {"SetSRIOVState", 32968, "Target Port is NULL",
         "Invalid Port is passed, Cannot Enable/Disable SRIOV"},
        {"GetHBAFeatures", 32968, UNKNOWN, UNKNOWN},
    };
    for (const auto& row : rows) {
        expect(row.value, {row.without}, row.method, {});
        expect(32968, {row.another}, row.method, {{"Target", unknown_port}});
    }
    expect(32968, {INVALID}, "InstallFromURI", {{"Target", card}});
    expect(32968, {INVALID}, "InstallFromByteStream", {{"Target", card}});
    EXPECT_EQ(vlnsim_calls("AX_IsLocalHBA"), 0u);
}

TEST_F(Installation, WhatAnInstallationFromAUriRefuses) {
    expect(4097, {"Null sized URI..returning"}, "InstallFromURI", {{"Target", port}});
    for (const std::uint64_t option : {0, 1, 3, 8, 12, 32768})
        expect(
            5,
            {"size of InstallOptions array = 2, first member 2",
             "invalid value of Install options"},
            "InstallFromURI",
            {{"Target", port}, {"URI", uri("new.img")}, {"InstallOptions", options({2, option})}});
    write("other.img", VERSION, "VMC-9");
    std::ofstream(road.root() / "no.img") << "text";
    std::filesystem::copy_file(road.root() / "new.img", road.root() / "cut.img");
    std::filesystem::resize_file(road.root() / "cut.img", 1000);
    const struct {
        const char* file;
        std::uint64_t value;
        const char* line;
    } files[] = {{"no.img", 40141, "Status: <141>:The file is no firmware image"},
                 {"cut.img", 40142, "Status: <142>:The firmware image is damaged"},
                 {"other.img", 40143, "Status: <143>:The firmware image is for another model"},
                 {"", 40140, "Error - in the firmware download functionality status=140"}};
    for (const auto& row : files) {
        expect(row.value, {row.line}, "InstallFromURI", {{"Target", port}, {"URI", uri(row.file)}});
        EXPECT_EQ(shown("FWDownloadStatus"), std::to_string(row.value));
    }
    EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), 0u);
    expect_faulty("AX_IsLocalHBA", 1, 40001, {"HBA IS NOT LOCAL", "INVALID wwpn"}, "InstallFromURI",
                  {{"Target", port}, {"URI", uri("new.img")}});
    EXPECT_TRUE(is_there("cut.img") && is_there("new.img"));
}

TEST_F(Installation, AStatusOfTheDownloadIsPassedOnAndNothingIsTriedTwice) {
    const struct {
        std::uint64_t status;
        const char* line;
    } rows[] = {{148, "ERROR: AX_DownloadFirmware: Mailbox failed; Internal Driver Error."},
                {149, "ERROR: AX_DownloadFirmware: Mailbox timed out."},
                {150, "ERROR: AX_DownloadFirmware: Mailbox busy; retry."},
                {77, "ERROR: AX_DownloadFirmware: status = 77"}};
    unsigned long calls = 0;
    for (const auto& row : rows) {
        expect_faulty(
            "AX_DownloadFirmware", row.status, 40000 + row.status,
            {row.line, "Error - in the firmware download functionality status="}, "InstallFromURI",
            {{"Target", fc_port}, {"URI", uri("new.img")}, {"InstallOptions", options({2})}});
        EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), ++calls);
        EXPECT_EQ(text_of(find(road, "VLNMPCA_FCPort", "DeviceID", FCOE_PORT), "FWDownloadStatus"),
                  std::to_string(40000 + row.status));
    }
    EXPECT_EQ(vlnsim_calls("AX_ResetHBA"), 0u);
    EXPECT_EQ(shown("FWDownloadStatus"), "-");
}

TEST_F(Installation, NewFirmwareRunsAfterTheReset) {
    expect(0,
           {"CNA Firmware download functionality completed for target 100002564C000000",
            "vlncimDownloadFW: Removing the FW file from CIMOM's repository "},
           "InstallFromURI",
           {{"Target", port},
            {"URI", Value::text("file://" + (road.root() / "new.img").string())},
            {"InstallOptions", options({})}});
    EXPECT_EQ(shown("FWDownloadStatus"), "-");
    EXPECT_TRUE(is_there("new.img"));
    EXPECT_EQ(text_of(firmware(), "FirmwareOnFlash"), VERSION);
    EXPECT_EQ(text_of(firmware(), "VersionString"), "10.2.261.13");
    expect_faulty("AX_ResetHBA", 60, 40060, {"AX_ResetHBA returned with code 60"}, "Reset",
                  {{"Target", port}});
    expect(0,
           {"WWN 10:00:02:56:4C:00:00:01 is reset",
            "vlncimReset for target 100002564C000001 is Successful.. Updating the Provider Data"},
           "Reset", {{"Target", fc_port}});
    road.wait_for_refreshes(2);
    EXPECT_EQ(text_of(firmware(), "VersionString"), VERSION);
    EXPECT_EQ(text_of(firmware(), "InstanceID"), "VLN CNA:OperationalFirmware:v10.4.255.3 "
                                                 "VR10420117:00 UpdatedFirmware:v10.4.255.3");
}

TEST_F(Installation, OptionTwoResetsEachTimeThatItIsGiven) {
    const host::Named_Values inputs = {
        {"Target", port},
        {"URI", Value::text("file://localhost" + (road.root() / "new.img").string())},
        {"InstallOptions", options({2, 4, 2, 11})}};
    expect(0, {"Fiwmware download functionality complete with Reset on the HBA"}, "InstallFromURI",
           inputs);
    EXPECT_EQ(vlnsim_calls("AX_ResetHBA"), 2u);
    EXPECT_EQ(text_of(firmware(), "FirmwareOnFlash"), VERSION);
    expect_faulty("AX_ResetHBA", 60, 40060,
                  {"VLNMPCA_SoftwareInstallationService_Provider::vlncimResetHBA failed"},
                  "InstallFromURI", inputs);
    EXPECT_EQ(shown("FWDownloadStatus"), "-");
}

struct Rebooting : Installation {
    Rebooting() : Installation(R"("firmwareTakesEffect": "reboot", )") {}
};

TEST_F(Rebooting, TheRequestForARebootStandsWithThePort) {
    expect(0,
           {"CNA Firmware download completed for target 100002564C000000 Please reboot system "
            "to activate new firmware."},
           "InstallFromURI",
           {{"Target", port}, {"URI", uri("new.img")}, {"InstallOptions", options({2})}});
    EXPECT_EQ(vlnsim_calls("AX_ResetHBA"), 0u);
    EXPECT_EQ(shown("FWDownloadStatus"), "40247");
    EXPECT_EQ(text_of(firmware(), "FirmwareOnFlash"), VERSION);
    expect(0, {}, "Reset", {{"Target", port}});
    road.wait_for_refreshes(2);
    EXPECT_EQ(shown("FWDownloadStatus"), "-") << "a rebuild of the maps forgets it";
    EXPECT_EQ(text_of(firmware(), "VersionString"), "10.2.261.13");
    vlnsim_reboot();
    vlnsim_advance(11ull * 60 * 1000000);
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(3);
    EXPECT_EQ(text_of(firmware(), "VersionString"), VERSION);
}

TEST_F(Installation, AnImageOfBytesIsAFileAsLongAsTheCall) {
    const std::string name = (road.root() / "stream.img").string();
    const Value image = bytes_of("new.img");
    const Value named = texts({"", name.c_str()});
    constexpr const char* METHOD = "InstallFromByteStream";
    const struct {
        std::uint64_t value;
        const char* line;
        Value options, values;
    } rows[] = {
        {5,
         "InstallOptionsValues is empty. Should have the correct firmware file name. Returning "
         "Invalid Parameter",
         options({32768}), texts({})},
        {5, "invalid value of Install options", options({3, 32768}), named},
        {5, "InstallOptions does not have the value 32768", options({}), named},
        {5, "InstallOptions does not have the value 32768", options({2, 11}), named},
        {5, "InstallOptionsValues has no file name for the value 32768", options({32768, 2, 32768}),
         named},
        {4, "Could not open file to copy the firmware from ByteStream", options({32768}), named},
        {4, "Could not open file to copy the firmware from ByteStream", options({32768}),
         texts({"no/such/folder/stream.img"})},
        {4, "Could not open file to copy the firmware from ByteStream", options({32768}),
         texts({"/dev/full"})},
        {0, "CNA Firmware download functionality completed for target 100002564C000000",
         options({2, 32768}), named},
    };
    for (const auto& row : rows)
        expect(row.value, {row.line}, METHOD,
               {{"Target", port},
                {"Image", image},
                {"InstallOptions", row.options},
                {"InstallOptionsValues", row.values}});
    EXPECT_TRUE(std::filesystem::exists("/dev/full"));
    EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), 1u);
    EXPECT_EQ(vlnsim_calls("AX_ResetHBA"), 0u) << "even with option 2";
    EXPECT_EQ(text_of(firmware(), "FirmwareOnFlash"), "10.2.261.13") << "until the next refresh";
    EXPECT_FALSE(is_there("stream.img"));
    expect(40141, {"Error - in the firmware download functionality status=141"}, METHOD,
           {{"Target", port},
            {"Image", array(CMPI_uint8, {1, 2, 3})},
            {"InstallOptions", options({4, 32768})},
            {"InstallOptionsValues", named}});
    EXPECT_EQ(shown("FWDownloadStatus"), "-");
    EXPECT_FALSE(is_there("stream.img"));
}

// ---- From an address ----

// As the service tells it to consoles.
bool is_curl_there(Road& road) {
    return text_of(road.enumerate("VLNMPCA_SoftwareInstallationServiceCapabilities").at(0),
                   "SupportedURISchemes") == "{3, 4, 5, 6, 8}";
}

TEST_F(Installation, AnImageIsFetchedFromAnAddressAndRemovedWhenItIsInstalled) {
    if (sizeof(void*) == 4 && !is_curl_there(road))
        GTEST_SKIP() << "the machine has no libcurl of 32 bits (Debian: libcurl4:i386)";
    std::filesystem::create_directory(road.root() / "served");
    write("served/web.img", VERSION);
    const Http_Server server(road.root() / "served");
    const std::string &plain = server.plain(), &secure = server.secure();
    const struct {
        std::string uri;
        std::uint64_t value;
        const char* line;
        const char* left; // in the working folder
    } rows[] = {
        {plain + "/web.img", 0, "web.img removed successfully", nullptr},
        {secure + "/web.img", 0, "web.img removed successfully", nullptr},
        {plain + "/none.img", 40141, "Status: <141>:The file is no firmware image", "none.img"},
        {plain + "/cut.vfw", 4107, "ERROR: CURL returned with Error :18", "cut.vfw"},
        {"http://127.0.0.1:1/no.img", 4107, "ERROR: CURL returned with Error :7", "no.img"},
        {"http://[/bad.img", 4107, "ERROR: CURL returned with Error :3", "bad.img"},
        {"bare.img", 4107, "ERROR: vlncimDownloadFW: FW file not found", nullptr},
    };
    for (const auto& row : rows) {
        expect(row.value, {row.line}, "InstallFromURI",
               {{"Target", port}, {"URI", Value::text(row.uri)}});
        EXPECT_TRUE(!row.left || is_there(row.left)) << row.uri;
    }
    EXPECT_FALSE(is_there("web.img"));
    EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), 2u);
    EXPECT_EQ(text_of(firmware(), "FirmwareOnFlash"), VERSION);
}

TEST_F(Installation, WithoutLibcurlAnAddressCannotBeReached) {
    if (is_curl_there(road))
        GTEST_SKIP() << "there is a libcurl; the test services_without_libcurl hides it";
    EXPECT_EQ(
        road.count_in_log("libcurl is not present. only file type URIScheme will be supported"),
        1u);
    expect(4107,
           {"ERROR: Could not load the curl library to download from internet",
            "ERROR: vlncimDownloadFW: FW file not found"},
           "InstallFromURI",
           {{"Target", port}, {"URI", Value::text("http://127.0.0.1:1/new.img")}});
    expect(5, {"ERROR: vlncimDownloadFW: Can't stat FW file "}, "InstallFromURI",
           {{"Target", port}, {"URI", uri("new.img/of/no/folder")}});
}

// ---- Switches of a port ----

TEST_F(Installation, APortIsSwitchedOffAndOn) {
    const auto switch_port = [&](bool on, std::uint64_t value,
                                 std::initializer_list<const char*> lines) {
        return expect(value, lines, "SetPortEnabled",
                      {{"Target", port}, {"PortEnabled", Value::boolean(on)}});
    };
    expect(32968, {"Invalid Port is passed, Cannot Enable/Disable port"}, "SetPortEnabled",
           {{"Target", fc_port}, {"PortEnabled", Value::boolean(true)}});
    expect(32968, {"Invalid input for PortEnabled argument "}, "SetPortEnabled",
           {{"Target", port}});
    switch_port(false, 40221,
                {"SetPortEnabled::One or more port Functions have Boot Code enabled",
                 "Please disable boot Code and try again",
                 "Provider::SetPortEnabled failed for target 100002564C000000"});
    for (const char* wwn : {NIC_PORT, FCOE_PORT})
        set_value(wwn, "adapterAttributes", "BootCodeEnabled", "0");
    for (int turn = 0; turn < 2; ++turn) { // the second asks for all attributes
        const host::Method_Result result = switch_port(false, 0, {});
        const Value* config = host::find(result.outputs, "ConfigStatus");
        ASSERT_TRUE(config);
        EXPECT_EQ(config->as_unsigned(), 1u);
        EXPECT_EQ(shown("OperationalStatus") + shown("StatusDescriptions") + shown("EnabledState") +
                      shown("Speed") + shown("FunctionalPortSpeed"),
                  "{32790}{Disable}30Not Available");
        switch_port(true, 0, {});
        EXPECT_EQ(shown("OperationalStatus") + shown("EnabledState"), "{2}2");
        vlnsim_fault("AX_GetPortState", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    }
    vlnsim_fault("AX_GetPortAttributes", VLNSIM_EVERY, VLNSIM_STATUS, 1);
    switch_port(false, 0, {"Error occurred while retrieving NicPort status..."});
    EXPECT_EQ(shown("EnabledState"), "2");
}

struct Waiting : Installation {
    Waiting() : Installation(R"("portChangeTakesEffect": "reset", )") {}
};

TEST_F(Waiting, APortThatNeedsAReset) {
    for (const char* wwn : {NIC_PORT, FCOE_PORT})
        set_value(wwn, "adapterAttributes", "BootCodeEnabled", "0");
    const auto result =
        expect(0, {"Please reset the HBA to activate the new setting"}, "SetPortEnabled",
               {{"Target", port}, {"PortEnabled", Value::boolean(false)}});
    EXPECT_EQ(host::find(result.outputs, "ConfigStatus")->as_unsigned(), 5u);
    EXPECT_EQ(shown("StatusDescriptions"), "{Operational. Need RESET}");
    expect(0, {}, "Reset", {{"Target", port}});
    road.wait_for_refreshes(2);
    EXPECT_EQ(shown("StatusDescriptions"), "{Disable}");
}

struct Profiled : Installation {
    Profiled()
        : Installation(R"("multichannel": 2, "profiles": {"active": 5, "list": [
            {"id": 4, "name": "NIC"}, {"id": 5, "name": "nic - ets disabled"}]}, )") {}
};

TEST_F(Profiled, SriovAndWhatStandsInItsWay) {
    const auto sriov = [&](bool on, std::uint64_t value, const char* line) {
        expect(value, {line}, "SetSRIOVState",
               {{"Target", port}, {"EnableState", Value::boolean(on)}});
    };
    expect(32968, {"Invalid Port is passed, Cannot Enable/Disable SRIOV"}, "SetSRIOVState",
           {{"Target", fc_port}, {"EnableState", Value::boolean(true)}});
    expect(32968, {"Invalid input for EnableState argument "}, "SetSRIOVState", {{"Target", port}});
    const struct {
        const char* feature;
        const char* value;
        std::uint64_t result;
        const char* line;
    } features[] = {
        {"SRIOV", R"({"status": 190})", 40190,
         "Unable to determine if operating system supports SR-IOV."},
        {"SRIOV", "0", 40251,
         "SR-IOV not supported on this operating system. Operation disallowed."},
        {"SetSRIOV", R"({"status": 1})", 40001, " Unable to determine if SRIOV is settable"},
        {"SetSRIOV", "0", 40251,
         " SR-IOV not settable on this adapter or current adapter configuration. "},
        {"ProfileManagement", R"({"status": 190})", 40190,
         "unable to determine if adapter supports Profile Management."},
    };
    for (const auto& row : features) {
        set_value(NIC_PORT, "features", row.feature, row.value);
        sriov(true, row.result, row.line);
        set_value(NIC_PORT, "features", row.feature, "1");
    }
    sriov(true, 40004, " SRIOV cannot cannot be enabled if multichannel is enabled.");
    sriov(false, 40002,
          " NIC ETS Disabled profile must be deconfigured before SR-IOV can be disabled");
    vlnsim_fault("AX_ListProfiles", 1, VLNSIM_TOO_SMALL, 40);
    sriov(false, 40002, "must be deconfigured");
    vlnsim_fault("AX_ListProfiles", 1, VLNSIM_STATUS, 190);
    sriov(false, 40190, "AX_ListProfiles error: 190");
    vlnsim_fault("AX_GetAdapterPortConfig", 1, VLNSIM_STATUS, 60);
    sriov(true, 40060, "AX_GetAdapterPortConfig error: 60");
    set_value(NIC_PORT, "features", "ProfileManagement", "0");
    vlnsim_fault("AX_SetAdapterAttribute", 1, VLNSIM_STATUS, 60);
    sriov(true, 40060, " Operation failure. SRIOV State has not been set");
    EXPECT_NE(shown("SRIOVState"), "1");
    sriov(true, 0, "SetSRIOVState for target 100002564C000000 is Successful. Reboot Required ");
    EXPECT_EQ(shown("SRIOVState"), "1");
    vlnsim_advance(11ull * 60 * 1000000);
    road.enumerate("VLNMPCA_Card");
    road.wait_for_refreshes(2);
    EXPECT_EQ(road.count_in_log("_SRIOVState: [ 1 ]"), 1u) << "as the adapter tells it";
}

TEST_F(Installation, TheListOfFeatures) {
    const auto result =
        expect(0, {"VLN_MethodWrapper::Features: 480->0"}, "GetHBAFeatures", {{"Target", port}});
    const Value::Array& list = host::find(result.outputs, "Features")->as_array();
    ASSERT_EQ(list.size(), 512u);
    EXPECT_EQ(list[402].as_unsigned(), 1u) << "NIC";
    EXPECT_EQ(list[201].as_unsigned(), 0u) << "Tessel";
    expect_faulty("AX_GetHBAFeatureList", 60, 40060,
                  {"Failed to get the HBA List, exited with the error code 60"}, "GetHBAFeatures",
                  {{"Target", port}});
}

// ---- At once ----

// A download holds the data; whoever reads them, or installs as well, waits and gets its answer.
TEST_F(Installation, ReadersAndAnotherInstallationWaitForADownload) {
    vlnsim_fault("AX_DownloadFirmware", 1, VLNSIM_HOLD, 0);
    std::vector<std::thread> clients;
    const host::Named_Values inputs = {{"Target", port}, {"URI", uri("new.img")}};
    for (int i = 0; i < 2; ++i)
        clients.emplace_back([&] {
            const auto reply = road.manager().invoke(service, "InstallFromURI", inputs);
            EXPECT_TRUE(reply.ok() && reply.value.value.as_unsigned() == 0);
        });
    while (vlnsim_held() != 1)
        std::this_thread::yield();
    vlnsim_advance(11ull * 60 * 1000000);
    for (const char* name : {"VLNMPCA_EthernetPort", "VLNMPCA_Card", "VLNMPCA_SoftwareIdentity"})
        clients.emplace_back([this, name] {
            const auto reply = road.manager().enumerate(name);
            EXPECT_TRUE(reply.ok() && !reply.value.empty()) << name;
        });
    vlnsim_clear_faults();
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(vlnsim_calls("AX_DownloadFirmware"), 2u);
}

} // namespace
