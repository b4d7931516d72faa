#include "simulator/simulator.h"

#include "simulator/host_files.h"
#include "simulator/scenario.h"

#include <algorithm>
#include <cstdlib>

namespace vlnsim {
namespace {

constexpr const char* scenario_variable = "VLNSIM_SCENARIO";
constexpr std::size_t max_violations = 10000;

} // namespace

Simulator& Simulator::instance() {
    static Simulator* const simulator = new Simulator;
    return *simulator;
}

void Simulator::choose_scenario() {
    if (scenario_chosen)
        return;
    scenario_chosen = true;
    const char* path = std::getenv(scenario_variable);
    if (!path || !*path)
        return;
    try {
        replace_host(read_scenario(read_file(path), path), path);
    } catch (const std::exception& e) {
        std::fprintf(stderr, "%s\n", e.what());
        host.initialisation = AX_STATUS_ERROR;
    }
}

void Simulator::replace_host(Host fresh, std::string name) {
    described = std::move(fresh);
    scenario_name = std::move(name);
    scenario_chosen = true;
    restart();
}

void Simulator::restart() {
    host = described;
    initialised = false;
    hba_loaded = false;
    handles.clear();
    tests.clear();
    next_test = 1;
    forget_faults();
    faults = host.faults;
    violations.clear();
    forget_calls();
    write_files(host, true);
}

void Simulator::forget_faults() {
    faults.clear();
    ++clearances;
    cleared.notify_all();
}

void Simulator::wait_for_clearance(std::unique_lock<std::mutex>& lock) {
    const unsigned long before = clearances;
    ++held;
    cleared.wait(lock, [&] { return clearances != before; });
    --held;
}

void Simulator::forget_calls() {
    calls.fill(0);
    lookups.clear();
    recorded.clear();
}

void Simulator::add_violation(Entry entry, const std::string& what) {
    if (violations.size() < max_violations)
        violations.push_back(std::string(entry_name(entry)) + ": " + what);
}

Function* Simulator::find_function(std::uint64_t wwpn) {
    for (Function& function : host.functions)
        if (function.wwpn == wwpn)
            return &function;
    return nullptr;
}

bool Simulator::is_former_name(std::uint64_t wwpn) const {
    return std::any_of(host.functions.begin(), host.functions.end(), [&](const Function& each) {
        return std::find(each.former_wwpns.begin(), each.former_wwpns.end(), wwpn) !=
               each.former_wwpns.end();
    });
}

Function* Simulator::find_dead_port(std::uint64_t address) {
    for (Function& port : host.dead_ports)
        if (port.mac_address() == address)
            return &port;
    return nullptr;
}

Function* Simulator::find_instance(std::uint32_t instance) {
    for (Function& function : host.functions)
        if (function.instance == instance)
            return &function;
    return nullptr;
}

Function* Simulator::find_hba_adapter(std::string_view name) {
    for (Function& function : host.functions)
        if (function.hba_name && *function.hba_name == name)
            return &function;
    return nullptr;
}

std::vector<Function*> Simulator::hba_adapters() {
    std::vector<Function*> adapters;
    for (Function& function : host.functions)
        if (function.hba_name)
            adapters.push_back(&function);
    return adapters;
}

} // namespace vlnsim
