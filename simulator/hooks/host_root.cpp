// The module for simulation works in a folder of its own: the host's root is the simulator's. Where
// none was chosen there are no files: the machine's own are never the simulated host's.
#include "foundation/host_paths.h"
#include "simulator/vlnsim.h"

namespace cimple {

const char* host_root() {
    const char* root = vlnsim_host_root();
    return *root ? root : "/nonexistent";
}

} // namespace cimple
