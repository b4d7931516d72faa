// MAC addresses as the console wants them.
#ifndef VLN_AGENT_ETHERNET_MAC_TEXT_H
#define VLN_AGENT_ETHERNET_MAC_TEXT_H

#include "cimple/string.h"

#include <string>

namespace cimple {

inline constexpr uint32 MAC_DIGITS = 12;

// The address without its separators ("-", ":" or blanks). An address that does not come to 12
// bytes is the library's fault: builds that check locks, the ones for development, end there; the
// others log the text and answer false, and the port is left out. So it is in all builds if the
// bytes are no text.
bool removeSeptr(const std::string& address, String& portPermMACAddr);

} // namespace cimple

#endif // VLN_AGENT_ETHERNET_MAC_TEXT_H
