#include "cimple/cimom.h"

namespace cimple {

bool Instance_Enumerator::more() const {
    Thread_Context* context = Thread_Context::top();
    return context && _rep && context->more(_rep);
}

void Instance_Enumerator::next() {
    Thread_Context* context = Thread_Context::top();
    if (context && _rep)
        context->next(_rep);
}

Ref<Instance> Instance_Enumerator::get() const {
    Thread_Context* context = Thread_Context::top();
    return context && _rep ? context->get(_rep) : Ref<Instance>();
}

void Instance_Enumerator::destroy() {
    if (Thread_Context* context = Thread_Context::top(); context && _rep)
        context->destroy_enum(_rep);
    else
        delete _rep; // it outlived the call: what it holds is freed all the same
    _rep = nullptr;
}

bool cimom::get_username(String& user) {
    Thread_Context* context = Thread_Context::top();
    return context && context->get_username(user);
}

int cimom::allow_unload(bool flag) {
    Thread_Context* context = Thread_Context::top();
    if (!context)
        return -1;
    context->allow_unload(flag);
    return 0;
}

int cimom::enum_instances(const char* name_space, const Instance* model,
                          Instance_Enumerator& enumerator) {
    enumerator.destroy();
    Thread_Context* context = Thread_Context::top();
    if (context)
        enumerator._rep = context->start_enum(name_space, model);
    return enumerator._rep ? 0 : -1;
}

int cimom::enum_instances(const char*, const Instance*, Array<Instance*>&) {
    std::fputs("NOT IMPLEMENTED.\n", stderr);
    __cimple_assert(__FILE__, __LINE__, __func__, "false");
}

Ref<Instance> cimom::get_instance(const char* name_space, const Instance* model) {
    Thread_Context* context = Thread_Context::top();
    return context ? context->get_instance(name_space, model) : Ref<Instance>();
}

int cimom::create_instance(const char* name_space, const Instance* instance) {
    Thread_Context* context = Thread_Context::top();
    return context ? context->create_instance(name_space, instance) : -1;
}

int cimom::delete_instance(const char* name_space, const Instance* instance) {
    Thread_Context* context = Thread_Context::top();
    return context ? context->delete_instance(name_space, instance) : -1;
}

int cimom::modify_instance(const char* name_space, const Instance* instance) {
    Thread_Context* context = Thread_Context::top();
    return context ? context->modify_instance(name_space, instance) : -1;
}

int cimom::invoke_method(const char* name_space, const Instance* instance, Instance* method) {
    Thread_Context* context = Thread_Context::top();
    return context ? context->invoke_method(name_space, instance, method) : -1;
}

} // namespace cimple
