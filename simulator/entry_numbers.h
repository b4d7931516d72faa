// A number for each entry point. Free of the libraries' declarations, which the faces cannot
// include.
#ifndef VLNSIM_ENTRY_NUMBERS_H
#define VLNSIM_ENTRY_NUMBERS_H

namespace vlnsim {

enum class Entry : unsigned {
#define VLNSIM_A(name, model) AX_##name,
#define VLNSIM_B(name, model) LAX_##name,
#define VLNSIM_C(name, model) AX_##name,
#define VLNSIM_D(name, model) HBA_##name,
#define VLNSIM_E(name, model) CPQFC_##name,
#define VLNSIM_F(name, model) name,
#include "simulator/entry_points.def"
#undef VLNSIM_A
#undef VLNSIM_B
#undef VLNSIM_C
#undef VLNSIM_D
#undef VLNSIM_E
#undef VLNSIM_F
    count
};

constexpr unsigned entry_count = static_cast<unsigned>(Entry::count);

} // namespace vlnsim

#endif // VLNSIM_ENTRY_NUMBERS_H
