#include "derivedObjects/pattern.h"
#include "tests/agent/agent_fixture.h"

#include "stored_classes.h"

#include <map>
#include <set>
#include <string>

namespace cimple {

namespace {

using Clearing_Test = Agent_Test;

void put_one_in_each_store(ProviderAgent& agent) {
    for (const Store_Row& row : store_table) {
        Instance_Map_Base& store = row.store(agent);
        store.clear();
        ASSERT_EQ(store.insert(create(store.meta_class())), 0) << row.name;
    }
}

bool is_san(Store_Group group) {
    return group == Store_Group::SAN_FCOE || group == Store_Group::SAN_ISCSI;
}

bool outlives_refreshes(Store_Group group) {
    return group == Store_Group::KEPT || group == Store_Group::REBUILT;
}

} // namespace

TEST_F(Clearing_Test, EveryStoreIsInOneGroup) {
    std::map<Store_Group, int> sizes;
    std::set<std::string> names;
    for (const Store_Row& row : store_table) {
        ++sizes[row.group];
        EXPECT_TRUE(names.insert(row.name).second) << row.name << " stands twice";
    }
    using enum Store_Group;
    const std::pair<Store_Group, int> expected[] = {
        {PLATFORM, 2},  {RECORD_LOG, 5}, {SOFTWARE_UPDATE_SERVICE, 2},
        {SAN_FCOE, 17}, {SAN_ISCSI, 20}, {KEPT, 7},
        {REBUILT, 26}};
    for (const auto& [group, size] : expected)
        EXPECT_EQ(sizes[group], size) << static_cast<int>(group);
}

TEST_F(Clearing_Test, EachPassClearsItsOwnStores) {
    Loaded_Agent agent;
    put_one_in_each_store(*agent);
    agent->clearAdapterMaps();
    for (const Store_Row& row : store_table)
        EXPECT_EQ(row.store(*agent).size(), is_san(row.group) || outlives_refreshes(row.group))
            << row.name;

    put_one_in_each_store(*agent);
    agent->clearSANMaps();
    for (const Store_Row& row : store_table)
        EXPECT_EQ(row.store(*agent).size(), !is_san(row.group)) << row.name;

    put_one_in_each_store(*agent);
    agent->ClearMaps();
    for (const Store_Row& row : store_table)
        EXPECT_EQ(row.store(*agent).size(), outlives_refreshes(row.group)) << row.name;
}

// The catalogue's classes against the rows: each has its own, of its own class.
TEST_F(Clearing_Test, EveryProviderClassHasItsRow) {
    const Meta_Class* const classes[] = {
#define VLN_PROVIDER_CLASS(class_name) &class_name::static_meta_class,
#define VLN_PROVIDER_ASSOCIATION(class_name) &class_name::static_meta_class,
#include "provider_classes.inc"
    };
    Loaded_Agent agent;
    std::map<const Meta_Class*, const Pattern_Row*> rows;
    for (const Pattern_Row& row : pattern_table)
        EXPECT_TRUE(rows.emplace(row.meta_class, &row).second) << row.meta_class->name;
    EXPECT_EQ(rows.size(), std::size(classes));

    int without_store = 0, with_three = 0;
    std::map<Pattern_Shape, int> shapes;
    for (const Meta_Class* meta_class : classes) {
        ASSERT_TRUE(rows.contains(meta_class)) << meta_class->name;
        const Pattern_Row& row = *rows[meta_class];
        ++shapes[row.shape];
        without_store += row.stores[0] == NO_STORE;
        with_three += row.stores[2] != NO_STORE;
        for (Store_Id id : row.stores) {
            if (id != NO_STORE) {
                EXPECT_EQ(agent->store(id).meta_class(), meta_class) << store_table[id].name;
            }
        }
        EXPECT_EQ(row.shape == Pattern_Shape::ACTIVE, row.update_mutex != nullptr);
    }
    EXPECT_EQ(without_store, 6);
    EXPECT_EQ(with_three, 3);
    EXPECT_EQ(shapes[Pattern_Shape::SAN_GROUP], 37);
    EXPECT_EQ(shapes[Pattern_Shape::ACTIVE], 6);
}

} // namespace cimple
