// The walk over the targets of an iSCSI port: first their sessions, then their logical units, since
// a path to a unit begins at an endpoint that a session has made.

#include "agent/san/iscsi_san_maps.h"

#include "agent/hardware/port_name.h"
#include "agent/san/iscsi_session_maps.h"
#include "agent/store_search.h"
#include "agent/text.h"
#include "classes/CIM_ComputerSystem.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_SCSIProtocolController.h"
#include "classes/VLNMPCA_TCPProtocolEndpoint.h"
#include "device/library/bound_functions.h"
#include "device/scan_end.h"

#include <cstdlib>
#include <new>

namespace cimple {

namespace {

// A list of the library, which allocates as the caller of an operation frees.
struct Free_List {
    void operator()(void* list) const { std::free(list); }
};

template <class List>
using Owned_List = std::unique_ptr<List, Free_List>;

void log_missing_information(std::size_t index, const AX_iSCSI_Session& session) {
    // A session has no handle until its login is through.
    const bool named = session.tsih != 0;
    VLN_LOG(VLN_DBG, "Unable to list session information for session %d (%s=%d).\n",
            static_cast<int>(index), named ? "TSIH" : "ISID Qualifier",
            named ? static_cast<int>(session.tsih) : static_cast<int>(session.isidQualifier));
}

ISCSI_Target target_of(std::size_t index, const AX_iSCSI_Target& entry) {
    ISCSI_Target target{};
    target.index = index;
    target.raw_name = fieldText(entry.name);
    target.name = text(target.raw_name);
    return target;
}

} // namespace

uint32 ISCSI_SAN_Maps::GetiSCSITargets(Port& port) {
    VLN_LOG(VLN_DBG, "Entered GetiSCSITargets.");
    try {
        ISCSI_View view{port, text(port.getPortName()), {}, nullptr, nullptr, nullptr, nullptr};
        if (!VLN_MethodWrapper::string2HBAName(&view.wwn, view.port_name.c_str()))
            return AX_STATUS_ERROR;
        findEnds(view);
        if (!view.system) {
            VLN_LOG(VLN_ERR, "GetiSCSITargets: There is no computer system to tie targets to");
            return AX_STATUS_ERROR;
        }
        return walkTargets(view);
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "GetiSCSITargets: Out of memory");
        return AX_STATUS_NO_MEMORY;
    }
}

void ISCSI_SAN_Maps::findEnds(ISCSI_View& view) const {
    const auto& systems = _agent.m_CIM_ComputerSystem_map;
    const auto& controllers = _agent.m_VLNMPCA_SCSIProtocolController_map;
    view.system = systems.size() == 0 ? nullptr : systems[0];
    view.controller = controllers.size() == 0 ? nullptr : controllers[0];
    view.ethernet_port = find_in_system(_agent, _agent.m_VLNMPCA_EthernetPort_map,
                                        &VLNMPCA_EthernetPort::DeviceID, view.port_name);
    view.tcp_endpoint =
        find_in_system(_agent, _agent.m_VLNMPCA_TCPProtocolEndpoint_map,
                       &VLNMPCA_TCPProtocolEndpoint::Name, tcp_endpoint_name(view.port_name));
}

uint32 ISCSI_SAN_Maps::walkTargets(const ISCSI_View& view) {
    AX_iSCSI_TargetList* table = nullptr;
    AX_STATUS status = VLN_MethodWrapper::ListiSCSITargets(&view.wwn, &table);
    if (status != AX_STATUS_OK)
        return status;
    const Owned_List<AX_iSCSI_TargetList> owner(table);
    VLN_LOG(VLN_DBG, "AX_iSCSI_GetTargets succeded.");
    std::vector<ISCSI_Target> targets;
    for (uint32 i = 0; i < table->count && !scan_is_to_end; ++i) {
        VLN_LOG(VLN_DBG, "targetList index: %u", i);
        ISCSI_Target& target = targets.emplace_back(target_of(i, table->entry[i]));
        if (table->entry[i].flags & AX_ISCSI_TARGET_HAS_SESSIONS)
            status = createSessions(view, target);
        if (status != AX_STATUS_OK)
            return status;
    }
    for (const ISCSI_Target& target : targets) {
        if (scan_is_to_end)
            break;
        status = createTarget(view, target);
        if (status != AX_STATUS_OK)
            return status;
    }
    return AX_STATUS_OK;
}

uint32 ISCSI_SAN_Maps::createSessions(const ISCSI_View& view, ISCSI_Target& target) {
    AX_iSCSI_SessionList* table = nullptr;
    const char* name = target.raw_name.c_str();
    const AX_STATUS status = VLN_MethodWrapper::ListiSCSISessions(&view.wwn, name, &table);
    if (status != AX_STATUS_OK)
        return status;
    const Owned_List<AX_iSCSI_SessionList> owner(table);
    VLN_LOG(VLN_DBG, " AX_iSCSI_GetSessions() succesful.");
    VLN_LOG(VLN_DBG, "Total Sessions: %d", static_cast<int>(table->count));
    ISCSI_Session_Maps maps(_agent, view, target);
    for (uint32 i = 0; i < table->count; ++i) {
        const AX_iSCSI_Session& entry = table->entry[i];
        AX_iSCSI_SessionInfo info{};
        if (AX_iSCSI_GetSessionInfo(AX_WwnOf(&view.wwn), name, &entry, &info) != AX_STATUS_OK) {
            log_missing_information(i, entry);
            continue;
        }
        VLN_LOG(VLN_DBG, "AX_iSCSI_GetSessionInfo() succesful.");
        maps.createSession(entry.sessionId, info);
    }
    return AX_STATUS_OK;
}

} // namespace cimple
