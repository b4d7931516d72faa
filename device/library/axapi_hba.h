/*
 * The SNIA HBA API as published, and the CPQFC interface. Included by device/library/axapi.h.
 *
 * The HBA API passes its WWNs by value as well, as an 8-byte structure of bytes. Its records have
 * the compiler's layout, so the entries of HBA_FCPTARGETMAPPING are 296 bytes on the 32-bit
 * platform and 304 on the 64-bit one: use sizeof.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_HBA_H
#define VLN_DEVICE_LIBRARY_AXAPI_HBA_H

#include "device/library/axapi.h"

#include <string.h>
#include <time.h>

/* The published header knows nothing of visibility; its functions follow AX_API. */
#ifdef AX_LIBRARY
#pragma GCC visibility push(default)
#else
#pragma GCC visibility push(hidden)
#endif
#include <hbaapi.h>
#pragma GCC visibility pop

AX_CHECK_SIZE(HBA_WWN, 8);
AX_STATIC_ASSERT(sizeof(HBA_FCPSCSIENTRY) == (sizeof(void*) == 4 ? 296 : 304));

/* A name as the operations hold it, as the management library takes it. */
static inline AX_WWN AX_WwnOf(const HBA_WWN* name) {
    AX_WWN wwn;
    memcpy(&wwn, name, sizeof wwn);
    return wwn;
}

AX_BEGIN_DECLS

/* Used by no service. Assumed: the signatures, after their HBA API namesakes. */
AX_API AX_STATUS CPQFC_LoadLibrary(void);
AX_API AX_STATUS CPQFC_FreeLibrary(void);
AX_API uint32_t CPQFC_GetNumberOfAdapters(void);
AX_API uint32_t CPQFC_OpenAdapter(char* adapterName);
AX_API void CPQFC_CloseAdapter(uint32_t handle);
AX_API AX_STATUS CPQFC_QoSGetConfig(uint32_t handle, void* buffer, uint32_t* size);
AX_API AX_STATUS CPQFC_QoSSetConfig(uint32_t handle, const void* buffer, uint32_t size);
AX_API AX_STATUS CPQFC_QoSGetGlobalFlag(uint32_t handle, uint32_t* flag);
AX_API AX_STATUS CPQFC_QoSSetGlobalFlag(uint32_t handle, uint32_t flag);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_HBA_H */
