// Many clients at once, with refreshes beneath them: always a whole picture or the one before it.
#include "tests/road/road.h"

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
