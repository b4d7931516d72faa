#include "cimple/thread.h"

#include "cimple/assert.h"
#include "cimple/guard.h"
#include "cimple/log.h"
#include "cimple/thread_context.h"

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <memory>
#include <new>

namespace cimple {

namespace {
constexpr uint64 USEC_PER_SECOND = 1000000;
}

// ---- The lock order ----

#ifdef CIMPLE_CHECK_LOCKS
namespace {

struct Held_Lock {
    const Mutex* mutex;
    int rank;
    const char* name;
};

// The ranked locks of this thread, in the order they were taken. Plain data: nothing of it needs a
// destructor when a thread of the object manager ends.
constexpr unsigned MAX_HELD = 32;
thread_local Held_Lock held_locks[MAX_HELD];
thread_local unsigned num_held_locks = 0;

void check_lock_order(const Mutex* mutex, int rank, const char* name) {
    const Held_Lock* conflict = nullptr;
    for (unsigned i = 0; i < num_held_locks; i++) {
        if (held_locks[i].mutex == mutex)
            return; // a recursive mutex may be taken again at any time
        if (held_locks[i].rank >= rank)
            conflict = &held_locks[i];
    }
    if (!conflict)
        return;
    char text[256];
    std::snprintf(text, sizeof(text), "lock order: %s (rank %d) taken while %s (rank %d) is held",
                  name, rank, conflict->name, conflict->rank);
    __cimple_assert(__FILE__, __LINE__, "check_lock_order", text);
}

void note_locked(const Mutex* mutex, int rank, const char* name) {
    CIMPLE_ASSERT(num_held_locks < MAX_HELD);
    held_locks[num_held_locks++] = {mutex, rank, name};
}

void note_unlocked(const Mutex* mutex) {
    unsigned i = num_held_locks;
    while (i > 0 && held_locks[i - 1].mutex != mutex)
        i--;
    if (i == 0)
        return;
    for (; i < num_held_locks; i++)
        held_locks[i - 1] = held_locks[i];
    num_held_locks--;
}

} // namespace
#else
namespace {
inline void check_lock_order(const Mutex*, int, const char*) {}
inline void note_locked(const Mutex*, int, const char*) {}
inline void note_unlocked(const Mutex*) {}
} // namespace
#endif

// ---- Mutex, Cond ----

Mutex::~Mutex() {
    pthread_mutex_destroy(&_mutex);
}

void Mutex::lock() {
    if (_rank)
        check_lock_order(this, _rank, _name);
    if (pthread_mutex_lock(&_mutex) != 0)
        __cimple_assert("Mutex", __LINE__, "void cimple::Mutex::lock()",
                        "pthread_mutex_lock(&((MutexRep*)_rep)->mutex) == 0");
    if (_rank)
        note_locked(this, _rank, _name);
}

int Mutex::try_lock() {
    // An attempt cannot block, so it has no place in the order; what it takes has.
    const int error = pthread_mutex_trylock(&_mutex);
    if (error == 0 && _rank)
        note_locked(this, _rank, _name);
    return error == 0 || error == EBUSY ? error : -1;
}

void Mutex::unlock() {
    if (_rank)
        note_unlocked(this);
    pthread_mutex_unlock(&_mutex);
}

Cond::~Cond() {
    pthread_cond_destroy(&_cond);
}

void Cond::signal() {
    pthread_cond_signal(&_cond);
}

void Cond::broadcast() {
    pthread_cond_broadcast(&_cond);
}

void Cond::wait(Mutex& mutex) {
    pthread_cond_wait(&_cond, &mutex._mutex);
}

bool Cond::wait_until(Mutex& mutex, uint64 monotonic_usec) {
    timespec end{};
    end.tv_sec = static_cast<time_t>(monotonic_usec / USEC_PER_SECOND);
    end.tv_nsec = static_cast<long>(monotonic_usec % USEC_PER_SECOND * 1000);
    return pthread_cond_clockwait(&_cond, &mutex._mutex, CLOCK_MONOTONIC, &end) == 0;
}

// ---- Thread ----

namespace {

thread_local bool started_here = false;

struct Thread_Start {
    Thread_Proc proc;
    void* argument;
    Thread_Context* context;
};

// Keeps the new thread's context on its stack; runs on every way out, Thread::exit among them.
class Context_Holder {
public:
    explicit Context_Holder(Thread_Context* context) : _context(context) {
        if (context)
            Thread_Context::push(context);
    }
    ~Context_Holder() {
        if (_context) {
            Thread_Context::pop();
            delete _context;
        }
    }
    Context_Holder(const Context_Holder&) = delete;
    Context_Holder& operator=(const Context_Holder&) = delete;

private:
    Thread_Context* _context;
};

void* call_guarded(Thread_Proc proc, void* argument) {
    void* value = nullptr;
    if (!run_guarded([&] { value = proc(argument); }))
        CIMPLE_ERR("exception in a thread");
    return value;
}

void* _thread_proc(void* start_record) {
    const Thread_Start start = *static_cast<Thread_Start*>(start_record);
    delete static_cast<Thread_Start*>(start_record);
    started_here = true;

    Thread_Context* context = start.context;
    if (context && !context->thread_start_hook()) {
        delete context;
        context = nullptr;
    }
    const Context_Holder holder(context);
    void* value;
    if (context) {
        value = call_guarded(start.proc, start.argument);
        context->thread_exit_hook();
    } else {
        value = call_guarded(start.proc, start.argument);
    }
    CIMPLE_ASSERT(context == Thread_Context::top());
    return value;
}

int create_thread(pthread_t& thread, Thread_Proc proc, void* argument, int detach_state) {
    std::unique_ptr<Thread_Start> start(new (std::nothrow) Thread_Start{proc, argument, nullptr});
    if (!start)
        return ENOMEM;
    if (Thread_Context* parent = Thread_Context::top())
        start->context = parent->thread_create_hook(argument);

    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setdetachstate(&attributes, detach_state);
    const int error = pthread_create(&thread, &attributes, _thread_proc, start.get());
    pthread_attr_destroy(&attributes);

    if (error == 0)
        start.release(); // the new thread frees it
    else
        delete start->context;
    return error;
}

} // namespace

int Thread::create_joinable(Thread& thread, Thread_Proc proc, void* argument) {
    return create_thread(thread._thread, proc, argument, PTHREAD_CREATE_JOINABLE);
}

int Thread::create_detached(Thread& thread, Thread_Proc proc, void* argument) {
    return create_thread(thread._thread, proc, argument, PTHREAD_CREATE_DETACHED);
}

int Thread::join(Thread& thread, void*& value) {
    value = nullptr;
    return pthread_join(thread._thread, &value);
}

bool Thread::join_within(Thread& thread, uint64 usec) {
    timespec end{};
    clock_gettime(CLOCK_REALTIME, &end); // which is what this wait goes by
    const uint64 nanoseconds = static_cast<uint64>(end.tv_nsec) + usec * 1000;
    end.tv_sec += static_cast<time_t>(nanoseconds / 1000000000);
    end.tv_nsec = static_cast<long>(nanoseconds % 1000000000);
    return pthread_timedjoin_np(thread._thread, nullptr, &end) == 0;
}

void Thread::exit(void* value) {
    if (Thread_Context* context = Thread_Context::top())
        context->thread_exit_hook();
    pthread_exit(value);
}

bool Thread::is_ours() {
    return started_here;
}

Thread Thread::self() {
    Thread thread;
    thread._thread = pthread_self();
    return thread;
}

// ---- Time ----

namespace {

std::atomic<const Time::Clock*> the_clock{&system_clock};

// All pauses of the process share one condition: there are few, and a stop is rare.
constinit Process_Wide<Mutex> pause_mutex;
constinit Process_Wide<Cond> pause_cond;

uint64 monotonic_now() {
    timespec present{};
    clock_gettime(CLOCK_MONOTONIC, &present);
    return static_cast<uint64>(present.tv_sec) * USEC_PER_SECOND +
           static_cast<uint64>(present.tv_nsec) / 1000;
}

void host_pause(uint64 usec, const bool& stop) {
    const uint64 end = monotonic_now() + usec;
    Auto_Mutex lock(*pause_mutex);
    while (!load_flag(stop) && pause_cond->wait_until(*pause_mutex, end))
        ;
}

// The flag went up before: a thread that has tested it under the mutex waits by now.
void host_wake() {
    Auto_Mutex lock(*pause_mutex);
    pause_cond->broadcast();
}

} // namespace

uint64 Time::now() {
    return the_clock.load(std::memory_order_relaxed)->now();
}

void Time::sleep(uint64 usec) {
    the_clock.load(std::memory_order_relaxed)->sleep(usec);
}

// A clock with pauses of its own is a test's, on which a sleep takes no time.
void Time::sleep(uint64 usec, const bool& stop) {
    const Clock* clock = the_clock.load(std::memory_order_relaxed);
    if (!clock->pause)
        host_pause(usec, stop);
    else if (!load_flag(stop))
        clock->sleep(usec);
}

void Time::pause(uint64 usec, const bool& stop) {
    const auto clock_pause = the_clock.load(std::memory_order_relaxed)->pause;
    (clock_pause ? clock_pause : host_pause)(usec, stop);
}

// Both ways: a thread that is to be woken may have gone to rest before the clock was replaced.
void Time::wake() {
    host_wake();
    if (const auto clock_wake = the_clock.load(std::memory_order_relaxed)->wake)
        clock_wake();
}

void Time::replace_clock(const Clock* clock) {
    the_clock = clock ? clock : &system_clock;
}

} // namespace cimple
