// Portals, targets and sessions come and go.
#include "services/iscsi_settings/provider.h"
#include "services/iscsi_settings/service_call.h"

namespace cimple {

namespace {

// How a client wants to log in.
struct Login_Arguments {
    const Property<boolean>& header_digest;
    const Property<boolean>& immediate_data;
    const Property<boolean>& data_digest;
    const Property<uint32>& method;
    CHAP_Texts texts;

    bool wants_digest() const {
        return (!header_digest.is_null() && header_digest.value) ||
               (!data_digest.is_null() && data_digest.value);
    }
};

void take_flag(const Property<boolean>& flag, uint8& option) {
    if (!flag.is_null())
        option = flag.value;
}

void take_options(const Login_Arguments& login, AX_iSCSI_LoginOptions& options) {
    take_flag(login.header_digest, options.headerDigest);
    take_flag(login.immediate_data, options.immediateData);
    take_flag(login.data_digest, options.dataDigest);
}

bool read_initiator(ISCSI_Call& call, AX_iSCSI_InitiatorProperties& initiator) {
    const AX_STATUS status = VLN_MethodWrapper::GetIscsiInitiatorProps(&call.name, &initiator);
    return status == AX_STATUS_OK || call.failed(ISCSI_FAILED, "GetIscsiInitiatorProps", status);
}

// What the initiator offers by itself, with what the client wants of it.
bool make_login(ISCSI_Call& call, const Login_Arguments& login, AX_iSCSI_LoginProperties& made) {
    AX_iSCSI_InitiatorProperties initiator{};
    if (!read_initiator(call, initiator))
        return false;
    made = {};
    made.options = initiator.loginOptions;
    take_options(login, made.options);
    if (!login.method.is_null())
        put_account(login.method.value, login.texts, made.authentication);
    return true;
}

// The portal may stand with digests that nobody wants any more: it is then made anew. If it cannot
// be added again it is gone.
AX_STATUS add_portal(const ISCSI_Call& call, const Login_Arguments& login,
                     const AX_iSCSI_LoginProperties& wanted) {
    AX_iSCSI_LoginProperties properties = wanted;
    const AX_STATUS status =
        VLN_MethodWrapper::AddTargetPortal(&call.name, call.portal, &properties);
    const bool has_digest = properties.options.headerDigest || properties.options.dataDigest;
    if (status != AX_STATUS_PORTAL_EXISTS || login.wants_digest() || !has_digest)
        return status;
    if (const AX_STATUS removed = VLN_MethodWrapper::RemoveTargetPortal(&call.name, call.portal))
        return removed;
    properties = wanted;
    properties.options.headerDigest = 0;
    properties.options.dataDigest = 0;
    const AX_STATUS added =
        VLN_MethodWrapper::AddTargetPortal(&call.name, call.portal, &properties);
    if (added != AX_STATUS_OK)
        call.agent.requestSANRefresh(); // as only a success does else, and the portal is gone
    return added;
}

// Asks for the refresh, or logs what the library answered.
void finish(ISCSI_Call& call, AX_STATUS status, const char* done) {
    if (status == AX_STATUS_OK)
        call.refresh(done);
    else
        call.failed(ISCSI_FAILED, call.method, status);
}

void log_in(ISCSI_Call& call, const char* target, const Property<String>& address,
            const Property<uint16>& port, const Login_Arguments& login) {
    AX_iSCSI_InitiatorProperties initiator{};
    if (!read_initiator(call, initiator))
        return;
    if (initiator.name[0] == '\0') {
        call.refuse(ISCSI_FAILED, "Invalid (blank) initiator SCSI name.");
        return;
    }
    AX_iSCSI_LoginProperties properties{};
    if (const AX_STATUS status =
            VLN_MethodWrapper::GetTargetLoginAuthProperties(&call.name, target, &properties)) {
        call.failed(ISCSI_FAILED, "GetTargetLoginAuthProperties", status);
        return;
    }
    take_options(login, properties.options);
    if (!login.method.is_null())
        put_account(login.method.value, login.texts, properties.authentication);
    if (call.read_portal(address, port))
        finish(call, VLN_MethodWrapper::TargetLogin(&call.name, target, call.portal, properties),
               "Login done");
}

} // namespace

sint32 ISCSI_Service_Provider::AddTargetPortal(const Service* self, Text* mac, Text* address,
                                               Short* port, Flag* header_digest,
                                               Flag* immediate_data, Flag* data_digest,
                                               Number* method, Text* target_name,
                                               Text* target_secret, Text* initiator_name,
                                               Text* initiator_secret, Number* result) {
    const Login_Arguments login{*header_digest,
                                *immediate_data,
                                *data_digest,
                                *method,
                                {target_name, target_secret, initiator_name, initiator_secret}};
    return run_iscsi_method("AddTargetPortal", self, result, [&](ISCSI_Call& call) {
        AX_iSCSI_LoginProperties wanted{};
        if (call.check_port(*mac) && call.check_authentication(*method, login.texts) &&
            make_login(call, login, wanted) && call.read_portal(*address, *port))
            finish(call, add_portal(call, login, wanted), "Target Portal added");
    });
}

sint32 ISCSI_Service_Provider::RemoveTargetPortal(const Service* self, Text* mac, Text* address,
                                                  Short* port, Number* result) {
    return run_iscsi_method("RemoveTargetPortal", self, result, [&](ISCSI_Call& call) {
        if (call.check_port(*mac) && call.read_portal(*address, *port))
            finish(call, VLN_MethodWrapper::RemoveTargetPortal(&call.name, call.portal),
                   "Target Portal removed");
    });
}

sint32 ISCSI_Service_Provider::AddTarget(const Service* self, Text* mac, Text* address, Short* port,
                                         Text* target, Flag* header_digest, Flag* immediate_data,
                                         Flag* data_digest, Flag* login, Flag* boot, Number* method,
                                         Text* target_name, Text* target_secret,
                                         Text* initiator_name, Text* initiator_secret,
                                         Number* result) {
    const Login_Arguments arguments{*header_digest,
                                    *immediate_data,
                                    *data_digest,
                                    *method,
                                    {target_name, target_secret, initiator_name, initiator_secret}};
    return run_iscsi_method("AddTarget", self, result, [&](ISCSI_Call& call) {
        AX_iSCSI_LoginProperties wanted{};
        if (call.check_port(*mac) && call.check_target(*target) &&
            call.check_authentication(*method, arguments.texts) &&
            make_login(call, arguments, wanted) && call.read_portal(*address, *port))
            finish(call,
                   VLN_MethodWrapper::AddTarget(&call.name, target->value.c_str(), call.portal,
                                                wanted, !login->is_null() && login->value,
                                                !boot->is_null() && boot->value),
                   "Target added");
    });
}

sint32 ISCSI_Service_Provider::RemoveTarget(const Service* self, Text* mac, Text* target,
                                            Number* result) {
    return run_iscsi_method("RemoveTarget", self, result, [&](ISCSI_Call& call) {
        if (call.check_port(*mac) && call.check_target(*target))
            finish(call, VLN_MethodWrapper::RemoveTarget(&call.name, target->value.c_str()),
                   "Target removed");
    });
}

sint32 ISCSI_Service_Provider::TargetLogin(const Service* self, Text* mac, Text* target,
                                           Text* address, Short* port, Flag* header_digest,
                                           Flag* immediate_data, Flag* data_digest, Number* method,
                                           Text* target_name, Text* target_secret,
                                           Text* initiator_name, Text* initiator_secret,
                                           Number* result) {
    const Login_Arguments login{*header_digest,
                                *immediate_data,
                                *data_digest,
                                *method,
                                {target_name, target_secret, initiator_name, initiator_secret}};
    return run_iscsi_method("TargetLogin", self, result, [&](ISCSI_Call& call) {
        if (call.check_port(*mac) && call.check_target(*target) &&
            call.check_authentication(*method, login.texts))
            log_in(call, target->value.c_str(), *address, *port, login);
    });
}

sint32 ISCSI_Service_Provider::TargetLogout(const Service* self, Text* mac, Text* target,
                                            Number* session, Text* address, Number* result) {
    return run_iscsi_method("TargetLogout", self, result, [&](ISCSI_Call& call) {
        const AX_IPAddress* portal = nullptr;
        if (call.check_port(*mac) && call.check_target(*target) &&
            call.read_optional_address(*address, portal))
            finish(call,
                   VLN_MethodWrapper::TargetLogout(&call.name, target->value.c_str(), portal,
                                                   session->is_null() ? 0 : session->value),
                   "Logout done");
    });
}

} // namespace cimple
