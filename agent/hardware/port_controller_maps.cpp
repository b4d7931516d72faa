// The controller of a physical port, shared by all functions on that port.

#include "agent/adapter_map_builder.h"
#include "agent/associations.h"
#include "agent/hardware/physical_port.h"
#include "agent/hardware/port_name.h"
#include "agent/hardware/port_speed.h"
#include "agent/profiles/profile_maps.h"
#include "agent/state_tables.h"
#include "agent/text.h"
#include "classes/VLNMPCA_ControlledBy.h"
#include "classes/VLNMPCA_RegisteredProfile.h"

namespace cimple {

namespace {

constexpr uint16 CONTROLLER_TYPE_ETHERNET = 2; // CIM_PortController.ControllerType
constexpr uint16 PROTOCOL_SUPPORTED_OTHER = 1; // CIM_Controller.ProtocolSupported
constexpr uint16 AVAILABILITY_RUNNING = 3;     // CIM_LogicalDevice.Availability
constexpr uint16 STATE_NOT_APPLICABLE = 5;     // EnabledState and RequestedState of a controller
constexpr uint16 ENABLED_DEFAULT_ENABLED = 2;

Ref<VLNMPCA_PortController> port_controller_instance(const NICAdapterAttributes& adapter,
                                                     const NICPortAttributes& attributes,
                                                     const String& serial_and_number,
                                                     const CIM_ComputerSystem& system) {
    auto controller = make_instance<VLNMPCA_PortController>();
    const String name = format_text("%s:%s:%d", adapter.Model.c_str(), adapter.SerialNumber.c_str(),
                                    static_cast<int>(adapter.PortNumber));
    controller->Description.set(text(adapter.ModelDescription));
    controller->ElementName.set(name);
    controller->Name.set(name);
    name_in_system(*controller, system);
    controller->DeviceID.set(serial_and_number);
    controller->ControllerType.set(CONTROLLER_TYPE_ETHERNET);
    controller->ProtocolSupported.set(PROTOCOL_SUPPORTED_OTHER);
    controller->MaxNumberControlled.set(adapter.numberOfPorts);
    controller->ProtocolDescription.set("Multiple Protocols FCoE+NIC,iSCSI+NIC,NIC");
    controller->Availability.set(AVAILABILITY_RUNNING);
    controller->EnabledState.set(STATE_NOT_APPLICABLE);
    controller->RequestedState.set(STATE_NOT_APPLICABLE);
    controller->EnabledDefault.set(ENABLED_DEFAULT_ENABLED);
    controller->SubAdapterId.set(text(adapter.Subadapter_number));
    controller->PhyLinkDownReason.set(attributes.PhyLinkDownReason);
    append_port_state(controller.get(),
                      find_port_state(portControllerStateMap, attributes.FunctionalPortState));
    return controller;
}

// How the port's speed is set, as far as the adapter tells.
void read_port_speed(VLNMPCA_PortController& controller, const String& port_name) {
    HBA_WWN wwn{};
    AX_PhyPortSpeed settings{};
    if (!port_name_to_wwn(port_name, wwn) ||
        VLN_MethodWrapper::GetPhyPortSpeedAttributesValues(&wwn, &settings) != AX_STATUS_OK)
        return;
    set_port_speed(controller, settings);
}

} // namespace

// What belongs to the controller alone is made with it, and so once for all functions of the port.
void Adapter_Map_Builder::findOrMakePortController(NIC_Port& port) {
    auto& controllers = _agent.m_VLNMPCA_PortController_map;
    const auto count = static_cast<std::size_t>(controllers.size());
    VLN_LOG(VLN_DBG, "inside Port controller %zu", count);
    port.port_controller = find_port_controller(_agent, port.serial_and_number);
    if (port.port_controller)
        return;
    VLN_LOG(VLN_DBG, "create Port controller instance %zu", count);
    auto controller = port_controller_instance(*port.function.attributes, *port.attributes,
                                               port.serial_and_number, *_system);
    read_port_speed(*controller, port.name);
    port.port_controller = insert_instance(controllers, controller);
    port.new_port_controller = true;
    joinPortController(port);
}

void Adapter_Map_Builder::joinPortController(const NIC_Port& port) {
    associate(_agent.m_VLNMPCA_ProductPortControllerComponent_map, port.function.product,
              port.port_controller, "Insert Failed (CNA): VLNMPCA_ProductPortControllerComponent");
    associate(_agent.m_VLNMPCA_CardRealizesPortController_map, port.function.card,
              port.port_controller,
              {"Insert Failed (CNA): m_VLNMPCA_CardRealizesPortController_map", VLN_DBG});
    associate(_agent.m_VLNMPCA_PortControllerConformsToProfile_map,
              Profile_Maps(_agent).find(PROFILE_REGISTRATION), port.port_controller);
    joinFirmwareToController(port);
    VLN_LOG(VLN_DBG, "Generating VLNMPCA_PortControllerSystemDevice (MPCA Port Controller:%s)",
            port.serial_and_number.c_str());
    associate(_agent.m_VLNMPCA_PortControllerSystemDevice_map, _system, port.port_controller);
    associate(_agent.m_VLNMPCA_PortControllerRealizes_map, port.connector, port.port_controller);
}

void Adapter_Map_Builder::joinControlledBy(const NIC_Port& port) {
    associate(_agent.m_VLNMPCA_ControlledBy_map, port.port_controller, port.ethernet_port, {},
              [&](Instance& controlled_by) {
                  cast<VLNMPCA_ControlledBy>(&controlled_by)
                      ->AccessState.set(access_state(port.attributes->FunctionalPortState));
              });
}

} // namespace cimple
