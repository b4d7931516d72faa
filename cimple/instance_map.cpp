#include "cimple/instance_map.h"

#include "cimple/instance_detail.h"

#include <algorithm>
#include <bit>
#include <utility>
#include <vector>

namespace cimple {

using detail::Key_Signature;

// An open hash table of member positions, so that filling or copying a store stays linear.
//
// Equal keys imply equal hashes only within one shape, see Key_Signature. A store practically
// always has one; the index keeps count of them all, and says when a look-up has to walk the
// members.
struct Instance_Map_Base::Key_Index {
    struct Shape {
        uint64 shape;
        uint32 count;
        const Instance* sample; // any member of that shape
    };

    static constexpr uint32 FREE = 0xFFFFFFFF;
    static constexpr std::size_t SMALLEST_TABLE = 16;

    std::vector<Key_Signature> signatures; // one per member
    std::vector<uint32> table;             // positions; a power of two, at most half full
    std::vector<Shape> shapes;

    // Makes the next add succeed without allocating.
    void reserve_one() {
        const std::size_t count = signatures.size() + 1;
        signatures.reserve(std::bit_ceil(count));
        shapes.reserve(std::bit_ceil(shapes.size() + 1));
        if (2 * count > table.size()) {
            std::vector<uint32> grown(std::max(SMALLEST_TABLE, std::bit_ceil(2 * count)), FREE);
            table.swap(grown);
            place_all();
        }
    }

    void add(const Instance* instance, const Key_Signature& signature) noexcept {
        place(static_cast<uint32>(signatures.size()), signature.hash);
        signatures.push_back(signature);
        const auto known = std::find_if(shapes.begin(), shapes.end(),
                                        [&](const Shape& s) { return s.shape == signature.shape; });
        if (known != shapes.end())
            ++known->count;
        else
            shapes.push_back({signature.shape, 1, instance});
    }

    // Forgets a member that has left the list already.
    void remove(uint32 position, const Array<Instance*>& members) noexcept {
        const uint64 shape = signatures[position].shape;
        signatures.erase(signatures.begin() + static_cast<std::ptrdiff_t>(position));
        std::fill(table.begin(), table.end(), FREE);
        place_all();
        const auto known = std::find_if(shapes.begin(), shapes.end(),
                                        [&](const Shape& s) { return s.shape == shape; });
        if (--known->count == 0) {
            shapes.erase(known);
            return;
        }
        const auto heir = std::find_if(signatures.begin(), signatures.end(),
                                       [&](const Key_Signature& s) { return s.shape == shape; });
        known->sample = members[static_cast<uint32>(heir - signatures.begin())];
    }

    void assign(const Array<Instance*>& members) {
        Key_Index fresh;
        for (const Instance* member : members) {
            fresh.reserve_one();
            fresh.add(member, detail::key_signature(member));
        }
        *this = std::move(fresh);
    }

    void clear() noexcept {
        signatures.clear();
        table.clear();
        shapes.clear();
    }

    // Whether a member of another shape than the keys' might still match them.
    bool needs_walk(const Instance* keys, const Key_Signature& signature) const {
        return std::any_of(shapes.begin(), shapes.end(), [&](const Shape& s) {
            return s.shape != signature.shape && detail::keys_embed(keys, s.sample);
        });
    }

    // First position with that signature that match accepts, or -1.
    template <class Match>
    sint32 find(const Key_Signature& signature, Match match) const {
        uint32 first = FREE;
        if (table.empty())
            return -1;
        const std::size_t mask = table.size() - 1;
        for (std::size_t i = start(signature.hash); table[i] != FREE; i = (i + 1) & mask) {
            const uint32 position = table[i];
            if (position < first && signatures[position].hash == signature.hash && match(position))
                first = position;
        }
        return first == FREE ? -1 : static_cast<sint32>(first);
    }

private:
    std::size_t start(uint64 hash) const {
        return static_cast<std::size_t>(hash ^ hash >> 32) & (table.size() - 1);
    }

    void place(uint32 position, uint64 hash) noexcept {
        std::size_t i = start(hash);
        while (table[i] != FREE)
            i = (i + 1) & (table.size() - 1);
        table[i] = position;
    }

    void place_all() noexcept {
        for (uint32 i = 0; i < signatures.size(); ++i)
            place(i, signatures[i].hash);
    }
};

Instance_Map_Base::Instance_Map_Base(const Meta_Class* meta_class)
    : _meta_class(meta_class), _index(std::make_unique<Key_Index>()) {}

Instance_Map_Base::~Instance_Map_Base() {
    clear();
}

uint32 Instance_Map_Base::size() const noexcept {
    return _members.size();
}

Instance* Instance_Map_Base::at(uint32 index) const noexcept {
    return index < _members.size() ? _members[index] : nullptr;
}

sint32 Instance_Map_Base::find_match(const Instance* keys, const Key_Signature& signature) const {
    if (_index->needs_walk(keys, signature)) {
        for (uint32 i = 0; i < _members.size(); ++i) {
            if (key_eq(keys, _members[i]))
                return static_cast<sint32>(i);
        }
        return -1;
    }
    return _index->find(signature,
                        [&](uint32 position) { return key_eq(keys, _members[position]); });
}

sint32 Instance_Map_Base::find(const Instance* keys) const {
    if (!keys || _members.empty())
        return -1;
    return find_match(keys, detail::key_signature(keys));
}

Instance* Instance_Map_Base::lookup(const Instance* keys) const {
    const sint32 index = find(keys);
    return index < 0 ? nullptr : _members[static_cast<uint32>(index)];
}

sint32 Instance_Map_Base::get_instance(const Instance* keys, Instance*& out) const {
    const Instance* match = lookup(keys);
    if (!match)
        return GET_INSTANCE_NOT_FOUND;
    out = clone(match);
    return GET_INSTANCE_OK;
}

sint32 Instance_Map_Base::enum_instances(const Enum_Instances_Handler& handler) const {
    for (const Instance* member : _members) {
        if (!handler.handle(clone(member)))
            break;
    }
    return ENUM_INSTANCES_OK;
}

sint32 Instance_Map_Base::create_instance(const Instance* instance) {
    Ref<Instance> copy(clone(instance));
    if (insert(copy.get()) < 0)
        return CREATE_INSTANCE_DUPLICATE;
    copy.release();
    return CREATE_INSTANCE_OK;
}

sint32 Instance_Map_Base::delete_instance(const Instance* keys) {
    const sint32 index = find(keys);
    if (index < 0)
        return DELETE_INSTANCE_NOT_FOUND;
    Instance* member = _members[static_cast<uint32>(index)];
    remove(static_cast<uint32>(index));
    unref(member);
    return DELETE_INSTANCE_OK;
}

sint32 Instance_Map_Base::modify_instance(const Instance* model, const Instance* instance) {
    const sint32 index = find(instance);
    if (index < 0)
        return MODIFY_INSTANCE_NOT_FOUND;
    Instance* member = _members[static_cast<uint32>(index)];
    copy(member, instance, model);
    // A key reference may now lead to an instance with more keys than the one that it matched.
    if (!(detail::key_signature(member) == _index->signatures[static_cast<std::size_t>(index)]))
        _index->assign(_members);
    return MODIFY_INSTANCE_OK;
}

sint32 Instance_Map_Base::insert(Instance* instance) {
    if (!instance)
        return -1;
    const Key_Signature signature = detail::key_signature(instance);
    if (find_match(instance, signature) >= 0)
        return -1;
    _index->reserve_one();
    _members.append(instance);
    _index->add(instance, signature);
    return static_cast<sint32>(_members.size()) - 1;
}

void Instance_Map_Base::remove(uint32 index) {
    if (index >= _members.size())
        return;
    _members.remove(index);
    _index->remove(index, _members);
}

void Instance_Map_Base::clear() noexcept {
    Array<Instance*> members;
    members.swap(_members);
    _index->clear();
    for (Instance* member : members)
        unref(member);
}

} // namespace cimple
