// What several functions are part of: an adapter, that is card and sub-adapter.
#ifndef VLNSIM_SAME_HARDWARE_H
#define VLNSIM_SAME_HARDWARE_H

#include "simulator/host_model.h"

namespace vlnsim {

inline bool same_adapter(const Function& a, const Function& b) {
    return a.card == b.card && a.sub_adapter == b.sub_adapter;
}

// Calls visit for each function of the same adapter.
template <class Visit>
void each_of_adapter(Host& host, const Function& adapter, Visit visit) {
    for (Function& function : host.functions)
        if (same_adapter(function, adapter))
            visit(function);
}

} // namespace vlnsim

#endif // VLNSIM_SAME_HARDWARE_H
