/*
 * The management library: personality, port configuration, channels, virtual functions and quality
 * of service. Included by device/library/axapi.h.
 */
#ifndef VLN_DEVICE_LIBRARY_AXAPI_CHANNELS_H
#define VLN_DEVICE_LIBRARY_AXAPI_CHANNELS_H

#include "device/library/axapi.h"

AX_BEGIN_DECLS

/* --------------------------------------------------------------------- personality */

enum { AX_PERSONALITIES = 8 };

/* Assumed: the numbers. */
enum { AX_PERSONALITY_NIC = 1, AX_PERSONALITY_ISCSI, AX_PERSONALITY_FCOE, AX_PERSONALITY_ROCE };

/* Assumed: the layout. */
typedef struct AX_AdapterPersonalityInfo {
    uint32_t current;
    uint32_t configured;
    uint32_t availableCount; /* of available */
    uint32_t available[AX_PERSONALITIES];
} AX_AdapterPersonalityInfo;

AX_API AX_STATUS AX_ChangeAdapterPersonality(AX_WWN wwn, uint32_t personality);
AX_API AX_STATUS AX_GetAdapterPersonalityInfo(AX_WWN wwn, AX_AdapterPersonalityInfo* info);

/* -------------------------------------------------------------- port configuration */

enum { AX_CONFIG_PORTS = 4, AX_CONFIG_FUNCTIONS = 16 };

enum { AX_PROTOCOL_NONE, AX_PROTOCOL_NIC, AX_PROTOCOL_ISCSI, AX_PROTOCOL_FCOE, AX_PROTOCOL_ROCE };

/* Capability flags of a function. */
enum {
    AX_FUNCTION_NIC = 1,
    AX_FUNCTION_ROCE = 2,
    AX_FUNCTION_ISCSI = 4,
    AX_FUNCTION_FCOE = 8,
    AX_FUNCTION_NONE = 16,
    AX_FUNCTION_ETS_DISABLED = 32
};

/* adapterFlags. Assumed: all but the concurrent mode. */
enum {
    AX_ADAPTER_MIXED_MODE = 1,
    AX_ADAPTER_GANGED_MODE = 2,
    AX_ADAPTER_CONCURRENT_MODE = 4,
    AX_ADAPTER_SRIOV = 8,
    AX_ADAPTER_T10DIF = 16,
    AX_ADAPTER_REBOOT_REQUIRED = 32
};

typedef struct AX_FunctionConfig {
    uint32_t protocol;        /* AX_PROTOCOL_, in force; in a set call what is to be */
    uint32_t pendingProtocol; /* after the next reboot; not looked at in a set call */
    uint32_t flags;           /* AX_FUNCTION_ */
    uint32_t functionNumber;  /* PCI */
    uint8_t mac[6];
    uint8_t reserved22[2];
    uint8_t reserved24[144];
} AX_FunctionConfig;
AX_CHECK_SIZE(AX_FunctionConfig, 168);

typedef struct AX_PortConfig {
    uint32_t functionCount; /* of function */
    uint32_t maxFunctionCount;
    uint32_t reserved[6];
    AX_FunctionConfig function[AX_CONFIG_FUNCTIONS];
} AX_PortConfig;

/* Assumed: the layout. Only its size is the library's. */
typedef struct AX_AdapterPortConfig {
    uint32_t portCount; /* of port */
    uint32_t maxFCoEFunctions;
    uint32_t maxiSCSIFunctions;
    uint32_t adapterFlags; /* AX_ADAPTER_ */
    uint32_t activeProfileId;
    uint32_t configuredProfileId;
    int32_t mcType;           /* 0 none, 1 to 5 a multichannel type, 2 vNIC */
    int32_t configuredMCType; /* the same, -1: mcType applies */
    uint8_t pid;              /* profile to configure */
    uint8_t profileVersion;
    uint8_t minPorts;
    uint8_t maxPorts;
    uint32_t ariFunctionCount4; /* the ARI function count times 4 */
    uint32_t iplMaxFunctionCount;
    uint32_t reserved[2];
    AX_PortConfig port[AX_CONFIG_PORTS];
} AX_AdapterPortConfig;
AX_CHECK_SIZE(AX_AdapterPortConfig, 10932);

enum { AX_PROFILES = 32 };

typedef struct AX_Profile {
    uint32_t id;
    uint32_t flags;
    uint32_t reserved[2];
    char name[56];
} AX_Profile;
AX_CHECK_SIZE(AX_Profile, 72);
AX_CHECK_OFFSET(AX_Profile, name, 16);

/*
 * Assumed: the head. A list is allocated as this record and room for count profiles behind it, so
 * there is always more room than count says.
 */
typedef struct AX_ProfileList {
    uint32_t count;
    uint32_t activeProfileId;
    uint32_t configuredProfileId;
    AX_Profile profile[AX_PROFILES];
} AX_ProfileList;
AX_CHECK_SIZE(AX_ProfileList, 2316);

AX_API AX_STATUS AX_GetAdapterPortConfig(AX_WWN wwn, AX_AdapterPortConfig* config);
AX_API AX_STATUS AX_SetAdapterPortConfig(AX_WWN wwn, const AX_AdapterPortConfig* config);
AX_API AX_STATUS AX_SetAdapterPortConfigDefaults(AX_WWN wwn);
AX_API AX_STATUS AX_ListProfiles(AX_WWN wwn, AX_ProfileList* list);

/* ---------------------------------------------------------------- channel management */

/* Assumed: the words but the third and the fifth. */
typedef struct AX_ChannelMgmtCNAInfo {
    uint32_t version;
    uint32_t capabilities; /* bit 4: partitioning can be switched */
    uint32_t currentState; /* 1 enabled */
    uint32_t configuredState;
    uint32_t mgmtType;
    uint32_t configuredMgmtType;
    uint32_t availableModes; /* bit n: mode n + 1 */
    uint32_t reserved;
} AX_ChannelMgmtCNAInfo;
AX_CHECK_OFFSET(AX_ChannelMgmtCNAInfo, currentState, 8);
AX_CHECK_OFFSET(AX_ChannelMgmtCNAInfo, mgmtType, 16);

/* What can be changed, and in a set call what is. */
enum {
    AX_CHANNEL_MASK_LPVID = 4,
    AX_CHANNEL_MASK_BANDWIDTH = 8,
    AX_CHANNEL_MASK_TYPE = 16,
    AX_CHANNEL_MASK_INNER_LPVID = 32
};

/* Channel types, as bits in supportedTypes. Assumed: the storage ones. */
enum { AX_CHANNEL_NIC = 1, AX_CHANNEL_ISCSI = 2, AX_CHANNEL_FCOE = 4, AX_CHANNEL_NIC_ROCE = 8 };

enum { AX_CHANNELS = 16 };

/* Assumed: the order of the fields. */
typedef struct AX_Channel {
    uint32_t type;
    uint32_t lpvid;
    uint32_t minBandwidth; /* percent */
    uint32_t maxBandwidth;
    uint32_t innerLPVID;
    uint8_t mac[6];
    uint8_t reserved26[2];
    uint32_t state; /* 1 up */
    uint32_t functionNumber;
    char name[64];
    uint8_t reserved100[32];
} AX_Channel;
AX_CHECK_SIZE(AX_Channel, 132);

typedef struct AX_ChannelMgmtPortInfo {
    uint32_t mask;  /* AX_CHANNEL_MASK_ */
    uint32_t count; /* of channel, filled by the library */
    AX_Channel channel[AX_CHANNELS];
} AX_ChannelMgmtPortInfo;

AX_API AX_STATUS AX_GetChannelMgmtCNAInfo(AX_WWN wwn, AX_ChannelMgmtCNAInfo* info);
AX_API AX_STATUS AX_SetChannelMgmtCNAInfo(AX_WWN wwn, const AX_ChannelMgmtCNAInfo* info);
AX_API AX_STATUS AX_GetChannelMgmtPortInfo(AX_WWN wwn, AX_ChannelMgmtPortInfo* info);
AX_API AX_STATUS AX_SetChannelMgmtPortInfo(AX_WWN wwn, const AX_ChannelMgmtPortInfo* info);

/* --------------------------------------------- dead ports, virtual functions, QoS */

/*
 * A port whose firmware has failed. It is no instance of the library; as an argument its MAC
 * address stands for it, in the last six bytes of a WWN, which begins with zeros. Assumed: that
 * form, and the order of the fields.
 */
typedef struct AX_DeadNicPort {
    uint8_t mac[6];
    uint8_t reserved[2];
    char model[128];
    char serialNumber[128];
} AX_DeadNicPort;

typedef struct AX_DeadNicPortList {
    uint32_t count;
    uint32_t reserved;
    AX_DeadNicPort entry[1];
} AX_DeadNicPortList;

typedef struct AX_VirtualFunctionList {
    uint32_t count;
    uint32_t reserved;
    AX_NAME entry[1];
} AX_VirtualFunctionList;

/* Assumed: the layout. */
typedef struct AX_VirtualFunctionProperties {
    uint32_t busNumber; /* PCI */
    uint32_t deviceNumber;
    uint32_t functionNumber;
    uint16_t vendorID;
    uint16_t deviceID;
    uint16_t subVendorID;
    uint16_t subsystemID;
    uint32_t revisionID;
    uint32_t vlanID;
    uint32_t linkStatus;
    uint8_t mac[6];
    uint8_t reserved[2];
    char transmitRate[32]; /* with its unit */
} AX_VirtualFunctionProperties;
AX_CHECK_SIZE(AX_VirtualFunctionProperties, 72);

enum { AX_QOS_NIC = 1, AX_QOS_ISCSI = 2 };

/* Assumed: the order of the fields. */
typedef struct AX_QoS {
    uint32_t kind;              /* AX_QOS_ */
    uint32_t flag;              /* 1 in a set call */
    uint32_t maxBytesPerSecond; /* NIC: bandwidth */
    uint32_t maxIOsPerSecond;
} AX_QoS;

AX_API AX_STATUS AX_ListDeadNicPorts(AX_DeadNicPortList* list);
AX_API AX_STATUS AX_GetVirtualFunctionList(AX_WWN wwn, AX_VirtualFunctionList* list);
AX_API AX_STATUS AX_GetVirtualFunctionProperties(AX_WWN wwn, AX_WWN function,
                                                 AX_VirtualFunctionProperties* properties);
AX_API AX_STATUS AX_GetQoS(AX_WWN wwn, AX_QoS* qos);
AX_API AX_STATUS AX_SetQoS(AX_WWN wwn, const AX_QoS* qos);

AX_END_DECLS

#endif /* VLN_DEVICE_LIBRARY_AXAPI_CHANNELS_H */
