// Life of an adapter, the factory, and the frame of every call.
#include "cimple/cmpi_adapter.h"

#include "cimple/cmpi_frame.h"
#include "cimple/cmpi_thread_context.h"
#include "cimple/guard.h"
#include "cimple/log.h"

#include <cstdio>
#include <memory>

namespace cimple {

namespace {

// Guards the static blocks' adapter pointers and the counts in the adapters. A leaf: no provider
// code runs under it, since a load or unload may wait for a thread that is itself in a factory.
constinit Process_Wide<Mutex> factory_mutex(false, LOCK_RANK_FACTORY, "factory");
constinit Process_Wide<Cond> factory_cond; // a load has ended

constexpr uint32 POISON = 0xDDDDDDDD;

const char* return_word(int rc) {
    static constexpr struct {
        int rc;
        const char* word;
    } WORDS[] = {
        {0, "CMPI_RC_OK"},
        {2, "CMPI_RC_ERR_ACCESS_DENIED"},
        {3, "CMPI_RC_ERR_INVALID_NAMESPACE"},
        {4, "CMPI_RC_ERR_INVALID_PARAMETER"},
        {5, "CMPI_RC_ERR_INVALID_CLASS"},
        {6, "CMPI_RC_ERR_NOT_FOUND"},
        {7, "CMPI_RC_ERR_NOT_SUPPORTED"},
        {8, "CMPI_RC_ERR_CLASS_HAS_CHILDREN"},
        {9, "CMPI_RC_ERR_CLASS_HAS_INSTANCES"},
        {10, "CMPI_RC_ERR_INVALID_SUPERCLASS"},
        {11, "CMPI_RC_ERR_ALREADY_EXISTS"},
        {12, "CMPI_RC_ERR_NO_SUCH_PROPERTY"},
        {13, "CMPI_RC_ERR_TYPE_MISMATCH"},
        {14, "CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
        {15, "CMPI_RC_ERR_INVALID_QUERY"},
        {16, "CMPI_RC_ERR_METHOD_NOT_AVAILABLE"},
        {17, "CMPI_RC_ERR_METHOD_NOT_FOUND"},
        {50, "CMPI_RC_DO_NOT_UNLOAD"},
        {51, "CMPI_RC_NEVER_UNLOAD"},
        {60, "CMPI_RC_ERR_INVALID_HANDLE"},
        {61, "CMPI_RC_ERR_INVALID_DATA_TYPE"},
        {100, "CMPI_RC_ERROR_SYSTEM"},
        {200, "CMPI_RC_ERROR"},
    };
    for (const auto& row : WORDS)
        if (row.rc == rc)
            return row.word;
    return "CMPI_RC_ERR_FAILED";
}

// A thread context for the time of a call.
class Pushed_Context {
public:
    Pushed_Context(const CMPIBroker* broker, const CMPIContext* context, CMPI_Adapter* adapter)
        : _context(broker, context, adapter) {
        Thread_Context::push(&_context);
    }
    ~Pushed_Context() { Thread_Context::pop(); }
    Pushed_Context(const Pushed_Context&) = delete;
    Pushed_Context& operator=(const Pushed_Context&) = delete;

private:
    CMPI_Thread_Context _context;
};

// ---- Life ----

// Without the adapter's own lock: nobody uses it any more.
void destroy_adapter(CMPI_Adapter* adapter) {
    CIMPLE_DBG("enter: %s()", "~CMPI_Adapter");
    const std::unique_ptr<CMPI_Adapter> owner(adapter);
    const bool complete = run_guarded([adapter] {
        adapter->proc(adapter->registration, OP_DESTROY_PROVIDER,
                      reinterpret_cast<Provider_Word>(adapter->provider), 0, 0, 0, 0, 0, 0, 0);
    });
    if (!complete)
        CIMPLE_ERR("exception in %s()", "~CMPI_Adapter");
}

void drop_user(CMPI_Adapter* adapter) {
    Auto_Mutex guard(*factory_mutex);
    const bool last = --adapter->users == 0;
    guard.unlock();
    if (last)
        destroy_adapter(adapter);
}

// Takes the adapter out of its block, so that the next factory call starts afresh.
void unlink_adapter(CMPI_Adapter* adapter) {
    Provider_Static_Data* block = adapter->static_data;
    block->magic = POISON;
    block->adapter = nullptr;
}

// Keeps the provider's adapter alive through a call, whatever cleanup does meanwhile.
class Adapter_Use {
public:
    explicit Adapter_Use(Provider_Static_Data* block) {
        if (!block)
            return;
        const Auto_Mutex guard(*factory_mutex);
        _adapter = block->adapter;
        if (_adapter)
            _adapter->users++;
    }
    ~Adapter_Use() {
        if (_adapter)
            drop_user(_adapter);
    }
    Adapter_Use(const Adapter_Use&) = delete;
    Adapter_Use& operator=(const Adapter_Use&) = delete;
    CMPI_Adapter* get() const { return _adapter; }

private:
    CMPI_Adapter* _adapter = nullptr;
};

void fill_block(Provider_Static_Data* block, const char* provider_name) {
    const auto fill_name = [provider_name](char(&name)[256], const char* kind) {
        std::snprintf(name, sizeof(name), "%s%s", kind, provider_name);
    };
    fill_name(block->instance_name, "instance");
    fill_name(block->method_name, "method");
    fill_name(block->indication_name, "indication");
    fill_name(block->association_name, "association");

    block->magic = PROVIDER_STATIC_DATA_MAGIC;
    block->instance_ft = INSTANCE_FUNCTIONS;
    block->method_ft = METHOD_FUNCTIONS;
    block->indication_ft = INDICATION_FUNCTIONS;
    block->association_ft = ASSOCIATION_FUNCTIONS;
    // The four names all go to the instance table, so that it bears the association's name and the
    // other tables none. Object managers have seen it so from the start: it is meant to stay.
    block->instance_ft.miName = block->instance_name;
    block->instance_ft.miName = block->method_name;
    block->instance_ft.miName = block->indication_name;
    block->instance_ft.miName = block->association_name;
}

// Under the factory's mutex. The new adapter is not loaded yet.
CMPI_Adapter* create_adapter(Provider_Static_Data* block, const Registration* registration,
                             const CMPIBroker* broker, const char* provider_name) {
    auto adapter = std::make_unique<CMPI_Adapter>();
    adapter->registration = registration;
    adapter->proc = registration->proc;
    adapter->proc(registration, OP_CREATE_PROVIDER,
                  reinterpret_cast<Provider_Word>(&adapter->provider), 0, 0, 0, 0, 0, 0, 0);
    CIMPLE_DBG("enter: %s()", "CMPI_Adapter");
    adapter->static_data = block;
    adapter->broker = broker;
    adapter->loader = Thread::self();
    fill_block(block, provider_name);
    return adapter.release();
}

void end_loading(CMPI_Adapter* adapter, bool loaded) {
    const Auto_Mutex guard(*factory_mutex);
    adapter->loading = false;
    if (!loaded)
        unlink_adapter(adapter);
    factory_cond->broadcast();
}

// A load that fails is not looked at: the provider answers its calls as well as it can, and the
// cause stands in its own log.
void load_adapter(CMPI_Adapter* adapter, const CMPIContext* context) {
    try {
        const Pushed_Context pushed(adapter->broker, context, adapter);
        const Call call = {*adapter, adapter->broker, context};
        call.provider(OP_LOAD);
        adapter->proc(adapter->registration, OP_GET_META_CLASS,
                      reinterpret_cast<Provider_Word>(&adapter->meta_class), 0, 0, 0, 0, 0, 0, 0);
        CIMPLE_DBG("return: %s()", "CMPI_Adapter");
    } catch (...) {
        end_loading(adapter, false);
        drop_user(adapter);
        throw;
    }
    end_loading(adapter, true);
}

void count_or_load(Provider_Static_Data* block, const Registration* registration,
                   const CMPIBroker* broker, const CMPIContext* context,
                   const char* provider_name) {
    Auto_Mutex guard(*factory_mutex);
    while (block->adapter && block->adapter->loading && !(block->adapter->loader == Thread::self()))
        factory_cond->wait(*factory_mutex);
    if (block->adapter) {
        block->adapter->load_count++;
        block->adapter->broker = broker;
        return;
    }
    block->adapter = create_adapter(block, registration, broker, provider_name);
    CMPI_Adapter* adapter = block->adapter;
    guard.unlock();
    load_adapter(adapter, context);
}

// The same values are written at each call of the factory.
void* fill_interface(Provider_Static_Data* block, char letter) {
    const Auto_Mutex guard(*factory_mutex);
    switch (letter) {
    case 'I':
        block->instance_mi = {block, &block->instance_ft};
        return &block->instance_mi;
    case 'M':
        block->method_mi = {block, &block->method_ft};
        return &block->method_mi;
    case 'A':
        block->association_mi = {block, &block->association_ft};
        return &block->association_mi;
    case 'N':
        block->indication_mi = {block, &block->indication_ft};
        return &block->indication_mi;
    default:
        return nullptr;
    }
}

} // namespace

Answer cleanup_adapter(const Call& call, bool terminating) {
    CMPI_Adapter& adapter = call.adapter;
    if (!terminating && !adapter.allow_unload)
        return {CMPI_RC_DO_NOT_UNLOAD, "cleanup do not unload"};

    Auto_Mutex guard(*factory_mutex);
    if (adapter.load_count > 1) {
        adapter.load_count--;
        return {CMPI_RC_OK, "cleanup decrement"};
    }
    if (adapter.static_data->adapter != &adapter)
        return CMPI_RC_ERR_INVALID_HANDLE; // another thread's cleanup was the last
    // Out of the block first: a factory call that the unload causes, or that comes meanwhile, loads
    // anew instead of finding a provider on its way out.
    unlink_adapter(&adapter);
    guard.unlock();
    // The block's share; the frame's own keeps the adapter to the end of this call.
    const std::unique_ptr<CMPI_Adapter, void (*)(CMPI_Adapter*)> share(&adapter, drop_user);
    call.provider(OP_UNLOAD);
    return {CMPI_RC_OK, "cleanup unload"};
}

// ---- Call ----

sint32 Call::run(int operation, const Provider_Word (&args)[8]) const {
    return adapter.proc(adapter.registration, operation, args[0], args[1], args[2], args[3],
                        args[4], args[5], args[6], args[7]);
}

const Meta_Repository* Call::repository() const {
    const Meta_Repository* repository = nullptr;
    run(OP_GET_REPOSITORY, {word(&repository)});
    return repository;
}

const Meta_Class* Call::find_class(const CMPIObjectPath* path) const {
    const String name = cmpi::class_name(path);
    if (adapter.meta_class && name_equal(adapter.meta_class->name, name.c_str()))
        return adapter.meta_class; // as the search would find, but at once
    return find_meta_class(repository(), name.c_str());
}

Converter Call::converter(const String& name_space) const {
    return {broker, repository(), name_space};
}

// ---- Frame ----

namespace {

Answer run_body(CMPI_Adapter& adapter, const CMPIContext* context, const char* function,
                Locking locking, Answer (*body)(const Call&, void*), void* closure) {
    const Pushed_Context pushed(adapter.broker, context, &adapter);
    // A call that an up-call of our own thread leads to does not wait for the clients of its
    // provider: they may be waiting for that thread.
    const bool locks = locking == Locking::ADAPTER && !Thread::is_ours();
    if (locks)
        adapter.lock.lock();
    const auto unlock = [locks](CMPI_Adapter* held) {
        if (locks)
            held->lock.unlock();
    };
    const std::unique_ptr<CMPI_Adapter, decltype(unlock)> locked(&adapter, unlock);

    CIMPLE_DBG("enter: %s()", function);
    const Answer answer = body({adapter, adapter.broker, context}, closure);
    if (answer.text)
        CIMPLE_DBG("return: %s(): %s %s", function, return_word(answer.traced), answer.text);
    else
        CIMPLE_DBG("return: %s(): %s", function, return_word(answer.traced));
    return answer;
}

} // namespace

CMPIStatus run_call(void* handle, const CMPIContext* context, const char* function, Locking locking,
                    Answer (*body)(const Call& call, void* closure), void* closure) {
    Answer answer = CMPI_RC_ERR_INVALID_HANDLE;
    const bool complete = run_guarded([&] {
        const Adapter_Use use(static_cast<Provider_Static_Data*>(handle));
        if (use.get())
            answer = run_body(*use.get(), context, function, locking, body, closure);
    });
    if (!complete) {
        CIMPLE_ERR("exception in %s()", function);
        return cmpi::FAILED_STATUS;
    }
    return {static_cast<CMPIrc>(answer.rc), nullptr};
}

// ---- Delivery ----

bool deliver_path(Delivery& delivery, const Instance* instance, const char* name_space) {
    cmpi::Scoped<CMPIObjectPath> path;
    delivery.error = make_cmpi_object_path(delivery.call.broker, instance, name_space, path.out(),
                                           &delivery.ends);
    if (delivery.error != CMPI_RC_OK)
        return false;
    cmpi::return_path(delivery.result, path.get());
    return true;
}

bool deliver_instance(Delivery& delivery, const Instance* instance, const char* name_space) {
    const CMPIBroker* broker = delivery.call.broker;
    cmpi::Scoped<CMPIObjectPath> path;
    delivery.error =
        make_cmpi_object_path(broker, instance, name_space, path.out(), &delivery.ends);
    if (delivery.error != CMPI_RC_OK)
        return false;
    cmpi::Scoped<CMPIInstance> object;
    delivery.error = make_CMPI_instance(broker, instance, name_space, path.get(),
                                        delivery.properties, object.out(), &delivery.ends);
    if (delivery.error != CMPI_RC_OK)
        return false;
    cmpi::return_instance(delivery.result, object.get());
    return true;
}

} // namespace cimple

// ---- Factory ----

extern "C" int cimple_cmpi_adapter(cimple::Provider_Static_Data* static_data,
                                   const cimple::Registration* registration,
                                   const CMPIBroker* broker, const CMPIContext* context,
                                   const char* provider_name, char letter, void** out) {
    using namespace cimple;
    *out = nullptr;
    const bool complete = run_guarded([&] {
        CIMPLE_DBG("enter: %s()", "cimple_cmpi_adapter");
        count_or_load(static_data, registration, broker, context, provider_name);
        *out = fill_interface(static_data, letter);
        CIMPLE_DBG("return: %s()", "cimple_cmpi_adapter");
    });
    if (!complete)
        CIMPLE_ERR("exception in %s()", "cimple_cmpi_adapter");
    return 0;
}
