// A store narrowed to what a receiver looks at, against a walk over all of its members.
#include "cimple/instance_map.h"
#include "tests/cimple/random_links.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <vector>

namespace cimple {
namespace {

using Positions = std::vector<uint32>;

Positions everything(const Instance_Map_Base& store) {
    Positions all(store.size());
    for (uint32 i = 0; i < store.size(); ++i)
        all[i] = i;
    return all;
}

// What the receiver keeps of the members at these positions.
Positions kept(const Instance_Map_Base& store, const Enumeration_Focus& focus,
               Positions positions) {
    if (focus.kind == Enumeration_Focus::KEYS) {
        const auto match = std::find_if(positions.begin(), positions.end(), [&](uint32 i) {
            return key_eq(focus.instance, store.at(i));
        });
        return match == positions.end() ? Positions{} : Positions{*match};
    }
    std::erase_if(positions,
                  [&](uint32 i) { return !is_reference_to(store.at(i), focus.instance, ""); });
    return positions;
}

// How often a question was answered without the whole store.
struct Tally {
    int narrowed = 0;
    int whole = 0;
};

void check(Instance_Map_Base& store, const Instance* source, Tally& tally) {
    for (const auto kind : {Enumeration_Focus::KEYS, Enumeration_Focus::REFERENCES_TO}) {
        const Enumeration_Focus focus = {kind, source};
        const auto wanted = store.narrow(focus);
        ++(wanted ? tally.narrowed : tally.whole);
        const Positions positions = wanted.value_or(everything(store));
        const bool ascending = std::adjacent_find(positions.begin(), positions.end(),
                                                  std::greater_equal<uint32>{}) == positions.end();
        ASSERT_TRUE(ascending) << "in order, each once";
        ASSERT_EQ(kept(store, focus, positions), kept(store, focus, everything(store)));
    }
}

void change(Instance_Map_Base& store, Random_Links& random,
            const std::function<Instance*(Random_Links&)>& make) {
    Ref<Instance> made(make(random));
    const uint32 kind = random.below(20);
    if (kind == 0) {
        store.clear();
    } else if (kind < 4 && store.size()) {
        store.remove(random.below(store.size()));
    } else if (kind < 7) {
        store.modify_instance(made.get(), made.get());
    } else if (store.insert(made.get()) >= 0) {
        made.release();
    }
}

// Sources that match nothing, a subclass, a class with other names for the keys, no keys at all.
Ref<Instance> random_source(Random_Links& random) {
    switch (random.below(12)) {
    case 0:
        return Ref<Instance>(create_null<Test_Root>());
    case 1:
        return Ref<Instance>(random.link());
    default:
        return Ref<Instance>(random.end(false));
    }
}

Tally run(const Meta_Class& meta_class, const std::function<Instance*(Random_Links&)>& make) {
    Tally tally;
    for (uint32 seed = 1; seed <= 40; ++seed) {
        Random_Links random(seed);
        Instance_Map_Base store(&meta_class);
        for (int step = 0; step < 100; ++step) {
            for (uint32 i = random.below(4); i > 0; --i)
                change(store, random, make);
            check(store, random_source(random).get(), tally);
        }
    }
    return tally;
}

TEST(Narrowing, KeepsWhatAWalkFindsThroughEveryChange) {
    const Tally links = run(Test_Link::static_meta_class, [](Random_Links& r) { return r.link(); });
    const Tally crowds =
        run(Test_Crowd::static_meta_class, [](Random_Links& r) { return r.crowd(); });
    EXPECT_GT(links.narrowed, 6000);
    EXPECT_GT(links.whole, 0) << "a source without keys matches every end";
    EXPECT_GT(crowds.narrowed, 6000) << "references in arrays are nobody's end";
}

TEST(Narrowing, ASingleEndIsFoundAmongMany) {
    Instance_Map<Test_Link> store;
    for (uint32 i = 0; i < 1000; ++i) {
        ASSERT_EQ(store.insert(make_link(make_base("left", i), make_base("right", i / 2))),
                  static_cast<sint32>(i));
    }
    const Ref<Instance> end(make_base("right", 7));
    EXPECT_EQ(store.narrow({Enumeration_Focus::REFERENCES_TO, end.get()}), (Positions{14, 15}));
    EXPECT_EQ(store.narrow({Enumeration_Focus::KEYS, store[40]}), Positions{40});
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

// A fault of whoever changes a member; the store tells of it, and finds its members by what they
// are.
TEST(Narrowing, AChangeOfKeysIsFollowed) {
    Instance_Map<Test_Base> store;
    store.insert(make_base("a", 1));
    store.insert(make_base("b", 1));
    store.insert(make_base("c", 1));
    const Ref<Instance> keys(make_base("c", 1));
    const Enumeration_Focus focus = {Enumeration_Focus::KEYS, keys.get()};
    EXPECT_EQ(store.first_equal(), -1);
    cimple::change(store, 1, [](Test_Base& member) { member.Id.set("a"); });
    EXPECT_EQ(store.first_equal(), 1);
    store.remove(1);
    EXPECT_EQ(store.first_equal(), -1) << "distinct again";
    EXPECT_EQ(store.narrow(focus), Positions{1});
    cimple::change(store, 1, [](Test_Base& member) { member.Id.set("d"); });
    EXPECT_EQ(store.narrow(focus), Positions{});
}

} // namespace
} // namespace cimple
