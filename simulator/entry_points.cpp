#include "simulator/entry_points.h"

#include "simulator/call.h"

#include <algorithm>
#include <iterator>

namespace vlnsim {
namespace {

// Stands for any function without a model: callers clean up their arguments themselves under both
// calling conventions, so one shape serves all signatures.
template <Entry entry>
AX_STATUS not_supported() {
    return answer<AX_STATUS>(entry, [](Call&) -> AX_STATUS { return AX_STATUS_NOT_SUPPORTED; });
}

template <class Function>
Any_Function erased(Function* function) {
    return reinterpret_cast<Any_Function>(function);
}

struct Row {
    const char* name;
    Any_Function function;
};

#define VLNSIM_ROW_MODEL(function) {#function, erased(&library::function)},
#define VLNSIM_ROW_STUB(function) {#function, erased(&not_supported<Entry::function>)},
#define VLNSIM_A(name, model) VLNSIM_ROW_##model(AX_##name)
#define VLNSIM_B(name, model) VLNSIM_ROW_##model(LAX_##name)
#define VLNSIM_C(name, model) VLNSIM_ROW_##model(AX_##name)
#define VLNSIM_D(name, model) VLNSIM_ROW_##model(HBA_##name)
#define VLNSIM_E(name, model) VLNSIM_ROW_##model(CPQFC_##name)
#define VLNSIM_F(name, model) VLNSIM_ROW_##model(name)
const Row table[] = {
#include "simulator/entry_points.def"
};

const Row& row(Entry entry) {
    return table[static_cast<unsigned>(entry)];
}

} // namespace

const char* entry_name(Entry entry) {
    return row(entry).name;
}
Any_Function entry_function(Entry entry) {
    return row(entry).function;
}

bool is_entry_name(std::string_view function) {
    return std::any_of(std::begin(table), std::end(table),
                       [&](const Row& row) { return function == row.name; });
}

bool is_symbol_name(std::string_view symbol) {
    // LAX_GetVPD is the local library's name of AX_GetVPD.
    return is_entry_name(symbol) ||
           (symbol.starts_with("LAX_") && is_entry_name(symbol.substr(1))) ||
           (symbol.starts_with("AX_") && is_entry_name(symbol.substr(3)));
}

} // namespace vlnsim
