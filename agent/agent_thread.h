// A background thread of the agent, and the class provider whose call started it: with that call's
// broker and context the thread is known to the object manager, so that it has to end before that
// provider does.
#ifndef VLN_AGENT_AGENT_THREAD_H
#define VLN_AGENT_AGENT_THREAD_H

#include "cimple/thread.h"

namespace cimple {

class Agent_Thread {
public:
    Agent_Thread();

    // Starts the thread for the provider whose call the present thread is in; 0 or an error. An
    // earlier thread, which must be at its end, is joined before.
    int start(Thread_Proc proc, void* argument);
    // Whether there is a thread that the call of this provider started. Never of none.
    bool is_given_by(const void* provider);
    // Waits for the thread, if there is one that nobody else waits for.
    void join();
    // The same for so long at most, and only if no other thread is in here: for the end of the
    // process, where nothing may stand for ever. False if the thread goes on.
    bool join_within(uint64 usec);

private:
    bool take(Thread& thread);

    Mutex _mutex; // guards the rest
    Thread _thread;
    const void* _provider = nullptr;
    bool _exists = false; // started, and nobody has waited for it
};

} // namespace cimple

#endif // VLN_AGENT_AGENT_THREAD_H
