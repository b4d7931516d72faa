// What switches a port: enabled or not, with virtual functions or without.
#include "operations/operation_frame.h"

#include <strings.h>

namespace cimple {

namespace {

constexpr uint32 FEATURE_SRIOV_OF_SYSTEM = 35;
constexpr uint32 FEATURE_SET_SRIOV = 435;
constexpr uint32 FEATURE_PROFILE_MANAGEMENT = 436;

constexpr AX_STATUS BOOT_CODE_ENABLED = 221;
constexpr uint32 NEEDS_RESET = 5; // of what AX_SetPortEnabled tells

constexpr AX_STATUS PROFILE_FORBIDS_DISABLING = 2;
constexpr AX_STATUS MULTICHANNEL_FORBIDS_ENABLING = 4;
constexpr char ETS_DISABLED_PROFILE[] = "NIC - ETS Disabled";

// Whether the profile in force has no ETS, which it can't do with SR-IOV off.
AX_STATUS findEtsDisabled(const HBA_WWN* name, bool& found) {
    Reply reply;
    const Reply_Shape shape{
        .head = sizeof(AX_ProfileList), .entry = sizeof(AX_Profile), .first = AX_PROFILES};
    const AX_STATUS status =
        reply.fetch(shape, {"Unable to allocate the memory for the list of profiles"},
                    counted<AX_ProfileList>([name](AX_ProfileList* list) {
                        return AX_ListProfiles(wwnOf(name), list);
                    }));
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "AX_ListProfiles error: %d", status);
        return status;
    }
    const auto* list = static_cast<const AX_ProfileList*>(reply.data());
    const AX_Profile* profile = list->profile;
    for (uint32 i = 0; i < reply.count(); ++i, ++profile)
        if (profile->id == list->activeProfileId &&
            strncasecmp(profile->name, ETS_DISABLED_PROFILE, sizeof profile->name) == 0)
            found = true;
    return AX_STATUS_OK;
}

AX_STATUS mayDisable(const HBA_WWN* name) {
    bool etsDisabled = false;
    if (const AX_STATUS status = findEtsDisabled(name, etsDisabled))
        return status;
    if (!etsDisabled)
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

} // namespace cimple
