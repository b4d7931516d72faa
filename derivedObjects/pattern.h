// What the class providers of the pattern do, once for all of them.
//
// A class provider has no state: it is a row of a constant table, which tells the class, the shape
// of its enumeration and its stores. The templates in pattern_provider.h only pick the row.
#ifndef VLN_DERIVED_OBJECTS_PATTERN_H
#define VLN_DERIVED_OBJECTS_PATTERN_H

#include "agent/stores.h"
#include "cimple/thread.h"

#include <array>

namespace cimple {

class ProviderAgent;

enum class Pattern_Shape : uint8 {
    ADAPTER_GROUP, // behind the gate of the adapter maps
    SAN_GROUP,     // behind the gate of the SAN maps, and asks for a SAN pass when they are stale
    ACTIVE,        // behind both adapter gates, and refreshes some properties at each call
};

// Changes the instances of an active class. Runs with both adapter gates, m_DataMutex and
// the class's own recursive mutex held, and may call the management library.
using Update_Routine = void (*)(ProviderAgent& agent);

inline constexpr std::size_t MAX_PATTERN_STORES = 3;

struct Pattern_Row {
    const Meta_Class* meta_class;
    Pattern_Shape shape;
    std::array<Store_Id, MAX_PATTERN_STORES>
        stores;               // up to the first NO_STORE, in order of delivery
    Update_Routine update;    // active classes; null: nothing to refresh
    Mutex& (*update_mutex)(); // active classes
};

// A class's place in the table.
enum Pattern_Id : uint16 {
#define VLN_STORE(group, class_name) PATTERN_##class_name,
#define VLN_NO_STORE(class_name) PATTERN_##class_name,
#include "agent/stores.inc"
    NUM_PATTERNS
};

extern const Pattern_Row pattern_table[NUM_PATTERNS];

template <class C>
inline constexpr Pattern_Id pattern_id = NUM_PATTERNS;

#define VLN_STORE(group, class_name)                                                               \
    template <>                                                                                    \
    inline constexpr Pattern_Id pattern_id<class_name> = PATTERN_##class_name;
#define VLN_NO_STORE(class_name) VLN_STORE(none, class_name)
#include "agent/stores.inc"

// ---- The operations. None of them throws; a cancellation of the thread passes through. ----

// Builds the agent if there is none, and takes a reference. LOAD_FAILED, and no reference, when the
// libraries are not usable or memory is short.
sint32 pattern_load(const Pattern_Row& row);

// Gives back what a load of the class took; the last of all destroys the agent. The row is one of
// the table.
sint32 pattern_unload(const Pattern_Row& row);

// Hands each stored instance to the handler, shared with the store, on the caller's thread with no
// lock held; of those only that the handler looks at, if it tells and the store can find them.
// Answers 0 always: an exception makes the enumeration short, and two stored instances with equal
// keys make it empty.
sint32 pattern_enum_instances(const Pattern_Row& row, const Enum_Instances_Handler& handler);

} // namespace cimple

#endif // VLN_DERIVED_OBJECTS_PATTERN_H
