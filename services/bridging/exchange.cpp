// What a console changes of what a port exchanges with its switch, and of the throttle of an FCoE
// port.
#include "services/bridging/instances.h"
#include "services/bridging/provider.h"
#include "services/method_call.h"

#include <cstring>
#include <optional>

namespace cimple {

namespace {

bool begins_with(const String& text, const char* word, std::size_t characters) {
    return std::strncmp(text.c_str(), word, characters) == 0;
}

// ---- DCBX and LLDP ----

struct Exchange_Row {
    Property<String> VLNMPCA_DcbxLldpData::*state;
    const char* parameter;
    const char* failed;
};

// LLDP carries DCBX: who switches both at once has to mind the order, which is this one.
constexpr Exchange_Row EXCHANGE_ROWS[] = {
    {&VLNMPCA_DcbxLldpData::DCBXState, "dcbxstate",
     "VLN_MethodWrapper::vlncimSetCEEParams call for dcbxstate failed"},
    {&VLNMPCA_DcbxLldpData::LLDPtxState, "txstate",
     "VLN_MethodWrapper::vlncimSetCEEParams call for txstate failed"},
    {&VLNMPCA_DcbxLldpData::LLDPrxState, "rxstate",
     "VLN_MethodWrapper::vlncimSetCEEParams call for rxstate failed"},
    {&VLNMPCA_DcbxLldpData::LLDPtxPortDesc, "txportdesc",
     "VLN_MethodWrapper::vlncimSetCEEParams call for txportdesc failed"},
    {&VLNMPCA_DcbxLldpData::LLDPtxSysDesc, "txsysdesc",
     "VLN_MethodWrapper::vlncimSetCEEParams call for txsysdesc failed"},
    {&VLNMPCA_DcbxLldpData::LLDPtxSysName, "txsysname",
     "VLN_MethodWrapper::vlncimSetCEEParams call for txsysname failed"},
    {&VLNMPCA_DcbxLldpData::LLDPtxSysCap, "txsyscap",
     "VLN_MethodWrapper::vlncimSetCEEParams call for txsyscap failed"},
};

// The number of a state as the operation takes it; null for a text that is none.
const char* state_number(const String& text) {
    return begins_with(text, "Ena", 3) ? "1" : begins_with(text, "Dis", 3) ? "0" : nullptr;
}

// asked: a change has gone to the library.
sint32 set_states(const VLNMPCA_DcbxLldpData& model, const VLNMPCA_DcbxLldpData& had,
                  const HBA_WWN& name, bool& asked) {
    const bool validate = model.ValidateRule.is_null() || model.ValidateRule.value != 0;
    VLN_LOG(VLN_DBG, "ValidateRule = %d", static_cast<int>(validate));
    for (const Exchange_Row& row : EXCHANGE_ROWS) {
        const Property<String>& wanted = model.*row.state;
        if (wanted.is_null() || wanted.value == (had.*row.state).value)
            continue;
        const char* number = state_number(wanted.value);
        if (!number)
            return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                                 "Invalid state, supported states are Enabled and Disabled");
        asked = true;
        if (VLN_MethodWrapper::vlncimSetCEEParams(&name, row.parameter, number, validate) !=
            AX_STATUS_OK)
            return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER, row.failed);
    }
    return MODIFY_INSTANCE_OK;
}

sint32 modify_exchange(ProviderAgent& agent, const VLNMPCA_DcbxLldpData* model,
                       const VLNMPCA_DcbxLldpData* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "VLNMPCA_DcbxLldpData::modify_instance invalid parameter");
    const auto* found = agent.m_VLNMPCA_DcbxLldpData_map.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid instance of VLNMPCA_DcbxLldpData Data");
    const String device_id = found->ElementName.value;
    HBA_WWN name{};
    if (!nameOfDeviceId(device_id.c_str(), name,
                        "VLNMPCA_DcbxLldpData::modify_instance::", VLN_ERR))
        return MODIFY_INSTANCE_FAILED;
    bool asked = false;
    const sint32 status = set_states(*model, *found, name, asked);
    if (status == MODIFY_INSTANCE_OK || asked)
        read_exchange_back(agent, device_id, name);
    return status;
}

// ---- Throttle ----

sint32 modify_throttle(ProviderAgent& agent, const VLNMPCA_PFCThrottle* model,
                       const VLNMPCA_PFCThrottle* instance) {
    if (!model || !instance)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "VLNMPCA_PFCThrottle::modify_instance invalid parameter");
    const auto* found = agent.m_VLNMPCA_PFCThrottle_map.lookup(model);
    if (!found)
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid instance of VLNMPCA_PFCThrottle Data");
    HBA_WWN name{};
    if (!nameOfDeviceId(found->ElementName.value.c_str(), name,
                        "VLNMPCA_PFCThrottle::modify_instance::", VLN_ERR))
        return MODIFY_INSTANCE_FAILED;
    if (model->PFCThrottle.is_null())
        return MODIFY_INSTANCE_OK;
    const String& wanted = model->PFCThrottle.value;
    const bool on = begins_with(wanted, "enable", 2);
    if (!on && !begins_with(wanted, "disable", 2))
        return refuse_modify(MODIFY_INSTANCE_INVALID_PARAMETER,
                             "Invalid PFCThrottle, supported values are enable and disable");
    VLN_LOG(VLN_DBG, on ? "Setting PFCThrottle to enable" : "Setting PFCThrottle to disable");
    if (VLN_MethodWrapper::SetPfcThrottle(&name, on) != AX_STATUS_OK)
        return refuse_modify(MODIFY_INSTANCE_FAILED, "VLN_MethodWrapper::SetPfcThrottle failed");
    change(agent.m_VLNMPCA_PFCThrottle_map, found, [on](VLNMPCA_PFCThrottle& throttle) {
        throttle.PFCThrottle.set(on ? "enabled" : "disabled");
    });
    return MODIFY_INSTANCE_OK;
}

} // namespace

sint32 Exchange_Provider::modify_instance(const VLNMPCA_DcbxLldpData* model,
                                          const VLNMPCA_DcbxLldpData* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_exchange(agent, model, instance); });
}

sint32 Flow_Control_Throttle_Provider::modify_instance(const VLNMPCA_PFCThrottle* model,
                                                       const VLNMPCA_PFCThrottle* instance) {
    return answer_modify(
        [&](ProviderAgent& agent) { return modify_throttle(agent, model, instance); });
}

} // namespace cimple
