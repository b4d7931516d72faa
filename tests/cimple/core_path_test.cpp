// Model paths: both ways, and on bytes that nobody meant well with.
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <string>

namespace cimple {
namespace {

std::string path_of(const Instance* instance) {
    String path;
    return instance_to_model_path(instance, path) == 0 ? path.c_str() : "fault";
}

Ref<Instance> read(const Meta_Class& meta_class, const std::string& path) {
    return Ref<Instance>(model_path_to_instance(&meta_class, path.c_str()));
}

TEST(Path, WritesAndReadsAllTypes) {
    Ref<Test_Types> types(create<Test_Types>());
    types->B.set(true);
    types->U8.set(255);
    types->S8.set(-128);
    types->S64.set(INT64_MIN);
    types->U64.set(UINT64_MAX);
    types->R32.set(-0.25f);
    types->R64.set(1e300);
    types->C16.set(u',');
    types->Str.set("a\"b\\c,d=\n");
    const std::string path = path_of(types.get());
    EXPECT_EQ(path.substr(0, 40), "Test_Types.B=true,U8=255,S8=-128,U16=0,S");
    EXPECT_NE(path.find("R32=-0.250000,"), std::string::npos) << path;
    EXPECT_NE(path.find("C16=',',Str=\"a\\\"b\\\\c,d=\n\",Date=\"00000000000000.000000:000\""),
              std::string::npos)
        << path;
    const Ref<Instance> read_back = read(Test_Types::static_meta_class, path);
    ASSERT_TRUE(read_back);
    EXPECT_TRUE(key_eq(types.get(), read_back.get()));
    types->C16.set(u'\u20AC');
    const Ref<Instance> wide = read(Test_Types::static_meta_class, path_of(types.get()));
    ASSERT_TRUE(wide);
    EXPECT_TRUE(key_eq(types.get(), wide.get()));
}

TEST(Path, NestsQuotedPaths) {
    Ref<Test_Chain> chain(create_null<Test_Chain>());
    chain->Link = make_link(make_leaf("say \"hi\" \\ bye\\"), make_base("r", 31));
    chain->End = make_base("end", 0);
    EXPECT_EQ(path_of(chain->Link->Right), "Test_Base.Id=\"r\",Slot=31");
    const std::string path = path_of(chain.get());
    const Ref<Test_Chain> read_back(
        model_path_to_instance(&Test_Chain::static_meta_class, path.c_str()));
    ASSERT_TRUE(read_back) << path;
    EXPECT_TRUE(key_eq(chain.get(), read_back.get())) << path;
    EXPECT_TRUE(read_back->Link->Weight.is_null());
}

TEST(Path, AcceptsWhatItSays) {
    const auto slot_of = [](const std::string& text) {
        const Ref<Instance> base =
            read(Test_Sub::static_meta_class, "Test_Base.Id=\"x\",Slot=" + text);
        return base ? static_cast<Test_Base*>(base.get())->Slot.value : 0;
    };
    EXPECT_EQ(slot_of("10"), 10u);
    EXPECT_EQ(slot_of("0x1F"), 31u);
    EXPECT_EQ(slot_of("1F"), 31u);
    EXPECT_EQ(slot_of("4294967295"), 4294967295u);
    const Ref<Instance> other_order =
        read(Test_Base::static_meta_class, "TEST_sub.SLOT=1,id=\"\\q\\\"\"");
    ASSERT_TRUE(other_order);
    EXPECT_EQ(other_order->__meta_class, &Test_Sub::static_meta_class);
    EXPECT_EQ(static_cast<Test_Sub*>(other_order.get())->Id.value, String("q\""));
}

TEST(Path, RefusesEveryFault) {
    const char* const refused[] = {
        "",
        ".",
        "Test_Base",
        "Test_Base.",
        "Nobody.Id=\"x\",Slot=1",
        "Test_Base.Id=\"x\"",                      // a key is missing
        "Test_Base.Id=\"x\",Slot=1,",              // a pair is missing
        "Test_Base.Id=\"x\",Slot=1,Slot=1",        // twice
        "Test_Base.Id=\"x\",Id=\"x\"",             // twice, with the right count
        "Test_Base.Id=\"x\",Slot=1,Caption=\"c\"", // no key
        "Test_Base.Id=\"x\",Slot=",
        "Test_Base.Id=\"x\",Slot=-1",
        "Test_Base.Id=\"x\",Slot=4294967296",
        "Test_Base.Id=\"x\",Slot=99999999999999999999999",
        "Test_Base.Id=\"x\",Slot= 1",
        "Test_Base.Id=\"x\",Slot=0x",
        "Test_Base.Id=\"x\",Slot=1G",
        "Test_Base.Id=\"x,Slot=1",
        "Test_Base.Id=\"x\\",
        "Test_Base.Id=\"x\"y,Slot=1",
        "Test_Base.Id=x,Slot=1",
        "Test_Base.=\"x\",Slot=1",
        "Test_Base Id=\"x\",Slot=1",
        "Test_Link.Left=\"Test_Leaf.Name=\\\"l\\\"\",Right=\"Test_Leaf.Name=\\\"l\\\"\"", // class
        "Test_Link.Left=\"Test_Leaf.Name=\\\"l\\\"\",Right=\"\"",
        "Test_Link.Left=NULL,Right=NULL",
    };
    for (const char* path : refused)
        EXPECT_FALSE(read(Test_Base::static_meta_class, path)) << path;
    EXPECT_EQ(model_path_to_instance(&Test_Base::static_meta_class, nullptr), nullptr);
    EXPECT_EQ(model_path_to_instance(nullptr, "Test_Base.Id=\"x\",Slot=1"), nullptr);
}

TEST(Path, IsNotWrittenWithoutAllKeys) {
    Ref<Test_Base> base(make_base("x", 1));
    base->Slot.null = 1;
    String path("before");
    EXPECT_EQ(instance_to_model_path(base.get(), path), -1);
    EXPECT_EQ(path, String("before"));
    EXPECT_EQ(path_of(Ref<Test_Root>(create<Test_Root>()).get()), "fault"); // no keys
    EXPECT_EQ(path_of(Ref<Test_Link>(create<Test_Link>()).get()), "fault");
}

} // namespace
} // namespace cimple
