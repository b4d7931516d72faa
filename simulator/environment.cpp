// A simulated host in a process that knows nothing of the simulator: the environment describes it.
#include "simulator/call.h"

#include <cstdlib>
#include <filesystem>

namespace {

using namespace vlnsim;

constexpr const char* root_variable = "VLNSIM_HOST_ROOT";

bool host_is_chosen() {
    Simulator& simulator = Simulator::instance();
    std::lock_guard lock(simulator.mutex);
    return simulator.scenario_chosen;
}

} // namespace

int vlnsim_make_host_root(const char* folder, char* error, size_t size) {
    namespace fs = std::filesystem;
    std::error_code fault;
    const fs::path root = fs::absolute(folder ? folder : "", fault);
    for (const char* part : {"etc", "var/log", "tmp", "proc"}) {
        if (!fault)
            fs::create_directories(root / part, fault);
        if (fault) {
            if (error)
                copy_text("the folder " + (root / part).string() +
                              " cannot be made: " + fault.message(),
                          error, size);
            return 1;
        }
    }
    vlnsim_set_host_root(root.c_str());
    return 0;
}

void vlnsim_use_environment(void) {
    if (host_is_chosen())
        return;
    char error[4096] = "";
    const char* root = std::getenv(root_variable);
    if (root && *root && vlnsim_make_host_root(root, error, sizeof error) != 0)
        std::fprintf(stderr, "%s: %s\n", root_variable, error);
    if (vlnsim_open_libraries(error, sizeof error) != 0)
        std::fprintf(stderr, "the simulated libraries cannot be opened: %s\n", error);
}
