// World Wide Names: reading, changing and restoring those of a port, and looking for names that the
// host has already.
#include "cimple/guard.h"
#include "cimple/thread.h"
#include "operations/operation_frame.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr int TRIES = 300;
constexpr uint64 BETWEEN_TRIES = 1000000; // microseconds
constexpr uint32 MAX_SEARCHED_VPORTS = 1023;
// No host has as many; a count beyond it is a library's mistake, and would take for ever.
constexpr uint32 MAX_ADAPTERS = 65536;

// What a change, or a restore, says of an activation word.
struct Activation_Lines {
    uint32 word;
    const char* lines[3]; // in this order, the rest null
};

constexpr char REBOOT[] = "Reboot required to activate the new setting";
constexpr char UNTIL_POWER_DOWN[] =
    "Volatile names will be active until system power-down or HBA power-cycle";
constexpr char RESET[] = "Reset required to activate the new setting";

constexpr Activation_Lines CHANGED[] = {
    {AX_WWN_ACTIVATION_VOLATILE_REBOOT, {REBOOT, UNTIL_POWER_DOWN}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT, {REBOOT}},
    {AX_WWN_ACTIVATION_VOLATILE_RESET, {RESET, UNTIL_POWER_DOWN}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_RESET, {RESET}},
};

constexpr char RESTORED[] = "WWNs restored successfully";

constexpr Activation_Lines RESTORED_LINES[] = {
    {AX_WWN_ACTIVATION_NONE, {"WWNs already active. No Restore needed"}},
    {AX_WWN_ACTIVATION_VOLATILE_REBOOT, {RESTORED, REBOOT, UNTIL_POWER_DOWN}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT, {RESTORED, REBOOT}},
    {AX_WWN_ACTIVATION_VOLATILE_RESET,
     {RESTORED, "Reset the HBA to activate the new setting", UNTIL_POWER_DOWN}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_RESET,
     {RESTORED, "Please reset the HBA to activate the new setting"}},
};

template <std::size_t N>
void logActivation(const Activation_Lines (&table)[N], uint32 word) {
    for (const Activation_Lines& row : table)
        for (const char* line : row.lines)
            if (row.word == word && line)
                VLN_LOG(VLN_WARN, "%s", line);
}

// ---- Reading ----

// The word "configured" stands for names that wait, whichever set was asked for.
constexpr Activation_Lines READ[] = {
    {AX_WWN_ACTIVATION_NONE, {"Volatile WWNs are active"}},
    {AX_WWN_ACTIVATION_VOLATILE, {"Current WWNs: Volatile"}},
    {AX_WWN_ACTIVATION_NON_VOLATILE, {"Current WWNs: Non-Volatile"}},
    {AX_WWN_ACTIVATION_VOLATILE_REBOOT,
     {"Configured WWNs: Volatile (Activation required: warm reboot)"}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT,
     {"Configured WWNs: Non-Volatile (Activation required: warm reboot)"}},
    {AX_WWN_ACTIVATION_VOLATILE_RESET,
     {"Configured WWNs: Volatile (Activation required: adapter restart)"}},
    {AX_WWN_ACTIVATION_NON_VOLATILE_RESET,
     {"Configured WWNs: Non-Volatile (Activation required: adapter restart)"}},
};

void logRead(uint32 type, uint32 activation) {
    if (type == AX_WWN_NON_VOLATILE)
        VLN_LOG(VLN_INFO, "Non-Volatile WWNs read successfully");
    else if (type == AX_WWN_FACTORY_DEFAULT)
        VLN_LOG(VLN_INFO, "Factory Default WWNs read successfully");
    else if (activation == AX_WWN_ACTIVATION_NO_NAMES)
        VLN_LOG(VLN_INFO, "%s",
                type == AX_WWN_VOLATILE ? "Volatile WWNs DO NOT EXIST on this adapter"
                                        : "Configured WWNs DO NOT EXIST");
    else
        for (const Activation_Lines& row : READ)
            if (row.word == activation)
                VLN_LOG(VLN_INFO, "%s", row.lines[0]);
}

void logCapability(uint32 capability) {
    if (capability & AX_WWN_READ_ONLY)
        VLN_LOG(VLN_INFO,
                "Read Only mode: World Wide Name Management is not supported in this mode");
    VLN_LOG(VLN_INFO, capability & AX_WWN_CAN_CHANGE_NON_VOLATILE
                          ? "Can change Non-Volatile WWNs"
                          : "Cannot change Non-Volatile WWNs");
    VLN_LOG(VLN_INFO, capability & AX_WWN_CAN_CHANGE_VOLATILE ? "Can change Volatile WWNs"
                                                              : "Cannot change Volatile WWNs");
    if (capability & AX_WWN_NEEDS_REBOOT)
        VLN_LOG(VLN_INFO, "Activation requirement: Reboot");
    if (capability & AX_WWN_NEEDS_RESET)
        VLN_LOG(VLN_INFO, "Activation requirement: Reset HBA");
}

// ---- Duplicates ----

bool same(const AX_NAME& name, const HBA_WWN* other) {
    return other && std::memcmp(name.byte, other->wwn, sizeof name.byte) == 0;
}

// The names of adapters met so far, some of which are listed more than once.
class Met_Adapters {
public:
    // False for one that was met before. Without memory the list is given up, and each adapter
    // counts as new.
    bool add(const uint8 (&name)[8]) {
        AX_NAME entry;
        std::memcpy(entry.byte, name, sizeof entry.byte);
        for (const AX_NAME& each : _names)
            if (std::memcmp(each.byte, entry.byte, sizeof each.byte) == 0)
                return false;
        try {
            _names.push_back(entry);
        } catch (const std::bad_alloc&) {
            std::printf("\nERROR: isDuplicateEntryInWWPNList: %s failed",
                        _names.empty() ? "malloc" : "realloc");
            _names.clear();
        }
        return true;
    }

private:
    std::vector<AX_NAME> _names;
};

// By WWN_Duplicate. A list of virtual ports tells the first kind alone.
constexpr const char* DUPLICATES[] = {nullptr, "vport WWPN", "vport WWNN", "vport target WWPN",
                                      "vport target WWNN"};

bool hasVPort(AX_WWN adapter, const HBA_WWN* wwpn, const HBA_WWN* wwnn) {
    uint32 reported = 0;
    Reply reply;
    // The count is kept apart: what it says beyond the buffer's room is not looked at.
    const AX_STATUS status =
        reply.fetch({offsetof(AX_VPortList, entry), sizeof(AX_VPort), 1},
                    {"Unable to allocate the memory for the list of virtual ports"},
                    [&](void* buffer, uint32& count) {
                        auto* list = static_cast<AX_VPortList*>(buffer);
                        list->count = count;
                        const AX_STATUS answer = AX_VPList(adapter, list);
                        reported = list->count;
                        count = answer == AX_STATUS_OK ? std::min(reported, count) : reported;
                        return answer;
                    });
    if (status != AX_STATUS_OK || reported > MAX_SEARCHED_VPORTS)
        return false;
    const AX_VPort* entry = static_cast<const AX_VPortList*>(reply.data())->entry;
    return std::any_of(entry, entry + reply.count(), [&](const AX_VPort& port) {
        return same(port.wwpn, wwpn) || same(port.wwpn, wwnn);
    });
}

// ---- Changing ----

// Asks until the library has done it: at once, and then TRIES times.
template <class Call>
AX_STATUS askUntilDone(const char* waiting, const char* thrown, const bool& stop, Call call) {
    AX_STATUS status = AX_STATUS_ERROR;
    const bool complete = run_guarded([&] {
        status = call();
        for (int tries = 0; status == AX_STATUS_WWN_IN_PROGRESS && tries < TRIES; ++tries) {
            if (tries == 0)
                VLN_LOG(VLN_INFO, "%s", waiting);
            Time::sleep(BETWEEN_TRIES, stop);
            if (load_flag(stop))
                return;
            status = call();
        }
    });
    if (!complete)
        VLN_LOG(VLN_ERR, "%s", thrown);
    return complete ? status : AX_STATUS_ERROR;
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetWWNCapability(const HBA_WWN* name, uint32* capability) {
    Operation_Frame frame("VLN_MethodWrapper::GetWWNCapability");
    if (!frame.given(capability))
        return frame.status();
    const AX_STATUS status = AX_GetWWNCapability(wwnOf(name), capability);
    if (status == AX_STATUS_OK)
        logCapability(*capability);
    else if (status == AX_STATUS_WWN_NOT_AVAILABLE)
        VLN_OPERATION_FAILED(status, "WWN Management is not available on this HBA");
    else
        VLN_OPERATION_FAILED(
            status, "GetWWNCapability: AX_ReadWWNCapability call failed with error: %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::ReadWWN(const HBA_WWN* name, uint32 type, HBA_WWN* wwpn, HBA_WWN* wwnn,
                                     uint32* activation) {
    Operation_Frame frame("VLN_MethodWrapper::ReadWWN");
    if (!frame.given(wwpn) || !frame.given(wwnn) || !frame.given(activation))
        return frame.status();
    AX_NAME names[2] = {};
    *activation = 0;
    const AX_STATUS status = AX_ReadWWN(wwnOf(name), type, &names[0], &names[1], activation);
    if (status == AX_STATUS_OK) {
        std::memcpy(wwpn->wwn, names[0].byte, sizeof wwpn->wwn);
        std::memcpy(wwnn->wwn, names[1].byte, sizeof wwnn->wwn);
        logRead(type, *activation);
    } else if (status == AX_STATUS_WWN_NOT_AVAILABLE) {
        VLN_OPERATION_FAILED(status, "WWN Management is NOT AVAILABLE on this adapter");
    } else if (status == AX_STATUS_WWN_NOT_SUPPORTED && type == AX_WWN_VOLATILE) {
        VLN_OPERATION_FAILED(status, "Volatile WWNs are NOT SUPPORTED on this adapter");
    } else {
        VLN_OPERATION_FAILED(status, "ReadWWN: AX_ReadWWN call failed with error: %d", status);
    }
    return status;
}

AX_STATUS VLN_MethodWrapper::ValidateNewWWNs(const HBA_WWN* wwpn, const HBA_WWN* wwnn) {
    if (AX_ValidateWwn(wwnOf(wwpn)) == AX_STATUS_ILLEGAL_WWN) {
        VLN_LOG(VLN_ERR, "The supplied 'New WWPN' is not valid");
        return AX_STATUS_ILLEGAL_WWN;
    }
    if (AX_ValidateWwn(wwnOf(wwnn)) == AX_STATUS_ILLEGAL_WWN) {
        VLN_LOG(VLN_ERR, "The supplied 'New WWNN' is not valid");
        return AX_STATUS_ILLEGAL_WWN;
    }
    return AX_STATUS_OK;
}

VLN_MethodWrapper::WWN_Duplicate VLN_MethodWrapper::FindDuplicateWWN(const HBA_WWN* wwpn,
                                                                     const HBA_WWN* wwnn) {
    Met_Adapters met;
    const uint32 count = std::min(AX_GetNumberOfLocalAdapters(), MAX_ADAPTERS);
    for (uint32 index = 0; index < count; ++index) {
        AX_LocalHBAInfo info{};
        if (AX_GetLocalHBAInfo(index, &info) != AX_STATUS_OK || !met.add(info.portWWN))
            continue;
        HBA_WWN adapter{};
        std::memcpy(adapter.wwn, info.portWWN, sizeof adapter.wwn);
        if (hasVPort(wwnOf(&adapter), wwpn, wwnn)) {
            VLN_LOG(VLN_DBG, "ChangeWWN: Duplication of %s detected.",
                    DUPLICATES[WWN_OF_VPORT_PORT]);
            return WWN_OF_VPORT_PORT;
        }
    }
    return WWN_UNIQUE;
}

AX_STATUS VLN_MethodWrapper::ChangeWWN(const HBA_WWN* name, const HBA_WWN* wwpn,
                                       const HBA_WWN* wwnn, uint32 type, uint32* activation,
                                       const bool& stop) {
    Operation_Frame frame("VLN_MethodWrapper::ChangeWWN");
    if (!frame.given(activation))
        return frame.status();
    VLN_LOG(VLN_INFO, "ChangeWWN operation initiated");
    *activation = 0;
    const AX_STATUS status =
        askUntilDone("Validating new WWNs...", "Error in AX_ChangeWWN", stop, [&] {
            return AX_ChangeWWN(wwnOf(name), wwnOf(wwpn), wwnOf(wwnn), type, activation);
        });
    if (status == AX_STATUS_OK) {
        VLN_LOG(VLN_WARN, "New WWNs written successfully");
        logActivation(CHANGED, *activation);
        return status;
    }
    if (status == AX_STATUS_WWN_NOT_AVAILABLE)
        VLN_LOG(VLN_ERR, "WWN Management is not available on this HBA");
    else if (status == AX_STATUS_WWN_NOT_SUPPORTED)
        VLN_LOG(VLN_ERR, "WWN NOT SUPPORTED");
    VLN_OPERATION_FAILED(status, "ChanngeWWN: AX_ChangeWWN call failed with error: %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::RestoreWWN(const HBA_WWN* name, uint32 type, uint32* activation,
                                        const bool& stop) {
    Operation_Frame frame("VLN_MethodWrapper::RestoreWWN");
    if (!frame.given(activation))
        return frame.status();
    VLN_LOG(VLN_INFO, "RestoreWWN operation initiated.");
    *activation = 0;
    const AX_STATUS status = askUntilDone("Restoring WWNs...", "Error in RestoreWWN", stop, [&] {
        return AX_RestoreWWN(wwnOf(name), type, activation);
    });
    if (status == AX_STATUS_OK)
        logActivation(RESTORED_LINES, *activation);
    return status;
}

} // namespace cimple
