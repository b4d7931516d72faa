// The context of a thread that the object manager knows: up-calls through CMPI.
#ifndef CIMPLE_CMPI_THREAD_CONTEXT_H
#define CIMPLE_CMPI_THREAD_CONTEXT_H

#include "cimple/cmpi_adapter.h"
#include "cimple/thread_context.h"

namespace cimple {

struct CMPI_Enumerator;

// All that an up-call hands out is given back on the thread that got it, at the latest when the
// context ends or its thread detaches: some brokers do not survive what is left then.
class CMPI_Thread_Context : public Thread_Context {
public:
    // Borrows all three. adapter is null on a thread that a provider started, which may outlive it.
    CMPI_Thread_Context(const CMPIBroker* broker, const CMPIContext* context,
                        CMPI_Adapter* adapter) noexcept
        : _broker(broker), _context(context), _adapter(adapter) {}
    ~CMPI_Thread_Context() override;
    CMPI_Thread_Context(const CMPI_Thread_Context&) = delete;
    CMPI_Thread_Context& operator=(const CMPI_Thread_Context&) = delete;

    const CMPIBroker* broker() const { return _broker; }
    const CMPIContext* context() const { return _context; }
    const void* provider() const override { return _adapter; }

    Thread_Context* thread_create_hook(void* argument) override;
    bool thread_start_hook() override;
    void thread_exit_hook() override;

    Instance_Enumerator_Rep* start_enum(const char* name_space, const Instance* model) override;
    void destroy_enum(Instance_Enumerator_Rep* rep) override;
    bool more(Instance_Enumerator_Rep* rep) override;
    void next(Instance_Enumerator_Rep* rep) override;
    Ref<Instance> get(Instance_Enumerator_Rep* rep) override;

    Ref<Instance> get_instance(const char* name_space, const Instance* model) override;
    int create_instance(const char* name_space, const Instance* instance) override;
    int delete_instance(const char* name_space, const Instance* instance) override;
    int modify_instance(const char* name_space, const Instance* instance) override;
    int invoke_method(const char* name_space, const Instance* instance, Instance* method) override;
    void allow_unload(bool flag) override;
    bool get_username(String& user) override;

private:
    friend struct CMPI_Enumerator;
    void end_enumerations() noexcept;

    const CMPIBroker* _broker;
    const CMPIContext* _context;
    CMPI_Adapter* _adapter;
    CMPIContext* _prepared = nullptr; // made for a thread that has not attached; ours till it does
    CMPI_Enumerator* _enumerators = nullptr; // that hold an enumeration of this context
};

} // namespace cimple

#endif // CIMPLE_CMPI_THREAD_CONTEXT_H
