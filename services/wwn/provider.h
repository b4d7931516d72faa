// The service that reads and changes World Wide Names: its methods.
#ifndef VLN_SERVICES_WWN_PROVIDER_H
#define VLN_SERVICES_WWN_PROVIDER_H

#include "classes/VLNMPCA_FCWWNService.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

// Besides what Method_Result has, ChangeWWN answers 91 for a name that a virtual port has already
// and 32969 for one that is missing. Arguments that are handed out keep what came in where a method
// has nothing to tell.
//
// ChangeWWN holds m_DataMutex for as long as the library is at it, five minutes at most; RestoreWWN
// gives it up before. An unload of the class cuts these waits short, and waits for the call.
struct WWN_Service_Provider : Pattern_Provider<VLNMPCA_FCWWNService> {
    using Service = VLNMPCA_FCWWNService;
    using Target_Port = VLNMPCA_FCPort* const*;
    using Result = Property<uint32>;

    sint32 unload();

    sint32 GetWWNCapability(const Service* self, Target_Port target, Property<uint32>* capability,
                            Result* result);
    sint32 ReadWWN(const Service* self, Target_Port target, Property<uint16>* type,
                   Property<String>* wwpn, Property<String>* wwnn, Property<uint16>* activation,
                   Result* result);
    sint32 ChangeWWN(const Service* self, Target_Port target, Property<String>* wwpn,
                     Property<String>* wwnn, Property<uint16>* type, Property<uint16>* activation,
                     Result* result);
    // 0 also when the library refuses; then there is no activation.
    sint32 RestoreWWN(const Service* self, Target_Port target, Property<uint16>* type,
                      Property<uint16>* activation, Result* result);
};

template <>
struct Provider_For<VLNMPCA_FCWWNService> {
    using type = WWN_Service_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_WWN_PROVIDER_H
