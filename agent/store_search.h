// Finding instances of a store: by their key through its index, or by something else.
#ifndef VLN_AGENT_STORE_SEARCH_H
#define VLN_AGENT_STORE_SEARCH_H

#include "agent/associations.h"
#include "agent/stores.h"
#include "cimple/instance_map.h"

namespace cimple {

// The instance with that key, which is the only one of its class, or the only one beside the name
// of the class itself; null for none.
template <class T, class Owner>
const T* find_by_key(const Instance_Map<T>& store, Property<String> Owner::*key,
                     const String& value) {
    auto model = make_instance<T>();
    if constexpr (requires { model->CreationClassName; })
        model->CreationClassName.set(T::static_meta_class.name);
    (model.get()->*key).set(value);
    return store.lookup(model.get());
}

// The same for an instance that is weak to the host's computer system.
template <class T, class Owner>
const T* find_in_system(const Instance_Stores& stores, const Instance_Map<T>& store,
                        Property<String> Owner::*key, const String& value) {
    const CIM_ComputerSystem* system = stores.m_CIM_ComputerSystem_map[0];
    if (!system)
        return nullptr;
    auto model = make_instance<T>();
    name_in_system(*model, *system);
    (model.get()->*key).set(value);
    return store.lookup(model.get());
}

// The first instance for which wanted(const T&) holds, in insertion order, or null.
template <class T, class Predicate>
const T* find_first(const Instance_Map<T>& store, Predicate wanted) {
    for (uint32 i = 0; i < store.size(); ++i)
        if (wanted(*store[i]))
            return store[i];
    return nullptr;
}

// The same from the newest to the oldest.
template <class T, class Predicate>
const T* find_last(const Instance_Map<T>& store, Predicate wanted) {
    for (uint32 i = store.size(); i-- > 0;)
        if (wanted(*store[i]))
            return store[i];
    return nullptr;
}

} // namespace cimple

#endif // VLN_AGENT_STORE_SEARCH_H
