#include "cimple/instance_map.h"

#include "cimple/end_index.h"

#include <utility>

namespace cimple {

using detail::Key_Signature;

// An open hash table of members, so that filling or copying a store stays linear.
//
// The table knows a member by a number that it keeps when others before it go, and not by its
// position: taking one out moves no other. Numbers ascend in the order of the members, so that the
// position is found by bisection, at once while nothing was ever taken out.
struct Instance_Map_Base::Key_Index {
    struct Entry {
        Key_Signature signature;
        uint32 number;
    };
    struct Slot {
        uint32 number;
        uint32 hash; // of the bits that the place in the table comes from
    };
    static constexpr uint32 FREE = 0xFFFFFFFF;
    static constexpr std::size_t SMALLEST_TABLE = 16;

    std::vector<Entry> entries;                 // one per member
    std::vector<Slot> table;                    // a power of two, at most half full
    detail::Key_Shapes<const Instance*> shapes; // the sample: any member of that shape
    uint32 next_number = 0;

    // Makes the next add succeed without allocating.
    void reserve_one() {
        const std::size_t count = entries.size() + 1;
        entries.reserve(std::bit_ceil(count));
        shapes.reserve_one();
        if (2 * count <= table.size() && next_number != FREE)
            return;
        std::vector<Slot> grown(std::max(SMALLEST_TABLE, std::bit_ceil(2 * count)), {FREE, 0});
        table.swap(grown);
        next_number = 0;
        for (Entry& entry : entries) {
            entry.number = next_number++;
            place(entry);
        }
    }

    void add(const Instance* instance, const Key_Signature& signature) noexcept {
        entries.push_back({signature, next_number++});
        place(entries.back());
        shapes.add(signature.shape, instance);
    }

    // Forgets a member that has left the list already.
    void remove(uint32 position, const Array<Instance*>& members) noexcept {
        const Entry entry = entries[position];
        entries.erase(entries.begin() + static_cast<std::ptrdiff_t>(position));
        vacate(entry);
        shapes.remove(entry.signature.shape, [&]() noexcept -> const Instance* {
            const auto heir = std::find_if(entries.begin(), entries.end(), [&](const Entry& e) {
                return e.signature.shape == entry.signature.shape;
            });
            return members[static_cast<uint32>(heir - entries.begin())];
        });
    }

    // The same member, in another instance.
    void replace(const Instance* former, const Instance* present) noexcept {
        shapes.replace(former, present);
    }

    void clear() noexcept {
        entries.clear();
        table.clear();
        shapes.clear();
        next_number = 0;
    }

    // First position with that signature that match accepts, or -1.
    template <class Match>
    sint32 find(const Key_Signature& signature, Match match) const {
        uint32 first = FREE;
        if (table.empty())
            return -1;
        const uint32 hash = folded(signature);
        for (std::size_t i = home(hash); table[i].number != FREE; i = next(i)) {
            if (table[i].hash != hash)
                continue;
            const uint32 position = position_of(table[i].number);
            if (position < first && entries[position].signature.hash == signature.hash &&
                match(position))
                first = position;
        }
        return first == FREE ? -1 : static_cast<sint32>(first);
    }

private:
    static uint32 folded(const Key_Signature& signature) {
        return static_cast<uint32>(signature.hash ^ signature.hash >> 32);
    }
    std::size_t home(uint32 hash) const { return hash & (table.size() - 1); }
    std::size_t next(std::size_t slot) const { return (slot + 1) & (table.size() - 1); }

    // Of a member that is there. As many numbers as were taken out lie between it and its position.
    uint32 position_of(uint32 number) const {
        const std::size_t most =
            std::min<std::size_t>(number - entries[0].number, entries.size() - 1);
        if (entries[most].number == number)
            return static_cast<uint32>(most);
        const auto end = entries.begin() + static_cast<std::ptrdiff_t>(most);
        const auto found = std::lower_bound(entries.begin(), end, number,
                                            [](const Entry& e, uint32 n) { return e.number < n; });
        return static_cast<uint32>(found - entries.begin());
    }

    void place(const Entry& entry) noexcept {
        const uint32 hash = folded(entry.signature);
        std::size_t i = home(hash);
        while (table[i].number != FREE)
            i = next(i);
        table[i] = {entry.number, hash};
    }

    // Frees the entry's slot, and moves up those behind it that a search would not reach any more.
    void vacate(const Entry& entry) noexcept {
        const std::size_t mask = table.size() - 1;
        std::size_t hole = home(folded(entry.signature));
        while (table[hole].number != entry.number)
            hole = next(hole);
        for (std::size_t i = next(hole); table[i].number != FREE; i = next(i)) {
            const std::size_t way = (i - home(table[i].hash)) & mask;
            if (way >= ((i - hole) & mask)) {
                table[hole] = table[i];
                hole = i;
            }
        }
        table[hole].number = FREE;
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

const Instance* Instance_Map_Base::at(uint32 index) const noexcept {
    return index < _members.size() ? _members[index] : nullptr;
}

sint32 Instance_Map_Base::find_match(const Key_Index& index, const Instance* keys,
                                     const Key_Signature& signature) const {
    const auto matches = [&](uint32 position) { return key_eq(keys, _members[position]); };
    if (!index.shapes.others_may_match(keys, signature, [](const Instance* s) { return s; }))
        return index.find(signature, matches);
    for (uint32 i = 0; i < index.entries.size(); ++i) {
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

const Instance* Instance_Map_Base::lookup(const Instance* keys) const {
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
    for (Instance* member : _members) {
        if (!handler.handle(Ref<Instance>::share(member).release()))
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
    remove(static_cast<uint32>(index));
    return DELETE_INSTANCE_OK;
}

sint32 Instance_Map_Base::modify_instance(const Instance* model, const Instance* instance) {
    const sint32 index = find(instance);
    if (index < 0)
        return MODIFY_INSTANCE_NOT_FOUND;
    cimple::change(*this, static_cast<uint32>(index),
                   [&](Instance& member) { copy(&member, instance, model); });
    return MODIFY_INSTANCE_OK;
}

const Instance* Instance_Map_Base::change(uint32 index,
                                          void (*apply)(Instance& member, void* closure),
                                          void* closure) {
    if (index >= _members.size())
        return nullptr;
    Instance*& member = _members[index];
    if (!is_shared(member)) {
        apply(*member, closure);
    } else {
        Ref<Instance> copy(clone(member));
        apply(*copy, closure);
        _index->replace(member, copy.get());
        const Ref<Instance> former(std::exchange(member, copy.release()));
    }
    // A key reference may now lead to an instance with more keys than the one that it matched.
    if (!(detail::key_signature(member) == _index->entries[index].signature)) {
        reindex();
        _ends.reset();
    }
    return member;
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
    _ends.reset();
    return static_cast<sint32>(_members.size()) - 1;
}

Ref<const Instance> Instance_Map_Base::remove(uint32 index) {
    if (index >= _members.size())
        return {};
    Ref<const Instance> member(_members[index]);
    _members.remove(index);
    _index->remove(index, _members);
    _ends.reset();
    if (_first_equal >= 0)
        reindex();
    return member;
}

// After a change of keys: the index anew, and whether each member would still go in.
void Instance_Map_Base::reindex() {
    auto fresh = std::make_unique<Key_Index>();
    sint32 first_equal = -1;
    for (uint32 i = 0; i < _members.size(); ++i) {
        const Key_Signature signature = detail::key_signature(_members[i]);
        if (first_equal < 0 && find_match(*fresh, _members[i], signature) >= 0)
            first_equal = static_cast<sint32>(i);
        fresh->reserve_one();
        fresh->add(_members[i], signature);
    }
    _index = std::move(fresh);
    _first_equal = first_equal;
}

std::optional<std::vector<uint32>> Instance_Map_Base::narrow(const Enumeration_Focus& focus) {
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
    _first_equal = -1;
    _ends.reset();
    for (Instance* member : members)
        unref(member);
}

} // namespace cimple
