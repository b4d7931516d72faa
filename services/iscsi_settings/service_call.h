// What the methods of the iSCSI setting service share: the checks of their arguments, in the order
// in which all of them make these, and their lines.
#ifndef VLN_SERVICES_ISCSI_SETTINGS_SERVICE_CALL_H
#define VLN_SERVICES_ISCSI_SETTINGS_SERVICE_CALL_H

#include "agent/gates.h"
#include "classes/VLNMPCA_iSCSISettingService.h"
#include "operations/method_wrapper.h"
#include "services/iscsi_settings/rules.h"
#include "services/method_call.h"

namespace cimple {

// Return values beside those that all services have.
enum ISCSI_Result : uint32 {
    ISCSI_FAILED_SETTING = 1,
    ISCSI_INVALID_ARGUMENT = 5,
    ISCSI_FAILED = 32769,
};

// One call. Its checks answer false when they have put what is wrong into the result.
struct ISCSI_Call {
    ProviderAgent& agent;
    const char* method; // in front of its lines
    uint32 result = METHOD_DONE;
    HBA_WWN name{};        // of the port
    AX_IPAddress portal{}; // of the target

    // "METHOD: line" at level 3.
    bool refuse(uint32 value, const char* line);
    // "METHOD: operation failed with status." at level 3.
    bool failed(uint32 value, const char* operation, AX_STATUS status);

    bool check_service(const VLNMPCA_iSCSISettingService* self);
    bool check_port(const Property<String>& mac, uint32 value = METHOD_INVALID_TARGET);
    bool check_target(const Property<String>& target, uint32 value = METHOD_INVALID_TARGET);
    // A method that is not given is none.
    bool check_authentication(const Property<uint32>& type, const CHAP_Texts& texts);
    // A port that is not given is that of iSCSI.
    bool read_portal(const Property<String>& address, const Property<uint16>& port,
                     uint32 value = METHOD_INVALID_TARGET);
    // The address may be left out: then given is null.
    bool read_optional_address(const Property<String>& address, const AX_IPAddress*& given,
                               uint32 value = METHOD_INVALID_TARGET);

    // "METHOD: what. Refreshing SAN Data.", and the refresh is asked for.
    void refresh(const char* what);
};

// Runs the steps of a method behind the prologue. Refreshes that former calls have asked for are
// left to those who look.
template <class Steps>
sint32 run_iscsi_method(const char* method, const VLNMPCA_iSCSISettingService* self,
                        Property<uint32>* result, Steps steps) {
    return answer_method(*result, [&](ProviderAgent& agent) {
        const Operation_Prologue prologue(agent, Pending_Requests::LEFT);
        ISCSI_Call call{agent, method};
        if (call.check_service(self))
            steps(call);
        return call.result;
    });
}

} // namespace cimple

#endif // VLN_SERVICES_ISCSI_SETTINGS_SERVICE_CALL_H
