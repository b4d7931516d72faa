// The per-thread stack of contexts through which provider code calls the object manager.
//
// The frame of every CMPI call pushes a context and pops it; so do threads started during one. The
// stack is thread-specific: nothing here locks.
#ifndef CIMPLE_THREAD_CONTEXT_H
#define CIMPLE_THREAD_CONTEXT_H

#include "cimple/instance.h"

namespace cimple {

// An enumeration in progress; each kind of context has its own.
struct Instance_Enumerator_Rep {
    virtual ~Instance_Enumerator_Rep() = default;
};

class Thread_Context {
public:
    virtual ~Thread_Context() = default;

    // Which provider's call this is, to be compared only; null on a thread that a provider started.
    virtual const void* provider() const { return nullptr; }

    // A context for a thread about to start, made on the parent; null if that fails.
    virtual Thread_Context* thread_create_hook(void* argument) = 0;
    // First on the new thread. False: the object manager does not know the thread, and is not
    // called on it.
    virtual bool thread_start_hook() = 0;
    virtual void thread_exit_hook() = 0; // last on the new thread

    // Null on any failure; the caller gives the result to destroy_enum.
    virtual Instance_Enumerator_Rep* start_enum(const char* name_space, const Instance* model) = 0;
    virtual void destroy_enum(Instance_Enumerator_Rep* rep) = 0;
    virtual bool more(Instance_Enumerator_Rep* rep) = 0;
    virtual void next(Instance_Enumerator_Rep* rep) = 0;
    virtual Ref<Instance> get(Instance_Enumerator_Rep* rep) = 0;

    virtual Ref<Instance> get_instance(const char* name_space, const Instance* model) = 0;
    virtual int create_instance(const char* name_space, const Instance* instance) = 0;
    virtual int delete_instance(const char* name_space, const Instance* instance) = 0;
    virtual int modify_instance(const char* name_space, const Instance* instance) = 0;
    virtual int invoke_method(const char* name_space, const Instance* instance,
                              Instance* method) = 0;
    virtual void allow_unload(bool flag) = 0;
    virtual bool get_username(String& user) = 0;

    // The caller keeps ownership of what it pushes.
    static void push(Thread_Context* context);
    static void pop(); // an empty stack is left alone
    static Thread_Context* top();

private:
    Thread_Context* _prev = nullptr; // the context beneath it on this thread
};

} // namespace cimple

#endif // CIMPLE_THREAD_CONTEXT_H
