/*
 * The management library: dumps and event logs. Included by device/library/axapi.h.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_DUMP_H
#define VLN_DEVICE_LIBRARY_AXAPI_DUMP_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

enum { AX_DUMP_FILE_NAME_SIZE = 256, AX_DUMP_DIRECTORY_SIZE = 256 };

typedef struct AX_DumpFileList {
    uint32_t count; /* with AX_STATUS_LIST_TOO_SMALL, the number of files */
    uint32_t reserved;
    char name[1][AX_DUMP_FILE_NAME_SIZE];
} AX_DumpFileList;
AX_CHECK_OFFSET(AX_DumpFileList, name, 8);

/* Where events of a module go, in this order in AX_EventLogModule and as bits in the set call. */
enum { AX_LOG_MODE_RAM, AX_LOG_MODE_UART, AX_LOG_MODE_NVRAM, AX_LOG_MODE_TFTP, AX_LOG_MODES };

typedef struct AX_EventLogMode {
    uint32_t enabled;
    uint32_t traceLevel;
    uint32_t portMask;
    uint32_t pciFuncMask;
} AX_EventLogMode;

/* What a firmware module logs. Assumed: the fields; only the size is the library's. */
typedef struct AX_EventLogModule {
    char name[32];
    AX_EventLogMode mode[AX_LOG_MODES];
    uint8_t reserved[16];
} AX_EventLogModule;
AX_CHECK_SIZE(AX_EventLogModule, 112);

/* Assumed: the words but the first and the fourth. */
typedef struct AX_EventLogConfig {
    uint32_t capacity; /* modules that there is room for */
    uint32_t maxLogEntries;
    uint32_t logEntrySize;
    uint32_t moduleCount; /* of module, never above capacity */
    uint32_t logType;     /* a bit per AX_LOG_MODE_ */
    uint32_t reserved[3];
    AX_EventLogModule module[1];
} AX_EventLogConfig;
AX_CHECK_OFFSET(AX_EventLogConfig, moduleCount, 12);

AX_API AX_STATUS AX_GenerateDump(uint32_t reserved0, uint32_t reserved1, AX_WWN wwn);
/* snapshotMode: 0 flash, 1 RAM. */
AX_API AX_STATUS AX_GenerateEfdDump(AX_WWN wwn, int32_t snapshotMode, uint32_t reserved);
AX_API AX_STATUS AX_GenerateCoreDump(AX_WWN wwn, const char* options);
AX_API AX_STATUS AX_RetrieveFATDump(void);
AX_API AX_STATUS AX_RetrieveFATDump2(AX_WWN wwn);
AX_API AX_STATUS AX_GetDumpDirectoryA(AX_WWN wwn, char* directory, uint32_t size);
AX_API AX_STATUS AX_SetDumpDirectory(AX_WWN wwn, const char* directory);
AX_API AX_STATUS AX_GetDumpRetentionCount(AX_WWN wwn, uint32_t* count);
AX_API AX_STATUS AX_SetDumpRetentionCount(AX_WWN wwn, uint32_t count);
AX_API AX_STATUS AX_GetDumpFileNames(AX_WWN wwn, AX_DumpFileList* list);
AX_API AX_STATUS AX_DeleteDumpFiles(AX_WWN wwn);

AX_API AX_STATUS AX_Get_DX_EventLogConfigDataAll(AX_WWN wwn, AX_EventLogConfig* config);
/* modes: a bit per AX_LOG_MODE_, below 16; level below 256. */
AX_API AX_STATUS AX_Set_DX_EventLogConfigDataModule(AX_WWN wwn, const char* module, uint32_t modes,
                                                    uint32_t level, uint32_t portMask,
                                                    uint32_t pciFuncMask);
AX_API AX_STATUS AX_Set_DX_EventLogTraceLevel(AX_WWN wwn, uint32_t level, uint32_t ram,
                                              uint32_t uart, uint32_t nvram, uint32_t tftp);
AX_API AX_STATUS AX_Set_DX_DefaultLoggingConfig(AX_WWN wwn);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_DUMP_H */
