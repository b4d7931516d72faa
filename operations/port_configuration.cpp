// How an adapter is split into ports and functions, and the profiles that go with it.
#include "operations/adapter_profiles.h"
#include "operations/orrigan_rules.h"

namespace cimple {

namespace {

constexpr uint32 FEATURE_PROFILE_LISTING = 437;

constexpr Feature_Test PROFILES{FEATURE_PROFILE_MANAGEMENT,
                                "Unable to determine if adapter supports Profile Management.",
                                "Profile Management not supported on this adapter"};
constexpr Feature_Test PERSONALITY{
    VLN_MethodWrapper::CHANGES_PERSONALITY,
    "Unable to determine if adapter supports changing its personality.",
    "Changing the personality is not supported on this adapter"};

void logRefusal(const Rule_Refusal& refused) {
    if (refused.line[0] != '\0')
        VLN_LOG(VLN_ERR, "%s", refused.line);
}

AX_STATUS validate(const Orrigan_Request& request) {
    VLN_LOG(VLN_DBG, "RoCE Enabled: %d, MC Enabled = %d, NIC Only = %d", request.facts.roce,
            request.facts.multichannel(), request.facts.nicOnly);
    const Refused refused = firstBrokenRule(request);
    if (refused)
        logRefusal(*refused);
    return refused ? AX_STATUS_INVALID_ARGUMENT : AX_STATUS_OK;
}

AX_STATUS mayHaveMultichannel(const HBA_WWN* name, const Orrigan_Facts& facts) {
    bool sriov = false;
    if (!facts.multichannel())
        return AX_STATUS_OK;
    if (const AX_STATUS status =
            askFeature(name, VLN_MethodWrapper::HAS_SRIOV_ON,
                       "Unable to determine if adapter supports SRIOV.", &sriov))
        return status;
    if (!sriov)
        return AX_STATUS_OK;
    VLN_LOG(VLN_ERR, "Multichannel cannot be enabled if SRIOV is enabled.");
    return AX_STATUS_INVALID_ARGUMENT;
}

// Gives the configuration its profile, after all that forbids it.
AX_STATUS prepare(const HBA_WWN* name, AX_AdapterPortConfig& config, bool& etsDisabled) {
    bool sriov = false;
    if (const AX_STATUS status =
            askFeature(name, FEATURE_SRIOV_OF_SYSTEM,
                       "Unable to determine if adapter supports SRIOV.", &sriov))
        return status;
    AX_ChannelMgmtCNAInfo info{};
    if (const AX_STATUS status = AX_GetChannelMgmtCNAInfo(wwnOf(name), &info)) {
        VLN_OPERATION_FAILED(status, "Unable to determine if adapter supports channel management");
        return status;
    }
    const Orrigan_Request request{config, orriganFacts(config), sriov, info.capabilities};
    if (const AX_STATUS status = validate(request)) {
        VLN_LOG(VLN_ERR, "ValidateParams for SetAdapterPortConfig Failed");
        return status;
    }
    Adapter_Profiles list;
    if (const AX_STATUS status = list.read(name))
        return status;
    const Profile_Choice choice = chooseProfile(request, list.profiles());
    if (choice.etsDisabled)
        VLN_LOG(VLN_DBG, "NIC - ETS Disabled Configured");
    if (choice.refused) {
        logRefusal(*choice.refused);
        return choice.refused->number;
    }
    if (const AX_STATUS status = mayHaveMultichannel(name, request.facts))
        return status;
    config.pid = choice.pid;
    etsDisabled = choice.etsDisabled;
    return AX_STATUS_OK;
}

void disableEts(AX_AdapterPortConfig& config) {
    for (AX_PortConfig& port : config.port)
        for (AX_FunctionConfig& function : port.function)
            function.flags |= AX_FUNCTION_ETS_DISABLED;
}

AX_STATUS setFunctionCount(const HBA_WWN* name, const AX_AdapterPortConfig& config,
                           const char* line) {
    VLN_LOG(VLN_DBG, "%s", line);
    const AX_STATUS status =
        VLN_MethodWrapper::SetAriFunctionCount(name, config.ariFunctionCount4 / 4);
    if (status != AX_STATUS_OK)
        VLN_LOG(VLN_ERR, " Operation failure. SetAriFunctionCount failed.");
    return status;
}

bool hasRoom(uint32 count, uint32 room, const char* what) {
    if (count <= room)
        return true;
    VLN_LOG(VLN_ERR, "The management library reports %u %s in a record for %u", count, what, room);
    return false;
}

} // namespace

AX_STATUS VLN_MethodWrapper::HasFeature(const HBA_WWN* name, Configuration_Feature feature,
                                        bool* value) {
    Operation_Frame frame("VLN_MethodWrapper::HasFeature");
    if (!frame.given(value))
        return frame.status();
    return askFeature(name, feature, "Unable to determine if adapter supports configuration",
                      value);
}

AX_STATUS VLN_MethodWrapper::GetAdpaterPortConfig(const HBA_WWN* name,
                                                  AX_AdapterPortConfig* config) {
    Operation_Frame frame("VLN_MethodWrapper::GetAdpaterPortConfig");
    if (!frame.given(config) || !frame.offers(name, PROFILES))
        return frame.status();
    *config = {};
    if (const AX_STATUS status = AX_GetAdapterPortConfig(wwnOf(name), config)) {
        VLN_OPERATION_FAILED(status, "AX_GetAdapterPortConfig error: %d", status);
        return status;
    }
    bool sane = hasRoom(config->portCount, AX_CONFIG_PORTS, "ports");
    if (sane)
        for (const AX_PortConfig& port : portsOf(*config))
            sane = sane && hasRoom(port.functionCount, AX_CONFIG_FUNCTIONS, "functions");
    return sane ? AX_STATUS_OK : AX_STATUS_ERROR;
}

AX_STATUS VLN_MethodWrapper::OrriganValidateParams(const AX_AdapterPortConfig& config,
                                                   bool sriovSupported, uint32 capabilities) {
    Operation_Frame frame("VLN_MethodWrapper::OrriganValidateParams");
    return validate({config, orriganFacts(config), sriovSupported, capabilities});
}

AX_STATUS VLN_MethodWrapper::SetAdpaterPortConfig(const HBA_WWN* name, AX_AdapterPortConfig* config,
                                                  bool* etsDisabled, NPAR_Update npar) {
    Operation_Frame frame("VLN_MethodWrapper::SetAdpaterPortConfig");
    if (!frame.given(config) || !frame.given(etsDisabled) || !frame.offers(name, PROFILES))
        return frame.status();
    *etsDisabled = false;
    bool withoutEts = false;
    if (const AX_STATUS status = prepare(name, *config, withoutEts))
        return status;
    if (withoutEts)
        disableEts(*config);
    if (npar == NPAR_GOES_ON)
        if (const AX_STATUS status = setFunctionCount(name, *config, " Enabling NPAREp"))
            return status;
    if (const AX_STATUS status = AX_SetAdapterPortConfig(wwnOf(name), config)) {
        VLN_OPERATION_FAILED(status, "AX_SetAdapterPortConfig error: %d", status);
        return status;
    }
    *etsDisabled = withoutEts;
    return npar == NPAR_GOES_OFF ? setFunctionCount(name, *config, " Disabling NPAREp")
                                 : AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::ListProfiles(const HBA_WWN* name, AX_ProfileList** profiles) {
    Operation_Frame frame("VLN_MethodWrapper::ListProfiles");
    if (!frame.given(profiles) || !frame.offers(name, PROFILES) ||
        !frame.offers(name, {FEATURE_PROFILE_LISTING,
                             "Unable to determine if adapter supports Profile Listing.",
                             "Profile Listing not supported on this adapter"}))
        return frame.status();
    Adapter_Profiles list;
    const AX_STATUS status = list.read(name);
    if (status == AX_STATUS_OK)
        *profiles = list.release();
    return status;
}

AX_STATUS VLN_MethodWrapper::SetAriFunctionCount(const HBA_WWN* name, uint32 count) {
    Operation_Frame frame("VLN_MethodWrapper::SetAriFunctionCount");
    const AX_STATUS status = AX_SetAriFuncs(wwnOf(name), count);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_SetAriFuncs error: %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::FactoryDefaults(const HBA_WWN* name) {
    Operation_Frame frame("VLN_MethodWrapper::FactoryDefaults");
    if (!frame.offers(name, PROFILES))
        return frame.status();
    const AX_STATUS status = AX_SetAdapterPortConfigDefaults(wwnOf(name));
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_SetAdapterPortConfigDefaults error: %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::GetAdapterPersonalities(const HBA_WWN* name,
                                                     AX_AdapterPersonalityInfo* info) {
    Operation_Frame frame("VLN_MethodWrapper::GetAdapterPersonalities");
    if (!frame.given(info) || !frame.offers(name, PERSONALITY))
        return frame.status();
    *info = {};
    if (const AX_STATUS status = AX_GetAdapterPersonalityInfo(wwnOf(name), info)) {
        VLN_OPERATION_FAILED(status, "AX_GetAdapterPersonalityInfo error: %d", status);
        return status;
    }
    return hasRoom(info->availableCount, AX_PERSONALITIES, "personalities") ? AX_STATUS_OK
                                                                            : AX_STATUS_ERROR;
}

AX_STATUS VLN_MethodWrapper::ChangeAdapterPersonality(const HBA_WWN* name, uint32 personality) {
    Operation_Frame frame("VLN_MethodWrapper::ChangeAdapterPersonality");
    bool managed = false;
    if (const AX_STATUS status = askFeature(name, PROFILES.feature, PROFILES.unknown, &managed))
        return status;
    if (managed)
        return AX_STATUS_NOT_SUPPORTED;
    if (!frame.offers(name, PERSONALITY))
        return frame.status();
    const AX_STATUS status = AX_ChangeAdapterPersonality(wwnOf(name), personality);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_ChangeAdapterPersonality error: %d", status);
    return status;
}

} // namespace cimple
