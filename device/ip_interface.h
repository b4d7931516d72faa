// What the host's IP stack knows of a network interface, by the interface's name.
//
// An object is used by one thread at a time. Nothing throws but for want of memory.
#ifndef DEVICE_IP_INTERFACE_H
#define DEVICE_IP_INTERFACE_H

#include "cimple/types.h"

#include <string>

namespace cimple {

// The kernel's calls of these queries, netdevice(7).
struct IP_Calls {
    int (*socket)(int domain, int type, int protocol);
    int (*ioctl)(int descriptor, unsigned long request, void* argument);
    int (*close)(int descriptor);
};

// What is asked unless a test puts its own in the place. Of a source of its own: the module for
// simulation is linked with another one.
extern const IP_Calls kernel_ip_calls;

class VLN_IPInterfaceConfig {
public:
    VLN_IPInterfaceConfig(); // a socket that cannot be had makes every query fail
    ~VLN_IPInterfaceConfig();
    VLN_IPInterfaceConfig(const VLN_IPInterfaceConfig&) = delete;
    VLN_IPInterfaceConfig& operator=(const VLN_IPInterfaceConfig&) = delete;

    // A name is cut to the 16 characters of the kernel's record: a longer one fails or means
    // another interface, and is not tested for.

    bool GetInterfaceState(const std::string& interfaceName);  // true when it is up
    sint32 GetIPAddressType(const std::string& interfaceName); // address family; -1 on failure
    std::string GetIPv4SubnetMask(const std::string& interfaceName); // empty on failure
    std::string GetIPv4Address(const std::string& interfaceName);    // empty on failure

    // For tests: null puts the kernel's back. Not while an object lives.
    static void setCalls(const IP_Calls* calls);

private:
    int m_socket;
};

} // namespace cimple

#endif // DEVICE_IP_INTERFACE_H
