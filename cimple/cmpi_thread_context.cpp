#include "cimple/cmpi_thread_context.h"

#include "cimple/cmpi_call.h"
#include "cimple/conversion.h"
#include "cimple/log.h"

#include <memory>
#include <new>

namespace cimple {

// The enumeration goes with the enumerator, or before it with the context that it is of: who holds
// an enumerator beyond its call finds it at its end.
struct CMPI_Enumerator : Instance_Enumerator_Rep {
    CMPI_Enumerator(CMPI_Thread_Context& owner, CMPIEnumeration* elements, const Instance* model,
                    const char* in_name_space)
        : enumeration(elements), name_space(in_name_space), current(), _owner(owner),
          _next(owner._enumerators) {
        meta_class = model->__meta_class;
        ref(meta_class);
        owner._enumerators = this;
    }
    ~CMPI_Enumerator() override {
        end();
        unref(meta_class);
    }

    void end() noexcept {
        if (!enumeration)
            return;
        CMPI_Enumerator** link = &_owner._enumerators;
        while (*link != this)
            link = &(*link)->_next;
        *link = _next;
        cmpi::release(enumeration);
        enumeration = nullptr;
    }

    CMPIEnumeration* enumeration; // null: ended
    const Meta_Class* meta_class; // of the model: elements are converted to it
    String name_space;
    Ref<Instance> current;

private:
    CMPI_Thread_Context& _owner; // as long as there is an enumeration
    CMPI_Enumerator* _next;
};

namespace {

CMPI_Enumerator& enumerator(Instance_Enumerator_Rep* rep) {
    return *static_cast<CMPI_Enumerator*>(rep);
}

// What an up-call makes is given back at its end: the thread may live long.
using Path = cmpi::Scoped<CMPIObjectPath>;
using Object = cmpi::Scoped<CMPIInstance>;
using Args = cmpi::Scoped<CMPIArgs>;

bool make_path(const CMPIBroker* broker, const Instance* instance, const char* name_space,
               Path& path) {
    return instance && name_space &&
           make_cmpi_object_path(broker, instance, name_space, path.out()) == CMPI_RC_OK;
}

bool make_object(const CMPIBroker* broker, const Instance* instance, const char* name_space,
                 const Path& path, Object& object) {
    return make_CMPI_instance(broker, instance, name_space, path.get(), nullptr, object.out()) ==
           CMPI_RC_OK;
}

Converter converter_for(const CMPIBroker* broker, const Meta_Class* meta_class,
                        const String& name_space) {
    return {broker, meta_class->meta_repository, name_space};
}

} // namespace

CMPI_Thread_Context::~CMPI_Thread_Context() {
    end_enumerations();
    cmpi::release(_prepared);
}

void CMPI_Thread_Context::end_enumerations() noexcept {
    while (_enumerators)
        _enumerators->end();
}

// ---- Threads ----

Thread_Context* CMPI_Thread_Context::thread_create_hook(void*) {
    CMPIContext* prepared = _broker->bft->prepareAttachThread(_broker, _context);
    if (!prepared)
        return nullptr;
    auto* child = new (std::nothrow) CMPI_Thread_Context(_broker, prepared, nullptr);
    if (child)
        child->_prepared = prepared;
    else
        cmpi::release(prepared);
    return child;
}

bool CMPI_Thread_Context::thread_start_hook() {
    if (!cmpi::good(_broker->bft->attachThread(_broker, _context))) {
        CIMPLE_ERR("CBAttachThread() failed");
        return false;
    }
    _prepared = nullptr; // the broker frees it when the thread detaches
    return true;
}

void CMPI_Thread_Context::thread_exit_hook() {
    end_enumerations();
    _broker->bft->detachThread(_broker, _context);
}

// ---- Enumeration ----

Instance_Enumerator_Rep* CMPI_Thread_Context::start_enum(const char* name_space,
                                                         const Instance* model) {
    Path path;
    if (!make_path(_broker, model, name_space, path))
        return nullptr;
    cmpi::Status status;
    cmpi::Scoped<CMPIEnumeration> enumeration(
        _broker->bft->enumerateInstances(_broker, _context, path.get(), nullptr, status.out()));
    if (!enumeration || !status)
        return nullptr;
    auto rep = std::make_unique<CMPI_Enumerator>(*this, enumeration.get(), model, name_space);
    enumeration.keep();
    next(rep.get());
    return rep.release();
}

void CMPI_Thread_Context::destroy_enum(Instance_Enumerator_Rep* rep) {
    delete rep;
}

bool CMPI_Thread_Context::more(Instance_Enumerator_Rep* rep) {
    return static_cast<bool>(enumerator(rep).current);
}

// An element of another type, a null one, or one that cannot be fetched ends the enumeration. The
// state word does not tell a null one: a broker is known that sets it on good elements.
void CMPI_Thread_Context::next(Instance_Enumerator_Rep* rep) {
    CMPI_Enumerator& state = enumerator(rep);
    state.current.reset();
    if (!state.enumeration || !cmpi::has_next(state.enumeration))
        return;
    CMPIStatus status;
    const CMPIData data = cmpi::get_next(state.enumeration, status);
    if (!cmpi::good(status) || data.type != CMPI_instance || !data.value.inst ||
        (data.state & (CMPI_notFound | CMPI_badValue)))
        return;
    state.current = make_cimple_instance(converter_for(_broker, state.meta_class, state.name_space),
                                         state.meta_class, data.value.inst);
}

Ref<Instance> CMPI_Thread_Context::get(Instance_Enumerator_Rep* rep) {
    return enumerator(rep).current;
}

// ---- Single instances ----

Ref<Instance> CMPI_Thread_Context::get_instance(const char* name_space, const Instance* model) {
    Path path;
    if (!make_path(_broker, model, name_space, path))
        return {};
    cmpi::Status status;
    const Object found(
        _broker->bft->getInstance(_broker, _context, path.get(), nullptr, status.out()));
    if (!found || !status)
        return {};
    return make_cimple_instance(converter_for(_broker, model->__meta_class, name_space),
                                model->__meta_class, found.get());
}

int CMPI_Thread_Context::create_instance(const char* name_space, const Instance* instance) {
    Path path;
    Object source;
    if (!make_path(_broker, instance, name_space, path) ||
        !make_object(_broker, instance, name_space, path, source))
        return -1;
    cmpi::Status status;
    const Path created(
        _broker->bft->createInstance(_broker, _context, path.get(), source.get(), status.out()));
    return status ? 0 : -1;
}

int CMPI_Thread_Context::delete_instance(const char* name_space, const Instance* instance) {
    Path path;
    if (!make_path(_broker, instance, name_space, path))
        return -1;
    const cmpi::Status status(_broker->bft->deleteInstance(_broker, _context, path.get()));
    return status ? 0 : -1;
}

int CMPI_Thread_Context::modify_instance(const char* name_space, const Instance* instance) {
    Path path;
    Object source;
    if (!make_path(_broker, instance, name_space, path) ||
        !make_object(_broker, instance, name_space, path, source))
        return -1;
    const cmpi::Status status(
        _broker->bft->modifyInstance(_broker, _context, path.get(), source.get(), nullptr));
    return status ? 0 : -1;
}

// ---- Methods ----

int CMPI_Thread_Context::invoke_method(const char* name_space, const Instance* instance,
                                       Instance* method) {
    const auto failed = [] {
        CIMPLE_WARN("failed");
        return -1;
    };
    if (!name_space || !instance || !method || !instance->__meta_class->meta_repository ||
        !_broker || !_context)
        return failed();
    const Meta_Class* meta_class = instance->__meta_class;
    const Meta_Features* meta_method = method->__meta_class;

    Path path;
    if (meta_method->flags & FLAG_STATIC)
        path.out() = cmpi::new_path(_broker, name_space, meta_class->name);
    else
        make_path(_broker, instance, name_space, path);
    if (!path)
        return failed();
    const Args in(cmpi::new_args(_broker));
    if (!in || make_method_args(_broker, name_space, method, FLAG_IN, in.get()) != CMPI_RC_OK)
        return failed();
    const Args out(cmpi::new_args(_broker));
    if (!out)
        return failed();
    cmpi::Status status;
    const CMPIData result = _broker->bft->invokeMethod(
        _broker, _context, path.get(), meta_method->name, in.get(), out.get(), status.out());
    if (!status) {
        CIMPLE_WARN("failed[%u]", static_cast<unsigned>(status.rc()));
        return -1;
    }
    const int rc =
        read_method_out(converter_for(_broker, meta_class, name_space), out.get(), result, method);
    if (!(result.state & cmpi::UNUSABLE))
        cmpi::release(result.value, result.type);
    return rc == CMPI_RC_OK ? 0 : failed();
}

// ---- The rest ----

void CMPI_Thread_Context::allow_unload(bool flag) {
    if (_adapter)
        _adapter->allow_unload = flag;
}

bool CMPI_Thread_Context::get_username(String& user) {
    CMPIStatus status = cmpi::GOOD_STATUS;
    if (!_context)
        return false;
    const CMPIData entry = _context->ft->getEntry(_context, CMPIPrincipal, &status);
    const char* text = nullptr;
    if (cmpi::good(status) && entry.type == CMPI_string && !(entry.state & cmpi::UNUSABLE))
        text = cmpi::chars(entry.value.string);
    if (!text) {
        CIMPLE_WARN("username not OK cmpirc=%d", static_cast<int>(status.rc));
        return false;
    }
    user = text;
    return true;
}

} // namespace cimple
