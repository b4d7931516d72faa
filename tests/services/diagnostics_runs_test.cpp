// Runs of the diagnostic tests: what each may come to, and what it leaves behind.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"

#include <fstream>
#include <sstream>

using host::Named_Values;
using host::Value;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;

namespace {

constexpr const char* BEACON = "VLNMPCA: NIC LED(Beacon)Test";
constexpr const char* MAC = "VLNMPCA: NIC MAC LoopBackTest";
constexpr const char* ECHO = "VLNMPCA: FCOE EchoTest";
constexpr const char* CABLE = "VLNMPCA: PHY TDRTest";
constexpr const char* NIC = "100002564C000000";
constexpr const char* FC = "100002564C000002";

// The words of the table.
const std::map<std::string, const char*> NAMES = {{"BEACON", BEACON},
                                                  {"MAC", MAC},
                                                  {"PHY", "VLNMPCA: NIC PHY LoopBackTest"},
                                                  {"DMA", "VLNMPCA: NIC DMA LoopBackTest"},
                                                  {"EXTERNAL", "VLNMPCA: External LoopBackTest"},
                                                  {"ECHO", ECHO},
                                                  {"CABLE", CABLE},
                                                  {"NIC", NIC},
                                                  {"FC", FC},
                                                  {"IDLE", "100002564C000101"}};

// The second port has no light, and is to get another name.
const std::string SCENARIO = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
    {"use": "cna", "adapterAttributes": {"DiagVersionNumber": 4},
     "features": {"CableDiagnostics": 1}, "diagnostics": {}, "ports": [{}, {"beacon": 1,
     "nameManagement": {"can": ["volatile", "reboot"], "volatile": {"wwnn": "2000024500000001"}}}],
     "functions": [{"use": "nic"},
                   {"use": "fcoe", "targets": {"wwpn": "50:25:64:C{port}:00:00:00:00"}}]}]})";

constexpr const char* RESULTS[] = {
    "Success",
    "General Error",
    "Link Down",
    "I/O Error",
    "Timeout",
    "Transmit Error",
    "Receive Error",
    "Mailbox Error",
    "Error: Echo test not supported",
    "Error: Echo Failed",
    "Error: Target Unreachable",
    "Error: HBA temperature exceeded operational range. Adapter stopped.\n\nPlease see the product "
    "documentation",
    "Error: Failed to allocate resource",
    "Error: Another diagnostic test is running. Please try again",
    "Error: Sequence Timeout",
    "Error: Bus reset received during test",
    "Error: Read-Write test is running",
    "Error: Driver busy. Please try again",
    "Error: Mailbox not ready",
    "Error: Port not ready",
    "Unknown",
};

std::vector<std::string> split(const std::string& text, const std::string& separator) {
    std::vector<std::string> pieces;
    std::size_t begin = 0;
    for (std::size_t end = 0; end != text.npos; begin = end + separator.size()) {
        end = text.find(separator, begin);
        pieces.push_back(text.substr(begin, end - begin));
    }
    return pieces;
}

// "name=value" to both.
std::pair<std::string, std::string> parts_of(const std::string& text, char sign) {
    const std::size_t at = text.find(sign);
    return {text.substr(0, at), at == text.npos ? "" : text.substr(at + 1)};
}

Value setting_value(const std::string& name, const std::string& text) {
    if (name == "HaltOnError")
        return Value::boolean(text != "0");
    if (name == "BeaconSetState")
        return Value::unsigned_number(CMPI_uint32, std::stoul(text));
    if (name != "LoopControlParameter")
        return Value::text(text);
    Value::Array loops;
    if (!text.empty())
        loops.push_back(Value::text(text));
    return Value::array(CMPI_string, std::move(loops));
}

// A run: what it meets, and what it comes to.
struct Row {
    std::string test, port;
    std::string given; // "TABLE.NAME=VALUE" of the host, "setting." of the test, "fault." once
    std::string value; // of the method
    std::string job;   // its state and percentage, and the completion state; "-": none
    std::string text;  // of the record and of a line of the log
    std::string more;  // "NAME=VALUE; ...", as expect_more has them
};

class Runs {
public:
    Runs() : road({.scenario = SCENARIO, .log = true}) {
        // The longest test is over before the picture of the host is too old, with which jobs go.
        std::ofstream(road.root() / "etc/vorlan_mpca_provider.conf")
            << "VLN_PROVIDER_CACHE_TIMEOUT = 30\n";
        for (const auto& link : road.enumerate("VLNMPCA_AvailableDiagnosticService")) {
            const host::ObjectPath& port = *link.property("UserOfService")->as_reference();
            ports[port.key("DeviceID")->as_text()] = Value::reference(port);
        }
        vlnsim_record_calls(1);
    }

    host::ObjectPath path_of(const std::string& test) {
        return find(road, "VLNMPCA_DiagnosticTest", "Name", test).path;
    }
    void change(const std::string& test, const std::string& name, const std::string& value) {
        host::Instance setting = find(road, "VLNMPCA_DiagnosticSettingData", "InstanceID", test);
        host::set(setting.properties, name, setting_value(name, value));
        EXPECT_TRUE(road.manager().modify(setting, {{name}}).ok());
    }
    host::Instance record_of(const std::string& job) {
        return find(road, "VLNMPCA_DiagnosticServiceRecord", "InstanceID", job + ":Service Record");
    }
    // The name of the run's job; empty without one.
    std::string run(const std::string& test, const std::string& port) {
        const auto reply = road.manager().invoke(path_of(test), "RunDiagnosticService",
                                                 {{"ManagedElement", ports[port]}});
        const Value* job = host::find(reply.value.outputs, "Job");
        result = reply.value.value.as_unsigned();
        return job && job->as_reference() ? job->as_reference()->key("InstanceID")->as_text() : "";
    }
    void meet(const Row& row) {
        for (const std::string& each : split(row.given, " ")) {
            const auto [what, value] = parts_of(each, '=');
            const auto [table, name] = parts_of(what, '.');
            if (table == "setting")
                change(row.test, name, value);
            else if (table == "fault")
                vlnsim_fault(name.c_str(), 1, VLNSIM_STATUS, std::stoul(value));
            else if (!table.empty())
                set_value(row.port.c_str(), table.c_str(), name.c_str(), value.c_str());
        }
    }
    void expect(const Row& row) {
        SCOPED_TRACE(row.test + " " + row.given + " " + row.text);
        meet(row);
        const std::string job = run(row.test, row.port);
        vlnsim_clear_faults();
        EXPECT_EQ(std::to_string(result), row.value);
        EXPECT_GE(road.count_in_log(row.text), 1u) << road.log_text();
        ASSERT_EQ(job.empty(), row.job == "-");
        const host::Instance record = job.empty() ? host::Instance() : record_of(job);
        if (!job.empty())
            expect_job(row, job, record);
        else
            EXPECT_EQ(road.enumerate("VLNMPCA_DiagnosticServiceRecord").size(), 0u);
        for (const std::string& each : split(row.more, "; "))
            if (!each.empty())
                expect_more(row, record, each);
    }
    void expect_job(const Row& row, const std::string& id, const host::Instance& record) {
        const host::Instance job = find(road, "VLNMPCA_ConcreteJob", "InstanceID", id);
        const host::Instance completion =
            find(road, "VLNMPCA_DiagnosticCompletionRecord", "InstanceID", id);
        EXPECT_EQ(text_of(job, "JobState") + " " + text_of(job, "PercentComplete") + " " +
                      text_of(completion, "CompletionState"),
                  row.job);
        EXPECT_EQ(text_of(job, "Name"), row.test);
        EXPECT_EQ(text_of(job, "wwpn"), row.port);
        EXPECT_EQ(id.find(row.test + ":"), 0u);
        EXPECT_EQ(id.substr(id.rfind(':')), row.test == BEACON ? ":65535" : ":1");
        EXPECT_EQ(text_of(completion, "ElementName"), row.test + " Completion Record");
        EXPECT_EQ(text_of(record, "RecordData"), row.text);
        EXPECT_EQ(text_of(record, "ServiceName"), row.test);
    }
    // A count of calls, a line of the log, a call, what a port shows, or a property of the record.
    void expect_more(const Row& row, const host::Instance& record, const std::string& what) {
        const auto [name, value] = parts_of(what, '=');
        if (name.starts_with("AX_"))
            EXPECT_EQ(std::to_string(vlnsim_calls(name.c_str())), value) << name;
        else if (name == "log")
            EXPECT_GE(road.count_in_log(value), 1u) << value;
        else if (name == "call")
            EXPECT_TRUE(is_recorded(value)) << value;
        else if (name == "light")
            EXPECT_EQ(text_of(find(road, ports[row.port].as_reference()->class_name, "DeviceID",
                                   row.port),
                              "LocationIndicator"),
                      value);
        else
            EXPECT_EQ(text_of(record, name), value) << name;
    }
    static bool is_recorded(const std::string& call) {
        char text[512] = "";
        for (std::size_t i = 0; vlnsim_recorded_call(i, text, sizeof text) == 0; ++i)
            if (text == call)
                return true;
        return false;
    }

    Road road;
    std::map<std::string, Value> ports;
    std::uint64_t result = 0;
};

// ---- Each outcome ----

std::string with_line_ends(std::string text) {
    for (std::size_t at = text.find("\\n"); at != text.npos; at = text.find("\\n"))
        text.replace(at, 2, "\n");
    return text;
}

TEST(Diagnostic_Runs, ComeToEachOfTheirEnds) {
    std::ifstream file(VLN_DIAGNOSTIC_RUNS);
    std::size_t count = 0;
    for (std::string line; std::getline(file, line); ++count) {
        std::vector<std::string> fields = split(line, "\t");
        fields.resize(7);
        Runs().expect({NAMES.at(fields[0]), NAMES.at(fields[1]), fields[2], fields[3], fields[4],
                       with_line_ends(fields[5]), fields[6]});
    }
    EXPECT_GT(count, 50u);
}

TEST(Diagnostic_Runs, ResultsHaveTheirWords) {
    Runs runs;
    const auto expect = [&](const char* test, const char* port, std::size_t code,
                            const std::string& head, const char* end) {
        set_value(port, "diagnostics", "result", std::to_string(code).c_str());
        const std::string job = runs.run(test, port);
        EXPECT_EQ(text_of(runs.record_of(job), "RecordData"), head + RESULTS[code] + end);
    };
    runs.change(ECHO, "TargetDevice", "502564C000000000");
    for (std::size_t code = 1; code < std::size(RESULTS); ++code) {
        expect(MAC, NIC, code, "Loopback - Result = ",
               ", cycles complete = 10; error cycles = 0; time taken to execute = 1000 ms");
        expect(ECHO, FC, code, "VLNMPCA: FCOE EchoTest Resulted with Failure, Result - ", " ");
        expect(CABLE, NIC, code, "VLNMPCA: PHY TDRTest - Result = ",
               ", cycles complete = 1; error cycles = 0; time taken to execute = 550 ms");
    }
}

TEST(Diagnostic_Runs, WhatCannotBeTestedIsRefused) {
    Runs runs;
    const auto refused = [&](const host::ObjectPath& test, const Named_Values& inputs,
                             const char* line) {
        const auto reply = runs.road.manager().invoke(test, "RunDiagnosticService", inputs);
        EXPECT_EQ(reply.value.value.as_unsigned(), 5u) << line;
        EXPECT_EQ(runs.road.count_in_log(line), 1u) << line;
    };
    const host::ObjectPath test = runs.path_of(MAC);
    host::ObjectPath unknown = test, stranger = *runs.ports[NIC].as_reference();
    host::set(unknown.keys, "Name", Value::text("DumpDiagnostic"));
    host::set(stranger.keys, "DeviceID", Value::text("100002564CFFFFFF"));
    refused(unknown, {{"ManagedElement", runs.ports[NIC]}},
            "Invalid instance of Run Diagnostic Service");
    refused(test, {}, "ManagedElement has a null pointer");
    refused(test, {{"ManagedElement", Value::reference(stranger)}},
            "Invalid ManagedElement EthernetPort|FCPort");
    const auto reply =
        runs.road.manager().invoke(test, "RunDiagnostic", {{"ManagedElement", runs.ports[NIC]}});
    EXPECT_EQ(reply.status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(runs.road.count_in_log("entering RunDiagnostic method"), 1u);
    EXPECT_EQ(runs.road.enumerate("VLNMPCA_ConcreteJob").size(), 0u);
}

// ---- What is left behind ----

TEST(Diagnostic_Runs, AFullLogLosesTheOldestRun) {
    constexpr std::size_t ROOM = 200;
    Runs runs;
    const std::string other = runs.run(MAC, NIC), first = runs.run(BEACON, NIC),
                      second = runs.run(BEACON, FC);
    for (std::size_t i = 2; i <= ROOM; ++i)
        runs.run(BEACON, NIC);
    for (const char* name :
         {"VLNMPCA_ConcreteJob", "VLNMPCA_OwningJobElement", "VLNMPCA_AffectedJobElement",
          "VLNMPCA_DiagnosticServiceRecord", "VLNMPCA_DiagnosticCompletionRecord",
          "VLNMPCA_LogManagesRecord", "VLNMPCA_RecordAppliesToElement"}) {
        const auto all = runs.road.enumerate(name);
        EXPECT_EQ(all.size(), ROOM + 1) << name;
        for (const auto& each : all)
            EXPECT_EQ(road::text_of(each, "InstanceID").find(first + ":"), std::string::npos);
    }
    for (const std::string& kept : {other, second})
        EXPECT_EQ(walk(runs.road, runs.record_of(kept), "VLNMPCA_LogManagesRecord").size(), 1u);
    const auto log = find(runs.road, "VLNMPCA_DiagnosticsLog", "InstanceID", BEACON);
    EXPECT_EQ(walk(runs.road, log, "VLNMPCA_LogManagesRecord").size(), ROOM);
}

// ---- Beside others ----

// Whoever comes while a test runs waits for its end, a refresh too, and then finds all as it was.
TEST(Diagnostic_Runs, ClientsAndARefreshWaitForATestAndNoLonger) {
    Runs runs;
    runs.road.wait_for_refreshes(1);
    sudden_ends::hold("AX_DiagGetResults");
    std::thread tester([&] {
        EXPECT_NE(runs.run(MAC, NIC), "");
        EXPECT_EQ(runs.result, 0u);
    });
    sudden_ends::wait_until_held();
    vlnsim_advance(3 * sudden_ends::STALE);
    std::vector<std::thread> clients;
    for (const char* name : {"VLNMPCA_EthernetPort", "VLNMPCA_DiagnosticsLog", "VLNMPCA_Chip",
                             "VLNMPCA_FCPort", "VLNMPCA_AvailableDiagnosticService"})
        clients.emplace_back(
            [&runs, name] { EXPECT_GT(runs.road.enumerate(name).size(), 0u) << name; });
    clients.emplace_back([&runs] { runs.road.enumerate("VLNMPCA_ConcreteJob"); });
    sudden_ends::rest();
    vlnsim_clear_faults();
    tester.join();
    for (std::thread& client : clients)
        client.join();
    runs.road.wait_for_refreshes(2);
    EXPECT_EQ(runs.road.enumerate("VLNMPCA_DiagnosticTest").size(), 7u);
    EXPECT_NE(runs.run(BEACON, NIC), "");
    EXPECT_EQ(runs.road.enumerate("VLNMPCA_DiagnosticServiceRecord").size(), 1u);
}

// A test whose class is unloaded ends soon, also on an adapter that does not let go of it, and its
// client gets its answer.
TEST(Diagnostic_Runs, AnUnloadCancelsTheTestThatRuns) {
    const struct {
        const char* cancel_status;
        unsigned long cancels;
    } rows[] = {{"0", 1}, {"190", 5}};
    for (const auto& row : rows) {
        Runs runs;
        runs.road.wait_for_refreshes(1);
        set_value(NIC, "diagnostics", "endless", "1");
        set_value(NIC, "diagnostics", "cancelStatus", row.cancel_status);
        sudden_ends::hold("AX_DiagGetResults");
        std::thread tester([&] {
            EXPECT_EQ(runs.run(MAC, NIC), "") << "a job would go with the agent";
            EXPECT_EQ(runs.result, 0u);
        });
        sudden_ends::wait_until_held();
        std::thread unloading([&] { EXPECT_TRUE(runs.road.manager().cleanup(true).ok()); });
        while (runs.road.count_in_log("VLNMPCA_DiagnosticTest_Provider::unload(): ending") == 0)
            std::this_thread::yield();
        vlnsim_clear_faults();
        tester.join();
        unloading.join();
        EXPECT_EQ(vlnsim_calls("AX_DiagCancelDiagnostic"), row.cancels);
        EXPECT_LT(vlnsim_calls("AX_DiagGetResults"), 10u);
        EXPECT_EQ(runs.road.enumerate("VLNMPCA_ConcreteJob").size(), 0u) << "of another agent";
        EXPECT_EQ(runs.road.enumerate("VLNMPCA_DiagnosticTest").size(), 7u);
    }
}

} // namespace
