// What the masks of a Fibre Channel port mean in CIM, as tables.
#ifndef VLN_AGENT_FCOE_FC_PORT_TABLES_H
#define VLN_AGENT_FCOE_FC_PORT_TABLES_H

#include "cimple/instance.h"
#include "device/port_attributes.h"

namespace cimple {

struct Service_Class {
    uint32 bit;   // of the library's mask
    uint16 value; // CIM_FCPort.SupportedCOS
};

inline constexpr Service_Class serviceClasses[] = {
    {1, 7}, // class F
    {2, 1}, {4, 2}, {8, 3}, {16, 4}, {64, 5},
};

// FC-4 types, numbered by FC-GS, that CIM_FCPort.SupportedFC4Types has under the same number.
inline constexpr uint8 fc4Types[] = {
    4,                      // ISO/IEC 8802-2 LLC
    5,                      // IP over FC
    8,  9,                  // SCSI: FCP, GPP
    17, 18, 19, 21, 22, 23, // IPI-3 and CP IPI-3: master, slave, peer
    25, 26, 27, 28,         // SBCCS and FC-SB-2: channel, control unit
    32, 34, 36,             // Fibre Channel services, FC-SW, SNMP
    64,                     // HIPPI-FP
    80, 81, 82,             // BBL
    88, 96,                 // FC-VI, FC-AV
};

inline constexpr uint8 FC4_FIRST_VENDOR_TYPE = 224; // from here on each vendor has its own
inline constexpr uint16 FC4_VENDOR_UNIQUE = 255;
inline constexpr uint16 FC4_OTHER = 1;
inline constexpr uint16 FC_UNKNOWN = 0; // of both properties

// Append the values of the bits set, each once; the unknown value if
// there is none.
void append_service_classes(Property<Array<uint16>>& property, uint32 mask);
void append_fc4_types(Property<Array<uint16>>& property, const Fc4_Types& mask);

} // namespace cimple

#endif // VLN_AGENT_FCOE_FC_PORT_TABLES_H
