// The instance stores of the agent: one for each class that is answered from memory.
//
// A store counts its instances, an association shares its ends with other stores, so nothing points
// from one store into another and they may be cleared in any order. m_DataMutex guards all of them.
// The classes are only declared here: who reads properties includes the class's own header.
#ifndef VLN_AGENT_STORES_H
#define VLN_AGENT_STORES_H

#include "cimple/instance_map.h"

namespace cimple {

#define VLN_PLATFORM_STORE(group, class_name) struct class_name;
#define VLN_STORE(group, class_name) struct class_name;
#define VLN_NO_STORE(class_name) struct class_name;
#include "agent/stores.inc"

// Decides what clears a store.
enum class Store_Group : uint8 {
    PLATFORM,
    RECORD_LOG,
    NIC,
    SOFTWARE_UPDATE_SERVICE,
    SOFTWARE_UPDATE,
    DIAGNOSTICS,
    FCOE,
    ISCSI,
    SAN_FCOE,
    SAN_ISCSI,
    KEPT,    // by its owner alone, in its own step of the pass
    REBUILT, // by the routine that fills it
};

// A store's place in the table below.
enum Store_Id : sint16 {
    NO_STORE = -1,
#define VLN_PLATFORM_STORE(group, class_name) STORE_##class_name,
#define VLN_STORE(group, class_name) STORE_##class_name,
#define VLN_EXTRA_STORE(group, class_name, name) STORE_##name,
#include "agent/stores.inc"
    NUM_STORES
};

struct Instance_Stores {
    Instance_Stores();
    ~Instance_Stores();
    Instance_Stores(const Instance_Stores&) = delete;
    Instance_Stores& operator=(const Instance_Stores&) = delete;

    Instance_Map_Base& store(Store_Id id) noexcept;

#define VLN_PLATFORM_STORE(group, class_name) Instance_Map<class_name> m_##class_name##_map;
#define VLN_STORE(group, class_name) Instance_Map<class_name> m_##class_name##_map;
#define VLN_EXTRA_STORE(group, class_name, name) Instance_Map<class_name> m_##name##_map;
#include "agent/stores.inc"
};

struct Store_Row {
    const char* name; // of the member
    Store_Group group;
    Instance_Map_Base& (*store)(Instance_Stores& stores);
};

// Row n describes the store with the number n.
extern const Store_Row store_table[NUM_STORES];

// Destroys every instance of the group's stores.
void clear_group(Instance_Stores& stores, Store_Group group) noexcept;

} // namespace cimple

#endif // VLN_AGENT_STORES_H
