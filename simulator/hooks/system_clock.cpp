// The module for simulation takes the simulator's clock, so that a test moves time instead of
// waiting.
#include "cimple/thread.h"
#include "simulator/vlnsim.h"

namespace cimple {
namespace {

uint64 now() {
    return vlnsim_now();
}

void sleep(uint64 usec) {
    vlnsim_sleep(usec);
}

int is_raised(const void* flag) {
    return load_flag(*static_cast<const bool*>(flag));
}

void pause(uint64 usec, const bool& stop) {
    vlnsim_pause(usec, &is_raised, &stop);
}

} // namespace

const Time::Clock system_clock = {&now, &sleep, &pause, &vlnsim_wake};

} // namespace cimple
