// Up-calls: what provider code may ask of the object manager, on the thread's current context.
//
// Without a context (a thread the object manager does not know) every call answers -1, null or
// false. Instances given are not taken over. A namespace is that of the target, e.g.
// "root/pg_interop".
#ifndef CIMPLE_CIMOM_H
#define CIMPLE_CIMOM_H

#include "cimple/thread_context.h"

namespace cimple {

// The result of cimom::enum_instances:
//     for (; enumerator.more(); enumerator.next())
//         use(enumerator.get());
// It stands on the first element at once, and is used on the thread that started it.
class Instance_Enumerator {
public:
    Instance_Enumerator() noexcept = default;
    ~Instance_Enumerator() { destroy(); }
    Instance_Enumerator(const Instance_Enumerator&) = delete;
    Instance_Enumerator& operator=(const Instance_Enumerator&) = delete;

    bool more() const;
    void next();
    Ref<Instance> get() const; // the present element, counted
    void destroy();            // ends the enumeration early

private:
    friend class cimom;
    Instance_Enumerator_Rep* _rep = nullptr;
};

class cimom {
public:
    static bool get_username(String& user);
    static int allow_unload(bool flag);
    // 0 when the enumeration was started. Elements are converted to the model's class.
    static int enum_instances(const char* name_space, const Instance* model,
                              Instance_Enumerator& enumerator);
    // The form that fills an array is not implemented, and ends the process.
    [[noreturn]] static int enum_instances(const char* name_space, const Instance* model,
                                           Array<Instance*>& instances);
    static Ref<Instance> get_instance(const char* name_space, const Instance* model);
    static int create_instance(const char* name_space, const Instance* instance);
    static int delete_instance(const char* name_space, const Instance* instance);
    static int modify_instance(const char* name_space, const Instance* instance);
    // Calls the method and puts its outputs and return value into the method instance.
    static int invoke_method(const char* name_space, const Instance* instance, Instance* method);
};

} // namespace cimple

#endif // CIMPLE_CIMOM_H
