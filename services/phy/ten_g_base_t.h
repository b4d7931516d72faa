// Reading the PHY of a 10GBASE-T port.
#ifndef VLN_SERVICES_PHY_TEN_G_BASE_T_H
#define VLN_SERVICES_PHY_TEN_G_BASE_T_H

#include "classes/VLNMPCA_PHYPhysicalComponent.h"
#include "operations/method_wrapper.h"

namespace cimple {

// The statuses with which these operations fail beside 0.
enum Phy_Status : uint32 {
    PHY_OK = 0,
    PHY_UNKNOWN = 32768, // no port of that name
    PHY_CALL_FAILED = 32769,
    PHY_NO_MEMORY = 32774,
    PHY_INVALID_ARGUMENT = 32969,
};

// All but the port's own attributes that its settings need.
struct Phy_Settings {
    uint32 line_rates = 0; // AX_LINE_RATE_
    uint32 cable_nvp = 0;
};

struct VLNMPCA_TenGBaseT {
    // The velocity of propagation in the cable, in percent of light's; 0 if the PHY does not tell.
    static uint32 GetCableNVP(const char* device_id, uint32& value);

    // Sets what the PHY tells of itself and of its cable; what it does not tell is 0 or empty.
    static uint32 GetPHYPortAttributeValues(const HBA_WWN* name, VLNMPCA_PHYPhysicalComponent* phy,
                                            Phy_Settings* settings);
    // The same of its counters.
    static uint32 GetPHYPortStatistics(const HBA_WWN* name, VLNMPCA_PHYPhysicalComponent* phy);
};

// A signal-to-noise ratio as the library codes it, in tenths of a decibel: "4.2 dB".
String signal_to_noise_text(sint32 code);

} // namespace cimple

#endif // VLN_SERVICES_PHY_TEN_G_BASE_T_H
