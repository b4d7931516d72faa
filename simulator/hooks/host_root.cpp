// The module for simulation works in a folder of its own: the host's root is the simulator's.
#include "foundation/host_paths.h"
#include "simulator/vlnsim.h"

namespace cimple {

const char* host_root() {
    return vlnsim_host_root();
}

} // namespace cimple
