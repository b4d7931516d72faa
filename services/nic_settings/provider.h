// The settings of a NIC's port that a console modifies. Both answer
// MODIFY_INSTANCE_INVALID_PARAMETER for what cannot be meant, and MODIFY_INSTANCE_FAILED for an
// unknown instance and for what the adapter refuses.
#ifndef VLN_SERVICES_NIC_SETTINGS_PROVIDER_H
#define VLN_SERVICES_NIC_SETTINGS_PROVIDER_H

#include "classes/VLNMPCA_NICNetworkBootData.h"
#include "classes/VLNMPCA_NICQOSData.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Network_Boot_Provider : Pattern_Provider<VLNMPCA_NICNetworkBootData> {
    // Switches network boot off, or on with BootMethod; without one, with what the adapter takes.
    sint32 modify_instance(const VLNMPCA_NICNetworkBootData* model,
                           const VLNMPCA_NICNetworkBootData* instance);
};

struct NIC_QoS_Provider : Pattern_Provider<VLNMPCA_NICQOSData> {
    // Sets Value and reads it back.
    sint32 modify_instance(const VLNMPCA_NICQOSData* model, const VLNMPCA_NICQOSData* instance);
};

template <>
struct Provider_For<VLNMPCA_NICNetworkBootData> {
    using type = Network_Boot_Provider;
};

template <>
struct Provider_For<VLNMPCA_NICQOSData> {
    using type = NIC_QoS_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_NIC_SETTINGS_PROVIDER_H
