// The two classes of a physical port that a console modifies: the settings of its PHY, and the port
// controller, whose speed can be set.
#ifndef VLN_SERVICES_PHY_PROVIDER_H
#define VLN_SERVICES_PHY_PROVIDER_H

#include "classes/VLNMPCA_PHYPhysicalComponentData.h"
#include "classes/VLNMPCA_PortController.h"
#include "derivedObjects/provider_for.h"

namespace cimple {

struct Phy_Data_Provider : Pattern_Provider<VLNMPCA_PHYPhysicalComponentData> {
    // Sets CableNVP, then what line rates are advertised. That of any of the three being named
    // switches the adapter's feature on; their values are kept for readers alone.
    sint32 modify_instance(const VLNMPCA_PHYPhysicalComponentData* model,
                           const VLNMPCA_PHYPhysicalComponentData* instance);
};

struct Port_Controller_Provider : Pattern_Provider<VLNMPCA_PortController> {
    // Sets PortSpeedMode with ConfiguredPortSpeed and DACCableLength. What the library answers to a
    // failed attempt stands in MICallRMStatus afterwards.
    sint32 modify_instance(const VLNMPCA_PortController* model,
                           const VLNMPCA_PortController* instance);
};

template <>
struct Provider_For<VLNMPCA_PHYPhysicalComponentData> {
    using type = Phy_Data_Provider;
};

template <>
struct Provider_For<VLNMPCA_PortController> {
    using type = Port_Controller_Provider;
};

} // namespace cimple

#endif // VLN_SERVICES_PHY_PROVIDER_H
