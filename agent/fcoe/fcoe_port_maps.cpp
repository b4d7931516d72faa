// What an FC port is joined with: its hardware, the Ethernet ports beside it, services, firmware.

#include "agent/fcoe/fcoe_maps.h"

#include "agent/associations.h"
#include "agent/fcoe/fc_port_maps.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_identity.h"
#include "agent/software/software_identity.h"
#include "agent/state_tables.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_FCControlledBy.h"
#include "classes/VLNMPCA_FCWWNService.h"
#include "classes/VLNMPCA_SCSIProtocolInitiatorEndpoint.h"
#include "classes/VLNMPCA_VLANEndpoint.h"

namespace cimple {

namespace {

bool equal(const String* first, const String* second) {
    return first && second && *first == *second;
}

// The two ports are functions of one physical port.
bool is_pair(const VLNMPCA_EthernetPort& ethernet_port, const VLNMPCA_FCPort& fc_port) {
    if (ethernet_port.PortNumber.value != fc_port.PortNumber.value)
        return false;
    VLN_LOG(VLN_DBG, "Port Number matched");
    if (!equal(port_identity(ethernet_port, IDENTITY_SERIAL),
               port_identity(fc_port, IDENTITY_VPD_SERIAL)))
        return false;
    VLN_LOG(VLN_DBG, "other identifying info matched");
    return true;
}

// A virtual port is one channel of a physical port: a guest beside the FC port, not its host. Its
// VLAN endpoint tells.
bool is_virtual(const ProviderAgent& agent, const VLNMPCA_EthernetPort& port) {
    const String* serial = port_identity(port, IDENTITY_SERIAL);
    if (!serial)
        return false;
    const String name = format_text("%s:%s", serial->c_str(), port.DeviceID.value.c_str());
    const auto* endpoint =
        find_in_system(agent, agent.m_VLNMPCA_VLANEndpoint_map, &VLNMPCA_VLANEndpoint::Name, name);
    return endpoint && endpoint->OtherTypeDescription.value == "vNIC";
}

} // namespace

// Without a NIC function on the physical port there is no connector.
bool FCoE_Map_Builder::joinConnector(const FC_Function& function) {
    VLN_LOG(VLN_DBG, "FC Port Serial Number:PortNumber == %s", function.serial_and_number.c_str());
    const auto* connector = find_connector(_agent, function.serial_and_number);
    return !connector || associate(_agent.m_VLNMPCA_FCRealizes_map, connector, function.fc_port);
}

// Any of the Ethernet ports of the pair leads to the same controller.
bool FCoE_Map_Builder::joinPortController(const FC_Function& function) {
    const auto* ethernet_port =
        find_first(_agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& candidate) {
            return is_pair(candidate, *function.fc_port);
        });
    const auto* controller =
        ethernet_port ? find_port_controller(_agent, function.serial_and_number) : nullptr;
    if (!controller)
        return true;
    VLN_LOG(VLN_DBG, "MAC address matched matched");
    return associate(_agent.m_VLNMPCA_FCControlledBy_map, controller, function.fc_port, {},
                     [&](Instance& controlled_by) {
                         cast<VLNMPCA_FCControlledBy>(&controlled_by)
                             ->AccessState.set(
                                 access_state(function.attributes.FunctionalPortState));
                     });
}

bool FCoE_Map_Builder::joinWWNService(const FC_Function& function) {
    const auto& services = _agent.m_VLNMPCA_FCWWNService_map;
    return services.size() == 0 ||
           associate_as(_agent.m_VLNMPCA_FCWWNServiceAffectsFCPort_map,
                        format_text("FCOE FC WWN Management Service Affects FCPort: %s",
                                    function.name.c_str()),
                        function.fc_port, services[0]);
}

bool FCoE_Map_Builder::createInitiatorEndpoint(const FC_Function& function) {
    const auto* endpoint = insert_instance(_agent.m_VLNMPCA_SCSIProtocolInitiatorEndpoint_map,
                                           initiator_endpoint_instance(function.name, *_system));
    return endpoint &&
           associate(_agent.m_VLNMPCA_DeviceSAPImplementation_map, function.fc_port, endpoint) &&
           associate_as(
               _agent.m_VLNMPCA_LocalHostedInitiatorAccessPoint_map,
               format_text("Local SCSI Protocol Endpoint %s", function.serial_and_name.c_str()),
               _system, endpoint);
}

// The firmware is that of the ASIC; its identity is made with the NIC functions.
bool FCoE_Map_Builder::joinFirmware(const FC_Function& function) {
    const auto* firmware = find_firmware(_agent.m_VLNMPCA_SoftwareIdentity_map, function.adapter);
    if (!firmware)
        return true;
    return associate_as(_agent.m_VLNMPCA_FCPortSoftwareIdentity_map,
                        format_text("Software Identity (Firmware) %s:%s",
                                    function.adapter.SerialNumber.c_str(),
                                    firmware->VersionString.value.c_str()),
                        firmware, function.fc_port, {},
                        software_status({STATUS_CURRENT, STATUS_NEXT, STATUS_ON_PORT}));
}

// The FC port depends on its ASIC's Ethernet side as a whole: port numbers play no part.
bool FCoE_Map_Builder::joinEthernetPorts(const FC_Function& function) {
    const auto& ports = _agent.m_VLNMPCA_EthernetPort_map;
    const String* asic = port_identity(*function.fc_port, IDENTITY_ASIC);
    for (uint32 i = 0; i < ports.size(); ++i) {
        if (!equal(port_identity(*ports[i], IDENTITY_ASIC), asic) || is_virtual(_agent, *ports[i]))
            continue;
        if (!associate(_agent.m_VLNMPCA_HostedDependency_map, ports[i], function.fc_port))
            return false;
        VLN_LOG(VLN_DBG, "created HostedDependencyInstance");
    }
    return true;
}

} // namespace cimple
