// The catalogue of diagnostic tests as a client sees it: settings, help and logs.
#include "tests/road/properties.h"

#include <sstream>

using host::Named_Values;
using host::Value;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;

namespace {

constexpr const char* BEACON = "VLNMPCA: NIC LED(Beacon)Test";
constexpr const char* MAC_LOOPBACK = "VLNMPCA: NIC MAC LoopBackTest";
constexpr const char* PHY_LOOPBACK = "VLNMPCA: NIC PHY LoopBackTest";
constexpr const char* EXTERNAL_LOOPBACK = "VLNMPCA: External LoopBackTest";
constexpr const char* DMA_LOOPBACK = "VLNMPCA: NIC DMA LoopBackTest";
constexpr const char* ECHO = "VLNMPCA: FCOE EchoTest";
constexpr const char* CABLE = "VLNMPCA: PHY TDRTest";

// "NAME=VALUE NAME=VALUE": true or false, a number, the elements of LoopControlParameter, or a
// text.
Named_Values values_of(const std::string& text) {
    Named_Values values;
    std::istringstream words(text);
    for (std::string word; words >> word;) {
        const std::string name = word.substr(0, word.find('='));
        const std::string value = word.substr(name.size() + 1);
        if (name == "HaltOnError") {
            values.push_back({name, Value::boolean(value == "true")});
        } else if (name == "LoopControlParameter") {
            Value::Array elements;
            std::istringstream list(value);
            for (std::string element; std::getline(list, element, ',');)
                elements.push_back(Value::text(element));
            values.push_back({name, Value::array(CMPI_string, std::move(elements))});
        } else if (name == "LoopPattern" || name == "TargetDevice") {
            values.push_back({name, Value::text(value)});
        } else {
            values.push_back({name, Value::unsigned_number(CMPI_uint32, std::stoul(value))});
        }
    }
    return values;
}

class Diagnostics : public testing::Test {
protected:
    host::Instance setting(const char* test) {
        return find(road, "VLNMPCA_DiagnosticSettingData", "InstanceID", test);
    }
    // With the values set in the instance as well.
    host::Status modify(host::Instance& instance, const char* values) {
        std::vector<std::string> names;
        for (const host::Named_Value& each : values_of(values)) {
            host::set(instance.properties, each.name, each.value);
            names.push_back(each.name);
        }
        return road.manager().modify(instance, names);
    }
    // On the first Ethernet port.
    void run(const char* test) {
        const Value port = Value::reference(road.enumerate("VLNMPCA_EthernetPort").at(0).path);
        const auto reply =
            road.manager().invoke(find(road, "VLNMPCA_DiagnosticTest", "Name", test).path,
                                  "RunDiagnosticService", {{"ManagedElement", port}});
        EXPECT_TRUE(reply.ok() && reply.value.value.as_unsigned() == 0) << test;
    }
    // What the call logs.
    template <class Call>
    std::string logged(Call call) {
        const std::size_t before = road.log_text().size();
        call();
        return road.log_text().substr(before);
    }

    Road road{{.scenario = "diagnostics.json", .log = true}};
};

// ---- The catalogue ----

// The classes of the ports that the test can be run on, the two of each once.
std::string ports_of(Road& road, const host::Instance& test) {
    std::string names;
    const auto ports = walk(road, test, "VLNMPCA_AvailableDiagnosticService");
    for (std::size_t i = 0; i < ports.size(); i += 2)
        names += " " + ports[i].path.class_name.substr(8);
    EXPECT_EQ(ports, walk(road, test, "VLNMPCA_ServiceAffectsElement"));
    return names;
}

TEST_F(Diagnostics, EachTestTellsItsPortsAndItsSettings) {
    constexpr const char* LOOPS = "{HaltOnError, LoopPattern, LoopControlParameter}";
    constexpr const char* LOOP_VALUES = "{3} {10} 1a2b3c4d - FALSE 4000";
    const struct {
        const char* test;
        const char* ports;
        const char* settable;
        const char* values;            // of the properties below
        const char* setting = nullptr; // its name, if it is not the test's
    } rows[] = {
        {BEACON, " EthernetPort FCPort", "{HaltOnError, BeaconSetState}", "{0} {} N/A 3 TRUE -"},
        {MAC_LOOPBACK, " EthernetPort", LOOPS, LOOP_VALUES},
        {PHY_LOOPBACK, " EthernetPort", LOOPS, LOOP_VALUES},
        {EXTERNAL_LOOPBACK, " EthernetPort FCPort", LOOPS, LOOP_VALUES},
        {DMA_LOOPBACK, " EthernetPort", LOOPS, LOOP_VALUES},
        {ECHO, " FCPort",
         "{HaltOnError, TargetDevice, EchoMechanism, LUN, BufferSize, BufferPattern}",
         "{3} {10}  - TRUE -", "VLN: MPCA FCOE Echo test Setting"},
        {CABLE, " EthernetPort", "{HaltOnError}", "{0} {} N/A - TRUE -",
         "VLN: MPCA PHYTDR test Setting"},
    };
    const auto tests = road.enumerate("VLNMPCA_DiagnosticTest");
    ASSERT_EQ(tests.size(), std::size(rows));
    for (std::size_t i = 0; i < tests.size(); ++i) {
        const auto& row = rows[i];
        SCOPED_TRACE(row.test);
        const auto beside = [&](const char* via) { return walk(road, tests[i], via).at(0); };
        EXPECT_EQ(text_of(tests[i], "Name"), row.test);
        EXPECT_EQ(ports_of(road, tests[i]), row.ports);
        EXPECT_EQ(text_of(beside("VLNMPCA_DiagElementCapabilities"),
                          "OtherSupportedServiceModesDescriptions"),
                  row.settable);
        EXPECT_EQ(text_of(beside("VLNMPCA_UseOfLog"), "InstanceID"), row.test);
        const host::Instance set = beside("VLNMPCA_ElementSettingData");
        expect_properties(set, {{"InstanceID", row.test},
                                {"ElementName", row.setting ? row.setting : row.test},
                                {"LogOptions", "{2, 6, 9}"}});
        std::string values;
        for (const char* property : {"LoopControl", "LoopControlParameter", "LoopPattern",
                                     "BeaconSetState", "NonDestructive", "MaxLoopsSupported"})
            values += (values.empty() ? "" : " ") + text_of(set, property);
        EXPECT_EQ(values, row.values);
    }
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_DiagnosticIdentity").at(0), "VersionString"),
              "1.4.1");
    const std::string log = road.log_text();
    EXPECT_LT(log.find("Create the Diagnostic classes"), log.find("Updating FRU information"));
    EXPECT_EQ(road.count_in_log("Number of EthernetPort 2 FCoE port 2"), 1u);
    EXPECT_EQ(road.count_in_log("Total no of Diagnostic tests available: 7"), 1u);
}

// A port without a light or without the cable test is not offered what it cannot do.
TEST_F(Diagnostics, ATestIsOfferedWhereItCanBeRun) {
    vlnsim_fault("AX_DiagBeaconState", 0, VLNSIM_STATUS, 63);
    vlnsim_fault("AX_GetHBAFeature", 0, VLNSIM_STATUS, 1);
    const auto tests = road.enumerate("VLNMPCA_DiagnosticTest");
    vlnsim_clear_faults();
    EXPECT_EQ(tests.size(), 6u);
    EXPECT_EQ(ports_of(road, tests.at(0)), "");
    EXPECT_EQ(road.count_in_log("Beacon not avaialble for port : 100002564C000000"), 1u);
    EXPECT_EQ(road.count_in_log("TDR test feature is not supported for Port 100002564C000000"), 1u);
    EXPECT_EQ(road.count_in_log("Total no of Diagnostic tests available: 6"), 1u);
}

// ---- Settings ----

struct Change {
    const char* test;
    const char* values;
    const char* line = nullptr; // of the refusal
};

constexpr const char* LONG_LOOPS = "Error: loopControlParameter exceeds 4 characters";
constexpr const char* BAD_LOOPS = "Error: Invalid LoopControlData, Valid range 1-4000. ";
constexpr const char* LONG_PATTERN = "Error: loop pattern exceeds 8 characters";
constexpr const char* BAD_PATTERN = "Error: Invalid 'Pattern' used. Use hexadecimal characters. ";
constexpr const char* BAD_BEACON = "Invalid BeaconSetState, Valid values are 2 or 3";
constexpr const char* NOTHING = "Error: Invalid Input Parameter";

// With what is right beside what is wrong: nothing is written then.
constexpr Change CHANGES[] = {
    {MAC_LOOPBACK, "LoopControlParameter=4000"},
    {MAC_LOOPBACK, "LoopControlParameter=4001", BAD_LOOPS},
    {MAC_LOOPBACK, "LoopControlParameter=0", BAD_LOOPS},
    {MAC_LOOPBACK, "LoopControlParameter=12345", LONG_LOOPS},
    {MAC_LOOPBACK, "LoopControlParameter=1x", BAD_LOOPS},
    {MAC_LOOPBACK, "LoopControlParameter=,", BAD_LOOPS},
    {MAC_LOOPBACK, "LoopControlParameter=1,2", BAD_LOOPS},
    {PHY_LOOPBACK, "LoopControlParameter="}, // no element
    {MAC_LOOPBACK, "LoopPattern=abcDEF09"},
    {MAC_LOOPBACK, "LoopPattern=123456789", LONG_PATTERN},
    {MAC_LOOPBACK, "LoopPattern=0x1a", BAD_PATTERN},
    {EXTERNAL_LOOPBACK, "LoopPattern="},
    {DMA_LOOPBACK, "HaltOnError=false LoopPattern=ab LoopControlParameter=4001", BAD_LOOPS},
    {MAC_LOOPBACK, "BeaconSetState=2", NOTHING},
    {MAC_LOOPBACK, "HaltOnError=false"},
    {BEACON, "BeaconSetState=2"},
    {BEACON, "BeaconSetState=1 HaltOnError=false", BAD_BEACON},
    {BEACON, "BeaconSetState=4", BAD_BEACON},
    {BEACON, "LoopPattern=ab", NOTHING},
    {CABLE, "HaltOnError=false"},
    {CABLE, "LoopPattern=ab RetentionCount=3", NOTHING},
    {ECHO, "TargetDevice=502564C03B200001 LoopPattern=c0ffee LoopControlParameter=25"},
    {ECHO, "TargetDevice=502564C03B2000012", "Error: TargetDevice exceeds 16 characters"},
    {ECHO, "LoopPattern=123456789", "Error: Buffer pattern exceeds 8 characters"},
    {ECHO, "LoopPattern=tea", BAD_PATTERN},
    {ECHO, "LoopControlParameter=5000 HaltOnError=false", BAD_LOOPS},
    {ECHO, "MaxLoopsSupported=9", NOTHING},
};

TEST_F(Diagnostics, SettingsChangeAllTogetherOrNotAtAll) {
    // A console may send all that it got.
    for (const host::Instance& each : road.enumerate("VLNMPCA_DiagnosticSettingData"))
        EXPECT_TRUE(road.manager().modify(each).ok()) << text_of(each, "InstanceID");
    for (const Change& change : CHANGES) {
        SCOPED_TRACE(change.test + std::string(" ") + change.values);
        const host::Instance before = setting(change.test);
        host::Instance changed = before;
        host::Status status;
        const std::string log = logged([&] { status = modify(changed, change.values); });
        EXPECT_EQ(status.rc, change.line ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        EXPECT_EQ(setting(change.test), change.line ? before : changed);
        EXPECT_NE(log.find(change.line ? change.line : ""), std::string::npos) << log;
    }
    host::Instance unknown = setting(BEACON);
    host::set(unknown.path.keys, "InstanceID", Value::text("DumpDiagnostic"));
    host::set(unknown.properties, "InstanceID", Value::text("DumpDiagnostic"));
    EXPECT_EQ(modify(unknown, "HaltOnError=true").rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(road.count_in_log("Invalid instance of DiagnosticSetting Data"), 1u);
}

// ---- Help and logs ----

TEST_F(Diagnostics, HelpIsGivenAsText) {
    const auto ask = [](const char* document, std::uint16_t format, std::uint16_t delivery) {
        return Named_Values{{"RequestedDocument", Value::text(document)},
                            {"Format", Value::unsigned_number(CMPI_uint16, format)},
                            {"RequestedDelivery", Value::unsigned_number(CMPI_uint16, delivery)}};
    };
    const auto without = [&](std::size_t argument) {
        Named_Values values = ask(BEACON, 1, 1);
        values.erase(values.begin() + static_cast<std::ptrdiff_t>(argument));
        return values;
    };
    constexpr const char* MISSING = "Invalid Requested Document";
    constexpr const char* DELIVERY = "Unsupported Delivery options, Use '1' for proper support";
    const struct {
        const char* service;
        Named_Values inputs;
        std::uint64_t value;
        std::string told; // the help, or the line of the refusal
    } rows[] = {
        {BEACON, ask(BEACON, 1, 1), 0,
         "Sets the beacon state to either Off(3) or On(2) for the specified WWPN/MAC address"},
        {PHY_LOOPBACK, ask(PHY_LOOPBACK, 1, 1), 0,
         "Loopback test connects the MAC/PHY transmit output to the receive input."},
        {CABLE, ask(CABLE, 1, 1), 0, ""},
        {BEACON, ask(CABLE, 1, 1), 4, ""},
        {BEACON, ask(BEACON, 2, 1), 5, DELIVERY},
        {BEACON, ask(BEACON, 1, 2), 5, DELIVERY},
        {BEACON, without(0), 5, MISSING},
        {BEACON, without(1), 5, MISSING},
        {BEACON, without(2), 5, MISSING},
        {"none", ask(BEACON, 1, 1), 33068, "Invalid instance of Help Service"},
    };
    for (const auto& row : rows) {
        auto path = road.enumerate("VLNMPCA_HelpService").at(0).path;
        host::set(path.keys, "Name", Value::text(row.service));
        host::Reply<host::Method_Result> reply;
        std::string told =
            logged([&] { reply = road.manager().invoke(path, "GetHelp", row.inputs); });
        EXPECT_EQ(reply.value.value.as_unsigned(), row.value) << row.told;
        if (row.value == 0) {
            told = host::find(reply.value.outputs, "DocumentInfo")->as_text();
            EXPECT_EQ(told.empty(), row.told.empty());
            EXPECT_EQ(host::find(reply.value.outputs, "Format")->as_unsigned(), 1u);
        }
        EXPECT_NE(told.find(row.told), std::string::npos) << told;
    }
}

TEST_F(Diagnostics, AClearedLogLosesTheRecordsOfItsTestAlone) {
    for (const char* test : {BEACON, MAC_LOOPBACK, BEACON})
        run(test);
    const auto clear = [&](const char* test) {
        auto path = road.enumerate("VLNMPCA_DiagnosticsLog").at(0).path;
        host::set(path.keys, "InstanceID", Value::text(test));
        return road.manager().invoke(path, "ClearLog", {}).value.value.as_unsigned();
    };
    const auto left = [&] {
        std::string counts;
        for (const char* name :
             {"VLNMPCA_LogManagesRecord", "VLNMPCA_RecordAppliesToElement",
              "VLNMPCA_DiagnosticServiceRecord", "VLNMPCA_DiagnosticCompletionRecord"})
            counts += std::to_string(road.enumerate(name).size());
        return counts + " " + std::to_string(road.enumerate("VLNMPCA_ConcreteJob").size());
    };
    EXPECT_EQ(clear("none"), 33068u);
    EXPECT_EQ(clear(CABLE), 0u);
    EXPECT_EQ(left(), "3333 3");
    EXPECT_EQ(clear(BEACON), 0u);
    EXPECT_EQ(left(), "1111 3");
    EXPECT_EQ(text_of(road.enumerate("VLNMPCA_DiagnosticServiceRecord").at(0), "ServiceName"),
              MAC_LOOPBACK);
    EXPECT_EQ(road.count_in_log("vlncimNIC CDM Clear log"), 2u);
}

// What a console has changed, and what runs have left, goes with the next look at the hardware.
TEST_F(Diagnostics, ARefreshBeginsAnew) {
    host::Instance changed = setting(MAC_LOOPBACK);
    EXPECT_TRUE(modify(changed, "LoopPattern=0").ok());
    run(BEACON);
    EXPECT_EQ(road.enumerate("VLNMPCA_ConcreteJob").size(), 1u);
    road.wait_for_refreshes(1);
    vlnsim_advance(11ull * 60 * 1000000);
    road.enumerate("VLNMPCA_Card"); // asks for the refresh
    road.wait_for_refreshes(2);
    EXPECT_EQ(text_of(setting(MAC_LOOPBACK), "LoopPattern"), "1a2b3c4d");
    for (const char* name : {"VLNMPCA_ConcreteJob", "VLNMPCA_OwningJobElement",
                             "VLNMPCA_DiagnosticServiceRecord", "VLNMPCA_RecordAppliesToElement"})
        EXPECT_TRUE(road.enumerate(name).empty()) << name;
    EXPECT_EQ(road.count_in_log("Clearing the ConcreteJob objects related to CDM"), 2u);
}

} // namespace
