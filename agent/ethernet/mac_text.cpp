#include "agent/ethernet/mac_text.h"

#include "cimple/assert.h"
#include "foundation/log.h"
#include "foundation/utf8.h"

#include <cstring>

namespace cimple {

bool removeSeptr(const std::string& address, String& portPermMACAddr) {
    portPermMACAddr.clear();
    for (char c : address)
        if (!std::strchr("-: ", c))
            portPermMACAddr.append(c);
#ifdef CIMPLE_CHECK_LOCKS
    CIMPLE_ASSERT(12 == strlen(portPermMACAddr.c_str()));
#endif
    if (portPermMACAddr.size() == MAC_DIGITS &&
        is_utf8({portPermMACAddr.c_str(), portPermMACAddr.size()}))
        return true;
    VLN_LOG(VLN_ERR, "Skipping port: [%s] is not a MAC address", address.c_str());
    return false;
}

} // namespace cimple
