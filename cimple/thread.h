// Mutexes, conditions, threads, clocks: a thin layer over POSIX threads.
#ifndef CIMPLE_THREAD_H
#define CIMPLE_THREAD_H

#include "cimple/types.h"

#include <pthread.h>

namespace cimple {

// The engine's own places in the lock order. Both are leaves: they may be taken while any lock of
// the layers above is held, and nothing but the log is taken under them. An adapter's lock has no
// place: an up-call may take another provider's on the same thread.
inline constexpr int LOCK_RANK_FACTORY = 900;
inline constexpr int LOCK_RANK_LOG = 1000;

// A mutex with an optional place in a lock order. In builds with CIMPLE_CHECK_LOCKS a thread that
// takes a ranked mutex while it holds another of the same or a higher rank ends the process with
// both names; rank 0 takes no part in the order.
class Mutex {
public:
    // Constant initialisation, so that a mutex with static storage needs no constructor at load
    // time.
    constexpr explicit Mutex(bool recursive = false, int rank = 0, const char* name = "") noexcept
        : _mutex(recursive ? RECURSIVE : PLAIN), _rank(rank), _name(name) {}
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    void lock();    // a failure ends the process
    int try_lock(); // 0, 16 (EBUSY) or -1
    void unlock();

private:
    friend class Cond;
    static constexpr pthread_mutex_t PLAIN = PTHREAD_MUTEX_INITIALIZER;
    static constexpr pthread_mutex_t RECURSIVE = PTHREAD_RECURSIVE_MUTEX_INITIALIZER_NP;
    pthread_mutex_t _mutex;
    int _rank;
    const char* _name;
};

class Auto_Mutex {
public:
    explicit Auto_Mutex(Mutex& mutex) : _mutex(&mutex) { mutex.lock(); }
    ~Auto_Mutex() { unlock(); }
    Auto_Mutex(const Auto_Mutex&) = delete;
    Auto_Mutex& operator=(const Auto_Mutex&) = delete;
    void unlock() {
        if (_mutex)
            _mutex->unlock();
        _mutex = nullptr;
    }

private:
    Mutex* _mutex;
};

class Cond {
public:
    constexpr Cond() noexcept = default;
    ~Cond();
    Cond(const Cond&) = delete;
    Cond& operator=(const Cond&) = delete;

    void signal();
    void broadcast();
    // One wait, no time-out, no loop: the caller tests its condition itself.
    void wait(Mutex& mutex);
    // The same, until that time of the monotonic clock at the latest; false when it has come.
    bool wait_until(Mutex& mutex, uint64 monotonic_usec);

private:
    pthread_cond_t _cond = PTHREAD_COND_INITIALIZER;
};

// Static storage that is initialised at compile time and never destroyed: a thread may still run
// when the process or the module ends, and must find its locks whole.
//     constinit Process_Wide<Mutex> the_mutex(false, 0, "name");
//     Auto_Mutex guard(*the_mutex);
template <class T>
class Process_Wide {
public:
    template <class... Args>
    constexpr explicit Process_Wide(Args... args) noexcept : _value(args...) {}
    constexpr ~Process_Wide() {}
    T& operator*() { return _value; }
    T* operator->() { return &_value; }

private:
    union {
        T _value;
    };
};

using Thread_Proc = void* (*)(void* argument);

class Thread {
public:
    Thread() noexcept = default;

    // Starts a thread; 0 or the error of pthread_create. Started on a thread that has a context,
    // the new thread gets one of its own and is attached to the object manager around its function.
    // An exception that the function lets out ends the thread with the value null, not the process.
    static int create_joinable(Thread& thread, Thread_Proc proc, void* argument);
    static int create_detached(Thread& thread, Thread_Proc proc, void* argument);

    static int join(Thread& thread, void*& value); // value is 0 before the join
    // False if the thread runs on after so many microseconds; it is not joined then.
    static bool join_within(Thread& thread, uint64 usec);
    [[noreturn]] static void exit(void* value);
    static Thread self();
    static bool is_ours(); // whether the present thread was started by one of the two above
    friend bool operator==(const Thread& a, const Thread& b) {
        return pthread_equal(a._thread, b._thread) != 0;
    }

private:
    pthread_t _thread{};
};

// Holds off a cancellation of this thread to the end of the scope, for steps that must not be left
// half done: the thread ends at its next wait outside.
class No_Cancellation {
public:
    No_Cancellation() { pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &_former); }
    ~No_Cancellation() { pthread_setcancelstate(_former, nullptr); }
    No_Cancellation(const No_Cancellation&) = delete;
    No_Cancellation& operator=(const No_Cancellation&) = delete;

private:
    int _former = PTHREAD_CANCEL_ENABLE;
};

// A plain byte that threads share without a lock, where a late reading does no harm.
inline bool load_flag(const bool& flag) noexcept {
    return __atomic_load_n(&flag, __ATOMIC_RELAXED);
}
inline void raise_flag(bool& flag) noexcept {
    __atomic_store_n(&flag, true, __ATOMIC_RELAXED);
}

// The process's clock. Tests replace it; the product never does.
class Time {
public:
    static uint64 now();            // microseconds since the epoch, 0 if the clock fails
    static void sleep(uint64 usec); // a signal ends it early
    // The same, and ended early as a pause is. A clock that a test moves is moved by it, as by
    // every sleep.
    static void sleep(uint64 usec, const bool& stop);
    // A sleep of a thread that another one may want to join: it ends early once `stop` is raised
    // and wake called, in this order. A flag that is up already ends it at once.
    static void pause(uint64 usec, const bool& stop);
    static void wake();

    struct Clock {
        uint64 (*now)();
        void (*sleep)(uint64 usec);
        // Without them a pause takes the host's time.
        void (*pause)(uint64 usec, const bool& stop) = nullptr;
        void (*wake)() = nullptr;
    };
    static void replace_clock(const Clock* clock); // null: system_clock
};

// The clock that Time starts with. It has a translation unit of its own, so that a variant of the
// module can be linked with another one.
extern const Time::Clock system_clock;

} // namespace cimple

#endif // CIMPLE_THREAD_H
