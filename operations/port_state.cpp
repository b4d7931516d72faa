// What switches a port: enabled or not, with virtual functions or without.
#include "cimple/guard.h"
#include "device/library/attribute_buffer.h"
#include "operations/adapter_profiles.h"
#include "operations/orrigan_rules.h"

namespace cimple {

namespace {

constexpr uint32 FEATURE_SET_SRIOV = 435;

constexpr AX_STATUS BOOT_CODE_ENABLED = 221;
constexpr uint32 NEEDS_RESET = 5; // of what AX_SetPortEnabled tells

constexpr AX_STATUS PROFILE_FORBIDS_DISABLING = 2;
constexpr AX_STATUS MULTICHANNEL_FORBIDS_ENABLING = 4;

AX_STATUS mayDisable(const HBA_WWN* name) {
    Adapter_Profiles list;
    if (const AX_STATUS status = list.read(name))
        return status;
    const auto profiles = list.profiles();
    if (std::none_of(profiles.begin(), profiles.end(), [&](const AX_Profile& profile) {
            return profile.id == list.list().activeProfileId && isEtsDisabled(profile);
        }))
        return AX_STATUS_OK;
    VLN_LOG(VLN_ERR,
            " NIC ETS Disabled profile must be deconfigured before SR-IOV can be disabled");
    return PROFILE_FORBIDS_DISABLING;
}

AX_STATUS mayEnable(const HBA_WWN* name) {
    AX_AdapterPortConfig config{};
    if (const AX_STATUS status = AX_GetAdapterPortConfig(wwnOf(name), &config)) {
        VLN_OPERATION_FAILED(status, "AX_GetAdapterPortConfig error: %d", status);
        return status;
    }
    if (config.mcType == 0)
        return AX_STATUS_OK;
    VLN_LOG(VLN_ERR, " SRIOV cannot cannot be enabled if multichannel is enabled.");
    VLN_LOG(VLN_ERR, "MCType: %d", config.mcType);
    return MULTICHANNEL_FORBIDS_ENABLING;
}

// What profile and multichannel forbid, on an adapter that has them.
AX_STATUS mayChange(const HBA_WWN* name, bool enable) {
    uint32 managed = 0;
    if (const AX_STATUS status =
            AX_GetHBAFeature(wwnOf(name), FEATURE_PROFILE_MANAGEMENT, &managed)) {
        VLN_OPERATION_FAILED(status, "unable to determine if adapter supports Profile Management.");
        return status;
    }
    if (managed == 0)
        return AX_STATUS_OK;
    return enable ? mayEnable(name) : mayDisable(name);
}

} // namespace

AX_STATUS VLN_MethodWrapper::SetPortEnabled(const char* deviceId, bool enabled, uint32* dynamic) {
    Operation_Frame frame("VLN_MethodWrapper::SetPortEnabled");
    HBA_WWN name{};
    if (!frame.given(dynamic))
        return frame.status();
    if (!nameOfDeviceId(deviceId, name, "VLN_MethodWrapper::SetPortEnabled::", VLN_ERR))
        return AX_STATUS_ERROR;
    const AX_STATUS status = AX_SetPortEnabled(wwnOf(&name), enabled, dynamic);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_SetPortEnabled exited with the error code %d", status);
    if (status == BOOT_CODE_ENABLED) {
        VLN_LOG(VLN_ERR, "SetPortEnabled::One or more port Functions have Boot Code enabled");
        VLN_LOG(VLN_ERR, "Please disable boot Code and try again");
    }
    if (status == AX_STATUS_OK && *dynamic == NEEDS_RESET)
        VLN_LOG(VLN_WARN, "Please reset the HBA to activate the new setting");
    return status;
}

AX_STATUS VLN_MethodWrapper::SetSRIOVEnabledState(const HBA_WWN* name, uint32 state) {
    Operation_Frame frame("VLN_MethodWrapper::SetSRIOVEnabledState");
    if (!frame.offers(name, {FEATURE_SRIOV_OF_SYSTEM,
                             "Unable to determine if operating system supports SR-IOV.",
                             "SR-IOV not supported on this operating system. Operation "
                             "disallowed."}) ||
        !frame.offers(name,
                      {FEATURE_SET_SRIOV, " Unable to determine if SRIOV is settable",
                       " SR-IOV not settable on this adapter or current adapter configuration. "}))
        return frame.status();
    if (const AX_STATUS status = mayChange(name, state != 0))
        return status;
    const AX_STATUS status =
        AX_SetAdapterAttribute(wwnOf(name), AX_PA_SRIOV_STATE, &state, sizeof state);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, " Operation failure. SRIOV State has not been set");
    return status;
}

AX_STATUS VLN_MethodWrapper::GetSRIOVState(const HBA_WWN* name, uint32* state) {
    Operation_Frame frame("VLN_MethodWrapper::GetSRIOVState");
    if (!frame.given(state))
        return frame.status();
    AX_STATUS status = AX_STATUS_ERROR;
    const bool complete = run_guarded([&] {
        Attribute_Buffer buffer(AX_PORT_ATTRIBUTES_SIZE);
        status = fetchPortAttributes(wwnOf(name), buffer);
        if (status == AX_STATUS_OK)
            status = getPortAttributeNumber(buffer, AX_PA_SRIOV_STATE, "_SRIOVState", state);
    });
    return complete ? status : AX_STATUS_ERROR;
}

} // namespace cimple
