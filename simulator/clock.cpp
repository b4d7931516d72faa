// The clock of the simulated host. It has a lock of its own: a thread that sleeps in a library call
// must not hold up the others.
#include "simulator/vlnsim.h"

#include <cerrno>
#include <ctime>
#include <mutex>

namespace {

constexpr std::uint64_t usec_per_second = 1000000;

std::mutex clock_mutex;
bool is_virtual = false;
std::uint64_t virtual_now = 0;

// Whether time is virtual; then it has advanced by usec.
bool advance(std::uint64_t usec) {
    std::lock_guard lock(clock_mutex);
    if (is_virtual)
        virtual_now += usec;
    return is_virtual;
}

} // namespace

void vlnsim_use_virtual_clock(uint64_t start_usec) {
    std::lock_guard lock(clock_mutex);
    is_virtual = true;
    virtual_now = start_usec;
}

void vlnsim_use_system_clock(void) {
    std::lock_guard lock(clock_mutex);
    is_virtual = false;
}

void vlnsim_advance(uint64_t usec) {
    advance(usec);
}

uint64_t vlnsim_now(void) {
    {
        std::lock_guard lock(clock_mutex);
        if (is_virtual)
            return virtual_now;
    }
    timespec now{};
    if (clock_gettime(CLOCK_REALTIME, &now) != 0)
        return 0;
    return static_cast<std::uint64_t>(now.tv_sec) * usec_per_second +
           static_cast<std::uint64_t>(now.tv_nsec) / 1000;
}

void vlnsim_sleep(uint64_t usec) {
    if (advance(usec))
        return;
    timespec left{};
    left.tv_sec = static_cast<time_t>(usec / usec_per_second);
    left.tv_nsec = static_cast<long>(usec % usec_per_second * 1000);
    while (nanosleep(&left, &left) != 0 && errno == EINTR)
        ;
}
