// One of the library files that callers open: the symbols that it exports, as indirect functions.
// Compiled once for each file, with VLNSIM_FACE its number in vlnsim_library.
#include "simulator/entry_numbers.h"
#include "simulator/faces.h"

#define FACE_LOCAL 0
#define FACE_FALLBACK 1
#define FACE_HBA 2

// The types of the functions do not matter here: who looks a symbol up knows them.
#define VLNSIM_EXPORT(symbol, entry, exported)                                                     \
    extern "C" {                                                                                   \
    vlnsim_any_function resolve_##symbol(void) {                                                   \
        return vlnsim_resolve(VLNSIM_FACE, #symbol, static_cast<unsigned>(vlnsim::Entry::entry),   \
                              exported);                                                           \
    }                                                                                              \
    __attribute__((visibility("default"), ifunc("resolve_" #symbol))) void symbol(void);           \
    }

#if VLNSIM_FACE == FACE_LOCAL
#define VLNSIM_A(name, model) VLNSIM_EXPORT(LAX_##name, AX_##name, 1)
#define VLNSIM_B(name, model) VLNSIM_EXPORT(LAX_##name, LAX_##name, 1)
#define VLNSIM_C(name, model) VLNSIM_EXPORT(AX_##name, AX_##name, 1)
#define VLNSIM_D(name, model)
#define VLNSIM_E(name, model)
#define VLNSIM_F(name, model) VLNSIM_EXPORT(name, name, 1)
#elif VLNSIM_FACE == FACE_FALLBACK
// A fallback library offers the HBA API as well; some versions of it have LAX_ names too.
#define VLNSIM_A(name, model)                                                                      \
    VLNSIM_EXPORT(AX_##name, AX_##name, 1)                                                         \
    VLNSIM_EXPORT(LAX_##name, AX_##name, 0)
#define VLNSIM_B(name, model) VLNSIM_EXPORT(LAX_##name, LAX_##name, 0)
#define VLNSIM_C(name, model) VLNSIM_EXPORT(AX_##name, AX_##name, 1)
#define VLNSIM_D(name, model) VLNSIM_EXPORT(HBA_##name, HBA_##name, 1)
#define VLNSIM_E(name, model) VLNSIM_EXPORT(CPQFC_##name, CPQFC_##name, 1)
#define VLNSIM_F(name, model) VLNSIM_EXPORT(name, name, 1)
#else
#define VLNSIM_A(name, model)
#define VLNSIM_B(name, model)
#define VLNSIM_C(name, model)
#define VLNSIM_D(name, model) VLNSIM_EXPORT(HBA_##name, HBA_##name, 1)
#define VLNSIM_E(name, model)
#define VLNSIM_F(name, model)
#endif

#include "simulator/entry_points.def"
