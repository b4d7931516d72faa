#include "services/channels/instances.h"

#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/VLNMPCA_ChannelMgmtService.h"
#include "classes/VLNMPCA_ChannelSettingData.h"
#include "classes/VLNMPCA_Chip.h"
#include "services/channels/adapters.h"
#include "services/service_instance.h"

#include <cctype>
#include <set>
#include <span>
#include <string>
#include <string_view>

namespace cimple {

namespace {

// What the library tells of one port.
struct Port_Channels {
    AX_ChannelMgmtCNAInfo management{};
    AX_ChannelMgmtPortInfo port{};
};

Ref<VLNMPCA_ChannelMgmtService> channel_service_instance(const CIM_ComputerSystem& system) {
    constexpr char DESCRIPTION[] = "Vorlan MPCA Channel Management Service";
    auto service = service_instance<VLNMPCA_ChannelMgmtService>(DESCRIPTION, "OK", system);
    service->ElementName.set(DESCRIPTION);
    return service;
}

void set_management(VLNMPCA_ChannelSettingData& data, const AX_ChannelMgmtCNAInfo& management) {
    data.CurrentState.set(static_cast<uint8>(management.currentState));
    data.ConfiguredState.set(static_cast<uint8>(management.configuredState));
    data.ManagementType.set(static_cast<uint8>(management.mgmtType));
    data.ConfiguredMgmtType.set(static_cast<uint8>(management.configuredMgmtType));
    data.ChannelMgmtVersion.set(static_cast<uint8>(management.version));
    data.AvailableMgmtTypes.set({});
    for (uint8 mode = 0; mode < 32; ++mode)
        if (management.availableModes >> mode & 1)
            data.AvailableMgmtTypes.append(static_cast<uint8>(mode + 1));
}

Ref<VLNMPCA_ChannelSettingData> channel_instance(const VLNMPCA_EthernetPort& port,
                                                 const Port_Channels& told,
                                                 const AX_Channel& channel) {
    const String& adapter = port.DeviceID.value;
    const String mac = mac_of_channel(channel);
    auto data = make_instance<VLNMPCA_ChannelSettingData>();
    data->InstanceID.set(
        format_text("VLN:MPCA ChannelSettingData:%s:%s", adapter.c_str(), mac.c_str()));
    data->ElementName.set(data->InstanceID.value);
    data->Adapter.set(adapter);
    data->PortNumber.set(port.PortNumber.value);
    data->FunctionNumber.set(static_cast<uint8>(channel.functionNumber));
    data->MACAddress.set(mac);
    data->VNICName.set(field_text(channel.name));
    data->ChannelType.set(static_cast<uint8>(channel.type));
    data->ChannelState.set(static_cast<uint8>(channel.state));
    data->LPVId.set(static_cast<uint16>(channel.lpvid));
    data->InnerLPVId.set(static_cast<uint16>(channel.innerLPVID));
    data->MinBandwidth.set(static_cast<uint16>(channel.minBandwidth));
    data->MaxBandwidth.set(static_cast<uint16>(channel.maxBandwidth));
    data->UpdateMask.set(static_cast<uint8>(told.port.mask));
    set_management(*data, told.management);
    return data;
}

AX_STATUS read_channels(const VLNMPCA_EthernetPort& port, Port_Channels& told) {
    HBA_WWN name{};
    if (!port_name_to_wwn(port.DeviceID.value, name))
        return AX_STATUS_ERROR;
    if (const AX_STATUS status = VLN_MethodWrapper::GetChannelMgmtCNAInfo(&name, &told.management))
        return status;
    if (const AX_STATUS status = VLN_MethodWrapper::GetChannelMgmtPortInfo(&name, &told.port))
        return status;
    VLN_LOG(VLN_DBG, "No of channels: %u, Version: %u", told.port.count, told.management.version);
    return AX_STATUS_OK;
}

// An address as digits alone, of one case.
std::string digits_of(const String& mac) {
    std::string digits;
    for (const char c : std::string_view(mac.c_str(), mac.size()))
        if (std::isxdigit(static_cast<unsigned char>(c)))
            digits += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return digits;
}

// The channels of all functions of a link are told by each of these functions.
class Channel_Builder {
public:
    explicit Channel_Builder(ProviderAgent& agent) : _agent(agent) {}

    AX_STATUS add(const VLNMPCA_EthernetPort& port) {
        if (is_virtual_function(port)) {
            VLN_LOG(VLN_DBG, "SRIOV Ethernet Port, skipping this port from CM check.");
            return AX_STATUS_OK;
        }
        if (!port.PermanentAddress.is_null() &&
            _told.count(digits_of(port.PermanentAddress.value))) {
            VLN_LOG(VLN_DBG, "Channel details already filled for: %s", port.DeviceID.value.c_str());
            return AX_STATUS_OK;
        }
        Port_Channels told;
        if (const AX_STATUS status = read_channels(port, told))
            return status == AX_STATUS_NOT_SUPPORTED ? AX_STATUS_OK : status;
        for (const AX_Channel& channel : std::span(told.port.channel, told.port.count)) {
            const auto* data = insert_instance(_agent.m_VLNMPCA_ChannelSettingData_map,
                                               channel_instance(port, told, channel));
            if (data)
                associate(_agent.m_VLNMPCA_ChannelMgmtServiceElementSettingData_map,
                          _agent.m_VLNMPCA_ChannelMgmtService_map[0], data);
            _told.insert(digits_of(mac_of_channel(channel)));
        }
        return AX_STATUS_OK;
    }

private:
    ProviderAgent& _agent;
    std::set<std::string> _told; // addresses
};

void clear_channel_settings(ProviderAgent& agent) {
    agent.m_VLNMPCA_ChannelMgmtServiceElementSettingData_map.clear();
    agent.m_VLNMPCA_ChannelSettingData_map.clear();
}

} // namespace

String mac_of_channel(const AX_Channel& channel) {
    const uint8_t* mac = channel.mac;
    return format_text("%02x-%02x-%02x-%02x-%02x-%02x", mac[0], mac[1], mac[2], mac[3], mac[4],
                       mac[5]);
}

uint32 create_channel_service(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto& chips = agent.m_VLNMPCA_Chip_map;
    if (chips.size() == 0)
        return MAP_OK;
    const auto* service = insert_instance(agent.m_VLNMPCA_ChannelMgmtService_map,
                                          channel_service_instance(*scope.system));
    associate(agent.m_VLNMPCA_HostedChannelMgmtService_map, scope.system, service);
    for (uint32 i = 0; i < chips.size(); ++i)
        associate(agent.m_VLNMPCA_ChannelMgmtServiceAffectsElement_map, chips[i], service);
    return rebuild_channel_settings(agent, {}) == AX_STATUS_OK ? MAP_OK : SKIP_DEVICE;
}

void clear_channel_service(ProviderAgent& agent) {
    clear_channel_settings(agent);
    agent.m_VLNMPCA_ChannelMgmtServiceAffectsElement_map.clear();
    agent.m_VLNMPCA_HostedChannelMgmtService_map.clear();
    agent.m_VLNMPCA_ChannelMgmtService_map.clear();
}

AX_STATUS rebuild_channel_settings(ProviderAgent& agent, const String& adapter) {
    clear_channel_settings(agent);
    AX_STATUS status = AX_STATUS_OK;
    Channel_Builder builder(agent);
    const auto& ports = agent.m_VLNMPCA_EthernetPort_map;
    for (uint32 i = 0; i < ports.size(); ++i) {
        const AX_STATUS read = builder.add(*ports[i]);
        const bool asked = adapter.empty() || ports[i]->DeviceID.value == adapter;
        if (asked && status == AX_STATUS_OK)
            status = read;
    }
    return status;
}

} // namespace cimple
