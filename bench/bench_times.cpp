// Wall-clock times, for orientation: they vary with the machine, the instruction counts do not.
#include "bench/bench_hooks.h"
#include "bench/bench_program.h"
#include "host/manager.h"

#include <benchmark/benchmark.h>

#include <dlfcn.h>
#include <stdlib.h>

#include <filesystem>
#include <memory>
#include <string>

namespace {

// The module stays in memory once it was loaded, so each turn loads a copy of its own.
void load_module(benchmark::State& state) {
    char folder[] = "/tmp/vln_bench.XXXXXX";
    if (!mkdtemp(folder))
        return state.SkipWithError("no folder for copies of the module");
    for (auto _ : state) {
        state.PauseTiming();
        static int turn = 0; // a name that was loaded is not loaded again
        const std::string copy = std::string(folder) + "/" + std::to_string(++turn);
        std::filesystem::copy_file(VLN_SIMULATED_MODULE, copy);
        state.ResumeTiming();
        if (!dlopen(copy.c_str(), RTLD_NOW)) {
            state.SkipWithError(dlerror());
            break;
        }
    }
    std::filesystem::remove_all(folder);
}
BENCHMARK(load_module)->Unit(benchmark::kMicrosecond)->Iterations(100);

// From the first call of a fresh agent, with its scan of the adapters, to the answer.
void first_enumeration(benchmark::State& state) {
    simulate(read_scenario("two-port-cna.json"));
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
    simulate(read_scenario("two-port-cna.json"));
    host::Manager manager;
    manager.load(VLN_SIMULATED_MODULE);
    manager.enumerate("VLNMPCA_EthernetPort");
    for (auto _ : state)
        benchmark::DoNotOptimize(manager.enumerate("VLNMPCA_EthernetPort"));
}
BENCHMARK(enumeration_from_the_cache)->Unit(benchmark::kMicrosecond);

// So many calls of a function of the management library, with its binding and without.
void library_calls(benchmark::State& state, const char* name) {
    simulate(read_scenario("two-port-cna.json"));
    host::Manager manager;
    manager.load(VLN_BENCH_MODULE);
    manager.enumerate("VLNMPCA_Card");
    const auto work = hook<void (*)()>(name);
    for (auto _ : state)
        work();
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * VLN_BENCH_CALLS);
}
BENCHMARK_CAPTURE(library_calls, bound, "vln_bench_bound_calls");
BENCHMARK_CAPTURE(library_calls, direct, "vln_bench_direct_calls");

} // namespace

BENCHMARK_MAIN();
