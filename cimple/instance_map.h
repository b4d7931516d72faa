// A store: instances of one class in insertion order, found by their keys.
//
// The store owns its members, one count of each. Its operations answer the status numbers of
// providers directly. Not locked: the owner's mutex guards it. Whoever holds that may change a
// member in place, but not its keys: the store looks members up by the keys they came with. Filling
// a store and copying it are linear in its size, a look-up is constant, taking a member out closes
// the gap in the list and no more. narrow takes linear time once after a change of the store, and
// then as much as it finds.
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
    Instance* at(uint32 index) const noexcept; // borrowed, or null

    sint32 find(const Instance* keys) const;      // first index with key_eq(keys, member), or -1
    Instance* lookup(const Instance* keys) const; // borrowed, or null

    // Ascending positions of members with all those among them that a receiver with this focus does
    // not ignore: enough of the store for it. Nothing when all of the store is needed, because that
    // cannot be told, or because two members have equal keys, which the copy of the store is to
    // find.
    std::optional<std::vector<uint32>> narrow(const Enumeration_Focus& focus);

    // Provider-visible operations. What goes in is copied, what comes out is the caller's.
    sint32 get_instance(const Instance* keys, Instance*& out) const;    // 0 or 60
    sint32 enum_instances(const Enum_Instances_Handler& handler) const; // 0; ends when told to stop
    sint32 create_instance(const Instance* instance);                   // 0 or 80
    sint32 delete_instance(const Instance* keys);                       // 0 or 90
    sint32 modify_instance(const Instance* model, const Instance* instance); // 0 or 100

    // Takes over the instance and answers its index; -1 if its key is present: then the caller
    // keeps it.
    sint32 insert(Instance* instance);
    // Takes the slot out without destroying its instance; a bad index is ignored.
    void remove(uint32 index);
    void
    clear() noexcept; // drops all members, in order; those that nobody else counts are destroyed

private:
    struct Key_Index; // hash of the key values to positions
    enum class Keys : uint8 { UNCHECKED, DISTINCT, EQUAL };

    // Searches the members that are in the index.
    sint32 find_match(const Key_Index& index, const Instance* keys,
                      const detail::Key_Signature& signature) const;
    bool reindex();
    void changed() noexcept;

    const Meta_Class* _meta_class;
    Array<Instance*> _members;
    std::unique_ptr<Key_Index> _index;
    Keys _keys = Keys::UNCHECKED;     // since the last change
    std::unique_ptr<End_Index> _ends; // null: not built since the last change
};

template <class T>
class Instance_Map : public Instance_Map_Base {
public:
    Instance_Map() : Instance_Map_Base(&T::static_meta_class) {}
    T* operator[](uint32 index) const noexcept { return static_cast<T*>(at(index)); }
    T* lookup(const Instance* keys) const {
        return static_cast<T*>(Instance_Map_Base::lookup(keys));
    }
};

} // namespace cimple

#endif // CIMPLE_INSTANCE_MAP_H
