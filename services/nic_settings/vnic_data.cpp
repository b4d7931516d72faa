#include "services/nic_settings/vnic_data.h"

#include "agent/hardware/port_identity.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_ChannelSettingData.h"
#include "classes/VLNMPCA_EthernetPort.h"

#include <set>
#include <string>
#include <utility>

namespace cimple {

namespace {

constexpr char IDENTITY_VIRTUAL_PORT[] = "VirtualPortNumber";
constexpr char NO_CHANNELS[] = "NotSupported";

// An ASIC, and the number of a PCI function of it.
using Channel_Key = std::pair<std::string, uint64>;
using Channel_Keys = std::set<Channel_Key>;

Channel_Key key_of(const VLNMPCA_EthernetPort& port, uint64 function) {
    const String* asic = port_identity(port, IDENTITY_ASIC);
    return {asic ? asic->c_str() : "", function};
}

// A channel's adapter is the name of one of its ports.
Channel_Keys channels_of(const ProviderAgent& agent) {
    Channel_Keys keys;
    const auto& channels = agent.m_VLNMPCA_ChannelSettingData_map;
    for (uint32 i = 0; i < channels.size(); ++i)
        if (const auto* port =
                find_in_system(agent, agent.m_VLNMPCA_EthernetPort_map,
                               &VLNMPCA_EthernetPort::DeviceID, channels[i]->Adapter.value))
            keys.insert(key_of(*port, channels[i]->FunctionNumber.value));
    return keys;
}

// A virtual function has no physical port among its identities, and no channel.
bool is_physical(const VLNMPCA_EthernetPort& port) {
    return port_identity(port, IDENTITY_PHYSICAL_PORT) != nullptr;
}

// The port's number behind the card's serial number.
String physical_number(const VLNMPCA_EthernetPort& port) {
    const String* name = port_identity(port, IDENTITY_PHYSICAL_PORT);
    const std::string text = name ? name->c_str() : "";
    return String(text.substr(text.rfind(':') + 1).c_str());
}

void set_numbers(VLNMPCA_EthernetPort& port, bool is_channel) {
    append_port_identity(port, IDENTITY_PORT_NUMBER, physical_number(port));
    append_port_identity(
        port, IDENTITY_VIRTUAL_PORT,
        is_channel ? format_text("%llu", static_cast<unsigned long long>(port.Generation.value))
                   : String(NO_CHANNELS));
    if (is_channel)
        port.OtherPortType.set("vNIC");
}

} // namespace

uint32 update_vnic_data(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    const Channel_Keys channels = channels_of(agent);
    for (uint32 i = 0; i < ports.size(); ++i) {
        const VLNMPCA_EthernetPort& port = *ports[i];
        if (!is_physical(port))
            continue;
        if (port_identity(port, IDENTITY_VIRTUAL_PORT)) {
            VLN_LOG(VLN_DBG, "vNIC Details already filled: %s ", port.DeviceID.value.c_str());
            continue;
        }
        const bool is_channel = channels.count(key_of(port, port.Generation.value)) != 0;
        change(ports, i, [&](VLNMPCA_EthernetPort& each) { set_numbers(each, is_channel); });
    }
    return MAP_OK;
}

} // namespace cimple
