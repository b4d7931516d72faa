// The meta model: look-up, relations, classes made at run time, printed forms.
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <string>

namespace cimple {
namespace {

TEST(Meta, NamesAreFoundInAnyCase) {
    EXPECT_EQ(find_meta_class(&test_repository, "test_SUB"), &Test_Sub::static_meta_class);
    EXPECT_EQ(find_meta_class(&test_repository, "Test_Su"), nullptr);
    EXPECT_EQ(find_meta_class(&test_repository, "Test_Subs"), nullptr);
    EXPECT_EQ(find_meta_class(nullptr, "Test_Sub"), nullptr);
    const Meta_Repository none{nullptr, 0};
    EXPECT_EQ(find_meta_class(&none, "Test_Sub"), nullptr);
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
    EXPECT_EQ(is_subclass_by_name(&test_repository, "test_base", "test_sub"), 0);
    EXPECT_EQ(is_subclass_by_name(&test_repository, "Test_Sub", "Test_Base"), 1);
    EXPECT_EQ(is_subclass_by_name(&test_repository, "Test_Sub", "nobody"), -1);
    EXPECT_EQ(is_subclass_by_name(&test_repository, nullptr, "Test_Base"), -1);
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

TEST(Meta, QualifiersAreRemovedByNameOrAll) {
    Meta_Class* made = create_meta_class("Made", &Test_Root::static_meta_class, 0);
    ASSERT_EQ(made->num_meta_qualifiers, 1u); // Abstract went with the copy
    EXPECT_STREQ(made->meta_qualifiers[0]->name, "Version");
    const char* const names[] = {"Other", "VERSION"};
    remove_qualifiers(made, names, 1);
    EXPECT_EQ(made->num_meta_qualifiers, 1u);
    remove_qualifiers(made, names, 2);
    EXPECT_EQ(made->num_meta_qualifiers, 0u);
    EXPECT_EQ(made->meta_qualifiers, nullptr);
    unref(made);

    Meta_Class* service = create_meta_class("Made", &Test_Service::static_meta_class, 0);
    const Meta_Feature* level = find_method(service, "Run")->meta_features[0];
    EXPECT_EQ(level->num_meta_qualifiers, 1u);
    remove_qualifiers(service, nullptr, 1); // the count goes with the list
    EXPECT_EQ(level->num_meta_qualifiers, 0u);
    unref(service);
}

std::string printed(const Meta_Class& meta_class, const Print_Options& options = {}) {
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
    const std::string types = printed(Test_Types::static_meta_class);
    EXPECT_NE(types.find("    string Names[2] = {\"a\", \"b\"};\n"), std::string::npos) << types;
    EXPECT_EQ(printed(Test_Service::static_meta_class, {.qualifiers = true}),
              "class Test_Service\n"
              "{\n"
              "    [Key,\n"
              "     Read]\n"
              "    string Name = NULL;\n"
              "    uint32 Run(\n"
              "        [In,\n"
              "         Description(\"for tests\")]\n"
              "        uint32 Level,\n"
              "        [In]\n"
              "        Test_Base ref Target,\n"
              "        [In(False),\n"
              "         Out]\n"
              "        string Answer);\n"
              "};\n");
    // Abstract is a flag and an empty qualifier: it prints once.
    EXPECT_EQ(printed(Test_Root::static_meta_class, {.local_only = true, .qualifiers = true}),
              "[Abstract,\n"
              " Version(\"1.0\")]\n"
              "class Test_Root\n"
              "{\n"
              "    [Read]\n"
              "    string Caption = NULL;\n"
              "};\n");
    EXPECT_NE(printed(Test_Sub::static_meta_class, {.local_only = true, .qualifiers = true})
                  .find("    [Read(False),\n     Values({\"a\", \"b\"})]\n"),
              std::string::npos);
}

} // namespace
} // namespace cimple
