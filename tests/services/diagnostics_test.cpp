// The catalogue of diagnostic tests as a client sees it: settings, help and logs.
#include "tests/road/properties.h"

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

// One NIC and one FCoE function; the NIC's port has a copper PHY with cable diagnostics.
const std::string COPPER = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards":
    [{"use": "cna", "functions": [{"use": "nic", "features": {"CableDiagnostics": 1}},
                                  {"use": "fcoe"}]}]})";

Value loops(std::initializer_list<const char*> values) {
    Value::Array elements;
    for (const char* value : values)
        elements.push_back(Value::text(value));
    return Value::array(CMPI_string, std::move(elements));
}

Value number(std::uint32_t value) {
    return Value::unsigned_number(CMPI_uint32, value);
}

class Diagnostics : public testing::Test {
protected:
    host::Instance setting(const char* test) {
        return find(road, "VLNMPCA_DiagnosticSettingData", "InstanceID", test);
    }
    // What the call logs.
    template <class Call>
    std::string logged(Call call) {
        const std::size_t before = road.log_text().size();
        call();
        return road.log_text().substr(before);
    }

    Road road{{.scenario = COPPER, .log = true}};
};

// ---- The catalogue ----

// The names of the port classes that the test can be run on.
std::string ports_of(Road& road, const host::Instance& test) {
    std::string names;
    for (const auto& port : walk(road, test, "VLNMPCA_AvailableDiagnosticService"))
        names += " " + port.path.class_name.substr(8);
    EXPECT_EQ(walk(road, test, "VLNMPCA_AvailableDiagnosticService"),
              walk(road, test, "VLNMPCA_ServiceAffectsElement"));
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
              "1.2.1");
    EXPECT_EQ(road.count_in_log("Number of EthernetPort 1 FCoE port 1"), 1u);
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
    Named_Values values;
    const char* line = nullptr; // of the refusal
};

constexpr const char* LONG_LOOPS = "Error: loopControlParameter exceeds 4 characters";
constexpr const char* BAD_LOOPS = "Error: Invalid LoopControlData, Valid range 1-4000. ";
constexpr const char* BAD_PATTERN = "Error: Invalid 'Pattern' used. Use hexadecimal characters. ";
constexpr const char* BAD_BEACON = "Invalid BeaconSetState, Valid values are 2 or 3";
constexpr const char* NOTHING = "Error: Invalid Input Parameter";

TEST_F(Diagnostics, SettingsChangeAllTogetherOrNotAtAll) {
    const Value off = Value::boolean(false);
    const Value good = Value::text("abcDEF09");
    const Change changes[] = {
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"4000"})}}},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"4001"})}}, BAD_LOOPS},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"0"})}}, BAD_LOOPS},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"12345"})}}, LONG_LOOPS},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"1x"})}}, BAD_LOOPS},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({""})}}, BAD_LOOPS},
        {MAC_LOOPBACK, {{"LoopControlParameter", loops({"1", "2"})}}, BAD_LOOPS},
        {PHY_LOOPBACK, {{"LoopControlParameter", loops({})}}},
        {MAC_LOOPBACK, {{"LoopPattern", good}}},
        {MAC_LOOPBACK,
         {{"LoopPattern", Value::text("123456789")}},
         "Error: loop pattern exceeds 8 characters"},
        {MAC_LOOPBACK, {{"LoopPattern", Value::text("0x1a")}}, BAD_PATTERN},
        {EXTERNAL_LOOPBACK, {{"LoopPattern", Value::text("")}}},
        // What is right beside what is wrong is not written.
        {DMA_LOOPBACK,
         {{"HaltOnError", off}, {"LoopPattern", good}, {"LoopControlParameter", loops({"4001"})}},
         BAD_LOOPS},
        {MAC_LOOPBACK, {{"BeaconSetState", number(2)}}, NOTHING},
        {MAC_LOOPBACK, {{"HaltOnError", off}, {"TargetDevice", Value::text("ignored")}}},
        {BEACON, {{"BeaconSetState", number(2)}}},
        {BEACON, {{"BeaconSetState", number(1)}, {"HaltOnError", off}}, BAD_BEACON},
        {BEACON, {{"BeaconSetState", number(4)}}, BAD_BEACON},
        {BEACON, {{"LoopPattern", good}}, NOTHING},
        {CABLE, {{"HaltOnError", off}}},
        {CABLE, {{"LoopPattern", good}, {"RetentionCount", number(3)}}, NOTHING},
        {ECHO,
         {{"TargetDevice", Value::text("502564C03B200001")},
          {"LoopPattern", Value::text("c0ffee")},
          {"LoopControlParameter", loops({"25"})}}},
        {ECHO,
         {{"TargetDevice", Value::text("502564C03B2000012")}},
         "Error: TargetDevice exceeds 16 characters"},
        {ECHO,
         {{"LoopPattern", Value::text("123456789")}},
         "Error: Buffer pattern exceeds 8 characters"},
        {ECHO, {{"LoopPattern", Value::text("tea")}}, BAD_PATTERN},
        {ECHO, {{"LoopControlParameter", loops({"5000"})}}, BAD_LOOPS},
        {ECHO, {{"MaxLoopsSupported", number(9)}}, NOTHING},
    };
    for (const Change& change : changes) {
        const host::Instance before = setting(change.test);
        host::Instance changed = before;
        std::vector<std::string> names;
        std::string trace = change.test;
        for (const host::Named_Value& each : change.values) {
            host::set(changed.properties, each.name, each.value);
            names.push_back(each.name);
            trace += " " + each.name + "=" + text_of(changed, each.name);
        }
        SCOPED_TRACE(trace);
        host::Status status;
        const std::string log = logged([&] { status = road.manager().modify(changed, names); });
        EXPECT_EQ(status.rc, change.line ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        if (change.line) {
            EXPECT_NE(log.find(change.line), std::string::npos) << log;
            EXPECT_EQ(setting(change.test), before);
        } else {
            host::set(changed.properties, "TargetDevice",
                      *(change.test == ECHO ? changed : before).property("TargetDevice"));
            EXPECT_EQ(setting(change.test), changed);
        }
    }
}

TEST_F(Diagnostics, AnUnknownSettingIsNotFound) {
    host::Instance unknown = setting(BEACON);
    host::set(unknown.path.keys, "InstanceID", Value::text("DumpDiagnostic"));
    host::set(unknown.properties, "InstanceID", Value::text("DumpDiagnostic"));
    EXPECT_EQ(road.manager().modify(unknown).rc, CMPI_RC_ERR_NOT_FOUND);
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

} // namespace
