// The module for simulation bears the simulated host's name, never the machine's.
#include "agent/platform/host_identity.h"
#include "simulator/vlnsim.h"

namespace cimple {
namespace {

bool resolve(const char* name, std::string& canonical_name, std::string& address) {
    char text[16];
    if (vlnsim_resolve_host(name, text, sizeof text) != 0)
        return false;
    canonical_name = name;
    address = text;
    return true;
}

constexpr Host_Queries simulated_host = {vlnsim_host_name, resolve};

} // namespace

const Host_Queries& host_queries() {
    return simulated_host;
}

} // namespace cimple
