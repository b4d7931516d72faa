// Instances: life, copying, narrowing, printing. Balance of what they own is the sanitizer's to
// find.
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <string>

namespace cimple {
namespace {

Test_Types* make_types() {
    auto* types = create<Test_Types>(true);
    types->Str.set("text");
    types->Date.set(Datetime(93784000005, 0, false));
    types->Dates.append(Datetime(1, 2, true));
    types->U64.set(UINT64_MAX);
    return types;
}

Test_Holder* make_holder() {
    auto* holder = create_null<Test_Holder>();
    holder->Id.set("h");
    holder->Object = make_base("inner", 1);
    holder->Objects.append(make_base("one", 1));
    holder->Objects.append(nullptr);
    holder->Objects.append(make_base("three", 3));
    return holder;
}

TEST(Instance, TakesDefaultsAndIsNullWithoutOne) {
    Ref<Test_Types> types(create<Test_Types>(true));
    EXPECT_TRUE(types->Numbers.value == (Array<uint32>{1, 2}));
    EXPECT_TRUE(types->Names.value == (Array<String>{"a", "b"}));
    EXPECT_TRUE(types->Installed.value == Datetime(93784000005, 0, false));
    EXPECT_FALSE(types->Numbers.is_null() || types->Names.is_null() || types->Installed.is_null());
    EXPECT_TRUE(types->B.is_null() && types->Dates.is_null() && types->Str.is_null());
    Ref<Test_Sub> sub(create<Test_Sub>(true));
    EXPECT_EQ(sub->State.value, 5);
}

TEST(Instance, MethodInstancesAreBuiltLikeOthers) {
    Ref<Instance> method(create(as_class(&Test_Service_Run_method::static_meta_class), true));
    auto* run = static_cast<Test_Service_Run_method*>(method.get());
    run->Answer.set("done");
    run->Target = make_base("t", 1);
    Ref<Instance> copied(clone(run));
    EXPECT_TRUE(identical(run, copied.get()));
    EXPECT_EQ(cast<Test_Base>(copied.get()), nullptr);
    EXPECT_TRUE(key_eq(run, copied.get()));
}

TEST(Instance, ClonesShareNothingThatChanges) {
    Ref<Test_Types> types(make_types());
    types->__name_space = "root/vorlan";
    Ref<Test_Types> copied(clone(types.get()));
    EXPECT_EQ(copied->__refs, 1u);
    EXPECT_TRUE(identical(types.get(), copied.get()));
    copied->Names.value[0] = "changed";
    EXPECT_FALSE(identical(types.get(), copied.get()));
    EXPECT_EQ(types->Names.value[0], String("a"));

    Ref<Test_Holder> holder(make_holder());
    Ref<Test_Holder> second(clone(holder.get()));
    EXPECT_TRUE(identical(holder.get(), second.get()));
    EXPECT_NE(second->Object, holder->Object);
    EXPECT_EQ(second->Objects.value[1], nullptr);
    EXPECT_NE(second->Objects.value[2], holder->Objects.value[2]);
    second->Objects.value[2]->Slot.set(4);
    EXPECT_FALSE(identical(holder.get(), second.get()));
    second->Objects.append(nullptr);
    EXPECT_FALSE(identical(holder.get(), second.get()));
    EXPECT_FALSE(identical(holder.get(), types.get()));

    Ref<Test_Link> link(create<Test_Link>());
    Ref<Test_Link> unlinked(clone(link.get()));
    EXPECT_EQ(unlinked->Left, nullptr);
}

TEST(Instance, CopiesWhatTheModelHolds) {
    Ref<Test_Types> from(make_types());
    from->U32.set(7);
    Ref<Test_Types> to(create_null<Test_Types>());
    to->U32.set(1);
    Ref<Test_Types> model(create_null<Test_Types>());
    model->Str.null = 0;
    model->Numbers.null = 0;
    copy(to.get(), from.get(), model.get());
    EXPECT_EQ(to->Str.value, String("text"));
    EXPECT_TRUE(to->Numbers.value == (Array<uint32>{1, 2}));
    EXPECT_EQ(to->U32.value, 1u);
    copy(to.get(), from.get());
    EXPECT_TRUE(identical(to.get(), from.get()));
    copy(to.get(), to.get());
    EXPECT_TRUE(identical(to.get(), from.get()));
}

TEST(Instance, CopyReplacesReferencesAndNeedsOneClass) {
    Ref<Test_Holder> from(make_holder());
    Ref<Test_Holder> to(make_holder());
    to->Object->Slot.set(99);
    copy(to.get(), from.get());
    EXPECT_TRUE(identical(to.get(), from.get()));
    Ref<Test_Holder> empty(create_null<Test_Holder>());
    copy(to.get(), empty.get());
    EXPECT_EQ(to->Object, nullptr);
    EXPECT_TRUE(to->Objects.is_null() && to->Objects.value.empty());

    Ref<Test_Base> base(make_base("a", 1));
    Ref<Test_Sub> sub(create<Test_Sub>());
    copy(sub.get(), base.get());
    EXPECT_TRUE(sub->Id.value.empty());

    Ref<Test_Base> keys(make_base("b", 2));
    keys->Caption.set("not a key");
    copy_keys(base.get(), keys.get());
    EXPECT_TRUE(key_eq(base.get(), keys.get()));
    EXPECT_TRUE(base->Caption.is_null());
}

Test_Crowd* make_crowd() {
    auto* crowd = create_null<Test_Crowd>();
    crowd->Head = make_base("head", 1);
    crowd->Others.append(make_base("one", 1));
    crowd->Others.append(nullptr);
    return crowd;
}

TEST(Instance, KeysMayBeTakenAway) {
    Ref<Test_Base> base(make_base("a", 1));
    base->Caption.set("stays");
    nullify_keys(base.get());
    EXPECT_TRUE(base->Id.is_null() && base->Slot.is_null());
    EXPECT_EQ(base->Caption.value, String("stays"));
    Ref<Test_Crowd> crowd(make_crowd());
    nullify_keys(crowd.get());
    EXPECT_NE(crowd->Head, nullptr); // a reference has no flag of its own
    EXPECT_EQ(crowd->Others.value.size(), 2u);
}

TEST(Instance, ClearEmptiesEverything) {
    Ref<Test_Types> types(make_types());
    types->__name_space = "root/vorlan";
    clear(types.get());
    EXPECT_TRUE(identical(types.get(), Ref<Test_Types>(create_null<Test_Types>()).get()));
    EXPECT_EQ(types->U64.value, 0u);
    EXPECT_TRUE(types->Str.value.empty() && types->Names.value.empty());
    Ref<Test_Holder> holder(make_holder());
    clear(holder.get());
    EXPECT_EQ(holder->Object, nullptr);
    EXPECT_TRUE(holder->Objects.is_null());
}

TEST(Instance, FilterKeepsWhatIsNamed) {
    Ref<Test_Holder> holder(make_holder());
    holder->Count.set(3);
    const char* const names[] = {"COUNT", "nobody", "Id", "objects", nullptr};
    EXPECT_EQ(filter_properties(holder.get(), names, true), 0);
    EXPECT_FALSE(holder->Id.is_null() || holder->Count.is_null() || holder->Objects.is_null());

    const char* const object[] = {"Object", nullptr};
    EXPECT_EQ(filter_properties(holder.get(), object, false), 0);
    EXPECT_TRUE(holder->Id.is_null() && holder->Count.is_null() && holder->Objects.is_null());
    EXPECT_EQ(holder->Object->Id.value, String("inner")); // one that is there stays

    Ref<Test_Holder> model(create_null<Test_Holder>());
    EXPECT_EQ(filter_properties(model.get(), object, true), 0);
    ASSERT_NE(model->Object, nullptr);
    EXPECT_EQ(model->Object->__meta_class, &Test_Base::static_meta_class);

    const char* const none[] = {nullptr};
    holder->Id.null = 0;
    EXPECT_EQ(filter_properties(holder.get(), none, true), 0);
    EXPECT_FALSE(holder->Id.is_null());
    EXPECT_EQ(filter_properties(holder.get(), nullptr, true), 0);
    EXPECT_FALSE(holder->Count.is_null() || holder->Objects.is_null());

    Ref<Test_Service> service(create<Test_Service>());
    const char* const method[] = {"Run", nullptr};
    EXPECT_EQ(filter_properties(service.get(), method, true), -1);
}

std::string printed(const Instance* instance, bool keys_only) {
    char* text = nullptr;
    std::size_t size = 0;
    std::FILE* stream = open_memstream(&text, &size);
    print(instance, stream, keys_only);
    std::fclose(stream);
    std::string result(text, size);
    std::free(text);
    return result;
}

TEST(Instance, Prints) {
    Ref<Test_Base> base(make_base("a\t\"b\"\n", 1));
    base->__name_space = "root/vorlan";
    EXPECT_EQ(printed(base.get(), false), "Test_Base\n"
                                          "{\n"
                                          "    string __name_space = \"root/vorlan\";\n"
                                          "    string Id = \"a\\t\\\"b\\\"\\n\";\n"
                                          "    uint32 Slot = 1;\n"
                                          "    string Caption = NULL;\n"
                                          "}\n");
    Ref<Test_Link> link(create<Test_Link>());
    link->Right = make_base("r", 2);
    EXPECT_EQ(printed(link.get(), true), "Test_Link\n"
                                         "{\n"
                                         "    Test_Root Left = NULL;\n"
                                         "    Test_Base Right = Test_Base\n"
                                         "    {\n"
                                         "        string Id = \"r\";\n"
                                         "        uint32 Slot = 2;\n"
                                         "    };\n"
                                         "}\n");
    Ref<Test_Crowd> crowd(make_crowd());
    EXPECT_EQ(printed(crowd.get(), false), "Test_Crowd\n"
                                           "{\n"
                                           "    Test_Base Head = Test_Base\n"
                                           "    {\n"
                                           "        string Id = \"head\";\n"
                                           "        uint32 Slot = 1;\n"
                                           "        string Caption = NULL;\n"
                                           "    };\n"
                                           "    Test_Base Tail = NULL;\n"
                                           "    Test_Base Others = { Test_Base\n"
                                           "    {\n"
                                           "        string Id = \"one\";\n"
                                           "        uint32 Slot = 1;\n"
                                           "        string Caption = NULL;\n"
                                           "    }, NULL };\n"
                                           "}\n");
    crowd->Others.null = 1;
    EXPECT_NE(printed(crowd.get(), false).find("    Test_Base Others = NULL;\n"), std::string::npos);
    base->Id.set("\f\r");
    EXPECT_NE(printed(base.get(), true).find("Id = \"\\f\\r\""), std::string::npos);
    Ref<Test_Types> types(create<Test_Types>(true));
    types->B.set(true);
    types->C16.set(u'\u20AC');
    types->R32.set(1.5f);
    types->S64.set(INT64_MIN);
    const std::string text = printed(types.get(), false);
    for (const char* line :
         {"    boolean B = true;\n", "    char16 C16 = 0x20AC;\n", "    real32 R32 = 1.500000;\n",
          "    sint64 S64 = -9223372036854775808;\n", "    string Names = { \"a\", \"b\" };\n",
          "    datetime Installed = \"00000001020304.000005:000\";\n", "    uint8 U8 = NULL;\n"})
        EXPECT_NE(text.find(line), std::string::npos) << line << text;
}

} // namespace
} // namespace cimple
