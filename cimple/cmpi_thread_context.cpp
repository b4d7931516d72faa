#include "cimple/cmpi_thread_context.h"

#include "cimple/cmpi_call.h"
#include "cimple/conversion.h"
#include "cimple/log.h"

#include <memory>
#include <new>

namespace cimple {

namespace {

struct CMPI_Enumerator : Instance_Enumerator_Rep {
    CMPIEnumeration* enumeration = nullptr;
    const Meta_Class* meta_class = nullptr; // of the model: elements are converted to it
    String name_space;
    Ref<Instance> current;
};

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
                        const char* name_space) {
    return {broker, meta_class->meta_repository, name_space};
}

} // namespace

CMPI_Thread_Context::~CMPI_Thread_Context() {
    cmpi::release(_prepared);
}

// ---- Threads ----

Thread_Context* CMPI_Thread_Context::thread_create_hook(void*) {
    CMPIContext* prepared = _broker->bft->prepareAttachThread(_broker, _context);
    if (!prepared)
        return nullptr;
    auto* child = new (std::nothrow) CMPI_Thread_Context(_broker, prepared, _adapter);
    if (child)
        child->_prepared = prepared;
    else
        cmpi::release(prepared);
    return child;
}

void CMPI_Thread_Context::thread_start_hook() {
    _prepared = nullptr; // the broker frees it when the thread detaches
    if (!cmpi::good(_broker->bft->attachThread(_broker, _context)))
        CIMPLE_ERR("CBAttachThread() failed");
}

void CMPI_Thread_Context::thread_exit_hook() {
    _broker->bft->detachThread(_broker, _context);
}

// ---- Enumeration ----

Instance_Enumerator_Rep* CMPI_Thread_Context::start_enum(const char* name_space,
                                                         const Instance* model) {
    Path path;
    if (!make_path(_broker, model, name_space, path))
        return nullptr;
    CMPIStatus status = cmpi::GOOD_STATUS;
    CMPIEnumeration* enumeration =
        _broker->bft->enumerateInstances(_broker, _context, path.get(), nullptr, &status);
    if (!enumeration || !cmpi::good(status))
        return nullptr;
    auto rep = std::make_unique<CMPI_Enumerator>();
    rep->enumeration = enumeration;
    rep->meta_class = model->__meta_class;
    rep->name_space = name_space;
    next(rep.get());
    return rep.release();
}

void CMPI_Thread_Context::destroy_enum(Instance_Enumerator_Rep* rep) {
    delete rep;
}

bool CMPI_Thread_Context::more(Instance_Enumerator_Rep* rep) {
    return static_cast<bool>(enumerator(rep).current);
}

// An element of another type, or one that cannot be fetched, ends the enumeration.
void CMPI_Thread_Context::next(Instance_Enumerator_Rep* rep) {
    CMPI_Enumerator& state = enumerator(rep);
    state.current.reset();
    if (!cmpi::has_next(state.enumeration))
        return;
    CMPIStatus status;
    const CMPIData data = cmpi::get_next(state.enumeration, status);
    if (!cmpi::good(status) || data.type != CMPI_instance || (data.state & cmpi::UNUSABLE))
        return;
    Instance* instance = nullptr;
    make_cimple_instance(converter_for(_broker, state.meta_class, state.name_space.c_str()),
                         state.meta_class, data.value.inst, instance);
    state.current.reset(instance);
}

Ref<Instance> CMPI_Thread_Context::get(Instance_Enumerator_Rep* rep) {
    return enumerator(rep).current;
}

// ---- Single instances ----

Ref<Instance> CMPI_Thread_Context::get_instance(const char* name_space, const Instance* model) {
    Path path;
    if (!make_path(_broker, model, name_space, path))
        return {};
    CMPIStatus status = cmpi::GOOD_STATUS;
    const CMPIInstance* found =
        _broker->bft->getInstance(_broker, _context, path.get(), nullptr, &status);
    if (!found || !cmpi::good(status))
        return {};
    Instance* instance = nullptr;
    make_cimple_instance(converter_for(_broker, model->__meta_class, name_space),
                         model->__meta_class, found, instance);
    return instance;
}

int CMPI_Thread_Context::create_instance(const char* name_space, const Instance* instance) {
    Path path;
    Object source;
    if (!make_path(_broker, instance, name_space, path) ||
        !make_object(_broker, instance, name_space, path, source))
        return -1;
    CMPIStatus status = cmpi::GOOD_STATUS;
    _broker->bft->createInstance(_broker, _context, path.get(), source.get(), &status);
    return cmpi::good(status) ? 0 : -1;
}

int CMPI_Thread_Context::delete_instance(const char* name_space, const Instance* instance) {
    Path path;
    if (!make_path(_broker, instance, name_space, path))
        return -1;
    return cmpi::good(_broker->bft->deleteInstance(_broker, _context, path.get())) ? 0 : -1;
}

int CMPI_Thread_Context::modify_instance(const char* name_space, const Instance* instance) {
    Path path;
    Object source;
    if (!make_path(_broker, instance, name_space, path) ||
        !make_object(_broker, instance, name_space, path, source))
        return -1;
    const CMPIStatus status =
        _broker->bft->modifyInstance(_broker, _context, path.get(), source.get(), nullptr);
    return cmpi::good(status) ? 0 : -1;
}

// ---- Methods ----

int CMPI_Thread_Context::invoke_method(const char* name_space, const Instance* instance,
                                       Instance* method) {
    const auto failed = [] {
        CIMPLE_WARN("failed");
        return -1;
    };
    if (!name_space || !instance || !method || !instance->__meta_class->meta_repository)
        return failed();
    const Meta_Class* meta_class = instance->__meta_class;
    const Meta_Features* meta_method = method->__meta_class;

    Path path(meta_method->flags & FLAG_STATIC
                  ? cmpi::new_path(_broker, name_space, meta_class->name)
                  : nullptr);
    if (!path && !make_path(_broker, instance, name_space, path))
        return failed();
    const Args in(cmpi::new_args(_broker));
    if (!in || make_method_args(_broker, name_space, method, FLAG_IN, in.get()) != CMPI_RC_OK)
        return failed();
    const Args out(cmpi::new_args(_broker));
    if (!out)
        return failed();
    CMPIStatus status = cmpi::GOOD_STATUS;
    const CMPIData result = _broker->bft->invokeMethod(
        _broker, _context, path.get(), meta_method->name, in.get(), out.get(), &status);
    if (!cmpi::good(status)) {
        CIMPLE_WARN("failed[%u]", static_cast<unsigned>(status.rc));
        return -1;
    }
    if (read_method_out(converter_for(_broker, meta_class, name_space), out.get(), result,
                        method) != CMPI_RC_OK)
        return failed();
    return 0;
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
