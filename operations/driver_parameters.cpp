// The parameters of a driver, and the logical units that it serves before others.
#include "operations/operation_frame.h"

#include <charconv>
#include <cstddef>
#include <cstdio>
#include <cstring>
#include <new>

namespace cimple {

namespace {

constexpr uint32 FIRST_TABLE = 52; // records

struct Parameter_Query {
    const char* function; // of the library, without its prefix
    AX_STATUS (*call)(AX_WWN wwn, AX_DriverParam* table, uint32_t* count);
    const char* noMemory;
    sint32 noMemoryLevel;
};

constexpr Parameter_Query GLOBAL_QUERY = {
    "GetDriverParamsGlobal", AX_GetDriverParamsGlobal,
    "ERROR: vlncimGetDriverParamsGlobal: Unable to allocate buffer", VLN_ERR};
constexpr Parameter_Query LOCAL_QUERY = {"GetDriverParams", AX_GetDriverParams,
                                         "Unable to allocate memory for pConfParams", VLN_CRIT};

AX_STATUS outOfMemory(const Parameter_Query& query) {
    VLN_LOG(query.noMemoryLevel, "%s", query.noMemory);
    return AX_STATUS_NO_MEMORY;
}

AX_STATUS queryParameters(const Parameter_Query& query, AX_WWN wwn, Reply& reply) {
    const Reply_Shape shape{.head = 0,
                            .entry = sizeof(AX_DriverParam),
                            .first = FIRST_TABLE,
                            .tooSmallToo = AX_STATUS_LIST_TOO_SMALL};
    int calls = 0;
    const auto call = [&](void* buffer, uint32& count) {
        const AX_STATUS status = query.call(wwn, static_cast<AX_DriverParam*>(buffer), &count);
        if (++calls == 1)
            VLN_LOG(VLN_DBG, "AX_%s: status=%d", query.function, static_cast<int>(status));
        return status;
    };
    const AX_STATUS status = reply.fetch(shape, {nullptr, AX_STATUS_NO_MEMORY}, call);
    if (status == AX_STATUS_NO_MEMORY && !reply.data())
        return outOfMemory(query);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "ERROR: vlncim%s: AX_%s call failed (%c) (%d)", query.function,
                             query.function, calls > 1 ? 'a' : 'b', static_cast<int>(status));
    return status;
}

// The line of the first rule that the arguments of a change break, or null.
const char* brokenRule(uint32 scope, uint32 duration, const char* parameter, const char* value) {
    if (scope > VLN_MethodWrapper::PARAMETER_GLOBAL)
        return "INVALID CW1";
    if (duration > VLN_MethodWrapper::PARAMETER_PERSISTENT)
        return "INVALID CW2";
    if (!parameter)
        return "Null pointer assignment in argument pDriverParam";
    return value ? nullptr : "Null pointer assignment in argument pVal";
}

// Nothing but a decimal number is taken: a unit that the client did not mean would be changed.
bool readUnit(const char* text, uint32& unit) {
    const char* const end = text ? text + std::strlen(text) : nullptr;
    const auto read = std::from_chars(text, end, unit);
    return text != end && read.ec == std::errc() && read.ptr == end;
}

} // namespace

AX_STATUS VLN_MethodWrapper::FCoEGetDriverParam(const char* port, bool global,
                                                std::vector<AX_DriverParam>* parameters) {
    Operation_Frame frame("Entering VLN_MethodWrapper::FCoEGetDriverParam()");
    if (!frame.given(parameters))
        return frame.status();
    parameters->clear();
    HBA_WWN name{};
    if (string2HBAName(&name, port) != 1)
        return AX_STATUS_ERROR;
    const Parameter_Query& query = global ? GLOBAL_QUERY : LOCAL_QUERY;
    Reply reply;
    const AX_STATUS status = queryParameters(query, wwnOf(&name), reply);
    if (status != AX_STATUS_OK)
        return status;
    try {
        const auto* table = static_cast<const AX_DriverParam*>(reply.data());
        parameters->assign(table, table + reply.count());
    } catch (const std::bad_alloc&) {
        return outOfMemory(query);
    }
    VLN_LOG(VLN_DBG, "number of driver parameters %d", static_cast<int>(reply.count()));
    VLN_LOG(VLN_DBG, "Exiting VLN_MethodWrapper::FCoEGetDriverParam()");
    return AX_STATUS_OK;
}

AX_STATUS VLN_MethodWrapper::vlncimSetDriverParam(const char* deviceId, const HBA_WWN* name,
                                                  uint32 scope, uint32 duration,
                                                  const char* parameter, const char* value) {
    Operation_Frame frame("VLN_MethodWrapper::vlncimSetDriverParam");
    const char* const broken =
        Validatewwpn(name) != 0 ? "INVALID wwpn" : brokenRule(scope, duration, parameter, value);
    if (broken) {
        VLN_LOG(VLN_ERR, "%s", broken);
        return AX_STATUS_ERROR;
    }
    VLN_LOG(VLN_DBG, "vlncimSetDriverParam Parameters ::");
    VLN_LOG(VLN_DBG, "CW1=%d CW2=%d pDriverParam=%s pVal=%s, deviceID=%s", static_cast<int>(scope),
            static_cast<int>(duration), parameter, value, deviceId ? deviceId : "");
    char text[256] = {};
    const int length = std::snprintf(text, sizeof text, "%s=%s", parameter, value);
    if (length < 0 || static_cast<std::size_t>(length) >= sizeof text) {
        VLN_LOG(VLN_ERR, "The driver parameter's name and value are too long");
        return AX_STATUS_ERROR;
    }
    const uint32 control = scope << 1 | duration;
    VLN_LOG(VLN_DBG, "pParamStr:[%s], Ccw:[%d]", text, static_cast<int>(control));
    VLN_LOG(VLN_DBG, "Calling AX_SetDriverParam");
    const AX_STATUS status = AX_SetDriverParam(wwnOf(name), text, control);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "AX_SetDriverParam fails with status : %d", status);
    return status;
}

AX_STATUS VLN_MethodWrapper::SetOASLunState(const char* initiator, const char* vport,
                                            const char* target, const char* lun, uint32 state,
                                            uint32 option) {
    uint32 unit = 0;
    const bool isNumber = readUnit(lun, unit);
    VLN_LOG(VLN_DBG,
            "Enter VLN_MethodWrapper:SetOASLunState Input OASState: %d, Lun no: %d, option: %d",
            static_cast<int>(state), static_cast<int>(unit), static_cast<int>(option));
    if (!isNumber) {
        VLN_LOG(VLN_ERR, "The number of the logical unit is none: %s", lun ? lun : "");
        return AX_STATUS_ERROR;
    }
    HBA_WWN port{}, seer{}, seen{};
    if (!nameOfDeviceId(initiator, port, "", VLN_ERR) ||
        !nameOfDeviceId(vport, seer, "", VLN_ERR) || !nameOfDeviceId(target, seen, "", VLN_ERR))
        return AX_STATUS_ERROR;
    const AX_STATUS status =
        AX_SetOASLunState(wwnOf(&port), wwnOf(&seer), wwnOf(&seen), unit, state, option);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, " Operation failure. PrioVia State has not been set");
    return status;
}

AX_STATUS VLN_MethodWrapper::GetOASLunList(const HBA_WWN* name, uint32 option,
                                           std::vector<AX_OASLun>* units) {
    constexpr uint32 FIRST_LIST = 64; // units
    Operation_Frame frame("VLN_MethodWrapper::GetOASLunList");
    if (!frame.given(units))
        return frame.status();
    const AX_STATUS status = fetch_list<AX_OASLunList>(
        units, FIRST_LIST, {"Unable to allocate the memory for the list of units with priority"},
        [&](AX_OASLunList* list) { return AX_GetOASLunList(wwnOf(name), option, list); });
    if (status == AX_STATUS_NOT_SUPPORTED)
        VLN_LOG(VLN_DBG, "GetOASLunList failed. Unsupported Hardware");
    else if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetOASLunList exited with the error code %d", status);
    return status;
}

} // namespace cimple
