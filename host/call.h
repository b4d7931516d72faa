// A call into a provider as long as it lasts: who runs, and the objects that end with it.
//
// Calls nest on a thread, since an up-call may lead into another provider. A thread that a provider
// attaches has a call of its own from attachThread to detachThread.
#ifndef HOST_CALL_H
#define HOST_CALL_H

#include "host/object_store.h"

#include <memory>
#include <string>

namespace host {

class Call {
public:
    Call(Core& core, std::string class_name, const char* operation);
    ~Call(); // frees what the call left behind
    Call(const Call&) = delete;
    Call& operator=(const Call&) = delete;

    Core& core;
    const std::string class_name;
    const char* const operation;
    Arena arena;

    const Call* outer() const { return _outer; }

    static Call* top(); // null: this thread runs no provider
    // Whether the provider of the class runs somewhere on this thread's stack.
    static bool is_running(const Core& core, const std::string& class_name);

    // For attachThread: gives this thread a call until detach, or until it ends, which is a fault.
    static bool attach(Core& core, const void* context);
    // False if the thread is not attached with that context.
    static bool detach(Core& core, const void* context);

private:
    Call* _outer;
};

} // namespace host

#endif // HOST_CALL_H
