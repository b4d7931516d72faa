#include "services/iscsi_settings/service_call.h"

#include "agent/hardware/port_name.h"
#include "services/iscsi_settings/instances.h"

namespace cimple {

bool ISCSI_Call::refuse(uint32 value, const char* line) {
    VLN_LOG(VLN_ERR, "%s: %s", method, line);
    result = value;
    return false;
}

bool ISCSI_Call::failed(uint32 value, const char* operation, AX_STATUS status) {
    VLN_LOG(VLN_ERR, "%s: %s failed with %d.", method, operation, static_cast<int>(status));
    result = value;
    return false;
}

bool ISCSI_Call::check_service(const VLNMPCA_iSCSISettingService* self) {
    if (self && agent.m_VLNMPCA_iSCSISettingService_map.lookup(self))
        return true;
    return refuse(METHOD_UNKNOWN_INSTANCE, "Invalid instance of VLNMPCA_iSCSISettingService");
}

bool ISCSI_Call::check_port(const Property<String>& mac, uint32 value) {
    return (!mac.is_null() && find_iscsi_port(agent, mac.value, name)) ||
           refuse(value, "Invalid MAC address passed.");
}

bool ISCSI_Call::check_target(const Property<String>& target, uint32 value) {
    return is_target_name(target) || refuse(value, "Invalid Target name passed.");
}

bool ISCSI_Call::check_authentication(const Property<uint32>& type, const CHAP_Texts& texts) {
    return is_authentication(type.is_null() ? uint32{AX_ISCSI_AUTH_NONE} : type.value, texts) ||
           refuse(METHOD_INVALID_TARGET, "Invalid authentication options passed.");
}

bool ISCSI_Call::read_portal(const Property<String>& address, const Property<uint16>& port,
                             uint32 value) {
    const uint16 number = port.is_null() ? ISCSI_TCP_PORT : port.value;
    return (!address.is_null() &&
            VLN_MethodWrapper::addressOf(address.value.c_str(), number, portal)) ||
           refuse(value, "Invalid IP address passed.");
}

bool ISCSI_Call::read_optional_address(const Property<String>& address, const AX_IPAddress*& given,
                                       uint32 value) {
    given = nullptr;
    if (address.is_null() || address.value.empty())
        return true;
    if (!read_portal(address, {}, value))
        return false;
    given = &portal;
    return true;
}

void ISCSI_Call::refresh(const char* what) {
    VLN_LOG(VLN_INFO, "%s: %s. Refreshing SAN Data.", method, what);
    agent.requestSANRefresh();
}

} // namespace cimple
