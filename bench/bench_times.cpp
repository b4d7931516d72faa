// Wall-clock times, for orientation: they vary with the machine, the instruction counts do not.
#include "bench/bench_hooks.h"
#include "host/manager.h"
#include "simulator/vlnsim.h"

#include <benchmark/benchmark.h>

#include <dlfcn.h>
#include <stdlib.h>

#include <filesystem>
#include <memory>
#include <string>

namespace {

void simulate(const char* scenario) {
    static const std::string root = [] {
        char folder[] = "/tmp/vorlan-bench-XXXXXX";
        const char* made = mkdtemp(folder);
        std::filesystem::create_directories(std::string(made ? made : "/tmp") + "/etc");
        return std::string(made ? made : "/tmp");
    }();
    char error[512] = "";
    vlnsim_reset();
    vlnsim_use_virtual_clock(1400000000ull * 1000000);
    vlnsim_set_host_root(root.c_str());
    if (vlnsim_load_scenario((std::string(VLN_SCENARIOS "/") + scenario).c_str(), error,
                             sizeof error) ||
        vlnsim_open_libraries(error, sizeof error)) {
        std::fprintf(stderr, "%s\n", error);
        std::exit(2);
    }
}

void load_module(benchmark::State& state) {
    for (auto _ : state) {
        void* module = dlopen(VLN_SIMULATED_MODULE, RTLD_NOW);
        benchmark::DoNotOptimize(module);
        dlclose(module);
    }
}
BENCHMARK(load_module)->Unit(benchmark::kMicrosecond);

// From the first call of a fresh agent, with its scan of the adapters, to the answer.
void first_enumeration(benchmark::State& state) {
    simulate("two-port-cna.json");
    host::Manager manager;
    manager.load(VLN_SIMULATED_MODULE);
    for (auto _ : state) {
        benchmark::DoNotOptimize(manager.enumerate("VLNMPCA_EthernetPort"));
        state.PauseTiming();
        manager.cleanup(true);
        state.ResumeTiming();
    }
}
BENCHMARK(first_enumeration)->Unit(benchmark::kMicrosecond);

void enumeration_from_the_cache(benchmark::State& state) {
    simulate("two-port-cna.json");
    host::Manager manager;
    manager.load(VLN_SIMULATED_MODULE);
    manager.enumerate("VLNMPCA_EthernetPort");
    for (auto _ : state)
        benchmark::DoNotOptimize(manager.enumerate("VLNMPCA_EthernetPort"));
}
BENCHMARK(enumeration_from_the_cache)->Unit(benchmark::kMicrosecond);

// So many calls of a function of the management library, with its binding and without.
void library_calls(benchmark::State& state, const char* hook) {
    simulate("two-port-cna.json");
    host::Manager manager;
    manager.load(VLN_BENCH_MODULE);
    manager.enumerate("VLNMPCA_Card");
    void* module = dlopen(VLN_BENCH_MODULE, RTLD_NOW);
    const auto work = reinterpret_cast<void (*)()>(module ? dlsym(module, hook) : nullptr);
    if (!work) {
        state.SkipWithError("no such hook");
        return;
    }
    for (auto _ : state)
        work();
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * VLN_BENCH_CALLS);
    dlclose(module);
}
BENCHMARK_CAPTURE(library_calls, bound, "vln_bench_bound_calls");
BENCHMARK_CAPTURE(library_calls, direct, "vln_bench_direct_calls");

} // namespace

BENCHMARK_MAIN();
