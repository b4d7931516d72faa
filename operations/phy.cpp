// The speed settings of a physical port and of its PHY.
#include "cimple/guard.h"
#include "operations/method_wrapper.h"

#include "device/library/attribute_buffer.h"
#include "operations/operation_frame.h"

#include <cstdio>

namespace cimple {

namespace {

constexpr uint32 FEATURE_CABLE_DIAGNOSTICS = 428;
constexpr uint32 FEATURE_LINE_RATE = 429;
constexpr uint32 MIN_NVP = 1; // percent
constexpr uint32 MAX_NVP = 100;
constexpr uint32 MAX_LINE_RATE = 3;

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

// The status with which a setting ends whose feature the adapter lacks, or can't tell; else 0.
AX_STATUS test_feature(const HBA_WWN* name, uint32 feature, const char* setting) {
    uint32 value = 0;
    AX_STATUS status = AX_GetHBAFeature(wwnOf(name), feature, &value);
    if (status == AX_STATUS_OK && value == 0)
        status = AX_STATUS_NOT_SUPPORTED;
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "%s setting is not supported, exited with the error code %d",
                             setting, static_cast<int>(status));
    return status;
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

AX_STATUS VLN_MethodWrapper::SetPhyPortSpeed(const HBA_WWN* name, const char* speed, uint32 mode,
                                             sint32 cableLength) {
    Operation_Frame frame("VLN_MethodWrapper::SetPhyPortSpeed");
    if (!frame.given(speed))
        return frame.status();
    const AX_STATUS status = AX_SetPhyPortSpeedSettings(wwnOf(name), speed, mode, cableLength);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetPhyPortSpeed exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetCableNVP(const HBA_WWN* name, uint32 percent) {
    Operation_Frame frame("VLN_MethodWrapper::SetCableNVP");
    if (percent < MIN_NVP || percent > MAX_NVP) {
        VLN_LOG(VLN_ERR, "Invalid CableNVP value, Vaild value b/n 1 - 100");
        return AX_STATUS_ERROR;
    }
    if (const AX_STATUS status = test_feature(name, FEATURE_CABLE_DIAGNOSTICS, "SetCableNVP"))
        return status;
    const AX_STATUS status = AX_DiagSetNVP(wwnOf(name), percent);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetCableNVP exited with the error code %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetLineRateAdvertised(const HBA_WWN* name, uint32 rate) {
    Operation_Frame frame("VLN_MethodWrapper::SetLineRateAdvertised");
    if (rate > MAX_LINE_RATE) {
        VLN_LOG(VLN_ERR, "Invalid Line Rate Passed");
        return AX_STATUS_ERROR;
    }
    if (const AX_STATUS status = test_feature(name, FEATURE_LINE_RATE, "LineRateAdvertised"))
        return status;
    const AX_STATUS status =
        AX_SetAdapterAttribute(wwnOf(name), AX_PA_LINE_RATE_ADVERTISED, &rate, sizeof rate);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "SetLineRateAdvertised exited with the error code %d", status);
    return status;
}

} // namespace cimple
