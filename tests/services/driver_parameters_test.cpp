// The parameters of the FCoE driver as a client reads them.
#include "tests/road/properties.h"

using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;
using road::walk;

namespace {

constexpr std::uint64_t SECOND = 1000000;
constexpr const char* PAIRED = "100002564C000001"; // the first port, with 60 parameters
constexpr const char* ALONE = "100002564C010000";

std::string parameter_id(const char* kind, const std::string& name) {
    return std::string("VLN:FCoE ") + kind + " Driver Parameter:" + name;
}

TEST(DriverParameters, FourSettingsOfEach) {
    Road road({.scenario = "fcoe-pair.json"});
    const auto settings = road.enumerate("VLNMPCA_DriverParameterSettingData");
    ASSERT_EQ(settings.size(), 4 * (2 + 60 + 2u));
    const std::string local = std::string(PAIRED) + ":nodev_tmo";
    const struct {
        std::size_t index;
        std::string id;
        const char* value;
    } rows[] = {
        {0, parameter_id("Current Global", "log_verbose"), "64"},
        {1, parameter_id("Maximum Global", "log_verbose"), "65535"},
        {2, parameter_id("Minimum Global", "log_verbose"), "0"},
        {3, parameter_id("Default Global", "log_verbose"), "0"},
        {8, parameter_id("Current Local", local), "45"},
        {9, parameter_id("Default Local", local), "30"},
        {10, parameter_id("Maximum Local", local), "255"},
        {11, parameter_id("Minimum Local", local), "1"},
        {8 + 59 * 4, parameter_id("Current Local", std::string(PAIRED) + ":tune_59"), "59"},
    };
    for (const auto& row : rows)
        expect_properties(settings[row.index],
                          {{"InstanceID", row.id.c_str()}, {"Value", row.value}});
    expect_properties(settings[8], {{"ParameterName", "nodev_tmo"},
                                    {"help", "Seconds that a target may be missing"},
                                    {"ChangeableType", "1"},
                                    {"exportFlag", "1"},
                                    {"ConfigurationName", "local"},
                                    {"ElementName", PAIRED}});
    expect_properties(settings[0], {{"ConfigurationName", "-"}, {"exportFlag", "1"}});
    for (const host::Instance& setting : settings)
        EXPECT_NE(text_of(setting, "ParameterName"), "of_the_second_adapter");
}

// The first table is for 52 records; the first port has 60.
TEST(DriverParameters, ATableThatIsTooSmallIsTakenAgain) {
    Road road({.scenario = "fcoe-pair.json", .log = true});
    EXPECT_EQ(road.enumerate("VLNMPCA_FCPort").size(), 2u);
    EXPECT_EQ(vlnsim_calls("AX_GetDriverParams"), 3u);
    EXPECT_EQ(vlnsim_calls("AX_GetDriverParamsGlobal"), 1u) << "of the first adapter alone";
    road.close();
    EXPECT_EQ(road.count_in_log("AX_GetDriverParams: status=191"), 1u);
    EXPECT_EQ(road.count_in_log("number of driver parameters 60"), 1u);
}

TEST(DriverParameters, SettingsBelongToTheServiceAndToTheirPort) {
    Road road({.scenario = "fcoe-pair.json"});
    const char* const flags[] = {"IsCurrent", "IsDefault", "IsMaximum", "IsMinimum", "IsNext"};
    std::map<std::string, std::size_t> kinds;
    for (const host::Instance& setting : road.enumerate("VLNMPCA_DriverElementSettingData")) {
        const std::string id = end_of(setting, "SettingData", "InstanceID");
        const std::string kind = "Is" + id.substr(std::string("VLN:FCoE ").size(), 7);
        ++kinds[kind];
        for (const char* flag : flags)
            EXPECT_EQ(text_of(setting, flag), flag == kind ? "1" : "2") << id << " " << flag;
    }
    EXPECT_EQ(kinds,
              (std::map<std::string, std::size_t>{
                  {"IsCurrent", 64}, {"IsDefault", 64}, {"IsMaximum", 64}, {"IsMinimum", 64}}));
    const auto ports = road.enumerate("VLNMPCA_FCPort");
    EXPECT_EQ(walk(road, ports.at(0), "VLNMPCA_LocalPortElementSettingData").size(), 240u);
    EXPECT_EQ(walk(road, ports.at(1), "VLNMPCA_LocalPortElementSettingData").size(), 8u);
}

TEST(DriverParameters, ADriverThatDoesNotTellHasNone) {
    Road road({.scenario = "fcoe-pair.json", .log = true});
    vlnsim_fault("AX_GetDriverParamsGlobal", VLNSIM_EVERY, VLNSIM_STATUS, 190);
    vlnsim_fault("AX_GetDriverParams", 1, VLNSIM_STATUS, 251);
    const auto settings = road.enumerate("VLNMPCA_DriverServiceAffectsElement");
    EXPECT_EQ(settings.size(), 2u);
    EXPECT_EQ(road.enumerate("VLNMPCA_LocalPortElementSettingData").size(), 8u);
    road.close();
    for (const char* line :
         {"ERROR: vlncimGetDriverParamsGlobal: AX_GetDriverParamsGlobal call failed (b) (190)",
          "Call to FCoEGetDriverParam to retrieve Global Driver Parameters failed",
          "rmStatus = 190",
          "Call to FCoEGetDriverParam to retrieve Local Driver Parameters failed"})
        EXPECT_EQ(road.count_in_log(line), 1u) << line;
}

TEST(DriverParameters, ValuesAreReadAtMostEveryFiveSeconds) {
    Road road({.scenario = "fcoe-pair.json"});
    const auto value = [&road](const std::string& id) {
        return text_of(find(road, "VLNMPCA_DriverParameterSettingData", "InstanceID", id), "Value");
    };
    const std::string global = parameter_id("Current Global", "log_verbose");
    const std::string local = parameter_id("Current Local", std::string(ALONE) + ":nodev_tmo");
    EXPECT_EQ(value(global), "64");
    set_value(PAIRED, "globalDriverParameters", "log_verbose", "128");
    set_value(ALONE, "driverParameters", "nodev_tmo", "77");
    vlnsim_advance(5 * SECOND - 1);
    const unsigned long calls = vlnsim_calls("AX_GetDriverParamsGlobal");
    EXPECT_EQ(value(global), "64");
    EXPECT_EQ(value(local), "30");
    EXPECT_EQ(vlnsim_calls("AX_GetDriverParamsGlobal"), calls);
    vlnsim_advance(1);
    EXPECT_EQ(value(global), "128");
    EXPECT_EQ(value(local), "77");
    EXPECT_EQ(value(parameter_id("Default Local", std::string(ALONE) + ":nodev_tmo")), "30");
}

} // namespace
