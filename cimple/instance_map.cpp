#include "cimple/instance_map.h"

#include "cimple/end_index.h"

#include <utility>

namespace cimple {

using detail::Key_Signature;

// An open hash table of member positions, so that filling or copying a store stays linear.
struct Instance_Map_Base::Key_Index {
    static constexpr uint32 FREE = 0xFFFFFFFF;
    static constexpr std::size_t SMALLEST_TABLE = 16;

    std::vector<Key_Signature> signatures;      // one per member
    std::vector<uint32> table;                  // positions; a power of two, at most half full
    detail::Key_Shapes<const Instance*> shapes; // the sample: any member of that shape

    // Makes the next add succeed without allocating.
    void reserve_one() {
        const std::size_t count = signatures.size() + 1;
        signatures.reserve(std::bit_ceil(count));
        shapes.reserve_one();
        if (2 * count > table.size()) {
            std::vector<uint32> grown(std::max(SMALLEST_TABLE, std::bit_ceil(2 * count)), FREE);
            table.swap(grown);
            place_all();
        }
    }

    void add(const Instance* instance, const Key_Signature& signature) noexcept {
        place(static_cast<uint32>(signatures.size()), signature.hash);
        signatures.push_back(signature);
        shapes.add(signature.shape, instance);
    }

    // Forgets a member that has left the list already.
    void remove(uint32 position, const Array<Instance*>& members) noexcept {
        const uint64 shape = signatures[position].shape;
        signatures.erase(signatures.begin() + static_cast<std::ptrdiff_t>(position));
        std::fill(table.begin(), table.end(), FREE);
        place_all();
        shapes.remove(shape, [&]() noexcept -> const Instance* {
            const auto heir =
                std::find_if(signatures.begin(), signatures.end(),
                             [&](const Key_Signature& s) { return s.shape == shape; });
            return members[static_cast<uint32>(heir - signatures.begin())];
        });
    }

    void clear() noexcept {
        signatures.clear();
        table.clear();
        shapes.clear();
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

sint32 Instance_Map_Base::find_match(const Key_Index& index, const Instance* keys,
                                     const Key_Signature& signature) const {
    const auto matches = [&](uint32 position) { return key_eq(keys, _members[position]); };
    if (!index.shapes.others_may_match(keys, signature, [](const Instance* s) { return s; }))
        return index.find(signature, matches);
    for (uint32 i = 0; i < index.signatures.size(); ++i) {
        if (matches(i))
            return static_cast<sint32>(i);
    }
    return -1;
}

sint32 Instance_Map_Base::find(const Instance* keys) const {
    if (!keys || _members.empty())
        return -1;
    return find_match(*_index, keys, detail::key_signature(keys));
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
        reindex();
    changed();
    return MODIFY_INSTANCE_OK;
}

sint32 Instance_Map_Base::insert(Instance* instance) {
    if (!instance)
        return -1;
    const Key_Signature signature = detail::key_signature(instance);
    if (find_match(*_index, instance, signature) >= 0)
        return -1;
    _index->reserve_one();
    _members.append(instance);
    _index->add(instance, signature);
    changed();
    return static_cast<sint32>(_members.size()) - 1;
}

void Instance_Map_Base::remove(uint32 index) {
    if (index >= _members.size())
        return;
    _members.remove(index);
    _index->remove(index, _members);
    changed();
}

// Does to the members' keys what a copy of the store does: whether each of them would go in.
bool Instance_Map_Base::reindex() {
    auto fresh = std::make_unique<Key_Index>();
    bool distinct = true;
    for (const Instance* member : _members) {
        const Key_Signature signature = detail::key_signature(member);
        distinct = distinct && find_match(*fresh, member, signature) < 0;
        fresh->reserve_one();
        fresh->add(member, signature);
    }
    _index = std::move(fresh);
    return distinct;
}

void Instance_Map_Base::changed() noexcept {
    _keys = Keys::UNCHECKED;
    _ends.reset();
}

std::optional<std::vector<uint32>> Instance_Map_Base::narrow(const Enumeration_Focus& focus) {
    if (_keys == Keys::UNCHECKED)
        _keys = reindex() ? Keys::DISTINCT : Keys::EQUAL;
    if (_keys == Keys::EQUAL)
        return std::nullopt;
    std::vector<uint32> positions;
    if (focus.kind == Enumeration_Focus::KEYS) {
        if (const sint32 match = find(focus.instance); match >= 0)
            positions.push_back(static_cast<uint32>(match));
        return positions;
    }
    if (!_ends) {
        auto ends = std::make_unique<End_Index>();
        ends->build(_members);
        _ends = std::move(ends);
    }
    if (!_ends->find(focus.instance, _members, positions))
        return std::nullopt;
    return positions;
}

void Instance_Map_Base::clear() noexcept {
    Array<Instance*> members;
    members.swap(_members);
    _index->clear();
    changed();
    for (Instance* member : members)
        unref(member);
}

} // namespace cimple
