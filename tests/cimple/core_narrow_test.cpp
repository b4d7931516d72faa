// A store narrowed to what a receiver looks at, and asked for a member, against a walk over all of
// its members: random links between ends whose keys are of several shapes.
#include "cimple/instance_map.h"
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <random>
#include <vector>

namespace cimple {
namespace {

using Positions = std::vector<uint32>;

class Random_Links {
public:
    explicit Random_Links(uint32 seed) : _random(seed) {}

    uint32 below(uint32 limit) { return static_cast<uint32>(_random() % limit); }

    // An end of any class that a reference of the schema accepts, with keys or without.
    Instance* end() {
        switch (below(16)) {
        case 0:
            return create_null<Test_Root>();
        case 1:
        case 2: {
            auto* leaf = create_null<Test_Leaf>();
            leaf->Name.set(name());
            return leaf;
        }
        case 3:
        case 4: {
            auto* stranger = create_null<Test_Stranger>();
            stranger->ID.set(name());
            stranger->SLOT.set(below(3));
            return stranger;
        }
        default:
            return base();
        }
    }
    Instance* link() {
        auto* made = create_null<Test_Link>();
        made->Left = below(6) ? end() : nullptr;
        made->Right = below(6) ? base() : nullptr;
        return made;
    }

private:
    const char* name() { return &"d\0c\0b\0a\0A\0"[2 * below(6)]; }
    Test_Base* base() {
        Test_Base* made = below(2) ? create_null<Test_Base>() : create_null<Test_Sub>();
        made->Id.set(name());
        made->Slot.set(below(3));
        made->Id.null = below(8) == 0; // a flag that no comparison looks at
        return made;
    }

    std::minstd_rand _random;
};

// What a receiver with the focus keeps of the members at these positions.
Positions kept(const Instance_Map_Base& store, const Enumeration_Focus& focus,
               Positions positions) {
    const bool by_keys = focus.kind == Enumeration_Focus::KEYS;
    std::erase_if(positions, [&](uint32 i) {
        return by_keys ? !key_eq(focus.instance, store.at(i))
                       : !is_reference_to(store.at(i), focus.instance, "");
    });
    if (by_keys && positions.size() > 1)
        positions.resize(1);
    return positions;
}

// Counts how often a question was answered without the whole store.
void check(Instance_Map_Base& store, const Instance* source, int& narrowed) {
    Positions everything(store.size());
    for (uint32 i = 0; i < store.size(); ++i)
        everything[i] = i;
    for (const auto kind : {Enumeration_Focus::KEYS, Enumeration_Focus::REFERENCES_TO}) {
        const Enumeration_Focus focus = {kind, source};
        const Positions expected = kept(store, focus, everything);
        if (kind == Enumeration_Focus::KEYS) {
            ASSERT_EQ(store.find(source), expected.empty() ? -1 : static_cast<sint32>(expected[0]));
        }
        const auto answer = store.narrow(focus);
        narrowed += answer.has_value();
        const Positions positions = answer.value_or(everything);
        const bool ascending = std::adjacent_find(positions.begin(), positions.end(),
                                                  std::greater_equal<uint32>{}) == positions.end();
        ASSERT_TRUE(ascending) << "in order, each once";
        ASSERT_EQ(kept(store, focus, positions), expected);
    }
}

void change(Instance_Map_Base& store, Random_Links& random) {
    Ref<Instance> made(random.link());
    const uint32 kind = random.below(20);
    if (kind == 0) {
        store.clear();
    } else if (kind < 4 && store.size()) {
        const uint32 index = random.below(store.size());
        const Ref<Instance> taken(store.at(index));
        store.remove(index);
    } else if (kind < 7) {
        store.modify_instance(made.get(), made.get());
    } else if (store.insert(made.get()) >= 0) {
        made.release();
    }
}

TEST(Narrowing, KeepsWhatAWalkFindsThroughEveryChange) {
    int narrowed = 0, questions = 0;
    for (uint32 seed = 1; seed <= 40; ++seed) {
        Random_Links random(seed);
        Instance_Map_Base store(&Test_Link::static_meta_class);
        for (int step = 0; step < 100; ++step, questions += 2) {
            for (uint32 i = random.below(4); i > 0; --i)
                change(store, random);
            const Ref<Instance> source(random.below(3) ? random.end() : random.link());
            check(store, source.get(), narrowed);
        }
    }
    EXPECT_GT(narrowed, questions / 4);
    EXPECT_LT(narrowed, questions) << "a source without keys matches every end";
}

// A reference that is no key may be changed in place, so nothing is remembered of it.
TEST(Narrowing, ReferencesThatAreNoKeysAreNotIndexed) {
    Instance_Map<Test_Holder> store;
    auto* holder = create_null<Test_Holder>();
    holder->Id.set("h");
    ASSERT_EQ(store.insert(holder), 0);
    const Ref<Instance> end(make_base("e", 1));
    EXPECT_FALSE(store.narrow({Enumeration_Focus::REFERENCES_TO, end.get()}));
    EXPECT_EQ(store.narrow({Enumeration_Focus::KEYS, holder}), Positions{0});
}

} // namespace
} // namespace cimple
