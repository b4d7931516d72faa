#include "services/nic_settings/virtual_functions.h"

#include "agent/associations.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_name.h"
#include "agent/profiles/profile_maps.h"
#include "agent/provider_agent.h"
#include "agent/state_tables.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/VLNMPCA_ConcreteIdentity.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_LANEndpoint.h"
#include "classes/VLNMPCA_NICLogicalDevice.h"
#include "classes/VLNMPCA_PCIDevice.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_VFAllocationSettingData.h"
#include "classes/VLNMPCA_VLANEndpoint.h"

#include <initializer_list>

namespace cimple {

namespace {

constexpr uint16 SRIOV_ON = 1; // VLNMPCA_EthernetPort.SRIOVState
constexpr uint16 SRIOV_NOT_SUPPORTED = 3;
constexpr uint16 RESOURCE_TYPE = 11; // CIM_ResourceAllocationSettingData
constexpr uint16 CONSUMER_VISIBILITY_VIRTUALIZED = 3;
constexpr uint16 MAPPING_DEDICATED = 2;
constexpr uint16 IF_TYPE_ETHERNET_CSMACD = 6; // IANAifType
constexpr uint16 PROTOCOL_TYPE_OTHER = 1;     // CIM_ProtocolEndpoint.ProtocolType

// What the virtual functions of a port hang on.
struct Owner {
    ProviderAgent& agent;
    const CIM_ComputerSystem& system;
    uint32 adapter; // its number
    uint32 port;    // its place among the adapter's
    HBA_WWN name;
    const VLNMPCA_EthernetPort* ethernet_port;
    const VLNMPCA_PCIDevice* pci_device; // these three null for a port without one
    const VLNMPCA_LANEndpoint* lan_endpoint;
    const VLNMPCA_PortController* controller;
    const VLNMPCA_RegisteredProfile* profile;
    String serial;
};

struct Virtual_Function {
    String name; // 16 digits
    AX_VirtualFunctionProperties properties{};
    String mac;
    String port_id; // of its Ethernet port
};

String name_text(const AX_NAME& name) {
    const uint8(&b)[8] = name.byte;
    return format_text("%02X%02X%02X%02X%02X%02X%02X%02X", b[0], b[1], b[2], b[3], b[4], b[5], b[6],
                       b[7]);
}

String mac_text(const uint8 (&mac)[6]) {
    return format_text("%02x-%02x-%02x-%02x-%02x-%02x", mac[0], mac[1], mac[2], mac[3], mac[4],
                       mac[5]);
}

// ---- Instances of one virtual function ----

Ref<VLNMPCA_NICLogicalDevice> logical_device_instance(const Owner& owner,
                                                      const Virtual_Function& function) {
    const AX_VirtualFunctionProperties& properties = function.properties;
    auto device = make_instance<VLNMPCA_NICLogicalDevice>();
    name_in_system(*device, owner.system);
    device->DeviceID.set(format_text("%d:%d:%s", static_cast<int>(owner.adapter),
                                     static_cast<int>(owner.port), function.name.c_str()));
    device->ElementName.set(
        format_text("VorlanNIC(SRIOV)Function:%d", static_cast<int>(properties.functionNumber)));
    append_port_identity(*device, "PhysicalMACAddress",
                         owner.ethernet_port->PermanentAddress.value);
    append_port_identity(*device, IDENTITY_SERIAL, owner.serial);
    device->BusNumber.set(static_cast<uint8>(properties.busNumber));
    device->DeviceNumber.set(static_cast<uint8>(properties.deviceNumber));
    device->FunctionNumber.set(static_cast<uint8>(properties.functionNumber));
    device->SubsystemId.set(properties.subsystemID);
    device->SubystemVendorId.set(properties.subVendorID);
    device->PCIDeviceId.set(properties.deviceID);
    device->VendorId.set(properties.vendorID);
    device->RevisionId.set(properties.revisionID);
    device->MACAddress.set(function.mac);
    device->VLanId.set(properties.vlanID);
    device->LinkStatus.set(properties.linkStatus);
    device->TransmitRate.set(field_text(properties.transmitRate));
    return device;
}

Ref<VLNMPCA_EthernetPort> logical_port_instance(const Owner& owner,
                                                const Virtual_Function& function) {
    auto port = make_instance<VLNMPCA_EthernetPort>();
    name_in_system(*port, owner.system);
    port->DeviceID.set(function.port_id);
    port->Name.set("SRIOV"); // what tells it from the ports of physical functions
    port->ElementName.set(format_text("VorlanNIC(SRIOV)Port:%d",
                                      static_cast<int>(function.properties.functionNumber)));
    port->SRIOVState.set(SRIOV_NOT_SUPPORTED);
    if (const String* asic = port_identity(*owner.ethernet_port, IDENTITY_ASIC))
        append_port_identity(*port, IDENTITY_ASIC, *asic);
    return port;
}

Ref<VLNMPCA_VFAllocationSettingData> allocation_instance(const Virtual_Function& function) {
    auto data = make_instance<VLNMPCA_VFAllocationSettingData>();
    data->InstanceID.set(
        format_text("VLN:EthernetPortAllocationSettingData:%s", function.port_id.c_str()));
    data->ElementName.set(data->InstanceID.value);
    data->ResourceType.set(RESOURCE_TYPE);
    data->ConsumerVisibility.set(CONSUMER_VISIBILITY_VIRTUALIZED);
    data->MappingBehavior.set(MAPPING_DEDICATED);
    return data;
}

Ref<VLNMPCA_LANEndpoint> lan_endpoint_instance(const Owner& owner,
                                               const Virtual_Function& function) {
    auto endpoint = make_instance<VLNMPCA_LANEndpoint>();
    name_in_system(*endpoint, owner.system);
    endpoint->Name.set(function.mac);
    endpoint->ElementName.set(function.mac);
    endpoint->NameFormat.set("Ethernet");
    endpoint->ProtocolIFType.set(IF_TYPE_ETHERNET_CSMACD);
    endpoint->MACAddress.set(function.mac);
    return endpoint;
}

Ref<VLNMPCA_VLANEndpoint> vlan_endpoint_instance(const Owner& owner,
                                                 const Virtual_Function& function) {
    auto endpoint = make_instance<VLNMPCA_VLANEndpoint>();
    name_in_system(*endpoint, owner.system);
    endpoint->Name.set(format_text("%s:%s", owner.serial.c_str(), function.port_id.c_str()));
    endpoint->ElementName.set(format_text("VLAN Endpoint:%s", function.port_id.c_str()));
    endpoint->ProtocolType.set(PROTOCOL_TYPE_OTHER);
    endpoint->OtherTypeDescription.set("vNIC");
    endpoint->ProtocolIFType.set(IF_TYPE_ETHERNET_CSMACD);
    endpoint->MACAddress.set(function.mac);
    return endpoint;
}

// ---- What they are joined by ----

// Both ends, or nothing: what an owner lacks is no fault of its virtual functions.
void join(Instance_Map_Base& store, const Instance* first, const Instance* second) {
    if (first && second)
        associate(store, first, second);
}

const VLNMPCA_NICLogicalDevice* create_logical_device(const Owner& owner,
                                                      const Virtual_Function& function) {
    ProviderAgent& agent = owner.agent;
    const auto* device = insert_instance(agent.m_VLNMPCA_NICLogicalDevice_map,
                                         logical_device_instance(owner, function));
    join(agent.m_VLNMPCA_NICControlledBy_map, owner.pci_device, device);
    join(agent.m_VLNMPCA_SystemVirtualPCIDevice_map, &owner.system, device);
    join(agent.m_VLNMPCA_PCIDeviceConformsToProfile_map, owner.profile, device);
    return device;
}

const VLNMPCA_EthernetPort* create_logical_port(const Owner& owner,
                                                const Virtual_Function& function) {
    ProviderAgent& agent = owner.agent;
    const auto* port =
        insert_instance(agent.m_VLNMPCA_EthernetPort_map, logical_port_instance(owner, function));
    if (!port)
        return nullptr;
    const auto* allocation =
        insert_instance(agent.m_VLNMPCA_VFAllocationSettingData_map, allocation_instance(function));
    join(agent.m_VLNMPCA_VFElementSettingData_map, port, allocation);
    join(agent.m_VLNMPCA_ControlledBy_map, owner.controller, port);
    join(agent.m_VLNMPCA_EthernetPortSystemDevice_map, &owner.system, port);
    return port;
}

void create_endpoints(const Owner& owner, const Virtual_Function& function,
                      const VLNMPCA_EthernetPort& port) {
    ProviderAgent& agent = owner.agent;
    const auto* lan_endpoint =
        insert_instance(agent.m_VLNMPCA_LANEndpoint_map, lan_endpoint_instance(owner, function));
    join(agent.m_VLNMPCA_NICSAPImplementation_map, &port, lan_endpoint);
    join(agent.m_VLNMPCA_VFActiveConnection_map, owner.lan_endpoint, lan_endpoint);
    join(agent.m_VLNMPCA_HostedLANEndpoint_map, &owner.system, lan_endpoint);
    const auto* vlan_endpoint =
        insert_instance(agent.m_VLNMPCA_VLANEndpoint_map, vlan_endpoint_instance(owner, function));
    join(agent.m_VLNMPCA_VFBindsToLANEndpoint_map, lan_endpoint, vlan_endpoint);
    join(agent.m_VLNMPCA_HostedVLANEndpoint_map, &owner.system, vlan_endpoint);
}

void create_virtual_function(const Owner& owner, const AX_NAME& name) {
    Virtual_Function function;
    function.name = name_text(name);
    if (VLN_MethodWrapper::GetVirtualFuncPropertyList(&owner.name, name, &function.properties) !=
        AX_STATUS_OK) {
        VLN_LOG(VLN_ERR, "No VF properties available for VF: %s", function.name.c_str());
        return;
    }
    function.mac = mac_text(function.properties.mac);
    function.port_id = format_text("%s_%d", owner.ethernet_port->DeviceID.value.c_str(),
                                   static_cast<int>(function.properties.functionNumber));
    const auto* device = create_logical_device(owner, function);
    const auto* port = create_logical_port(owner, function);
    join(owner.agent.m_VLNMPCA_LogicalConcreteIdentity_map, port, device);
    if (port)
        create_endpoints(owner, function, *port);
}

// ---- Ports ----

const VLNMPCA_PCIDevice* find_pci_device(const ProviderAgent& agent,
                                         const VLNMPCA_EthernetPort& port) {
    const auto* identity =
        find_first(agent.m_VLNMPCA_ConcreteIdentity_map, [&](const VLNMPCA_ConcreteIdentity& each) {
            return key_eq(each.SystemElement, &port);
        });
    return identity ? cast<VLNMPCA_PCIDevice>(identity->SameElement) : nullptr;
}

Owner owner_of(const Map_Scope& scope, Adapter& adapter, const Port& port,
               const VLNMPCA_EthernetPort& shown) {
    ProviderAgent& agent = scope.agent;
    const auto text_of = [&](const char* description) {
        const String* identity = port_identity(shown, description);
        return identity ? *identity : String();
    };
    return {agent,
            *scope.system,
            adapter.getAdapterNumber(),
            port.getPortIndex(),
            {},
            &shown,
            find_pci_device(agent, shown),
            find_in_system(agent, agent.m_VLNMPCA_LANEndpoint_map, &VLNMPCA_LANEndpoint::Name,
                           shown.DeviceID.value),
            find_port_controller(agent, text_of(IDENTITY_PHYSICAL_PORT)),
            Profile_Maps(agent).find(PROFILE_PCI_DEVICE),
            text_of(IDENTITY_SERIAL)};
}

// False when the port's virtual functions can't be listed.
bool create_for_port(const Map_Scope& scope, Adapter& adapter, const Port& port) {
    ProviderAgent& agent = scope.agent;
    const auto* shown = find_in_system(agent, agent.m_VLNMPCA_EthernetPort_map,
                                       &VLNMPCA_EthernetPort::DeviceID, text(port.getPortName()));
    if (!shown)
        return true;
    if (shown->SRIOVState.is_null() || shown->SRIOVState.value != SRIOV_ON) {
        VLN_LOG(VLN_DBG, "VLNMPCA_NICSrIovSupport::SR-IOV State Disabled ");
        return true;
    }
    Owner owner = owner_of(scope, adapter, port, *shown);
    std::vector<AX_NAME> functions;
    if (!port_name_to_wwn(shown->DeviceID.value, owner.name) ||
        VLN_MethodWrapper::GetVirtualFuncList(&owner.name, &functions) != AX_STATUS_OK)
        return false;
    VLN_LOG(VLN_DBG, "VLNMPCA_NICSrIovSupport::No of virtual functions: [ %d ] for %s",
            static_cast<int>(functions.size()), shown->DeviceID.value.c_str());
    for (const AX_NAME& function : functions)
        create_virtual_function(owner, function);
    return true;
}

} // namespace

uint32 create_virtual_functions(const Map_Scope& scope) {
    uint32 status = MAP_OK;
    for (const auto& adapter : scope.agent.m_pData->adapters)
        if (adapter->getAdapterType() == ADAPTER_NIC)
            for (const auto& port : adapter->getPorts())
                if (!create_for_port(scope, *adapter, *port))
                    status = SKIP_DEVICE;
    return status;
}

void clear_virtual_functions(ProviderAgent& agent) {
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_NICLogicalDevice_map, &agent.m_VLNMPCA_NICControlledBy_map,
             &agent.m_VLNMPCA_SystemVirtualPCIDevice_map,
             &agent.m_VLNMPCA_PCIDeviceConformsToProfile_map,
             &agent.m_VLNMPCA_LogicalConcreteIdentity_map,
             &agent.m_VLNMPCA_VFAllocationSettingData_map,
             &agent.m_VLNMPCA_VFElementSettingData_map, &agent.m_VLNMPCA_VFActiveConnection_map,
             &agent.m_VLNMPCA_VFBindsToLANEndpoint_map})
        store->clear();
}

} // namespace cimple
