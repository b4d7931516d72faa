#include "services/driver_parameters/lun_priorities.h"

#include "agent/hardware/port_identity.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_DriverParameterService.h"
#include "device/library/axapi.h"
#include "services/driver_parameters/instances.h"
#include "services/virtual_ports/instances.h"

#include <iterator>

namespace cimple {

namespace {

using Setting = VLNMPCA_DriverParameterSettingData;

constexpr const char* OPTION_WORDS[] = {"Driver", "Config"}; // by AX_OAS_
constexpr char CONFIGURATION[] = "Prio Via";

String wwpn_text(const AX_NAME& name) {
    String text;
    for (const uint8 byte : name.byte)
        text += format_text("%02X", byte);
    return text;
}

String priority_id(const AX_OASLun& unit) {
    return format_text("VLN:PrioVia:%s:%s:%s:%u", priority_option_word(unit.option),
                       wwpn_text(unit.initiator).c_str(), wwpn_text(unit.target).c_str(),
                       static_cast<unsigned>(unit.lun));
}

const VLNMPCA_VirtualFCPort* find_virtual_port(const ProviderAgent& agent, const String& wwpn) {
    const CIM_ComputerSystem* system = agent.m_CIM_ComputerSystem_map[0];
    if (!system)
        return nullptr;
    auto model = make_instance<VLNMPCA_VirtualFCPort>();
    name_in_system(*model, *system);
    model->CreationClassName.set(VIRTUAL_PORT_CLASS);
    model->DeviceID.set(wwpn);
    return agent.m_VLNMPCA_VirtualFCPort_map.lookup(model.get());
}

uint32 remove_links(Instance_Map_Base& links, const Wanted_Priority& wanted) {
    uint32 removed = 0;
    for (uint32 i = links.size(); i-- > 0;) {
        const auto* link = static_cast<const CIM_ElementSettingData*>(links.at(i));
        if (link->SettingData && wanted(*static_cast<const Setting*>(link->SettingData))) {
            links.remove(i);
            ++removed;
        }
    }
    return removed;
}

// ---- What an adapter tells ----

void show_unit(ProviderAgent& agent, const AX_OASLun& unit, const VLNMPCA_FCPort& asked) {
    const String id = priority_id(unit);
    VLN_LOG(VLN_DBG, "Set content: %s", id.c_str());
    const Initiator initiator = find_initiator(agent, wwpn_text(unit.initiator));
    if (initiator.physical) {
        const VLNMPCA_FCPort& port = *initiator.physical;
        VLN_LOG(VLN_DBG, "Found the FCPort Instance: %s", port.DeviceID.value.c_str());
        const String* chip = port_identity(port, IDENTITY_ASIC);
        const String* told_by = port_identity(asked, IDENTITY_ASIC);
        if (!chip || !told_by || !(*chip == *told_by))
            return; // another adapter's port: that one tells it
    } else {
        VLN_LOG(VLN_DBG, "Entered CreateVFCoEPrioViaInstances");
    }
    // An adapter may tell a unit at each of its ports.
    if (find_by_key(agent.m_VLNMPCA_DriverParameterSettingData_map, &Setting::InstanceID, id))
        return;
    VLN_LOG(VLN_DBG, "Prio Via Buffer InstanceId: %s", id.c_str());
    if (!initiator.known())
        VLN_LOG(VLN_WARN, "Could not find the corresponding Virtual FC Port instance.");
    if (show_priority(agent, priority_setting(id, "VLN:PrioVia", unit.option, unit.state != 0),
                      initiator))
        VLN_LOG(VLN_DBG, "Created FCoE Prio Via Driver param");
}

// False when the adapter has no priority of units.
bool show_units(ProviderAgent& agent, const VLNMPCA_FCPort& port, const HBA_WWN& name,
                uint32 option) {
    std::vector<AX_OASLun> units;
    const AX_STATUS status = VLN_MethodWrapper::GetOASLunList(&name, option, &units);
    if (status == AX_STATUS_OK && units.empty())
        VLN_LOG(VLN_DBG, "No entries in the set");
    for (const AX_OASLun& unit : units)
        show_unit(agent, unit, port);
    return status != AX_STATUS_NOT_SUPPORTED;
}

} // namespace

Initiator find_initiator(const ProviderAgent& agent, const String& wwpn) {
    Initiator initiator;
    initiator.physical =
        find_in_system(agent, agent.m_VLNMPCA_FCPort_map, &VLNMPCA_FCPort::DeviceID, wwpn);
    if (!initiator.physical)
        initiator.virtual_port = find_virtual_port(agent, wwpn);
    return initiator;
}

Priority_Name::Priority_Name(const String& instance_id)
    : option_word(instance_id.substr(12, 6)), initiator(instance_id.substr(19, 16)),
      target(instance_id.substr(36, 16)), lun(instance_id.substr(53)) {}

std::optional<uint32> Priority_Name::option() const {
    for (uint32 option = 0; option < std::size(OPTION_WORDS); ++option)
        if (option_word == OPTION_WORDS[option])
            return option;
    return std::nullopt;
}

const char* priority_option_word(uint32 option) {
    return OPTION_WORDS[option == AX_OAS_CONFIG ? AX_OAS_CONFIG : AX_OAS_DRIVER];
}

Ref<Setting> priority_setting(const String& instance_id, const char* element_name, uint32 option,
                              uint32 state) {
    auto setting = make_instance<Setting>();
    setting->InstanceID.set(instance_id);
    setting->ElementName.set(element_name);
    setting->ConfigurationName.set(CONFIGURATION);
    setting->ParameterName.set(PRIORITY_PARAMETER);
    setting->Value.set(state);
    setting->Option.set(static_cast<uint16>(option));
    return setting;
}

bool show_priority(ProviderAgent& agent, Ref<Setting> setting, const Initiator& initiator) {
    const Setting* shown =
        insert_instance(agent.m_VLNMPCA_DriverParameterSettingData_map, std::move(setting));
    if (!shown)
        return false;
    const Association_Details flags = setting_flags(nullptr);
    if (associate(agent.m_VLNMPCA_DriverElementSettingData_map, parameter_service(agent), shown, {},
                  flags))
        VLN_LOG(VLN_DBG, "VLNMPCA_DriverElementSettingData::create() SUCCESFUL");
    if (initiator.physical)
        associate(agent.m_VLNMPCA_LocalPortElementSettingData_map, initiator.physical, shown, {},
                  flags);
    if (initiator.virtual_port)
        associate(agent.m_VLNMPCA_VPortElementSettingData_map, initiator.virtual_port, shown, {},
                  flags);
    return true;
}

bool hide_priorities(ProviderAgent& agent, const Wanted_Priority& wanted) {
    const Wanted_Priority wanted_one = [&wanted](const Setting& setting) {
        return setting.ParameterName.value == PRIORITY_PARAMETER && wanted(setting);
    };
    remove_links(agent.m_VLNMPCA_LocalPortElementSettingData_map, wanted_one);
    remove_links(agent.m_VLNMPCA_VPortElementSettingData_map, wanted_one);
    uint32 links = remove_links(agent.m_VLNMPCA_DriverElementSettingData_map, wanted_one);
    auto& settings = agent.m_VLNMPCA_DriverParameterSettingData_map;
    uint32 hidden = 0;
    for (uint32 i = settings.size(); i-- > 0;)
        if (wanted_one(*settings[i])) {
            settings.remove(i);
            ++hidden;
        }
    return links == hidden;
}

uint32 create_lun_priorities(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto& ports = agent.m_VLNMPCA_FCPort_map;
    for (uint32 i = 0; i < ports.size(); ++i) {
        HBA_WWN name{};
        if (VLN_MethodWrapper::string2HBAName(&name, ports[i]->DeviceID.value.c_str()) != 1)
            continue;
        for (const uint32 option : {uint32{AX_OAS_DRIVER}, uint32{AX_OAS_CONFIG}})
            if (!show_units(agent, *ports[i], name, option))
                break;
    }
    return MAP_OK;
}

} // namespace cimple
