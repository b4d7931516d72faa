// The bridge between CMPI calls and one provider procedure.
//
// Every provider has one static block, whose tables the object manager keeps, and at most one
// adapter, alive from the first factory call to the last cleanup. The generated entry points call
// cimple_cmpi_adapter with their own block and registration: nothing is looked up by name.
#ifndef CIMPLE_CMPI_ADAPTER_H
#define CIMPLE_CMPI_ADAPTER_H

#include "cimple/registration.h"
#include "cimple/thread.h"
#include "cmpi/cmpi.h"

#include <atomic>
#include <vector>

namespace cimple {

struct CMPI_Adapter;

inline constexpr uint32 PROVIDER_STATIC_DATA_MAGIC = 0x5DE2B131;

// Zero-initialised; filled by the first factory call. The hdl of each pair points here.
struct Provider_Static_Data {
    uint32 magic;          // 0xDDDDDDDD after the last cleanup
    CMPI_Adapter* adapter; // null when the provider is not loaded
    CMPIInstanceMIFT instance_ft;
    CMPIMethodMIFT method_ft;
    CMPIIndicationMIFT indication_ft;
    CMPIAssociationMIFT association_ft;
    CMPIInstanceMI instance_mi;
    CMPIMethodMI method_mi;
    CMPIAssociationMI association_mi;
    CMPIIndicationMI indication_mi;
    char instance_name[256];
    char method_name[256];
    char indication_name[256];
    char association_name[256];
};

// A namespace with how many subscriptions watch it.
struct Indication_Filter {
    String name_space;
    uint32 count;
};

struct CMPI_Adapter {
    const Registration* registration = nullptr;
    Provider_Proc proc = nullptr;
    void* provider = nullptr;
    // Of the latest factory call: an object manager that has dropped the module without a cleanup
    // finds its adapters as they were, and their brokers are gone.
    std::atomic<const CMPIBroker*> broker{nullptr};
    Provider_Static_Data* static_data = nullptr;
    uint32 load_count = 1;                // factory calls less cleanups
    std::atomic<bool> allow_unload{true}; // written by cimom::allow_unload
    std::vector<Indication_Filter> filters;
    const Meta_Class* meta_class = nullptr;
    bool indications_enabled = false;
    Mutex lock{true}; // recursive; serialises the calls to this provider

    // Guarded, like load_count and the block's pointer, by the factory's mutex: the calls in
    // progress and the block itself keep the adapter alive; a second factory call waits for the
    // first load.
    uint32 users = 1;
    bool loading = true;
    Thread loader; // the thread that runs the load: it must not wait for itself
};

} // namespace cimple

// Stores the interface for the letter ('I', 'M', 'A', 'N'; any other: null) in out. Answers 0.
// Counts the adapter; creates it and loads the provider on the first call. No exception leaves it:
// then out is null. May be called by several threads at once.
extern "C" int cimple_cmpi_adapter(cimple::Provider_Static_Data* static_data,
                                   const cimple::Registration* registration,
                                   const CMPIBroker* broker, const CMPIContext* context,
                                   const char* provider_name, char letter, void** out);

#endif // CIMPLE_CMPI_ADAPTER_H
