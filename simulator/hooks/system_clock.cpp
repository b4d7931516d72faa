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

} // namespace

const Time::Clock system_clock = {&now, &sleep};

} // namespace cimple
