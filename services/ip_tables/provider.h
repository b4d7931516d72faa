// The entries of ARP and route tables, which a console adds and deletes.
//
// A change goes to the adapter first and then to the stores, where it stands until the adapters
// are read anew. m_DataMutex is held through the call into the library.
#ifndef VLN_SERVICES_IP_TABLES_PROVIDER_H
#define VLN_SERVICES_IP_TABLES_PROVIDER_H

#include "classes/VLNMPCA_ARPEntry.h"
#include "classes/VLNMPCA_RouteEntry.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

template <class Entry>
struct Table_Entry_Provider : Pattern_Provider<Entry> {
    // CREATE_INSTANCE_INVALID_PARAMETER for a property that is no address or no port's; else
    // CREATE_INSTANCE_FAILED, also for an entry that is there. On success the instance has its
    // keys as they will be enumerated.
    sint32 create_instance(Entry* instance);
    // DELETE_INSTANCE_NOT_FOUND, or DELETE_INSTANCE_FAILED.
    sint32 delete_instance(const Entry* instance);
};

extern template struct Table_Entry_Provider<VLNMPCA_ARPEntry>;
extern template struct Table_Entry_Provider<VLNMPCA_RouteEntry>;

template <>
struct Provider_For<VLNMPCA_ARPEntry> {
    using type = Table_Entry_Provider<VLNMPCA_ARPEntry>;
};

template <>
struct Provider_For<VLNMPCA_RouteEntry> {
    using type = Table_Entry_Provider<VLNMPCA_RouteEntry>;
};

} // namespace cimple

#endif // VLN_SERVICES_IP_TABLES_PROVIDER_H
