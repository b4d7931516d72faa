// Setting the speed of a physical port.
#include "agent/hardware/port_identity.h"
#include "agent/hardware/port_speed.h"
#include "agent/text.h"
#include "services/method_call.h"
#include "services/phy/provider.h"

namespace cimple {

namespace {

using Controller = VLNMPCA_PortController;

constexpr uint16 MODE_CHOSEN = 1; // by the adapter
constexpr uint16 MODE_NAMED = 2;
constexpr uint16 MODE_FORCED = 3;
constexpr uint32 INTERFACE_SFP_PLUS_10G = 4;
constexpr sint32 NO_CABLE_LENGTH = -1;

struct Wanted_Speed {
    uint32 mode;
    const char* speed;
    sint32 cable_length;
};

// ---- The port to be asked ----

// "serial:port number" of an FC port; empty without one of the two.
String physical_port_of(const VLNMPCA_FCPort& port) {
    const String* serial = port_identity(port, IDENTITY_VPD_SERIAL);
    const String* number = port_identity(port, IDENTITY_PORT_NUMBER);
    return serial && number ? format_text("%s:%s", serial->c_str(), number->c_str()) : String();
}

// The name of a port on the physical port: of an FC port, else of an Ethernet port, else empty.
String find_port_name(const ProviderAgent& agent, const String& physical_port) {
    const auto* fc_port = find_first(agent.m_VLNMPCA_FCPort_map, [&](const VLNMPCA_FCPort& port) {
        return physical_port_of(port) == physical_port;
    });
    if (fc_port) {
        VLN_LOG(VLN_DBG, "VLNMPCA_PortController::modify_instance- Successfully got portWWN,%s",
                fc_port->DeviceID.value.c_str());
        return fc_port->DeviceID.value;
    }
    const auto* port =
        find_first(agent.m_VLNMPCA_EthernetPort_map, [&](const VLNMPCA_EthernetPort& each) {
            const String* name = port_identity(each, IDENTITY_PHYSICAL_PORT);
            return name && *name == physical_port;
        });
    if (!port)
        return {};
    VLN_LOG(VLN_DBG, "VLNMPCA_PortController::modify_instance- Successfully Got MAC,%s",
            port->DeviceID.value.c_str());
    return port->DeviceID.value;
}

// ---- What is wanted ----

// The line of the first rule that the arguments break, or null. No library and no lock beside it.
const char* check_wanted(const Controller& model, const Controller& instance) {
    const bool speed = !model.ConfiguredPortSpeed.is_null();
    const bool length = !model.DACCableLength.is_null();
    const uint16 mode = model.PortSpeedMode.value;
    if (model.PortSpeedMode.is_null())
        return speed || length
                   ? "ERROR: VLNMPCA_PortController::modify_instance No PortSpeedMode Specified"
                   : "ERROR: VLNMPCA_PortController::modify_instance Invalid or unsupported value "
                     "specified for mode, "
                     "speed or length parameters.";
    if ((mode == MODE_NAMED || mode == MODE_FORCED) && !speed)
        return "ERROR: VLNMPCA_PortController::modify_instance No ConfiguredPortSpeed Specified";
    // Consoles rely on it that such a port is refused without a length.
    if (!length && mode == MODE_FORCED && instance.InterfaceType.value == INTERFACE_SFP_PLUS_10G)
        return "ERROR: VLNMPCA_PortController::modify_instance Cable Length specified when mode is "
               "FORCE and SFP_PLUS_10GB_TYPE";
    return nullptr;
}

Wanted_Speed read_wanted(const Controller& model) {
    const uint16 mode = model.PortSpeedMode.value;
    const bool length = !model.DACCableLength.is_null() && mode != MODE_CHOSEN;
    return {mode, model.ConfiguredPortSpeed.value.c_str(),
            length ? static_cast<sint32>(model.DACCableLength.value) : NO_CABLE_LENGTH};
}

// ---- The steps ----

sint32 set_speed(ProviderAgent& agent, const Controller& instance, const HBA_WWN& name,
                 const Wanted_Speed& wanted) {
    VLN_LOG(VLN_DBG,
            "VLNMPCA_PortController::modify_instance Cable Length:%d, Mode: %d ,PortSpeed : %s",
            static_cast<int>(wanted.cable_length), static_cast<int>(wanted.mode), wanted.speed);
    const AX_STATUS status =
        VLN_MethodWrapper::SetPhyPortSpeed(&name, wanted.speed, wanted.mode, wanted.cable_length);
    VLN_LOG(VLN_DBG, "found the key match for instance.");
    if (status == AX_STATUS_OK)
        return MODIFY_INSTANCE_OK;
    change(agent.m_VLNMPCA_PortController_map, &instance, [status](Controller& controller) {
        controller.MICallRMStatus.set(METHOD_LIBRARY_STATUS + status);
    });
    return refuse_modify(MODIFY_INSTANCE_FAILED,
                         "ERROR: VLNMPCA_PortController::SetPhyPortSpeed failed");
}

sint32 read_back(ProviderAgent& agent, const Controller& instance, const HBA_WWN& name) {
    AX_PhyPortSpeed settings{};
    if (VLN_MethodWrapper::GetPhyPortSpeedAttributesValues(&name, &settings) != AX_STATUS_OK)
        return refuse_modify(
            MODIFY_INSTANCE_FAILED,
            "ERROR: VLNMPCA_PortController::GetPhyPortSpeedAttributesValues failed");
    change(agent.m_VLNMPCA_PortController_map, &instance,
           [&](Controller& controller) { set_port_speed(controller, settings); });
    VLN_LOG(VLN_DBG, "VLNMPCA_PortController::modify_instance Successfully updated the map.");
    return MODIFY_INSTANCE_OK;
}

sint32 modify(ProviderAgent& agent, const Controller* model, const Controller* instance) {
    if (!model || !instance) {
        VLN_LOG(VLN_DBG, "ERROR: VLNMPCA_PortController::modify_instance invalid parameter");
        return MODIFY_INSTANCE_INVALID_PARAMETER;
    }
    const auto* found = agent.m_VLNMPCA_PortController_map.lookup(instance);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_FAILED,
                             "ERROR: Invalid instance of VLNMPCA_PortController Data");
    HBA_WWN name{};
    if (!nameOfDeviceId(find_port_name(agent, found->DeviceID.value).c_str(), name,
                        "ERROR: VLNMPCA_PortController::modify_instance::", VLN_ERR))
        return MODIFY_INSTANCE_FAILED;
    if (const char* broken = check_wanted(*model, *instance))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, broken);
    if (const sint32 status = set_speed(agent, *instance, name, read_wanted(*model)))
        return status;
    return read_back(agent, *instance, name);
}

} // namespace

sint32 Port_Controller_Provider::modify_instance(const Controller* model,
                                                 const Controller* instance) {
    VLN_LOG(VLN_DBG, "VLNMPCA_PortController::modify_instance()");
    return answer_modify([&](ProviderAgent& agent) { return modify(agent, model, instance); });
}

} // namespace cimple
