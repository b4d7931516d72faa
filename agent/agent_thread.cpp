#include "agent/agent_thread.h"

#include "agent/lock_order.h"
#include "cimple/thread_context.h"

#include <utility>

namespace cimple {

Agent_Thread::Agent_Thread() : _mutex(false, RANK_AGENT_THREAD, "agent thread") {}

int Agent_Thread::start(Thread_Proc proc, void* argument) {
    join();
    const Thread_Context* context = Thread_Context::top();
    Auto_Mutex lock(_mutex);
    _provider = context ? context->provider() : nullptr;
    const int error = Thread::create_joinable(_thread, proc, argument);
    _exists = error == 0;
    return error;
}

bool Agent_Thread::is_given_by(const void* provider) {
    Auto_Mutex lock(_mutex);
    return provider && _exists && _provider == provider;
}

// Under the mutex.
bool Agent_Thread::take(Thread& thread) {
    thread = _thread;
    return std::exchange(_exists, false);
}

void Agent_Thread::join() {
    Thread thread;
    {
        Auto_Mutex lock(_mutex);
        if (!take(thread))
            return;
    }
    void* value = nullptr;
    Thread::join(thread, value);
}

bool Agent_Thread::join_within(uint64 usec) {
    if (_mutex.try_lock() != 0)
        return false;
    Thread thread;
    const bool exists = take(thread);
    _mutex.unlock();
    return !exists || Thread::join_within(thread, usec);
}

} // namespace cimple
