// What the memory of a pluggable transceiver says, as SFF-8472 lays it out: who made it, and what
// it measures of itself.
//
// A pure parser: any bytes give some reading, and nothing throws but for want of memory. The check
// sums are not tested, since modules with wrong ones are in use and work.
#ifndef DEVICE_SFF8472_H
#define DEVICE_SFF8472_H

#include "cimple/types.h"
#include "device/library/axapi.h"

#include <optional>
#include <string>

namespace cimple {

struct SFF_Transceiver {
    // In the order of the diagnostics page.
    enum Quantity : uint8 {
        TEMPERATURE, // degrees Celsius
        VOLTAGE,     // volts
        BIAS,        // milliamperes
        TX_POWER,    // milliwatts
        RX_POWER,
        QUANTITIES
    };
    enum Level : uint8 { HIGH_ALARM, LOW_ALARM, HIGH_WARNING, LOW_WARNING, MEASURED, LEVELS };

    uint8 identifier = 0; // SFF-8024; 3 is SFP and its successors
    uint8 extIdentifier = 0;
    uint8 connector = 0;              // SFF-8024
    std::optional<uint16> waveLength; // nanometres; none for a cable
    std::string vendor;
    std::string oui; // "xx-xx-xx" in upper case
    std::string partNumber;
    std::string revision;
    std::string serialNumber;
    std::string dateCode; // "yymmdd", and up to two characters of the vendor's own

    bool hasDiagnostics = false;
    uint8 status = 0; // byte 110: faults and signal losses
    // None for a module without diagnostics, or when its calibration leads to no number.
    std::optional<real32> value[QUANTITIES][LEVELS];
};

// False for memory without an identity: nothing is plugged in.
bool parse_sff8472(const AX_SffData& data, SFF_Transceiver& transceiver);

} // namespace cimple

#endif // DEVICE_SFF8472_H
