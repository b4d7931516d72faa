// A dump that waits for a refresh: what else the dump service does is in tables/dump.txt.
#include "tests/hostile/sudden_ends.h"

using host::Value;

namespace {

// The refresh that the method waits for ends early, with the class that started it.
TEST(Dump_Wait, OutlastsNoRefresh) {
    sudden_ends::Held_Road road(true);
    const auto service = road->enumerate("VLNMPCA_DumpService").at(0).path;
    const auto port = road->enumerate("VLNMPCA_EthernetPort").at(0).path;
    road->wait_for_refreshes(1);
    road.up_calls.start_refresh(road->manager(), "VLNMPCA_Card");
    EXPECT_EQ(vlnsim_fault("AX_GenerateCoreDump", 1, VLNSIM_STATUS, 247), 0);
    std::thread client([&] {
        const auto reply = road->manager().invoke(service, "GenerateCoreDump",
                                                  {{"Target", Value::reference(port)}});
        EXPECT_EQ(reply.value.value.as_unsigned(), 0u);
    });
    while (road->count_in_log("Constructing the maps ") == 0)
        std::this_thread::yield();
    std::thread letting_go([&] {
        while (road->count_in_log("PERF: Clearing the previous thread...with join") == 0)
            std::this_thread::yield();
        road.up_calls.let_go();
    });
    EXPECT_TRUE(road->manager().cleanup("VLNMPCA_Card", true).ok());
    client.join();
    letting_go.join();
    EXPECT_EQ(road->enumerate("VLNMPCA_Card").size(), 1u);
}

} // namespace
