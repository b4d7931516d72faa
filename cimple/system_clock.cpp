#include "cimple/thread.h"

#include <sys/select.h>
#include <sys/time.h>

namespace cimple {

namespace {

uint64 system_now() {
    timeval present;
    if (gettimeofday(&present, nullptr) != 0)
        return 0;
    return static_cast<uint64>(present.tv_sec) * 1000000 + static_cast<uint64>(present.tv_usec);
}

void system_sleep(uint64 usec) {
    timeval span;
    span.tv_sec = static_cast<decltype(span.tv_sec)>(usec / 1000000);
    span.tv_usec = static_cast<decltype(span.tv_usec)>(usec % 1000000);
    select(0, nullptr, nullptr, nullptr, &span);
}

} // namespace

const Time::Clock system_clock = {system_now, system_sleep};

} // namespace cimple
