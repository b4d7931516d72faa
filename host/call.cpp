#include "host/call.h"

#include "host/core.h"

namespace host {

namespace {

thread_local Call* top_call = nullptr;

// The attachment of a thread. The core lives on while a thread is attached to it.
struct Attachment {
    std::shared_ptr<Core> core;
    std::unique_ptr<Call> call;
    const void* context = nullptr;

    ~Attachment() {
        if (call)
            report(core.get(), FaultKind::attachment, "a thread ended without detachThread");
        end();
    }

    void end() {
        if (!call)
            return;
        core->end_thread(call->arena);
        call.reset();
        context = nullptr;
        --core->attached_threads;
        core.reset();
    }
};

thread_local Attachment attachment;

} // namespace

Call::Call(Core& made_by, std::string name, const char* what)
    : core(made_by), class_name(std::move(name)), operation(what), _outer(top_call) {
    top_call = this;
}

Call::~Call() {
    top_call = _outer;
    core.left.fetch_add(destroy_all(arena), std::memory_order_relaxed);
}

Call* Call::top() {
    return top_call;
}

bool Call::is_running(const Core& core, const std::string& class_name) {
    for (const Call* call = top_call; call; call = call->outer())
        if (&call->core == &core && same_name(call->class_name, class_name))
            return true;
    return false;
}

bool Call::attach(Core& core, const void* context) {
    if (top_call)
        return false;
    attachment.core = core.shared_from_this();
    attachment.call = std::make_unique<Call>(core, "", "attached thread");
    attachment.context = context;
    ++core.attached_threads;
    return true;
}

bool Call::detach(Core& core, const void* context) {
    if (!attachment.call || attachment.core.get() != &core || attachment.context != context ||
        top_call != attachment.call.get())
        return false;
    attachment.end();
    return true;
}

} // namespace host
