// The table of operating system services: thin, over POSIX threads.
//
// Handles are heap objects of ours, or the thread's own identifier; a provider destroys what it
// makes.

#include "host/broker.h"

#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <pthread.h>
#include <string>

namespace host {

namespace {

static_assert(sizeof(pthread_t) <= sizeof(void*));
static_assert(sizeof(pthread_key_t) == sizeof(unsigned));
static_assert(sizeof(pthread_once_t) == sizeof(int));

pthread_t thread_of(void* handle) {
    return static_cast<pthread_t>(reinterpret_cast<std::uintptr_t>(handle));
}

// The file name of a library by its generic name; freed by the caller with free().
char* resolve_file_name(const char* generic_name) noexcept {
    return generic_name ? strdup(("lib" + std::string(generic_name) + ".so").c_str()) : nullptr;
}

void* new_thread(void* (*start)(void*), void* argument, int detached) noexcept {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    if (detached)
        pthread_attr_setdetachstate(&attributes, PTHREAD_CREATE_DETACHED);
    pthread_t thread{};
    const int failed = pthread_create(&thread, &attributes, start, argument);
    pthread_attr_destroy(&attributes);
    return failed ? nullptr : reinterpret_cast<void*>(static_cast<std::uintptr_t>(thread));
}

int join_thread(void* thread, void** value) noexcept {
    return pthread_join(thread_of(thread), value);
}

int exit_thread(void* value) { // leaves by unwinding the thread's stack
    pthread_exit(value);
}

int cancel_thread(void* thread) noexcept {
    return pthread_cancel(thread_of(thread));
}

int thread_sleep(CMPIUint32 milliseconds) noexcept {
    timespec rest = {static_cast<time_t>(milliseconds / 1000),
                     static_cast<long>(milliseconds % 1000) * 1'000'000};
    while (nanosleep(&rest, &rest) != 0)
        if (errno != EINTR)
            return errno;
    return 0;
}

int thread_once(int* once, void (*init)(void)) {
    return pthread_once(reinterpret_cast<pthread_once_t*>(once), init);
}

int create_thread_key(unsigned* key, void (*cleanup)(void*)) noexcept {
    return pthread_key_create(key, cleanup);
}

int destroy_thread_key(unsigned key) noexcept {
    return pthread_key_delete(key);
}

void* thread_specific(unsigned key) noexcept {
    return pthread_getspecific(key);
}

int set_thread_specific(unsigned key, void* value) noexcept {
    return pthread_setspecific(key, value);
}

void* new_mutex(int) noexcept {
    auto* mutex = new pthread_mutex_t;
    pthread_mutex_init(mutex, nullptr);
    return mutex;
}

void destroy_mutex(void* mutex) noexcept {
    if (!mutex)
        return;
    pthread_mutex_destroy(static_cast<pthread_mutex_t*>(mutex));
    delete static_cast<pthread_mutex_t*>(mutex);
}

void lock_mutex(void* mutex) noexcept {
    pthread_mutex_lock(static_cast<pthread_mutex_t*>(mutex));
}

void unlock_mutex(void* mutex) noexcept {
    pthread_mutex_unlock(static_cast<pthread_mutex_t*>(mutex));
}

void* new_condition(int) noexcept {
    auto* condition = new pthread_cond_t;
    pthread_cond_init(condition, nullptr);
    return condition;
}

void destroy_condition(void* condition) noexcept {
    if (!condition)
        return;
    pthread_cond_destroy(static_cast<pthread_cond_t*>(condition));
    delete static_cast<pthread_cond_t*>(condition);
}

int wait_condition(void* condition, void* mutex) noexcept {
    return pthread_cond_wait(static_cast<pthread_cond_t*>(condition),
                             static_cast<pthread_mutex_t*>(mutex));
}

int wait_condition_until(void* condition, void* mutex, timespec* deadline) noexcept {
    return pthread_cond_timedwait(static_cast<pthread_cond_t*>(condition),
                                  static_cast<pthread_mutex_t*>(mutex), deadline);
}

int signal_condition(void* condition) noexcept {
    return pthread_cond_signal(static_cast<pthread_cond_t*>(condition));
}

} // namespace

const CMPIBrokerExtFT system_functions = {
    CMPIVersion100,    resolve_file_name,  new_thread,      join_thread,
    exit_thread,       cancel_thread,      thread_sleep,    thread_once,
    create_thread_key, destroy_thread_key, thread_specific, set_thread_specific,
    new_mutex,         destroy_mutex,      lock_mutex,      unlock_mutex,
    new_condition,     destroy_condition,  wait_condition,  wait_condition_until,
    signal_condition};

} // namespace host
