// The class provider of the pattern, one type for each class, without data and without logic.
#ifndef VLN_DERIVED_OBJECTS_PATTERN_PROVIDER_H
#define VLN_DERIVED_OBJECTS_PATTERN_PROVIDER_H

#include "agent/name_spaces.h"
#include "derivedObjects/pattern.h"
#include "method_stubs.h"

namespace cimple {

// Everything but loading and enumerating is unsupported: the engine serves a get, and all
// association queries, from the enumeration. A hand-written provider derives from this and hides
// what it does itself.
template <class C>
struct Pattern_Provider : Method_Stubs<C> {
    static const Pattern_Row& row() { return pattern_table[pattern_id<C>]; }

    sint32 load() { return pattern_load(row()); }
    sint32 unload() { return pattern_unload(row()); }
    sint32 get_instance(const C*, C*&) { return GET_INSTANCE_UNSUPPORTED; }
    sint32 enum_instances(const C*, const Enum_Instances_Handler& handler) {
        return pattern_enum_instances(row(), handler);
    }
    sint32 create_instance(C*) { return CREATE_INSTANCE_UNSUPPORTED; }
    sint32 delete_instance(const C*) { return DELETE_INSTANCE_UNSUPPORTED; }
    sint32 modify_instance(const C*, const C*) { return MODIFY_INSTANCE_UNSUPPORTED; }

    // Asked of association classes only.
    sint32 enum_associator_names(const Instance*, const char*, const char*, const char*,
                                 const Enum_Associator_Names_Handler&) {
        return ENUM_ASSOCIATOR_NAMES_UNSUPPORTED;
    }
    sint32 enum_references(const Instance*, const C*, const char*, const Enum_References_Handler&) {
        return ENUM_REFERENCES_UNSUPPORTED;
    }
    sint32 enum_associators(const Instance*, const char*, const char*, const char*,
                            const Enum_Associators_Handler&) {
        return ENUM_ASSOCIATORS_UNSUPPORTED;
    }
};

} // namespace cimple

#endif // VLN_DERIVED_OBJECTS_PATTERN_PROVIDER_H
