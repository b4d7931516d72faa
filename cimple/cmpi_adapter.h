// The bridge between CMPI calls and one provider procedure.
//
// Every provider has one static block, whose tables the object manager keeps, and at most one adapter,
// alive from the first factory call to the last cleanup. The generated entry points call
// cimple_cmpi_adapter with their own block and registration: nothing is looked up by name.
#ifndef CIMPLE_CMPI_ADAPTER_H
#define CIMPLE_CMPI_ADAPTER_H

#include "cimple/registration.h"
#include "cimple/thread.h"
#include "cmpi/cmpi.h"

namespace cimple {

struct CMPI_Adapter;

inline constexpr uint32 PROVIDER_STATIC_DATA_MAGIC = 0x5DE2B131;

// Zero-initialised; filled by the first factory call. The hdl of each pair points here.
struct Provider_Static_Data {
    uint32 magic;
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

struct Indication_Filter {
    String name_space;
    uint32 count;
};

struct CMPI_Adapter {
    const Registration* registration;
    Provider_Proc proc;
    void* provider;
    const CMPIBroker* broker; // from the first factory call
    Provider_Static_Data* static_data;
    uint32 load_count; // starts at 1
    bool allow_unload; // starts true
    struct Filters;    // indication filters by namespace
    Filters* filters;
    const Meta_Class* meta_class;
    bool indications_enabled;
    Mutex lock; // recursive; serialises the calls to this provider
};

} // namespace cimple

// Stores the interface for the letter ('I', 'M', 'A', 'N'; any other: null) in out. Answers 0. Counts
// the adapter; creates it and loads the provider on the first call. No exception leaves it.
extern "C" int cimple_cmpi_adapter(cimple::Provider_Static_Data* static_data,
                                   const cimple::Registration* registration,
                                   const CMPIBroker* broker, const CMPIContext* context,
                                   const char* provider_name, char letter, void** out);

#endif // CIMPLE_CMPI_ADAPTER_H
