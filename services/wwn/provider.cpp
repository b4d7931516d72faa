#include "services/wwn/provider.h"

#include "agent/text.h"
#include "services/method_call.h"
#include "services/waiting_call.h"

#include <cstring>
#include <span>

namespace cimple {

namespace {

// Return values beside those that all services have.
constexpr uint32 DUPLICATE_FOUND = 91;
constexpr uint32 NAME_MISSING = 32969;

constexpr char CLASS[] = "VLNMPCA_FCWWNService_Provider::";
// Logs have been searched for it under this name from the start.
constexpr char CAPABILITY_CLASS[] = "VLNHBA_FCHBAWWNService_Provider::";

uint32 library_result(AX_STATUS status) {
    return status == AX_STATUS_OK ? uint32{METHOD_DONE} : METHOD_LIBRARY_STATUS + status;
}

// ---- Arguments ----

// One call on the service. name is the target's, once begin has found it.
struct WWN_Call {
    ProviderAgent& agent;
    Operation_Prologue& prologue;
    HBA_WWN name{};
};

// METHOD_DONE when service and target are known and the target's name could be made out.
uint32 check_target(WWN_Call& call, const VLNMPCA_FCWWNService* self, const Instance* target,
                    const char* caller) {
    if (!self || !call.agent.m_VLNMPCA_FCWWNService_map.lookup(self)) {
        VLN_LOG(VLN_DBG, "Invalid instance of MPCA WWN Service");
        return METHOD_UNKNOWN_INSTANCE;
    }
    const auto* port = target ? call.agent.m_VLNMPCA_FCPort_map.lookup(target) : nullptr;
    if (!port) {
        VLN_LOG(VLN_DBG, "Invalid VLNMPCA_FCPort");
        return METHOD_INVALID_TARGET;
    }
    return nameOfDeviceId(port->DeviceID.value.c_str(), call.name, caller, VLN_ERR)
               ? METHOD_DONE
               : METHOD_INVALID_TARGET;
}

// Runs steps(call) behind the prologue on a service and a target that there are.
template <class Steps>
sint32 run(const VLNMPCA_FCWWNService* self, VLNMPCA_FCPort* const* target,
           Property<uint32>* result, const char* method, Steps steps, const char* caller = CLASS) {
    return answer_method(*result, [&](ProviderAgent& agent) -> uint32 {
        Operation_Prologue prologue(agent);
        WWN_Call call{agent, prologue};
        VLN_LOG(VLN_DBG, "Entering %s%s", CLASS, method);
        if (const uint32 refused = check_target(call, self, target ? *target : nullptr, caller))
            return refused;
        return steps(call);
    });
}

// False, with a line, for a type that the method has no line for; else that line is logged.
bool check_type(const char* method, const Property<uint16>& type,
                std::span<const char* const> lines) {
    if (!type.is_null() && type.value < lines.size()) {
        VLN_LOG(VLN_INFO, "%s", lines[type.value]);
        return true;
    }
    VLN_LOG(VLN_ERR, "%s: Type %d not recognized...", method,
            type.is_null() ? -1 : static_cast<int>(type.value));
    return false;
}

// A name as ReadWWN tells it, or in 16 digits as ports bear it.
bool read_name(const String& text, HBA_WWN& name) {
    return text.size() == 2 * sizeof name.wwn
               ? VLN_MethodWrapper::string2HBAName(&name, text.c_str()) == 1
               : VLN_MethodWrapper::str2HBAName(&name, text.c_str()) == 0;
}

// What is no name at all is as little valid as what the library refuses.
uint32 read_new_names(const Property<String>& wwpn, const Property<String>& wwnn, HBA_WWN& new_wwpn,
                      HBA_WWN& new_wwnn) {
    if (wwpn.is_null() || wwnn.is_null()) {
        VLN_LOG(VLN_ERR, "ChangeWWN: a new name is missing");
        return NAME_MISSING;
    }
    const char* const invalid = !read_name(wwpn.value, new_wwpn)   ? "WWPN"
                                : !read_name(wwnn.value, new_wwnn) ? "WWNN"
                                                                   : nullptr;
    if (!invalid)
        return library_result(VLN_MethodWrapper::ValidateNewWWNs(&new_wwpn, &new_wwnn));
    VLN_LOG(VLN_ERR, "The supplied 'New %s' is not valid", invalid);
    return METHOD_LIBRARY_STATUS + AX_STATUS_ILLEGAL_WWN;
}

String name_text(const HBA_WWN& name) {
    const auto& b = name.wwn;
    return format_text("%02x:%02x:%02x:%02x:%02x:%02x:%02x:%02x", b[0], b[1], b[2], b[3], b[4],
                       b[5], b[6], b[7]);
}

} // namespace

sint32 WWN_Service_Provider::unload() {
    Waiting_Call::end_all(Service::static_meta_class);
    return Pattern_Provider::unload();
}

sint32 WWN_Service_Provider::GetWWNCapability(const Service* self, Target_Port target,
                                              Property<uint32>* capability, Result* result) {
    return run(
        self, target, result, "GetWWNCapability",
        [&](const WWN_Call& call) -> uint32 {
            uint32 word = 0;
            const AX_STATUS status = VLN_MethodWrapper::GetWWNCapability(&call.name, &word);
            if (status == AX_STATUS_OK)
                capability->set(word);
            return library_result(status);
        },
        CAPABILITY_CLASS);
}

sint32 WWN_Service_Provider::ReadWWN(const Service* self, Target_Port target,
                                     Property<uint16>* type, Property<String>* wwpn,
                                     Property<String>* wwnn, Property<uint16>* activation,
                                     Result* result) {
    static constexpr const char* TYPES[] = {"Reading Volatile WWNs.", "Reading Non-Volatile WWNs.",
                                            "Reading Factory Default WWNs.",
                                            "Reading current WWNs.", "Reading configured WWNs."};
    wwpn->clear(); // these go in as well, and any bytes of a client would come back
    wwnn->clear();
    return run(self, target, result, "ReadWWN", [&](const WWN_Call& call) -> uint32 {
        if (!check_type("ReadWWN", *type, TYPES))
            return METHOD_INVALID_TARGET;
        HBA_WWN port_name{}, node_name{};
        uint32 word = 0;
        if (const AX_STATUS status =
                VLN_MethodWrapper::ReadWWN(&call.name, type->value, &port_name, &node_name, &word))
            return library_result(status);
        if (type->value != AX_WWN_NON_VOLATILE && type->value != AX_WWN_FACTORY_DEFAULT)
            activation->set(static_cast<uint16>(word));
        wwpn->set(name_text(port_name));
        VLN_LOG(VLN_INFO, "WWPN: %s", wwpn->value.c_str());
        wwnn->set(name_text(node_name));
        VLN_LOG(VLN_INFO, "WWNN: %s", wwnn->value.c_str());
        // Who asks may follow up a change that has come into force since the last look.
        call.agent.m_bAdapterRefreshRequested = true;
        return METHOD_DONE;
    });
}

sint32 WWN_Service_Provider::ChangeWWN(const Service* self, Target_Port target,
                                       Property<String>* wwpn, Property<String>* wwnn,
                                       Property<uint16>* type, Property<uint16>* activation,
                                       Result* result) {
    static constexpr const char* TYPES[] = {"Writing Volatile World Wide Name.",
                                            "Writing Non-Volatile World Wide Name."};
    const Waiting_Call waiting(Service::static_meta_class);
    return run(self, target, result, "ChangeWWN", [&](const WWN_Call& call) -> uint32 {
        if (!check_type("ChangeWWN", *type, TYPES))
            return METHOD_INVALID_TARGET;
        HBA_WWN new_wwpn{}, new_wwnn{};
        if (const uint32 refused = read_new_names(*wwpn, *wwnn, new_wwpn, new_wwnn))
            return refused;
        if (const auto kind = VLN_MethodWrapper::FindDuplicateWWN(&new_wwpn, &new_wwnn)) {
            activation->set(static_cast<uint16>(kind));
            return DUPLICATE_FOUND;
        }
        uint32 word = 0;
        if (const AX_STATUS status = VLN_MethodWrapper::ChangeWWN(
                &call.name, &new_wwpn, &new_wwnn, type->value, &word, waiting.stop()))
            return library_result(status);
        activation->set(static_cast<uint16>(word));
        call.agent.m_bAdapterRefreshRequested = true;
        VLN_LOG(VLN_WARN, "ChangeWWN operation completed. Please restart the CIMOM to use Vorlan "
                          "CIM provider");
        return METHOD_DONE;
    });
}

sint32 WWN_Service_Provider::RestoreWWN(const Service* self, Target_Port target,
                                        Property<uint16>* type, Property<uint16>* activation,
                                        Result* result) {
    static constexpr const char* TYPES[] = {"Restoring Factory Default World Wide Name...",
                                            "Restoring Non-volatile World Wide Name..."};
    // The entry's line is that of a reading.
    const Waiting_Call waiting(Service::static_meta_class);
    return run(self, target, result, "ReadWWN", [&](const WWN_Call& call) -> uint32 {
        if (!check_type("RestoreWWN", *type, TYPES))
            return METHOD_INVALID_TARGET;
        call.prologue.letDataGo();
        uint32 word = 0;
        // A refusal is no failure to the client: it sees that nothing waits for it.
        if (VLN_MethodWrapper::RestoreWWN(&call.name, type->value, &word, waiting.stop()) !=
            AX_STATUS_OK)
            return METHOD_DONE;
        activation->set(static_cast<uint16>(word));
        call.agent.m_bAdapterRefreshRequested = true;
        return METHOD_DONE;
    });
}

} // namespace cimple
