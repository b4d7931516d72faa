// Addresses in the records of the library.
#ifndef VLNSIM_IP_ADDRESS_H
#define VLNSIM_IP_ADDRESS_H

#include "device/library/axapi.h"

namespace vlnsim {

inline bool is_ipv6(const AX_IPAddress& address) {
    return address.flags & AX_IP_FLAG_V6;
}

// The first four bytes, which are all of an IPv4 address, as a number.
inline uint32_t ipv4_number(const AX_IPAddress& address) {
    uint32_t number = 0;
    for (int i = 0; i < 4; ++i)
        number = number << 8 | address.address[i];
    return number;
}

inline void put_ipv4(uint32_t number, AX_IPAddress& address) {
    for (int i = 4; i-- > 0; number >>= 8)
        address.address[i] = static_cast<uint8_t>(number);
}

} // namespace vlnsim

#endif // VLNSIM_IP_ADDRESS_H
