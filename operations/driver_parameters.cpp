// The parameters of a driver.
#include "operations/operation_frame.h"

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

} // namespace cimple
