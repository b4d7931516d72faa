// The speed settings of a physical port.
#include "cimple/guard.h"
#include "operations/method_wrapper.h"

#include "device/library/attribute_buffer.h"
#include "operations/operation_frame.h"

#include <cstdio>

namespace cimple {

namespace {

struct Number_Row {
    uint16 identifier;
    const char* label;
    uint32_t AX_PhyPortSpeed::*member;
};

struct Text_Row {
    uint16 identifier;
    const char* label;
    char (AX_PhyPortSpeed::*member)[256];
};

constexpr Number_Row NUMBERS[] = {
    {AX_PA_INTERFACE_TYPE, "_InterfaceType", &AX_PhyPortSpeed::interfaceType},
    {AX_PA_PORT_SPEED_MODE, "_PortSpeedMode", &AX_PhyPortSpeed::portSpeedMode},
    {AX_PA_DAC_CABLE_LENGTH, "_DACCableLength", &AX_PhyPortSpeed::dacCableLength},
};

constexpr Text_Row TEXTS[] = {
    {AX_PA_AUTONEG_SUPPORTED_SPEEDS, "_AutoNegSupportedSpeeds",
     &AX_PhyPortSpeed::autoNegSupportedSpeeds},
    {AX_PA_FORCE_SUPPORTED_SPEEDS, "_ForceSupportedSpeeds", &AX_PhyPortSpeed::forceSupportedSpeeds},
    {AX_PA_CONFIGURED_PORT_SPEED, "_ConfiguredPortSpeed", &AX_PhyPortSpeed::configuredPortSpeed},
};

void readSettings(Attribute_Buffer& buffer, AX_PhyPortSpeed& settings) {
    for (const Number_Row& row : NUMBERS)
        getPortAttributeNumber(buffer, row.identifier, row.label, &(settings.*row.member));
    for (const Text_Row& row : TEXTS) {
        Attribute_Text text;
        getPortAttributeText(text, buffer, row.identifier, row.label);
        std::snprintf(settings.*row.member, sizeof(settings.*row.member), "%s", text);
    }
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetPhyPortSpeedAttributesValues(const HBA_WWN* name,
                                                             AX_PhyPortSpeed* settings) {
    Operation_Frame frame("VLN_MethodWrapper::GetPhyPortSpeedAttributesValues");
    if (!frame.given(settings))
        return frame.status();
    *settings = {};
    AX_STATUS status = AX_STATUS_ERROR;
    const bool complete = run_guarded([&] {
        Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
        status = fetchPortAttributes(wwnOf(name), buffer);
        if (status == AX_STATUS_OK)
            readSettings(buffer, *settings);
        else
            VLN_OPERATION_FAILED(
                status, "GetPhyPortSpeedAttributesValues exited with the error code %d", status);
    });
    if (complete)
        return status;
    VLN_LOG(VLN_ERR, "Unable to allocate the memory for the port attributes");
    return AX_STATUS_ERROR;
}

} // namespace cimple
