// The linker leads the allocations of the module's own code here. Those by the nothrow form of new
// are left out: they are of the steps that start a thread, and a thread that could not be started
// leaves its clients waiting, which is known.
#include "tests/hostile/starving.h"

#include <atomic>
#include <cerrno>
#include <cstddef>
#include <new>
#include <pthread.h>

namespace {

std::atomic<unsigned long> made{0};
std::atomic<unsigned long> refused{0};
std::atomic<bool> threads_refused{false};

bool may_allocate() {
    return ++made != refused;
}

} // namespace

unsigned long starve(unsigned long number) {
    refused = number;
    return made.exchange(0);
}

void refuse_threads(bool are_refused) {
    threads_refused = are_refused;
}

// operator new and its array form, by the letter that size_t has in their names.
#if __SIZEOF_SIZE_T__ == 8
#define NEW(prefix) prefix##_Znwm
#define NEW_ARRAY(prefix) prefix##_Znam
#else
#define NEW(prefix) prefix##_Znwj
#define NEW_ARRAY(prefix) prefix##_Znaj
#endif

extern "C" {

int __real_pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*proc)(void*),
                          void* argument);
int __wrap_pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*proc)(void*),
                          void* argument) {
    return threads_refused ? EAGAIN : __real_pthread_create(thread, attributes, proc, argument);
}

void* __real_malloc(std::size_t size);
void* __real_calloc(std::size_t count, std::size_t size);
void* __real_realloc(void* block, std::size_t size);
void* NEW(__real_)(std::size_t size);
void* NEW_ARRAY(__real_)(std::size_t size);

void* __wrap_malloc(std::size_t size) {
    return may_allocate() ? __real_malloc(size) : nullptr;
}
void* __wrap_calloc(std::size_t count, std::size_t size) {
    return may_allocate() ? __real_calloc(count, size) : nullptr;
}
void* __wrap_realloc(void* block, std::size_t size) {
    return may_allocate() ? __real_realloc(block, size) : nullptr;
}
void* NEW(__wrap_)(std::size_t size) {
    return may_allocate() ? NEW(__real_)(size) : throw std::bad_alloc();
}
void* NEW_ARRAY(__wrap_)(std::size_t size) {
    return may_allocate() ? NEW_ARRAY(__real_)(size) : throw std::bad_alloc();
}
}
