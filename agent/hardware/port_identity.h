// Who a port is besides its key: OtherIdentifyingInfo holds a text in the place where
// IdentifyingDescriptions tells what the text is.
#ifndef VLN_AGENT_HARDWARE_PORT_IDENTITY_H
#define VLN_AGENT_HARDWARE_PORT_IDENTITY_H

#include "cimple/instance.h"

namespace cimple {

inline constexpr char IDENTITY_ASIC[] = "SerialNumber + Sub-AdapterID";
inline constexpr char IDENTITY_PHYSICAL_PORT[] = "SerialNumber:PhysicalPortNumber";
inline constexpr char IDENTITY_SERIAL[] = "SerialNumber";
inline constexpr char IDENTITY_VPD_SERIAL[] = "VPD:SERIAL_NUMBER"; // the same, of an FC port
inline constexpr char IDENTITY_PORT_NUMBER[] = "PhysicalPortNumber";

template <class Port>
void append_port_identity(Port& port, const char* description, const String& identity) {
    port.OtherIdentifyingInfo.append(identity);
    port.IdentifyingDescriptions.append(String(description));
}

// The text with that description, or null.
template <class Port>
const String* port_identity(const Port& port, const char* description) {
    const Array<String>& descriptions = port.IdentifyingDescriptions.value;
    const Array<String>& identities = port.OtherIdentifyingInfo.value;
    for (uint32 i = 0; i < descriptions.size() && i < identities.size(); ++i)
        if (descriptions[i] == description)
            return &identities[i];
    return nullptr;
}

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_PORT_IDENTITY_H
