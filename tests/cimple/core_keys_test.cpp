// Keys: equality across classes, the hash that goes with it, and the store that rests on both.
#include "cimple/instance_map.h"
#include "cimple/shared_instances.h"
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

namespace cimple {
namespace {

template <class T>
Ref<T> own(T* instance) {
    return Ref<T>(instance);
}

TEST(Keys, EqualAcrossClassesWithTheSameKeys) {
    const Ref<Test_Base> base(make_base("a", 1));
    const auto sub = own(make_base<Test_Sub>("a", 1));
    const auto stranger = own(make_stranger("a", 1));
    for (const Instance* other :
         {static_cast<const Instance*>(sub.get()), static_cast<const Instance*>(stranger.get())}) {
        EXPECT_TRUE(key_eq(base.get(), other));
        EXPECT_TRUE(key_eq(other, base.get()));
        EXPECT_EQ(key_hash(base.get()), key_hash(other));
    }
    sub->Id.set("A");
    EXPECT_FALSE(key_eq(base.get(), sub.get())); // values have case
    base->Caption.set("no key");
    EXPECT_EQ(key_hash(base.get()), key_hash(stranger.get()));
    base->Id.null = 1; // flags play no part
    EXPECT_TRUE(key_eq(base.get(), stranger.get()));
    EXPECT_EQ(key_hash(base.get()), key_hash(stranger.get()));
}

TEST(Keys, OneWayWhereTheOtherHasMoreOrOtherKeys) {
    const auto root = own(create<Test_Root>());
    const auto leaf = own(make_leaf("x"));
    const auto base = own(make_base("x", 1));
    EXPECT_TRUE(key_eq(root.get(), leaf.get())); // nothing to compare
    EXPECT_FALSE(key_eq(leaf.get(), root.get()));
    EXPECT_FALSE(key_eq(leaf.get(), base.get()));
    EXPECT_FALSE(key_eq(base.get(), leaf.get()));
}

TEST(Keys, ReferencesCompareByTheirKeys) {
    const auto a = own(make_link(make_leaf("l"), make_base("r", 1)));
    const auto b = own(make_link(make_leaf("l"), make_base("r", 1)));
    b->Right->Caption.set("no key");
    EXPECT_TRUE(key_eq(a.get(), b.get()));
    EXPECT_EQ(key_hash(a.get()), key_hash(b.get()));
    const auto null = own(make_link(make_leaf("l"), nullptr));
    EXPECT_FALSE(key_eq(a.get(), null.get()));
    EXPECT_FALSE(key_eq(null.get(), a.get()));
    EXPECT_TRUE(key_eq(null.get(), own(make_link(make_leaf("l"), nullptr)).get()));
    // Same keys, unrelated class.
    const auto c = own(make_link(make_stranger("r", 1), make_base("r", 1)));
    const auto d = own(make_link(make_base("r", 1), make_base("r", 1)));
    EXPECT_FALSE(key_eq(c.get(), d.get()));
}

TEST(Keys, AllTypesTellInstancesApart) {
    const auto types = own(create<Test_Types>());
    using Change = void (*)(Test_Types&);
    const Change changes[] = {
        [](Test_Types& t) { t.B.set(true); },
        [](Test_Types& t) { t.U8.set(1); },
        [](Test_Types& t) { t.S16.set(-1); },
        [](Test_Types& t) { t.U64.set(uint64{1} << 40); },
        [](Test_Types& t) { t.R32.set(0.5f); },
        [](Test_Types& t) { t.C16.set(u'x'); },
        [](Test_Types& t) { t.Str.set("x"); },
        [](Test_Types& t) { t.Date.value.set_timestamp(true); },
    };
    for (const Change change : changes) {
        const auto other = own(static_cast<Test_Types*>(clone(types.get())));
        EXPECT_TRUE(key_eq(types.get(), other.get()));
        change(*other);
        EXPECT_FALSE(key_eq(types.get(), other.get()));
        EXPECT_FALSE(identical(types.get(), other.get()));
    }
}

TEST(Keys, AssociationPointsToInstance) {
    const auto link = own(make_link(make_leaf("l"), make_base("r", 1)));
    const auto leaf = own(make_leaf("l"));
    const auto base = own(make_base("r", 1));
    const auto other = own(make_base("r", 2));
    EXPECT_TRUE(is_reference_to(link.get(), leaf.get(), ""));
    EXPECT_TRUE(is_reference_to(link.get(), leaf.get(), nullptr));
    EXPECT_TRUE(is_reference_to(link.get(), base.get(), "RIGHT"));
    EXPECT_FALSE(is_reference_to(link.get(), base.get(), "Left"));
    EXPECT_FALSE(is_reference_to(link.get(), base.get(), "Nobody"));
    EXPECT_FALSE(is_reference_to(link.get(), other.get(), ""));
}

// ---- The store ----

TEST(InstanceMap, AnswersProviderStatus) {
    Instance_Map<Test_Base> map;
    const auto base = own(make_base("a", 1));
    EXPECT_EQ(map.create_instance(base.get()), 0);
    EXPECT_EQ(map.create_instance(base.get()), CREATE_INSTANCE_DUPLICATE);
    EXPECT_EQ(map.size(), 1u);
    EXPECT_NE(map[0], base.get());

    Instance* out = nullptr;
    EXPECT_EQ(map.get_instance(base.get(), out), 0);
    EXPECT_NE(out, map[0]);
    EXPECT_TRUE(identical(out, base.get()));
    unref(out);

    base->Caption.set("new");
    base->Slot.set(1);
    const auto model = own(create_null<Test_Base>());
    EXPECT_EQ(map.modify_instance(model.get(), base.get()), 0);
    EXPECT_TRUE(map[0]->Caption.is_null());
    EXPECT_EQ(map.modify_instance(nullptr, base.get()), 0);
    EXPECT_EQ(map[0]->Caption.value, String("new"));

    const auto nobody = own(make_base("nobody", 1));
    out = nullptr;
    EXPECT_EQ(map.get_instance(nobody.get(), out), GET_INSTANCE_NOT_FOUND);
    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(map.modify_instance(nullptr, nobody.get()), MODIFY_INSTANCE_NOT_FOUND);
    EXPECT_EQ(map.delete_instance(nobody.get()), DELETE_INSTANCE_NOT_FOUND);
    EXPECT_EQ(map.delete_instance(base.get()), 0);
    EXPECT_EQ(map.size(), 0u);
    EXPECT_EQ(map.find(base.get()), -1);
    EXPECT_EQ(map.insert(nullptr), -1);
    EXPECT_EQ(map.find(nullptr), -1);
    EXPECT_EQ(map[0], nullptr);
}

TEST(InstanceMap, EnumeratesInOrderUntilToldToStop) {
    Instance_Map<Test_Base> map;
    for (const char* id : {"c", "a", "b"})
        EXPECT_GE(map.insert(make_base(id, 0)), 0);
    struct Seen {
        std::string ids;
        std::size_t limit;
    };
    const auto collect = [](const Instance* instance, sint32, void* data) {
        auto* seen = static_cast<Seen*>(data);
        const Ref<const Test_Base> base(instance);
        seen->ids += base->Id.value.c_str();
        return seen->ids.size() < seen->limit;
    };
    Seen all{"", 100};
    EXPECT_EQ(map.enum_instances(Enum_Instances_Handler(collect, &all)), 0);
    EXPECT_EQ(all.ids, "cab");
    Seen some{"", 2};
    EXPECT_EQ(map.enum_instances(Enum_Instances_Handler(collect, &some)), 0);
    EXPECT_EQ(some.ids, "ca");
}

// Against a plain list, through inserts and removals: phases in which it grows, and shrinks.
TEST(InstanceMap, IndexFollowsEveryChange) {
    Instance_Map<Test_Base> map;
    std::vector<std::string> ids;
    uint32 random = 1;
    for (int step = 0; step < 20000; ++step) {
        random = random * 1664525 + 1013904223;
        std::string id = "id" + std::to_string((random >> 16) % 1000);
        if (step / 2000 % 2 && !ids.empty())
            id = ids[(random >> 16) % ids.size()];
        const Ref<Test_Base> keys(make_base(id.c_str(), 7));
        const auto at = std::find(ids.begin(), ids.end(), id);
        ASSERT_EQ(map.find(keys.get()),
                  at == ids.end() ? -1 : static_cast<sint32>(at - ids.begin()));
        if (at == ids.end()) {
            ASSERT_EQ(map.create_instance(keys.get()), 0);
            ids.push_back(id);
        } else if (random & 1) {
            ASSERT_EQ(map.delete_instance(keys.get()), 0);
            ids.erase(at);
        } else {
            map.remove(static_cast<uint32>(at - ids.begin()));
            ids.erase(at);
        }
        ASSERT_EQ(map.size(), ids.size());
    }
    for (uint32 i = 0; i < map.size(); ++i)
        EXPECT_STREQ(map[i]->Id.value.c_str(), ids[i].c_str()) << "in the order of insertion";
    map.remove(map.size());
    EXPECT_EQ(map.size(), ids.size());
    map.clear();
    EXPECT_EQ(map.find(own(make_base("id1", 7)).get()), -1);
    EXPECT_EQ(map.insert(make_base("id1", 7)), 0);
}

#ifdef CIMPLE_CHECK_LOCKS
// Whoever writes what a reader has is found out: at once, or when the reader is done.
TEST(InstanceMapDeathTest, AWriteToASharedInstanceEndsTheProcess) {
    Instance_Map<Test_Base> map;
    Test_Base* base = make_base("a", 1);
    EXPECT_EQ(map.insert(base), 0);
    Shared_Instances reader;
    reader.add(map[0]);
    EXPECT_DEATH(nullify_non_keys(base), "is_shared");
    EXPECT_DEATH(
        {
            base->Id.set("b");
            unref(reader.take(0));
        },
        "a shared instance is written");
}
#endif

TEST(InstanceMap, SubclassMatchesBaseKey) {
    Instance_Map<Test_Base> map;
    EXPECT_EQ(map.insert(make_base<Test_Sub>("a", 1)), 0);
    const auto base = own(make_base("a", 1));
    EXPECT_EQ(map.find(base.get()), 0);
    EXPECT_EQ(map.create_instance(base.get()), CREATE_INSTANCE_DUPLICATE);
    EXPECT_EQ(map.find(own(make_stranger("a", 1)).get()), 0);
}

// Members whose keys are of several shapes: an index by hash alone would miss the one-way matches.
TEST(InstanceMap, KeylessReferenceMatchesFirstMember) {
    Instance_Map<Test_Link> map;
    EXPECT_EQ(map.insert(make_link(make_leaf("x"), make_base("r", 1))), 0);
    EXPECT_EQ(map.insert(make_link(make_leaf("y"), make_base("r", 1))), 1);
    EXPECT_EQ(map.insert(make_link(nullptr, make_base("r", 1))), 2);
    const auto any = own(make_link(create<Test_Root>(), make_base("r", 1)));
    EXPECT_EQ(map.find(any.get()), 0);
    const auto none = own(make_link(create<Test_Root>(), make_base("r", 2)));
    EXPECT_EQ(map.find(none.get()), -1);
    map.remove(0);
    EXPECT_EQ(map.find(any.get()), 0);
    EXPECT_EQ(map.find(own(make_link(make_leaf("y"), make_base("r", 1))).get()), 0);
    EXPECT_EQ(map.find(own(make_link(nullptr, make_base("r", 1))).get()), 1);
}

TEST(InstanceMap, StaysRightWhenAModificationWidensAKeyReference) {
    Instance_Map<Test_Link> map;
    EXPECT_EQ(map.insert(make_link(make_leaf("x"), make_base("r", 1))), 0);
    const auto any = own(make_link(create<Test_Root>(), make_base("r", 1)));
    EXPECT_EQ(map.modify_instance(nullptr, any.get()), 0);
    EXPECT_EQ(map[0]->Left->__meta_class, &Test_Root::static_meta_class);
    EXPECT_EQ(map.find(any.get()), 0);
    EXPECT_EQ(map.find(own(make_link(make_leaf("x"), make_base("r", 1))).get()), -1);
}

TEST(InstanceMap, WithoutKeysHoldsOneMember) {
    Instance_Map<Test_Root> map;
    EXPECT_EQ(map.insert(create<Test_Root>()), 0);
    const auto second = own(create<Test_Root>());
    EXPECT_EQ(map.create_instance(second.get()), CREATE_INSTANCE_DUPLICATE);
}

} // namespace
} // namespace cimple
