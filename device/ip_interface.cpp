#include "device/ip_interface.h"

#include "foundation/log.h"

#include <algorithm>
#include <arpa/inet.h>
#include <atomic>
#include <cstring>
#include <net/if.h>
#include <sys/ioctl.h>
#include <sys/socket.h>

namespace cimple {

namespace {

std::atomic<const IP_Calls*> calls{&kernel_ip_calls};

// What the kernel answers, in a record with the interface's name. False if it does not.
bool ask(int socket, unsigned long request, const std::string& name, ifreq& record) {
    record = {};
    const std::size_t length = std::min(name.size(), sizeof record.ifr_name);
    std::memcpy(record.ifr_name, name.data(), length);
    return calls.load()->ioctl(socket, request, &record) >= 0;
}

// Empty for another family than IPv4.
std::string ipv4_text(const sockaddr& address) {
    if (address.sa_family != AF_INET)
        return {};
    sockaddr_in internet;
    std::memcpy(&internet, &address, sizeof internet);
    char text[INET_ADDRSTRLEN] = "";
    inet_ntop(AF_INET, &internet.sin_addr, text, sizeof text);
    return text;
}

} // namespace

// The socket must not leak into programs that the object manager starts.
VLN_IPInterfaceConfig::VLN_IPInterfaceConfig()
    : m_socket(calls.load()->socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {}

VLN_IPInterfaceConfig::~VLN_IPInterfaceConfig() {
    if (m_socket >= 0)
        calls.load()->close(m_socket);
    m_socket = -1;
    VLN_LOG(VLN_DBG, "VLN_IPInterfaceConfig -- Destructor of IPInterface");
}

void VLN_IPInterfaceConfig::setCalls(const IP_Calls* replacement) {
    calls = replacement ? replacement : &kernel_ip_calls;
}

bool VLN_IPInterfaceConfig::GetInterfaceState(const std::string& interfaceName) {
    ifreq record;
    if (!ask(m_socket, SIOCGIFFLAGS, interfaceName, record)) {
        VLN_LOG(VLN_DBG,
                "GetInterfaceState -- Failed to obtain the the Interface State for strInterface: "
                "[%s]",
                interfaceName.c_str());
        return false;
    }
    const bool up = (record.ifr_flags & IFF_UP) != 0;
    if (up)
        VLN_LOG(VLN_DBG, "GetInterfaceState -- Interface: [%s] is UP", interfaceName.c_str());
    else
        VLN_LOG(VLN_DBG, "GetInterfaceState -- Interface: [%s] is Down", interfaceName.c_str());
    return up;
}

sint32 VLN_IPInterfaceConfig::GetIPAddressType(const std::string& interfaceName) {
    ifreq record;
    if (!ask(m_socket, SIOCGIFADDR, interfaceName, record)) {
        VLN_LOG(VLN_DBG,
                "GetIPAddressType -- Failed to obtain the IP Address type for strInterface: [%s]",
                interfaceName.c_str());
        return -1;
    }
    const sint32 family = record.ifr_addr.sa_family;
    VLN_LOG(VLN_DBG, "GetIPAddressType -- INET FAMILY for strInterface [%s]: [%d]",
            interfaceName.c_str(), family);
    return family;
}

std::string VLN_IPInterfaceConfig::GetIPv4SubnetMask(const std::string& interfaceName) {
    ifreq record;
    if (!ask(m_socket, SIOCGIFNETMASK, interfaceName, record)) {
        VLN_LOG(VLN_DBG,
                "GetIPv4SubnetMask - Failed to obtain the IPv4 Subnet Mask for strInterface: [%s]",
                interfaceName.c_str());
        return {};
    }
    return ipv4_text(record.ifr_netmask);
}

std::string VLN_IPInterfaceConfig::GetIPv4Address(const std::string& interfaceName) {
    ifreq record;
    if (!ask(m_socket, SIOCGIFADDR, interfaceName, record)) {
        VLN_LOG(VLN_DBG,
                "GetIPv4Address --- Failed to obtain the IP Address for strInterface: [%s]",
                interfaceName.c_str());
        return {};
    }
    std::string text = ipv4_text(record.ifr_addr);
    if (!text.empty())
        VLN_LOG(VLN_ERR, "GetIPv4Address --- IPv4 Address for strInterface [%s]: [%s]",
                interfaceName.c_str(), text.c_str());
    return text;
}

} // namespace cimple
