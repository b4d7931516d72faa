// The World Wide Name service as a client calls it.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"

using host::Named_Values;
using host::Value;
using road::find;
using road::Road;
using road::text_of;

namespace {

// One card; its FCoE function takes these values of name management and of virtual ports.
std::string card(const std::string& values) {
    return R"({"use": "cna", "functions": [{"use": "nic"}, {"use": "fcoe", )" + values + "}]}";
}
std::string scenario(const std::string& cards) {
    return R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [)" + cards + "]}";
}

const std::string SCENARIO = scenario(
    card(R"("nameManagement": {"can": ["nonVolatile", "volatile", "reset"], "busy": 0})") + "," +
    card(R"("nameManagement": {"can": ["nonVolatile", "volatile", "reboot"]},
            "virtualPorts": [{"count": 3, "wwpn": "20:01:02:56:4C:00:00:{vport:02X}",
                              "wwnn": "20:01:02:56:4C:00:01:00"}])") +
    "," + card(R"("nameManagement": {"can": "readOnly"})") + "," +
    card(
        R"("nameManagement": null, "virtualPorts": [{"count": 1024, "wwpn": "20 02 02564C00 {vport:04X}"}])"));

constexpr const char* BY_RESET = "100002564C000001";
constexpr const char* BY_REBOOT = "100002564C010001";
constexpr const char* READ_ONLY = "100002564C020001";
constexpr const char* WITHOUT = "100002564C030001";
constexpr const char* NEW_WWPN = "10:00:02:56:4c:00:0f:01";
constexpr const char* NEW_WWNN = "20:00:02:56:4c:00:0f:01";
constexpr const char* NEW_PORT = "100002564C000F01";
constexpr const char* VOLATILE_UNTIL =
    "Volatile names will be active until system power-down or HBA power-cycle";

struct Row {
    const char* method;
    const char* port;
    int type;               // -1: none
    std::uint64_t value;    // returned
    const char* activation; // "-": not set
    const char* line;
    std::uint64_t fault = 0; // the status that the library's function of that name answers
};

class Names : public testing::Test {
protected:
    explicit Names(const std::string& text = SCENARIO) : road({.scenario = text, .log = true}) {
        service = road.enumerate("VLNMPCA_FCWWNService").at(0).path;
        some_port = road.enumerate("VLNMPCA_FCPort").at(0).path;
        road.wait_for_refreshes(1);
    }

    Value port(const char* id) {
        host::ObjectPath path = some_port;
        host::set(path.keys, "DeviceID", Value::text(id));
        return Value::reference(path);
    }
    static Value type(unsigned number) { return Value::unsigned_number(CMPI_uint16, number); }

    host::Reply<host::Method_Result> call(const char* method, const Named_Values& inputs) {
        return road.manager().invoke(service, method, inputs);
    }
    Named_Values inputs_of(const Row& row, const char* wwpn = NEW_WWPN) {
        Named_Values inputs = {{"Target", port(row.port)}};
        if (row.type >= 0)
            inputs.push_back({"Type", type(static_cast<unsigned>(row.type))});
        if (std::string_view(row.method) == "ChangeWWN") {
            inputs.push_back({"NewWWPN", Value::text(wwpn)});
            inputs.push_back({"NewWWNN", Value::text(NEW_WWNN)});
        }
        return inputs;
    }
    static std::string output(const host::Method_Result& result, const char* name) {
        const Value* value = host::find(result.outputs, name);
        return value && !value->is_null() ? std::to_string(value->as_unsigned()) : "-";
    }
    // Answers what is logged meanwhile.
    std::string expect(const Row& row, const Named_Values& inputs) {
        SCOPED_TRACE(std::string(row.method) + ": " + row.line);
        if (row.fault)
            vlnsim_fault((std::string("AX_") + row.method).c_str(), VLNSIM_EVERY, VLNSIM_STATUS,
                         row.fault);
        const std::size_t before = road.log_text().size();
        const auto reply = call(row.method, inputs);
        const std::string log = road.log_text().substr(before);
        EXPECT_TRUE(reply.ok());
        EXPECT_EQ(reply.value.value.as_unsigned(), row.value);
        EXPECT_EQ(output(reply.value, "WWNOperationStatus"), row.activation);
        EXPECT_NE(log.find(row.line), std::string::npos) << log;
        vlnsim_clear_faults();
        return log;
    }
    std::string expect(const Row& row) { return expect(row, inputs_of(row)); }

    bool shows(const char* device_id) {
        for (const host::Instance& each : road.enumerate("VLNMPCA_FCPort"))
            if (text_of(each, "DeviceID") == device_id)
                return true;
        return false;
    }

    Road road;
    host::ObjectPath service, some_port;
};

TEST_F(Names, WhatIsNoArgumentIsRefusedBeforeTheLibraryIsAsked) {
    const char* const unknown = "100002564CFFFFFF";
    for (const char* method : {"GetWWNCapability", "ReadWWN", "ChangeWWN", "RestoreWWN"}) {
        expect({method, unknown, -1, 32968, "-", "Invalid VLNMPCA_FCPort"});
        expect({method, BY_RESET, -1, 32968, "-", "Invalid VLNMPCA_FCPort"}, {});
    }
    const std::size_t before = vlnsim_calls(nullptr);
    const Row rows[] = {
        {"ReadWWN", BY_RESET, 7, 32968, "-", "ReadWWN: Type 7 not recognized..."},
        {"ReadWWN", BY_RESET, 5, 32968, "-", "ReadWWN: Type 5 not recognized..."},
        {"ReadWWN", BY_RESET, -1, 32968, "-", "ReadWWN: Type -1 not recognized..."},
        {"ChangeWWN", BY_RESET, 2, 32968, "-", "ChangeWWN: Type 2 not recognized..."},
        {"RestoreWWN", BY_RESET, 2, 32968, "-", "RestoreWWN: Type 2 not recognized..."},
    };
    for (const Row& row : rows)
        expect(row);
    EXPECT_EQ(vlnsim_calls(nullptr), before);

    const struct {
        const char* wwpn;
        const char* wwnn;
        std::uint64_t value;
        const char* line;
    } names[] = {
        {nullptr, NEW_WWNN, 32969, "ChangeWWN: a new name is missing"},
        {NEW_WWPN, nullptr, 32969, "ChangeWWN: a new name is missing"},
        {"", NEW_WWNN, 40005, "The supplied 'New WWPN' is not valid"},
        {"30:00:02:56:4c:00:0f:01", NEW_WWNN, 40005, "The supplied 'New WWPN' is not valid"},
        {NEW_WWPN, "20:00", 40005, "The supplied 'New WWNN' is not valid"},
        {NEW_WWPN, "0000025640000001", 40005, "The supplied 'New WWNN' is not valid"},
    };
    for (const auto& row : names) {
        Named_Values inputs = {{"Target", port(BY_RESET)}, {"Type", type(1)}};
        if (row.wwpn)
            inputs.push_back({"NewWWPN", Value::text(row.wwpn)});
        if (row.wwnn)
            inputs.push_back({"NewWWNN", Value::text(row.wwnn)});
        expect({"ChangeWWN", BY_RESET, 1, row.value, "-", row.line}, inputs);
    }
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 0u);
    host::set(service.keys, "Name", Value::text("other"));
    expect({"ReadWWN", BY_RESET, 0, 33068, "-", "Invalid instance of MPCA WWN Service"});
}

TEST_F(Names, EachCapabilityHasItsLine) {
    const struct {
        const char* port;
        std::uint64_t word;
        std::vector<const char*> lines;
    } rows[] = {
        {BY_RESET,
         0x200C,
         {"Can change Non-Volatile WWNs", "Can change Volatile WWNs",
          "Activation requirement: Reset HBA"}},
        {BY_REBOOT, 0x100C, {"Activation requirement: Reboot"}},
        {READ_ONLY,
         0x80000000,
         {"Read Only mode: World Wide Name Management is not supported in this mode",
          "Cannot change Non-Volatile WWNs", "Cannot change Volatile WWNs"}},
    };
    for (const auto& row : rows)
        for (const char* line : row.lines) {
            expect({"GetWWNCapability", row.port, -1, 0, "-", line});
            const auto reply = call("GetWWNCapability", {{"Target", port(row.port)}});
            EXPECT_EQ(output(reply.value, "WWNCapability"), std::to_string(row.word));
        }
}

TEST_F(Names, EachStatusOfTheLibraryHasItsLine) {
    const char* const not_available = "WWN Management is NOT AVAILABLE on this adapter";
    const Row rows[] = {
        {"GetWWNCapability", WITHOUT, -1, 40092, "-",
         "WWN Management is not available on this HBA"},
        {"GetWWNCapability", BY_RESET, -1, 40190, "-",
         "GetWWNCapability: AX_ReadWWNCapability call failed with error: 190", 190},
        {"ReadWWN", WITHOUT, 1, 40092, "-", not_available},
        {"ReadWWN", BY_RESET, 0, 40089, "-", "Volatile WWNs are NOT SUPPORTED on this adapter", 89},
        {"ReadWWN", BY_RESET, 1, 40089, "-", "ReadWWN: AX_ReadWWN call failed with error: 89", 89},
        {"ChangeWWN", WITHOUT, 0, 40092, "-", "WWN Management is not available on this HBA"},
        {"ChangeWWN", READ_ONLY, 0, 40089, "-", "WWN NOT SUPPORTED"},
        {"ChangeWWN", BY_RESET, 1, 40190, "-",
         "ChanngeWWN: AX_ChangeWWN call failed with error: 190", 190},
        {"RestoreWWN", WITHOUT, 0, 0, "-", "RestoreWWN operation initiated."},
        {"RestoreWWN", READ_ONLY, 1, 0, "-", "Restoring Non-volatile World Wide Name..."},
    };
    for (const Row& row : rows)
        expect(row);
    EXPECT_EQ(road.count_in_log("PERF: DataFetch_Handler Thread BEGIN"), 1u)
        << "nothing has changed";
}

// The five sets of names through a change, a reset or reboot, and back.
TEST_F(Names, EachActivationWordHasItsLines) {
    const Row before[] = {
        {"ReadWWN", BY_RESET, 0, 0, "9", "Volatile WWNs DO NOT EXIST on this adapter"},
        {"ReadWWN", BY_RESET, 1, 0, "-", "Non-Volatile WWNs read successfully"},
        {"ReadWWN", BY_RESET, 2, 0, "-", "Factory Default WWNs read successfully"},
        {"ReadWWN", BY_RESET, 3, 0, "4", "Current WWNs: Non-Volatile"},
        {"ReadWWN", BY_RESET, 4, 0, "9", "Configured WWNs DO NOT EXIST"},
        {"RestoreWWN", BY_RESET, 0, 0, "1", "WWNs already active. No Restore needed"},
        {"ChangeWWN", BY_RESET, 1, 0, "8", "Reset required to activate the new setting"},
        {"ReadWWN", BY_RESET, 4, 0, "8",
         "Configured WWNs: Non-Volatile (Activation required: adapter restart)"},
        {"ChangeWWN", BY_RESET, 0, 0, "7", VOLATILE_UNTIL},
        {"ReadWWN", BY_RESET, 4, 0, "7",
         "Configured WWNs: Volatile (Activation required: adapter restart)"},
        {"RestoreWWN", BY_RESET, 0, 0, "7", "Reset the HBA to activate the new setting"},
        {"ReadWWN", BY_RESET, 3, 0, "4", "WWPN: 10:00:02:56:4c:00:00:01"},
        {"ReadWWN", BY_RESET, 4, 0, "7", "WWNN: 20:00:02:56:4c:00:0f:01"},
    };
    for (const Row& row : before)
        expect(row);
    EXPECT_EQ(road.count_in_log("WWNs restored successfully"), 1u);
    EXPECT_EQ(road.count_in_log(VOLATILE_UNTIL), 2u) << "of the change and of the restore";
    EXPECT_EQ(road.count_in_log("New WWNs written successfully"), 2u);
    EXPECT_EQ(road.count_in_log("ChangeWWN operation completed. Please restart the CIMOM"), 2u);
    const auto installer = road.enumerate("VLNMPCA_SoftwareInstallationService").at(0).path;
    EXPECT_EQ(road.manager()
                  .invoke(installer, "Reset", {{"Target", port(BY_RESET)}})
                  .value.value.as_unsigned(),
              0u);
    while (!shows(NEW_PORT))
        std::this_thread::yield();
    EXPECT_FALSE(shows(BY_RESET));
    const Row after[] = {
        {"ReadWWN", NEW_PORT, 0, 0, "1", "Volatile WWNs are active"},
        {"ReadWWN", NEW_PORT, 3, 0, "3", "Current WWNs: Volatile"},
        {"RestoreWWN", NEW_PORT, 0, 0, "1", "WWNs already active. No Restore needed"},
        {"RestoreWWN", NEW_PORT, 1, 0, "8", "Please reset the HBA to activate the new setting"},
    };
    for (const Row& row : after)
        expect(row);
}

TEST_F(Names, AChangeMayWaitForAReboot) {
    const char* const reboot = "Reboot required to activate the new setting";
    const Row rows[] = {
        {"ChangeWWN", BY_REBOOT, 1, 0, "6", reboot},
        {"ReadWWN", BY_REBOOT, 4, 0, "6",
         "Configured WWNs: Non-Volatile (Activation required: warm reboot)"},
        {"RestoreWWN", BY_REBOOT, 1, 0, "6", reboot},
        {"ChangeWWN", BY_REBOOT, 0, 0, "5", VOLATILE_UNTIL},
        {"RestoreWWN", BY_REBOOT, 0, 0, "5", reboot},
        {"ReadWWN", BY_REBOOT, 0, 0, "5",
         "Configured WWNs: Volatile (Activation required: warm reboot)"},
    };
    for (const Row& row : rows)
        expect(row);
    vlnsim_reboot();
    while (!shows(NEW_PORT))
        vlnsim_advance(sudden_ends::STALE);
    EXPECT_FALSE(shows(BY_REBOOT));
}

TEST_F(Names, ANameOfAVirtualPortIsNotGivenTwice) {
    const char* const line = "ChangeWWN: Duplication of vport WWPN detected.";
    const Row row = {"ChangeWWN", BY_RESET, 1, 91, "1", line};
    expect(row, inputs_of(row, "20:01:02:56:4C:00:00:02"));
    Named_Values as_node = inputs_of(row);
    host::set(as_node, "NewWWNN", Value::text("200102564C000000"));
    expect(row, as_node);
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 0u);
    // Of a port name alone, and of lists that are not too long.
    const Row done = {"ChangeWWN", BY_RESET, 1, 0, "8", "New WWNs written successfully"};
    expect(done, inputs_of(done, "20:01:02:56:4C:00:01:00"));
    expect(done, inputs_of(done, "20:02:02:56:4C:00:00:00"));
}

class Busy_Names : public Names {
protected:
    Busy_Names()
        : Names(scenario(
              card(R"("nameManagement": {"can": ["nonVolatile", "reset"], "busy": 2})") + "," +
              card(R"("nameManagement": {"can": ["nonVolatile", "reset"], "busy": 100000})"))) {}

    static constexpr const char* PATIENT = BY_RESET;
    static constexpr const char* ENDLESS = BY_REBOOT;
    static constexpr std::uint64_t SECOND = 1000000;
};

TEST_F(Busy_Names, TheLibraryIsAskedOnceASecondForFiveMinutes) {
    const std::uint64_t start = vlnsim_now();
    expect({"ChangeWWN", PATIENT, 1, 0, "8", "Validating new WWNs..."});
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 3u);
    EXPECT_EQ(vlnsim_now() - start, 2 * SECOND);
    const Row endless = {
        "ChangeWWN", ENDLESS, 1, 40097, "-", "ChanngeWWN: AX_ChangeWWN call failed with error: 97"};
    expect(endless, inputs_of(endless, "10:00:02:56:4c:00:0f:02"));
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 3u + 301u);
    EXPECT_EQ(vlnsim_now() - start, 302 * SECOND);
    expect({"RestoreWWN", ENDLESS, 0, 0, "-", "Restoring WWNs..."});
    EXPECT_EQ(vlnsim_calls("AX_RestoreWWN"), 301u);
    EXPECT_EQ(road.count_in_log("Validating new WWNs..."), 2u);
}

// A restore leaves the data to others; a change does not.
TEST_F(Busy_Names, ARestoreHoldsUpNobody) {
    sudden_ends::hold("AX_RestoreWWN");
    const Row row = {"RestoreWWN", PATIENT, 0, 0, "1", "Restoring WWNs..."};
    std::thread client([&] { expect(row); });
    sudden_ends::wait_until_held();
    EXPECT_EQ(road.enumerate("VLNMPCA_FCPort").size(), 2u);
    vlnsim_clear_faults();
    client.join();
}

TEST_F(Busy_Names, AnUnloadCutsTheWaitShort) {
    const struct {
        const char* method;
        int type; // non-volatile names are written, the factory's restored
    } rows[] = {{"ChangeWWN", 1}, {"RestoreWWN", 0}};
    for (const auto& [method, type] : rows) {
        road.enumerate("VLNMPCA_FCWWNService");
        const std::string function = std::string("AX_") + method;
        const std::string line = "unload(): ending the calls that wait";
        const std::size_t unloads = road.count_in_log(line);
        sudden_ends::hold(function.c_str());
        const std::uint64_t start = vlnsim_now();
        const Named_Values inputs = inputs_of({method, ENDLESS, type, 0, "-", ""});
        std::thread client([&] { EXPECT_TRUE(call(function.c_str() + 3, inputs).ok()); });
        sudden_ends::wait_until_held();
        std::thread letting_go([&] {
            while (road.count_in_log(line) == unloads)
                std::this_thread::yield();
            vlnsim_clear_faults();
        });
        EXPECT_TRUE(road.manager().cleanup("VLNMPCA_FCWWNService", true).ok());
        letting_go.join();
        client.join();
        EXPECT_EQ(vlnsim_calls(function.c_str()), 1u);
        EXPECT_EQ(vlnsim_now(), start);
    }
}

} // namespace
