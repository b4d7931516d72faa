// The three classes of bridging settings that a console modifies. There are no methods: what is
// given in a modification, and differs from what the instance has, is set one after the other.
//
// Each modification holds m_DataMutex through its calls into the library. One that fails part way
// leaves what was set before, and the instances are read back. INSTANCE_NOT_FOUND is answered for a
// setting that the adapter or a rule of the operation refuses, FAILED for a request that is none.
#ifndef VLN_SERVICES_BRIDGING_PROVIDER_H
#define VLN_SERVICES_BRIDGING_PROVIDER_H

#include "classes/VLNMPCA_DcbxLldpData.h"
#include "classes/VLNMPCA_PFCThrottle.h"
#include "classes/VLNMPCA_PGData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Priority_Group_Provider : Pattern_Provider<VLNMPCA_PGData> {
    // Of a configured instance. Afterwards all instances of bridging are built anew.
    sint32 modify_instance(const VLNMPCA_PGData* model, const VLNMPCA_PGData* instance);
};

struct Exchange_Provider : Pattern_Provider<VLNMPCA_DcbxLldpData> {
    // FAILED as well for what the adapter refuses.
    sint32 modify_instance(const VLNMPCA_DcbxLldpData* model, const VLNMPCA_DcbxLldpData* instance);
};

struct Flow_Control_Throttle_Provider : Pattern_Provider<VLNMPCA_PFCThrottle> {
    sint32 modify_instance(const VLNMPCA_PFCThrottle* model, const VLNMPCA_PFCThrottle* instance);
};

template <>
struct Provider_For<VLNMPCA_PGData> {
    using type = Priority_Group_Provider;
};

template <>
struct Provider_For<VLNMPCA_DcbxLldpData> {
    using type = Exchange_Provider;
};

template <>
struct Provider_For<VLNMPCA_PFCThrottle> {
    using type = Flow_Control_Throttle_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_BRIDGING_PROVIDER_H
