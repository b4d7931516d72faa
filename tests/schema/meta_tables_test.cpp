// How the generated tables hang together, over every class of the catalogue. What is in them, the
// table of the catalogue tells.
#include "cimple/instance.h"
#include "meta_repository.h"

#include <gtest/gtest.h>

using namespace cimple;

namespace {

uint32 member_offset(const Meta_Feature* feature) {
    return feature->flags & FLAG_REFERENCE ? static_cast<const Meta_Reference*>(feature)->offset
                                           : static_cast<const Meta_Property*>(feature)->offset;
}

void check_method(const Meta_Method& method) {
    ASSERT_GT(method.num_meta_features, 0u) << method.name;
    const Meta_Feature* last = method.meta_features[method.num_meta_features - 1];
    EXPECT_STREQ(last->name, "return_value");
    EXPECT_EQ(last->flags, FLAG_PROPERTY | FLAG_OUT);
    EXPECT_EQ(static_cast<const Meta_Property*>(last)->type, method.return_type);
    for (uint32 i = 0; i + 1 < method.num_meta_features; i++)
        EXPECT_TRUE(method.meta_features[i]->flags & (FLAG_IN | FLAG_OUT)) << method.name;
}

// What the class does not declare itself is its superclass's own record, in the same place.
void check_inheritance(const Meta_Class& meta_class) {
    const Meta_Class* super = meta_class.super_meta_class;
    const uint32 inherited = super ? super->num_meta_features : 0;
    ASSERT_LE(inherited, meta_class.num_meta_features);
    for (uint32 i = 0; i < meta_class.num_meta_features; i++) {
        const Meta_Feature* feature = meta_class.meta_features[i];
        if (!meta_class.locals[i]) {
            ASSERT_LT(i, inherited) << meta_class.name << "." << feature->name;
            EXPECT_EQ(feature, super->meta_features[i]) << meta_class.name;
            continue;
        }
        EXPECT_TRUE(!(feature->flags & FLAG_PROPERTY) || feature->flags & FLAG_READ)
            << meta_class.name << "." << feature->name;
        if (i < inherited && !(feature->flags & FLAG_METHOD)) {
            EXPECT_EQ(member_offset(feature), member_offset(super->meta_features[i]))
                << meta_class.name << "." << feature->name;
        }
    }
}

TEST(MetaTables, EveryClassIsConsistent) {
    ASSERT_EQ(meta_repository.num_meta_classes, 441u);
    for (uint32 i = 0; i < meta_repository.num_meta_classes; i++) {
        const Meta_Class& meta_class = *meta_repository.meta_classes[i];
        EXPECT_EQ(find_meta_class(&meta_repository, meta_class.name), &meta_class);
        EXPECT_EQ(meta_class.meta_repository, &meta_repository);
        EXPECT_EQ(!(meta_class.flags & FLAG_CLASS), !!(meta_class.flags & FLAG_ASSOCIATION))
            << meta_class.name;
        check_inheritance(meta_class);
        uint32 keys = 0;
        for (uint32 j = 0; j < meta_class.num_meta_features; j++) {
            const Meta_Feature* feature = meta_class.meta_features[j];
            EXPECT_EQ(find_feature(&meta_class, feature->name, FLAG_FEATURE), feature);
            if (feature->flags & FLAG_KEY) {
                ASSERT_LT(keys, meta_class.num_keys) << meta_class.name;
                EXPECT_EQ(meta_class.keys[keys].feature, j) << meta_class.name;
                EXPECT_EQ(meta_class.keys[keys++].name_hash, key_name_hash(feature->name));
            }
            if (feature->flags & FLAG_METHOD)
                check_method(*static_cast<const Meta_Method*>(feature));
        }
        EXPECT_EQ(keys, meta_class.num_keys) << meta_class.name;
    }
}

} // namespace
