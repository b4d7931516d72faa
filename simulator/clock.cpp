// The clock of the simulated host. It has a lock of its own: a thread that sleeps in a library call
// must not hold up the others.
#include "simulator/vlnsim.h"

#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <ctime>
#include <iterator>
#include <mutex>
#include <set>

namespace {

constexpr std::uint64_t usec_per_second = 1000000;

// It lives from the first use to the end of the process, as threads may pause for as long.
struct Clock {
    std::mutex mutex; // guards the rest
    std::condition_variable moved;
    bool is_virtual = false;
    std::uint64_t now = 0; // of a virtual clock
    bool skips_sleeps = false;
    std::uint64_t skipped = 0; // by which the host's time is ahead of the system's
    unsigned long changes = 0; // from one clock to another
    std::multiset<std::uint64_t> pause_ends;
};
constexpr std::uint64_t NEVER = ~std::uint64_t{0}; // the end of a pause on the system's clock

Clock& the_clock() {
    static Clock* const clock = new Clock;
    return *clock;
}

// Whether time is virtual; then it has advanced by usec.
bool advance(std::uint64_t usec) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    if (clock.is_virtual) {
        clock.now += usec;
        clock.moved.notify_all();
    }
    return clock.is_virtual;
}

// Whether a sleep of usec is over without one.
bool skip(std::uint64_t usec) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    if (clock.skips_sleeps)
        clock.skipped += usec;
    return clock.skips_sleeps;
}

void change_clock(bool is_virtual, std::uint64_t start_usec) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    clock.is_virtual = is_virtual;
    clock.now = start_usec;
    clock.skips_sleeps = false;
    clock.skipped = 0;
    ++clock.changes;
    clock.moved.notify_all();
}

} // namespace

void vlnsim_use_virtual_clock(uint64_t start_usec) {
    change_clock(true, start_usec);
}

void vlnsim_use_system_clock(void) {
    change_clock(false, 0);
}

void vlnsim_skip_sleeps(void) {
    change_clock(false, 0);
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    clock.skips_sleeps = true;
}

void vlnsim_advance(uint64_t usec) {
    advance(usec);
}

uint64_t vlnsim_now(void) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    if (clock.is_virtual)
        return clock.now;
    timespec now{};
    if (clock_gettime(CLOCK_REALTIME, &now) != 0)
        return 0;
    return static_cast<std::uint64_t>(now.tv_sec) * usec_per_second +
           static_cast<std::uint64_t>(now.tv_nsec) / 1000 + clock.skipped;
}

void vlnsim_sleep(uint64_t usec) {
    if (advance(usec) || skip(usec))
        return;
    timespec left{};
    left.tv_sec = static_cast<time_t>(usec / usec_per_second);
    left.tv_nsec = static_cast<long>(usec % usec_per_second * 1000);
    while (nanosleep(&left, &left) != 0 && errno == EINTR)
        ;
}

void vlnsim_pause(uint64_t usec, int (*stopped)(const void* context), const void* context) {
    Clock& clock = the_clock();
    std::unique_lock lock(clock.mutex);
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::microseconds(usec);
    const unsigned long changes = clock.changes;
    const std::uint64_t end = clock.is_virtual ? clock.now + usec : NEVER;
    const auto place = clock.pause_ends.insert(end);
    const auto over = [&] {
        return stopped(context) || clock.changes != changes || clock.now >= end;
    };
    if (clock.is_virtual)
        clock.moved.wait(lock, over);
    else
        clock.moved.wait_until(lock, deadline, over);
    clock.pause_ends.erase(place);
}

void vlnsim_wake(void) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    clock.moved.notify_all();
}

size_t vlnsim_paused(void) {
    Clock& clock = the_clock();
    std::lock_guard lock(clock.mutex);
    return static_cast<size_t>(
        std::distance(clock.pause_ends.upper_bound(clock.now), clock.pause_ends.end()));
}
