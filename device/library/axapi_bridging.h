/*
 * The management library: data centre bridging, FCoE and FIP. Included by device/library/axapi.h.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_BRIDGING_H
#define VLN_DEVICE_LIBRARY_AXAPI_BRIDGING_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

enum {
    AX_PRIORITY_GROUPS = 8,
    AX_PRIORITY_GROUP_IDS = 16,
    AX_UNLIMITED_GROUP = 15, /* its traffic has no bandwidth limit */
    AX_APPLICATION_SLOTS = 15,
    AX_UNCHANGED = -1 /* a word of a set call that stays as it is */
};

/* Ethernet types and ports that name an application's traffic. */
enum { AX_APP_ISCSI = 3260, AX_APP_FCOE = 35078, AX_APP_FIP = 35092, AX_APP_ROCE = 35093 };

/* Priority flow control. The bitmap has a bit per priority 0 to 7. */
typedef struct AX_PFC {
    int32_t enabled;
    int32_t willing;
    int32_t advertise;
    int32_t priorityBitmap;
} AX_PFC;
AX_CHECK_SIZE(AX_PFC, 16);

/* One application's traffic. A slot whose protocol is 0 is free. */
typedef struct AX_Application {
    uint32_t kind; /* 0 Ethernet type, 1 TCP port */
    uint32_t protocol;
    uint32_t spare;
    uint32_t priority; /* bitmap in AX_CEE_Params */
} AX_Application;
AX_CHECK_SIZE(AX_Application, 16);

typedef struct AX_ApplicationTable {
    AX_Application slot[AX_APPLICATION_SLOTS];
} AX_ApplicationTable;
AX_CHECK_SIZE(AX_ApplicationTable, 240);

typedef struct AX_DcbxPortVars {
    uint32_t state; /* 0 or 1 */
    uint32_t mode;
} AX_DcbxPortVars;

typedef struct AX_Lldp {
    uint32_t txState;
    uint32_t rxState;
    uint32_t txPortDesc;
    uint32_t txSysDesc;
    uint32_t txSysName;
    uint32_t txSysCap;
} AX_Lldp;

typedef struct AX_PGSetting {
    uint32_t enabled;
    uint32_t willing;
    uint32_t advertise;
} AX_PGSetting;

/* Per group a bitmap of the priorities in it. */
typedef struct AX_PGPriorityBitmaps {
    uint32_t group[AX_PRIORITY_GROUPS];
} AX_PGPriorityBitmaps;

/* As AX_PGPriorityBitmaps, with AX_UNLIMITED_GROUP. */
typedef struct AX_PGPriorityBitmapsExt {
    uint32_t group[AX_PRIORITY_GROUPS];
    uint32_t groupFifteen;
} AX_PGPriorityBitmapsExt;

/* In percent of the link. */
typedef struct AX_PGBandwidth {
    uint32_t percent[AX_PRIORITY_GROUPS];
} AX_PGBandwidth;

/* How a setting stands with the link partner: each 1, 0, or another value for unknown. */
typedef struct AX_CEE_State {
    uint32_t enabled;
    uint32_t syncd;
    uint32_t error;
    uint32_t willing;
    uint32_t advertise;
} AX_CEE_State;

/*
 * Priority groups, flow control and applications of a port, configured or in force. The groups from
 * 8 to 14 are nobody's: a priority in one is the switch's error.
 */
typedef struct AX_CEE_Settings {
    AX_CEE_State pg;
    AX_CEE_State pfc;
    AX_CEE_State fcoe;
    AX_CEE_State iscsi;
    uint32_t pfcBitmap;
    uint32_t groupBitmap[AX_PRIORITY_GROUP_IDS];
    uint32_t bandwidth[AX_PRIORITY_GROUPS];
    AX_ApplicationTable application;
} AX_CEE_Settings;

/* Assumed: the layout. Only its size is the library's. */
typedef struct AX_CEE_Params {
    AX_DcbxPortVars dcbx;
    uint32_t dcbxOperatingVersion;
    uint32_t dcbxMaximumVersion;
    AX_Lldp lldp;
    uint32_t maxSupportedPG;
    AX_CEE_Settings configured;
    AX_CEE_Settings active;
    uint8_t reserved[1520 - 11 * 4 - 2 * 420];
} AX_CEE_Params;
AX_CHECK_SIZE(AX_CEE_Settings, 420);
AX_CHECK_OFFSET(AX_CEE_Settings, pfcBitmap, 80);
AX_CHECK_OFFSET(AX_CEE_Settings, groupBitmap, 84);
AX_CHECK_OFFSET(AX_CEE_Settings, bandwidth, 148);
AX_CHECK_OFFSET(AX_CEE_Settings, application, 180);
AX_CHECK_SIZE(AX_CEE_Params, 1520);
AX_CHECK_OFFSET(AX_CEE_Params, lldp, 16);
AX_CHECK_OFFSET(AX_CEE_Params, maxSupportedPG, 40);
AX_CHECK_OFFSET(AX_CEE_Params, configured, 44);
AX_CHECK_OFFSET(AX_CEE_Params, active, 464);

AX_API AX_STATUS AX_CNA_GetCEE_Params(AX_WWN wwn, AX_CEE_Params* params);
AX_API AX_STATUS AX_CNA_GetPGPriorityBitmaps(AX_WWN wwn, AX_PGPriorityBitmaps* bitmaps);
AX_API AX_STATUS AX_CNA_SetPGPriorityBitmaps(AX_WWN wwn, const AX_PGPriorityBitmaps* bitmaps);
AX_API AX_STATUS AX_CNA_SetPGPriorityBitmapsExt(AX_WWN wwn, const AX_PGPriorityBitmapsExt* bitmaps);
AX_API AX_STATUS AX_CNA_SetPGBandwidth(AX_WWN wwn, const AX_PGBandwidth* bandwidth);
AX_API AX_STATUS AX_CNA_SetPFC(AX_WWN wwn, const AX_PFC* pfc);
AX_API AX_STATUS AX_CNA_SetDcbxPortVars(AX_WWN wwn, const AX_DcbxPortVars* vars);
AX_API AX_STATUS AX_CNA_SetLldp(AX_WWN wwn, const AX_Lldp* lldp);
AX_API AX_STATUS AX_CNA_SetPGSetting(AX_WWN wwn, const AX_PGSetting* setting);
AX_API AX_STATUS AX_CNA_GetTLV(AX_WWN wwn, AX_ApplicationTable* table);
AX_API AX_STATUS AX_CNA_SetTLV(AX_WWN wwn, const AX_ApplicationTable* table);

/* ------------------------------------------------------------------ FCoE and FIP */

/* Assumed: one word. */
typedef struct AX_FIPParams {
    uint32_t cinVlanID;
} AX_FIPParams;
AX_CHECK_SIZE(AX_FIPParams, 4);

enum { AX_FCF_VLAN_VALID = 1u << 5 };

/* Which forwarder a port prefers. Assumed: what follows the two names. */
typedef struct AX_FCFConnectList {
    AX_NAME fabricName;
    AX_NAME switchName;
    uint32_t flags; /* bit 5: vlanID holds; any VLAN otherwise */
    uint16_t vlanID;
    uint8_t fcMap[3]; /* most significant first */
    uint8_t reserved[3];
} AX_FCFConnectList;
AX_CHECK_SIZE(AX_FCFConnectList, 28);
AX_CHECK_OFFSET(AX_FCFConnectList, switchName, 8);
AX_CHECK_OFFSET(AX_FCFConnectList, flags, 16);
AX_CHECK_OFFSET(AX_FCFConnectList, vlanID, 20);
AX_CHECK_OFFSET(AX_FCFConnectList, fcMap, 22);

enum { AX_FCF_VLANS = 8 };

/* A Fibre Channel forwarder. Assumed: the order of the fields. */
typedef struct AX_Fcf {
    uint32_t entryID;
    uint32_t activeFCFs;
    uint32_t state;
    uint32_t priority;
    AX_NAME fabricName;
    AX_NAME switchName;
    uint8_t mac[6];
    uint8_t fcMap[3];
    uint8_t reserved41;
    uint16_t vlanCount; /* of vlanID, AX_FCF_VLANS at most */
    uint16_t vlanID[AX_FCF_VLANS];
    uint32_t period; /* of advertisements, milliseconds */
} AX_Fcf;
AX_CHECK_SIZE(AX_Fcf, 64);
AX_CHECK_OFFSET(AX_Fcf, fabricName, 16);
AX_CHECK_OFFSET(AX_Fcf, mac, 32);
AX_CHECK_OFFSET(AX_Fcf, vlanCount, 42);
AX_CHECK_OFFSET(AX_Fcf, period, 60);

typedef struct AX_FcfList {
    uint32_t count;
    uint32_t reserved;
    AX_Fcf entry[1];
} AX_FcfList;
AX_CHECK_OFFSET(AX_FcfList, entry, 8);

AX_API AX_STATUS AX_CNA_FCOE_GetFIPParams(AX_WWN wwn, AX_FIPParams* params);
AX_API AX_STATUS AX_CNA_FCOE_SetFIPParams(AX_WWN wwn, const AX_FIPParams* params);
AX_API AX_STATUS AX_CNA_FCOE_GetFcfList(AX_WWN wwn, AX_FcfList* list);
AX_API AX_STATUS AX_CNA_FCOE_GetFCFConnectList(AX_WWN wwn, AX_FCFConnectList* list);
AX_API AX_STATUS AX_CNA_FCOE_SetFCFConnectList(AX_WWN wwn, const AX_FCFConnectList* list);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_BRIDGING_H */
