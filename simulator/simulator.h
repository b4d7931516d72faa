// The one simulated host of the process, with everything that is remembered about its callers.
#ifndef VLNSIM_SIMULATOR_H
#define VLNSIM_SIMULATOR_H

#include "simulator/entry_points.h"
#include "simulator/host_model.h"
#include "simulator/vlnsim.h"

#include <array>
#include <condition_variable>
#include <cstdio>
#include <map>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace vlnsim {

// A struct with a mutex: whoever touches the rest holds it. It lives from the first use to the end
// of the process, since threads may call the libraries for as long.
struct Simulator {
    static Simulator& instance();

    std::mutex mutex;

    Host host;
    Host described; // as the scenario has it, for a restart
    std::string scenario_name;
    bool scenario_chosen = false; // loaded, or looked for in the environment

    bool initialised = false;                     // AX_InitLib
    bool hba_loaded = false;                      // HBA_LoadLibrary
    std::map<std::uint32_t, std::string> handles; // open HBA API handles: the adapter's name
    std::uint32_t next_handle = 1;
    std::map<std::uint32_t, Test> tests; // by their handles
    std::uint32_t next_test = 1;

    std::array<unsigned long, entry_count> calls{};
    std::map<std::string, unsigned long> lookups;
    std::vector<Fault> faults;
    std::size_t held = 0;         // calls that wait for the rules to be cleared
    unsigned long clearances = 0; // of the rules
    std::condition_variable cleared;
    std::FILE* trace = nullptr;
    bool recording = false;
    std::vector<std::string> recorded;
    std::vector<std::string> violations;

    // All of these are called with the mutex held.

    // Loads the scenario that the environment names, unless one was chosen before. A bad one is
    // told on standard error, and AX_InitLib fails from then on.
    void choose_scenario();
    // With a host that nobody has called yet.
    void replace_host(Host fresh, std::string name);
    void restart();
    void forget_calls();
    void forget_faults();
    // Without the mutex meanwhile.
    void wait_for_clearance(std::unique_lock<std::mutex>& lock);
    void add_violation(Entry entry, const std::string& what);

    Function* find_function(std::uint64_t wwpn);
    // Whether a function had the name before its names changed.
    bool is_former_name(std::uint64_t wwpn) const;
    // By its MAC address as a number.
    Function* find_dead_port(std::uint64_t address);
    Function* find_instance(std::uint32_t instance);
    Function* find_hba_adapter(std::string_view name);
    std::vector<Function*> hba_adapters();
};

} // namespace vlnsim

#endif // VLNSIM_SIMULATOR_H
