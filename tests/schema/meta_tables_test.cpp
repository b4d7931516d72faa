// The generated tables as the engine sees them, over every class of the catalogue.
#include "cimple/instance.h"
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_ConcreteJob.h"
#include "meta_repository.h"

#include <gtest/gtest.h>

#include <cstring>
#include <map>
#include <string>

using namespace cimple;

namespace {

// Bytes of a feature's member, 0 for a method, which has none.
uint32 member_size(const Meta_Feature* feature) {
    if (feature->flags & FLAG_METHOD)
        return 0;
    if (feature->flags & FLAG_REFERENCE) {
        const bool array = static_cast<const Meta_Reference*>(feature)->subscript != 0;
        return static_cast<uint32>(array ? sizeof(void*) + 1 : sizeof(void*));
    }
    const auto* property = static_cast<const Meta_Property*>(feature);
    return (property->subscript ? static_cast<uint32>(sizeof(void*)) : type_size(property->type)) +
           1;
}

uint32 member_offset(const Meta_Feature* feature) {
    return feature->flags & FLAG_REFERENCE ? static_cast<const Meta_Reference*>(feature)->offset
                                           : static_cast<const Meta_Property*>(feature)->offset;
}

// Members lie behind the head, inside the structure, and apart from one another.
void check_layout(const Meta_Features& owner, const std::string& name) {
    EXPECT_EQ(owner.refs.load(), 0u) << name;
    std::map<uint32, uint32> members;
    for (uint32 i = 0; i < owner.num_meta_features; i++) {
        const Meta_Feature* feature = owner.meta_features[i];
        const uint32 kind = feature->flags & FLAG_FEATURE;
        ASSERT_TRUE(kind && (kind & (kind - 1)) == 0) << name << "." << feature->name;
        EXPECT_EQ(feature->refs.load(), 0u);
        if (kind == FLAG_METHOD)
            continue;
        EXPECT_TRUE(members.emplace(member_offset(feature), member_size(feature)).second)
            << name << "." << feature->name;
    }
    uint32 end = sizeof(Instance);
    for (const auto& [offset, size] : members) {
        EXPECT_GE(offset, end) << name;
        end = offset + size;
    }
    EXPECT_LE(end, owner.size) << name;
}

void check_method(const Meta_Method& method) {
    ASSERT_GT(method.num_meta_features, 0u) << method.name;
    check_layout(method, method.name);
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
        check_layout(meta_class, meta_class.name);
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

TEST(MetaTables, EveryClassLivesADay) {
    for (uint32 i = 0; i < meta_repository.num_meta_classes; i++) {
        const Meta_Class* meta_class = meta_repository.meta_classes[i];
        for (bool defaults : {false, true}) {
            Instance* instance = create(meta_class, defaults);
            ASSERT_NE(instance, nullptr) << meta_class->name;
            Instance* copy = clone(instance);
            EXPECT_TRUE(identical(instance, copy)) << meta_class->name;
            destroy(instance);
            destroy(copy);
        }
        for (uint32 j = 0; j < meta_class->num_meta_features; j++) {
            const Meta_Feature* feature = meta_class->meta_features[j];
            if (!(feature->flags & FLAG_METHOD))
                continue;
            // A method instance is made as a class instance is.
            const auto* method = static_cast<const Meta_Method*>(feature);
            destroy(create(reinterpret_cast<const Meta_Class*>(method), true));
        }
    }
}

// The table of the catalogue tells what the records say; this, that a structure's members are where
// they say.
TEST(MetaTables, StructuresAndRecordsAgree) {
    const Meta_Property* temperature =
        find_property(&VLNMPCA_Card::static_meta_class, "boardtemperature");
    ASSERT_NE(temperature, nullptr);
    Ref<VLNMPCA_Card> card(create<VLNMPCA_Card>());
    card->BoardTemperature.set(-7);
    EXPECT_EQ(*static_cast<const sint32*>(member(card.get(), temperature->offset)), -7);
    Ref<VLNMPCA_ConcreteJob> job(create<VLNMPCA_ConcreteJob>(true));
    EXPECT_STREQ(job->TimeBeforeRemoval.value.ascii().c_str(), "00000000000500.000000:000");
}

} // namespace
