/*
 * The management library: virtual ports, LUN priority, the older SCSI path and events. Included by
 * device/library/axapi.h.
 *
 * Records and signatures of this file are assumed unless a size is asserted.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_VIRTUAL_PORTS_H
#define VLN_DEVICE_LIBRARY_AXAPI_VIRTUAL_PORTS_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

/* ------------------------------------------------------------------ virtual ports */

typedef struct AX_VPort {
    AX_NAME wwpn;
    AX_NAME wwnn;
    uint8_t reserved[8];
} AX_VPort;
AX_CHECK_SIZE(AX_VPort, 24);

typedef struct AX_VPortList {
    uint32_t count;
    AX_VPort entry[1];
} AX_VPortList;
AX_CHECK_SIZE(AX_VPortList, 28);

typedef struct AX_VPortAttributes {
    AX_NAME wwpn;
    AX_NAME wwnn;
    AX_NAME fabricName;
    uint32_t fcId;
    uint32_t state; /* as port attribute 774 */
    char name[256];
} AX_VPortAttributes;

/* A logical unit of a target that the virtual port sees. */
typedef struct AX_VPortTarget {
    AX_NAME wwpn;
    AX_NAME wwnn;
    uint32_t fcId;
    uint32_t scsiBusNumber;
    uint32_t scsiTargetNumber;
    uint32_t scsiOSLun;
    AX_UINT64 fcpLun;
    char osDeviceName[256];
} AX_VPortTarget;

typedef struct AX_VPortTargetList {
    uint32_t count;
    uint32_t reserved;
    AX_VPortTarget entry[1];
} AX_VPortTargetList;

typedef struct AX_VM {
    char id[64];
} AX_VM;

typedef struct AX_VMList {
    uint32_t count;
    uint32_t reserved;
    AX_VM entry[1];
} AX_VMList;

typedef struct AX_VMInfo {
    char name[256];
    char operatingSystem[256];
} AX_VMInfo;

AX_API AX_STATUS AX_VPList(AX_WWN wwn, AX_VPortList* list);
AX_API AX_STATUS AX_VPGetAttributes(AX_WWN wwn, AX_WWN vport, AX_VPortAttributes* attributes);
AX_API AX_STATUS AX_VPListTargets(AX_WWN wwn, AX_WWN vport, AX_VPortTargetList* list);
AX_API AX_STATUS AX_VpScsiInquiry(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint64_t fcpLun,
                                  uint32_t evpd, uint32_t page, void* response,
                                  uint32_t responseSize, void* sense, uint32_t senseSize);
AX_API AX_STATUS AX_VpScsiReadCapacity(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint64_t fcpLun,
                                       void* response, uint32_t responseSize, void* sense,
                                       uint32_t senseSize);
AX_API AX_STATUS AX_VpScsiReportLUNs(AX_WWN wwn, AX_WWN vport, AX_WWN target, void* response,
                                     uint32_t responseSize, void* sense, uint32_t senseSize);
AX_API AX_STATUS AX_GetVMFromVPort(AX_WWN wwn, AX_WWN vport, AX_VM* vm);
AX_API AX_STATUS AX_GetVMInfo(const AX_VM* vm, AX_VMInfo* info);
AX_API AX_STATUS AX_VPCreate(AX_WWN wwn, AX_WWN vport, AX_WWN vportNode, const char* name);
AX_API AX_STATUS AX_VPAutoGenCreate(AX_WWN wwn, const char* name, AX_NAME* vport,
                                    AX_NAME* vportNode);
AX_API AX_STATUS AX_VPDelete(AX_WWN wwn, AX_WWN vport);
AX_API AX_STATUS AX_ListVM(AX_VMList* list);

/* ------------------------------------------------------------------- LUN priority */

enum { AX_OAS_DRIVER, AX_OAS_CONFIG };

enum { AX_OAS_ALL_LUNS = 256 };

typedef struct AX_OASLun {
    AX_NAME initiator; /* a physical or a virtual port */
    AX_NAME target;
    uint32_t lun;
    uint32_t state;  /* 1 priority on */
    uint32_t option; /* AX_OAS_ */
    uint32_t reserved;
} AX_OASLun;

typedef struct AX_OASLunList {
    uint32_t count;
    uint32_t reserved;
    AX_OASLun entry[1];
} AX_OASLunList;

AX_API AX_STATUS AX_GetOASLunList(AX_WWN wwn, uint32_t option, AX_OASLunList* list);
AX_API AX_STATUS AX_SetOASLunState(AX_WWN wwn, AX_WWN vport, AX_WWN target, uint32_t lun,
                                   uint32_t state, uint32_t option);

/* ------------------------------------------- older SCSI path, not called by the system */

AX_API AX_STATUS AX_ScsiInquiry(AX_WWN wwn, AX_WWN target, uint64_t fcpLun, uint32_t evpd,
                                uint32_t page, void* response, uint32_t responseSize, void* sense,
                                uint32_t senseSize);
AX_API AX_STATUS AX_ScsiReadCapacity(AX_WWN wwn, AX_WWN target, uint64_t fcpLun, void* response,
                                     uint32_t responseSize, void* sense, uint32_t senseSize);
AX_API AX_STATUS AX_GetLunList(AX_WWN wwn, AX_WWN target, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_GetLunAttributes(AX_WWN wwn, AX_WWN target, uint64_t fcpLun, void* buffer,
                                     uint32_t* size);
AX_API AX_STATUS AX_GetFcpTargetMapping(AX_WWN wwn, void* buffer, uint32_t* size);

/* --------------------------------------------------- events, not called by the system */

typedef void (*AX_PortEventHandler)(void* data, AX_WWN wwn, uint32_t event);

AX_API AX_STATUS AX_RegisterForAdapterPortEvents(AX_WWN wwn, AX_PortEventHandler handler,
                                                 void* data, uint32_t* handle);
AX_API AX_STATUS AX_UnRegisterForAdapterPortEvents(uint32_t handle);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_VIRTUAL_PORTS_H */
