// How the speed of a physical port is set, as its controller shows it.
#ifndef VLN_AGENT_HARDWARE_PORT_SPEED_H
#define VLN_AGENT_HARDWARE_PORT_SPEED_H

#include "agent/text.h"
#include "classes/VLNMPCA_PortController.h"
#include "device/library/axapi.h"

namespace cimple {

inline void set_port_speed(VLNMPCA_PortController& controller, const AX_PhyPortSpeed& settings) {
    controller.InterfaceType.set(settings.interfaceType);
    controller.AutoNegSupportedSpeeds.set(text(settings.autoNegSupportedSpeeds));
    controller.ForceSupportedSpeeds.set(text(settings.forceSupportedSpeeds));
    controller.ConfiguredPortSpeed.set(text(settings.configuredPortSpeed));
    controller.PortSpeedMode.set(static_cast<uint16>(settings.portSpeedMode));
    controller.DACCableLength.set(settings.dacCableLength);
}

} // namespace cimple

#endif // VLN_AGENT_HARDWARE_PORT_SPEED_H
