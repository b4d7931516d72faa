// What an iSCSI function is told: how it names itself, portals, targets and sessions, name servers.
//
// Records with CHAP secrets pass through here. No line of the log shows any of them.
#include "foundation/address_text.h"
#include "operations/operation_frame.h"

#include <algorithm>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint32 FIRST_NAME_SERVERS = 4;

// The status, after a line of the operation that failed.
AX_STATUS settled(const char* operation, AX_STATUS status) {
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "%s exited with the error code %d", operation, status);
    return status;
}

bool pings(const HBA_WWN* name, const AX_IPAddress& address) {
    int32_t reply = 0;
    return AX_Ping(wwnOf(name), &address, &reply) == AX_STATUS_OK && reply > 0;
}

} // namespace

bool VLN_MethodWrapper::addressOf(const char* text, uint16 tcpPort, AX_IPAddress& address) {
    const auto bytes = parse_ipv4(text ? text : "");
    if (!bytes)
        return false;
    address = {};
    std::copy(bytes->begin(), bytes->end(), address.address);
    address.tcpPort = tcpPort;
    return true;
}

// ---- The initiator ----

AX_STATUS VLN_MethodWrapper::GetIscsiInitiatorProps(const HBA_WWN* name,
                                                    AX_iSCSI_InitiatorProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::GetIscsiInitiatorProps");
    if (!frame.given(properties))
        return frame.status();
    *properties = {};
    return settled("GetIscsiInitiatorProps",
                   AX_iSCSI_GetInitiatorProperties(wwnOf(name), properties));
}

AX_STATUS
VLN_MethodWrapper::SetInitiatorProperties(const HBA_WWN* name,
                                          const AX_iSCSI_InitiatorProperties& properties) {
    Operation_Frame frame("VLN_MethodWrapper::SetInitiatorProperties");
    return settled("SetInitiatorProperties",
                   AX_iSCSI_SetInitiatorProperties(wwnOf(name), &properties));
}

AX_STATUS VLN_MethodWrapper::GetIscsiPortStatistics(const HBA_WWN* name,
                                                    AX_iSCSI_PortStatistics* statistics) {
    Operation_Frame frame("VLN_MethodWrapper::GetIscsiPortStatistics");
    if (!frame.given(statistics))
        return frame.status();
    *statistics = {};
    return settled("GetIscsiPortStatistics", AX_iSCSI_GetPortStatistics(wwnOf(name), statistics));
}

AX_STATUS VLN_MethodWrapper::SetiSCSIBoot(const HBA_WWN* name, uint32 enabled) {
    Operation_Frame frame("VLN_MethodWrapper::SetiSCSIBoot");
    const AX_STATUS status =
        AX_SetAdapterAttribute(wwnOf(name), AX_PA_ISCSI_BOOT, &enabled, sizeof enabled);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(
            status, "ERROR: AX_SetAdapterAttribute failure. iSCSIBoot state has not been set");
    return status;
}

AX_STATUS VLN_MethodWrapper::Ping(const HBA_WWN* name, const char* ipAddress, uint16 tcpPort) {
    Operation_Frame frame("VLN_MethodWrapper::Ping");
    VLN_IpInfo info{};
    if (!frame.given(ipAddress, "Invalid iIPAddress argument") ||
        ipAddr2IpInfo(ipAddress, &info) != 0)
        return AX_STATUS_ERROR;
    AX_IPAddress address{};
    std::memcpy(address.address, info.address, sizeof address.address);
    address.tcpPort = tcpPort;
    int32_t reply = 0;
    const AX_STATUS status = AX_Ping(wwnOf(name), &address, &reply);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "IP address %s is unreachable.", ipAddress);
    else if (reply > 0)
        VLN_LOG(VLN_DBG, "Ping to IP address completed successfully");
    else
        VLN_LOG(VLN_ERR, "IP address %s does not answer.", ipAddress);
    return status;
}

// ---- Name servers ----

AX_STATUS VLN_MethodWrapper::GetiSNSServer(const HBA_WWN* name, VLN_NameServers* servers) {
    constexpr char NO_MEMORY[] = "Unable to allocate the memory for the list of iSNS servers";
    Operation_Frame frame("VLN_MethodWrapper::GetiSNSServer");
    if (!frame.given(servers))
        return frame.status();
    Reply reply;
    const AX_STATUS status = reply.fetch(
        {.head = offsetof(AX_iSCSI_iSNSServerList, server),
         .entry = sizeof(AX_IPAddress),
         .first = FIRST_NAME_SERVERS},
        {NO_MEMORY}, counted<AX_iSCSI_iSNSServerList>([&](AX_iSCSI_iSNSServerList* list) {
            return AX_iSCSI_GetiSNSServers(wwnOf(name), list);
        }));
    if (status != AX_STATUS_OK)
        return settled("GetiSNSServer", status);
    try {
        const auto* list = static_cast<const AX_iSCSI_iSNSServerList*>(reply.data());
        servers->enabled = list->enabled;
        servers->list.assign(list->server, list->server + reply.count());
        return AX_STATUS_OK;
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", NO_MEMORY);
        return AX_STATUS_ERROR;
    }
}

AX_STATUS VLN_MethodWrapper::UpdateiSNSServer(const HBA_WWN* name, const char* ipAddress,
                                              uint16 tcpPort, uint32 enable) {
    Operation_Frame frame("VLN_MethodWrapper::UpdateiSNSServer");
    AX_IPAddress server{};
    if (!addressOf(ipAddress, tcpPort, server)) {
        VLN_LOG(VLN_ERR, "UpdateiSNSServer: Invalid IP address passed.");
        return AX_STATUS_ERROR;
    }
    const bool answers = pings(name, server);
    AX_STATUS status = AX_iSCSI_AddiSNSServer(wwnOf(name), &server);
    if (status == AX_STATUS_OK)
        status = AX_iSCSI_SetiSNSState(wwnOf(name), enable);
    if (status == AX_STATUS_OK && !answers)
        VLN_LOG(VLN_WARN, "iSNS server has been updated, but IP address is unreachable");
    return settled("UpdateiSNSServer", status);
}

AX_STATUS VLN_MethodWrapper::DeleteiSNSServer(const HBA_WWN* name, const AX_IPAddress& server) {
    Operation_Frame frame("VLN_MethodWrapper::DeleteiSNSServer");
    return settled("DeleteiSNSServer", AX_iSCSI_RemoveiSNSServer(wwnOf(name), &server));
}

// ---- Portals ----

AX_STATUS VLN_MethodWrapper::AddTargetPortal(const HBA_WWN* name, const AX_IPAddress& portal,
                                             AX_iSCSI_LoginProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::AddTargetPortal");
    if (!frame.given(properties))
        return frame.status();
    return settled("AddTargetPortal",
                   AX_iSCSI_AddSendTargetPortal(wwnOf(name), &portal, properties));
}

AX_STATUS VLN_MethodWrapper::RemoveTargetPortal(const HBA_WWN* name, const AX_IPAddress& portal) {
    Operation_Frame frame("VLN_MethodWrapper::RemoveTargetPortal");
    return settled("RemoveTargetPortal", AX_iSCSI_RemoveSendTargetPortal(wwnOf(name), &portal));
}

AX_STATUS VLN_MethodWrapper::GetTargetPortalProperties(const HBA_WWN* name,
                                                       const AX_IPAddress& portal,
                                                       AX_iSCSI_LoginProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::GetTargetPortalProperties");
    if (!frame.given(properties))
        return frame.status();
    *properties = {};
    return settled("GetTargetPortalProperties",
                   AX_iSCSI_GetSendTargetPortalProperties(wwnOf(name), &portal, properties));
}

AX_STATUS VLN_MethodWrapper::SetTargetPortalProperties(const HBA_WWN* name,
                                                       const AX_IPAddress& portal,
                                                       const AX_iSCSI_LoginProperties& properties) {
    Operation_Frame frame("VLN_MethodWrapper::SetTargetPortalProperties");
    return settled("SetTargetPortalProperties",
                   AX_iSCSI_SetSendTargetPortalProperties(wwnOf(name), &portal, &properties));
}

// ---- Targets and sessions ----

AX_STATUS VLN_MethodWrapper::AddTarget(const HBA_WWN* name, const char* target,
                                       const AX_IPAddress& portal,
                                       const AX_iSCSI_LoginProperties& properties, bool login,
                                       bool boot) {
    Operation_Frame frame("VLN_MethodWrapper::AddTarget");
    const auto add = boot ? &AX_iSCSI_AddBootTarget : &AX_iSCSI_AddTarget;
    return settled("AddTarget", add(wwnOf(name), target, &portal, &properties, login));
}

AX_STATUS VLN_MethodWrapper::RemoveTarget(const HBA_WWN* name, const char* target) {
    Operation_Frame frame("VLN_MethodWrapper::RemoveTarget");
    const AX_STATUS status = AX_iSCSI_RemoveTarget(wwnOf(name), target);
    // A console tries to remove targets that are in use as a matter of course.
    return status == AX_STATUS_TARGET_IN_USE ? status : settled("RemoveTarget", status);
}

AX_STATUS VLN_MethodWrapper::TargetLogin(const HBA_WWN* name, const char* target,
                                         const AX_IPAddress& portal,
                                         const AX_iSCSI_LoginProperties& properties) {
    Operation_Frame frame("VLN_MethodWrapper::TargetLogin");
    return settled("TargetLogin", AX_iSCSI_TargetLogin(wwnOf(name), target, &portal, &properties));
}

AX_STATUS VLN_MethodWrapper::TargetLogout(const HBA_WWN* name, const char* target,
                                          const AX_IPAddress* portal, uint32 sessionId) {
    Operation_Frame frame("VLN_MethodWrapper::TargetLogout");
    return settled("TargetLogout", AX_iSCSI_TargetLogout(wwnOf(name), target, portal, sessionId));
}

AX_STATUS VLN_MethodWrapper::GetTargetLoginAuthProperties(const HBA_WWN* name, const char* target,
                                                          AX_iSCSI_LoginProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::GetTargetLoginAuthProperties");
    if (!frame.given(properties))
        return frame.status();
    *properties = {};
    return settled("GetTargetLoginAuthProperties",
                   AX_iSCSI_GetTargetLoginAuthProperties(wwnOf(name), target, properties));
}

AX_STATUS
VLN_MethodWrapper::SetTargetLoginAuthProperties(const HBA_WWN* name, const char* target,
                                                const AX_iSCSI_LoginProperties& properties) {
    Operation_Frame frame("VLN_MethodWrapper::SetTargetLoginAuthProperties");
    return settled("SetTargetLoginAuthProperties",
                   AX_iSCSI_SetTargetLoginAuthProperties(wwnOf(name), target, &properties));
}

AX_STATUS VLN_MethodWrapper::SetTargetProperties(const HBA_WWN* name, const char* target,
                                                 uint32 extendedTimeOut) {
    Operation_Frame frame("VLN_MethodWrapper::SetTargetProperties");
    uint32 refused = 0;
    const AX_STATUS status =
        AX_iSCSI_SetTargetProperties(wwnOf(name), target, extendedTimeOut, &refused);
    if (status != AX_STATUS_OK && refused)
        VLN_LOG(VLN_ERR, "The ETO value is not supported by the target operating system.");
    return settled("SetTargetProperties", status);
}

AX_STATUS VLN_MethodWrapper::SetBootTargetSession(const HBA_WWN* name, const char* target,
                                                  const AX_IPAddress* address, uint32 enable) {
    Operation_Frame frame("VLN_MethodWrapper::SetBootTargetSession");
    return settled("SetBootTargetSession",
                   AX_iSCSI_SetBootSession(wwnOf(name), target, address, enable));
}

} // namespace cimple
