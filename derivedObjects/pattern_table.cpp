// The row of each of the provider's classes. A class has the shape of its store's group, and six
// classes are active.

#include "agent/lock_order.h"
#include "agent/status/dynamic_status.h"
#include "derivedObjects/pattern.h"
#include "stored_classes.h"

namespace cimple {

namespace {

template <Pattern_Id Id>
Mutex& update_mutex() {
    static constinit Process_Wide<Mutex> mutex(true, RANK_UPDATE, "update");
    return *mutex;
}

struct Active_Row {
    Pattern_Id id;
    Update_Routine update;
    Mutex& (*mutex)();
};

// The classes that refresh some of their properties at the moment of the call.
constexpr Active_Row ACTIVE_ROWS[] = {
    {PATTERN_VLNMPCA_PortController, UpdatePhyLinkDownReason,
     update_mutex<PATTERN_VLNMPCA_PortController>},
    {PATTERN_VLNMPCA_EthernetPort, UpdateEthernetPortStatus,
     update_mutex<PATTERN_VLNMPCA_EthernetPort>},
    {PATTERN_VLNMPCA_Card, UpdateBoardTemp, update_mutex<PATTERN_VLNMPCA_Card>},
    {PATTERN_VLNMPCA_FCPortStatistics, GetFCoEPortStats,
     update_mutex<PATTERN_VLNMPCA_FCPortStatistics>},
    {PATTERN_VLNMPCA_DriverParameterSettingData, UpdateDriverParameters,
     update_mutex<PATTERN_VLNMPCA_DriverParameterSettingData>},
    {PATTERN_VLNMPCA_FCPort, UpdateFCoEPortStatus, update_mutex<PATTERN_VLNMPCA_FCPort>},
};

struct Extra_Store {
    Pattern_Id id;
    Store_Id store;
};

constexpr Extra_Store EXTRA_STORES[] = {
#define VLN_EXTRA_STORE(group, class_name, name) {PATTERN_##class_name, STORE_##name},
#include "agent/stores.inc"
};

constexpr Pattern_Shape shape_of(Store_Group group) {
    return group == Store_Group::SAN_FCOE || group == Store_Group::SAN_ISCSI
               ? Pattern_Shape::SAN_GROUP
               : Pattern_Shape::ADAPTER_GROUP;
}

consteval Pattern_Row row(Pattern_Id id, const Meta_Class* meta_class, Pattern_Shape shape,
                          Store_Id first) {
    Pattern_Row result{meta_class, shape, {first, NO_STORE, NO_STORE}, nullptr, nullptr};
    std::size_t count = 1;
    for (const Extra_Store& extra : EXTRA_STORES)
        if (extra.id == id)
            result.stores[count++] = extra.store;
    for (const Active_Row& active : ACTIVE_ROWS) {
        if (active.id == id) {
            result.shape = Pattern_Shape::ACTIVE;
            result.update = active.update;
            result.update_mutex = active.mutex;
        }
    }
    return result;
}

} // namespace

constinit const Pattern_Row pattern_table[NUM_PATTERNS] = {
#define VLN_STORE(group, class_name)                                                               \
    row(PATTERN_##class_name, &class_name::static_meta_class, shape_of(Store_Group::group),        \
        STORE_##class_name),
#define VLN_NO_STORE(class_name)                                                                   \
    row(PATTERN_##class_name, &class_name::static_meta_class, Pattern_Shape::ADAPTER_GROUP,        \
        NO_STORE),
#include "agent/stores.inc"
};

} // namespace cimple
