// Finding instances of a store by something that is not its key.
#ifndef VLN_AGENT_STORE_SEARCH_H
#define VLN_AGENT_STORE_SEARCH_H

#include "cimple/instance_map.h"

namespace cimple {

// The first instance for which wanted(const T&) holds, in insertion order, or null.
template <class T, class Predicate>
T* find_first(const Instance_Map<T>& store, Predicate wanted) {
    for (uint32 i = 0; i < store.size(); ++i)
        if (wanted(*store[i]))
            return store[i];
    return nullptr;
}

// The same from the newest to the oldest.
template <class T, class Predicate>
T* find_last(const Instance_Map<T>& store, Predicate wanted) {
    for (uint32 i = store.size(); i-- > 0;)
        if (wanted(*store[i]))
            return store[i];
    return nullptr;
}

} // namespace cimple

#endif // VLN_AGENT_STORE_SEARCH_H
