// What a SAN costs: the pass over it, what is kept of it, and asking for what it made.
//
//   bench_san pass UNITS       two SAN passes, the first one with a scan of the adapters
//   bench_san volumes COUNT    one enumeration of so many volumes
//   bench_san resident UNITS   prints resident kilobytes before the module was loaded, and after
//                              every class was enumerated once, and the number of instances made
//
// What callgrind is to count stands in functions of its own.
#include "bench/bench_hooks.h"
#include "host/manager.h"
#include "simulator/vlnsim.h"

#include <dlfcn.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace {

constexpr const char* SCENARIO = VLN_SCENARIOS "/san-4096-luns.json";
constexpr const char* VOLUME = "VLNMPCA_StorageVolume";
constexpr unsigned TARGETS = 16; // in the scenario, of 256 units each

[[noreturn]] void fail(const std::string& text) {
    std::fprintf(stderr, "bench_san: %s\n", text.c_str());
    std::exit(2);
}

// The scenario with another number of units.
std::string san_of(unsigned units) {
    std::stringstream content;
    content << std::ifstream(SCENARIO).rdbuf();
    std::string text = content.str();
    const std::string as_it_is = "\"luns\": 256,";
    const std::size_t at = text.find(as_it_is);
    if (at == std::string::npos || units % TARGETS != 0)
        fail("the scenario has another form than expected");
    return text.replace(at, as_it_is.size(), "\"luns\": " + std::to_string(units / TARGETS) + ",");
}

// One target that has volumes alone.
std::string volumes(unsigned count) {
    return R"({"include": "parts/cna.json", "cards": [{"use": "cna", "functions": [{"use": "nic"},
        {"use": "fcoe", "targets": {"luns": )" +
           std::to_string(count) + R"(, "wwpn": "50:25:64:C0:00:00:00:01"}}]}]})";
}

void simulate(const std::string& scenario) {
    char error[512] = "";
    char folder[] = "/tmp/vorlan-bench-XXXXXX";
    if (!mkdtemp(folder))
        fail("no temporary folder");
    std::filesystem::create_directories(std::string(folder) + "/etc");
    vlnsim_use_virtual_clock(1400000000ull * 1000000);
    vlnsim_set_host_root(folder);
    if (vlnsim_load_scenario_text(scenario.c_str(), SCENARIO, error, sizeof error) ||
        vlnsim_open_libraries(error, sizeof error))
        fail(error);
}

template <class Function>
Function hook(const char* name) {
    void* module = dlopen(VLN_BENCH_MODULE, RTLD_NOW);
    void* symbol = module ? dlsym(module, name) : nullptr;
    if (!symbol)
        fail(dlerror());
    return reinterpret_cast<Function>(symbol);
}

unsigned long resident_kilobytes() {
    unsigned long size = 0;
    unsigned long resident = 0;
    if (std::FILE* file = std::fopen("/proc/self/statm", "r")) {
        if (std::fscanf(file, "%lu %lu", &size, &resident) != 2)
            resident = 0;
        std::fclose(file);
    }
    return resident * static_cast<unsigned long>(sysconf(_SC_PAGESIZE)) / 1024;
}

} // namespace

// The one enumeration that is counted.
extern "C" __attribute__((noinline)) std::size_t vln_measured(host::Manager& manager) {
    return manager.enumerate(VOLUME).value.size();
}

namespace {

void measure_resident(host::Manager& manager, unsigned long before) {
    for (const host::Class* known : manager.provider_classes())
        manager.enumerate(known->name);
    const unsigned long after = resident_kilobytes();
    std::printf("%lu %lu %u\n", before, after,
                hook<decltype(&vln_bench_instances)>("vln_bench_instances")());
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 3)
        fail("usage: bench_san pass|resident UNITS, or volumes COUNT");
    const std::string mode = argv[1];
    const auto count = static_cast<unsigned>(std::strtoul(argv[2], nullptr, 10));
    simulate(mode == "volumes" ? volumes(count) : san_of(count));
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const unsigned long before = resident_kilobytes();
    const host::Status status = manager.load(VLN_BENCH_MODULE);
    if (!status.ok())
        fail(status.message);
    if (mode == "resident") {
        measure_resident(manager, before);
        return 0;
    }
    manager.enumerate(VOLUME); // what happens once is not counted
    if (mode == "pass")
        hook<decltype(&vln_bench_san_refresh)>("vln_bench_san_refresh")();
    else if (mode != "volumes")
        fail("unknown mode " + mode);
    else if (vln_measured(manager) != count)
        fail("saw another number of volumes");
    return 0;
}
