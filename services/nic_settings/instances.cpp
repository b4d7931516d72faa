#include "services/nic_settings/instances.h"

#include "agent/associations.h"
#include "agent/hardware/port_name.h"
#include "agent/provider_agent.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_NICNetworkBootData.h"
#include "classes/VLNMPCA_NICQOSData.h"
#include "classes/VLNMPCA_NICSettingService.h"
#include "classes/VLNMPCA_SoftwareIdentity.h"
#include "services/service_instance.h"

#include <initializer_list>

namespace cimple {

namespace {

constexpr char SERVICE_NAME[] = "Vorlan NIC Setting Service";
constexpr char DRIVER_IDENTITY[] = "VORLAN:VNICD_DRIVER_TYPE"; // which NIC drivers alone have
constexpr char PXE[] = "PXE";
constexpr char PXE_AND_IBFT[] = "PXE,iBFT";

using Service = VLNMPCA_NICSettingService;

Ref<Service> nic_service_instance(const CIM_ComputerSystem& system) {
    auto service = service_instance<Service>(SERVICE_NAME, "OK", system);
    service->Name.set(SERVICE_NAME);
    service->ElementName.set(SERVICE_NAME);
    service->InstanceID.set("VLN:NIC Setting Service");
    return service;
}

// ---- Settings of one port ----

template <class Setting>
Ref<Setting> setting_instance(const char* id, const String& port) {
    auto setting = make_instance<Setting>();
    setting->InstanceID.set(format_text("%s:%s", id, port.c_str()));
    setting->ElementName.set(setting->InstanceID.value);
    return setting;
}

// Null when the adapter does not tell how it boots.
Ref<VLNMPCA_NICNetworkBootData> boot_data_instance(const String& port, const HBA_WWN& name) {
    VLN_MethodWrapper::Boot_Method method = VLN_MethodWrapper::BOOT_UNKNOWN;
    bool several = false;
    uint32 state = 0;
    const AX_STATUS status =
        VLN_MethodWrapper::GetNICNetworkBootParams(&name, &method, &several, &state);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the NIC Network Boot Params of %s. Status: %d",
                port.c_str(), static_cast<int>(status));
        return {};
    }
    auto data = setting_instance<VLNMPCA_NICNetworkBootData>("VLN:NICNetworkboot", port);
    data->Value.set(state);
    data->BootMethod.set(boot_method_text(method));
    data->AvailableMethods.set(several ? PXE_AND_IBFT : PXE);
    return data;
}

// Null when the adapter does not tell what limits the port.
Ref<VLNMPCA_NICQOSData> qos_data_instance(const String& port, const HBA_WWN& name) {
    AX_QoS qos{};
    qos.kind = AX_QOS_NIC;
    const AX_STATUS status = VLN_MethodWrapper::GetQosInfo(&name, &qos);
    if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "Failed to get the NIC Qos Info of %s. Status: %d", port.c_str(),
                static_cast<int>(status));
        return {};
    }
    auto data = setting_instance<VLNMPCA_NICQOSData>("VLN:NICQOS", port);
    data->ParameterName.set("QOS");
    data->Value.set(qos.maxBytesPerSecond);
    return data;
}

// ---- A port ----

const VLNMPCA_SoftwareIdentity* find_nic_driver(const ProviderAgent& agent) {
    return find_first(agent.m_VLNMPCA_SoftwareIdentity_map,
                      [](const VLNMPCA_SoftwareIdentity& software) {
                          const Array<String>& types = software.IdentityInfoType.value;
                          for (uint32 i = 0; i < types.size(); ++i)
                              if (types[i] == DRIVER_IDENTITY)
                                  return true;
                          return false;
                      });
}

template <class Setting>
void add_setting(Instance_Map<Setting>& store, Ref<Setting> setting, Instance_Map_Base& of_port,
                 const VLNMPCA_EthernetPort& port, Instance_Map_Base& of_service,
                 const Service& service) {
    const Setting* added = insert_instance(store, std::move(setting));
    if (!added)
        return;
    associate(of_port, &port, added);
    associate(of_service, &service, added);
}

void create_port_settings(ProviderAgent& agent, const Service& service,
                          const VLNMPCA_EthernetPort& port,
                          const VLNMPCA_SoftwareIdentity* driver) {
    const String& id = port.DeviceID.value;
    HBA_WWN name{};
    if (port_name_to_wwn(id, name)) {
        add_setting(agent.m_VLNMPCA_NICNetworkBootData_map, boot_data_instance(id, name),
                    agent.m_VLNMPCA_PortNICNetworkBootSettingData_map, port,
                    agent.m_VLNMPCA_ServiceNICNetworkBootSettingData_map, service);
        add_setting(agent.m_VLNMPCA_NICQOSData_map, qos_data_instance(id, name),
                    agent.m_VLNMPCA_PortNICQOSSettingData_map, port,
                    agent.m_VLNMPCA_ServiceNICQOSSettingData_map, service);
    }
    associate(agent.m_VLNMPCA_NICSettingServiceAffectsPort_map, &port, &service);
    if (driver)
        associate_once(agent.m_VLNMPCA_NICSettingServiceAffectsDriver_map, driver, &service);
    else
        VLN_LOG(VLN_DBG, "Did not find the corresponding Driver Identity Instance for this "
                         "EthernetPort Instance");
}

} // namespace

uint32 create_nic_settings(const Map_Scope& scope) {
    ProviderAgent& agent = scope.agent;
    const auto* service =
        insert_instance(agent.m_VLNMPCA_NICSettingService_map, nic_service_instance(*scope.system));
    if (!service)
        return SKIP_DEVICE;
    associate(agent.m_VLNMPCA_HostedNICSettingService_map, scope.system, service);
    const auto* driver = find_nic_driver(agent);
    for (const auto& adapter : agent.m_pData->adapters) {
        if (adapter->getAdapterType() != ADAPTER_NIC) {
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an NIC Adapter",
                    adapter->getAdapterName().c_str());
            continue;
        }
        for (const auto& port : adapter->getPorts())
            if (const auto* shown =
                    find_in_system(agent, agent.m_VLNMPCA_EthernetPort_map,
                                   &VLNMPCA_EthernetPort::DeviceID, text(port->getPortName())))
                create_port_settings(agent, *service, *shown, driver);
    }
    return MAP_OK;
}

void clear_nic_settings(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_PortNICNetworkBootSettingData_map,
             &agent.m_VLNMPCA_ServiceNICNetworkBootSettingData_map,
             &agent.m_VLNMPCA_PortNICQOSSettingData_map,
             &agent.m_VLNMPCA_ServiceNICQOSSettingData_map,
             &agent.m_VLNMPCA_NICSettingServiceAffectsPort_map,
             &agent.m_VLNMPCA_NICSettingServiceAffectsDriver_map,
             &agent.m_VLNMPCA_HostedNICSettingService_map, &agent.m_VLNMPCA_NICNetworkBootData_map,
             &agent.m_VLNMPCA_NICQOSData_map, &agent.m_VLNMPCA_NICSettingService_map})
        store->clear();
}

const char* boot_method_text(VLN_MethodWrapper::Boot_Method method) {
    switch (method) {
    case VLN_MethodWrapper::BOOT_PXE:
        return "PXE";
    case VLN_MethodWrapper::BOOT_IBFT:
        return "iBFT";
    case VLN_MethodWrapper::BOOT_NONE:
        return "None";
    case VLN_MethodWrapper::BOOT_UNKNOWN:
        break;
    }
    return "Not Applicable";
}

bool port_of_setting(const CIM_SettingData& setting, HBA_WWN& name) {
    const String& id = setting.InstanceID.value;
    uint32 begin = id.size();
    while (begin > 0 && id[begin - 1] != ':')
        --begin;
    return port_name_to_wwn(id.substr(begin), name);
}

} // namespace cimple
