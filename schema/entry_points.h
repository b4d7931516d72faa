// The factories that object managers look up by name (CMPI 1.00: <name>_Create_<kind>MI).
//
// Every provider has its own static block and its own registration record, and its factories are
// bound to both at compile time. A factory exists under two names, the provider's and the class's:
// some object managers have the one registered, some the other.
#ifndef SCHEMA_ENTRY_POINTS_H
#define SCHEMA_ENTRY_POINTS_H

#include "cimple/cmpi_adapter.h"

namespace cimple {

// Null if the adapter cannot be made. The broker keeps the answer until its cleanup call.
template <class MI>
MI* make_interface(Provider_Static_Data& data, const Registration& registration,
                   const CMPIBroker* broker, const CMPIContext* context, char letter) noexcept {
    void* interface = nullptr;
    cimple_cmpi_adapter(&data, &registration, broker, context, registration.provider_name, letter,
                        &interface);
    return static_cast<MI*>(interface);
}

} // namespace cimple

#define VLN_FACTORY(NAME, CLASS, NUMBER, KIND, LETTER)                                             \
    extern "C" __attribute__((visibility("default"))) CMPI##KIND##MI* NAME##_Create_##KIND##MI(    \
        const CMPIBroker* broker, const CMPIContext* context, CMPIStatus*) {                       \
        return cimple::make_interface<CMPI##KIND##MI>(CLASS##_data, cimple::registrations[NUMBER], \
                                                      broker, context, LETTER);                    \
    }

#define VLN_FACTORY_PAIR(CLASS, NUMBER, KIND, LETTER)                                              \
    VLN_FACTORY(CLASS##_Provider, CLASS, NUMBER, KIND, LETTER)                                     \
    VLN_FACTORY(CLASS, CLASS, NUMBER, KIND, LETTER)

#define VLN_CLASS_FACTORIES(CLASS, NUMBER)                                                         \
    static cimple::Provider_Static_Data CLASS##_data;                                              \
    VLN_FACTORY_PAIR(CLASS, NUMBER, Instance, 'I')                                                 \
    VLN_FACTORY_PAIR(CLASS, NUMBER, Method, 'M')

#define VLN_ASSOCIATION_FACTORIES(CLASS, NUMBER)                                                   \
    VLN_CLASS_FACTORIES(CLASS, NUMBER)                                                             \
    VLN_FACTORY_PAIR(CLASS, NUMBER, Association, 'A')

#endif // SCHEMA_ENTRY_POINTS_H
