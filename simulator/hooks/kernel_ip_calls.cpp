// The module for simulation sees the network interfaces of the simulated host, never the machine's.
#include "device/ip_interface.h"
#include "simulator/vlnsim.h"

#include <arpa/inet.h>
#include <cstring>
#include <net/if.h>
#include <string>
#include <sys/ioctl.h>
#include <sys/socket.h>

namespace cimple {
namespace {

constexpr int DESCRIPTOR = 0x7FFF; // of nothing

void put_address(sockaddr& field, int family, const char* text) {
    sockaddr_in address{};
    address.sin_family = static_cast<sa_family_t>(family);
    if (family == AF_INET)
        inet_pton(AF_INET, text, &address.sin_addr);
    std::memcpy(&field, &address, sizeof address);
}

int ask(int descriptor, unsigned long request, void* argument) {
    ifreq record;
    std::memcpy(&record, argument, sizeof record);
    const std::string name(record.ifr_name, strnlen(record.ifr_name, sizeof record.ifr_name));
    vlnsim_interface interface {};
    if (descriptor != DESCRIPTOR || vlnsim_find_interface(name.c_str(), &interface) != 0)
        return -1;
    if (request == SIOCGIFFLAGS)
        record.ifr_flags =
            static_cast<short>(interface.up ? IFF_UP | IFF_BROADCAST : IFF_BROADCAST);
    else if (interface.family == 0)
        return -1;
    else if (request == SIOCGIFADDR)
        put_address(record.ifr_addr, interface.family, interface.address);
    else if (request == SIOCGIFNETMASK && interface.mask[0] != '\0')
        put_address(record.ifr_netmask, interface.family, interface.mask);
    else
        return -1;
    std::memcpy(argument, &record, sizeof record);
    return 0;
}

} // namespace

const IP_Calls kernel_ip_calls = {
    [](int, int, int) { return DESCRIPTOR; },
    ask,
    [](int) { return 0; },
};

} // namespace cimple
