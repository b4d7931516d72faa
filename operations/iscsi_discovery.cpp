// The lists of what an iSCSI port sees: targets, sessions, logical units.
#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint32 FIRST_TARGETS = 128;
constexpr uint32 SPARE_TARGETS = 32; // targets that log in between the two calls
constexpr uint32 FIRST_SESSIONS = 1;
constexpr uint32 FIRST_LUNS = 64;

template <class List>
constexpr Reply_Shape shapeOf(uint32 first, uint32 spare = 0) {
    return {offsetof(List, entry), sizeof(List{}.entry[0]), first, spare};
}

// On success the list is the caller's.
template <class List>
AX_STATUS handOver(Reply& reply, AX_STATUS status, List** list) {
    if (status == AX_STATUS_OK)
        *list = static_cast<List*>(reply.release());
    return status;
}

// A reply without a buffer is one that there was no memory for, unlike one of a library that has
// none.
bool isOutOfMemory(AX_STATUS status, const Reply& reply) {
    return status == AX_STATUS_NO_MEMORY && !reply.data();
}

} // namespace

AX_STATUS VLN_MethodWrapper::ListiSCSITargets(const HBA_WWN* name, AX_iSCSI_TargetList** targets) {
    Operation_Frame frame("VLN_MethodWrapper::ListiSCSITargets");
    if (!frame.given(targets))
        return frame.status();
    Reply reply;
    bool called = false;
    const AX_STATUS status = reply.fetch(
        shapeOf<AX_iSCSI_TargetList>(FIRST_TARGETS, SPARE_TARGETS), {nullptr, AX_STATUS_NO_MEMORY},
        counted<AX_iSCSI_TargetList>([&](AX_iSCSI_TargetList* list) {
            called = true;
            return AX_iSCSI_GetTargets(wwnOf(name), list);
        }));
    if (isOutOfMemory(status, reply)) {
        if (called) {
            VLN_LOG(VLN_DBG, "ERROR: GetiSCSITargets: ");
            VLN_LOG(VLN_DBG, "Unable to allocate buffer. ");
        } else {
            VLN_LOG(VLN_DBG, "GetiSCSITargets: Out of memory, unable to allocate target list.");
        }
    } else if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_DBG, "ERROR: GetiSCSITargets Failed.");
        logStatus(status);
    }
    return handOver(reply, status, targets);
}

AX_STATUS VLN_MethodWrapper::ListiSCSISessions(const HBA_WWN* name, const char* target,
                                               AX_iSCSI_SessionList** sessions) {
    Operation_Frame frame("VLN_MethodWrapper::ListiSCSISessions");
    if (!frame.given(sessions))
        return frame.status();
    Reply reply;
    const AX_STATUS status =
        reply.fetch(shapeOf<AX_iSCSI_SessionList>(FIRST_SESSIONS), {nullptr, AX_STATUS_NO_MEMORY},
                    counted<AX_iSCSI_SessionList>([&](AX_iSCSI_SessionList* list) {
                        return AX_iSCSI_GetSessions(wwnOf(name), target, list);
                    }));
    if (isOutOfMemory(status, reply)) {
        VLN_LOG(VLN_DBG, " ListSessions: Unable to allocate buffer. ");
    } else if (status != AX_STATUS_OK) {
        VLN_LOG(VLN_DBG, "ERROR: AX_iSCSI_GetSessions() Failed.");
        logStatus(status);
    }
    return handOver(reply, status, sessions);
}

AX_STATUS VLN_MethodWrapper::GetiSCSILuns(const HBA_WWN* name, const char* target,
                                          AX_iSCSI_LunList** luns) {
    Operation_Frame frame("VLN_MethodWrapper::GetiSCSILuns",
                          "Exiting VLN_MethodWrapper::GetiSCSILuns");
    if (!frame.given(luns))
        return frame.status();
    Reply reply;
    const AX_STATUS status = reply.fetch(shapeOf<AX_iSCSI_LunList>(FIRST_LUNS),
                                         {"Unable to allocate the memory for the list of LUNs"},
                                         counted<AX_iSCSI_LunList>([&](AX_iSCSI_LunList* list) {
                                             return AX_iSCSI_GetLuns(wwnOf(name), target, list);
                                         }));
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetiSCSILuns exited with the error code %d", status);
    return handOver(reply, status, luns);
}

} // namespace cimple
