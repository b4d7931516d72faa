// How long the World Wide Name service waits for an adapter: what else it does is in
// tables/wwn.txt.
#include "tests/hostile/sudden_ends.h"

using host::Named_Values;
using host::Value;
using road::Road;

namespace {

// Of two cards, whose libraries are busy twice, and for ever.
class Busy_Names : public testing::Test {
protected:
    static std::string card(const char* busy) {
        return R"({"use": "cna", "functions": [{"use": "nic"}, {"use": "fcoe",
            "nameManagement": {"can": ["nonVolatile", "reset"], "busy": )" +
               std::string(busy) + "}}]}";
    }
    Busy_Names()
        : road({.scenario = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json", "cards": [)" +
                            card("2") + "," + card("100000") + "]}",
                .log = true}) {
        service = road.enumerate("VLNMPCA_FCWWNService").at(0).path;
        ports = road.enumerate("VLNMPCA_FCPort");
        road.wait_for_refreshes(1);
    }

    std::uint64_t call(const std::string& method, std::size_t port, unsigned type,
                       const char* name = "10:00:02:56:4c:00:0f:01") {
        Named_Values inputs = {{"Target", Value::reference(ports.at(port).path)},
                               {"Type", Value::unsigned_number(CMPI_uint16, type)}};
        if (method == "ChangeWWN") {
            inputs.push_back({"NewWWPN", Value::text(name)});
            inputs.push_back({"NewWWNN", Value::text("20:00:02:56:4c:00:0f:01")});
        }
        const auto reply = road.manager().invoke(service, method, inputs);
        EXPECT_TRUE(reply.ok());
        return reply.value.value.as_unsigned();
    }

    static constexpr std::size_t PATIENT = 0, ENDLESS = 1;
    static constexpr std::uint64_t SECOND = 1000000;
    Road road;
    host::ObjectPath service;
    std::vector<host::Instance> ports;
};

TEST_F(Busy_Names, TheLibraryIsAskedOnceASecondForFiveMinutes) {
    const std::uint64_t start = vlnsim_now();
    EXPECT_EQ(call("ChangeWWN", PATIENT, 1), 0u);
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 3u);
    EXPECT_EQ(vlnsim_now() - start, 2 * SECOND);
    EXPECT_EQ(call("ChangeWWN", ENDLESS, 1, "10:00:02:56:4c:00:0f:02"), 40097u);
    EXPECT_EQ(vlnsim_calls("AX_ChangeWWN"), 3u + 301u);
    EXPECT_EQ(vlnsim_now() - start, 302 * SECOND);
    EXPECT_EQ(call("RestoreWWN", ENDLESS, 0), 0u);
    EXPECT_EQ(vlnsim_calls("AX_RestoreWWN"), 301u);
    EXPECT_EQ(road.count_in_log("Validating new WWNs..."), 2u);
}

// Non-volatile names are written, the factory's restored.
TEST_F(Busy_Names, AnUnloadCutsTheWaitShort) {
    for (const std::string method : {"ChangeWWN", "RestoreWWN"}) {
        road.enumerate("VLNMPCA_FCWWNService");
        const std::string function = "AX_" + method;
        const std::string line = "unload(): ending the calls that wait";
        const std::size_t unloads = road.count_in_log(line);
        sudden_ends::hold(function.c_str());
        const std::uint64_t start = vlnsim_now();
        std::thread client([&] { call(method, ENDLESS, method == "ChangeWWN"); });
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
