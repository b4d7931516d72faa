// The dump service and its settings, as a client calls them.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"
#include "tests/services/changes.h"

#include <fstream>

using host::Named_Values;
using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using services::Change;
using services::Fault;

namespace {

constexpr const char* PORT = "100002564C000000"; // works, beside one that has failed
constexpr const char* TESSEL_PORT = "100002564C010000";
constexpr const char* DOWN_PORT = "000002564C000101";
constexpr const char* DIRECTORY = "var/log/vorlan/dump";
constexpr const char* INVALID_PORT = "Invalid MPCA Target Port";
constexpr const char* NO_TARGET = "Invalid instance of VLNMPCA_DumpService/Target";

Value texts(std::initializer_list<const char*> values) {
    Value::Array elements;
    for (const char* value : values)
        elements.push_back(Value::text(value));
    return Value::array(CMPI_string, std::move(elements));
}

Value numbers(std::initializer_list<std::uint32_t> values) {
    Value::Array elements;
    for (const std::uint32_t value : values)
        elements.push_back(Value::unsigned_number(CMPI_uint32, value));
    return Value::array(CMPI_uint32, std::move(elements));
}

struct Row {
    const char* method;
    Named_Values inputs;
    std::uint64_t value;
    const char* line;
    Fault fault = {};
};

class Dump : public testing::Test {
protected:
    explicit Dump(bool log = true) : road({.scenario = "dead-port.json", .log = log}) {
        service = road.enumerate("VLNMPCA_DumpService").at(0).path;
        port = target("VLNMPCA_EthernetPort", PORT);
        fc_port = Value::reference(road.enumerate("VLNMPCA_FCPort").at(0).path);
        tessel_port = target("VLNMPCA_EthernetPort", TESSEL_PORT);
        down_port = target("VLNMPCA_DownEthernetPort", DOWN_PORT);
        chip = Value::reference(road.enumerate("VLNMPCA_Chip").at(0).path);
        host::ObjectPath absent = *port.as_reference();
        host::set(absent.keys, "DeviceID", Value::text("100002564CFFFFFF"));
        unknown_port = Value::reference(absent);
    }

    Value target(const char* class_name, const char* id) {
        return Value::reference(find(road, class_name, "DeviceID", id).path);
    }
    host::Reply<host::Method_Result> call(const char* method, const Named_Values& inputs) {
        return road.manager().invoke(service, method, inputs);
    }
    // Calls the method and looks for its line among what it logs.
    void expect(const Row& row) {
        if (row.fault.function)
            vlnsim_fault(row.fault.function, 1, VLNSIM_STATUS, row.fault.status);
        const std::size_t before = road.log_text().size();
        const auto reply = call(row.method, row.inputs);
        const std::string log = road.log_text().substr(before);
        EXPECT_TRUE(reply.ok()) << row.method << ": " << row.line;
        EXPECT_EQ(reply.value.value.as_unsigned(), row.value) << row.method << ": " << row.line;
        EXPECT_NE(log.find(row.line), std::string::npos) << row.method << ": " << row.line << log;
        vlnsim_clear_faults();
    }
    std::string listed(const Value& of) {
        const auto reply = call("GetDumpFileNames", {{"Target", of}});
        std::string names;
        for (const Value& name : host::find(reply.value.outputs, "DumpFiles")->as_array())
            names += (names.empty() ? "" : " ") + name.as_text();
        return names;
    }
    std::string core_dump_status(const char* id) {
        return text_of(find(road, "VLNMPCA_EthernetPort", "DeviceID", id), "CoreDumpStatus");
    }

    Road road;
    host::ObjectPath service;
    Value port, fc_port, tessel_port, down_port, chip, unknown_port;
};

TEST_F(Dump, EachAnswerHasItsLine) {
    const Value ram = Value::text("RAM"), error = Value::text("Error");
    const Row rows[] = {
        {"GenerateExtFATDump", {{"SSMode", ram}}, 33068, "VLNMPCA_DumpService/Target/SSMode"},
        {"GenerateExtFATDump", {{"Target", port}}, 33068, "VLNMPCA_DumpService/Target/SSMode"},
        {"GenerateExtFATDump",
         {{"Target", unknown_port}, {"SSMode", ram}},
         32968,
         "Invalid MPCA Target port"},
        {"GenerateExtFATDump",
         {{"Target", down_port}, {"SSMode", ram}},
         32968,
         "Invalid MPCA Target port"},
        {"GenerateExtFATDump",
         {{"Target", port}, {"SSMode", Value::text("disk")}},
         32968,
         "Invalid Mode passed, supported modes are ram and flash"},
        {"GenerateExtFATDump", {{"Target", port}, {"SSMode", ram}}, 0, "SSMode : RAM"},
        {"GenerateExtFATDump",
         {{"Target", fc_port}, {"SSMode", Value::text("flash")}},
         0,
         "ExtFATDump file generated successfully"},
        {"GenerateExtFATDump",
         {{"Target", tessel_port}, {"SSMode", ram}},
         0,
         "Tessel CNA : Setting iSnapShotMode = -1"},
        {"GenerateExtFATDump",
         {{"Target", port}, {"SSMode", ram}},
         190,
         "Failed to generate the ExtFATDump file",
         {"AX_GenerateEfdDump", 190}},
        {"GetDumpFileNames", {}, 33068, NO_TARGET},
        {"GetDumpFileNames", {{"Target", unknown_port}}, 32968, INVALID_PORT},
        {"GetDumpFileNames",
         {{"Target", port}},
         40190,
         "Failed to Get the DumpFileNames",
         {"AX_GetDumpFileNames", 190}},
        {"GetDumpFileNames", {{"Target", port}}, 0, "Filename[1] = VR10420117-00-0002.efd"},
        {"DeleteDumpFiles", {}, 33068, NO_TARGET},
        {"DeleteDumpFiles", {{"Target", unknown_port}}, 32968, INVALID_PORT},
        {"DeleteDumpFiles",
         {{"Target", port}},
         5,
         "Failed to delete the dump files",
         {"AX_DeleteDumpFiles", 5}},
        {"DeleteDumpFiles", {{"Target", port}}, 0, "ExtFATDump files deleted Succesfully"},
        {"SetAdvancedFATDumpTraceLevel",
         {{"Mode", texts({"ram"})}},
         5,
         "Invalid TraceLevel Passed"},
        {"SetAdvancedFATDumpTraceLevel",
         {{"TraceLevel", error}},
         5,
         "Modes are empty. Different Mode Supported are RAM|NVRAM|UART|TFTP."},
        {"SetAdvancedFATDumpTraceLevel",
         {{"TraceLevel", error}, {"Mode", texts({"ram"})}},
         33068,
         NO_TARGET},
        {"SetAdvancedFATDumpTraceLevel",
         {{"Target", unknown_port}, {"TraceLevel", error}, {"Mode", texts({"ram"})}},
         32968,
         INVALID_PORT},
        {"SetAdvancedFATDumpTraceLevel",
         {{"Target", port}, {"TraceLevel", Value::text("loud")}, {"Mode", texts({"x"})}},
         32968,
         "Invalid TraceLevel passed, supported TraceLevels are All|EnterFunction|"},
        {"SetAdvancedFATDumpTraceLevel",
         {{"Target", port}, {"TraceLevel", error}, {"Mode", texts({"ram", "disk"})}},
         5,
         "Invalid Mode, Supported Modes are ram|nvram|uart|tftp"},
        {"SetAdvancedFATDumpTraceLevel",
         {{"Target", port}, {"TraceLevel", error}, {"Mode", texts({"ram"})}},
         40190,
         "Failed to set the trace level for the adapter : 100002564C000000",
         {"AX_Set_DX_EventLogTraceLevel", 190}},
        {"RestoreAdvancedFATDumpSetting", {}, 33068, NO_TARGET},
        {"RestoreAdvancedFATDumpSetting", {{"Target", down_port}}, 32968, INVALID_PORT},
        {"RestoreAdvancedFATDumpSetting",
         {{"Target", port}},
         40190,
         "vlncimRestoreDefaultSettings exited with the error code 190",
         {"AX_Set_DX_DefaultLoggingConfig", 190}},
        {"RestoreAdvancedFATDumpSetting",
         {{"Target", port}},
         0,
         "Restored the ExtFATDump settings Succesfully"},
        {"RetrieveFATDump", {{"Target", unknown_port}}, 32968, INVALID_PORT},
        {"RetrieveFATDump", {{"Target", port}}, 0, "VLN_MethodWrapper::vlncimRetrieveFATDump"},
        {"RetrieveFATDump",
         {{"Target", port}},
         40001,
         "VLNMPCA_SoftwareInstallationService_Provider::RetrieveFATDump failed. "},
        {"RetrieveFATDump", {}, 0, "VLN_MethodWrapper::vlncimRetrieveFATDump"},
        {"GenerateCoreDump", {}, 33068, NO_TARGET},
        {"GenerateCoreDump", {{"Target", unknown_port}}, 32968, "Checking the Down EthernetPort"},
        {"GenerateCoreDump",
         {{"Target", port}},
         0,
         "GenerateCoreDump Inputs: Device Id: 100002564C000000, Options String: live "},
        {"GenerateCoreDump",
         {{"Target", down_port}, {"Options", Value::text("down")}},
         0,
         "CNA Generate core dump functionality completed for target 000002564C000101"},
        {"GenerateCoreDump",
         {{"Target", down_port}},
         40004,
         "Error - in the generating core dump status=4"},
        {"GenerateCoreDump",
         {{"Target", down_port}, {"Options", Value::text("down")}},
         40251,
         "Unable to determine if adapter supports core dump",
         {"AX_GetHBAFeature", 251}},
        {"GenerateCoreDump",
         {{"Target", down_port}, {"Options", Value::text("down")}},
         40001,
         "GetDeadNICPorts exited with the error code 190",
         {"AX_ListDeadNicPorts", 190}},
        {"GenerateCoreDump",
         {{"Target", port}, {"Options", Value::text(std::string(40, 'x'))}},
         40004,
         "Options String: xxxxxxxxxxxxxxxxxxxxxxxxxxxxxxx "},
    };
    for (const Row& row : rows)
        expect(row);
    EXPECT_EQ(core_dump_status(PORT), "40004") << "the first of that adapter alone";
    EXPECT_EQ(core_dump_status(TESSEL_PORT), "-");

    const host::ObjectPath known = service;
    host::set(service.keys, "Name", Value::text("other"));
    for (const char* method : {"GetDumpFileNames", "RetrieveFATDump"})
        expect({method, {{"Target", port}}, 33068, NO_TARGET});
    service = known;
}

// What is no port at all may get as far as the provider, or not.
TEST_F(Dump, ATargetOfAnotherClassIsNone) {
    for (const char* method : {"GetDumpFileNames", "DeleteDumpFiles", "GenerateCoreDump"}) {
        const auto reply = call(method, {{"Target", chip}});
        if (!reply.ok())
            continue;
        const std::uint64_t value = reply.value.value.as_unsigned();
        EXPECT_TRUE(value == 32968 || value == 33068) << method << ": " << value;
    }
}

TEST_F(Dump, FilesAreListedKeptAndDeleted) {
    const std::filesystem::path folder = road.root() / DIRECTORY;
    for (int i = 0; i < 4; ++i)
        call("GenerateExtFATDump", {{"Target", port}, {"SSMode", Value::text("ram")}});
    call("GenerateExtFATDump", {{"Target", tessel_port}, {"SSMode", Value::text("ram")}});
    std::ofstream(folder / "VR10420117-00-notes.log") << "kept to itself";
    const unsigned long calls = vlnsim_calls("AX_GetDumpFileNames");
    EXPECT_EQ(listed(port), "VR10420117-00-0001.efd VR10420117-00-0002.efd VR10420117-00-0003.efd "
                            "VR10420117-00-0004.efd");
    EXPECT_EQ(vlnsim_calls("AX_GetDumpFileNames"), calls + 2) << "five files need the second call";
    EXPECT_EQ(listed(tessel_port), "VR10420118-00-0001.fat");

    host::Instance data =
        find(road, "VLNMPCA_ExtFATDumpData", "DumpDirectory", std::string("/") + DIRECTORY);
    host::set(data.properties, "RetentionCount", Value::unsigned_number(CMPI_uint32, 3));
    EXPECT_TRUE(road.manager().modify(data, {{"RetentionCount"}}).ok());
    EXPECT_EQ(text_of(road.manager().get(data.path).value, "RetentionCount"), "3");
    call("GenerateCoreDump", {{"Target", down_port}, {"Options", Value::text("down")}});
    EXPECT_EQ(listed(fc_port), "VR10420117-00-0004.efd VR10420117-00-0005.core")
        << "the third is the file that is no dump";
    call("DeleteDumpFiles", {{"Target", port}});
    EXPECT_EQ(listed(port), "");
    EXPECT_EQ(listed(tessel_port), "VR10420118-00-0001.fat");
}

TEST_F(Dump, TraceLevelsAreSetForAllModulesAndReadBack) {
    const auto shown = [this](const char* module, const char* property) {
        const std::string id = "VLN:MPCA ExtFATDumpAdvancedData:VR10420117:00:";
        return text_of(find(road, "VLNMPCA_ExtFATDumpAdvancedData", "InstanceID", id + module),
                       property);
    };
    EXPECT_EQ(shown("scheduler", "Modes"), "{}");
    road.wait_for_refreshes(1);
    vlnsim_record_calls(1);
    const Named_Values inputs = {{"Target", fc_port},
                                 {"TraceLevel", Value::text("WARNING")},
                                 {"Mode", texts({"ram", "UART"})}};
    EXPECT_EQ(call("SetAdvancedFATDumpTraceLevel", inputs).value.value.as_unsigned(), 0u);
    char first[256] = "";
    vlnsim_recorded_call(0, first, sizeof first);
    EXPECT_STREQ(first, "AX_Set_DX_EventLogTraceLevel(100002564C000002, 8, 1, 1, 0, 0) = 0");
    vlnsim_record_calls(0);
    EXPECT_EQ(shown("scheduler", "Modes"), "{RAM, UART}");
    EXPECT_EQ(shown("fcoe", "TraceLevel"), "{warning, warning}");
    EXPECT_EQ(call("RestoreAdvancedFATDumpSetting", {{"Target", port}}).value.value.as_unsigned(),
              0u);
    EXPECT_EQ(shown("fcoe", "TraceLevel"), "{error, fatal}");

    // The other chip's settings stand when this one's cannot be read back.
    for (const char* function : {"AX_Get_DX_EventLogConfigDataAll", "AX_GetDumpRetentionCount"}) {
        vlnsim_fault(function, 1, VLNSIM_STATUS, 190);
        EXPECT_EQ(call("RestoreAdvancedFATDumpSetting", {{"Target", port}}).status.rc,
                  CMPI_RC_ERR_FAILED);
        EXPECT_EQ(road.enumerate("VLNMPCA_ExtFATDumpData").size(), 1u);
        call("RestoreAdvancedFATDumpSetting", {{"Target", port}});
        EXPECT_EQ(road.enumerate("VLNMPCA_ElementExtFATDumpAdvancedData").size(), 6u);
    }
    EXPECT_EQ(road.count_in_log("Failed to create the Enhanced FAT Dump Setting classes"), 2u);
    EXPECT_EQ(road.count_in_log("Failed to get the Retention Count"), 1u);
}

class Dump_Settings : public Dump {
protected:
    void expect_changes(const host::Instance& instance, std::initializer_list<Change> changes) {
        services::expect_changes(road, instance, changes);
    }
};

TEST_F(Dump_Settings, RetentionCountsAreFromOneToTwenty) {
    const auto count = [](std::uint32_t value) {
        return Named_Values{{"RetentionCount", Value::unsigned_number(CMPI_uint32, value)}};
    };
    const Value folder = Value::text("/tmp");
    const char* const range = "ERROR: RetentionCount value must be in-between 1 and 20";
    const host::Instance data = road.enumerate("VLNMPCA_ExtFATDumpData").at(0);
    expect_changes(
        data,
        {{count(0), CMPI_RC_ERR_NOT_FOUND, range},
         {count(21), CMPI_RC_ERR_NOT_FOUND, range},
         {count(1), CMPI_RC_OK, "Found Functional port for adapter : VR10420117:00"},
         {count(20), CMPI_RC_OK, "Input RetentionCount 20"},
         {count(2),
          CMPI_RC_ERR_NOT_FOUND,
          "Failed to set the Retention count",
          {"AX_SetDumpRetentionCount", 190}},
         {{}, CMPI_RC_ERR_FAILED, "Error: No Modifiable parameter specified"},
         {{{"DumpDirectory", folder}}, CMPI_RC_ERR_NOT_SUPPORTED, "Input DumpDirectory /tmp"},
         {{{"RetentionCount", Value::unsigned_number(CMPI_uint32, 4)}, {"DumpDirectory", folder}},
          CMPI_RC_ERR_NOT_SUPPORTED,
          "Setting DumpDirectory is not supported on this platform."}});
    expect_properties(road.manager().get(data.path).value,
                      {{"RetentionCount", "4"}, {"DumpDirectory", "/var/log/vorlan/dump"}});
    host::Instance other = data;
    host::set(other.path.keys, "InstanceID", Value::text("VLN:MPCA ExtFATDumpData:none"));
    host::set(other.properties, "InstanceID", Value::text("VLN:MPCA ExtFATDumpData:none"));
    EXPECT_EQ(road.manager().modify(other).rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(Dump_Settings, AModuleTracesWhatItIsToldInTheModesThatAreNamed) {
    const host::Instance data = find(road, "VLNMPCA_ExtFATDumpAdvancedData", "InstanceID",
                                     "VLN:MPCA ExtFATDumpAdvancedData:VR10420117:00:fcoe");
    const Value both = texts({"uart", "ram"}), uart = texts({"UART"});
    const char* const modes = "Invalid Modes passed, supported modes are ram and uart";
    const char* const mode = "Invalid Mode passed, supported modes are ram and uart";
    const char* const mismatch =
        "Invalid Input parameter, Parameters are not matching with the modes passed";
    const char* const failed =
        "Failed to modify the ExtFATAdvanced Settings for module : fcoe : adapter : VR10420117:00";
    expect_changes(
        data,
        {{{}, CMPI_RC_ERR_FAILED, modes},
         {{{"Modes", texts({"ram", "ram", "ram", "ram", "ram"})}}, CMPI_RC_ERR_FAILED, modes},
         {{{"Modes", texts({"ram", "nvram"})}}, CMPI_RC_ERR_FAILED, mode},
         {{{"Modes", both}, {"TraceLevel", texts({"error"})}}, CMPI_RC_ERR_FAILED, mismatch},
         {{{"Modes", uart}, {"PortMask", numbers({1, 2})}}, CMPI_RC_ERR_FAILED, mismatch},
         {{{"Modes", uart}, {"PCIFuncMask", numbers({})}}, CMPI_RC_ERR_FAILED, mismatch},
         {{{"Modes", uart}, {"TraceLevel", texts({"loud"})}},
          CMPI_RC_ERR_FAILED,
          "Invalid TraceLevel passed"},
         {{{"Modes", uart}},
          CMPI_RC_ERR_FAILED,
          failed,
          {"AX_Set_DX_EventLogConfigDataModule", 190}},
         {{{"Modes", uart}}, CMPI_RC_ERR_FAILED, failed, {"AX_Get_DX_EventLogConfigDataAll", 1}},
         {{{"Modes", both},
           {"TraceLevel", texts({"Info", "FATAL"})},
           {"PCIFuncMask", numbers({7, 6})}},
          CMPI_RC_OK,
          "Successfully modify the ExtFATAdvanced Settings for module : fcoe : adapter : "},
         {{{"Modes", uart}, {"PortMask", numbers({2})}}, CMPI_RC_OK, "Successfully modify"}});
    expect_properties(road.manager().get(data.path).value, {{"Modes", "{RAM, UART}"},
                                                            {"TraceLevel", "{fatal, info}"},
                                                            {"PortMask", "{3, 2}"},
                                                            {"PCIFuncMask", "{6, 7}"}});
}

TEST_F(Dump, WhatIsDownIsShownAndNotTakenForAChip) {
    expect_properties(road.enumerate("VLNMPCA_DownEthernetPort").at(0),
                      {{"DeviceID", DOWN_PORT},
                       {"OtherIdentifyingInfo", "{VR10420117, VMC-2210}"},
                       {"IdentifyingDescriptions", "{SerialNumber, ModelNumber}"}});
    for (const auto& link : road.enumerate("VLNMPCA_DumpServiceAffectsElement"))
        EXPECT_EQ(end_of(link, "AffectedElement", "Tag").substr(0, 6), "VR1042");
    expect_properties(road.enumerate("VLNMPCA_ExtFATDumpData").at(1),
                      {{"InstanceID", "VLN:MPCA ExtFATDumpData:VR10420118:00"},
                       {"RetentionCount", "10"},
                       {"MaxLogEntries", "4096"},
                       {"LogEntrySize", "64"},
                       {"LogType", "{RAM, UART}"}});
    EXPECT_EQ(road.count_in_log("Created DownEthernetPort. Buffer: 000002564C000101"), 1u);
    EXPECT_EQ(road.count_in_log("Creating dump service for DownEthernetPort "), 1u);
}

TEST(Dump_Host, PortsThatHaveFailedCannotBeAskedFor) {
    Road road({.scenario = "dead-port.json", .log = true});
    vlnsim_fault("AX_ListDeadNicPorts", 1, VLNSIM_STATUS, 190);
    EXPECT_EQ(road.enumerate("VLNMPCA_DumpService").size(), 1u);
    EXPECT_EQ(road.count_in_log("RetrieveDownNICPorts failed"), 1u);
    EXPECT_TRUE(road.enumerate("VLNMPCA_DownEthernetPort").empty());
}

// ---- Beside others ----

// The maps are built anew while the method waits: it has given up what the refresh needs.
TEST_F(Dump, AfterADumpThatWantsARebootTheMapsAreNew) {
    road.wait_for_refreshes(1);
    sudden_ends::hold("AX_GetAllLocalHBAInstances");
    std::thread client([&] {
        expect({"GenerateCoreDump", {{"Target", tessel_port}}, 0, "Please reboot"});
    });
    sudden_ends::wait_until_held();
    vlnsim_clear_faults();
    client.join();
    road.wait_for_refreshes(2); // whose end counts for the age of the data
    EXPECT_EQ(core_dump_status(TESSEL_PORT), "40247");
    vlnsim_advance(sudden_ends::STALE);
    core_dump_status(TESSEL_PORT); // starts the refresh, and may see it already
    road.wait_for_refreshes(3);
    EXPECT_EQ(core_dump_status(TESSEL_PORT), "-") << "it lives as long as the maps";
}

// The refresh that the method waits for ends early, with the class that started it.
TEST(Dump_Wait, OutlastsNoRefresh) {
    sudden_ends::Held_Road road(true);
    const auto service = road->enumerate("VLNMPCA_DumpService").at(0).path;
    const auto port = road->enumerate("VLNMPCA_EthernetPort").at(0).path;
    road->wait_for_refreshes(1);
    road.up_calls.start_refresh(road->manager(), "VLNMPCA_Card");
    EXPECT_EQ(vlnsim_fault("AX_GenerateCoreDump", 1, VLNSIM_STATUS, 247), 0);
    std::thread client([&] {
        const auto reply = road->manager().invoke(service, "GenerateCoreDump",
                                                  {{"Target", Value::reference(port)}});
        EXPECT_EQ(reply.value.value.as_unsigned(), 0u);
    });
    while (road->count_in_log("Constructing the maps ") == 0)
        std::this_thread::yield();
    std::thread letting_go([&] {
        while (road->count_in_log("PERF: Clearing the previous thread...with join") == 0)
            std::this_thread::yield();
        road.up_calls.let_go();
    });
    EXPECT_TRUE(road->manager().cleanup("VLNMPCA_Card", true).ok());
    client.join();
    letting_go.join();
    EXPECT_EQ(road->enumerate("VLNMPCA_Card").size(), 1u);
}

// A dump that takes long holds up who comes meanwhile, and nobody longer than that.
TEST_F(Dump, EnumerationsAndARefreshAnswerAfterALongDump) {
    sudden_ends::hold("AX_GenerateEfdDump");
    std::vector<std::thread> clients;
    for (int i = 0; i < 2; ++i)
        clients.emplace_back([&] {
            const auto reply =
                call("GenerateExtFATDump", {{"Target", port}, {"SSMode", Value::text("ram")}});
            EXPECT_EQ(reply.value.value.as_unsigned(), 0u);
        });
    sudden_ends::wait_until_held();
    vlnsim_advance(sudden_ends::STALE);
    for (const char* name : {"VLNMPCA_EthernetPort", "VLNMPCA_DumpService", "VLNMPCA_Chip",
                             "VLNMPCA_ExtFATDumpData", "VLNMPCA_DownEthernetPort"})
        clients.emplace_back([this, name] { EXPECT_GT(road.enumerate(name).size(), 0u) << name; });
    clients.emplace_back([&] {
        EXPECT_EQ(call("GenerateCoreDump", {{"Target", tessel_port}}).value.value.as_unsigned(),
                  0u);
    });
    sudden_ends::rest();
    vlnsim_clear_faults();
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(listed(port), "VR10420117-00-0001.efd VR10420117-00-0002.efd");
}

} // namespace
