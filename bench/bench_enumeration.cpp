// One enumeration of VLNMPCA_EthernetPort, in a function that callgrind can be told to count alone.
//
//   bench_enumeration floor|provider|bound|direct|memory COUNT
//
// floor: the hand-written provider; provider: the library, its store filled up to COUNT; bound,
// direct: calls of a function of the management library, with its binding and without; memory:
// resident kilobytes after the first enumeration of a fresh process.
#include "bench/bench_hooks.h"
#include "bench/bench_program.h"
#include "host/manager.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr const char* CLASS_NAME = "VLNMPCA_EthernetPort";

} // namespace

// The one function whose instructions are counted.
extern "C" __attribute__((noinline)) std::size_t vln_measured(host::Manager& manager,
                                                              void (*work)()) {
    if (work) {
        work();
        return 0;
    }
    const auto reply = manager.enumerate(CLASS_NAME);
    return reply.value.size();
}

int main(int argc, char** argv) {
    if (argc != 3)
        fail("usage: bench_enumeration floor|provider|bound|direct|memory COUNT");
    const std::string mode = argv[1];
    const auto count = static_cast<unsigned>(std::strtoul(argv[2], nullptr, 10));
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const bool floor = mode == "floor";
    if (floor)
        setenv("VLN_FLOOR_INSTANCES", argv[2], 1);
    else
        simulate(read_scenario("two-port-cna.json"));
    const unsigned long before = resident_kilobytes();
    const char* module = floor              ? VLN_FLOOR_MODULE
                         : mode == "memory" ? VLN_SIMULATED_MODULE
                                            : VLN_BENCH_MODULE;
    const host::Status status = manager.load(module);
    if (!status.ok())
        fail(status.message);
    const auto first = manager.enumerate(CLASS_NAME); // what happens once is not counted
    if (mode == "memory") {
        std::printf("%lu %lu\n", before, resident_kilobytes());
        return 0;
    }
    if (!floor && hook<decltype(&vln_bench_fill)>("vln_bench_fill")(count) != count)
        fail("the store could not be filled");
    const char* work = mode == "bound"    ? "vln_bench_bound_calls"
                       : mode == "direct" ? "vln_bench_direct_calls"
                                          : nullptr;
    const std::size_t seen = vln_measured(manager, work ? hook<void (*)()>(work) : nullptr);
    if (!work && seen != count)
        fail("saw " + std::to_string(seen) + " instances");
    return 0;
}
