/*
 * The management library: diagnostics, beacon and PCI registers. Included by
 * device/library/axapi.h.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_DIAGNOSTICS_H
#define VLN_DEVICE_LIBRARY_AXAPI_DIAGNOSTICS_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

enum { AX_BEACON_NOT_AVAILABLE = 1, AX_BEACON_OFF = 2, AX_BEACON_ON = 3 };

/* The state of a test in AX_DiagResults. */
enum {
    AX_DIAG_RUNNING = 1,
    AX_DIAG_PENDING = 2,
    AX_DIAG_CANCELLED = 4,
    AX_DIAG_CANCEL_FINISHED = 5,
    AX_DIAG_COMPLETE = 6
};

/* The results of a test, twelve words. */
typedef struct AX_DiagResults {
    uint32_t reserved0;
    uint32_t state;
    uint32_t reserved2;
    uint32_t cyclesComplete;
    uint32_t milliseconds;
    uint32_t resultCode;
    uint32_t reserved6;
    uint32_t errorCycles;
    uint32_t transmitErrors;
    uint32_t receiveErrors;
    uint32_t reserved10[2];
} AX_DiagResults;
AX_CHECK_SIZE(AX_DiagResults, 48);
AX_CHECK_OFFSET(AX_DiagResults, state, 4);
AX_CHECK_OFFSET(AX_DiagResults, cyclesComplete, 12);
AX_CHECK_OFFSET(AX_DiagResults, errorCycles, 28);

/* The same twelve words for the cable test: the four pairs from byte 24 on. */
typedef struct AX_CableResults {
    uint32_t reserved0;
    uint32_t state;
    uint32_t reserved2;
    uint32_t cyclesComplete;
    uint32_t milliseconds;
    uint32_t resultCode;
    uint8_t pairState[4];   /* 0 ok, 1 ok without length, 2 open, 3 shorted */
    uint32_t pairLength[4]; /* centimetres */
    uint32_t reserved44;
} AX_CableResults;
AX_CHECK_SIZE(AX_CableResults, 48);
AX_CHECK_OFFSET(AX_CableResults, pairState, 24);
AX_CHECK_OFFSET(AX_CableResults, pairLength, 28);

/*
 * What a PCI function's configuration space holds: the type 0 header of the PCI Local Bus
 * Specification, then registers of its capabilities. Assumed: the order of the second part and of
 * the location words in front.
 */
typedef struct AX_PCIRegisters {
    uint32_t busNumber;
    uint32_t deviceNumber;
    uint32_t functionNumber;
    uint32_t pciType;

    uint16_t vendorID;
    uint16_t deviceID;
    uint16_t command;
    uint16_t status;
    uint8_t revisionID;
    uint8_t progIf;
    uint8_t subClass;
    uint8_t baseClass;
    uint8_t cacheLineSize;
    uint8_t latencyTimer;
    uint8_t headerType;
    uint8_t builtInSelfTest;
    uint32_t baseAddresses[6];
    uint32_t cis;
    uint16_t subVendorID;
    uint16_t subsystemID;
    uint32_t expansionROMBaseAddress;
    uint8_t capabilitiesPtr;
    uint8_t reserved53[7];
    uint8_t interruptLine;
    uint8_t interruptPin;
    uint8_t minimumGrant;
    uint8_t maximumLatency;

    uint32_t featureEnable;
    uint32_t pwrMgtCaps;
    uint32_t pwrMgtCtrl;
    uint32_t msiCtrl;
    uint32_t msiLowAddr;
    uint32_t msiHighAddr;
    uint32_t msiData;
    uint32_t msiMaskBits;
    uint32_t msiPendingBits;
    uint32_t msiXCtrl;
    uint32_t msiXTableOffset;
    uint32_t msiXPBAOffset;
    uint32_t vpdAddr;
    uint32_t vpdData[4];
    uint32_t pcieCap;
    uint32_t pcieDeviceCapReg;
    uint32_t pcieDeviceStatusCtrl;
    uint32_t pcieDeviceLinkCap;
    uint32_t pcieDeviceLinkStatusCtrl;
    uint32_t slotCap;
    uint32_t slotStatusCtrlReg;
    uint32_t rootCapCtrlReg;
    uint32_t rootStatusReg;
    uint32_t deviceCap2Reg;
    uint32_t deviceStatusCtl2Reg;
    uint32_t linkCap2Reg;
    uint32_t linkStatus2Ctl2Reg;
    uint32_t slotCap2Reg;
    uint32_t slotStatusCtl2Reg;
    uint32_t enhancedCapHdrAER;
    uint32_t uncorrectableErrStat;
    uint32_t uncorrectableErrMask;
    uint32_t uncorrectableErrSeverity;
    uint32_t correctableErrStat;
    uint32_t correctableErrMask;
    uint32_t advErrCapCtl;
    uint32_t headerLog[4];
    uint32_t enhancedCapHdrPBUDG;
    uint32_t dataSelectReg;
    uint32_t dataReg;
    uint32_t powerBudget;
} AX_PCIRegisters;
AX_CHECK_OFFSET(AX_PCIRegisters, featureEnable, 16 + 64);

AX_API AX_STATUS AX_DiagBeacon(AX_WWN wwn, uint32_t state);
AX_API AX_STATUS AX_DiagBeaconState(AX_WWN wwn, uint32_t* state);
AX_API AX_STATUS AX_DiagReadPCIRegistersV2(AX_WWN wwn, AX_PCIRegisters* registers);
AX_API AX_STATUS AX_DiagSetNVP(AX_WWN wwn, uint32_t percent);

/*
 * Tests run in the library's background under a handle, which is never 0. The argument behind the
 * handle is 0 and the pattern is hexadecimal digits, null for the default.
 */
AX_API AX_STATUS AX_DiagLoopBackTestV3(AX_WWN wwn, uint32_t type, uint32_t cycles,
                                       uint32_t haltOnError, uint32_t* handle, uint32_t reserved,
                                       const char* pattern);
AX_API AX_STATUS AX_DiagEchoTestV2(AX_WWN wwn, AX_WWN target, uint32_t cycles, uint32_t haltOnError,
                                   uint32_t* handle, uint32_t reserved, const char* pattern);
AX_API AX_STATUS AX_DiagRunTDR(AX_WWN wwn, uint32_t* handle, AX_CableResults* results);
/* The results are an AX_CableResults when the handle is a cable test's. */
AX_API AX_STATUS AX_DiagGetResults(AX_WWN wwn, uint32_t handle, AX_DiagResults* results);
AX_API AX_STATUS AX_DiagCancelDiagnostic(AX_WWN wwn, uint32_t handle);

/* Not called by the system. Assumed: the signatures, after their successors above. */
AX_API AX_STATUS AX_DiagEchoTest(AX_WWN wwn, AX_WWN target, uint32_t cycles, uint32_t haltOnError,
                                 uint32_t* handle);
AX_API AX_STATUS AX_DiagLoopBackTest(AX_WWN wwn, uint32_t type, uint32_t cycles,
                                     uint32_t haltOnError, uint32_t* handle);
AX_API AX_STATUS AX_DiagLoopBackTestV2(AX_WWN wwn, uint32_t type, uint32_t cycles,
                                       uint32_t haltOnError, uint32_t* handle, uint32_t reserved);
AX_API AX_STATUS AX_DiagPciLoopBackTest(AX_WWN wwn, uint32_t cycles, uint32_t haltOnError,
                                        uint32_t* handle);
AX_API AX_STATUS AX_DiagPciLoopBackTestV2(AX_WWN wwn, uint32_t cycles, uint32_t haltOnError,
                                          uint32_t* handle, uint32_t reserved);
AX_API AX_STATUS AX_DiagRunPOST(AX_WWN wwn, uint32_t* handle);
AX_API AX_STATUS AX_DiagMDIOSelfTest(AX_WWN wwn, uint32_t* handle);
AX_API AX_STATUS AX_DiagGetWakeupParams(AX_WWN wwn, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_DiagGetLoadListParams(AX_WWN wwn, void* buffer, uint32_t* size);
AX_API AX_STATUS AX_DiagDPortTest(AX_WWN wwn, uint32_t* handle);
AX_API AX_STATUS AX_DiagGetResultsDPort(AX_WWN wwn, uint32_t handle, void* buffer, uint32_t* size);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_DIAGNOSTICS_H */
