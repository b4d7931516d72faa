// Up-calls: what provider code may ask of the object manager, on the thread's current context.
//
// Without a context (a thread the object manager does not know) every call answers -1, null or false.
#ifndef CIMPLE_CIMOM_H
#define CIMPLE_CIMOM_H

#include "cimple/thread_context.h"

namespace cimple {

// The result of cimom::enum_instances; walks it with more, next and get.
class Instance_Enumerator {
public:
    Instance_Enumerator() noexcept = default;
    ~Instance_Enumerator();
    Instance_Enumerator(const Instance_Enumerator&) = delete;
    Instance_Enumerator& operator=(const Instance_Enumerator&) = delete;

    bool more() const;
    void next();
    Ref<Instance> get() const; // the present element, counted

private:
    friend class cimom;
    Thread_Context* _context = nullptr;
    Instance_Enumerator_Rep* _rep = nullptr;
};

class cimom {
public:
    static bool get_username(String& user);
    static int allow_unload(bool flag);
    // 0 when the enumeration was started.
    static int enum_instances(const char* name_space, const Instance* model,
                              Instance_Enumerator& enumerator);
    static Ref<Instance> get_instance(const char* name_space, const Instance* model);
    static int create_instance(const char* name_space, const Instance* instance);
    static int delete_instance(const char* name_space, const Instance* instance);
    static int modify_instance(const char* name_space, const Instance* instance);
    static int invoke_method(const char* name_space, const Instance* instance, Instance* method);
};

} // namespace cimple

#endif // CIMPLE_CIMOM_H
