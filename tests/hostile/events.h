// The seam at which events of the module fail: a build of it exports module_events, and leads what
// its own code asks of the system through here.
#ifndef TESTS_HOSTILE_EVENTS_H
#define TESTS_HOSTILE_EVENTS_H

#include <atomic>
#include <cstddef>

#include <execinfo.h>

namespace sweep {

enum Kind {
    CALL,       // into the management libraries: the simulator's script fails these
    ALLOCATION, // by malloc, calloc, realloc or new
    THREAD,     // pthread_create
    LINKER,     // dlopen and dlsym
    OPEN,       // of a file by any function; also mkdir, rename and sem_open
    READ,       // from a file, by the block
    WRITE,      // to a file, by the block: the disk is full
    BROKER,     // calls of the broker and of its objects
    UP_CALL,    // of the broker, to other providers
    KINDS
};

// Counts over all threads. The harness counts BROKER and UP_CALL here as well.
struct Events {
    // One more of the kind; true if it is the one that is to fail.
    bool fails(Kind kind) {
        if (++made[kind] != refused[kind])
            return false;
        depth = backtrace(stack, MOST_FRAMES);
        return true;
    }
    // From now on, counting anew, the event of that number fails; 0: none.
    void refuse(Kind kind, unsigned long number) {
        refused[kind] = 0;
        made[kind] = 0;
        refused[kind] = number;
    }

    std::atomic<unsigned long> made[KINDS]{};
    std::atomic<unsigned long> refused[KINDS]{};
    // Where the last one failed.
    static constexpr int MOST_FRAMES = 32;
    void* stack[MOST_FRAMES]{};
    int depth = 0;
};

} // namespace sweep

extern "C" __attribute__((visibility("default"))) sweep::Events* module_events();

#endif // TESTS_HOSTILE_EVENTS_H
