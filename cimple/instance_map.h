// A store: instances of one class in insertion order, found by their keys.
//
// The store has one count of each member. Its operations answer the status numbers of providers
// directly. Not locked: the owner's mutex guards it. Whoever holds that may take counts of members
// and read them later without it: a member that others count is never written. `change` below is
// the one way to write one. Filling a store is linear in its size, a look-up is constant, taking a
// member out closes the gap in the list and no more. narrow takes linear time once after a change
// of the store, and then as much as it finds.
#ifndef CIMPLE_INSTANCE_MAP_H
#define CIMPLE_INSTANCE_MAP_H

#include "cimple/registration.h"

#include <memory>
#include <optional>
#include <vector>

namespace cimple {

class End_Index;

namespace detail {
struct Key_Signature;
}

class Instance_Map_Base {
public:
    explicit Instance_Map_Base(const Meta_Class* meta_class);
    ~Instance_Map_Base();
    Instance_Map_Base(const Instance_Map_Base&) = delete;
    Instance_Map_Base& operator=(const Instance_Map_Base&) = delete;

    const Meta_Class* meta_class() const noexcept { return _meta_class; }
    uint32 size() const noexcept;
    const Instance* at(uint32 index) const noexcept; // borrowed, or null

    sint32 find(const Instance* keys) const; // first index with key_eq(keys, member), or -1
    const Instance* lookup(const Instance* keys) const; // borrowed, or null

    // Ascending positions of members with all those among them that a receiver with this focus does
    // not ignore: enough of the store for it. Nothing when all of the store is needed, because that
    // cannot be told.
    std::optional<std::vector<uint32>> narrow(const Enumeration_Focus& focus);

    // The first member with keys that one before it has too, or -1. Nothing but a change of keys
    // can make one.
    sint32 first_equal() const noexcept { return _first_equal; }

    // Has apply(member, closure) write the member: as it is while nobody else counts it, else a
    // copy that takes its place, so that whoever took it keeps it as it was. The index follows.
    // Answers where the member lies now; null, and nothing done, for a bad index. What the writer
    // throws passes through: a copy is dropped then.
    const Instance* change(uint32 index, void (*apply)(Instance& member, void* closure),
                           void* closure);

    // Provider-visible operations. What goes in is copied; what comes out of get_instance is the
    // caller's, a handler gets the members themselves.
    sint32 get_instance(const Instance* keys, Instance*& out) const;    // 0 or 60
    sint32 enum_instances(const Enum_Instances_Handler& handler) const; // 0; ends when told to stop
    sint32 create_instance(const Instance* instance);                   // 0 or 80
    sint32 delete_instance(const Instance* keys);                       // 0 or 90
    sint32 modify_instance(const Instance* model, const Instance* instance); // 0 or 100

    // Takes over the instance and answers its index; -1 if its key is present: then the caller
    // keeps it.
    sint32 insert(Instance* instance);
    // Takes a member out and hands it over; null for a bad index.
    Ref<const Instance> remove(uint32 index);
    void
    clear() noexcept; // drops all members, in order; those that nobody else counts are destroyed

private:
    struct Key_Index; // hash of the key values to positions

    // Searches the members that are in the index.
    sint32 find_match(const Key_Index& index, const Instance* keys,
                      const detail::Key_Signature& signature) const;
    void reindex();

    const Meta_Class* _meta_class;
    Array<Instance*> _members;
    std::unique_ptr<Key_Index> _index;
    sint32 _first_equal = -1;
    std::unique_ptr<End_Index> _ends; // null: not built since the last change
};

template <class T>
class Instance_Map : public Instance_Map_Base {
public:
    Instance_Map() : Instance_Map_Base(&T::static_meta_class) {}
    const T* operator[](uint32 index) const noexcept { return static_cast<const T*>(at(index)); }
    const T* lookup(const Instance* keys) const {
        return static_cast<const T*>(Instance_Map_Base::lookup(keys));
    }
};

// Writes the member with that position, or those keys, by apply(C& member), as told above:
//     change(agent.m_VLNMPCA_Card_map, index, [&](VLNMPCA_Card& card) { card.Name.set(name); });
template <class Apply>
const Instance* change(Instance_Map_Base& store, uint32 index, Apply apply) {
    return store.change(
        index, [](Instance& member, void* closure) { (*static_cast<Apply*>(closure))(member); },
        &apply);
}

template <class C, class Apply>
const C* change(Instance_Map<C>& store, uint32 index, Apply apply) {
    Instance_Map_Base& base = store;
    return static_cast<const C*>(
        change(base, index, [&](Instance& member) { apply(static_cast<C&>(member)); }));
}

template <class C, class Apply>
const C* change(Instance_Map<C>& store, const Instance* keys, Apply apply) {
    const sint32 index = store.find(keys);
    return index < 0 ? nullptr : change(store, static_cast<uint32>(index), apply);
}

} // namespace cimple

#endif // CIMPLE_INSTANCE_MAP_H
