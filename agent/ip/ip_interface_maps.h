// What hangs on an IP endpoint, whichever function of an adapter it belongs to: its settings, its
// capabilities, its gateway, and the service that configures it.
//
// Runs in the adapter pass, with the adapter maps' ready mutex and m_DataMutex held.
#ifndef VLN_AGENT_IP_IP_INTERFACE_MAPS_H
#define VLN_AGENT_IP_IP_INTERFACE_MAPS_H

#include "agent/provider_agent.h"
#include "agent/text.h"

namespace cimple {

inline constexpr uint16 IF_TYPE_IPV4 = 4096; // CIM_IPProtocolEndpoint.ProtocolIFType
inline constexpr uint16 IF_TYPE_IPV6 = 4097;

inline bool is_ipv6(const String& address) {
    return address.find(':') != -1;
}

// "0.0.0.0", and the same in IPv6.
inline bool is_unset(const std::string& address) {
    return address.find_first_not_of("0.:") == std::string::npos;
}

// A gateway as the library tells it; empty for an address of zeros, which stands for none.
inline String gateway_text(const std::string& address) {
    return is_unset(address) ? String() : text(address);
}

struct IP_Interface {
    const VLNMPCA_IPProtocolEndpoint* endpoint; // in its store
    String serial;                              // of the card
    String port_name;
    String address;
    String subnet_mask;
    String gateway; // empty for none
};

class IP_Interface_Maps {
public:
    IP_Interface_Maps(ProviderAgent& agent, const CIM_ComputerSystem* system)
        : _agent(agent), _system(system) {}

    // The one service of the host, made with the first call. Null if the store refused it.
    const VLNMPCA_IPConfigurationService* findOrMakeService();

    // 0; 32768 when the interface has no service or one of its instances stands already; 32769
    // when a link between them does.
    uint32 CreateIPInterfaceInstances(const IP_Interface& interface);

private:
    bool joinCapabilities(const IP_Interface& interface);
    uint32 createSettings(const IP_Interface& interface);
    bool joinGateway(const IP_Interface& interface);
    const VLNMPCA_RemoteServiceAccessPoint* findOrMakeGateway(const String& address);

    ProviderAgent& _agent;
    const CIM_ComputerSystem* _system;
};

} // namespace cimple

#endif // VLN_AGENT_IP_IP_INTERFACE_MAPS_H
