#include "agent/stores.h"

#include "stored_classes.h"

namespace cimple {

Instance_Stores::Instance_Stores() = default;
Instance_Stores::~Instance_Stores() = default;

#define VLN_ROW(group, class_name, name)                                                           \
    {"m_" #name "_map", Store_Group::group,                                                        \
     [](Instance_Stores& stores) -> Instance_Map_Base& { return stores.m_##name##_map; }},

constinit const Store_Row store_table[NUM_STORES] = {
#define VLN_PLATFORM_STORE(group, class_name) VLN_ROW(group, class_name, class_name)
#define VLN_STORE(group, class_name) VLN_ROW(group, class_name, class_name)
#define VLN_EXTRA_STORE(group, class_name, name) VLN_ROW(group, class_name, name)
#include "agent/stores.inc"
};

#undef VLN_ROW

Instance_Map_Base& Instance_Stores::store(Store_Id id) noexcept {
    return store_table[id].store(*this);
}

void clear_group(Instance_Stores& stores, Store_Group group) noexcept {
    for (const Store_Row& row : store_table)
        if (row.group == group)
            row.store(stores).clear();
}

} // namespace cimple
