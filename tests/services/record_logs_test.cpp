// The log of the provider itself, which a console sets and reads, and where it is from one load to
// the next: what else logs do is in tables/record_logs.txt.
#include "tests/road/properties.h"

#include <fstream>

using host::Named_Values;
using host::Value;
using road::expect_properties;
using road::Road;
using road::text_of;
using road::walk;

namespace {

namespace fs = std::filesystem;

constexpr const char* SETTINGS = "etc/vorlan_mpca_provider.dmp";
constexpr const char* FFDC = "opt/ibm/platform/log/vorlan_mpca_provider_ffdc.log";

Named_Values params(std::uint16_t level, std::uint16_t mode, const std::string& path = "") {
    return {{"LogLevel", Value::unsigned_number(CMPI_uint16, level)},
            {"LogMode", Value::unsigned_number(CMPI_uint16, mode)},
            {"TracePath", Value::text(path)}};
}

Named_Values state(std::uint16_t value) {
    return {{"RequestedState", Value::unsigned_number(CMPI_uint16, value)}};
}

class Record_Logs : public testing::Test {
protected:
    Record_Logs() {
        road.enumerate("VLNMPCA_RecordLog");
        road.wait_for_refreshes(1);
    }
    host::Instance log() { return road.enumerate("VLNMPCA_RecordLog").at(0); }
    std::uint64_t call(const char* method, const Named_Values& inputs = {}) {
        const auto reply = road.manager().invoke(log().path, method, inputs);
        EXPECT_TRUE(reply.ok()) << method;
        return reply.value.value.as_unsigned();
    }
    // RecordData of all entries, "|" behind each.
    std::string records() {
        std::string all;
        for (const host::Instance& record : road.enumerate("VLNMPCA_LogEntry"))
            all += text_of(record, "RecordData") + "|";
        return all;
    }

    Road road{{.scenario = "record-logs.json", .log = true}};
};

TEST_F(Record_Logs, TheProvidersRecordsAreThoseOfItsRing) {
    EXPECT_EQ(records(), "") << "the log goes to a file alone";
    EXPECT_EQ(call("SetLogParams", params(3, 1)), 0u);
    expect_properties(log(), {{"LogLevel", "3"}, {"LogMode", "1"}});
    call("SetLogParams", params(3, 7));
    // What a caller names is any text, and longer than a record; the last character fits not.
    call("SetLogParams", params(2, 1, "\xC3\xA4\xFF" + std::string(400, 'x')));
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
    EXPECT_EQ(walk(road, log(), "VLNMPCA_RecordLogManagesRecord").size(), 2u);
    EXPECT_EQ(call("ClearLog"), 0u);
    EXPECT_EQ(records(), "[Cleared all the logs]|");
}

// ---- From one load of the provider to the next ----

TEST_F(Record_Logs, WhatAConsoleSetsIsKept) {
    const std::string path = (road.root() / "chosen.log").string();
    EXPECT_EQ(call("SetLogParams", params(5, 4, "two\nlines")), 32968u);
    EXPECT_FALSE(fs::exists(road.root() / "two\nlines"));
    EXPECT_EQ(call("SetLogParams", params(4, 4, "chosen.log")), 0u);
    EXPECT_EQ(text_of(log(), "TracePath"), path) << "in the working folder";
    EXPECT_EQ(call("RequestStateChange", state(3)), 0u);
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
