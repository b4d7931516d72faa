// The method that turns the priorities of a target's units off at once.
#include "agent/text.h"
#include "services/driver_parameters/lun_priorities.h"
#include "services/driver_parameters/provider.h"
#include "services/method_call.h"

#include <cstring>
#include <string>

namespace cimple {

namespace {

enum Disable_Result : uint32 {
    DISABLE_REFUSED = 32769, // by the library
};

uint32 refuse(uint32 value, const char* line) {
    VLN_LOG(VLN_ERR, "%s", line);
    return value;
}

uint32 disable_priorities(ProviderAgent& agent, const VLNMPCA_DriverParameterService* self,
                          const String& initiator, const String& target,
                          const Property<uint8>& option) {
    if (!agent.m_VLNMPCA_DriverParameterService_map.lookup(self))
        return refuse(METHOD_UNKNOWN_INSTANCE, "Invalid instance of MPCA Driver Parameter Service");
    if (!find_initiator(agent, initiator).known())
        return refuse(METHOD_INVALID_TARGET, "Invald fc port.");
    HBA_WWN name{};
    if (VLN_MethodWrapper::string2HBAName(&name, target.c_str()) != 1)
        return refuse(METHOD_INVALID_TARGET, "Invalid Initiator fc port or Target device");
    VLN_LOG(VLN_DBG, "Option: %d.", option.is_null() ? -1 : option.value);
    if (option.is_null() || option.value > AX_OAS_CONFIG)
        return METHOD_INVALID_TARGET;
    const std::string all = std::to_string(AX_OAS_ALL_LUNS);
    if (VLN_MethodWrapper::SetOASLunState(initiator.c_str(), initiator.c_str(), target.c_str(),
                                          all.c_str(), 0, option.value) != AX_STATUS_OK)
        return refuse(DISABLE_REFUSED, "Disable PrioViaLunStates failed");
    const String text = format_text("%s:%s:%s", priority_option_word(option.value),
                                    initiator.c_str(), target.c_str());
    VLN_LOG(VLN_DBG, "Final Parse str: %s", text.c_str());
    // A client may have written the digits of a name in either case.
    if (!hide_priorities(agent, [&text](const VLNMPCA_DriverParameterSettingData& setting) {
            return strcasestr(setting.InstanceID.value.c_str(), text.c_str()) != nullptr;
        }))
        VLN_LOG(VLN_ERR, "Invalid associations ");
    VLN_LOG(VLN_DBG, "DisableAllPrioViaLuns Succeeded");
    return METHOD_DONE;
}

} // namespace

sint32 Driver_Parameter_Service_Provider::DisableAllPrioViaLuns(
    const VLNMPCA_DriverParameterService* self, Property<String>* initiator,
    Property<String>* target, Property<uint8>* option, Property<uint32>* return_value) {
    VLN_LOG(VLN_DBG, "VLNMPCA_DriverParameterService_Provider::DisableAllPrioViaLuns()");
    return answer_method(*return_value, [&](ProviderAgent& agent) -> uint32 {
        const Operation_Prologue prologue(agent);
        return disable_priorities(agent, self, initiator->value, target->value, *option);
    });
}

} // namespace cimple
