#include "services/virtual_ports/instances.h"

#include "agent/associations.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/VLNMPCA_FCPort.h"
#include "classes/VLNMPCA_ResourcePool.h"
#include "classes/VLNMPCA_VMSystemDevice.h"
#include "classes/VLNMPCA_VirtualDeviceSAPImplementation.h"
#include "classes/VLNMPCA_VirtualFCPort.h"
#include "device/scan_end.h"
#include "foundation/common.h"
#include "services/virtual_ports/unit_maps.h"

#include <initializer_list>

namespace cimple {

namespace {

constexpr char STEP[] = "VLNMPCA_PortVirtualization::CreatePortVirtualizationClasses::";

Ref<VLNMPCA_ResourcePool> pool_instance(const String& port_id) {
    auto pool = make_instance<VLNMPCA_ResourcePool>();
    pool->InstanceID.set(format_text("VLN:Resource Pool:%s", port_id.c_str()));
    pool->ElementName.set(pool->InstanceID.value);
    pool->PoolID.set(pool->InstanceID.value);
    pool->Primordial.set(false);
    return pool;
}

Ref<VLNMPCA_VirtualFCPort> port_instance(const CIM_ComputerSystem& system, const String& id,
                                         const String& node_name,
                                         const AX_VPortAttributes& attributes) {
    auto port = make_instance<VLNMPCA_VirtualFCPort>();
    name_in_system(*port, system);
    port->CreationClassName.set(VIRTUAL_PORT_CLASS);
    port->DeviceID.set(id);
    port->Name.set(id);
    port->NodeWWN.set(node_name);
    port->PortFCId.set(attributes.fcId);
    port->VPortName.set(field_text(attributes.name));
    port->EnabledState.set(enabled_state(attributes.state));
    return port;
}

class VLN_PortVirtualization {
public:
    explicit VLN_PortVirtualization(const Map_Scope& scope)
        : _agent(scope.agent), _system(*scope.system), _units(scope.agent, *scope.system) {
        VLN_LOG(VLN_DBG, "VLN_PortVirtualization::Constructor");
    }
    ~VLN_PortVirtualization() { VLN_LOG(VLN_DBG, "VLN_PortVirtualization::Destructor"); }

    uint32 CreatePortVirtualizationClasses();

private:
    bool createForPort(const VLNMPCA_FCPort& port);
    const VLNMPCA_ResourcePool* createPool(const VLNMPCA_FCPort& port);
    void createPort(const VLNMPCA_FCPort& carrier, const HBA_WWN& carrier_name,
                    const VLNMPCA_ResourcePool& pool, const AX_VPort& listed);
    void joinMachine(const Virtual_Port& port);

    ProviderAgent& _agent;
    const CIM_ComputerSystem& _system;
    Virtual_Unit_Maps _units;
};

uint32 VLN_PortVirtualization::CreatePortVirtualizationClasses() {
    VLN_LOG(VLN_DBG, "VLN_PortVirtualization::CreatePortVirtualizationClasses");
    const auto& ports = _agent.m_VLNMPCA_FCPort_map;
    VLN_LOG(VLN_DBG, "No of FC Ports: %d", static_cast<int>(ports.size()));
    uint32 status = MAP_OK;
    for (uint32 i = 0; i < ports.size(); ++i)
        if (!createForPort(*ports[i]))
            status = SKIP_DEVICE;
    return status;
}

// False when there is no pool for the port's virtual ports.
bool VLN_PortVirtualization::createForPort(const VLNMPCA_FCPort& port) {
    const char* const id = port.DeviceID.value.c_str();
    VLN_LOG(VLN_DBG, "FC Port ID: %s", id);
    HBA_WWN name{};
    if (!nameOfDeviceId(id, name, STEP, VLN_ERR))
        return true;
    std::vector<AX_VPort> listed;
    if (const AX_STATUS status = VLN_MethodWrapper::ListVPorts(&name, &listed)) {
        VLN_LOG(VLN_ERR,
                "VLNMPCA_PortVirtualization::Failure in listing vports for port: %s, AX Error: %d",
                id, static_cast<int>(status));
        return true;
    }
    VLN_LOG(VLN_DBG, "No of vports:%d for %s", static_cast<int>(listed.size()), id);
    if (listed.empty())
        return true;
    const VLNMPCA_ResourcePool* pool = createPool(port);
    if (!pool)
        return false;
    for (const AX_VPort& each : listed)
        if (!scan_is_to_end)
            createPort(port, name, *pool, each);
    return true;
}

const VLNMPCA_ResourcePool* VLN_PortVirtualization::createPool(const VLNMPCA_FCPort& port) {
    VLN_LOG(VLN_DBG, "Creating Resource pool ");
    const auto* pool =
        insert_instance(_agent.m_VLNMPCA_ResourcePool_map, pool_instance(port.DeviceID.value));
    if (!pool) {
        VLN_LOG(VLN_ERR, "Failed to create ResourcePool");
        return nullptr;
    }
    VLN_LOG(VLN_DBG, "Resource Pool created and inserted in map");
    VLN_LOG(VLN_DBG, "Creating HostedResource pool ");
    if (!associate(_agent.m_VLNMPCA_HostedResourcePool_map, &_system, pool)) {
        VLN_LOG(VLN_ERR, "Failed to create HostedResourcePool");
        return nullptr;
    }
    VLN_LOG(VLN_DBG, "HostedResource Pool created and inserted in map");
    return pool;
}

void VLN_PortVirtualization::createPort(const VLNMPCA_FCPort& carrier, const HBA_WWN& carrier_name,
                                        const VLNMPCA_ResourcePool& pool, const AX_VPort& listed) {
    Virtual_Port port{carrier.DeviceID.value, text(VLN_Common::wwnText(listed.wwpn.byte)),
                      carrier_name};
    const String node_name = text(VLN_Common::wwnText(listed.wwnn.byte));
    VLN_LOG(VLN_DBG, "VPort Id :%s Node name: %s", port.id.c_str(), node_name.c_str());
    if (!nameOfDeviceId(port.id.c_str(), port.name, STEP, VLN_DBG))
        return;
    AX_VPortAttributes attributes{};
    if (const AX_STATUS status =
            VLN_MethodWrapper::ListVPortAttributes(&carrier_name, &port.name, &attributes)) {
        VLN_LOG(VLN_ERR,
                "VLNMPCA_PortVirtualization::Failure in listing vports information for port: %s, "
                "AX Error: %d",
                port.id.c_str(), static_cast<int>(status));
        return;
    }
    port.shown = insert_instance(_agent.m_VLNMPCA_VirtualFCPort_map,
                                 port_instance(_system, port.id, node_name, attributes));
    if (!port.shown) {
        VLN_LOG(VLN_ERR, "Failed to create VirtualFCPort");
        return;
    }
    associate(_agent.m_VLNMPCA_VPortHostedDependency_map, &carrier, port.shown);
    associate(_agent.m_VLNMPCA_ElementAllocatedFromPool_map, &pool, port.shown);
    joinMachine(port);
    _units.CreateVPortTargets(port);
}

// A port that no virtual machine uses is the host's device all the same.
void VLN_PortVirtualization::joinMachine(const Virtual_Port& port) {
    std::string machine;
    const bool is_used = VLN_MethodWrapper::ListVMfromVPort(&port.carrier_name, &port.name,
                                                            &machine) == AX_STATUS_OK;
    associate(_agent.m_VLNMPCA_VMSystemDevice_map, &_system, port.shown, {}, [&](Instance& joined) {
        auto& device = *cast<VLNMPCA_VMSystemDevice>(&joined);
        device.VirtualPortId.set(port.id);
        if (is_used)
            device.VMName.set(text(machine));
    });
}

// Those in the store that FC ports have in it too.
void remove_initiators(ProviderAgent& agent) {
    const auto& links = agent.m_VLNMPCA_VirtualDeviceSAPImplementation_map;
    auto& initiators = agent.m_VLNMPCA_SCSIProtocolInitiatorEndpoint_map;
    for (uint32 i = links.size(); i-- > 0;) {
        const sint32 place = initiators.find(links[i]->Dependent);
        if (place >= 0)
            initiators.remove(static_cast<uint32>(place));
    }
}

} // namespace

uint32 create_virtual_ports(const Map_Scope& scope) {
    const uint32 status = VLN_PortVirtualization(scope).CreatePortVirtualizationClasses();
    if (scan_is_to_end)
        scope.agent.m_bAdapterRefreshRequested = true; // this one is left at a part of them
    return status;
}

void ClearPortVirtualizationMaps(ProviderAgent& agent) {
    VLN_LOG(VLN_DBG, "ClearPortVirtualizationMaps for FCoE invoked");
    remove_initiators(agent);
    for (Instance_Map_Base* store : std::initializer_list<Instance_Map_Base*>{
             &agent.m_VLNMPCA_ResourcePool_map, &agent.m_VLNMPCA_HostedResourcePool_map,
             &agent.m_VLNMPCA_ElementAllocatedFromPool_map, &agent.m_VLNMPCA_VirtualFCPort_map,
             &agent.m_VLNMPCA_VMSystemDevice_map, &agent.m_VLNMPCA_VPortHostedDependency_map,
             &agent.m_VLNMPCA_VirtualDeviceSAPImplementation_map,
             &agent.m_VLNMPCA_VirtualSCSIProtocolTargetEndpoint_map,
             &agent.m_VLNMPCA_VirtualLocalHostedAccessPoint_map,
             &agent.m_VLNMPCA_VirtualStorageVolume_map,
             &agent.m_VLNMPCA_VirtualStorageVolumeSystemDevice_map,
             &agent.m_VLNMPCA_VirtualSCSIInitiatorTargetLogicalUnitPath_map,
             &agent.m_VLNMPCA_VPortElementSettingData_map})
        store->clear();
    VLN_LOG(VLN_DBG, "Exiting ClearPortVirtualizationMaps ");
}

} // namespace cimple
