// Clients, classes and processes that end at the worst moment. A library call that stands still
// puts the provider there.
#include "tests/hostile/sudden_ends.h"

#include <atomic>
#include <fcntl.h>
#include <pthread.h>
#include <semaphore.h>
#include <sys/wait.h>
#include <unistd.h>

// What only the threads of the parent point to is no leak of the child, as the leak sanitizer would
// have it.
static bool is_forked_child = false;
extern "C" __attribute__((visibility("default"))) int __lsan_is_turned_off() {
    return is_forked_child;
}

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
        Held_Road road;
        hold(row.held);
        std::thread first([&] { road->manager().enumerate("VLNMPCA_Card"); });
        wait_until_held();
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

// ---- Classes ----

const std::string ENDED_EARLY = "PERF: Clearing the previous thread...with join";

// The refresh has the broker of the class whose call started it, and ends before that goes. A
// client of another class gets the whole of what it waits for all the same.
TEST(SuddenEnds, AClassTakesItsRefreshAlongAndNobodyElses) {
    Held_Road road(true);
    road->enumerate("VLNMPCA_Product");
    road.stand_in_san_pass("VLNMPCA_Card");
    // Not the refresh's class: goes at once, while the pass stands.
    EXPECT_TRUE(road->manager().cleanup("VLNMPCA_Product", true).ok());
    std::thread client([&] { EXPECT_EQ(road->enumerate("VLNMPCA_StorageVolume").size(), UNITS); });
    rest();
    std::thread letting_go = road.let_go_after(ENDED_EARLY);
    EXPECT_TRUE(road->manager().cleanup("VLNMPCA_Card", true).ok());
    client.join();
    letting_go.join();
    EXPECT_EQ(road->enumerate("VLNMPCA_Card").size(), 1u);
    EXPECT_EQ(vlnsim_calls("AX_InitLib"), 1u);
}

// Virtual ports can have more units than an unload may wait for. A part of them is shown to nobody.
TEST(SuddenEnds, AClassDoesNotWaitForTheUnitsOfVirtualPorts) {
    Held_Road road(true, "virtual-ports.json");
    road->enumerate("VLNMPCA_Product");
    road.stand_in_san_pass("VLNMPCA_Card", "AX_VpScsiInquiry");
    const unsigned long asked = vlnsim_calls("AX_VpScsiInquiry");
    std::thread letting_go = road.let_go_after(ENDED_EARLY);
    EXPECT_TRUE(road->manager().cleanup("VLNMPCA_Card", true).ok());
    letting_go.join();
    EXPECT_LE(vlnsim_calls("AX_VpScsiInquiry"), asked + 2) << "the next attempts at the same unit";
    EXPECT_EQ(road->enumerate("VLNMPCA_VirtualStorageVolume").size(), 7u);
    EXPECT_EQ(road->enumerate("VLNMPCA_SCSIProtocolInitiatorEndpoint").size(), 6u);
}

TEST(SuddenEnds, TheStatusThreadGoesWithThePortsAndComesBackWithThem) {
    road::Road road({.scenario = SCENARIO});
    road.enumerate("VLNMPCA_Card");
    for (int life = 0; life < 3; ++life) {
        road.enumerate("VLNMPCA_EthernetPort");
        while (vlnsim_paused() == 0)
            std::this_thread::yield();
        EXPECT_TRUE(road.manager().cleanup("VLNMPCA_EthernetPort", true).ok());
        EXPECT_EQ(vlnsim_paused(), 0u);
        vlnsim_advance(STALE);
    }
    EXPECT_EQ(road.enumerate("VLNMPCA_Card").size(), 1u);
}

// Eight clients of the SAN, each of another class, before and during a pass and twice after it,
// whether it reads the devices or makes the stores.
TEST(SuddenEnds, ABusyConsoleSettlesAfterOnePass) {
    constexpr const char* CLASSES[] = {"VLNMPCA_StorageVolume",
                                       "VLNMPCA_SCSIProtocolEndpoint",
                                       "VLNMPCA_LocalHostedAccessPoint",
                                       "VLNMPCA_StorageVolumeSystemDevice",
                                       "VLNMPCA_SCSIInitiatorTargetStorageVolumePath",
                                       "VLNMPCA_TapeDrive",
                                       "VLNMPCA_LogicalDisk",
                                       "VLNMPCA_StorageExtent"};
    for (const char* held : {"HBA_GetFcpTargetMapping", "HBA_SendReadCapacity"}) {
        SCOPED_TRACE(held);
        Held_Road road(true);
        hold(held);
        std::vector<std::thread> clients;
        for (std::size_t client = 0; client < std::size(CLASSES); ++client)
            clients.emplace_back([&, client] {
                if (client >= 2)
                    wait_until_held();
                const std::size_t first = road->enumerate(CLASSES[client]).size();
                EXPECT_EQ(first > 0, client < 5) << CLASSES[client];
                for (int look = 0; look < 2; ++look)
                    EXPECT_EQ(road->enumerate(CLASSES[client]).size(), first);
            });
        wait_until_held();
        while (road->count_in_log(" Entering BuildCimpleInfo()") < std::size(CLASSES))
            std::this_thread::yield();
        vlnsim_clear_faults();
        for (std::thread& client : clients)
            client.join();
        road->close();
        EXPECT_EQ(road->count_in_log("PERF: Building SAN Data..."), 1u);
    }
}

// What joins the adapters' picture with the SAN's is shown whole, whenever a refresh is looked at:
// by clients that come before its SAN pass and by those that come in it.
TEST(SuddenEnds, JoinedClassesAreWholeAcrossARefresh) {
    constexpr const char* JOINED[] = {"VLNMPCA_SAPAvailableForEthernetPort",
                                      "VLNMPCA_iSCSIProtocolEndpointSAPImplementation",
                                      "VLNMPCA_iSCSIBindsToTCP"};
    road::Road road({.scenario = road::card(R"({"use": "nic"},
        {"use": "iscsi", "iscsiTargets": {"sessions": {}}})"),
                     .log = true});
    for (const char* name : JOINED)
        EXPECT_EQ(road.enumerate(name).size(), 1u) << name;
    std::size_t refreshes = 0;
    for (const char* held : {"AX_GetHBAAttributes", "AX_iSCSI_GetTargets"}) {
        SCOPED_TRACE(held);
        road.wait_for_refreshes(++refreshes);
        vlnsim_advance(STALE);
        hold(held);
        std::thread first([&] { EXPECT_EQ(road.enumerate("VLNMPCA_iSCSISession").size(), 1u); });
        wait_until_held();
        std::vector<std::thread> clients;
        for (const char* name : JOINED)
            clients.emplace_back([&, name] { EXPECT_EQ(road.enumerate(name).size(), 1u) << name; });
        rest();
        vlnsim_clear_faults();
        for (std::thread& client : clients)
            client.join();
        first.join();
    }
}

// ---- Up-calls ----

// A provider of the platform that asks for our classes before it answers: on the same thread, and,
// once there is something to see, through another one.
TEST(SuddenEnds, APlatformProviderMayAskUsOnItsWay) {
    host::Manager* manager = nullptr;
    int asked = 0;
    const auto ask = [&](const std::string& line) {
        if (line.find("up-call enumerateInstances root/ibmse:IBMSD_ComputerSystem") != 0)
            return;
        const std::size_t present = asked++ == 0 ? 0 : 1;
        for (const char* name : {"VLNMPCA_Product", "VLNMPCA_Card", "VLNMPCA_FCPortStatistics"})
            EXPECT_EQ(manager->enumerate(name).value.size(), present) << name;
        manager->enumerate("VLNMPCA_StorageVolume");
        if (!present)
            return;
        std::thread other(
            [&] { EXPECT_EQ(manager->enumerate("VLNMPCA_Product").value.size(), present); });
        other.join();
    };
    road::Road road({.scenario = SCENARIO, .platform = road::PLATFORM, .log = true, .trace = ask});
    manager = &road.manager();
    for (std::size_t refresh = 1; refresh <= 2; ++refresh) {
        EXPECT_EQ(road.enumerate("VLNMPCA_Product").size(), 1u);
        road.wait_for_refreshes(refresh);
        vlnsim_advance(STALE);
    }
    EXPECT_EQ(asked, 2);
}

// ---- Processes ----

// Both semaphores are gone when all that the provider had to do at the end is done.
void check_names() {
    for (const char* prefix : {"/VLN_AX_INIT_LIB_", "/VLN_AX_INIT_LIB_DONE_"})
        if (sem_open((prefix + std::to_string(getpid())).c_str(), 0) != SEM_FAILED)
            _exit(7);
}

// A process with both threads alive: the refresh stands in a call, the status thread rests.
Held_Road& busy_process() {
    std::atexit(check_names); // registered first, so run last
    static Held_Road* const road = new Held_Road;
    (*road)->enumerate("VLNMPCA_EthernetPort");
    road->stand_in_san_pass("VLNMPCA_Card");
    return *road;
}

void let_go_soon() {
    std::thread([] {
        rest();
        vlnsim_clear_faults();
    }).detach();
}

class Process_Ends : public testing::Test {
protected:
    void SetUp() override { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

TEST_F(Process_Ends, WithAPassUnderWay) {
    const auto end = [] {
        busy_process();
        let_go_soon();
        std::exit(0);
    };
    EXPECT_EXIT(end(), testing::ExitedWithCode(0), "");
}

// A child has the provider's memory and none of its threads: it waits for none, and takes nothing
// from its parent.
TEST_F(Process_Ends, AsAForkedChild) {
    const auto end = [] {
        Held_Road& road = busy_process();
        const pid_t child = fork();
        if (child == 0) {
            is_forked_child = true;
            std::exit(0);
        }
        int status = 1;
        waitpid(child, &status, 0);
        vlnsim_clear_faults();
        const bool is_served = road->enumerate("VLNMPCA_Card").size() == 1;
        std::exit(WIFEXITED(status) && is_served ? WEXITSTATUS(status) : 1);
    };
    EXPECT_EXIT(end(), testing::ExitedWithCode(0), "");
}

// The object manager drops the module without a word, and takes it up again.
TEST_F(Process_Ends, AfterTheModuleWasDropped) {
    const auto end = [] {
        Held_Road& road = busy_process();
        road->manager().abandon();
        vlnsim_clear_faults();
        host::Manager next;
        const bool is_served = next.load(VLN_MODULE).ok() &&
                               next.enumerate("VLNMPCA_Card").value.size() == 1 &&
                               next.fault_count() == 0;
        std::exit(is_served ? 0 : 1);
    };
    EXPECT_EXIT(end(), testing::ExitedWithCode(0), "");
}

} // namespace
