// The priority of logical units (Prio Via) as a client sees, creates and deletes it.
#include "tests/road/properties.h"
#include "tests/services/changes.h"

using road::end_of;
using road::expect_properties;
using road::find;
using road::Road;
using road::text_of;
using road::walk;
using services::Fault;

namespace {

constexpr CMPIrc OK = CMPI_RC_OK;
constexpr CMPIrc REFUSED = CMPI_RC_ERR_INVALID_PARAMETER;
constexpr CMPIrc FAILED = CMPI_RC_ERR_FAILED;

constexpr const char* SETTING = "VLNMPCA_DriverParameterSettingData";
constexpr const char* PORT = "100002564C000001"; // that sees both targets, four units each
constexpr const char* TARGET = "502564C000000000";
constexpr const char* OTHER_TARGET = "502564C000000001";
constexpr const char* PLAIN_PORT = "100002564C010000"; // without priority of units

std::string priority_id(const char* option, const std::string& initiator, const std::string& target,
                        const char* lun) {
    return std::string("VLN:PrioVia:") + option + ":" + initiator + ":" + target + ":" + lun;
}

host::Instance setting(const std::string& id) {
    host::Instance instance;
    instance.path.class_name = SETTING;
    host::set(instance.path.keys, "InstanceID", host::Value::text(id));
    host::set(instance.properties, "InstanceID", host::Value::text(id));
    return instance;
}

std::vector<std::string> priorities(Road& road) {
    std::vector<std::string> ids;
    for (const host::Instance& each : road.enumerate(SETTING))
        if (text_of(each, "ParameterName") == "PrioVia")
            ids.push_back(text_of(each, "InstanceID"));
    return ids;
}

class Lun_Priorities : public testing::Test {
protected:
    // A call, what it is answered and what the log says from then on.
    template <class Call, class Answer>
    void expect(const std::string& what, Call call, Answer answer, const char* line,
                const Fault& fault = {}) {
        if (fault.function)
            vlnsim_fault(fault.function, 1, VLNSIM_STATUS, fault.status);
        const std::size_t before = road.log_text().size();
        EXPECT_EQ(call(), answer) << what;
        EXPECT_NE(road.log_text().find(line, before), std::string::npos) << what << ": " << line;
        vlnsim_clear_faults();
    }
    void expect_create(const std::string& id, CMPIrc status, const char* line,
                       const Fault& fault = {}) {
        expect(
            id, [&] { return road.manager().create(setting(id)).status.rc; }, status, line, fault);
    }
    void expect_delete(const std::string& id, CMPIrc status, const char* line,
                       const Fault& fault = {}) {
        expect(
            id, [&] { return road.manager().remove(setting(id).path).rc; }, status, line, fault);
    }

    // The second one, waited for.
    void refresh() {
        road.wait_for_refreshes(1);
        vlnsim_advance(3600ull * 1000000);
        road.enumerate("VLNMPCA_Card");
        road.wait_for_refreshes(2);
    }

    Road road{{.scenario = "driver-parameters.json", .log = true}};
};

TEST_F(Lun_Priorities, AreThoseOfTheAdapter) {
    EXPECT_EQ(priorities(road), (std::vector{priority_id("Driver", PORT, TARGET, "1"),
                                             priority_id("Driver", PORT, TARGET, "2"),
                                             priority_id("Config", PORT, OTHER_TARGET, "0")}));
    expect_properties(
        find(road, SETTING, "InstanceID", priority_id("Config", PORT, OTHER_TARGET, "0")),
        {{"ElementName", "VLN:PrioVia"},
         {"ConfigurationName", "Prio Via"},
         {"Value", "1"},
         {"Option", "1"}});
    EXPECT_EQ(road.count_in_log("GetOASLunList failed. Unsupported Hardware"), 1u);
    EXPECT_EQ(road.count_in_log("Found the FCPort Instance: 100002564C000001"), 3u);
}

TEST_F(Lun_Priorities, AnIdentifierIsCutByItsPlaces) {
    const std::string whole = priority_id("Driver", PORT, TARGET, "3");
    road.enumerate(SETTING);
    for (std::size_t length = 0; length < whole.size(); ++length)
        expect_create(
            whole.substr(0, length), length < sizeof "VLN:PrioVia" - 1 ? REFUSED : FAILED,
            length < 11   ? "InstanceID size = 0, PrioVia parameter not found in InstanceID: "
            : length < 35 ? "Also could not find the corresponding virtual FC port instance from"
                          : "The number of the logical unit is none: ");
    EXPECT_EQ(vlnsim_calls("AX_SetOASLunState"), 0u);
    EXPECT_EQ(priorities(road).size(), 3u);
}

TEST_F(Lun_Priorities, AreCreatedOrRefused) {
    const std::string whole = priority_id("Driver", PORT, TARGET, "3");
    const char* const no_number = "The number of the logical unit is none";
    road.enumerate(SETTING);
    expect_create(priority_id("driver", PORT, TARGET, "3"), FAILED,
                  "VLNMPCA_DriverParameterSettingData_Provider::Invalid option");
    expect_create(priority_id("Driver", "100002564C000009", TARGET, "3"), FAILED,
                  "Could not find the corresponding FC Port instance from initiator. Checking");
    expect_create(priority_id("Driver", PORT, "502564C00000000G", "3"), FAILED,
                  "str2HBAName failed");
    for (const char* lun : {"", "x", "3x", "-3", " 3", "4294967296"})
        expect_create(priority_id("Driver", PORT, TARGET, lun), FAILED, no_number);
    EXPECT_EQ(vlnsim_calls("AX_SetOASLunState"), 0u);
    expect_create(priority_id("Driver", PORT, TARGET, "4"), FAILED,
                  "The port sees no such target or logical unit");
    expect_create(priority_id("Config", PLAIN_PORT, "502564C100000000", "0"), FAILED,
                  "VLNMPCA_DriverParameterSettingData_Provider::SetOASLunState failed");
    expect_create(whole, FAILED, " Operation failure. PrioVia State has not been set",
                  {"AX_SetOASLunState", 190});
    EXPECT_EQ(priorities(road).size(), 3u) << "what is refused leaves nothing";
    expect_create(whole, OK, "create_instance() Succesful");
    expect_create(whole, CMPI_RC_ERR_ALREADY_EXISTS, "::Duplicate instance found.");

    const host::Instance created = find(road, SETTING, "InstanceID", whole);
    expect_properties(created, {{"ElementName", "Prio Via"},
                                {"ConfigurationName", "Prio Via"},
                                {"ParameterName", "PrioVia"},
                                {"Value", "1"},
                                {"Option", "0"}});
    for (const char* via :
         {"VLNMPCA_DriverElementSettingData", "VLNMPCA_LocalPortElementSettingData"}) {
        const auto links = road.manager().references(created.path, {via, "", "", ""});
        ASSERT_EQ(links.value.size(), 1u) << via;
        for (const char* flag : {"IsDefault", "IsCurrent", "IsNext", "IsMinimum", "IsMaximum"})
            expect_properties(links.value[0], {{flag, "2"}});
    }
    refresh();
    expect_properties(find(road, SETTING, "InstanceID", whole), {{"ElementName", "VLN:PrioVia"}});
}

TEST_F(Lun_Priorities, AreDeletedWithWhatJoinsThem) {
    const std::string first = priority_id("Driver", PORT, TARGET, "1");
    road.enumerate(SETTING);
    const auto joined = [&](const char* via) { return road.enumerate(via).size(); };
    const std::size_t of_driver = joined("VLNMPCA_DriverElementSettingData");
    const std::size_t of_ports = joined("VLNMPCA_LocalPortElementSettingData");
    expect_delete(priority_id("Driver", PORT, TARGET, "3"), CMPI_RC_ERR_NOT_FOUND,
                  "Instance Not found ");
    expect_delete("VLN:FCoE Current Global Driver Parameter:log_verbose", FAILED,
                  "Also could not find the corresponding virtual FC port instance");
    expect_delete(first, FAILED, "SetOASLunState failed", {"AX_SetOASLunState", 190});
    EXPECT_EQ(priorities(road).size(), 3u);
    expect_delete(first, OK, "delete_instance()");
    EXPECT_EQ(priorities(road).size(), 2u);
    EXPECT_EQ(joined("VLNMPCA_DriverElementSettingData"), of_driver - 1);
    EXPECT_EQ(joined("VLNMPCA_LocalPortElementSettingData"), of_ports - 1);
    refresh();
    EXPECT_EQ(priorities(road).size(), 2u) << "the adapter has forgotten it as well";
}

TEST_F(Lun_Priorities, AreTurnedOffForATarget) {
    const host::Instance service = road.enumerate("VLNMPCA_DriverParameterService").at(0);
    const auto disable = [&](const host::ObjectPath& path, const char* initiator,
                             const char* target, int option) {
        host::Named_Values inputs;
        if (initiator)
            host::set(inputs, "InitiatorWWPN", host::Value::text(initiator));
        if (target)
            host::set(inputs, "TargetWWPN", host::Value::text(target));
        if (option >= 0)
            host::set(inputs, "Option",
                      services::number(CMPI_uint8, static_cast<std::uint64_t>(option)));
        return road.manager()
            .invoke(path, "DisableAllPrioViaLuns", inputs)
            .value.value.as_unsigned();
    };
    const struct {
        const char *initiator, *target;
        int option;
        std::uint64_t value;
        const char* line;
        Fault fault = {};
    } rows[] = {
        {nullptr, TARGET, 0, 32968, "Invald fc port."},
        {"100002564C000000", TARGET, 0, 32968, "Invald fc port."}, // of the NIC
        {PORT, nullptr, 0, 32968, "Invalid Initiator fc port or Target device"},
        {PORT, "502564C0000000001", 0, 32968, "Invalid Initiator fc port or Target device"},
        {PORT, TARGET, -1, 32968, "Option: -1."},
        {PORT, TARGET, 5, 32968, "Option: 5."},
        {PORT, "502564C000000002", 0, 32769, "Disable PrioViaLunStates failed"},
        {PORT, TARGET, 0, 32769, "Operation failure", {"AX_SetOASLunState", 190}},
    };
    for (const auto& row : rows)
        expect(
            row.line, [&] { return disable(service.path, row.initiator, row.target, row.option); },
            row.value, row.line, row.fault);
    host::ObjectPath unknown = service.path;
    host::set(unknown.keys, "Name", host::Value::text("another"));
    expect(
        "unknown", [&] { return disable(unknown, PORT, TARGET, 0); }, 33068u,
        "Invalid instance of MPCA Driver Parameter Service");
    EXPECT_EQ(priorities(road).size(), 3u);
    expect(
        "all", [&] { return disable(service.path, PORT, "502564c000000000", 0); }, 0u,
        "Final Parse str: Driver:100002564C000001:502564c000000000");
    const auto left = std::vector{priority_id("Config", PORT, OTHER_TARGET, "0")};
    EXPECT_EQ(priorities(road), left);
    EXPECT_EQ(walk(road, find(road, SETTING, "InstanceID", left[0]),
                   "VLNMPCA_LocalPortElementSettingData")
                  .size(),
              1u);
    EXPECT_EQ(road.count_in_log("Invalid associations"), 0u);
    refresh();
    EXPECT_EQ(priorities(road), left) << "the adapter has forgotten them as well";
}

// A list that is longer than the first buffer, with units of a virtual port, of another adapter's
// port, and one that has lost its priority.
TEST(Lun_Priority_Lists, AreShownAsFarAsTheyAreTheAdapters) {
    Road road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [
        {"use": "cna", "ports": 2, "functions": [{"use": "fcoe", "unitPriorities": [
          {"initiator": "100002564C000000", "target": "502564C000000000", "count": 100},
          {"initiator": "200102564C000001", "target": "502564C000000000", "lun": 7},
          {"initiator": "100002564C010000", "target": "502564C000000000", "lun": 8},
          {"initiator": "100002564C000101", "target": "502564C000000000", "lun": 9, "state": 0}]},
          {"use": "nic"}]},
        {"use": "cna", "functions": [{"use": "fcoe"}]}]})",
               .log = true});
    const std::vector<std::string> ids = priorities(road);
    ASSERT_EQ(ids.size(), 102u);
    EXPECT_EQ(vlnsim_calls("AX_GetOASLunList"), 2u * (2 + 1) + 1);
    const std::string of_virtual = priority_id("Driver", "200102564C000001", TARGET, "7");
    EXPECT_EQ(ids[100], of_virtual);
    const host::Instance setting = find(road, SETTING, "InstanceID", of_virtual);
    EXPECT_EQ(walk(road, setting, "VLNMPCA_DriverElementSettingData").size(), 1u);
    EXPECT_TRUE(walk(road, setting, "VLNMPCA_LocalPortElementSettingData").empty());
    expect_properties(find(road, SETTING, "InstanceID", ids[101]), {{"Value", "0"}});
    road.close();
    EXPECT_EQ(road.count_in_log("Could not find the corresponding Virtual FC Port instance."), 1u);
    EXPECT_EQ(road.count_in_log("No entries in the set"), 2u);
    EXPECT_EQ(road.faults_in_log(), "");
}

} // namespace
