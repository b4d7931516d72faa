// How a port's link is divided into channels.
#include "operations/adapter_profiles.h"

namespace cimple {

namespace {

constexpr uint32 LAST_MODE = 5;
constexpr AX_STATUS UNSUPPORTED_MODE = 2;

constexpr char UNKNOWN[] = "Unable to determine if adapter supports channel management";

// An adapter without channels is none that fails.
void logFailure(AX_STATUS status, const char* operation) {
    VLN_LOG(status == AX_STATUS_NOT_SUPPORTED ? VLN_DBG : VLN_ERR,
            "%s exited with the error code %u", operation, status);
    VLN_MethodWrapper::logStatus(status);
}

// Whether the adapter has the mode. Older channel management does not tell of mode 1, but has it.
bool hasMode(const AX_ChannelMgmtCNAInfo& info, uint32 mode, bool current) {
    if (mode == 0)
        return true;
    if (mode > LAST_MODE) {
        VLN_LOG(VLN_WARN, "Not a recognized channel management mode: %u ", mode);
        return false;
    }
    return (info.availableModes >> (mode - 1) & 1) || (mode == 1 && !current);
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetChannelMgmtCNAInfo(const HBA_WWN* name,
                                                   AX_ChannelMgmtCNAInfo* info) {
    Operation_Frame frame("VLN_MethodWrapper::GetChannelMgmtCNAInfo");
    if (!frame.given(info))
        return frame.status();
    *info = {};
    const AX_STATUS status = AX_GetChannelMgmtCNAInfo(wwnOf(name), info);
    if (status != AX_STATUS_OK)
        logFailure(status, "GetChannelMgmtCNAInfo");
    return status;
}

AX_STATUS VLN_MethodWrapper::GetChannelMgmtPortInfo(const HBA_WWN* name,
                                                    AX_ChannelMgmtPortInfo* info) {
    Operation_Frame frame("VLN_MethodWrapper::GetChannelMgmtPortInfo");
    if (!frame.given(info))
        return frame.status();
    *info = {};
    const AX_STATUS status = AX_GetChannelMgmtPortInfo(wwnOf(name), info);
    if (status != AX_STATUS_OK)
        logFailure(status, "GetChannelMgmtPortInfo");
    if (status != AX_STATUS_OK || info->count <= AX_CHANNELS)
        return status;
    VLN_LOG(VLN_ERR, "The management library reports %u channels in a record for %u", info->count,
            static_cast<uint32>(AX_CHANNELS));
    return AX_STATUS_ERROR;
}

AX_STATUS VLN_MethodWrapper::SetChannelMgmtPortInfo(const HBA_WWN* name,
                                                    const AX_ChannelMgmtPortInfo& info) {
    Operation_Frame frame("VLN_MethodWrapper::SetChannelMgmtPortInfo");
    const AX_STATUS status = AX_SetChannelMgmtPortInfo(wwnOf(name), &info);
    if (status != AX_STATUS_OK)
        logFailure(status, "SetChannelMgmtPortInfo");
    return status;
}

AX_STATUS VLN_MethodWrapper::SetCMMode(const HBA_WWN* name, uint32 mode) {
    Operation_Frame frame("VLN_MethodWrapper::SetCMMode");
    bool profiles = false, sriov = false, current = false;
    if (const AX_STATUS status = askFeature(name, HAS_PROFILES, UNKNOWN, &profiles))
        return status;
    if (profiles)
        return AX_STATUS_NOT_SUPPORTED;
    if (const AX_STATUS status = askFeature(name, HAS_SRIOV_ON, UNKNOWN, &sriov))
        return status;
    if (sriov) {
        VLN_LOG(VLN_ERR, "SR-IOV is enabled on at least one of the ports on this adapter. It must "
                         "be disabled on all ports before Channel management can be enabled.");
        return AX_STATUS_ERROR;
    }
    AX_ChannelMgmtCNAInfo info{};
    if (const AX_STATUS status = askFeature(name, HAS_CURRENT_CHANNEL_MGMT, UNKNOWN, &current))
        return status;
    if (const AX_STATUS status = GetChannelMgmtCNAInfo(name, &info))
        return status;
    if (!hasMode(info, mode, current)) {
        VLN_LOG(VLN_ERR, "Unsupported channel management mode: %u", mode);
        return UNSUPPORTED_MODE;
    }
    info.configuredState = mode != 0;
    info.configuredMgmtType = mode;
    VLN_LOG(VLN_DBG,
            "VLN_MethodWrapper::Final parameters: ConfiguredMgmtType:%u, "
            "ConfiguredState: %u",
            info.configuredMgmtType, info.configuredState);
    const AX_STATUS status = AX_SetChannelMgmtCNAInfo(wwnOf(name), &info);
    if (status != AX_STATUS_OK)
        logFailure(status, "AX_SetChannelMgmtCNAInfo");
    return status;
}

AX_STATUS VLN_MethodWrapper::SetVEPAState(const HBA_WWN* name, uint32 state) {
    Operation_Frame frame("VLN_MethodWrapper::SetVEPAState");
    if (!frame.offers(name,
                      {FEATURE_PROFILE_MANAGEMENT, " Unable to determine if adapter supports VEPA.",
                       "VEPA not supported on this adapter"}))
        return frame.status();
    const AX_STATUS status =
        AX_SetAdapterAttribute(wwnOf(name), AX_PA_VEPA_STATE, &state, sizeof state);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, " Operation failure. VEPA State has not been set");
    return status;
}

} // namespace cimple
