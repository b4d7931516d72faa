// The parameters of the FCoE driver as a client reads and sets them.
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::set_value;
using road::text_of;
using road::walk;
using services::Change;
using services::expect_changes;
using services::Fault;

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

// ---- Changes ----

constexpr CMPIrc REFUSED = CMPI_RC_ERR_INVALID_PARAMETER;
constexpr CMPIrc FAILED = CMPI_RC_ERR_FAILED;

class Driver_Parameter_Changes : public testing::Test {
protected:
    host::Instance setting(const std::string& id) {
        return find(road, "VLNMPCA_DriverParameterSettingData", "InstanceID", id);
    }
    host::Instance local(const char* name) {
        return setting(parameter_id("Current Local", std::string(PAIRED) + ":" + name));
    }
    host::Instance global(const char* name) {
        return setting(parameter_id("Current Global", name));
    }
    std::string value(const host::Instance& setting) {
        return text_of(road.manager().get(setting.path).value, "Value");
    }

    Road road{{.scenario = "driver-parameters.json", .log = true}};
};

Change set(std::uint32_t value, CMPIrc status, const char* line, const Fault& fault = {}) {
    return {{{"Value", services::number(CMPI_uint32, value)}}, status, line, fault};
}

Change asks(std::uint32_t value, const char* call) {
    return {{{"Value", services::number(CMPI_uint32, value)}},
            CMPI_RC_OK,
            "vlncimFCoESetDriverParam succeded",
            {},
            call};
}

TEST_F(Driver_Parameter_Changes, ScopeAndDurationAreThoseOfTheParameter) {
    const host::Instance timeout = local("nodev_tmo"), depth = local("lun_queue_depth");
    const host::Instance verbose = global("log_verbose"), npiv = global("enable_npiv");
    expect_changes(road, timeout, {asks(60, R"("nodev_tmo=60", 0))")});
    expect_changes(road, depth, {asks(128, R"("lun_queue_depth=128", 1))")});
    expect_changes(road, verbose, {asks(0xFFFFFFFF, R"("log_verbose=-1", 2))")});
    expect_changes(road, npiv, {asks(0, R"("enable_npiv=0", 3))")});
    vlnsim_advance(5 * SECOND);
    const auto expect = [&](const char* of_timeout, const char* of_depth, const char* of_verbose,
                            const char* of_npiv) {
        EXPECT_EQ(value(timeout), of_timeout);
        EXPECT_EQ(value(depth), of_depth);
        EXPECT_EQ(value(verbose), of_verbose);
        EXPECT_EQ(value(npiv), of_npiv);
    };
    expect("60", "128", "4294967295", "0");
    EXPECT_EQ(value(setting(parameter_id("Default Local", std::string(PAIRED) + ":nodev_tmo"))),
              "30");
    vlnsim_reboot();
    vlnsim_advance(5 * SECOND);
    expect("30", "128", "0", "0");
}

TEST_F(Driver_Parameter_Changes, EachRefusalHasItsLine) {
    const auto through = [](const char* port, CMPIrc status, const char* line) {
        return Change{{{"Value", services::number(CMPI_uint32, 60)},
                       {"ElementName", host::Value::text(port)}},
                      status,
                      line};
    };
    const char* const not_set = "vlncimFCoESetDriverParam failed";
    const host::Instance timeout = local("nodev_tmo");
    expect_changes(
        road, timeout,
        {{{}, REFUSED, "No Value specified"},
         {{{"Value", host::Value::null(CMPI_uint32)}}, REFUSED, "No Value specified"},
         set(0, FAILED, "The value is out of the parameter's range"),
         set(256, FAILED, not_set),
         set(60, FAILED, "AX_SetDriverParam fails with status : 190", {"AX_SetDriverParam", 190}),
         set(60, FAILED, "INVALID wwpn", {"AX_IsLocalHBA", 1}),
         through("100002564C00", FAILED, "::modify_instance::str2HBAName failed"),
         through(ALONE, FAILED, "The driver parameter is not set through the port"),
         through("\"100002564C000001", CMPI_RC_OK, "succeded"),
         through("", CMPI_RC_OK, "succeded")});
    EXPECT_EQ(value(timeout), "60");
    expect_changes(road, local("topology"), {set(1, FAILED, "The parameter can't be changed")});
    expect_changes(road, local("scan_down"), {set(0, FAILED, "fails with status : 190")});
    EXPECT_EQ(value(local("scan_down")), "1");
    host::Instance unknown = timeout;
    for (host::Named_Values* values : {&unknown.path.keys, &unknown.properties})
        host::set(*values, "InstanceID",
                  host::Value::text(parameter_id("Current Local", "nodev_tmo")));
    expect_changes(road, unknown, {set(60, FAILED, "Invalid instance of VLNMPCA_DriverParameter")});
    for (const std::string& id :
         {parameter_id("Default Global", "log_verbose"),
          parameter_id("Maximum Local", std::string(PAIRED) + ":nodev_tmo"),
          parameter_id("Minimum Global", "log_verbose"),
          std::string("VLN:PrioVia:Driver:100002564C000001:502564C000000000:1")})
        expect_changes(
            road, setting(id),
            {set(1, REFUSED, "Modify instance is supported only on the current instance.")});
}

} // namespace
