// Many clients at once, with refreshes beneath them: always a whole picture or the one before it.
#include "tests/road/properties.h"
#include "tests/road/road.h"

#include <atomic>
#include <thread>

using road::Road;

namespace {

constexpr int CLIENTS = 8;
constexpr int CALLS = 40;

TEST(Concurrency, ClientsSeeWholeStoresWhileTheDataIsRebuilt) {
    Road road;
    constexpr struct {
        const char* name;
        std::size_t count;
    } CLASSES[] = {{"VLNMPCA_EthernetPort", 4},
                   {"VLNMPCA_PortController", 2},
                   {"VLNMPCA_Realizes", 4},
                   {"VLNMPCA_LANEndpoint", 2}};
    std::vector<std::thread> clients;
    for (int client = 0; client < CLIENTS; ++client)
        clients.emplace_back([&road, client, &CLASSES] {
            for (int call = 0; call < CALLS; ++call) {
                if (client == 0)
                    vlnsim_advance(11ull * 60 * 1000000); // the data is stale
                const auto& row = CLASSES[(client + call) % 4];
                const auto reply = road.manager().enumerate(row.name);
                EXPECT_TRUE(reply.ok());
                EXPECT_EQ(reply.value.size(), row.count) << row.name;
            }
        });
    for (std::thread& client : clients)
        client.join();
}

// A link goes down and comes back, settings are modified and refreshes run, while clients take
// their time over what they got: each port tells its speed as a number and as a text that agree.
TEST(Concurrency, InstancesAreReplacedBehindTheirReaders) {
    constexpr std::uint64_t SECOND = 1000000;
    Road road;
    const auto settings = road.manager().enumerate("VLNMPCA_ProviderConfigSetting");
    ASSERT_EQ(settings.value.size(), 3u);
    ASSERT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 4u);
    std::atomic<int> readers{4};
    std::atomic<bool> seen_down{false};
    std::vector<std::thread> clients;
    for (int client = readers; client > 0; --client)
        clients.emplace_back([&] {
            for (int call = 0; call < CALLS; ++call) {
                for (const auto& port : road.manager().enumerate("VLNMPCA_EthernetPort").value) {
                    const bool down = road::text_of(port, "Speed") == "0";
                    EXPECT_EQ(road::text_of(port, "FunctionalPortSpeed") == "Not Available", down);
                    seen_down = seen_down || down;
                }
                EXPECT_EQ(road.manager().enumerate("VLNMPCA_Realizes").value.size(), 4u);
                EXPECT_TRUE(road.manager().get(settings.value[0].path).ok());
            }
            --readers;
        });
    clients.emplace_back([&] {
        char error[256] = "";
        for (int turn = 0; readers > 0 || !seen_down; ++turn) {
            for (const char* state : {"FunctionalPortState", "PhysicalPortState"})
                vlnsim_set_value("100002564C000000", "portAttributes", state,
                                 turn / 30 % 2 ? "2" : "6", error, sizeof error);
            vlnsim_advance(6 * SECOND);
            if (seen_down)
                continue;
            for (const auto& port : road.manager().enumerate("VLNMPCA_EthernetPort").value)
                seen_down = seen_down || road::text_of(port, "Speed") == "0";
        }
    });
    clients.emplace_back([&] {
        for (unsigned turn = 0; readers > 0; ++turn) {
            host::Instance changed = settings.value[0];
            host::set(changed.properties, "current",
                      host::Value::unsigned_number(CMPI_uint32, 5 + turn % 20));
            EXPECT_TRUE(road.manager().modify(changed, {{"current"}}).ok());
        }
    });
    for (std::thread& client : clients)
        client.join();
}

// The first call of a fresh process, from many threads at once, builds one agent and scans once.
TEST(Concurrency, TheFirstCallsShareOneScan) {
    Road road;
    std::vector<std::thread> clients;
    for (int client = 0; client < CLIENTS; ++client)
        clients.emplace_back([&road] {
            EXPECT_EQ(road.manager().enumerate("VLNMPCA_Card").value.size(), 1u);
            EXPECT_EQ(road.manager().enumerate("VLNMPCA_EthernetPort").value.size(), 4u);
        });
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(vlnsim_calls("AX_InitLib"), 1u);
    // A table too small, the pass that looks for a NIC, the pass that creates.
    EXPECT_EQ(vlnsim_calls("AX_GetAllLocalHBAInstances"), 3u);
}

} // namespace
