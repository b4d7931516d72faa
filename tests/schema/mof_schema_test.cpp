#include "schema/mof_parser/mof.h"
#include "schema/mof_parser/word_map.h"

#include <gtest/gtest.h>

namespace {

mof::Schema schema(const char* text) {
    return mof::Schema(mof::parse_text(text, "t.mof"));
}

constexpr const char* FAMILY = R"(
    class Root { [Key] string Id; uint16 State = 5; [Write] string Name; uint32 Run(); };
    class Middle : Root { [Override("State")] uint16 State; string Own; };
    class Leaf : Middle { [Override("Id")] string Id; [Override("STATE"), Key] uint16 State = 7; };
)";

TEST(MofSchema, FlattensInheritedFeaturesFirst) {
    const mof::Schema family = schema(FAMILY);
    const mof::Schema_Class* leaf = family.find("LEAF");
    ASSERT_NE(leaf, nullptr);
    std::string names, locals;
    for (const mof::Schema_Feature& feature : leaf->features) {
        names += feature.name() + " ";
        locals += feature.local ? "1" : "0";
    }
    EXPECT_EQ(names, "Id State Name Run Own ");
    EXPECT_EQ(locals, "11000");
    EXPECT_EQ(leaf->number, 2u);
    EXPECT_EQ(family.classes().size(), 3u);
}

TEST(MofSchema, OverridesKeepKeyAndDefaultUnlessTheySayOtherwise) {
    mof::Schema first = schema(FAMILY);
    const mof::Schema_Class* middle = first.find("Middle");
    const mof::Schema_Class* leaf = first.find("Leaf");
    const mof::Schema family = std::move(first); // classes stay where they are
    EXPECT_EQ(family.find("Leaf"), leaf);
    EXPECT_EQ(leaf->superclass, middle);
    EXPECT_TRUE(leaf->find("id")->key);
    EXPECT_EQ(leaf->num_keys, 2u);
    EXPECT_EQ(middle->num_keys, 1u);
    EXPECT_EQ(middle->find("State")->default_value->magnitude, 5u);
    EXPECT_EQ(leaf->find("State")->default_value->magnitude, 7u);
    EXPECT_EQ(leaf->find("State")->origin->name(), "Root");
    EXPECT_EQ(leaf->find("State")->owner, leaf);
    EXPECT_EQ(leaf->find("Own")->owner, middle);
    EXPECT_EQ(leaf->find("nothing"), nullptr);
    EXPECT_TRUE(family.is_subclass("root", "Leaf") && family.is_subclass("Leaf", "Leaf"));
    for (const char* other : {"Root", "Other"})
        EXPECT_FALSE(family.is_subclass("Leaf", other) || family.is_subclass("Other", other));
}

TEST(MofSchema, RefusesWhatDoesNotHoldTogether) {
    const struct {
        const char* text;
        const char* message;
    } cases[] = {
        {"class A {}; class a {};", "t.mof:1:19: class 'a' declared twice"},
        {"class A : B {}; class B {};", "t.mof:1:11: superclass 'B' is not declared before"},
        {"class A : A {};", "t.mof:1:11: superclass 'A' is not declared before"},
        {"class A { uint8 x; string X; };", "t.mof:1:27: 'X' twice in one class"},
        {"class A { uint8 x; }; class B : A { uint8 x; };",
         "t.mof:1:43: 'x' of A is redeclared without Override"},
        {"class A { uint8 x; }; class B : A { [Override(\"x\")] uint16 x; };",
         "t.mof:1:60: 'x' is not of the type that A gives it"},
        {"class A { uint8 x; }; class B : A { [Override(\"x\")] uint8 x[]; };",
         "t.mof:1:59: 'x' is not of the type that A gives it"},
        {"class A {}; class B : A { [Override(\"x\")] uint8 x; };",
         "t.mof:1:49: no superclass of B has 'x' to override"},
        {"class A { uint8 x; }; class B : A { [Override(\"y\")] uint8 x; };",
         "t.mof:1:38: Override must name 'x' itself"},
        {"class A { Nowhere ref x; };", "t.mof:1:23: there is no class 'Nowhere'"},
        {"class A { uint8 f(Nowhere ref x); };", "t.mof:1:31: there is no class 'Nowhere'"},
        {"class A { [EmbeddedInstance(\"No\")] string x; };", "t.mof:1:43: there is no class 'No'"},
        {"class A { A ref x; }; class B {}; class C : A { [Override(\"x\")] B ref x; };",
         "t.mof:1:71: 'B' is no subclass of A, to which 'x' of A refers"},
        {"class A { [Key] uint8 f(); };", "t.mof:1:23: a method cannot be a key"},
        {"Qualifier Key : boolean = false, Scope(property); [Kee] class A {};",
         "t.mof:1:52: unknown qualifier 'Kee'"},
        {"Qualifier Key : boolean = false, Scope(property); class A { [Key(\"a\")] uint8 x; };",
         "t.mof:1:62: the value of 'Key' is not of its type"},
        {"Qualifier Key : boolean = false, Scope(property); [Key] class A {};",
         "t.mof:1:52: 'Key' does not belong on a class"},
        {"Qualifier K : boolean; Qualifier k : boolean;",
         "t.mof:1:34: qualifier 'k' declared twice"},
    };
    for (const auto& bad : cases) {
        try {
            schema(bad.text);
            ADD_FAILURE() << "accepted: " << bad.text;
        } catch (const mof::Error& error) {
            EXPECT_STREQ(error.what(), bad.message) << bad.text;
        }
    }
}

TEST(MofWords, RangesAndTheRest) {
    const mof::Document document = mof::parse_text(R"(
        class A {
            [ValueMap{"-2", "0x3..5", "6..", ".."}, Values{"below", "some", "many", "rest"}]
            sint16 number;
            [ValueMap{"a", "b"}, Values{"first", "second"}] string text[];
            [ValueMap{"..0", "18446744073709551615"}, Values{"none", "all"}] uint64 wide;
            uint8 plain;
        };)",
                                                   "t.mof");
    const std::vector<mof::Feature>& features = document.classes[0].features;
    const auto numbers = mof::Word_Map::read(features[0]);
    for (const auto& [value, word] : std::map<int, std::string>{
             {-2, "below"}, {3, "some"}, {5, "some"}, {6, "many"}, {32767, "many"}, {2, "rest"}})
        EXPECT_EQ(*numbers->find(std::int64_t{value}), word) << value;
    const auto texts = mof::Word_Map::read(features[1]);
    EXPECT_EQ(*texts->find("b"), "second");
    EXPECT_EQ(texts->find("c"), nullptr);
    EXPECT_THROW(mof::Word_Map::read(features[2]), mof::Error) << "past what an answer shows";
    EXPECT_FALSE(mof::Word_Map::read(features[3]));
}

} // namespace
