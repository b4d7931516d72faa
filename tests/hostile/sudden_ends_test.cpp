// Clients, classes and processes that end at the worst moment. A library call that stands still
// puts the provider there.
#include "tests/hostile/sudden_ends.h"

#include <pthread.h>
#include <thread>

namespace {

using namespace sudden_ends;

// A client that waits for the provider is cancelled: it ends, lets go of what it held, and whoever
// comes next is answered.
TEST(SuddenEnds, ACancelledClientHoldsUpNobody) {
    struct {
        const char* where;
        const char* held;       // the call that the refresh stands in
        const char* class_name; // what the client asks for
    } const rows[] = {
        {"gate of the adapter maps", "AX_GetHBAAttributes", "VLNMPCA_Product"},
        {"gate of the adapter data", "AX_GetHBAAttributes", "VLNMPCA_EthernetPort"},
        {"gate of the SAN maps", "HBA_SendReadCapacity", "VLNMPCA_StorageVolume"},
        {"the gate's own lock", "HBA_SendReadCapacity", "VLNMPCA_Product"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.where);
        Held_Road road(row.held);
        std::thread first([&] { road->manager().enumerate("VLNMPCA_Card"); });
        road.wait_until_held();
        std::thread client([&] { road->manager().enumerate(row.class_name); });
        rest();
        pthread_cancel(client.native_handle());
        rest();
        vlnsim_clear_faults();
        client.join();
        first.join();
        EXPECT_GT(road->enumerate(row.class_name).size(), 0u);
    }
}

} // namespace
