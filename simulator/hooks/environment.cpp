// The module for simulation never meets the machine's own management libraries: where the program
// that loads it has chosen no simulated host, the environment's is there before the module asks for
// one.
#include "simulator/vlnsim.h"

namespace {

__attribute__((constructor)) void choose_host() {
    vlnsim_use_environment();
}

} // namespace
