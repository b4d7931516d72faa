// The meta model: look-up, relations, classes made at run time, printed forms.
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <string>

namespace cimple {
namespace {

TEST(Meta, NamesAreFoundInAnyCase) {
    EXPECT_EQ(find_meta_class(&meta_repository, "test_SUB"), &Test_Sub::static_meta_class);
    EXPECT_EQ(find_meta_class(&meta_repository, "Test_Su"), nullptr);
    EXPECT_EQ(find_meta_class(&meta_repository, "Test_Subs"), nullptr);
    EXPECT_EQ(find_meta_class(nullptr, "Test_Sub"), nullptr);
    const Meta_Repository none{nullptr, 0};
    EXPECT_EQ(find_meta_class(&none, "Test_Sub"), nullptr);
    Meta_Repository unsorted = meta_repository; // without the table of names
    unsorted.num_name_slots = 0;
    EXPECT_EQ(find_meta_class(&unsorted, "test_SUB"), &Test_Sub::static_meta_class);
    EXPECT_EQ(find_meta_class(&unsorted, "Test_Su"), nullptr);
    EXPECT_EQ(find_class_in_tree(nullptr, "Test_Sub"), nullptr);
    EXPECT_TRUE(name_equal(nullptr, nullptr));
    EXPECT_FALSE(name_equal("", nullptr));

    const Meta_Class* service = &Test_Service::static_meta_class;
    EXPECT_EQ(find_method(service, "RUN"), &Test_Service_Run_method::static_meta_class);
    EXPECT_EQ(find_feature(service, "Run", FLAG_PROPERTY | FLAG_REFERENCE), nullptr);
    EXPECT_EQ(find_property(&Test_Sub::static_meta_class, "slot")->type, TYPE_UINT32);
    EXPECT_EQ(find_reference(&Test_Link::static_meta_class, "Weight"), nullptr);
    EXPECT_TRUE(has_feature_flag(service, FLAG_METHOD));
    EXPECT_FALSE(has_feature_flag(&Test_Base::static_meta_class, FLAG_REFERENCE));
    EXPECT_EQ(find_class_in_tree(&Test_Sub::static_meta_class, "TEST_BASE"),
              &Test_Base::static_meta_class);
    EXPECT_EQ(find_class_in_tree(&Test_Sub::static_meta_class, "Test_Link"),
              &Test_Link::static_meta_class);
}

TEST(Meta, WordsOfMofStandForTypesAndFlags) {
    for (uint32 type = 0; type < NUM_TYPES; ++type)
        EXPECT_EQ(type_name_to_code(type_name(type)), static_cast<Type>(type));
    EXPECT_EQ(type_name_to_code("UINT64"), TYPE_UINT64);
    EXPECT_EQ(type_name_to_code("uint65"), TYPE_NONE);
    EXPECT_EQ(flag_by_name("key"), FLAG_KEY);
    EXPECT_EQ(flag_by_name("lock"), 0u);
}

TEST(Meta, SubclassesAreRelatedByPointerOrName) {
    const Meta_Class* base = &Test_Base::static_meta_class;
    const Meta_Class* sub = &Test_Sub::static_meta_class;
    const Meta_Class* any = &Instance::static_meta_class;
    EXPECT_TRUE(is_subclass(base, base));
    EXPECT_TRUE(is_subclass(base, sub));
    EXPECT_FALSE(is_subclass(sub, base));
    EXPECT_TRUE(is_subclass(any, sub));
    EXPECT_TRUE(is_subclass(any, nullptr));
    EXPECT_FALSE(is_subclass(base, nullptr));
    EXPECT_FALSE(is_subclass(any, nullptr) && is_subclass(nullptr, base));
    EXPECT_FALSE(is_subclass(base, as_class(&Test_Service_Run_method::static_meta_class)));
    EXPECT_EQ(is_subclass_by_name(&meta_repository, "test_base", "test_sub"), 0);
    EXPECT_EQ(is_subclass_by_name(&meta_repository, "Test_Sub", "Test_Base"), 1);
    EXPECT_EQ(is_subclass_by_name(&meta_repository, "Test_Sub", "nobody"), -1);
    EXPECT_EQ(is_subclass_by_name(&meta_repository, nullptr, "Test_Base"), -1);
}

TEST(Meta, ClassWithBaseIsADeepCopy) {
    for (const Meta_Class* base :
         {&Test_Root::static_meta_class, &Test_Types::static_meta_class,
          &Test_Service::static_meta_class, &Test_Link::static_meta_class}) {
        Meta_Class* made = create_meta_class("Made", base, 0);
        Meta_Class* again = create_meta_class("mADE", made, 0);
        EXPECT_EQ(made->refs, 2u); // the second one's super class
        EXPECT_EQ(made->flags & FLAG_ABSTRACT, 0u);
        EXPECT_EQ(made->super_meta_class, base);
        EXPECT_TRUE(is_subclass(base, again));
        EXPECT_TRUE(identical(made, again));
        EXPECT_FALSE(identical(made, again, true));
        EXPECT_FALSE(identical(made, base));
        for (uint32 i = 0; i < made->num_meta_features; ++i) {
            EXPECT_NE(made->meta_features[i], base->meta_features[i]);
            EXPECT_NE(made->meta_features[i]->name, base->meta_features[i]->name);
            EXPECT_EQ(made->locals[i], 0);
        }
        unref(made);
        EXPECT_TRUE(name_equal(again->super_meta_class->name, "Made")); // kept by again
        unref(again);
        EXPECT_EQ(base->refs, 0u);
    }
}

TEST(Meta, InstancesOfMadeClassesTakeTheirDefaults) {
    Meta_Class* made = create_meta_class("Made", &Test_Types::static_meta_class, 0);
    auto* instance = static_cast<Test_Types*>(create(made, true));
    EXPECT_TRUE(instance->Names.value == (Array<String>{"a", "b"}));
    EXPECT_NE(cast<Test_Types>(instance), nullptr);
    Instance* copied = clone(instance);
    unref(made);
    unref(instance);
    EXPECT_EQ(made->refs, 1u) << "the clone's";
    unref(copied);
}

// ---- Qualifiers, which no table of the generator has ----

constexpr const char* WORDS[] = {"a", "b"};
constexpr Meta_Value FIVE{.uint16_value = 5};
constexpr Meta_Value VERSION{.string_value = "1.0"};
constexpr Meta_Value WORDS_VALUE{.array_value = {WORDS, 2}};
const Meta_Qualifier abstract{{0}, "Abstract", TYPE_BOOLEAN, 0, nullptr};
const Meta_Qualifier version{{0}, "Version", TYPE_STRING, 0, &VERSION};
const Meta_Qualifier values{{0}, "Values", TYPE_STRING, 1, &WORDS_VALUE};
const Meta_Qualifier* const class_qualifiers[] = {&abstract, &version};
const Meta_Qualifier* const value_qualifiers[] = {&values};

const Meta_Property state{
    {{0}, FLAG_PROPERTY, "State", value_qualifiers, 1}, TYPE_UINT16, 0, sizeof(Instance), &FIVE};
const Meta_Property level{{{0}, FLAG_PROPERTY | FLAG_IN, "Level", value_qualifiers, 1},
                          TYPE_STRING,
                          2,
                          sizeof(Instance),
                          nullptr};
const Meta_Property result{
    {{0}, FLAG_PROPERTY | FLAG_OUT, "return_value", nullptr, 0}, TYPE_UINT32, 0, 64, nullptr};
const Meta_Feature* const parameters[] = {&level, &result};
const Meta_Method run{{{{0}, FLAG_METHOD, "Run", nullptr, 0}, parameters, 2, 80}, TYPE_UINT32};
const Meta_Feature* const features[] = {&state, &run};
constexpr uint8 locals[] = {1, 1};
const Meta_Class qualified{
    {{{0}, FLAG_CLASS | FLAG_ABSTRACT, "Qualified", class_qualifiers, 2}, features, 2, 80},
    locals,
    nullptr,
    0,
    nullptr};

TEST(Meta, QualifiersAreRemovedByNameOrAll) {
    Meta_Class* made = create_meta_class("Made", &qualified, 0);
    ASSERT_EQ(made->num_meta_qualifiers, 1u); // Abstract went with the copy
    EXPECT_STREQ(made->meta_qualifiers[0]->name, "Version");
    EXPECT_EQ(find_method(made, "Run")->meta_features[0]->num_meta_qualifiers, 1u);
    const char* const names[] = {"Other", "VERSION"};
    remove_qualifiers(made, names, 1);
    EXPECT_EQ(made->num_meta_qualifiers, 1u);
    remove_qualifiers(made, names, 2);
    EXPECT_EQ(made->num_meta_qualifiers, 0u);
    EXPECT_EQ(made->meta_qualifiers, nullptr);
    remove_qualifiers(made, nullptr, 1); // the count goes with the list
    EXPECT_EQ(find_method(made, "Run")->meta_features[0]->num_meta_qualifiers, 0u);
    unref(made);
}

std::string printed(const Meta_Class& meta_class, const Print_Options& options) {
    testing::internal::CaptureStdout();
    print(&meta_class, options);
    std::fflush(stdout);
    return testing::internal::GetCapturedStdout();
}

TEST(Meta, Prints) {
    EXPECT_EQ(printed(Test_Sub::static_meta_class, {.local_only = true}),
              "class Test_Sub : Test_Base\n"
              "{\n"
              "    uint16 State = 5;\n"
              "};\n");
    EXPECT_EQ(printed(Test_Link::static_meta_class, {.qualifiers = true}),
              "[Association]\n"
              "class Test_Link\n"
              "{\n"
              "    [Key]\n"
              "    Test_Root ref Left;\n"
              "    [Key]\n"
              "    Test_Base ref Right;\n"
              "    [Read]\n"
              "    uint32 Weight = NULL;\n"
              "};\n");
    // Abstract is a flag and an empty qualifier: it prints once.
    EXPECT_EQ(printed(qualified, {.qualifiers = true}), "[Abstract,\n"
                                                        " Version(\"1.0\")]\n"
                                                        "class Qualified\n"
                                                        "{\n"
                                                        "    [Read(False),\n"
                                                        "     Values({\"a\", \"b\"})]\n"
                                                        "    uint16 State = 5;\n"
                                                        "    uint32 Run(\n"
                                                        "        [In,\n"
                                                        "         Values({\"a\", \"b\"})]\n"
                                                        "        string Level[2]);\n"
                                                        "};\n");
}

} // namespace
} // namespace cimple
