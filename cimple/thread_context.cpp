#include "cimple/thread_context.h"

#include <pthread.h>

namespace cimple {

namespace {

pthread_key_t cimple__thread_context_key;
pthread_once_t key_once = PTHREAD_ONCE_INIT;
bool key_created = false;

// The key has no destructor: a context belongs to the frame that pushed it.
void create_key() {
    key_created = pthread_key_create(&cimple__thread_context_key, nullptr) == 0;
}

pthread_key_t context_key() {
    pthread_once(&key_once, create_key);
    CIMPLE_ASSERT(key_created);
    return cimple__thread_context_key;
}

// The object manager may load and unload the module many times in one process, whose keys are few.
__attribute__((destructor)) void delete_key() {
    if (key_created)
        pthread_key_delete(cimple__thread_context_key);
}

} // namespace

void Thread_Context::push(Thread_Context* context) {
    context->_prev = top();
    pthread_setspecific(context_key(), context);
}

void Thread_Context::pop() {
    Thread_Context* context = top();
    if (!context)
        return;
    pthread_setspecific(context_key(), context->_prev);
    context->_prev = nullptr;
}

Thread_Context* Thread_Context::top() {
    return static_cast<Thread_Context*>(pthread_getspecific(context_key()));
}

} // namespace cimple
