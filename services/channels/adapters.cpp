#include "services/channels/adapters.h"

#include "agent/hardware/port_identity.h"
#include "agent/store_search.h"

#include <cstring>

namespace cimple {

bool is_virtual_function(const VLNMPCA_EthernetPort& port) {
    constexpr char SRIOV[] = "SRIOV";
    return std::strstr(port.Name.value.c_str(), SRIOV) ||
           std::strstr(port.ElementName.value.c_str(), SRIOV) ||
           port.OtherIdentifyingInfo.value.find(SRIOV) >= 0;
}

const VLNMPCA_EthernetPort* ethernet_port_of_chip(const ProviderAgent& agent, const String& chip) {
    return find_first(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& port) {
        const String* found = port_identity(port, IDENTITY_ASIC);
        return found && *found == chip && !is_virtual_function(port);
    });
}

} // namespace cimple
