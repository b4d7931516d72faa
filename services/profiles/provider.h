// The references from the provider's profiles to the platform's "Base Server" profile.
#ifndef VLN_SERVICES_PROFILES_PROVIDER_H
#define VLN_SERVICES_PROFILES_PROVIDER_H

#include "classes/VLNMPCA_BaseServerReferencedProfile.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Base_Server_Profile_Provider : Pattern_Provider<VLNMPCA_BaseServerReferencedProfile> {
    // Asks the object manager for the platform's profile at each call. Delivers nothing, and
    // answers 0, when the platform has none.
    sint32 get_instance(const VLNMPCA_BaseServerReferencedProfile* model,
                        VLNMPCA_BaseServerReferencedProfile*& instance);
    sint32 enum_instances(const VLNMPCA_BaseServerReferencedProfile* model,
                          const Enum_Instances_Handler& handler);
};

template <>
struct Provider_For<VLNMPCA_BaseServerReferencedProfile> {
    using type = Base_Server_Profile_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_PROFILES_PROVIDER_H
