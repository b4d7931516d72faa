#include "services/channels/port_config.h"

#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "operations/orrigan_rules.h"
#include "services/channels/adapters.h"
#include "services/channels/protocol_words.h"

#include <initializer_list>
#include <string>

namespace cimple {

namespace {

using D = VLNMPCA_PortConfigData;

constexpr const char* INSTANCE_ID[CONFIG_KINDS] = {
    "VLN:Current Configuration:", "VLN:Pending Configuration:", "VLN:Available Configuration:"};

template <class T>
using Per_Port = Property<Array<T>> D::*const[AX_CONFIG_PORTS];

constexpr Per_Port<String> ADDRESSES = {&D::MACAddrPort0, &D::MACAddrPort1, &D::MACAddrPort2,
                                        &D::MACAddrPort3};
constexpr Per_Port<String> ABILITIES = {&D::FuncProtocolsPort0, &D::FuncProtocolsPort1,
                                        &D::FuncProtocolsPort2, &D::FuncProtocolsPort3};
constexpr Per_Port<sint8> NUMBERS = {&D::FuncNumPort0, &D::FuncNumPort1, &D::FuncNumPort2,
                                     &D::FuncNumPort3};

struct Flag_Row {
    Property<boolean> D::*property;
    uint32 flag;
};
constexpr Flag_Row FLAGS[] = {
    {&D::SRIOV, AX_ADAPTER_SRIOV},
    {&D::T10DIF, AX_ADAPTER_T10DIF},
    {&D::MixedModeAllowed, AX_ADAPTER_MIXED_MODE},
    {&D::ConcurrentModeAllowed, AX_ADAPTER_CONCURRENT_MODE},
    {&D::GangedModeAllowed, AX_ADAPTER_GANGED_MODE},
};

String config_id(Config_Kind kind, const String& chip) {
    return format_text("%s%s", INSTANCE_ID[kind], chip.c_str());
}

String words_of(uint32 abilities) {
    std::string words;
    for (const Protocol_Word& row : PROTOCOL_WORDS)
        if (abilities & row.ability)
            words += (words.empty() ? "" : ",") + std::string(row.word);
    return String(words.c_str());
}

String word_of(uint32 protocol) {
    const Protocol_Word* row = find_word(&Protocol_Word::protocol, protocol);
    return row ? String(row->word) : format_text("%u", protocol);
}

void set_port(D& data, uint32 port, const AX_PortConfig& config, Config_Kind kind) {
    if (kind != CONFIG_AVAILABLE)
        (data.*CONFIG_PORT[port]).set({});
    (data.*ADDRESSES[port]).set({});
    (data.*ABILITIES[port]).set({});
    (data.*NUMBERS[port]).set({});
    for (const AX_FunctionConfig& function : functionsOf(config)) {
        const uint8_t* mac = function.mac;
        if (kind != CONFIG_AVAILABLE)
            (data.*CONFIG_PORT[port])
                .append(
                    word_of(kind == CONFIG_CURRENT ? function.protocol : function.pendingProtocol));
        (data.*ADDRESSES[port])
            .append(format_text("%02x-%02x-%02x-%02x-%02x-%02x", mac[0], mac[1], mac[2], mac[3],
                                mac[4], mac[5]));
        (data.*ABILITIES[port]).append(words_of(function.flags));
        (data.*NUMBERS[port]).append(static_cast<sint8>(function.functionNumber));
    }
}

// What is in force differs from what will be; what can be has neither.
void set_choice(D& data, const AX_AdapterPortConfig& config, Config_Kind kind) {
    if (kind == CONFIG_AVAILABLE)
        return;
    const bool current = kind == CONFIG_CURRENT;
    const int32_t pending_type =
        config.configuredMCType != -1 ? config.configuredMCType : config.mcType;
    data.PID.set(static_cast<uint8>(current ? config.activeProfileId : config.configuredProfileId));
    data.MCType.set(static_cast<uint8>(current ? config.mcType : pending_type));
    data.RebootRequired.set((config.adapterFlags & AX_ADAPTER_REBOOT_REQUIRED) != 0);
}

void fill_configuration(D& data, const AX_AdapterPortConfig& config, Config_Kind kind) {
    data.ParameterName.set("Port Configuration");
    for (uint32 port = 0; port < portsOf(config).size(); ++port)
        set_port(data, port, config.port[port], kind);
    set_choice(data, config, kind);
    for (const Flag_Row& row : FLAGS)
        (data.*row.property).set((config.adapterFlags & row.flag) != 0);
    data.NumOfPorts.set(static_cast<uint8>(config.portCount));
    data.MaxFCoEFunctions.set(static_cast<uint8>(config.maxFCoEFunctions));
    data.MaxiSCSIFunctions.set(static_cast<uint8>(config.maxiSCSIFunctions));
    data.MinPorts.set(config.minPorts);
    data.MaxPorts.set(config.maxPorts);
    data.ProfileVersion.set(config.profileVersion);
    data.MaxFunctionCount.set(static_cast<uint8>(config.ariFunctionCount4 / 4));
    data.IPLMaxFunctionCount.set(static_cast<uint8>(config.iplMaxFunctionCount));
}

void create_configuration(ProviderAgent& agent, const VLNMPCA_Chip& chip, Config_Kind kind,
                          const AX_AdapterPortConfig& config) {
    auto data = make_instance<D>();
    data->InstanceID.set(config_id(kind, chip.Tag.value));
    data->ElementName.set(data->InstanceID.value);
    fill_configuration(*data, config, kind);
    const auto* stored = insert_instance(agent.m_VLNMPCA_PortConfigData_map, std::move(data));
    if (stored)
        associate(agent.m_VLNMPCA_ElementPortConfigData_map, &chip, stored, {},
                  [kind](Instance& association) {
                      auto* link = cast<CIM_ElementSettingData>(&association);
                      link->IsCurrent.set(kind == CONFIG_CURRENT ? SETTING_IS : SETTING_IS_NOT);
                      link->IsNext.set(kind == CONFIG_PENDING ? SETTING_IS : SETTING_IS_NOT);
                  });
}

AX_STATUS create_configurations(ProviderAgent& agent, const VLNMPCA_Chip& chip,
                                const HBA_WWN& name) {
    AX_AdapterPortConfig config{};
    if (const AX_STATUS status = VLN_MethodWrapper::GetAdpaterPortConfig(&name, &config))
        return status;
    for (const Config_Kind kind : {CONFIG_CURRENT, CONFIG_PENDING, CONFIG_AVAILABLE})
        create_configuration(agent, chip, kind, config);
    return AX_STATUS_OK;
}

// What an adapter with the feature has.
struct Configuration_Part {
    VLN_MethodWrapper::Configuration_Feature feature;
    AX_STATUS (*create)(ProviderAgent& agent, const VLNMPCA_Chip& chip, const HBA_WWN& name);
};
constexpr Configuration_Part PARTS[] = {
    {VLN_MethodWrapper::HAS_PROFILES, create_configurations},
    {VLN_MethodWrapper::HAS_PROFILES, create_profiles},
    {VLN_MethodWrapper::CHANGES_PERSONALITY, create_personalities},
};

bool create_parts(ProviderAgent& agent, const VLNMPCA_Chip& chip) {
    const VLNMPCA_EthernetPort* port = ethernet_port_of_chip(agent, chip.Tag.value);
    HBA_WWN name{};
    if (!port || !port_name_to_wwn(port->DeviceID.value, name))
        return false;
    bool complete = true;
    for (const Configuration_Part& part : PARTS) {
        bool offered = false;
        AX_STATUS status = VLN_MethodWrapper::HasFeature(&name, part.feature, &offered);
        if (status == AX_STATUS_OK && offered)
            status = part.create(agent, chip, name);
        complete = complete && (status == AX_STATUS_OK || status == AX_STATUS_NOT_SUPPORTED);
    }
    return complete;
}

} // namespace

Property<Array<String>> VLNMPCA_PortConfigData::*const CONFIG_PORT[AX_CONFIG_PORTS] = {
    &D::ConfigPort0, &D::ConfigPort1, &D::ConfigPort2, &D::ConfigPort3};

bool is_current_configuration(const String& instance_id) {
    return std::string_view(instance_id.c_str()).find(INSTANCE_ID[CONFIG_CURRENT]) !=
           std::string_view::npos;
}

void change_configuration(ProviderAgent& agent, const String& chip, Config_Kind kind,
                          const AX_AdapterPortConfig& config) {
    const auto keys = make_instance<D>();
    keys->InstanceID.set(config_id(kind, chip));
    change(agent.m_VLNMPCA_PortConfigData_map, keys.get(),
           [&](D& data) { fill_configuration(data, config, kind); });
}

uint32 create_adapter_configurations(const Map_Scope& scope) {
    const auto& chips = scope.agent.m_VLNMPCA_Chip_map;
    uint32 status = MAP_OK;
    for (uint32 i = 0; i < chips.size(); ++i)
        if (!create_parts(scope.agent, *chips[i]))
            status = SKIP_DEVICE;
    return status;
}

void clear_adapter_configurations(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_ElementPortConfigData_map, &agent.m_VLNMPCA_PortConfigData_map,
             &agent.m_VLNMPCA_ElementPIDData_map, &agent.m_VLNMPCA_PIDData_map,
             &agent.m_VLNMPCA_ElementPersonalityData_map,
             &agent.m_VLNMPCA_PersonalitySettingData_map,
             &agent.m_VLNMPCA_ElementSupportedPersonalitiesData_map,
             &agent.m_VLNMPCA_SupportedPersonalitiesData_map})
        store->clear();
}

} // namespace cimple
