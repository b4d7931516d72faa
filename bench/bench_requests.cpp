// What single kinds of requests cost for storage volumes: the library beside providers written by
// hand, in the same object manager.
//
//   bench_requests floor|library names|instances|get|association COUNT
//   bench_requests library associations COUNT
//
// COUNT volumes are there. association asks one that has nothing to say about a volume,
// associations all of these. Prints the number of answers, of gets or of associations asked.
#include "bench/bench_program.h"
#include "host/manager.h"

#include <cstdio>
#include <cstdlib>

namespace {

constexpr const char* VOLUME = "VLNMPCA_StorageVolume";
constexpr const char* ASSOCIATION = "VLNMPCA_Realizes"; // which the floor has as well
constexpr std::size_t TIMES = 100;                      // that a small request is made

struct Requests {
    host::Manager& manager;
    std::string what;
    std::vector<host::ObjectPath> volumes;
    std::vector<host::Association_Filter> associations;
};

host::Association_Filter named(const std::string& association) {
    host::Association_Filter filter;
    filter.via = association;
    return filter;
}

std::vector<host::Association_Filter> silent_associations(host::Manager& manager,
                                                          const host::ObjectPath& volume) {
    std::vector<host::Association_Filter> silent;
    for (const host::Class* known : manager.provider_classes()) {
        if (!known->is_association)
            continue;
        const auto reply = manager.associator_names(volume, named(known->name));
        if (reply.ok() && reply.value.empty())
            silent.push_back(named(known->name));
    }
    return silent;
}

} // namespace

// What is counted. Answers how many of its kind it has done.
extern "C" __attribute__((noinline)) std::size_t vln_measured(const Requests& requests) {
    host::Manager& manager = requests.manager;
    if (requests.what == "names")
        return manager.enumerate_names(VOLUME).value.size();
    if (requests.what == "instances")
        return manager.enumerate(VOLUME).value.size();
    std::size_t done = 0;
    if (requests.what == "get")
        for (std::size_t i = 0; i < TIMES; ++i)
            done += manager.get(requests.volumes[i * 7919 % requests.volumes.size()]).ok();
    for (const auto& filter : requests.associations)
        done += manager.associator_names(requests.volumes.front(), filter).value.empty();
    return done;
}

int main(int argc, char** argv) {
    if (argc != 4)
        fail(
            "usage: bench_requests floor|library names|instances|get|association COUNT, or library "
            "associations COUNT");
    const bool floor = std::string(argv[1]) == "floor";
    const auto count = static_cast<unsigned>(std::strtoul(argv[3], nullptr, 10));
    if (floor)
        setenv("VLN_FLOOR_INSTANCES", argv[3], 1);
    else
        simulate(one_target(count));
    host::Options options;
    options.strict = false;
    host::Manager manager(options);
    const host::Status status = manager.load(floor ? VLN_FLOOR_MODULE : VLN_BENCH_MODULE);
    if (!status.ok())
        fail(status.message);
    // What happens once is not counted.
    Requests requests = {manager, argv[2], manager.enumerate_names(VOLUME).value, {}};
    if (requests.volumes.size() != count || !manager.get(requests.volumes.front()).ok())
        fail("saw " + std::to_string(requests.volumes.size()) + " volumes");
    if (requests.what == "association")
        requests.associations.assign(TIMES, named(ASSOCIATION));
    else if (requests.what == "associations")
        requests.associations = silent_associations(manager, requests.volumes.front());
    std::printf("%zu\n", vln_measured(requests));
    return 0;
}
