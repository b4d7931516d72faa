// The FIP settings that a console modifies.
#ifndef VLN_SERVICES_FIP_PROVIDER_H
#define VLN_SERVICES_FIP_PROVIDER_H

#include "classes/VLNMPCA_FIPData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct FIP_Data_Provider : Pattern_Provider<VLNMPCA_FIPData> {
    // Sets what is given of the five values; the port takes them up with its next reset. What was
    // written before a failure stays. In any case the instance then shows what the adapter has.
    sint32 modify_instance(const VLNMPCA_FIPData* model, const VLNMPCA_FIPData* instance);
};

template <>
struct Provider_For<VLNMPCA_FIPData> {
    using type = FIP_Data_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_FIP_PROVIDER_H
