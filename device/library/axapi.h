/*
 * The management library as this system sees it: every record that crosses the binding and every
 * entry point, in one place. The product defines bound functions of these names, hidden in its
 * module (device/library/bound_functions.cpp); a stand-in for the library defines them exported and
 * sets AX_LIBRARY before it includes this file.
 *
 * The file is C, needs nothing of the project, and means the same in both word sizes: records are
 * made of fixed-width fields, and a 64-bit field is aligned to 4 bytes as on the 32-bit platform
 * that the library is built for. Sizes and offsets that the library fixes are asserted. Fields
 * marked "assumed" are our own reading, where the library tells a size or an order and no more.
 *
 * Lists begin with a count: the caller puts the number of entries that there is room for, the
 * library answers with the number of entries that it wrote or, with AX_STATUS_MORE_DATA, needs.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_H
#define VLN_DEVICE_LIBRARY_AXAPI_H

#include <stddef.h>
#include <stdint.h>

#ifdef AX_LIBRARY
#define AX_API __attribute__((visibility("default")))
#else
#define AX_API __attribute__((visibility("hidden")))
#endif

#ifdef __cplusplus
#define AX_BEGIN_DECLS extern "C" {
#define AX_END_DECLS }
#define AX_STATIC_ASSERT(condition) static_assert(condition, #condition)
#else
#define AX_BEGIN_DECLS
#define AX_END_DECLS
#define AX_STATIC_ASSERT(condition) _Static_assert(condition, #condition)
#endif
#define AX_CHECK_SIZE(type, bytes) AX_STATIC_ASSERT(sizeof(type) == (bytes))
#define AX_CHECK_OFFSET(type, field, bytes) AX_STATIC_ASSERT(offsetof(type, field) == (bytes))

AX_BEGIN_DECLS

/* A status of the library, 0 for success. Unsigned, but AX_InitLib may answer below zero. */
typedef uint32_t AX_STATUS;

/* Not an enumeration, so that they are of the same type as a status. */
#define AX_STATUS_OK 0u
#define AX_STATUS_ERROR 1u /* also what a bound function answers without its symbol */
#define AX_STATUS_INVALID_ARGUMENT 4u
#define AX_STATUS_ILLEGAL_WWN 5u /* AX_ValidateWwn: not a valid name */
#define AX_STATUS_MORE_DATA 7u   /* lists: the count now holds what is needed */
#define AX_STATUS_NO_MEMORY 8u
#define AX_STATUS_CHECK_CONDITION 9u /* SCSI through a virtual port; assumed: as of the HBA API */
#define AX_STATUS_DIAG_IN_PROGRESS 60u
#define AX_STATUS_NO_DIAGNOSTICS 63u
#define AX_STATUS_WWN_NOT_SUPPORTED 89u
#define AX_STATUS_WWN_NOT_AVAILABLE 92u
#define AX_STATUS_WWN_IN_PROGRESS 97u /* call again */
#define AX_STATUS_TARGET_IN_USE 108u  /* assumed: a target with sessions is not removed */
#define AX_STATUS_PORTAL_EXISTS 116u  /* the portal stands with other login options */
#define AX_STATUS_MAILBOX_FAILED 148u /* firmware download: internal error of the driver */
#define AX_STATUS_MAILBOX_TIMEOUT 149u
#define AX_STATUS_MAILBOX_BUSY 150u
#define AX_STATUS_NOT_ANSWERING 190u
#define AX_STATUS_LIST_TOO_SMALL 191u /* dump files, driver parameters: as AX_STATUS_MORE_DATA */
#define AX_STATUS_REBOOT_NEEDED 247u  /* done, and a reboot is needed */
#define AX_STATUS_NOT_SUPPORTED 251u
#define AX_STATUS_BUFFER_TOO_SMALL 255u /* version calls: the size now holds what is needed */

typedef uint64_t AX_UINT64 __attribute__((aligned(4)));

/*
 * A World Wide Name as an argument. It travels by value as two 32-bit words: on i386 they are two
 * stack slots of a call, on x86-64 one register, the same as an 8-byte structure of bytes would be.
 * The words hold the eight bytes of the name in memory order.
 */
typedef struct AX_WWN {
    uint32_t word[2];
} AX_WWN;
AX_CHECK_SIZE(AX_WWN, 8);

/* A World Wide Name inside a record: eight bytes, most significant first. */
typedef struct AX_NAME {
    uint8_t byte[8];
} AX_NAME;
AX_CHECK_SIZE(AX_NAME, 8);

/* An IP address and where to reach it. An IPv4 address fills the first four bytes. */
typedef struct AX_IPAddress {
    uint8_t address[16];
    uint16_t tcpPort; /* host order, assumed */
    uint16_t flags;   /* bit 0: IPv6 */
} AX_IPAddress;
AX_CHECK_SIZE(AX_IPAddress, 20);
AX_CHECK_OFFSET(AX_IPAddress, flags, 18);

enum { AX_IP_FLAG_V6 = 1 };

/* ------------------------------------------------------------------------ library */

AX_API AX_STATUS AX_InitLib(void);
AX_API AX_STATUS AX_ExitLib(void);
/* size: room in the buffer; with AX_STATUS_BUFFER_TOO_SMALL, the size needed. */
AX_API AX_STATUS AX_GetVersion(char* text, uint32_t* size);
AX_API AX_STATUS AX_NimaVersion(char* text, uint32_t* size);
/* Leaves an empty text when it has no words for the status. */
AX_API AX_STATUS AX_StatusString(AX_STATUS status, char* text, uint32_t size);
AX_API AX_STATUS AX_SetDebugTraces(uint32_t traceGroup, uint32_t level);
AX_API int32_t VlnGetBoardNumber(AX_WWN wwn);

/* ----------------------------------------------------------------- local adapters */

/* Which instance the record calls are about. All words but two are zero. */
typedef struct HBAIdentifier {
    uint32_t reserved0;
    uint32_t instance;      /* as listed by AX_GetAllLocalHBAInstances */
    uint32_t instanceCount; /* the instances of the enumeration that it comes from */
    uint32_t reserved3[3];
} HBAIdentifier;
AX_CHECK_SIZE(HBAIdentifier, 24);
AX_CHECK_OFFSET(HBAIdentifier, instance, 4);
AX_CHECK_OFFSET(HBAIdentifier, instanceCount, 8);

/* Bits of SpecialFeatures. */
enum {
    AX_FEATURE_ISCSI_FUNCTION = 0x4,
    AX_FEATURE_NIC_FUNCTION = 0x8,
    AX_FEATURE_FCOE_FUNCTION = 0x10,
    AX_FEATURE_NIC_FUNCTION_TOO = 0x400 /* counted with AX_FEATURE_NIC_FUNCTION */
};

typedef struct LocalHBAInfoV4 {
    uint8_t portWWN[8]; /* of the adapter's first port */
    uint8_t nodeWWN[8];
    uint8_t fabricName[8];
    uint32_t nFlags;
    uint8_t reserved28[64];
    char model[148]; /* NUL-terminated */
    uint16_t subAdapterNumber;
    uint16_t reserved242;
    uint32_t SpecialFeatures;
    uint8_t reserved248[36];
} LocalHBAInfoV4;
AX_CHECK_SIZE(LocalHBAInfoV4, 284);
AX_CHECK_OFFSET(LocalHBAInfoV4, nodeWWN, 8);
AX_CHECK_OFFSET(LocalHBAInfoV4, fabricName, 16);
AX_CHECK_OFFSET(LocalHBAInfoV4, nFlags, 24);
AX_CHECK_OFFSET(LocalHBAInfoV4, model, 92);
AX_CHECK_OFFSET(LocalHBAInfoV4, subAdapterNumber, 240);
AX_CHECK_OFFSET(LocalHBAInfoV4, SpecialFeatures, 244);

/* The older form: the start of LocalHBAInfoV4, field for field. */
typedef struct LocalHBAInfoV3 {
    uint8_t portWWN[8];
    uint8_t nodeWWN[8];
    uint8_t fabricName[8];
    uint32_t nFlags;
    uint8_t reserved28[64];
    char model[148];
    uint16_t subAdapterNumber;
    uint16_t reserved242;
    uint32_t SpecialFeatures;
} LocalHBAInfoV3;
AX_CHECK_SIZE(LocalHBAInfoV3, 248);
AX_CHECK_OFFSET(LocalHBAInfoV3, SpecialFeatures, 244);

/* The oldest form. Assumed: it begins with the port name as its successors do. */
typedef struct AX_LocalHBAInfo {
    uint8_t portWWN[8];
    uint8_t nodeWWN[8];
    uint8_t reserved16[156];
} AX_LocalHBAInfo;
AX_CHECK_SIZE(AX_LocalHBAInfo, 172);

/* Assumed: texts of the host, each NUL-terminated; targetOS as in "Linux 2.6 x86_64 RH". */
typedef struct AX_ServerAttributes {
    char hostName[256];
    char targetOS[41];
    char reserved[7];
} AX_ServerAttributes;

/* count: room in the table; with AX_STATUS_MORE_DATA, the room needed. */
AX_API AX_STATUS AX_GetAllLocalHBAInstances(uint32_t* count, uint32_t* instances);
AX_API uint32_t AX_GetNumberOfLocalAdapters(void);
AX_API AX_STATUS AX_GetLocalHBAInfo(uint32_t index, AX_LocalHBAInfo* info);
AX_API AX_STATUS AX_GetLocalHBAInfoV3(const HBAIdentifier* identifier, LocalHBAInfoV3* info);
AX_API AX_STATUS AX_GetLocalHBAInfoV4(const HBAIdentifier* identifier, LocalHBAInfoV4* info);
AX_API AX_STATUS AX_IsLocalHBA(AX_WWN wwn, uint32_t* isLocal);
AX_API AX_STATUS AX_ValidateWwn(AX_WWN wwn);
AX_API AX_STATUS AX_GetAdapterType(AX_WWN wwn, uint32_t* type);
AX_API AX_STATUS AX_GetServerAttributes(AX_ServerAttributes* attributes);
AX_API AX_STATUS AX_SetAriFuncs(AX_WWN wwn, uint32_t functionCount);

/* -------------------------------------------------------- attributes and features */

enum {
    AX_ADAPTER_ATTRIBUTES_SIZE = 2864,
    AX_PORT_ATTRIBUTES_SIZE = 2048,
    AX_PORT_STATISTICS_SIZE = 512,
    AX_FEATURE_LIST_SIZE = 512
};

/* The speed settings of a physical port. Assumed: the order of the fields. */
typedef struct AX_PhyPortSpeed {
    uint32_t interfaceType;
    uint32_t portSpeedMode;
    uint32_t dacCableLength;
    char autoNegSupportedSpeeds[256];
    char forceSupportedSpeeds[256];
    char configuredPortSpeed[256];
} AX_PhyPortSpeed;
AX_CHECK_SIZE(AX_PhyPortSpeed, 780);

/* The two pages of a transceiver's memory as SFF-8472 lays them out. Assumed: both in one reply. */
typedef struct AX_SffData {
    uint8_t pageA0[256]; /* identity: identifier, connector, OUI, wavelength */
    uint8_t pageA2[256]; /* diagnostics: thresholds from byte 0, readings from byte 96 */
} AX_SffData;

/* size: room in the buffer on entry, bytes filled on return. */
AX_API AX_STATUS AX_GetHBAAttributes(AX_WWN wwn, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_GetPortAttributes(AX_WWN wwn, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_GetPortState(AX_WWN wwn, void* buffer, uint32_t* size);
/* The value lies inside the buffer and lives as long; null when the attribute is not there. */
AX_API void* AX_GetAttributeValue(void* buffer, uint16_t identifier, uint16_t* length,
                                  AX_STATUS* status);
AX_API AX_STATUS AX_GetPortStatistics(AX_WWN wwn, void* buffer, uint32_t size);
AX_API AX_STATUS AX_GetHBAFeature(AX_WWN wwn, uint32_t identifier, uint32_t* value);
AX_API AX_STATUS AX_GetHBAFeatureList(AX_WWN wwn, uint32_t size, uint8_t* list);
AX_API AX_STATUS AX_SetAdapterAttribute(AX_WWN wwn, uint32_t identifier, const void* value,
                                        uint32_t length);
AX_API AX_STATUS AX_GetDriverType(AX_WWN wwn, uint32_t* type);
AX_API AX_STATUS AX_GetSffData(AX_WWN wwn, AX_SffData* data);
/* dynamic: how the change comes into force; 5 after an adapter reset. */
AX_API AX_STATUS AX_SetPortEnabled(AX_WWN wwn, uint32_t enabled, uint32_t* dynamic);
/* cableLength: metres, -1 for none. */
AX_API AX_STATUS AX_SetPhyPortSpeedSettings(AX_WWN wwn, const char* speed, uint32_t mode,
                                            int32_t cableLength);

/* ------------------------------------------------------------- vital product data */

enum { AX_VPD_BUFFER_SIZE = 1536, AX_VPD_TAG_SIZE = 4, AX_VPD_VALUE_SIZE = 256 };

AX_API AX_STATUS AX_GetVPD(AX_WWN wwn, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_GetVPDV2(AX_WWN wwn, uint32_t version, void* buffer, uint32_t* size);
/* Copies the entry at the cursor, cut to the sizes, and answers the next cursor, null at the end.
 */
AX_API void* AX_GetNextVpdEntry(void* cursor, char* tag, uint32_t tagSize, char* value,
                                uint32_t valueSize);

/* -------------------------------------------------------------- firmware and boot */

AX_API AX_STATUS AX_DownloadFirmware(AX_WWN wwn, const char* file, uint32_t options);
AX_API AX_STATUS AX_VerifyFirmwareA(uint32_t reserved0, uint32_t reserved1, AX_WWN wwn,
                                    const char* file);
AX_API AX_STATUS AX_ImportHBAFileA(const char* file);
AX_API AX_STATUS AX_SetBootBiosState(AX_WWN wwn, uint32_t enable);
/* method: 1 PXE, 2 iBFT, 0 when the boot is switched off. */
AX_API AX_STATUS AX_SetNetbootParams(AX_WWN wwn, uint32_t enable, uint32_t method);
AX_API AX_STATUS AX_ResetHBA(AX_WWN wwn);

/* ---------------------------------------------------------------------------- WWN */

/* Bits of the capability word. */
#define AX_WWN_CAN_CHANGE_NON_VOLATILE (1u << 2)
#define AX_WWN_CAN_CHANGE_VOLATILE (1u << 3)
#define AX_WWN_NEEDS_REBOOT (1u << 12)
#define AX_WWN_NEEDS_RESET (1u << 13)
#define AX_WWN_READ_ONLY (1u << 31)

/* Which names; the last three can only be read. To restore, 0 means the factory default. */
enum {
    AX_WWN_VOLATILE = 0,
    AX_WWN_NON_VOLATILE = 1,
    AX_WWN_FACTORY_DEFAULT = 2,
    AX_WWN_CURRENT = 3,
    AX_WWN_CONFIGURED = 4
};

/* How names stand, or what a change waits for. */
enum {
    AX_WWN_ACTIVATION_NONE = 1, /* active as they are */
    AX_WWN_ACTIVATION_VOLATILE = 3,
    AX_WWN_ACTIVATION_NON_VOLATILE = 4,
    AX_WWN_ACTIVATION_VOLATILE_REBOOT = 5,
    AX_WWN_ACTIVATION_NON_VOLATILE_REBOOT = 6,
    AX_WWN_ACTIVATION_VOLATILE_RESET = 7,
    AX_WWN_ACTIVATION_NON_VOLATILE_RESET = 8,
    AX_WWN_ACTIVATION_NO_NAMES = 9
};

AX_API AX_STATUS AX_GetWWNCapability(AX_WWN wwn, uint32_t* capability);
AX_API AX_STATUS AX_ReadWWN(AX_WWN wwn, uint32_t type, AX_NAME* wwpn, AX_NAME* wwnn,
                            uint32_t* activation);
AX_API AX_STATUS AX_ChangeWWN(AX_WWN wwn, AX_WWN newWWPN, AX_WWN newWWNN, uint32_t type,
                              uint32_t* activation);
AX_API AX_STATUS AX_RestoreWWN(AX_WWN wwn, uint32_t type, uint32_t* activation);

/* -------------------------------------------------------------- driver parameters */

typedef struct AX_DriverParam {
    char name[32];
    uint32_t minimum;
    uint32_t maximum;
    uint32_t defaultValue;
    uint32_t current;
    uint16_t exportFlag;
    uint16_t changeableType;
    char help[80];
} AX_DriverParam;
AX_CHECK_SIZE(AX_DriverParam, 132);
AX_CHECK_OFFSET(AX_DriverParam, minimum, 32);
AX_CHECK_OFFSET(AX_DriverParam, maximum, 36);
AX_CHECK_OFFSET(AX_DriverParam, defaultValue, 40);
AX_CHECK_OFFSET(AX_DriverParam, current, 44);
AX_CHECK_OFFSET(AX_DriverParam, exportFlag, 48);
AX_CHECK_OFFSET(AX_DriverParam, changeableType, 50);
AX_CHECK_OFFSET(AX_DriverParam, help, 52);

/* count: room in the table on entry, records filled or needed on return. */
AX_API AX_STATUS AX_GetDriverParams(AX_WWN wwn, AX_DriverParam* table, uint32_t* count);
AX_API AX_STATUS AX_GetDriverParamsGlobal(AX_WWN wwn, AX_DriverParam* table, uint32_t* count);
/* text: "name=value". control: bit 0 persistent, bit 1 global. */
AX_API AX_STATUS AX_SetDriverParam(AX_WWN wwn, const char* text, uint32_t control);

AX_END_DECLS

#include "device/library/axapi_attributes.h"
#include "device/library/axapi_bridging.h"
#include "device/library/axapi_channels.h"
#include "device/library/axapi_diagnostics.h"
#include "device/library/axapi_dump.h"
#include "device/library/axapi_hba.h"
#include "device/library/axapi_iscsi.h"
#include "device/library/axapi_virtual_ports.h"

#endif /* VLN_DEVICE_LIBRARY_AXAPI_H */
