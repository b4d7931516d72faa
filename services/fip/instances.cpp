#include "services/fip/instances.h"

#include "agent/element_setting.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/text.h"
#include "classes/CIM_ElementSettingData.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_FIPFCFData.h"
#include "classes/VLNMPCA_FIPService.h"
#include "services/service_instance.h"

#include <algorithm>
#include <initializer_list>

namespace cimple {

namespace {

Ref<VLNMPCA_FIPService> fip_service_instance(const CIM_ComputerSystem& system) {
    constexpr char DESCRIPTION[] = "Vorlan MPCA FIP Service";
    auto service = service_instance<VLNMPCA_FIPService>(DESCRIPTION, "OK", system);
    service->ElementName.set(DESCRIPTION);
    return service;
}

void set_one(Property<Array<String>>& property, const std::string& value) {
    property.set({});
    property.append(text(value));
}

// ---- What a port is set to ----

Ref<VLNMPCA_FIPData> fip_data_instance(const String& port, const VLN_FIPParams& params) {
    auto data = make_instance<VLNMPCA_FIPData>();
    data->InstanceID.set(format_text("VLNMPCA_FIPData::%s", port.c_str()));
    data->ElementName.set(port);
    fill_fip_data(*data, params);
    return data;
}

void create_fip_data(ProviderAgent& agent, const VLNMPCA_FIPService* service,
                     const VLNMPCA_FCPort* port, const HBA_WWN& name) {
    const String& id = port->DeviceID.value;
    VLN_FIPParams params;
    if (VLN_MethodWrapper::vlnGetFIPParams(&name, &params) != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR,
                "Failed to get FIP Params from AXAPI for deviceID %s,skipping the FIP setting "
                "class creation",
                id.c_str());
        return;
    }
    const auto* data = insert_instance(agent.m_VLNMPCA_FIPData_map, fip_data_instance(id, params));
    if (!data)
        return;
    // In force after the port's next reset.
    associate(agent.m_VLNMPCA_ElementFIPData_map, service, data, {},
              [](Instance& link) { cast<CIM_ElementSettingData>(&link)->IsNext.set(SETTING_IS); });
    associate(agent.m_VLNMPCA_FIPServiceAffectsElement_map, port, service);
}

// ---- What it has found ----

String name_text(const AX_NAME& name) {
    const auto& b = name.byte;
    return format_text("%02X:%02X:%02X:%02X:%02X:%02X:%02X:%02X", b[0], b[1], b[2], b[3], b[4],
                       b[5], b[6], b[7]);
}

Ref<VLNMPCA_FIPFCFData> forwarder_instance(const String& port, uint32 index, const AX_Fcf& entry) {
    auto data = make_instance<VLNMPCA_FIPFCFData>();
    data->InstanceID.set(
        format_text("VLNMPCA_FIPFCFData::%s::%d", port.c_str(), static_cast<int>(index)));
    data->ElementName.set(port);
    data->EntryID.set(entry.entryID);
    data->ActiveFCFs.set(entry.activeFCFs);
    data->State.set(entry.state);
    data->Priority.set(entry.priority);
    data->PrimaryFabricName.set(name_text(entry.fabricName));
    data->PrimarySwitchName.set(name_text(entry.switchName));
    const auto& mac = entry.mac;
    data->Mac.set(format_text("%02X:%02X:%02X:%02X:%02X:%02X", mac[0], mac[1], mac[2], mac[3],
                              mac[4], mac[5]));
    const auto& map = entry.fcMap;
    data->FCMap.set(format_text("0x%02X%02X%02X", map[0], map[1], map[2]));
    data->VlanID.set({});
    for (uint32 i = 0; i < std::min<uint32>(entry.vlanCount, AX_FCF_VLANS); ++i)
        data->VlanID.append(entry.vlanID[i]);
    data->Period.set(entry.period);
    return data;
}

void create_forwarders(ProviderAgent& agent, const VLNMPCA_FIPService* service, const String& port,
                       const HBA_WWN& name) {
    std::vector<AX_Fcf> entries;
    if (VLN_MethodWrapper::GetFcfList(&name, &entries) != AX_STATUS_OK)
        return;
    uint32 index = 0;
    for (const AX_Fcf& entry : entries)
        if (const auto* data = insert_instance(agent.m_VLNMPCA_FIPFCFData_map,
                                               forwarder_instance(port, index++, entry)))
            associate(agent.m_VLNMPCA_ElementFIPFCFData_map, service, data, {}, [](Instance& link) {
                cast<CIM_ElementSettingData>(&link)->IsCurrent.set(SETTING_IS);
            });
}

} // namespace

void fill_fip_data(VLNMPCA_FIPData& data, const VLN_FIPParams& params) {
    set_one(data.PrimaryFabricName, params.primaryFabricName);
    set_one(data.PrimarySwitchName, params.primarySwitchName);
    set_one(data.VlanID, params.vlanId);
    data.FCMap.set(text(params.fcMap));
    if (params.cinVlanId)
        data.CinVlanID.set(*params.cinVlanId);
}

uint32 create_fip_classes(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto& ports = agent.m_VLNMPCA_FCPort_map;
    if (ports.size() == 0)
        return MAP_OK;
    const auto* service =
        insert_instance(agent.m_VLNMPCA_FIPService_map, fip_service_instance(*scope.system));
    if (!service)
        return SKIP_DEVICE;
    associate(agent.m_VLNMPCA_HostedFIPService_map, scope.system, service);
    for (uint32 i = 0; i < ports.size(); ++i) {
        HBA_WWN name{};
        if (!port_name_to_wwn(ports[i]->DeviceID.value, name))
            continue;
        create_fip_data(agent, service, ports[i], name);
        create_forwarders(agent, service, ports[i]->DeviceID.value, name);
    }
    return MAP_OK;
}

void clear_fip_classes(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_ElementFIPFCFData_map, &agent.m_VLNMPCA_ElementFIPData_map,
             &agent.m_VLNMPCA_FIPServiceAffectsElement_map, &agent.m_VLNMPCA_HostedFIPService_map,
             &agent.m_VLNMPCA_FIPFCFData_map, &agent.m_VLNMPCA_FIPData_map,
             &agent.m_VLNMPCA_FIPService_map})
        store->clear();
}

} // namespace cimple
