#include "services/dump/instances.h"

#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/VLNMPCA_Chip.h"
#include "classes/VLNMPCA_DownEthernetPort.h"
#include "classes/VLNMPCA_DumpService.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_ExtFATDumpData.h"
#include "classes/VLNMPCA_FCPort.h"
#include "services/dump/trace_levels.h"
#include "services/method_call.h"
#include "services/service_instance.h"

#include <initializer_list>

namespace cimple {

namespace {

constexpr char ADVANCED_ID[] = "VLN:MPCA ExtFATDumpAdvancedData:%s:%s"; // chip, module
constexpr uint16 OPERATIONAL_STATUS_OK = 2;
constexpr uint32 SHOWN_MODES[] = {AX_LOG_MODE_RAM, AX_LOG_MODE_UART};

// What the library tells of one chip.
struct Dump_Settings {
    VLN_EventLogSettings log;
    std::string directory;
    uint32 retention_count = 0;
};

// ---- Ports and chips ----

bool works(const CIM_LogicalPort& port) {
    return port.OperationalStatus.value.find(OPERATIONAL_STATUS_OK) == 0;
}

template <class Port_Class>
const Port_Class* find_port_of(const Instance_Map<Port_Class>& ports, const String& chip) {
    const auto is_of_chip = [&](const Port_Class& port) {
        const String* found = port_identity(port, IDENTITY_ASIC);
        return found && *found == chip;
    };
    const auto* working =
        find_first(ports, [&](const Port_Class& port) { return is_of_chip(port) && works(port); });
    return working ? working : find_first(ports, is_of_chip);
}

template <class Port_Class>
String chip_of(const Instance_Map<Port_Class>& ports, const String& device_id) {
    const auto* port =
        find_first(ports, [&](const Port_Class& each) { return each.DeviceID.value == device_id; });
    const String* chip = port ? port_identity(*port, IDENTITY_ASIC) : nullptr;
    return chip ? *chip : String();
}

// ---- The service ----

Ref<VLNMPCA_DumpService> dump_service_instance(const CIM_ComputerSystem& system) {
    constexpr char DESCRIPTION[] = "Vorlan MPCA Dump Service";
    auto service = service_instance<VLNMPCA_DumpService>(DESCRIPTION, "OK", system);
    service->ElementName.set(DESCRIPTION);
    return service;
}

// A port whose firmware has failed is enough for a host to have the service. It has no link to it:
// what the service is told to act on are chips.
bool has_what_to_dump(const ProviderAgent& agent) {
    const uint32 down = agent.m_VLNMPCA_DownEthernetPort_map.size();
    for (uint32 i = 0; i < down; ++i)
        VLN_LOG(VLN_DBG, "Creating dump service for DownEthernetPort ");
    return down != 0 || agent.m_VLNMPCA_Card_map.size() != 0 ||
           agent.m_VLNMPCA_EthernetPort_map.size() != 0 || agent.m_VLNMPCA_FCPort_map.size() != 0;
}

// ---- Settings ----

Ref<VLNMPCA_ExtFATDumpData> dump_data_instance(const String& chip, const Dump_Settings& settings) {
    auto data = make_instance<VLNMPCA_ExtFATDumpData>();
    data->InstanceID.set(format_text("VLN:MPCA ExtFATDumpData:%s", chip.c_str()));
    data->ElementName.set(data->InstanceID.value);
    data->RetentionCount.set(settings.retention_count);
    data->DumpDirectory.set(text(settings.directory));
    data->MaxLogEntries.set(settings.log.maxLogEntries);
    data->LogEntrySize.set(settings.log.logEntrySize);
    for (uint32 mode = 0; mode < AX_LOG_MODES; ++mode)
        if (settings.log.logType >> mode & 1)
            data->LogType.append(String(log_mode_text(mode)));
    return data;
}

Ref<VLNMPCA_ExtFATDumpAdvancedData> advanced_data_instance(const String& chip,
                                                           const AX_EventLogModule& module) {
    auto data = make_instance<VLNMPCA_ExtFATDumpAdvancedData>();
    data->InstanceID.set(format_text(ADVANCED_ID, chip.c_str(), field_text(module.name).c_str()));
    data->ElementName.set(data->InstanceID.value);
    fill_advanced_data(*data, module);
    return data;
}

AX_STATUS read_settings(const String& port, Dump_Settings& settings) {
    HBA_WWN name{};
    if (!port_name_to_wwn(port, name))
        return AX_STATUS_ERROR;
    if (const AX_STATUS status = VLN_MethodWrapper::GetExtFATAdvancedData(&name, &settings.log))
        return status;
    if (const AX_STATUS status =
            VLN_MethodWrapper::vlncimGetDumpDirectory(&name, &settings.directory)) {
        VLN_LOG(VLN_ERR, "Failed to get the Dump Directory");
        return status;
    }
    const AX_STATUS status =
        VLN_MethodWrapper::vlncimGetRetentionCount(&name, &settings.retention_count);
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, "Failed to get the Retention Count");
    return status;
}

void mark_current(Instance& association) {
    cast<CIM_ElementSettingData>(&association)->IsCurrent.set(SETTING_IS);
}

// A chip that cannot be read has no settings.
AX_STATUS create_settings(ProviderAgent& agent, const VLNMPCA_Chip& chip) {
    const String& tag = chip.Tag.value;
    const String port = port_of_chip(agent, tag);
    if (port.empty())
        return AX_STATUS_OK;
    Dump_Settings settings;
    if (const AX_STATUS status = read_settings(port, settings))
        return status;
    const auto* data =
        insert_instance(agent.m_VLNMPCA_ExtFATDumpData_map, dump_data_instance(tag, settings));
    if (data)
        associate(agent.m_VLNMPCA_ElementExtFATDumpData_map, &chip, data, {}, mark_current);
    for (const AX_EventLogModule& module : settings.log.modules)
        if (const auto* advanced = insert_instance(agent.m_VLNMPCA_ExtFATDumpAdvancedData_map,
                                                   advanced_data_instance(tag, module)))
            associate(agent.m_VLNMPCA_ElementExtFATDumpAdvancedData_map, &chip, advanced, {},
                      mark_current);
    return AX_STATUS_OK;
}

void clear_dump_settings(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_ElementExtFATDumpData_map,
             &agent.m_VLNMPCA_ElementExtFATDumpAdvancedData_map,
             &agent.m_VLNMPCA_ExtFATDumpData_map, &agent.m_VLNMPCA_ExtFATDumpAdvancedData_map})
        store->clear();
}

} // namespace

String port_of_chip(const ProviderAgent& agent, const String& chip) {
    if (const auto* port = find_port_of(agent.m_VLNMPCA_EthernetPort_map, chip))
        return port->DeviceID.value;
    const auto* port = find_port_of(agent.m_VLNMPCA_FCPort_map, chip);
    return port ? port->DeviceID.value : String();
}

String chip_of_port(const ProviderAgent& agent, const String& device_id) {
    const String chip = chip_of(agent.m_VLNMPCA_EthernetPort_map, device_id);
    return chip.empty() ? chip_of(agent.m_VLNMPCA_FCPort_map, device_id) : chip;
}

String chip_of_setting(const Instance_Map_Base& links, const CIM_SettingData& setting) {
    for (uint32 i = 0; i < links.size(); ++i) {
        const auto* link = cast<CIM_ElementSettingData>(links.at(i));
        if (key_eq(link->SettingData, &setting))
            return cast<VLNMPCA_Chip>(link->ManagedElement)->Tag.value;
    }
    return {};
}

String module_of(const VLNMPCA_ExtFATDumpAdvancedData& data, const String& chip) {
    const String& id = data.InstanceID.value;
    const uint32 head = format_text(ADVANCED_ID, chip.c_str(), "").size();
    return id.size() > head ? id.substr(head) : String();
}

// An empty array, not none, for what is traced nowhere.
void fill_advanced_data(VLNMPCA_ExtFATDumpAdvancedData& data, const AX_EventLogModule& module) {
    data.Modes.set({});
    data.PortMask.set({});
    data.PCIFuncMask.set({});
    data.TraceLevel.set({});
    for (const uint32 mode : SHOWN_MODES) {
        const AX_EventLogMode& values = module.mode[mode];
        if (!values.enabled)
            continue;
        data.Modes.append(String(log_mode_text(mode)));
        data.PortMask.append(values.portMask);
        data.PCIFuncMask.append(values.pciFuncMask);
        data.TraceLevel.append(String(trace_level_text(values.traceLevel)));
    }
}

uint32 create_dump_service(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    if (!has_what_to_dump(agent)) {
        VLN_LOG(VLN_ERR, "Unable to create the MPCA Dump service, No Card/Logical Port exist");
        return SKIP_DEVICE;
    }
    const auto* service =
        insert_instance(agent.m_VLNMPCA_DumpService_map, dump_service_instance(*scope.system));
    if (!service)
        return SKIP_DEVICE;
    associate(agent.m_VLNMPCA_HostedDumpService_map, scope.system, service);
    const auto& chips = agent.m_VLNMPCA_Chip_map;
    for (uint32 i = 0; i < chips.size(); ++i)
        associate(agent.m_VLNMPCA_DumpServiceAffectsElement_map, chips[i], service);
    rebuild_dump_settings(agent, {});
    return MAP_OK;
}

void clear_dump_service(ProviderAgent& agent) {
    clear_dump_settings(agent);
    agent.m_VLNMPCA_DumpServiceAffectsElement_map.clear();
    agent.m_VLNMPCA_HostedDumpService_map.clear();
    agent.m_VLNMPCA_DumpService_map.clear();
}

AX_STATUS rebuild_dump_settings(ProviderAgent& agent, const String& chip) {
    clear_dump_settings(agent);
    AX_STATUS status = AX_STATUS_OK;
    const auto& chips = agent.m_VLNMPCA_Chip_map;
    for (uint32 i = 0; i < chips.size(); ++i) {
        const AX_STATUS read = create_settings(agent, *chips[i]);
        if (chips[i]->Tag.value == chip)
            status = read;
    }
    return status;
}

} // namespace cimple
