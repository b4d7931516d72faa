// The logs that a console reads, sets, switches and empties.
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
using road::walk;
using services::Fault;
using services::number;

namespace {

namespace fs = std::filesystem;

constexpr const char* PROVIDER = "VLNMPCA:ProviderLog";
constexpr const char* NIMA = "VLN:MPCA NIMA Record Log";
constexpr const char* NIC = "VLN:MPCA NIC Driver Record Log";
constexpr const char* FC = "VLN:MPCA FC Driver Record Log";
constexpr const char* ISCSI = "VLN:MPCA ISCSI Driver Record Log";
constexpr const char* SETTINGS = "etc/vorlan_mpca_provider.dmp";
constexpr const char* FFDC = "opt/ibm/platform/log/vorlan_mpca_provider_ffdc.log";
constexpr std::uint64_t TIME_OUT = 10 * 60 * 1000000ull;

Named_Values params(std::uint16_t level, std::uint16_t mode, const std::string& path = "") {
    return {{"LogLevel", number(CMPI_uint16, level)},
            {"LogMode", number(CMPI_uint16, mode)},
            {"TracePath", Value::text(path)}};
}

Named_Values state(std::uint16_t value) {
    return {{"RequestedState", number(CMPI_uint16, value)}};
}

struct Row {
    const char* log; // the head of its identifier
    const char* method;
    Named_Values inputs;
    CMPIrc status;
    std::uint64_t value;
    const char* line;
    Fault fault = {};
};

class Record_Logs : public testing::Test {
protected:
    Record_Logs() {
        road.enumerate("VLNMPCA_RecordLog");
        road.wait_for_refreshes(1);
    }
    std::string id(const char* head) { return std::string(head) + ":simulated-host"; }
    host::Instance log(const char* head) {
        return find(road, "VLNMPCA_RecordLog", "InstanceID", id(head));
    }
    host::Reply<host::Method_Result> call(const char* head, const char* method,
                                          const Named_Values& inputs = {}) {
        const host::ObjectPath path = {
            "root/vorlan", "VLNMPCA_RecordLog", {{"InstanceID", Value::text(id(head))}}};
        return road.manager().invoke(path, method, inputs);
    }
    void expect_done(const char* head, const char* method, const Named_Values& inputs = {}) {
        const auto reply = call(head, method, inputs);
        EXPECT_TRUE(reply.ok() && reply.value.value.as_unsigned() == 0) << head << " " << method;
    }
    void expect(const Row& row) {
        if (row.fault.function)
            vlnsim_fault(row.fault.function, 1, VLNSIM_STATUS, row.fault.status);
        const std::size_t before = road.log_text().size();
        const auto reply = call(row.log, row.method, row.inputs);
        EXPECT_EQ(reply.status.rc, row.status) << row.method << ": " << row.line;
        EXPECT_EQ(reply.ok() ? reply.value.value.as_unsigned() : 0, row.value)
            << row.method << ": " << row.line;
        EXPECT_NE(road.log_text().find(row.line, before), std::string::npos)
            << row.method << ": " << row.line << road.log_text().substr(before);
        vlnsim_clear_faults();
    }
    // RecordData of all instances, "|" behind each.
    std::string records(const char* class_name) {
        std::string all;
        for (const host::Instance& record : road.enumerate(class_name))
            all += text_of(record, "RecordData") + "|";
        return all;
    }

    // The data are too old: has the next ones made.
    void refresh() {
        vlnsim_advance(TIME_OUT);
        road.enumerate("VLNMPCA_RecordLog");
        road.wait_for_refreshes(++refreshes);
    }

    Road road{{.scenario = "record-logs.json", .log = true}};
    std::size_t refreshes = 1;
};

TEST_F(Record_Logs, OneForEachDriverBesideTheProvidersAndTheLibrarys) {
    const struct {
        const char* head;
        const char* count;
        const char* user; // of the log; "" where nobody is told
        const char* parameters;
    } rows[] = {{PROVIDER, "-", "Vorlan CMPI MPCA Provider v10.2.261-13", "{2, 3}"},
                {NIMA, "-", "Vorlan CMPI MPCA Provider v10.2.261-13", ""},
                {NIC, "2", "VLN CNA: Driver vlnnet v", "-"},
                {FC, "2", "VLN FCoE: Driver vlnfcoe v", "-"},
                {ISCSI, "1", "VLN CNA: Driver vlniscsi v", "-"}};
    ASSERT_EQ(road.enumerate("VLNMPCA_RecordLog").size(), std::size(rows));
    for (const auto& row : rows) {
        const host::Instance found = log(row.head);
        expect_properties(found,
                          {{"CurrentNumberOfRecords", row.count}, {"MaxNumberOfRecords", "1024"}});
        const auto users = walk(road, found, "VLNMPCA_ProviderUseOfLog");
        ASSERT_EQ(users.size(), 1u) << row.head;
        EXPECT_TRUE(text_of(users[0], "InstanceID").starts_with(row.user)) << row.head;
        const auto capabilities = walk(road, found, "VLNMPCA_RecordLogCapabilities");
        ASSERT_EQ(capabilities.size(), *row.parameters ? 1u : 0u) << row.head;
        if (*row.parameters)
            expect_properties(capabilities[0], {{"LogParamsSupported", row.parameters},
                                                {"RequestedStatesSupported", "{2, 3}"}});
    }
    expect_properties(walk(road, log(FC), "VLNMPCA_RecordLogCapabilities").at(0),
                      {{"InstanceID", "VLN:MPCA FC Driver Record Log Capabilities"}});
    expect_properties(log(NIC), {{"Description", "Driver logs for MPCA Provider"}});
    road.close();
    for (const char* line : {"since it is not an MPCA NIC Adapter",
                             "Issue with MPCA Driver Log classes", "Missing Provider Software"})
        EXPECT_EQ(road.count_in_log(line), 0u) << line;
    const std::string text = road.log_text();
    for (const char* line :
         {"MPCA Driver Log classes are successfully created for NIC",
          "MPCA Driver Log classes are successfully created for FCoE-FC",
          "Skippping Adapter [Vorlan VMC-2210-00] since it is not an FCoE Adapter"})
        EXPECT_NE(text.find(line), std::string::npos) << line;
    std::size_t at = 0;
    for (const char* line :
         {"Reading Events for vfcd", "Reading Events for viscd", "Reading Events for vnicd",
          "Finished reading Events for vfcd", "Finished reading Events for viscd",
          "Finished reading Events for vnicd"})
        EXPECT_NE(at = text.find(line, at), std::string::npos) << line;
}

TEST_F(Record_Logs, TheDriversLinesAreRecordsNewestFirst) {
    const struct {
        const char* class_name;
        const char* association;
        const char* log;
        const char* first; // identifier and text of the newest one
        const char* line;
        std::size_t count;
    } rows[] = {{"VLNMPCA_NICDriverLogEntry", "VLNMPCA_NICDriverRecordLogManagesRecord", NIC,
                 "VLN:MPCA NIC Driver Record :0",
                 "May 13 16:53:07 simulated-host kernel: vnicd 10.2.261.13: vln1: link is down", 2},
                {"VLNMPCA_FCDriverLogEntry", "VLNMPCA_FCDriverRecordLogManagesRecord", FC,
                 "VLN:MPCA FC Driver Record :0",
                 "May 13 16:53:09 simulated-host kernel: vfcd: host 4: 100002564c000105: no light",
                 2},
                {"VLNMPCA_ISCSIDriverLogEntry", "VLNMPCA_ISCSIRecordLogManagesRecord", ISCSI,
                 "VLN:MPCA ISCSI Driver Record:0",
                 "May 13 16:52:58 simulated-host kernel: viscd: host 2: 100002564c000002: the name "
                 "server does not answer",
                 1}};
    for (const auto& row : rows) {
        const auto found = road.enumerate(row.class_name);
        ASSERT_EQ(found.size(), row.count) << row.class_name;
        expect_properties(found[0], {{"InstanceID", row.first},
                                     {"RecordData", row.line},
                                     {"RecordFormat", "[string record]"},
                                     {"LogInstanceID", id(row.log).c_str()}});
        const auto joined = walk(road, log(row.log), row.association);
        ASSERT_EQ(joined.size(), row.count) << row.association;
        EXPECT_EQ(joined[0], found[0]);
        EXPECT_EQ(walk(road, found[0], row.association).at(0), log(row.log));
    }
}

TEST_F(Record_Logs, ARefreshReadsWhatTheHostHasWrittenSince) {
    const std::string first = records("VLNMPCA_NICDriverLogEntry");
    ASSERT_EQ(vlnsim_log("vnicd: one more"), 0);
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), first);
    refresh();
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), "vnicd: one more|" + first);
    expect_done(NIC, "ClearLog");
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), "");
    EXPECT_TRUE(road.enumerate("VLNMPCA_NICDriverRecordLogManagesRecord").empty());
    EXPECT_EQ(text_of(log(NIC), "CurrentNumberOfRecords"), "0");
    refresh();
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), "vnicd: one more|" + first);
    // The host's log is rotated.
    fs::rename(road.root() / "var/log/messages", road.root() / "var/log/messages.1");
    vlnsim_log("vnicd: \xE4");
    refresh();
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), "vnicd: \xEF\xBF\xBD|");
    fs::remove(road.root() / "var/log/messages");
    refresh();
    EXPECT_EQ(records("VLNMPCA_NICDriverLogEntry"), "");
    EXPECT_EQ(road.count_in_log("Found FCoE-NIC Record Log Instance "), 1u);
}

TEST_F(Record_Logs, ADriversLogThatIsOffStaysAsItIs) {
    const std::string before = records("VLNMPCA_FCDriverLogEntry");
    expect_done(FC, "RequestStateChange", state(3));
    vlnsim_log("vfcd: unheard");
    refresh();
    EXPECT_EQ(records("VLNMPCA_FCDriverLogEntry"), before);
    expect_properties(log(FC), {{"EnabledState", "3"}, {"RequestedState", "3"}});
    expect_done(FC, "RequestStateChange", state(2));
    EXPECT_EQ(records("VLNMPCA_FCDriverLogEntry"), "vfcd: unheard|" + before);
    expect_properties(
        log(FC), {{"EnabledState", "2"}, {"RequestedState", "2"}, {"CurrentNumberOfRecords", "3"}});
    EXPECT_EQ(road.count_in_log("Log FCOE FC Driver Events "), 1u);
}

TEST_F(Record_Logs, EachAnswerHasItsLine) {
    constexpr CMPIrc OK = CMPI_RC_OK, UNSUPPORTED = CMPI_RC_ERR_NOT_SUPPORTED;
    const std::string root = road.root().string(), trace = root + "/var/log/provider-trace.log";
    const char* const nima = "Either Log level provided is out of range or Tracepath is set";
    const char* const no_path = "Setting the trace path failed";
    Named_Values without_level = params(1, 1);
    without_level.erase(without_level.begin());
    const Row rows[] = {
        {"no log", "SetLogParams", params(1, 1), OK, 33068, "Invalid instance of Record Log"},
        {"no log", "ClearLog", {}, OK, 33068, "Invalid instance of Record Log"},
        {"no log", "RequestStateChange", state(2), CMPI_RC_ERR_FAILED, 0,
         "Invalid instance of Record Log"},
        {NIC, "SetLogParams", params(9, 9), UNSUPPORTED, 0, "for Driver Record(MPCA-NIC) Log"},
        {FC, "SetLogParams", params(1, 1), UNSUPPORTED, 0, "for Driver Record(MPCA-FC) Log"},
        {ISCSI, "SetLogParams", params(1, 1), UNSUPPORTED, 0, "for Driver Record(MPCA-ISCSI) Log"},
        {NIMA, "SetLogParams", params(7, 1), OK, 32968, nima},
        {NIMA, "SetLogParams", params(1, 1, "x"), OK, 32968, nima},
        {NIMA, "SetLogParams", without_level, OK, 32968, nima},
        {NIMA,
         "SetLogParams",
         params(1, 1),
         OK,
         40190,
         "SetNIMATraceLevel exited with the error code 190",
         {"AX_SetDebugTraces", 190}},
        {NIMA, "SetLogParams", params(0, 0), OK, 0, "::SetNIMATraceLevel succesful"},
        {NIMA, "RequestStateChange", state(2), UNSUPPORTED, 0, "not supported for NIMA Log"},
        {NIC, "RequestStateChange", state(2), OK, 0, "Log FCOE NIC Driver Events "},
        {NIC, "RequestStateChange", state(4), CMPI_RC_ERR_FAILED, 0, "Invalid input"},
        {PROVIDER, "RequestStateChange", {}, CMPI_RC_ERR_FAILED, 0, "Invalid input"},
        {PROVIDER, "RequestStateChange", state(3), OK, 0, "Logs disabled"},
        {PROVIDER, "RequestStateChange", state(2), OK, 0, "Logs enabled"},
        {FC, "ClearLog", {}, OK, 0, "Found FCoE-FC Record Log Instance "},
        {ISCSI, "ClearLog", {}, OK, 0, "Found ISCSI Record Log Instance "},
        {PROVIDER, "SetLogParams", params(0, 1), OK, 32968, "Log level provided is out of range"},
        {PROVIDER, "SetLogParams", params(6, 1), OK, 32968, "Log level provided is out of range"},
        {PROVIDER, "SetLogParams", params(5, 0), OK, 32968, "Log mode provided is out of range"},
        {PROVIDER, "SetLogParams", params(5, 5), OK, 32968, "Log mode provided is out of range"},
        {PROVIDER, "SetLogParams", params(5, 2), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(5, 4, root), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(5, 4, "/dev/null"), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(5, 4, root + "/none/log"), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(5, 4, "two\nlines"), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(5, 4, std::string(256, 'x')), OK, 32968, no_path},
        {PROVIDER, "SetLogParams", params(4, 2, trace), OK, 0,
         "Changing the record log parameters 4-2-/"},
        {PROVIDER, "SetLogParams", params(5, 4, trace), OK, 0, "Setting path as /"},
    };
    for (const Row& row : rows)
        expect(row);
    EXPECT_FALSE(fs::exists(road.root() / "two\nlines"));
}

TEST_F(Record_Logs, LevelsOfTheLibraryAreItsOwn) {
    const std::uint32_t sent[] = {0, 2, 4, 3, 5, 6, 1, 99, 0};
    EXPECT_EQ(text_of(log(NIMA), "LogLevel"), "3");
    for (std::uint16_t level = 0; level < std::size(sent); ++level) {
        if (level == 7)
            continue;
        vlnsim_record_calls(1);
        expect_done(NIMA, "SetLogParams", params(level, 0));
        char line[256] = "";
        vlnsim_recorded_call(0, line, sizeof line);
        EXPECT_TRUE(std::string(line).starts_with("AX_SetDebugTraces(106, " +
                                                  std::to_string(sent[level]) + ")"))
            << line;
        vlnsim_record_calls(0);
        vlnsim_clear_calls();
        EXPECT_EQ(text_of(log(NIMA), "LogLevel"), std::to_string(level));
    }
    expect_done(NIMA, "SetLogParams", params(5, 0));
    refresh();
    expect_properties(log(NIMA), {{"LogLevel", "5"}});
}

TEST_F(Record_Logs, TheProvidersRecordsAreThoseOfItsRing) {
    EXPECT_EQ(records("VLNMPCA_LogEntry"), "") << "the log goes to a file alone";
    expect_done(PROVIDER, "SetLogParams", params(3, 1));
    expect_properties(log(PROVIDER), {{"LogLevel", "3"}, {"LogMode", "1"}});
    call(PROVIDER, "SetLogParams", params(3, 7));
    // What a caller names is any text, and longer than a record; the last character fits not.
    call(PROVIDER, "SetLogParams", params(2, 1, "\xC3\xA4\xFF" + std::string(400, 'x')));
    const auto found = road.enumerate("VLNMPCA_LogEntry");
    ASSERT_EQ(found.size(), 2u);
    expect_properties(found[0],
                      {{"InstanceID", "VLNMPCA:ProviderLog:0"},
                       {"LogInstanceID", "VLNMPCA:ProviderLog:simulated-host"},
                       {"RecordData", "[Log mode provided is out of range]"},
                       {"RecordFormat", "[string fileName][uint32 lineNumber]:[string record]"},
                       {"LogLevel", "VLN_ERR"}});
    expect_properties(found[1], {{"LogLevel", "VLN_CRIT"}});
    const std::string data = text_of(found[1], "RecordData");
    EXPECT_TRUE(data.starts_with("[Changing the record log parameters 2-1-\xC3\xA4\xEF\xBF\xBDxx"));
    EXPECT_EQ(data.size(), 199u);
    EXPECT_EQ(walk(road, log(PROVIDER), "VLNMPCA_RecordLogManagesRecord").size(), 2u);
    expect_done(PROVIDER, "ClearLog");
    EXPECT_EQ(records("VLNMPCA_LogEntry"), "[Cleared all the logs]|");
}

// ---- From one load of the provider to the next ----

TEST_F(Record_Logs, WhatAConsoleSetsIsKept) {
    const std::string path = (road.root() / "chosen.log").string();
    expect_done(PROVIDER, "SetLogParams", params(4, 4, "chosen.log"));
    EXPECT_EQ(text_of(log(PROVIDER), "TracePath"), path) << "in the working folder";
    expect_done(PROVIDER, "RequestStateChange", state(3));
    road.close();
    std::ifstream file(road.root() / SETTINGS);
    std::stringstream text;
    text << file.rdbuf();
    EXPECT_EQ(text.str(), "4,4,0\n" + path);
}

TEST(Record_Logs_First, ConsolesSettingTakesThePlaceOfTheDefaultLog) {
    Road road({.scenario = "record-logs.json"});
    const host::ObjectPath log = road.enumerate("VLNMPCA_RecordLog").at(0).path;
    ASSERT_FALSE(fs::exists(road.root() / SETTINGS));
    EXPECT_EQ(road.manager()
                  .invoke(log, "SetLogParams", params(5, 2, "chosen.log"))
                  .value.value.as_unsigned(),
              0u);
    const auto before = fs::file_size(road.root() / FFDC);
    road.enumerate("VLNMPCA_RecordLog");
    EXPECT_EQ(fs::file_size(road.root() / FFDC), before);
    EXPECT_GT(fs::file_size(road.root() / "chosen.log"), 0u);
    road.close();
    EXPECT_TRUE(fs::exists(road.root() / SETTINGS));
}

TEST(Record_Logs_First, WithoutAPathTheDefaultLogServes) {
    Road road({.scenario = "record-logs.json"});
    std::ofstream(road.root() / SETTINGS) << "0,5,0\n";
    const host::Instance log = road.enumerate("VLNMPCA_RecordLog").at(0);
    expect_properties(log, {{"TracePath", ""}, {"EnabledState", "2"}});
    EXPECT_TRUE(road.manager().invoke(log.path, "RequestStateChange", state(2)).ok());
    expect_properties(road.manager().get(log.path).value,
                      {{"EnabledState", "2"}, {"RequestedState", "2"}});
    EXPECT_EQ(road.manager().invoke(log.path, "ClearLog", {}).value.value.as_unsigned(), 0u);
    // A line of level 3 goes there.
    road.manager().invoke(log.path, "SetLogParams", params(0, 0));
    EXPECT_EQ(road.count_in_log("Log level provided is out of range"), 1u);
}

} // namespace
