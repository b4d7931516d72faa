#include "cimple/provider_proc.h"

#include "cimple/instance_detail.h"

namespace cimple {

namespace {

template <class T>
T* pointer(Provider_Word word) {
    return reinterpret_cast<T*>(word);
}

const char* text(Provider_Word word) {
    return word ? pointer<const char>(word) : "";
}

Instance_Handler handler_of(Provider_Word proc, Provider_Word client_data) {
    return {reinterpret_cast<Instance_Proc>(proc), pointer<void>(client_data)};
}

// The status is told whatever it is: the closing call is how the receiver learns of the end.
sint32 close_stream(Provider_Word proc, Provider_Word client_data, sint32 status) {
    reinterpret_cast<Instance_Proc>(proc)(nullptr, status, pointer<void>(client_data));
    return status;
}

// An instance as a provider sees it: of the provider's class or a subclass.
//
// The object manager picks the provider and may ask the provider of a subclass with instances of a
// base class, whose structure is shorter than what the provider would read. Those are handed over
// as an instance of the provider's class with the common members copied.
class In_Class {
public:
    In_Class(const Meta_Class* meta_class, Instance* instance) : _instance(instance) {
        if (!instance || is_subclass(meta_class, instance->__meta_class))
            return;
        _converted.reset(create_null(meta_class));
        _instance = _converted.get();
        _instance->__name_space = instance->__name_space;
        for (uint32 i = 0; i < meta_class->num_meta_features; i++)
            copy_common(meta_class->meta_features[i], instance);
    }
    Instance* get() const { return _instance; }

private:
    void copy_common(const Meta_Feature* feature, const Instance* source) {
        const Meta_Feature* other = find_feature(source->__meta_class, feature->name,
                                                 feature->flags & (FLAG_PROPERTY | FLAG_REFERENCE));
        if (!other)
            return;
        if (feature->flags & FLAG_PROPERTY) {
            const auto* mine = static_cast<const Meta_Property*>(feature);
            const auto* theirs = static_cast<const Meta_Property*>(other);
            if (mine->type == theirs->type && mine->subscript == theirs->subscript)
                detail::copy_value(_instance, mine, source, theirs);
            return;
        }
        const auto* mine = static_cast<const Meta_Reference*>(feature);
        const auto* theirs = static_cast<const Meta_Reference*>(other);
        if (mine->subscript != 0 || theirs->subscript != 0)
            return;
        const Instance* target = reference(source, theirs);
        if (target && is_subclass(mine->meta_class, target->__meta_class))
            reference(_instance, mine) = clone(target);
    }

    Instance* _instance;
    Ref<Instance> _converted;
};

sint32 enum_instances(const Provider_Operations& operations, const Provider_Word (&args)[8]) {
    const In_Class model(operations.meta_class, pointer<Instance>(args[1]));
    const Instance_Handler handler(reinterpret_cast<Instance_Proc>(args[2]), pointer<void>(args[3]),
                                   pointer<const Enumeration_Focus>(args[4]));
    const sint32 status = operations.enum_instances(pointer<void>(args[0]), model.get(), handler);
    return close_stream(args[2], args[3], status);
}

sint32 associator_names(const Provider_Operations& operations, const Provider_Word (&args)[8]) {
    const sint32 status = operations.enum_associator_names(
        pointer<void>(args[0]), pointer<Instance>(args[1]), text(args[2]), text(args[3]),
        text(args[4]), handler_of(args[5], args[6]));
    return status == ENUM_ASSOCIATOR_NAMES_UNSUPPORTED ? status
                                                       : close_stream(args[5], args[6], status);
}

sint32 references(const Provider_Operations& operations, const Provider_Word (&args)[8]) {
    const In_Class model(operations.meta_class, pointer<Instance>(args[2]));
    const sint32 status =
        operations.enum_references(pointer<void>(args[0]), pointer<Instance>(args[1]), model.get(),
                                   text(args[3]), handler_of(args[4], args[5]));
    return status == ENUM_REFERENCES_UNSUPPORTED ? status : close_stream(args[4], args[5], status);
}

sint32 associators(const Provider_Operations& operations, const Provider_Word (&args)[8]) {
    const sint32 status = operations.enum_associators(
        pointer<void>(args[0]), pointer<Instance>(args[1]), text(args[2]), text(args[3]),
        text(args[4]), handler_of(args[5], args[6]));
    return status == ENUM_ASSOCIATORS_UNSUPPORTED ? status : close_stream(args[5], args[6], status);
}

// Operations 5 and 7 to 10, each on one or two instances.
sint32 instance_operation(const Provider_Operations& operations, int operation,
                          const Provider_Word (&args)[8]) {
    void* provider = pointer<void>(args[0]);
    const In_Class first(operations.meta_class, pointer<Instance>(args[1]));
    switch (operation) {
    case OP_GET_INSTANCE:
        return operations.get_instance(provider, first.get(), *pointer<Instance*>(args[2]));
    case OP_CREATE_INSTANCE:
        return operations.create_instance(provider, first.get());
    case OP_DELETE_INSTANCE:
        return operations.delete_instance(provider, first.get());
    case OP_MODIFY_INSTANCE: {
        const In_Class instance(operations.meta_class, pointer<Instance>(args[2]));
        return operations.modify_instance(provider, first.get(), instance.get());
    }
    default:
        return operations.invoke_method(provider, first.get(), pointer<Instance>(args[2]));
    }
}

} // namespace

sint32 run_provider_operation(const Provider_Operations& operations, int operation,
                              const Provider_Word (&args)[8]) {
    switch (operation) {
    case OP_GET_META_CLASS:
        *pointer<const Meta_Class*>(args[0]) = operations.meta_class;
        return 0;
    case OP_GET_REPOSITORY:
        *pointer<const Meta_Repository*>(args[0]) = operations.meta_class->meta_repository;
        return 0;
    case OP_CREATE_PROVIDER:
        *pointer<void*>(args[0]) = operations.create();
        return 0;
    case OP_DESTROY_PROVIDER:
        if (args[0])
            operations.destroy(pointer<void>(args[0]));
        return 0;
    case OP_LOAD:
        return operations.load(pointer<void>(args[0]));
    case OP_UNLOAD:
        return operations.unload(pointer<void>(args[0]));
    case OP_ENUM_INSTANCES:
        return enum_instances(operations, args);
    case OP_GET_INSTANCE:
    case OP_CREATE_INSTANCE:
    case OP_DELETE_INSTANCE:
    case OP_MODIFY_INSTANCE:
        return instance_operation(operations, operation, args);
    case OP_INVOKE_METHOD:
        return operations.invoke_method ? instance_operation(operations, operation, args) : -1;
    case OP_ENUM_ASSOCIATOR_NAMES:
        return operations.enum_associator_names ? associator_names(operations, args) : -1;
    case OP_ENUM_REFERENCES:
        return operations.enum_references ? references(operations, args) : -1;
    case OP_ENUM_ASSOCIATORS:
        return operations.enum_associators ? associators(operations, args) : -1;
    default:
        return -1;
    }
}

bool is_method_instance(const Instance* method, const Meta_Method& meta_method) {
    // The layout counts as well as the name: a base class may declare a method of the same name.
    const Meta_Features* actual = method->__meta_class;
    return name_equal(actual->name, meta_method.name) && actual->size == meta_method.size;
}

} // namespace cimple
