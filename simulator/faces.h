/* Between the faces and the core: how an exported symbol finds what stands behind it. */
#ifndef VLNSIM_FACES_H
#define VLNSIM_FACES_H

#include "simulator/vlnsim.h"

#ifdef __cplusplus
extern "C" {
#endif

typedef void (*vlnsim_any_function)(void);

/* Called by the dynamic linker, through an indirect function, each time that somebody looks a
 * symbol up. Null: the scenario or the fault script says that the library does not export it;
 * dlsym() then answers null as well. exported: whether the library exports it when the scenario
 * says nothing. */
VLNSIM_API vlnsim_any_function vlnsim_resolve(int library, const char* symbol, unsigned entry,
                                              int exported);

#ifdef __cplusplus
}
#endif

#endif /* VLNSIM_FACES_H */
