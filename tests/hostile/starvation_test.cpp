// Want of memory at any one allocation of the product: the process lives, nothing is lost, and what
// was refused is there again after the next fresh start.
#include "tests/hostile/changes.h"
#include "tests/hostile/starving.h"

#include <dlfcn.h>
#include <pthread.h>
#include <set>
#include <thread>

using road::Road;

namespace {

// A card with everything, and few units behind it.
const std::string SCENARIO = R"({"include": ")" VLN_SCENARIOS R"(/parts/cna.json",
    "cards": [{"use": "cna", "functions": [{"use": "nic"}, {"use": "iscsi"},
        {"use": "fcoe", "targets": {"luns": 2, "wwpn": "50:25:64:C{port}:00:00:00:{target:02X}"}}]}]})";

template <class Hook>
Hook* find_hook(const char* name) {
    void* module = dlopen(VLN_MODULE, RTLD_LAZY | RTLD_NOLOAD);
    void* hook = module ? dlsym(module, name) : nullptr;
    if (module)
        dlclose(module);
    return reinterpret_cast<Hook*>(hook);
}

// A fresh agent, a look at every shape of class and of request, and the end of the agent. Answers
// how many ports there were.
std::size_t one_life(Road& road) {
    vlnsim_restart();
    host::Manager& manager = road.manager();
    for (const char* name : {"VLNMPCA_StorageVolume", "VLNMPCA_Card", "VLNMPCA_FCPortStatistics",
                             "VLNMPCA_BaseServerReferencedProfile", "VLNMPCA_EthernetPort"})
        manager.enumerate(name);
    const auto ports = manager.enumerate_names("VLNMPCA_EthernetPort").value;
    for (const host::ObjectPath& port : ports) {
        manager.get(port);
        manager.associators(port);
        manager.reference_names(port);
    }
    for (const host::Instance& setting : manager.enumerate("VLNMPCA_ProviderConfigSetting").value)
        manager.modify(setting);
    manager.cleanup(true);
    return ports.size();
}

TEST(Starvation, AnyOneAllocationMayFail) {
    Road road({.scenario = SCENARIO});
    auto* const starve_hook = find_hook<decltype(starve)>("starve");
    ASSERT_NE(starve_hook, nullptr);
    one_life(road); // what is made once for the process
    starve_hook(0);
    const std::size_t healthy = one_life(road);
    const unsigned long allocations = starve_hook(0);
    ASSERT_EQ(healthy, 2u);
    ASSERT_GT(allocations, 3000u);

    constexpr unsigned long FIRST = 150; // the start of an agent in full, then samples of the rest
    constexpr unsigned long SAMPLES = 250;
    const unsigned long step = allocations / SAMPLES + 1;
    for (unsigned long number = 1; number < allocations;
         number += number < FIRST ? 1 : step + number % 7) {
        SCOPED_TRACE("allocation " + std::to_string(number) + " of " + std::to_string(allocations));
        starve_hook(number);
        one_life(road);
        starve_hook(0);
        ASSERT_EQ(road.manager().live_object_count(), 0u);
        ASSERT_EQ(road.manager().fault_count(), 0u) << host::to_string(road.manager().faults()[0]);
        ASSERT_EQ(one_life(road), healthy) << "the next life is not whole";
    }
}

// A change answers, whatever it finds no memory for, and a method says so; the next agent makes it.
TEST(Starvation, AnyOneAllocationOfAChangeMayFail) {
    constexpr unsigned long SAMPLES = 40;
    for (const hostile::Change& row : hostile::read_changes()) {
        SCOPED_TRACE(row.what);
        Road road({.scenario = row.scenario});
        const hostile::Prepared_Change change(road, row);
        auto* const starve_hook = find_hook<decltype(starve)>("starve");
        const auto make_afresh = [&](unsigned long number) {
            EXPECT_TRUE(road.manager().cleanup(true).ok());
            vlnsim_restart();
            road.enumerate("VLNMPCA_StorageVolume"); // waits for the SAN pass
            starve_hook(number);
            return change.make();
        };
        const std::string healthy = make_afresh(0);
        const unsigned long allocations = starve_hook(0);
        std::set<std::string> answers;
        for (unsigned long number = 1; number <= allocations; number += allocations / SAMPLES + 1) {
            answers.insert(make_afresh(number));
            starve_hook(0);
            ASSERT_EQ(road.manager().fault_count(), 0u)
                << host::to_string(road.manager().faults()[0]);
        }
        EXPECT_TRUE(!change.is_method() || answers.contains("CMPI_RC_OK 32774"));
        EXPECT_EQ(make_afresh(0), healthy);
    }
}

// Without memory for the agent a class is loaded without a share in it: its cleanup takes nothing
// from the class that has found memory since.
TEST(Starvation, ACleanupUndoesWhatItsLoadTook) {
    Road road({.scenario = SCENARIO});
    auto* const starve_hook = find_hook<decltype(starve)>("starve");
    ASSERT_NE(starve_hook, nullptr);
    bool agent_failed = false;
    for (unsigned long number = 1; number <= 20; ++number) {
        SCOPED_TRACE("allocation " + std::to_string(number));
        vlnsim_restart();
        starve_hook(number);
        road.manager().enumerate("VLNMPCA_Product");
        starve_hook(0);
        agent_failed |= vlnsim_calls("AX_InitLib") == 0;
        const std::size_t cards = road.manager().enumerate("VLNMPCA_Card").value.size();
        EXPECT_TRUE(road.manager().cleanup("VLNMPCA_Product", true).ok());
        const unsigned long agents = vlnsim_calls("AX_InitLib");
        EXPECT_EQ(road.manager().enumerate("VLNMPCA_Card").value.size(), cards);
        EXPECT_EQ(vlnsim_calls("AX_InitLib"), agents);
        EXPECT_TRUE(road.manager().cleanup(true).ok());
    }
    EXPECT_TRUE(agent_failed);
}

// The refresh cannot be started: its client waits, everybody else's process goes on, and the next
// agent is whole. The status thread is tried again at the next look.
TEST(Starvation, AThreadThatCannotBeStarted) {
    Road road({.scenario = SCENARIO, .log = true});
    auto* const refuse = find_hook<decltype(refuse_threads)>("refuse_threads");
    ASSERT_NE(refuse, nullptr);
    refuse(true);
    std::thread client([&] { road.manager().enumerate("VLNMPCA_Product"); });
    while (road.count_in_log("[VLN_ERR] Error : DataFetch_Handler thread could not be started") ==
           0)
        std::this_thread::yield();
    pthread_cancel(client.native_handle());
    client.join();
    EXPECT_TRUE(road.manager().cleanup(true).ok());

    refuse(false);
    EXPECT_EQ(road.enumerate("VLNMPCA_Product").size(), 1u);
    refuse(true);
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 2u);
    EXPECT_EQ(road.count_in_log("[VLN_ERR] PERF: Thread DynamicDataFetch_Handler Creation failed"),
              1u);
    EXPECT_EQ(vlnsim_paused(), 0u);
    refuse(false);
    vlnsim_advance(11ull * 1000000);
    EXPECT_EQ(road.enumerate("VLNMPCA_EthernetPort").size(), 2u);
    while (vlnsim_paused() == 0)
        std::this_thread::yield();
}

} // namespace
