// FIP settings as a client reads and modifies them.
#include "tests/road/properties.h"

using host::Named_Values;
using host::Value;
using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;
using road::walk;

namespace {

constexpr const char* PORT = "100002564C000001"; // prefers a fabric, and has found 10 forwarders
constexpr const char* OTHER_PORT = "100002564C010000";
constexpr const char* FABRIC = "10:00:02:56:4C:FA:B0:01";

struct Fault {
    const char* function = nullptr;
    unsigned call = 1;
};

struct Change {
    Named_Values values;
    CMPIrc status;
    const char* line;
    Fault fault = {}; // answers 190
};

class Fip : public testing::Test {
protected:
    Fip() : road({.scenario = "fcoe-pair.json", .log = true}) {
        data = shown(PORT);
        road.wait_for_refreshes(1);
    }

    host::Instance shown(const char* port) {
        return find(road, "VLNMPCA_FIPData", "ElementName", port);
    }
    static Named_Values text(const char* name, const char* value) {
        return {{name, Value::text(value)}};
    }
    static Named_Values texts(const char* name, std::initializer_list<const char*> values) {
        Value::Array elements;
        for (const char* value : values)
            elements.push_back(Value::text(value));
        return {{name, Value::array(CMPI_string, std::move(elements))}};
    }
    static Named_Values cin(std::uint32_t value) {
        return {{"CinVlanID", Value::unsigned_number(CMPI_uint32, value)}};
    }

    CMPIrc modify(const Named_Values& values) {
        host::Instance changed = data;
        std::vector<std::string> names;
        for (const host::Named_Value& each : values) {
            host::set(changed.properties, each.name, each.value);
            names.push_back(each.name);
        }
        return road.manager().modify(changed, names).rc;
    }
    void expect(const Change& change) {
        if (change.fault.function)
            vlnsim_fault(change.fault.function, change.fault.call, VLNSIM_STATUS, 190);
        const std::size_t before = road.log_text().size();
        EXPECT_EQ(modify(change.values), change.status) << change.line;
        const std::string log = road.log_text().substr(before);
        EXPECT_NE(log.find(change.line), std::string::npos) << change.line << "\n" << log;
        vlnsim_clear_faults();
    }

    Road road;
    host::Instance data;
};

TEST_F(Fip, EachPortHasItsSettingAndItsForwarders) {
    expect_properties(data, {{"InstanceID", "VLNMPCA_FIPData::100002564C000001"},
                             {"PrimaryFabricName", "{10:00:02:56:4C:FA:B0:01}"},
                             {"PrimarySwitchName", "{20:00:02:56:4C:FA:B0:01}"},
                             {"VlanID", "{1002}"},
                             {"FCMap", "0x0EFC00"},
                             {"CinVlanID", "1"}});
    EXPECT_EQ(vlnsim_calls("AX_CNA_FCOE_GetFcfList"), 2u + 1u) << "ten need the second call";
    const auto service = road.enumerate("VLNMPCA_FIPService").at(0);
    EXPECT_EQ(walk(road, service, "VLNMPCA_ElementFIPFCFData").size(), 11u);
    EXPECT_EQ(walk(road, service, "VLNMPCA_ElementFIPData").size(), 2u);
    EXPECT_EQ(walk(road, service, "VLNMPCA_FIPServiceAffectsElement").size(), 2u);
    expect_properties(
        find(road, "VLNMPCA_FIPFCFData", "InstanceID", "VLNMPCA_FIPFCFData::100002564C000001::0"),
        {{"EntryID", "1"},
         {"ActiveFCFs", "2"},
         {"State", "1"},
         {"Priority", "1"},
         {"PrimaryFabricName", FABRIC},
         {"PrimarySwitchName", "20:00:02:56:4C:FA:B0:01"},
         {"Mac", "02:56:4C:FA:B0:01"},
         {"FCMap", "0x0EFC00"},
         {"VlanID", "{1002, 1003}"},
         {"Period", "8000"}});
    expect_properties(
        find(road, "VLNMPCA_FIPFCFData", "InstanceID", "VLNMPCA_FIPFCFData::100002564C000001::9"),
        {{"EntryID", "10"}, {"VlanID", "{}"}, {"FCMap", "0x0EFC01"}});
    EXPECT_EQ(road.count_in_log("FCoE FIP classes are successfully created"), 1u);
}

TEST_F(Fip, EachRefusalHasItsLineAndChangesNothing) {
    const char* const form = "pfabric value must be in the format XX:XX:XX:XX:XX:XX:XX:XX";
    const char* const range = "VLAN ID value must be between 0 and 4095";
    const Change rows[] = {
        {{}, CMPI_RC_ERR_INVALID_PARAMETER, "Error: No parameter specified"},
        {texts("PrimaryFabricName", {"100002564CFAB001"}), CMPI_RC_ERR_INVALID_PARAMETER, form},
        {texts("PrimaryFabricName", {"30:00:02:56:4C:FA:B0:01"}), CMPI_RC_ERR_INVALID_PARAMETER,
         "Invalid World Wide Port Name entered for primary fabric name"},
        {texts("PrimarySwitchName", {"x"}), CMPI_RC_ERR_INVALID_PARAMETER, form},
        {texts("PrimarySwitchName", {"00:00:02:56:4C:FA:B0:01"}), CMPI_RC_ERR_INVALID_PARAMETER,
         "Invalid World Wide Port Name entered for switch fabric name"},
        {texts("VlanID", {"12x"}), CMPI_RC_ERR_INVALID_PARAMETER, "Invalid VLAN ID value"},
        {texts("VlanID", {" "}), CMPI_RC_ERR_INVALID_PARAMETER, "Invalid VLAN ID value"},
        {texts("VlanID", {"4096"}), CMPI_RC_ERR_INVALID_PARAMETER, range},
        {texts("VlanID", {"-1"}), CMPI_RC_ERR_INVALID_PARAMETER, range},
        {texts("VlanID", {"0x1000000000000000000000"}), CMPI_RC_ERR_INVALID_PARAMETER, range},
        {text("FCMap", "0EFC00"), CMPI_RC_ERR_INVALID_PARAMETER, "Invalid fcmap value"},
        {cin(4096), CMPI_RC_ERR_INVALID_PARAMETER, "CIN VLAN ID value must be between 0 and 4095"},
        {cin(7),
         CMPI_RC_ERR_FAILED,
         "Failed to get FIP parameters, Unknown error, exited with error code 190",
         {"AX_GetHBAFeature"}},
        {cin(7),
         CMPI_RC_ERR_FAILED,
         "Error getting DCB FIP Parameters, Cannot set the specified parameter",
         {"AX_CNA_FCOE_GetFCFConnectList"}},
        {cin(7),
         CMPI_RC_ERR_FAILED,
         "Error getting CIN FIP Parameters, Cannot set the specified parameter",
         {"AX_CNA_FCOE_GetFIPParams"}},
        {cin(7),
         CMPI_RC_ERR_FAILED,
         "Setting of CIN FIP Param Failed,exited with error 190",
         {"AX_CNA_FCOE_SetFIPParams"}},
        {texts("VlanID", {"7"}),
         CMPI_RC_ERR_FAILED,
         "Setting of DCB FIP Param Failed, exited with error 190",
         {"AX_CNA_FCOE_SetFCFConnectList"}},
    };
    for (const Change& row : rows)
        expect(row);
    EXPECT_EQ(vlnsim_calls("AX_CNA_FCOE_SetFCFConnectList"), 1u) << "the last alone";
    EXPECT_EQ(vlnsim_calls("AX_CNA_FCOE_SetFIPParams"), 1u) << "and the one before it";
    expect_properties(shown(PORT), {{"PrimaryFabricName", "{10:00:02:56:4C:FA:B0:01}"},
                                    {"PrimarySwitchName", "{20:00:02:56:4C:FA:B0:01}"},
                                    {"VlanID", "{1002}"},
                                    {"FCMap", "0x0EFC00"},
                                    {"CinVlanID", "1"}});
    set_value(PORT, "features", "FCoE", "0");
    expect({cin(7), CMPI_RC_ERR_FAILED, "Unknown error, exited with error code 0"});
    EXPECT_EQ(road.count_in_log("Not a valid card, Feature is not supported"), 1u);
    host::set(data.path.keys, "InstanceID", Value::text("VLNMPCA_FIPData::none"));
    host::set(data.properties, "InstanceID", Value::text("VLNMPCA_FIPData::none"));
    expect({cin(7), CMPI_RC_ERR_FAILED, "Invalid instance of VLNMPCA_FIPData"});
}

TEST_F(Fip, WhatIsGivenIsSetAndTheRestStays) {
    const char* const done =
        "Successfully modified the FIP parameters, need a port reset to take affect";
    const struct {
        Named_Values values;
        unsigned long connect_calls; // so many by then
        road::Property_Text shown;
        const char* line;
    } rows[] = {
        {texts("PrimaryFabricName", {"20:00 02:56:4c:fa:b0:77", "more"}),
         1,
         {"PrimaryFabricName", "{20:00:02:56:4C:FA:B0:77}"},
         done},
        {texts("PrimarySwitchName", {"20:00:02:56:4C:FA:B0:78"}),
         2,
         {"PrimarySwitchName", "{20:00:02:56:4C:FA:B0:78}"},
         done},
        {texts("VlanID", {"4095"}), 3, {"VlanID", "{4095}"}, done},
        {texts("VlanID", {"0x10"}), 4, {"VlanID", "{16}"}, done},
        {texts("VlanID", {"ANY"}), 5, {"VlanID", "{16}"}, done},
        {texts("VlanID", {}), 5, {"VlanID", "{16}"}, done},
        {text("FCMap", "0x0EFC42"), 6, {"FCMap", "0x0EFC42"}, done},
        {text("FCMap", "0x0EFB00"), 6, {"FCMap", "0x0EFC42"}, "Invalid fcmap value"},
        {cin(4095), 6, {"CinVlanID", "4095"}, "Valid CIN VLAN ID value"},
    };
    unsigned long changes = 0;
    for (const auto& row : rows) {
        expect({row.values, CMPI_RC_OK, row.line});
        expect_properties(shown(PORT), {row.shown});
        EXPECT_EQ(vlnsim_calls("AX_CNA_FCOE_SetFCFConnectList"), row.connect_calls) << row.line;
        EXPECT_EQ(vlnsim_calls("AX_CNA_FCOE_SetFIPParams"), ++changes);
    }
    expect_properties(shown(PORT), {{"PrimaryFabricName", "{20:00:02:56:4C:FA:B0:77}"},
                                    {"PrimarySwitchName", "{20:00:02:56:4C:FA:B0:78}"}});
    expect_properties(shown(OTHER_PORT), {{"VlanID", "{1002}"}, {"CinVlanID", "1"}});
}

TEST_F(Fip, AnInstanceShowsWhatTheAdapterHas) {
    Named_Values both = texts("VlanID", {"7"});
    both.push_back(cin(8).at(0));
    expect({both,
            CMPI_RC_ERR_FAILED,
            "Setting of CIN FIP Param Failed,exited with error 190",
            {"AX_CNA_FCOE_SetFIPParams"}});
    expect_properties(shown(PORT), {{"VlanID", "{7}"}, {"CinVlanID", "1"}});
    // The change is made; that it cannot be read back leaves it to the next look.
    both.at(0) = texts("VlanID", {"9"}).at(0);
    expect({both,
            CMPI_RC_OK,
            "Failed to get the modified FIP Params from AXAPI for deviceID 100002564C000001",
            {"AX_CNA_FCOE_GetFCFConnectList", 2}});
    shown(PORT); // starts it
    road.wait_for_refreshes(2);
    expect_properties(shown(PORT), {{"VlanID", "{9}"}, {"CinVlanID", "8"}});
}

TEST(FipScan, WhatCannotBeReadIsLeftOut) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "ports": 3, "functions": [{"use": "nic"}, {"use": "fcoe",
            "fip": {"vlan": null, "forwarders": [{"vlans": [1, 2, 3, 4, 5, 6, 7, 8], "vlanCount": 65535}]}}]}]})",
               .log = true});
    vlnsim_fault("AX_CNA_FCOE_GetFIPParams", 1, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_CNA_FCOE_GetFcfList", 2, VLNSIM_STATUS, 251);
    const auto settings = road.enumerate("VLNMPCA_FIPData");
    ASSERT_EQ(settings.size(), 2u);
    EXPECT_EQ(text_of(settings[0], "ElementName"), "100002564C000104");
    EXPECT_EQ(text_of(settings[0], "VlanID"), "{Any}");
    EXPECT_EQ(road.enumerate("VLNMPCA_FIPServiceAffectsElement").size(), 2u);
    const auto forwarders = road.enumerate("VLNMPCA_FIPFCFData");
    ASSERT_EQ(forwarders.size(), 2u) << "of the first port and of the third";
    EXPECT_EQ(text_of(forwarders[0], "ElementName"), "100002564C000003");
    EXPECT_EQ(text_of(forwarders[0], "VlanID"), "{1, 2, 3, 4, 5, 6, 7, 8}");
    road.close();
    for (const char* line :
         {"Error getting CIN FIP Parameters, AX returned with value 190",
          "Failed to get FIP Params from AXAPI for deviceID 100002564C000003,skipping the FIP "
          "setting class creation",
          "Unable to get FCF info, returned with statuscode 251"})
        EXPECT_EQ(road.count_in_log(line), 1u) << line;
}

} // namespace
