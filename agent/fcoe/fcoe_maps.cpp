// The order of the FCoE stretch, and the FC ports themselves.

#include "agent/fcoe/fcoe_maps.h"

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/element_setting.h"
#include "agent/fcoe/fc_port_maps.h"
#include "agent/hardware/pci_maps.h"
#include "agent/hardware/port_name.h"
#include "agent/profiles/profile_maps.h"
#include "agent/status/dynamic_status.h"
#include "agent/text.h"
#include "cimple/guard.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_ElementPFCThrottle.h"
#include "classes/VLNMPCA_FCPortStatistics.h"
#include "classes/VLNMPCA_PFCThrottle.h"

namespace cimple {

namespace {

constexpr char LINE[] = "**************************************************";

FC_Function function_of(Adapter& adapter, Port& port) {
    const auto& attributes =
        static_cast<const FCoEAdapterAttributes&>(*adapter.getAdapterAttributes());
    const std::string& serial = attributes.SerialNumber;
    const std::string& name = port.getPortName();
    return {attributes,
            static_cast<const FCoEPortAttributes&>(*port.getPortAttributes()),
            port,
            adapter.getAdapterNumber(),
            text(name),
            format_text("%s:%s", serial.c_str(), name.c_str()),
            physical_port_name(attributes)};
}

} // namespace

uint32 FCoE_Map_Builder::run() {
    uint32 status = MAP_OK;
    if (run_guarded([&] { status = createClasses(); }))
        return status;
    VLN_LOG(VLN_DBG, " Exception in FCoE Card discovery");
    return MAP_OK;
}

uint32 FCoE_Map_Builder::createClasses() {
    if (!_agent.m_pData) {
        VLN_LOG(VLN_CRIT, "Could not locate the data pointer for FCoE - Serious issue");
        return MAP_OK;
    }
    if (!_agent.m_pData->hasFCoEAdapter) {
        VLN_LOG(VLN_DBG, "No FCoE Card found");
        return MAP_OK;
    }
    VLN_LOG(VLN_DBG, "MPCA FCoE Adapter present");
    if (const uint32 status = make_class_groups(Group_Place::FCOE, {_agent, _system}))
        return status;
    createWebLaunch();
    if (const uint32 status = createDriverIdentity())
        return status;
    createFCPorts();
    return make_class_groups(Group_Place::FC_PORTS, {_agent, _system});
}

void FCoE_Map_Builder::createFCPorts() {
    for (const auto& adapter : _agent.m_pData->adapters) {
        const auto number = static_cast<int>(adapter->getAdapterNumber());
        VLN_LOG(VLN_DBG, "Creating classes for adapter %d.", number);
        if (adapter->getAdapterType() != ADAPTER_FCOE) {
            VLN_LOG(VLN_DBG, "Skippping Adapter [%s] since it is not an FCoE Adapter",
                    adapter->getAdapterName().c_str());
            continue;
        }
        for (const auto& port : adapter->getPorts()) {
            VLN_LOG(VLN_DBG, "%s", LINE);
            VLN_LOG(VLN_DBG, "%s", LINE);
            VLN_LOG(VLN_DBG, "Creating classes for adapter %d and port %d.", number,
                    static_cast<int>(port->getPortIndex()));
            createFCPort(function_of(*adapter, *port));
        }
    }
}

// The steps of one port, in order, up to the first that leaves it.
void FCoE_Map_Builder::createFCPort(FC_Function function) {
    const bool complete =
        createPort(function) && createPFCThrottle(function) && createStatistics(function) &&
        joinConnector(function) && joinPortController(function) && joinWWNService(function) &&
        createInitiatorEndpoint(function) && joinFirmware(function) && joinEthernetPorts(function);
    if (!complete)
        return;
    createPCIDevice(function);
    makePortGroups(function);
}

bool FCoE_Map_Builder::createPort(FC_Function& function) {
    function.fc_port =
        insert_instance(_agent.m_VLNMPCA_FCPort_map, CreateFCPort(function, *_system));
    if (!function.fc_port)
        return false;
    Profile_Maps(_agent).createFCPortConforms(
        format_text("FC Port %s, FC Initiator Port", function.serial_and_name.c_str()),
        PROFILE_FCOE_INITIATOR_PORTS, function.fc_port);
    return associate(_agent.m_VLNMPCA_FCSystemDevice_map, _system, function.fc_port);
}

bool FCoE_Map_Builder::createPFCThrottle(const FC_Function& function) {
    if (!has_pfc_throttle(function.adapter))
        return true;
    const auto* throttle =
        insert_instance(_agent.m_VLNMPCA_PFCThrottle_map, pfc_throttle_instance(function));
    if (!throttle) {
        VLN_LOG(VLN_DBG, "Failed to create VLNMPCA_PFCThrottle");
        return false;
    }
    const auto* setting =
        associate(_agent.m_VLNMPCA_ElementPFCThrottle_map, function.fc_port, throttle, {},
                  [](Instance& setting) {
                      cast<VLNMPCA_ElementPFCThrottle>(&setting)->IsCurrent.set(SETTING_IS);
                  });
    if (!setting)
        VLN_LOG(VLN_DBG, "Failed to create VLNMPCA_ElementPFCThrottle");
    return setting != nullptr;
}

// The counters are read at once: a client that gets the instance by its name, or that comes just
// after a refresh, sees them too.
bool FCoE_Map_Builder::createStatistics(const FC_Function& function) {
    auto read = port_statistics_instance(function);
    readFCoEPortStatistics(function.port, *read);
    const auto* statistics = insert_instance(_agent.m_VLNMPCA_FCPortStatistics_map, read);
    return statistics &&
           associate(_agent.m_VLNMPCA_ElementStatisticalData_map, function.fc_port, statistics);
}

// A port whose registers can't be read lacks that instance alone.
void FCoE_Map_Builder::createPCIDevice(const FC_Function& function) {
    const uint32 status =
        PCI_Maps(_agent, _system)
            .CreatePCIDeviceInstance(
                {function.name, "FCoE", function.name,
                 format_text("Vorlan:FCOEAdapter%d", static_cast<int>(function.adapter_number)),
                 _agent.m_VLNMPCA_FCConcreteIdentity_map, function.fc_port});
    if (status != MAP_OK && status != SKIP_DEVICE)
        VLN_LOG(VLN_DBG, "CreatePCIDeviceInstance failed");
}

void FCoE_Map_Builder::makePortGroups(const FC_Function& function) {
    make_class_groups(Group_Place::FC_PORT,
                      {_agent, _system, &function.port, function.fc_port, _first_adapter});
    if (function.port.getPortIndex() == 0)
        _first_adapter = false;
}

} // namespace cimple
