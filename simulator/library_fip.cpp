// FIP: what an FCoE port is set to look for, and what it has found.
#include "simulator/call.h"

#include <algorithm>

namespace vlnsim::library {
namespace {

constexpr std::uint32_t max_vlan = 4095;

// The body for a function that has FIP; the argument is not null.
template <class Body>
AX_STATUS with_fip(Call& call, AX_WWN wwn, const void* argument, const char* name, Body body) {
    if (call.null(argument, name))
        return AX_STATUS_INVALID_ARGUMENT;
    Function* function = call.function(wwn);
    if (!function)
        return AX_STATUS_ILLEGAL_WWN;
    return function->fip ? body(*function->fip) : AX_STATUS{AX_STATUS_NOT_SUPPORTED};
}

// What an adapter takes. It looks at no names: any fabric may be there tomorrow.
bool is_possible(const AX_FCFConnectList& list) {
    const bool vlan = (list.flags & AX_FCF_VLAN_VALID) != 0;
    return (list.flags & ~std::uint32_t{AX_FCF_VLAN_VALID}) == 0 &&
           (!vlan || list.vlanID <= max_vlan) && list.fcMap[0] == 0x0E && list.fcMap[1] == 0xFC;
}

} // namespace

AX_STATUS AX_CNA_FCOE_GetFCFConnectList(AX_WWN wwn, AX_FCFConnectList* list) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_FCOE_GetFCFConnectList,
        [&](Call& call) {
            return with_fip(call, wwn, list, "list", [&](const Fip& fip) -> AX_STATUS {
                *list = fip.connect;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_CNA_FCOE_SetFCFConnectList(AX_WWN wwn, const AX_FCFConnectList* list) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_FCOE_SetFCFConnectList,
        [&](Call& call) {
            return with_fip(call, wwn, list, "list", [&](Fip& fip) -> AX_STATUS {
                if (!is_possible(*list))
                    return AX_STATUS_INVALID_ARGUMENT;
                fip.connect = *list;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_CNA_FCOE_GetFIPParams(AX_WWN wwn, AX_FIPParams* params) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_FCOE_GetFIPParams,
        [&](Call& call) {
            return with_fip(call, wwn, params, "params", [&](const Fip& fip) -> AX_STATUS {
                *params = fip.params;
                return AX_STATUS_OK;
            });
        },
        wwn);
}

AX_STATUS AX_CNA_FCOE_SetFIPParams(AX_WWN wwn, const AX_FIPParams* params) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_FCOE_SetFIPParams,
        [&](Call& call) {
            return with_fip(call, wwn, params, "params", [&](Fip& fip) -> AX_STATUS {
                if (params->cinVlanID > max_vlan)
                    return AX_STATUS_INVALID_ARGUMENT;
                fip.params = *params;
                return AX_STATUS_OK;
            });
        },
        wwn, params ? params->cinVlanID : 0);
}

AX_STATUS AX_CNA_FCOE_GetFcfList(AX_WWN wwn, AX_FcfList* list) {
    return answer<AX_STATUS>(
        Entry::AX_CNA_FCOE_GetFcfList,
        [&](Call& call) {
            return with_fip(call, wwn, list, "list", [&](const Fip& fip) -> AX_STATUS {
                if (call.list_too_small(list->count, fip.forwarders.size()))
                    return AX_STATUS_MORE_DATA;
                std::copy(fip.forwarders.begin(), fip.forwarders.end(), list->entry);
                return AX_STATUS_OK;
            });
        },
        wwn);
}

} // namespace vlnsim::library
