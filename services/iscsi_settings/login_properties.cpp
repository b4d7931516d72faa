// Who is asked for an answer, and how the next logins are made.
#include "services/iscsi_settings/provider.h"
#include "services/iscsi_settings/service_call.h"

#include <algorithm>
#include <functional>
#include <iterator>

namespace cimple {

namespace {

constexpr uint32 MAX_EXTENDED_TIME_OUT = 3200; // seconds
constexpr uint32 MAX_TCP_PORT = 65535;
constexpr char NO_OPTIONS[] = "HeaderDigest or ImmediateData or DataDigest are not set";

// An option as a client gives it, and where it goes.
struct Wanted_Option {
    const Property<uint32>& given;
    uint8 AX_iSCSI_LoginOptions::*option;

    bool is_given() const { return !given.is_null() && given.value < 2; }
    bool is_wrong() const { return !given.is_null() && given.value >= 2; }
};

// How a client wants the next login to be.
struct Login_Setting {
    Wanted_Option options[3];
    const Property<uint32>& method;
    CHAP_Texts texts;

    template <class Test>
    bool all(Test test) const {
        return std::all_of(std::begin(options), std::end(options), test);
    }
    template <class Test>
    bool any(Test test) const {
        return std::any_of(std::begin(options), std::end(options), test);
    }
    bool has_options() const { return any(std::mem_fn(&Wanted_Option::is_given)); }
    bool has_wrong_options() const { return any(std::mem_fn(&Wanted_Option::is_wrong)); }
    bool matches(const AX_iSCSI_LoginOptions& now) const {
        return all([&](const Wanted_Option& each) {
            return each.is_given() && now.*each.option == each.given.value;
        });
    }
    void put(AX_iSCSI_LoginProperties& properties) const {
        for (const Wanted_Option& each : options)
            if (each.is_given())
                properties.options.*each.option = static_cast<uint8>(each.given.value);
        if (!method.is_null())
            put_account(method.value, texts, properties.authentication);
    }
};

Login_Setting setting_of(const Property<uint32>& header_digest,
                         const Property<uint32>& immediate_data,
                         const Property<uint32>& data_digest, const Property<uint32>& method,
                         const CHAP_Texts& texts) {
    return {{{header_digest, &AX_iSCSI_LoginOptions::headerDigest},
             {immediate_data, &AX_iSCSI_LoginOptions::immediateData},
             {data_digest, &AX_iSCSI_LoginOptions::dataDigest}},
            method,
            texts};
}

// Options that are as wanted already leave all as it is, the account too.
void set_target_login(ISCSI_Call& call, const char* target, const Login_Setting& setting) {
    AX_iSCSI_LoginProperties properties{};
    AX_STATUS status =
        VLN_MethodWrapper::GetTargetLoginAuthProperties(&call.name, target, &properties);
    if (status != AX_STATUS_OK) {
        call.failed(ISCSI_FAILED_SETTING, "GetTargetLoginAuthProperties", status);
        return;
    }
    if (!setting.has_options())
        VLN_LOG(VLN_INFO, "%s", NO_OPTIONS);
    if (setting.matches(properties.options))
        return;
    setting.put(properties);
    status = VLN_MethodWrapper::SetTargetLoginAuthProperties(&call.name, target, properties);
    if (status != AX_STATUS_OK)
        call.failed(ISCSI_FAILED_SETTING, "SetTargetLoginAuthProperties", status);
}

void set_portal_login(ISCSI_Call& call, const Login_Setting& setting) {
    AX_iSCSI_LoginProperties properties{};
    AX_STATUS status =
        VLN_MethodWrapper::GetTargetPortalProperties(&call.name, call.portal, &properties);
    if (status != AX_STATUS_OK) {
        call.failed(ISCSI_FAILED_SETTING, "GetTargetPortalProperties", status);
        return;
    }
    setting.put(properties);
    status = VLN_MethodWrapper::SetTargetPortalProperties(&call.name, call.portal, properties);
    if (status != AX_STATUS_OK)
        call.failed(ISCSI_FAILED_SETTING, "SetTargetPortalProperties", status);
}

} // namespace

sint32 ISCSI_Service_Provider::Ping(const Service* self, Text* mac, Text* address, Number* port,
                                    Number* result) {
    return run_iscsi_method("Ping", self, result, [&](ISCSI_Call& call) {
        const bool complete = !mac->is_null() && !mac->value.empty() && !address->is_null() &&
                              !address->value.empty() && !port->is_null() && port->value != 0 &&
                              port->value <= MAX_TCP_PORT;
        if (!complete) {
            call.refuse(ISCSI_INVALID_ARGUMENT,
                        "Invalid argument passed (InitPortMACAddress|IPAddress|TCPPort)");
            return;
        }
        Property<uint16> number;
        number.set(static_cast<uint16>(port->value));
        if (call.check_port(*mac, ISCSI_INVALID_ARGUMENT) &&
            call.read_portal(*address, number, ISCSI_INVALID_ARGUMENT))
            call.result = VLN_MethodWrapper::Ping(&call.name, address->value.c_str(), number.value);
    });
}

sint32 ISCSI_Service_Provider::setBootTargetSession(const Service* self, Text* mac, Text* target,
                                                    Number*, Text* address, Number* enable,
                                                    Number* result) {
    return run_iscsi_method("setBootTargetSession", self, result, [&](ISCSI_Call& call) {
        const AX_IPAddress* given = nullptr;
        if (!call.check_port(*mac, ISCSI_INVALID_ARGUMENT) || !call.check_target(*target) ||
            !call.read_optional_address(*address, given, ISCSI_INVALID_ARGUMENT))
            return;
        if (enable->is_null() || enable->value > 1)
            call.refuse(ISCSI_INVALID_ARGUMENT, "Invalid argument passed (enableBootSession)");
        else
            call.result = VLN_MethodWrapper::SetBootTargetSession(&call.name, target->value.c_str(),
                                                                  given, enable->value);
    });
}

sint32 ISCSI_Service_Provider::setTargetLoginProperties(const Service* self, Text* mac,
                                                        Text* target, Number* header_digest,
                                                        Number* immediate_data, Number* data_digest,
                                                        Number* method, Text* target_name,
                                                        Text* target_secret, Text* initiator_name,
                                                        Text* initiator_secret, Number* result) {
    const Login_Setting setting =
        setting_of(*header_digest, *immediate_data, *data_digest, *method,
                   {target_name, target_secret, initiator_name, initiator_secret});
    return run_iscsi_method("setTargetLoginProperties", self, result, [&](ISCSI_Call& call) {
        if (call.check_port(*mac, ISCSI_INVALID_ARGUMENT) &&
            call.check_target(*target, ISCSI_FAILED_SETTING) &&
            call.check_authentication(*method, setting.texts))
            set_target_login(call, target->value.c_str(), setting);
    });
}

sint32 ISCSI_Service_Provider::setTargetProperties(const Service* self, Text* mac, Text* target,
                                                   Number* eto, Number* result) {
    return run_iscsi_method("setTargetProperties", self, result, [&](ISCSI_Call& call) {
        if (!call.check_port(*mac, ISCSI_INVALID_ARGUMENT) ||
            !call.check_target(*target, ISCSI_FAILED_SETTING))
            return;
        if (eto->is_null())
            return;
        if (eto->value > MAX_EXTENDED_TIME_OUT) {
            call.refuse(ISCSI_FAILED_SETTING, "Supported Value range is 0 to 3200");
            return;
        }
        const AX_STATUS status =
            VLN_MethodWrapper::SetTargetProperties(&call.name, target->value.c_str(), eto->value);
        if (status != AX_STATUS_OK)
            call.failed(ISCSI_FAILED_SETTING, "SetTargetProperties", status);
    });
}

sint32 ISCSI_Service_Provider::setTPLoginProperties(const Service* self, Text* mac, Text* address,
                                                    Short* port, Number* header_digest,
                                                    Number* immediate_data, Number* data_digest,
                                                    Number* method, Text* target_name,
                                                    Text* target_secret, Text* initiator_name,
                                                    Text* initiator_secret, Number* result) {
    const Login_Setting setting =
        setting_of(*header_digest, *immediate_data, *data_digest, *method,
                   {target_name, target_secret, initiator_name, initiator_secret});
    return run_iscsi_method("setTPLoginProperties", self, result, [&](ISCSI_Call& call) {
        if (!call.check_port(*mac, ISCSI_INVALID_ARGUMENT) ||
            !call.check_authentication(*method, setting.texts))
            return;
        if (port->is_null() || address->is_null())
            call.refuse(ISCSI_FAILED_SETTING, "Invalid IP Address or port number passed.");
        else if (!setting.has_options() || setting.has_wrong_options())
            call.refuse(ISCSI_FAILED_SETTING, NO_OPTIONS);
        else if (call.read_portal(*address, *port, ISCSI_FAILED_SETTING))
            set_portal_login(call, setting);
    });
}

} // namespace cimple
