// What a SAN costs: the pass over it, what is kept of it, and asking for what it made.
//
//   bench_san pass UNITS       two SAN passes, the first one with a scan of the adapters
//   bench_san iscsi TARGETS    so many targets are added and logged in to, one after the other,
//   then
//                              one look at what they have
//   bench_san volumes COUNT    one enumeration of so many volumes; prints how many objects of the
//                              object manager were alive at its peak
//   bench_san resident UNITS   prints resident kilobytes before the module was loaded, and after
//                              every class was enumerated once, and the number of instances made
//
// What callgrind is to count stands in functions of its own.
#include "bench/bench_hooks.h"
#include "bench/bench_program.h"
#include "host/manager.h"

#include <cstdio>
#include <cstdlib>

namespace {

constexpr const char* ISCSI_SCENARIO = "iscsi-empty.json";
constexpr const char* VOLUME = "VLNMPCA_StorageVolume";

std::string iscsi_san_of(unsigned targets) {
    return changed_scenario(ISCSI_SCENARIO, "{\"count\": 2,",
                            "{\"count\": " + std::to_string(targets) + ",");
}

} // namespace

// The one enumeration that is counted.
extern "C" __attribute__((noinline)) std::size_t vln_measured(host::Manager& manager) {
    return manager.enumerate(VOLUME).value.size();
}

// The changes that are counted.
extern "C" __attribute__((noinline)) void vln_measured_changes(host::Manager& manager,
                                                               unsigned count) {
    const auto service = manager.enumerate("VLNMPCA_iSCSISettingService").value.at(0).path;
    for (unsigned i = 1; i <= count; ++i) {
        const host::Named_Values inputs = {
            {"InitPortMACAddress", host::Value::text("100002564C000002")},
            {"TargetIPAddress", host::Value::text("198.51.100.200")},
            {"TargetName", host::Value::text("iqn.2010-04.com.example:shelf-" + std::to_string(i))},
            {"Login", host::Value::boolean(true)}};
        if (manager.invoke(service, "AddTarget", inputs).value.value.as_unsigned() != 0)
            fail("a target was refused");
    }
}

namespace {

void measure_iscsi(host::Manager& manager, unsigned count) {
    vln_measured_changes(manager, count);
    if (vln_measured(manager) != count)
        fail("saw another number of volumes");
}

void measure_volumes(host::Manager& manager, unsigned count) {
    manager.restart_peak();
    if (vln_measured(manager) != count)
        fail("saw another number of volumes");
    std::printf("%zu\n", manager.statistics().objects_peak);
}

void measure_resident(host::Manager& manager, unsigned long before) {
    for (const host::Class* known : manager.provider_classes())
        manager.enumerate(known->name);
    const unsigned long after = resident_kilobytes();
    std::printf("%lu %lu %u\n", before, after,
                hook<decltype(&vln_bench_instances)>("vln_bench_instances")(true));
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 3)
        fail("usage: bench_san pass|resident UNITS, volumes COUNT, or iscsi TARGETS");
    const std::string mode = argv[1];
    const auto count = static_cast<unsigned>(std::strtoul(argv[2], nullptr, 10));
    simulate(mode == "volumes" ? one_target(count)
             : mode == "iscsi" ? iscsi_san_of(count)
                               : san_of(count));
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
    else if (mode == "iscsi")
        measure_iscsi(manager, count);
    else if (mode == "volumes")
        measure_volumes(manager, count);
    else
        fail("unknown mode " + mode);
    return 0;
}
