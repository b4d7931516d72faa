// The parameters of drivers.
#include "simulator/call.h"

#include <algorithm>

namespace vlnsim::library {
namespace {

AX_STATUS answer_parameters(Call& call, AX_WWN wwn, AX_DriverParam* table, uint32_t* count,
                            std::optional<Driver_Parameters> Function::*parameters) {
    if (call.null(table, "table") || call.null(count, "count"))
        return AX_STATUS_INVALID_ARGUMENT;
    const Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    if (!(function->*parameters))
        return AX_STATUS_NOT_SUPPORTED;
    const Driver_Parameters& records = *(function->*parameters);
    auto needed = static_cast<std::uint32_t>(records.size());
    call.out("room", *count);
    const bool too_small = call.too_small(*count, needed);
    if (!too_small) {
        std::copy(records.begin(), records.end(), table);
        soil(table, needed * sizeof *table, *count * sizeof *table);
    }
    *count = needed;
    call.out("count", *count);
    return too_small ? AX_STATUS_LIST_TOO_SMALL : AX_STATUS_OK;
}

} // namespace

AX_STATUS AX_GetDriverParams(AX_WWN wwn, AX_DriverParam* table, uint32_t* count) {
    return answer<AX_STATUS>(
        Entry::AX_GetDriverParams,
        [&](Call& call) {
            return answer_parameters(call, wwn, table, count, &Function::driver_parameters);
        },
        wwn);
}

AX_STATUS AX_GetDriverParamsGlobal(AX_WWN wwn, AX_DriverParam* table, uint32_t* count) {
    return answer<AX_STATUS>(
        Entry::AX_GetDriverParamsGlobal,
        [&](Call& call) {
            return answer_parameters(call, wwn, table, count, &Function::global_driver_parameters);
        },
        wwn);
}

} // namespace vlnsim::library
