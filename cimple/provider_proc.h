// The provider procedures: what turns the numbered operations of registration.h into calls on a
// plain provider class.
//
// A generated registration names one of three templates per class; nothing else is written per
// class:
//
//     instance_proc<VLNMPCA_Card_Provider, VLNMPCA_Card>
//     association_proc<VLNMPCA_Realizes_Provider, VLNMPCA_Realizes>
//     method_proc<VLNMPCA_Dump_Provider, VLNMPCA_Dump, invoke_VLNMPCA_Dump>
//
// A provider class is an empty type with these members (C is its class), non-virtual:
//
//     sint32 load();
//     sint32 unload();
//     sint32 get_instance(const C* keys, C*& out);             // the caller owns out
//     sint32 enum_instances(const C* model, const Enum_Instances_Handler& handler);
//     sint32 create_instance(C* instance);
//     sint32 delete_instance(const C* keys);
//     sint32 modify_instance(const C* model, const C* instance);
// and for an association:
//     sint32 enum_associator_names(const Instance* source, const char* result_class,
//                                  const char* role, const char* result_role,
//                                  const Enum_Associator_Names_Handler& handler);
//     sint32 enum_references(const Instance* source, const C* model, const char* role,
//                            const Enum_References_Handler& handler);
//     sint32 enum_associators(const Instance* source, const char* result_class, const char* role,
//                             const char* result_role, const Enum_Associators_Handler& handler);
//
// Methods. For a class with extrinsic methods the generator writes one function, which tries the
// class's methods in declaration order; each method has a structure of its own, derived from
// Instance, with the member `static const Meta_Method static_meta_class`:
//
//     static sint32 invoke_VLNMPCA_Dump(VLNMPCA_Dump_Provider* provider, const VLNMPCA_Dump* self,
//                                       Instance* method) {
//         if (auto* m = method_cast<VLNMPCA_Dump_Start_method>(method))
//             return provider->Start(self, &m->Target, &m->Job, &m->return_value);
//         return -1;
//     }
//
// A parameter is passed as a pointer to its member: Property<T>*, or C** for a scalar reference.
//
// The templates hold thunks and a constant table only; the logic is in provider_proc.cpp, once.
#ifndef CIMPLE_PROVIDER_PROC_H
#define CIMPLE_PROVIDER_PROC_H

#include "cimple/registration.h"

#include <type_traits>

namespace cimple {

// One class's operations with its types erased. The last four are null where the class has none.
struct Provider_Operations {
    const Meta_Class* meta_class;
    void* (*create)();
    void (*destroy)(void* provider);
    sint32 (*load)(void* provider);
    sint32 (*unload)(void* provider);
    sint32 (*get_instance)(void* provider, const Instance* keys, Instance*& out);
    sint32 (*enum_instances)(void* provider, const Instance* model,
                             const Instance_Handler& handler);
    sint32 (*create_instance)(void* provider, Instance* instance);
    sint32 (*delete_instance)(void* provider, const Instance* keys);
    sint32 (*modify_instance)(void* provider, const Instance* model, const Instance* instance);

    sint32 (*invoke_method)(void* provider, const Instance* self, Instance* method);
    sint32 (*enum_associator_names)(void* provider, const Instance* source,
                                    const char* result_class, const char* role,
                                    const char* result_role, const Instance_Handler& handler);
    sint32 (*enum_references)(void* provider, const Instance* source, const Instance* model,
                              const char* role, const Instance_Handler& handler);
    sint32 (*enum_associators)(void* provider, const Instance* source, const char* result_class,
                               const char* role, const char* result_role,
                               const Instance_Handler& handler);
};

// Runs one numbered operation; -1 for one that the class does not have. Every enumeration ends in a
// call of the handler with a null instance and the provider's status; an association operation that
// the provider does not support ends without it, so that the adapter can derive the answer.
sint32 run_provider_operation(const Provider_Operations& operations, int operation,
                              const Provider_Word (&args)[8]);

// Whether the method instance belongs to this method: same name in any case, same layout.
bool is_method_instance(const Instance* method, const Meta_Method& meta_method);

template <class M>
M* method_cast(Instance* method) {
    return is_method_instance(method, M::static_meta_class) ? static_cast<M*>(method) : nullptr;
}

template <class P, class C>
struct Provider_Thunks {
    static_assert(std::is_empty_v<P>, "all state of a provider is in the agent");

    static P* self(void* provider) { return static_cast<P*>(provider); }
    static void* create() { return new P; }
    static void destroy(void* provider) { delete self(provider); }
    static sint32 load(void* provider) { return self(provider)->load(); }
    static sint32 unload(void* provider) { return self(provider)->unload(); }
    static sint32 get_instance(void* provider, const Instance* keys, Instance*& out) {
        C* found = nullptr;
        const sint32 status = self(provider)->get_instance(static_cast<const C*>(keys), found);
        out = found;
        return status;
    }
    static sint32 enum_instances(void* provider, const Instance* model,
                                 const Instance_Handler& handler) {
        return self(provider)->enum_instances(static_cast<const C*>(model), handler);
    }
    static sint32 create_instance(void* provider, Instance* instance) {
        return self(provider)->create_instance(static_cast<C*>(instance));
    }
    static sint32 delete_instance(void* provider, const Instance* keys) {
        return self(provider)->delete_instance(static_cast<const C*>(keys));
    }
    static sint32 modify_instance(void* provider, const Instance* model, const Instance* instance) {
        return self(provider)->modify_instance(static_cast<const C*>(model),
                                               static_cast<const C*>(instance));
    }
    template <sint32 (*Invoke)(P*, const C*, Instance*)>
    static sint32 invoke_method(void* provider, const Instance* instance, Instance* method) {
        return Invoke(self(provider), static_cast<const C*>(instance), method);
    }
    static sint32 enum_associator_names(void* provider, const Instance* source,
                                        const char* result_class, const char* role,
                                        const char* result_role, const Instance_Handler& handler) {
        return self(provider)->enum_associator_names(source, result_class, role, result_role,
                                                     handler);
    }
    static sint32 enum_references(void* provider, const Instance* source, const Instance* model,
                                  const char* role, const Instance_Handler& handler) {
        return self(provider)->enum_references(source, static_cast<const C*>(model), role, handler);
    }
    static sint32 enum_associators(void* provider, const Instance* source, const char* result_class,
                                   const char* role, const char* result_role,
                                   const Instance_Handler& handler) {
        return self(provider)->enum_associators(source, result_class, role, result_role, handler);
    }

    static constexpr Provider_Operations operations() {
        return {&C::static_meta_class,
                create,
                destroy,
                load,
                unload,
                get_instance,
                enum_instances,
                create_instance,
                delete_instance,
                modify_instance,
                nullptr,
                nullptr,
                nullptr,
                nullptr};
    }
    template <sint32 (*Invoke)(P*, const C*, Instance*)>
    static constexpr Provider_Operations method_operations() {
        Provider_Operations table = operations();
        table.invoke_method = invoke_method<Invoke>;
        return table;
    }
    static constexpr Provider_Operations association_operations() {
        Provider_Operations table = operations();
        table.enum_associator_names = enum_associator_names;
        table.enum_references = enum_references;
        table.enum_associators = enum_associators;
        return table;
    }
};

// The three kinds of procedure. Each has the type Provider_Proc.

template <class P, class C>
sint32 instance_proc(const Registration*, int operation, Provider_Word a0, Provider_Word a1,
                     Provider_Word a2, Provider_Word a3, Provider_Word a4, Provider_Word a5,
                     Provider_Word a6, Provider_Word a7) {
    static constexpr Provider_Operations table = Provider_Thunks<P, C>::operations();
    return run_provider_operation(table, operation, {a0, a1, a2, a3, a4, a5, a6, a7});
}

template <class P, class C, sint32 (*Invoke)(P*, const C*, Instance*)>
sint32 method_proc(const Registration*, int operation, Provider_Word a0, Provider_Word a1,
                   Provider_Word a2, Provider_Word a3, Provider_Word a4, Provider_Word a5,
                   Provider_Word a6, Provider_Word a7) {
    static constexpr Provider_Operations table =
        Provider_Thunks<P, C>::template method_operations<Invoke>();
    return run_provider_operation(table, operation, {a0, a1, a2, a3, a4, a5, a6, a7});
}

template <class P, class C>
sint32 association_proc(const Registration*, int operation, Provider_Word a0, Provider_Word a1,
                        Provider_Word a2, Provider_Word a3, Provider_Word a4, Provider_Word a5,
                        Provider_Word a6, Provider_Word a7) {
    static constexpr Provider_Operations table = Provider_Thunks<P, C>::association_operations();
    return run_provider_operation(table, operation, {a0, a1, a2, a3, a4, a5, a6, a7});
}

} // namespace cimple

#endif // CIMPLE_PROVIDER_PROC_H
