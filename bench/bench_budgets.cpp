// What the budgets are of (budgets.tsv): each row is one piece of work on a simulated host, done in
// vln_measured alone, once.
//
//   bench_budgets hosts         prints the names of the hosts
//   bench_budgets rows HOST     does the rows of a host, and prints their names in that order
//   bench_budgets memory HOST   prints what the host's first refresh leaves in memory, in kilobytes
//
// Nothing here looks at an Ethernet port: that would start the thread which polls the ports'
// states, and its work would fall into any row.
#include "bench/bench_hooks.h"
#include "bench/bench_program.h"
#include "host/manager.h"

#include <malloc.h>
#include <sys/prctl.h>

#include <cstdio>
#include <cstring>
#include <span>

namespace {

constexpr char FC_PORT[] = "VLNMPCA_FCPort";
constexpr char CONTROLLER[] = "VLNMPCA_PortController";
constexpr char VOLUME[] = "VLNMPCA_StorageVolume";
constexpr char SERVICE[] = "VLNMPCA_SoftwareInstallationService";

// A host at work, with what the rows ask about.
struct Bench {
    host::Manager& manager;
    host::ObjectPath source = {}; // of gets and walks
    host::ObjectPath service = {};
    host::Named_Values inputs = {}; // of the method
};

void expect(bool holds, const std::string& what) {
    if (!holds)
        fail("a row is not what it says: " + what);
}

// What a row started ends within it.
void settle() {
    hook<decltype(&vln_bench_settle)>("vln_bench_settle")();
}

// ---- What the rows do ----

void load(Bench& bench) {
    const host::Status status = bench.manager.load(VLN_BENCH_MODULE);
    expect(status.ok(), status.message);
}

// With the agent, the libraries and the whole first refresh.
void first_enumeration(Bench& bench) {
    expect(!bench.manager.enumerate(CONTROLLER).value.empty(), "first enumeration");
    settle();
}

void refresh(Bench&) {
    expect(hook<decltype(&vln_bench_whole_refresh)>("vln_bench_whole_refresh")(), "refresh");
}

void san_pass(Bench&) {
    expect(hook<decltype(&vln_bench_san_pass)>("vln_bench_san_pass")(), "SAN pass");
}

template <const char* CLASS, std::size_t COUNT>
void enumerate(Bench& bench) {
    expect(bench.manager.enumerate(CLASS).value.size() == COUNT, "enumeration");
}

template <const char* CLASS, std::size_t COUNT>
void names(Bench& bench) {
    expect(bench.manager.enumerate_names(CLASS).value.size() == COUNT, "names");
}

void get(Bench& bench) {
    expect(bench.manager.get(bench.source).ok(), "get");
}

void association(Bench& bench) {
    host::Association_Filter filter;
    filter.via = "VLNMPCA_FCControlledBy";
    expect(bench.manager.associators(bench.source, filter).value.size() == 1, "association");
}

void unfiltered_association(Bench& bench) {
    expect(bench.manager.associators(bench.source).value.size() > 10, "unfiltered association");
}

void method(Bench& bench) {
    const auto reply = bench.manager.invoke(bench.service, "GetHBAFeatures", bench.inputs);
    expect(reply.ok() && reply.value.value.as_unsigned() == 0, "method");
}

// ---- What goes before, and is not counted ----

// The providers of all classes are made, and what an association asks for the first time is asked.
void prepare_ports(Bench& bench) {
    bench.source = bench.manager.enumerate_names(FC_PORT).value.at(0);
    bench.service = bench.manager.enumerate_names(SERVICE).value.at(0);
    bench.inputs = {{"Target", host::Value::reference(bench.source)}};
    unfiltered_association(bench);
}

void prepare_volumes(Bench& bench) {
    bench.source = bench.manager.enumerate_names(VOLUME).value.at(0);
}

struct Row {
    const char* name; // null: not counted
    void (*work)(Bench&);
};

std::string blade() {
    return read_scenario("blade-16-functions.json");
}

std::string everything() {
    return read_scenario("everything.json");
}

std::string san() {
    return san_of(1024);
}

const Row BLADE[] = {
    {"load", load},
    {"first-enumeration", first_enumeration},
    {nullptr, prepare_ports},
    {nullptr, refresh}, // the first one finds lists that have not grown yet
    {"refresh-blade-16-functions", refresh},
    {"enumerate", enumerate<FC_PORT, 4>},
    {"names", names<FC_PORT, 4>},
    {"get", get},
    {"association", association},
    {"unfiltered-association", unfiltered_association},
    {"method", method},
};

const Row SAN[] = {
    {nullptr, load},
    {nullptr, first_enumeration},
    {nullptr, prepare_volumes},
    {"san-pass-1024-units", san_pass},
    {"enumerate-volumes", enumerate<VOLUME, 320>},
    {"names-volumes", names<VOLUME, 320>},
    {"get-volume", get},
};

const Row EVERYTHING[] = {
    {nullptr, load},
    {nullptr, first_enumeration},
    {nullptr, refresh},
    {"refresh-everything", refresh},
};

struct Bench_Host {
    const char* name;
    const char* file; // of the scenario: without it the host is not there
    std::string (*scenario)();
    std::span<const Row> rows;
};

const Bench_Host HOSTS[] = {
    {"blade", "blade-16-functions.json", blade, BLADE},
    {"san", "san-4096-luns.json", san, SAN},
    {"everything", "everything.json", everything, EVERYTHING},
};

const Bench_Host& find_host(const std::string& name) {
    for (const Bench_Host& known : HOSTS)
        if (name == known.name)
            return known;
    fail("unknown host " + name);
}

} // namespace

// What is counted.
extern "C" __attribute__((noinline)) void vln_measured(Bench& bench, const Row& row) {
    row.work(bench);
}

namespace {

void print_hosts() {
    for (const Bench_Host& known : HOSTS)
        if (has_scenario(known.file))
            std::printf("%s\n", known.name);
}

void do_rows(Bench& bench, const Bench_Host& host) {
    for (const Row& row : host.rows) {
        if (!row.name) {
            row.work(bench);
            continue;
        }
        vln_measured(bench, row);
        std::printf("%s\n", row.name);
    }
}

void measure_memory(Bench& bench) {
    const unsigned long before = resident_anonymous_kilobytes();
    load(bench);
    first_enumeration(bench);
    std::printf("%lu\n", resident_anonymous_kilobytes() - before);
}

} // namespace

int main(int argc, char** argv) {
    const std::string mode = argc > 1 ? argv[1] : "";
    if (mode == "hosts" && argc == 2) {
        print_hosts();
        return 0;
    }
    if ((mode != "rows" && mode != "memory") || argc != 3)
        fail("usage: bench_budgets hosts, rows HOST, or memory HOST");
    const Bench_Host& host = find_host(argv[2]);
    // Memory counts by pages, alike on all machines: one heap, and no huge pages.
    mallopt(M_ARENA_MAX, 1);
    prctl(PR_SET_THP_DISABLE, 1, 0, 0, 0);
    simulate(host.scenario());
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    Bench bench = {manager};
    if (mode == "rows")
        do_rows(bench, host);
    else
        measure_memory(bench);
    return 0;
}
