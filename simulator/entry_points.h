// The table of entry points: what the faces export and what stands behind it.
#ifndef VLNSIM_ENTRY_POINTS_H
#define VLNSIM_ENTRY_POINTS_H

#include "device/library/axapi.h"
#include "simulator/entry_numbers.h"

#include <string>
#include <string_view>

namespace vlnsim {

// The functions that the simulator models. Declared by the type that callers bind to, so that a
// body with another signature is an ambiguous overload and does not compile.
namespace library {
#define VLNSIM_DECLARE_MODEL(function) decltype(::function) function;
#define VLNSIM_DECLARE_STUB(function)
#define VLNSIM_A(name, model) VLNSIM_DECLARE_##model(AX_##name)
#define VLNSIM_B(name, model) VLNSIM_DECLARE_##model(LAX_##name)
#define VLNSIM_C(name, model) VLNSIM_DECLARE_##model(AX_##name)
#define VLNSIM_D(name, model) VLNSIM_DECLARE_##model(HBA_##name)
#define VLNSIM_E(name, model) VLNSIM_DECLARE_##model(CPQFC_##name)
#define VLNSIM_F(name, model) VLNSIM_DECLARE_##model(name)
#include "simulator/entry_points.def"
#undef VLNSIM_A
#undef VLNSIM_B
#undef VLNSIM_C
#undef VLNSIM_D
#undef VLNSIM_E
#undef VLNSIM_F
#undef VLNSIM_DECLARE_MODEL
#undef VLNSIM_DECLARE_STUB
} // namespace library

using Any_Function = void (*)();

const char* entry_name(Entry entry);
Any_Function entry_function(Entry entry);
bool is_entry_name(std::string_view function);
// As above, or the name of a symbol that one of the libraries exports.
bool is_symbol_name(std::string_view symbol);

} // namespace vlnsim

#endif // VLNSIM_ENTRY_POINTS_H
