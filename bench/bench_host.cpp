// What a blade of four cards with four functions each costs, and the same host with more cards.
//
//   bench_host walk names|instances FACTOR   prints the number of sources and of answers
//   bench_host refresh FACTOR                prints instances made, microseconds of each refresh
//   bench_host latency FACTOR                prints median, 99 % and longest, in microseconds
//   bench_host memory FACTOR                 prints bytes taken per instance
//   bench_host virtual FUNCTIONS             one refresh of another host: 16 ports with so many
//                                            virtual functions each; prints instances made
//   bench_host vports PORTS                  the same of an FC port with so many virtual ports,
//                                            each of which sees 64 units
//
// FACTOR multiplies the cards. What callgrind is to count stands in functions of its own.
#include "bench/bench_hooks.h"
#include "bench/bench_program.h"
#include "host/manager.h"

#include <malloc.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <thread>

namespace {

constexpr const char* SCENARIO = "blade-16-functions.json";

// The scenario with each group of two cards multiplied.
std::string scenario(unsigned factor) {
    std::string text = read_scenario(SCENARIO);
    const std::string two = "\"count\": 2,";
    const std::string more = "\"count\": " + std::to_string(2 * factor) + ",";
    std::size_t replaced = 0;
    for (std::size_t at = 0; (at = text.find(two, at)) != std::string::npos; at += more.size()) {
        text.replace(at, two.size(), more);
        ++replaced;
    }
    if (replaced != 2)
        fail("the scenario has another form than expected");
    return text;
}

std::string virtual_functions(unsigned count) {
    return R"({"include": "parts/cna.json", "cards": [{"use": "cna", "count": 8, "ports": 2,
        "functions": [{"use": "nic", "portAttributes": {"SRIOVState": 1},
                       "virtualFunctions": {"count": )" +
           std::to_string(count) + "}}]}]}";
}

std::string virtual_ports(unsigned count) {
    return R"({"include": "parts/cna.json", "cards": [{"use": "cna", "functions": [{"use": "nic"},
        {"use": "fcoe", "virtualPorts": [{"wwpn": "2001 0256 4C00 {vport:04X}", "count": )" +
           std::to_string(count) + R"(, "targets": {"luns": 64}}]}]}]})";
}

bool refresh() {
    static const auto run = hook<decltype(&vln_bench_refresh)>("vln_bench_refresh");
    return run();
}

unsigned stored_instances(bool san) {
    return hook<decltype(&vln_bench_instances)>("vln_bench_instances")(san);
}

std::vector<host::ObjectPath> every_instance(host::Manager& manager) {
    std::vector<host::ObjectPath> paths;
    for (const host::Class* known : manager.provider_classes()) {
        auto reply = manager.enumerate_names(known->name);
        std::move(reply.value.begin(), reply.value.end(), std::back_inserter(paths));
    }
    return paths;
}

double microseconds_since(std::chrono::steady_clock::time_point start) {
    return std::chrono::duration<double, std::micro>(std::chrono::steady_clock::now() - start)
        .count();
}

} // namespace

// Every association of every source: the references and what they lead to.
extern "C" __attribute__((noinline)) std::size_t
vln_measured(host::Manager& manager, const std::vector<host::ObjectPath>& sources, bool names) {
    std::size_t answers = 0;
    for (const host::ObjectPath& source : sources) {
        if (names) {
            answers += manager.reference_names(source).value.size();
            answers += manager.associator_names(source).value.size();
        } else {
            answers += manager.references(source).value.size();
            answers += manager.associators(source).value.size();
        }
    }
    return answers;
}

namespace {

void walk(host::Manager& manager, bool names) {
    const auto sources = every_instance(manager);
    std::printf("%zu %zu\n", sources.size(), vln_measured(manager, sources, names));
}

void refresh_once() {
    if (!refresh())
        fail("no refresh was due");
    std::printf("%u\n", stored_instances(false));
}

void time_refreshes() {
    constexpr int REFRESHES = 20;
    if (!refresh())
        fail("no refresh was due");
    const auto start = std::chrono::steady_clock::now();
    for (int i = 0; i < REFRESHES; ++i)
        refresh();
    const double time = microseconds_since(start) / REFRESHES;
    std::printf("%u %.0f\n", stored_instances(false), time);
}

// One thread keeps a refresh running; this one enumerates.
void measure_latency(host::Manager& manager) {
    constexpr std::size_t ENUMERATIONS = 1000;
    std::atomic<bool> stop{false};
    std::thread refresher([&] {
        while (!stop)
            refresh();
    });
    std::vector<double> times;
    while (times.size() < ENUMERATIONS) {
        const auto start = std::chrono::steady_clock::now();
        manager.enumerate("VLNMPCA_EthernetPort");
        times.push_back(microseconds_since(start));
    }
    stop = true;
    refresher.join();
    std::sort(times.begin(), times.end());
    std::printf("%.0f %.0f %.0f\n", times[ENUMERATIONS / 2], times[ENUMERATIONS * 99 / 100],
                times.back());
}

// Of the heap: the stores and the model of the devices behind them.
void measure_memory(host::Manager& manager, std::size_t before) {
    manager.enumerate("VLNMPCA_EthernetPort");
    refresh(); // so that nothing of the first one is still being made
    const std::size_t taken = mallinfo2().uordblks - before;
    std::printf("%.0f\n", static_cast<double>(taken) / stored_instances(true));
}

} // namespace

int main(int argc, char** argv) {
    const std::string mode = argc > 1 ? argv[1] : "";
    if (argc != (mode == "walk" ? 4 : 3))
        fail("usage: bench_host walk names|instances FACTOR, or refresh|latency|memory FACTOR, or "
             "virtual FUNCTIONS, or vports PORTS");
    mallopt(M_ARENA_MAX, 1); // all threads' memory in one count
    const auto number = static_cast<unsigned>(std::strtoul(argv[argc - 1], nullptr, 10));
    simulate(mode == "virtual"  ? virtual_functions(number)
             : mode == "vports" ? virtual_ports(number)
                                : scenario(number));
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const host::Status status = manager.load(VLN_BENCH_MODULE);
    if (!status.ok())
        fail(status.message);
    hook<decltype(&vln_bench_refresh)>("vln_bench_refresh");
    const std::size_t before = mallinfo2().uordblks;
    if (mode == "memory") {
        measure_memory(manager, before);
        return 0;
    }
    manager.enumerate("VLNMPCA_EthernetPort"); // what happens once is not counted
    if (mode == "walk")
        walk(manager, std::string(argv[2]) == "names");
    else if (mode == "refresh")
        time_refreshes();
    else if (mode == "virtual" || mode == "vports")
        refresh_once();
    else if (mode == "latency")
        measure_latency(manager);
    else
        fail("unknown mode " + mode);
    return 0;
}
