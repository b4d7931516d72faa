/*
 * The management library: iSCSI initiators, targets, sessions and network settings. Included by
 * device/library/axapi.h.
 *
 * Session, target and table sizes are the library's; the order of the fields inside the records of
 * this file is assumed unless an offset is asserted.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_ISCSI_H
#define VLN_DEVICE_LIBRARY_AXAPI_ISCSI_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

enum {
    AX_ISCSI_NAME_SIZE = 256, /* an iSCSI name has 223 characters at most, RFC 7143 */
    AX_ISCSI_SECRET_SIZE = 20 /* a CHAP secret has 16 at most */
};

enum { AX_ISCSI_AUTH_NONE, AX_ISCSI_AUTH_ONE_WAY_CHAP, AX_ISCSI_AUTH_MUTUAL_CHAP };

/* Login keys of RFC 7143, flags as 0 and 1: a block of five words, then bytes. */
typedef struct AX_iSCSI_LoginOptions {
    uint32_t firstBurstLength;
    uint32_t maxBurstLength;
    uint32_t maxRecvDataSegmentLength;
    uint16_t defaultTime2Wait;
    uint16_t defaultTime2Retain;
    uint16_t maxConnections;
    uint16_t maxOutstandingR2T;
    uint8_t initialR2T;
    uint8_t immediateData;
    uint8_t headerDigest;
    uint8_t dataDigest;
    uint8_t errorRecoveryLevel;
    uint8_t dataPDUInOrder;
    uint8_t dataSequenceInOrder;
    uint8_t reserved;
} AX_iSCSI_LoginOptions;
AX_CHECK_SIZE(AX_iSCSI_LoginOptions, 28);
AX_CHECK_OFFSET(AX_iSCSI_LoginOptions, initialR2T, 20);

/* Texts are NUL-terminated. The target's pair serves one-way CHAP, both pairs mutual CHAP. */
typedef struct AX_iSCSI_Authentication {
    uint32_t method; /* AX_ISCSI_AUTH_ */
    char targetCHAPName[AX_ISCSI_NAME_SIZE];
    char targetSecret[AX_ISCSI_SECRET_SIZE];
    char initiatorCHAPName[AX_ISCSI_NAME_SIZE];
    char initiatorSecret[AX_ISCSI_SECRET_SIZE];
} AX_iSCSI_Authentication;

typedef struct AX_iSCSI_InitiatorProperties {
    char name[AX_ISCSI_NAME_SIZE];
    char alias[AX_ISCSI_NAME_SIZE];
    AX_iSCSI_LoginOptions loginOptions;
    AX_iSCSI_Authentication authentication;
} AX_iSCSI_InitiatorProperties;

AX_API AX_STATUS AX_iSCSI_GetInitiatorProperties(AX_WWN wwn,
                                                 AX_iSCSI_InitiatorProperties* properties);
AX_API AX_STATUS AX_iSCSI_SetInitiatorProperties(AX_WWN wwn,
                                                 const AX_iSCSI_InitiatorProperties* properties);

/* ------------------------------------------------------------------ targets, LUNs */

enum {
    AX_ISCSI_TARGET_HAS_SESSIONS = 0x40,
    AX_ISCSI_TARGET_BOOT = 0x01 /* assumed */
};

typedef struct AX_iSCSI_Target {
    char name[512];
    uint8_t flags;
    uint8_t reserved[3];
} AX_iSCSI_Target;
AX_CHECK_SIZE(AX_iSCSI_Target, 516);
AX_CHECK_OFFSET(AX_iSCSI_Target, flags, 512);

typedef struct AX_iSCSI_TargetList {
    uint32_t count;
    uint32_t reserved;
    AX_iSCSI_Target entry[1];
} AX_iSCSI_TargetList;
AX_CHECK_OFFSET(AX_iSCSI_TargetList, entry, 8);

typedef struct AX_iSCSI_Lun {
    uint32_t number;
    char text[28]; /* the number and descriptive words, separated by blanks */
} AX_iSCSI_Lun;

typedef struct AX_iSCSI_LunList {
    uint32_t count;
    uint32_t reserved;
    AX_iSCSI_Lun entry[1];
} AX_iSCSI_LunList;

typedef struct AX_iSCSI_LunProperties {
    uint32_t number;
    uint32_t deviceType; /* peripheral device type of SPC */
    AX_UINT64 blockCount;
    uint32_t blockSize;
    char vendor[12];
    char product[20];
    char revision[8];
    char serialNumber[64];
    char osDeviceName[256];
} AX_iSCSI_LunProperties;

AX_API AX_STATUS AX_iSCSI_GetTargets(AX_WWN wwn, AX_iSCSI_TargetList* list);
AX_API AX_STATUS AX_iSCSI_GetLuns(AX_WWN wwn, const char* targetName, AX_iSCSI_LunList* list);
AX_API AX_STATUS AX_iSCSI_GetLunProperties(AX_WWN wwn, const char* targetName, uint32_t lun,
                                           AX_iSCSI_LunProperties* properties);

/* ----------------------------------------------------------------------- sessions */

enum {
    AX_ISCSI_SESSION_OPEN,
    AX_ISCSI_SESSION_CLOSED,
    AX_ISCSI_SESSION_LOGIN_IN_PROGRESS,
    AX_ISCSI_SESSION_LOGIN_FAILED,
    AX_ISCSI_SESSION_RECOVERY,
    AX_ISCSI_SESSION_DELETED
};

typedef struct AX_iSCSI_Session {
    AX_UINT64 isid;
    uint32_t isidQualifier;
    uint16_t tsih;
    uint16_t closed;    /* non-zero: a session that has ended */
    uint32_t sessionId; /* of the port; none is given twice while the library lists it */
    uint8_t reserved[12];
} AX_iSCSI_Session;
AX_CHECK_SIZE(AX_iSCSI_Session, 32);

typedef struct AX_iSCSI_SessionList {
    uint32_t count;
    uint32_t reserved;
    AX_iSCSI_Session entry[1];
} AX_iSCSI_SessionList;
AX_CHECK_SIZE(AX_iSCSI_SessionList, 40);

enum { AX_ISCSI_SESSION_NORMAL, AX_ISCSI_SESSION_DISCOVERY }; /* SessionType of RFC 7143 */
enum { AX_ISCSI_CONNECTION_CONNECTED, AX_ISCSI_CONNECTION_CLOSED };

/* The caller hands it over zeroed. An address of zeros is none. */
typedef struct AX_iSCSI_SessionInfo {
    AX_UINT64 isid;
    uint32_t isidQualifier;
    uint16_t tsih; /* 0 until the target has given one */
    uint16_t closed;
    uint32_t state;           /* AX_ISCSI_SESSION_ */
    uint32_t connectionState; /* AX_ISCSI_CONNECTION_ */
    uint32_t connectionId;
    uint32_t targetPortalGroup;
    uint32_t bootSession;
    uint32_t authenticationMethod; /* AX_ISCSI_AUTH_ */
    uint32_t tcpMSS;
    uint32_t durationSeconds;
    AX_IPAddress initiatorAddress;
    AX_IPAddress targetAddress;
    AX_IPAddress redirectAddress;
    AX_iSCSI_LoginOptions negotiated;
    char targetAlias[AX_ISCSI_NAME_SIZE];
    AX_UINT64 bytesTransferred;
    AX_UINT64 bytesReceived;
    AX_UINT64 commandPDUs;
    AX_UINT64 responsePDUs;
    uint32_t digestErrors;
    uint32_t connectionTimeoutErrors;
    uint32_t sessionType; /* AX_ISCSI_SESSION_NORMAL or AX_ISCSI_SESSION_DISCOVERY */
    uint32_t connectionCount;
    uint32_t maxSendDataSegmentLength; /* what the target declared; ours is among the negotiated */
    uint8_t reserved[224];
} AX_iSCSI_SessionInfo;
AX_CHECK_SIZE(AX_iSCSI_SessionInfo, 668);

AX_API AX_STATUS AX_iSCSI_GetSessions(AX_WWN wwn, const char* targetName,
                                      AX_iSCSI_SessionList* list);
AX_API AX_STATUS AX_iSCSI_GetSessionInfo(AX_WWN wwn, const char* targetName,
                                         const AX_iSCSI_Session* session,
                                         AX_iSCSI_SessionInfo* info);

/* Counters of the port's iSCSI function. Where and what they are called is assumed. */
typedef struct AX_iSCSI_PortStatistics {
    AX_UINT64 bytesTransmitted;
    AX_UINT64 bytesReceived;
    AX_UINT64 pdusTransmitted;
    AX_UINT64 pdusReceived;
    AX_UINT64 loginAccepts;
    AX_UINT64 loginOtherFails;
    AX_UINT64 loginRedirects;
    AX_UINT64 loginAuthenticateFails;
    AX_UINT64 loginAuthorizeFails;
    AX_UINT64 loginNegotiateFails;
    AX_UINT64 logoutNormals;
    AX_UINT64 logoutOtherCodes;
    AX_UINT64 sessionDigestErrors;
    AX_UINT64 sessionTimeoutErrors;
    AX_UINT64 sessionFormatErrors;
    AX_UINT64 sessionFailures;
} AX_iSCSI_PortStatistics;

AX_API AX_STATUS AX_iSCSI_GetPortStatistics(AX_WWN wwn, AX_iSCSI_PortStatistics* statistics);

/* ---------------------------------------------------- logging in, portals, targets */

/* How to log in to a target or to a discovery portal. */
typedef struct AX_iSCSI_LoginProperties {
    AX_iSCSI_LoginOptions options;
    AX_iSCSI_Authentication authentication;
} AX_iSCSI_LoginProperties;

AX_API AX_STATUS AX_iSCSI_AddTarget(AX_WWN wwn, const char* targetName, const AX_IPAddress* portal,
                                    const AX_iSCSI_LoginProperties* properties, uint32_t login);
AX_API AX_STATUS AX_iSCSI_AddBootTarget(AX_WWN wwn, const char* targetName,
                                        const AX_IPAddress* portal,
                                        const AX_iSCSI_LoginProperties* properties, uint32_t login);
AX_API AX_STATUS AX_iSCSI_RemoveTarget(AX_WWN wwn, const char* targetName);
AX_API AX_STATUS AX_iSCSI_TargetLogin(AX_WWN wwn, const char* targetName,
                                      const AX_IPAddress* portal,
                                      const AX_iSCSI_LoginProperties* properties);
/* portal: null for any. */
AX_API AX_STATUS AX_iSCSI_TargetLogout(AX_WWN wwn, const char* targetName,
                                       const AX_IPAddress* portal, uint32_t sessionId);
AX_API AX_STATUS AX_iSCSI_GetTargetLoginAuthProperties(AX_WWN wwn, const char* targetName,
                                                       AX_iSCSI_LoginProperties* properties);
AX_API AX_STATUS AX_iSCSI_SetTargetLoginAuthProperties(AX_WWN wwn, const char* targetName,
                                                       const AX_iSCSI_LoginProperties* properties);
/* eto: extended time-out, seconds. *etoRefused: the operating system takes no such value. */
AX_API AX_STATUS AX_iSCSI_SetTargetProperties(AX_WWN wwn, const char* targetName, uint32_t eto,
                                              uint32_t* etoRefused);
/* address: null for any. */
AX_API AX_STATUS AX_iSCSI_SetBootSession(AX_WWN wwn, const char* targetName,
                                         const AX_IPAddress* address, uint32_t enable);
/* With AX_STATUS_PORTAL_EXISTS, properties hold those that the portal stands with. */
AX_API AX_STATUS AX_iSCSI_AddSendTargetPortal(AX_WWN wwn, const AX_IPAddress* portal,
                                              AX_iSCSI_LoginProperties* properties);
AX_API AX_STATUS AX_iSCSI_RemoveSendTargetPortal(AX_WWN wwn, const AX_IPAddress* portal);
AX_API AX_STATUS AX_iSCSI_GetSendTargetPortalProperties(AX_WWN wwn, const AX_IPAddress* portal,
                                                        AX_iSCSI_LoginProperties* properties);
AX_API AX_STATUS AX_iSCSI_SetSendTargetPortalProperties(AX_WWN wwn, const AX_IPAddress* portal,
                                                        const AX_iSCSI_LoginProperties* properties);

/* --------------------------------------------------------------------------- iSNS */

typedef struct AX_iSCSI_iSNSServerList {
    uint32_t count;
    uint32_t enabled; /* the state that AX_iSCSI_SetiSNSState sets */
    AX_IPAddress server[1];
} AX_iSCSI_iSNSServerList;

AX_API AX_STATUS AX_iSCSI_GetiSNSServers(AX_WWN wwn, AX_iSCSI_iSNSServerList* list);
AX_API AX_STATUS AX_iSCSI_AddiSNSServer(AX_WWN wwn, const AX_IPAddress* server);
AX_API AX_STATUS AX_iSCSI_RemoveiSNSServer(AX_WWN wwn, const AX_IPAddress* server);
AX_API AX_STATUS AX_iSCSI_SetiSNSState(AX_WWN wwn, uint32_t enabled);

/* --------------------------------------------------------------- network settings */

enum { AX_ADDRESS_ORIGIN_STATIC = 3, AX_ADDRESS_ORIGIN_DHCP = 4 }; /* numbers of the CIM schema */

typedef struct AX_Ini_NetworkProperties {
    AX_IPAddress address;
    AX_IPAddress subnetMask;
    AX_IPAddress gateway;
    uint8_t addressOrigin; /* AX_ADDRESS_ORIGIN_ */
    uint8_t linkUp;
    uint8_t vlanEnabled;
    uint8_t priority; /* of the VLAN tag, 0 to 7 */
    uint16_t vlanID;
    uint16_t reserved;
} AX_Ini_NetworkProperties;

/* reply: positive when the address answered. */
AX_API AX_STATUS AX_Ping(AX_WWN wwn, const AX_IPAddress* address, int32_t* reply);
AX_API AX_STATUS AX_Ini_GetNetworkProperties(AX_WWN wwn, AX_Ini_NetworkProperties* properties);
AX_API AX_STATUS AX_Ini_SetNetworkProperties(AX_WWN wwn,
                                             const AX_Ini_NetworkProperties* properties);

typedef struct AX_ARPEntry {
    uint8_t mac[6];
    uint16_t flags;
    AX_IPAddress address;
} AX_ARPEntry;

typedef struct AX_ARPTable {
    uint32_t count;
    uint32_t reserved;
    AX_ARPEntry entry[1];
} AX_ARPTable;

typedef struct AX_RouteEntry {
    AX_IPAddress destination;
    AX_IPAddress subnetMask;
    AX_IPAddress gateway;
} AX_RouteEntry;

typedef struct AX_RouteTable {
    uint32_t count;
    uint32_t reserved;
    AX_RouteEntry entry[1];
} AX_RouteTable;

/* Exported under their LAX_ names by both libraries. */
AX_API AX_STATUS LAX_Ini_GetARPTable(AX_WWN wwn, AX_ARPTable* table);
AX_API AX_STATUS LAX_Ini_AddARPTableEntry(AX_WWN wwn, const AX_ARPEntry* entry);
AX_API AX_STATUS LAX_Ini_DeleteARPTableEntry(AX_WWN wwn, const AX_ARPEntry* entry);
AX_API AX_STATUS LAX_Ini_GetRouteTable(AX_WWN wwn, AX_RouteTable* table);
AX_API AX_STATUS LAX_Ini_AddRouteTableEntry(AX_WWN wwn, const AX_RouteEntry* entry);
AX_API AX_STATUS LAX_Ini_DeleteRouteTableEntry(AX_WWN wwn, const AX_RouteEntry* entry);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_ISCSI_H */
