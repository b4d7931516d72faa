// The Ethernet port of an iSCSI function, and what stands around it.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/ethernet/ethernet_port.h"
#include "agent/hardware/pci_maps.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_name.h"
#include "agent/iscsi/iscsi_maps.h"
#include "agent/profiles/profile_maps.h"
#include "agent/software/software_identity.h"
#include "classes/VLNMPCA_ControlledBy.h"
#include "classes/VLNMPCA_RegisteredProfile.h"
#include "classes/VLNMPCA_SCSIProtocolController.h"

namespace cimple {

namespace {

constexpr uint16 SRIOV_DISABLED = 2; // only NIC functions have virtual functions

// Null for a port whose address is no MAC address.
Ref<VLNMPCA_EthernetPort> iscsi_port_instance(const iSCSIAdapterAttributes& adapter,
                                              const iSCSIPortAttributes& attributes,
                                              const String& name,
                                              const CIM_ComputerSystem& system) {
    auto port = ethernet_port_instance(adapter, attributes, name, system);
    if (!port)
        return {};
    port->Name.set("iscsi"); // the host has no interface of this port
    port->ElementName.set(name);
    port->LDTO.set(attributes.LDTO);
    port->DefaultETO.set(attributes.DefaultETO);
    port->MaxCDBLength.set(attributes.MaxCDBLength);
    port->SRIOVState.set(SRIOV_DISABLED);
    return port;
}

} // namespace

// The steps of one port, in order. A port without its Ethernet port is left out.
void ISCSI_Map_Builder::createPort(iSCSIAdapter& adapter, Port& iscsi_port) {
    ISCSI_Port port{static_cast<const iSCSIAdapterAttributes&>(*adapter.getAdapterAttributes()),
                    static_cast<const iSCSIPortAttributes&>(*iscsi_port.getPortAttributes()),
                    adapter.getAdapterNumber(), iscsi_port.getPortIndex(),
                    text(iscsi_port.getPortName())};
    port.ethernet_port =
        insert_instance(_agent.m_VLNMPCA_EthernetPort_map,
                        iscsi_port_instance(port.adapter, port.attributes, port.name, *_system),
                        "Insert Failed iSCSI : m_VLNMPCA_EthernetPort_map");
    if (!port.ethernet_port) {
        VLN_LOG(VLN_CRIT, "iSCSI port creation failed");
        return;
    }
    make_class_groups(Group_Place::ISCSI_PORT, {_agent, _system, &iscsi_port, port.ethernet_port});
    joinPort(port);
    joinPortController(port);
    conformPort(port);
    joinConnector(port);
    createEndpoints(port);
    createPCIDevice(port);
}

void ISCSI_Map_Builder::joinPort(const ISCSI_Port& port) {
    if (associate(_agent.m_VLNMPCA_ProtocolControllerForPort_map, _protocol_controller,
                  port.ethernet_port))
        VLN_LOG(VLN_DBG, "VLNMPCA_ProtocolControllerForPort::create() SUCCESFUL");
    associate(_agent.m_VLNMPCA_EthernetPortSystemDevice_map, _system, port.ethernet_port);
}

// The controller conforms to its profile already, as all of them do from the record logs on. The
// driver is tied to it once, by the first of the functions that share it.
void ISCSI_Map_Builder::joinPortController(const ISCSI_Port& port) {
    const auto* controller = find_port_controller(_agent, physical_port_name(port.adapter));
    if (!controller)
        return;
    associate(_agent.m_VLNMPCA_ControlledBy_map, controller, port.ethernet_port, {},
              [&](Instance& controlled_by) {
                  cast<VLNMPCA_ControlledBy>(&controlled_by)
                      ->AccessState.set(access_state(port.attributes.FunctionalPortState));
              });
    if (_driver)
        associate_once(_agent.m_VLNMPCA_ElementSoftwareIdentity_map, _driver, controller, {},
                       software_status({STATUS_CURRENT}));
}

void ISCSI_Map_Builder::conformPort(const ISCSI_Port& port) {
    if (const auto* profile = Profile_Maps(_agent).find(PROFILE_ISCSI_INITIATOR_PORTS))
        associate(_agent.m_VLNMPCA_iSCSIPortConformsToProfile_map, profile, port.ethernet_port,
                  "Insert Failed : m_VLNMPCA_iSCSIPortConformsToProfile_map");
    else
        VLN_LOG(VLN_CRIT, "Missing Profile Registration Profile instance");
}

void ISCSI_Map_Builder::joinConnector(const ISCSI_Port& port) {
    const String name = physical_port_name(port.adapter);
    VLN_LOG(VLN_DBG, "iSCSI Serial Number:PortNumber == %s", name.c_str());
    if (const auto* connector = find_connector(_agent, name))
        associate(_agent.m_VLNMPCA_Realizes_map, connector, port.ethernet_port);
}

void ISCSI_Map_Builder::createPCIDevice(const ISCSI_Port& port) {
    const uint32 status =
        PCI_Maps(_agent, _system)
            .CreatePCIDeviceInstance(
                {port.name, "iSCSI", port.name,
                 format_text("Vorlan:ISCSIAdapter%d", static_cast<int>(port.adapter_number)),
                 _agent.m_VLNMPCA_ConcreteIdentity_map, port.ethernet_port});
    if (status != MAP_OK && status != SKIP_DEVICE)
        VLN_LOG(VLN_CRIT, "CreatePCIDeviceInstance failed");
}

} // namespace cimple
