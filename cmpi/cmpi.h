/* The binary interface between an object manager and its providers: CMPI 1.00.
 *
 * Plain C declarations of the published Common Manageability Programming Interface at level 1.00,
 * the level this provider is written to. Only layout matters here: members stand in table order,
 * nothing is packed, and cmpi_layout.h proves every size and offset for i386 and x86-64 at compile
 * time. A broker of a later level has longer tables; nothing beyond the 1.00 members is declared,
 * so nothing beyond them can be called by accident.
 *
 * Ownership (published interface): what a broker function returns belongs to the broker and lives
 * until the MI function returns; the result of clone belongs to the caller and goes to release.
 * Parameters of an MI function are never released by the provider.
 */
#ifndef CMPI_CMPI_H
#define CMPI_CMPI_H

#include <stddef.h>
#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Scalars ---- */

typedef unsigned char CMPIBoolean;
typedef unsigned short CMPIChar16;
typedef unsigned char CMPIUint8;
typedef unsigned short CMPIUint16;
typedef unsigned int CMPIUint32;
typedef unsigned long long CMPIUint64;
typedef signed char CMPISint8;
typedef short CMPISint16;
typedef signed int CMPISint32;
typedef long long CMPISint64;
typedef float CMPIReal32;
typedef double CMPIReal64;
typedef unsigned int CMPICount;
typedef unsigned short CMPIType;
typedef unsigned short CMPIValueState;
typedef unsigned int CMPIFlags;

/* ---- Versions ---- */

#define CMPIVersion100 100
#define CMPICurrentVersion CMPIVersion100

/* ---- Type codes: an array code is the element code with CMPI_ARRAY set ---- */

#define CMPI_ARRAY ((CMPIType)0x2000)

#define CMPI_null ((CMPIType)0x0000)
#define CMPI_boolean ((CMPIType)0x0002)
#define CMPI_char16 ((CMPIType)0x0003)
#define CMPI_real32 ((CMPIType)0x0008)
#define CMPI_real64 ((CMPIType)0x000c)
#define CMPI_uint8 ((CMPIType)0x0080)
#define CMPI_uint16 ((CMPIType)0x0090)
#define CMPI_uint32 ((CMPIType)0x00a0)
#define CMPI_uint64 ((CMPIType)0x00b0)
#define CMPI_sint8 ((CMPIType)0x00c0)
#define CMPI_sint16 ((CMPIType)0x00d0)
#define CMPI_sint32 ((CMPIType)0x00e0)
#define CMPI_sint64 ((CMPIType)0x00f0)
#define CMPI_instance ((CMPIType)0x1000)
#define CMPI_ref ((CMPIType)0x1100)
#define CMPI_args ((CMPIType)0x1200)
#define CMPI_class ((CMPIType)0x1300)
#define CMPI_filter ((CMPIType)0x1400)
#define CMPI_enumeration ((CMPIType)0x1500)
#define CMPI_string ((CMPIType)0x1600)
#define CMPI_chars ((CMPIType)0x1700)
#define CMPI_dateTime ((CMPIType)0x1800)
#define CMPI_ptr ((CMPIType)0x1900)
#define CMPI_charsptr ((CMPIType)0x1a00)

#define CMPI_booleanA ((CMPIType)(CMPI_ARRAY | CMPI_boolean))
#define CMPI_char16A ((CMPIType)(CMPI_ARRAY | CMPI_char16))
#define CMPI_real32A ((CMPIType)(CMPI_ARRAY | CMPI_real32))
#define CMPI_real64A ((CMPIType)(CMPI_ARRAY | CMPI_real64))
#define CMPI_uint8A ((CMPIType)(CMPI_ARRAY | CMPI_uint8))
#define CMPI_uint16A ((CMPIType)(CMPI_ARRAY | CMPI_uint16))
#define CMPI_uint32A ((CMPIType)(CMPI_ARRAY | CMPI_uint32))
#define CMPI_uint64A ((CMPIType)(CMPI_ARRAY | CMPI_uint64))
#define CMPI_sint8A ((CMPIType)(CMPI_ARRAY | CMPI_sint8))
#define CMPI_sint16A ((CMPIType)(CMPI_ARRAY | CMPI_sint16))
#define CMPI_sint32A ((CMPIType)(CMPI_ARRAY | CMPI_sint32))
#define CMPI_sint64A ((CMPIType)(CMPI_ARRAY | CMPI_sint64))
#define CMPI_instanceA ((CMPIType)(CMPI_ARRAY | CMPI_instance))
#define CMPI_refA ((CMPIType)(CMPI_ARRAY | CMPI_ref))
#define CMPI_stringA ((CMPIType)(CMPI_ARRAY | CMPI_string))
#define CMPI_charsA ((CMPIType)(CMPI_ARRAY | CMPI_chars))
#define CMPI_dateTimeA ((CMPIType)(CMPI_ARRAY | CMPI_dateTime))
#define CMPI_charsptrA ((CMPIType)(CMPI_ARRAY | CMPI_charsptr))

/* Groups and aliases */

#define CMPI_SIMPLE ((CMPIType)0x0002)
#define CMPI_REAL ((CMPIType)0x0008)
#define CMPI_UINT ((CMPIType)0x0080)
#define CMPI_SINT ((CMPIType)0x00c0)
#define CMPI_INTEGER ((CMPIType)0x00c0)
#define CMPI_ENC ((CMPIType)0x1000)
#define CMPI_keyInteger ((CMPIType)0x00f0)
#define CMPI_keyString ((CMPIType)0x1600)
#define CMPI_keyBoolean ((CMPIType)0x0002)
#define CMPI_keyRef ((CMPIType)0x1100)
#define CMPI_charString ((CMPIType)0x1600)
#define CMPI_integerString ((CMPIType)0x16f0)
#define CMPI_realString ((CMPIType)0x160c)
#define CMPI_numericString ((CMPIType)0x16fc)
#define CMPI_booleanString ((CMPIType)0x1602)
#define CMPI_dateTimeString ((CMPIType)0x1e00)
#define CMPI_classNameString ((CMPIType)0x1700)
#define CMPI_nameString ((CMPIType)0x1e00)

/* ---- State of a value: bits combine; a value is usable when (state & 0x8500) is 0 ---- */

#define CMPI_goodValue ((CMPIValueState)0x0000)
#define CMPI_nullValue ((CMPIValueState)0x0100)
#define CMPI_keyValue ((CMPIValueState)0x0200)
#define CMPI_notFound ((CMPIValueState)0x0400)
#define CMPI_badValue ((CMPIValueState)0x8000)

/* ---- Return codes ---- */

typedef enum CMPIrc {
    CMPI_RC_OK = 0,
    CMPI_RC_ERR_FAILED = 1,
    CMPI_RC_ERR_ACCESS_DENIED = 2,
    CMPI_RC_ERR_INVALID_NAMESPACE = 3,
    CMPI_RC_ERR_INVALID_PARAMETER = 4,
    CMPI_RC_ERR_INVALID_CLASS = 5,
    CMPI_RC_ERR_NOT_FOUND = 6,
    CMPI_RC_ERR_NOT_SUPPORTED = 7,
    CMPI_RC_ERR_CLASS_HAS_CHILDREN = 8,
    CMPI_RC_ERR_CLASS_HAS_INSTANCES = 9,
    CMPI_RC_ERR_INVALID_SUPERCLASS = 10,
    CMPI_RC_ERR_ALREADY_EXISTS = 11,
    CMPI_RC_ERR_NO_SUCH_PROPERTY = 12,
    CMPI_RC_ERR_TYPE_MISMATCH = 13,
    CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED = 14,
    CMPI_RC_ERR_INVALID_QUERY = 15,
    CMPI_RC_ERR_METHOD_NOT_AVAILABLE = 16,
    CMPI_RC_ERR_METHOD_NOT_FOUND = 17,
    CMPI_RC_DO_NOT_UNLOAD = 50,
    CMPI_RC_NEVER_UNLOAD = 51,
    CMPI_RC_ERR_INVALID_HANDLE = 60,
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61,
    CMPI_RC_ERROR_SYSTEM = 100,
    CMPI_RC_ERROR = 200,
} CMPIrc;

/* ---- Invocation flags ---- */

#define CMPI_FLAG_LocalOnly ((CMPIFlags)1)
#define CMPI_FLAG_DeepInheritance ((CMPIFlags)2)
#define CMPI_FLAG_IncludeQualifiers ((CMPIFlags)4)
#define CMPI_FLAG_IncludeClassOrigin ((CMPIFlags)8)

/* ---- Names of context entries. Not every broker sets every entry: test the status ---- */

#define CMPIInvocationFlags "CMPIInvocationFlags"
#define CMPIPrincipal "CMPIPrincipal"
#define CMPIInitNameSpace "CMPIInitNameSpace"
#define CMPIRole "CMPIRole"
#define CMPIAcceptLanguage "CMPIAcceptLanguage"
#define CMPIContentLanguage "CMPIContentLanguage"

/* ---- Other enumerations ---- */

typedef enum CMPIPredOp {
    CMPI_PredOp_Equals = 1,
    CMPI_PredOp_NotEquals = 2,
    CMPI_PredOp_LessThan = 3,
    CMPI_PredOp_GreaterThanOrEquals = 4,
    CMPI_PredOp_GreaterThan = 5,
    CMPI_PredOp_LessThanOrEquals = 6,
    CMPI_PredOp_Isa = 7,
    CMPI_PredOp_NotIsa = 8,
    CMPI_PredOp_Like = 9,
    CMPI_PredOp_NotLike = 10,
} CMPIPredOp;

typedef enum CMPISeverity {
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4,
} CMPISeverity;

typedef enum CMPILevel {
    CMPI_LEV_INFO = 1,
    CMPI_LEV_WARNING = 2,
    CMPI_LEV_VERBOSE = 3,
} CMPILevel;

typedef enum CMPISelectCondType {
    CMPI_COND_DOC = 0,
    CMPI_COND_COD = 1,
} CMPISelectCondType;

/* ---- Broker capability bits ---- */

#define CMPI_MB_Class_0 0x00000001u
#define CMPI_MB_Class_1 0x00000003u
#define CMPI_MB_Class_2 0x00000007u
#define CMPI_MB_Supports_PropertyMI 0x00000100u
#define CMPI_MB_Supports_IndicationMI 0x00000200u
#define CMPI_MB_Supports_IndicationPolling 0x00000400u
#define CMPI_MB_Supports_QueryNormalization 0x00000800u
#define CMPI_MB_Supports_Qualifier 0x00001000u
#define CMPI_MB_Supports_Schema 0x00003000u
#define CMPI_MB_BasicRead 0x00000001u
#define CMPI_MB_BasicWrite 0x00000003u
#define CMPI_MB_InstanceManipulation 0x00000007u
#define CMPI_MB_AssociationTraversal 0x00000009u
#define CMPI_MB_QueryExecution 0x00000011u
#define CMPI_MB_QueryNormalization 0x00000031u
#define CMPI_MB_Indications 0x00000081u
#define CMPI_MB_BasicQualifierSupport 0x00000047u
#define CMPI_MB_OSEncapsulationSupport 0x00000100u

/* ---- Objects. hdl is opaque; in the MI structures it belongs to the provider ---- */

typedef struct CMPIContext CMPIContext;
typedef struct CMPIContextFT CMPIContextFT;
typedef struct CMPIResult CMPIResult;
typedef struct CMPIResultFT CMPIResultFT;
typedef struct CMPIInstance CMPIInstance;
typedef struct CMPIInstanceFT CMPIInstanceFT;
typedef struct CMPIObjectPath CMPIObjectPath;
typedef struct CMPIObjectPathFT CMPIObjectPathFT;
typedef struct CMPIArgs CMPIArgs;
typedef struct CMPIArgsFT CMPIArgsFT;
typedef struct CMPIString CMPIString;
typedef struct CMPIStringFT CMPIStringFT;
typedef struct CMPIArray CMPIArray;
typedef struct CMPIArrayFT CMPIArrayFT;
typedef struct CMPIEnumeration CMPIEnumeration;
typedef struct CMPIEnumerationFT CMPIEnumerationFT;
typedef struct CMPIDateTime CMPIDateTime;
typedef struct CMPIDateTimeFT CMPIDateTimeFT;
typedef struct CMPISelectExp CMPISelectExp;
typedef struct CMPISelectExpFT CMPISelectExpFT;
typedef struct CMPISelectCond CMPISelectCond;
typedef struct CMPISelectCondFT CMPISelectCondFT;
typedef struct CMPISubCond CMPISubCond;
typedef struct CMPISubCondFT CMPISubCondFT;
typedef struct CMPIPredicate CMPIPredicate;
typedef struct CMPIPredicateFT CMPIPredicateFT;
typedef struct CMPIInstanceMI CMPIInstanceMI;
typedef struct CMPIInstanceMIFT CMPIInstanceMIFT;
typedef struct CMPIAssociationMI CMPIAssociationMI;
typedef struct CMPIAssociationMIFT CMPIAssociationMIFT;
typedef struct CMPIMethodMI CMPIMethodMI;
typedef struct CMPIMethodMIFT CMPIMethodMIFT;
typedef struct CMPIPropertyMI CMPIPropertyMI;
typedef struct CMPIPropertyMIFT CMPIPropertyMIFT;
typedef struct CMPIIndicationMI CMPIIndicationMI;
typedef struct CMPIIndicationMIFT CMPIIndicationMIFT;
typedef struct CMPIBroker CMPIBroker;
typedef struct CMPIBrokerFT CMPIBrokerFT;
typedef struct CMPIBrokerEncFT CMPIBrokerEncFT;
typedef struct CMPIBrokerExtFT CMPIBrokerExtFT;
typedef struct CMPIValuePtr CMPIValuePtr;
typedef struct CMPIData CMPIData;
typedef struct CMPIStatus CMPIStatus;
typedef union CMPIValue CMPIValue;

struct CMPIValuePtr {
    void* ptr;
    CMPICount length;
};

union CMPIValue {
    CMPIUint64 uint64;
    CMPIUint32 uint32;
    CMPIUint16 uint16;
    CMPIUint8 uint8;
    CMPISint64 sint64;
    CMPISint32 sint32;
    CMPISint16 sint16;
    CMPISint8 sint8;
    CMPIReal64 real64;
    CMPIReal32 real32;
    CMPIBoolean boolean;
    CMPIChar16 char16;
    CMPIInstance* inst;
    CMPIObjectPath* ref;
    CMPIArgs* args;
    CMPISelectExp* filter;
    CMPIEnumeration* Enum;
    CMPIArray* array;
    CMPIString* string;
    char* chars;
    CMPIDateTime* dateTime;
    CMPIValuePtr dataPtr;
    CMPISint8 Byte;
    CMPISint16 Short;
    CMPISint32 Int;
    CMPISint64 Long;
    CMPIReal32 Float;
    CMPIReal64 Double;
};

struct CMPIData {
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
};

struct CMPIStatus {
    CMPIrc rc;
    CMPIString* msg;
};

struct CMPIBroker {
    void* hdl;
    CMPIBrokerFT* bft;
    CMPIBrokerEncFT* eft;
    CMPIBrokerExtFT* xft;
};

/* Reads one property of whatever a select expression is evaluated over. */
typedef CMPIData CMPIAccessor(const char* propertyName, void* parm);

struct CMPIContext {
    void* hdl;
    CMPIContextFT* ft;
};

struct CMPIResult {
    void* hdl;
    CMPIResultFT* ft;
};

struct CMPIInstance {
    void* hdl;
    CMPIInstanceFT* ft;
};

struct CMPIObjectPath {
    void* hdl;
    CMPIObjectPathFT* ft;
};

struct CMPIArgs {
    void* hdl;
    CMPIArgsFT* ft;
};

struct CMPIString {
    void* hdl;
    CMPIStringFT* ft;
};

struct CMPIArray {
    void* hdl;
    CMPIArrayFT* ft;
};

struct CMPIEnumeration {
    void* hdl;
    CMPIEnumerationFT* ft;
};

struct CMPIDateTime {
    void* hdl;
    CMPIDateTimeFT* ft;
};

struct CMPISelectExp {
    void* hdl;
    CMPISelectExpFT* ft;
};

struct CMPISelectCond {
    void* hdl;
    CMPISelectCondFT* ft;
};

struct CMPISubCond {
    void* hdl;
    CMPISubCondFT* ft;
};

struct CMPIPredicate {
    void* hdl;
    CMPIPredicateFT* ft;
};

struct CMPIInstanceMI {
    void* hdl;
    CMPIInstanceMIFT* ft;
};

struct CMPIAssociationMI {
    void* hdl;
    CMPIAssociationMIFT* ft;
};

struct CMPIMethodMI {
    void* hdl;
    CMPIMethodMIFT* ft;
};

struct CMPIPropertyMI {
    void* hdl;
    CMPIPropertyMIFT* ft;
};

struct CMPIIndicationMI {
    void* hdl;
    CMPIIndicationMIFT* ft;
};

/* ---- Function tables, in the order of the interface ---- */

struct CMPIBrokerFT {
    unsigned int brokerCapabilities;
    unsigned int brokerVersion;
    const char* brokerName;
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* broker, const CMPIContext* ctx);
    CMPIStatus (*attachThread)(const CMPIBroker* broker, const CMPIContext* ctx);
    CMPIStatus (*detachThread)(const CMPIBroker* broker, const CMPIContext* ctx);
    CMPIStatus (*deliverIndication)(const CMPIBroker* broker, const CMPIContext* ctx,
                                    const char* nameSpace, const CMPIInstance* indication);
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* broker, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, CMPIStatus* st);
    CMPIInstance* (*getInstance)(const CMPIBroker* broker, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const char** propertyList,
                                 CMPIStatus* st);
    CMPIObjectPath* (*createInstance)(const CMPIBroker* broker, const CMPIContext* ctx,
                                      const CMPIObjectPath* op, const CMPIInstance* inst,
                                      CMPIStatus* st);
    CMPIStatus (*modifyInstance)(const CMPIBroker* broker, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const CMPIInstance* inst,
                                 const char** propertyList);
    CMPIStatus (*deleteInstance)(const CMPIBroker* broker, const CMPIContext* ctx,
                                 const CMPIObjectPath* op);
    CMPIEnumeration* (*execQuery)(const CMPIBroker* broker, const CMPIContext* ctx,
                                  const CMPIObjectPath* op, const char* query, const char* language,
                                  CMPIStatus* st);
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* broker, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char** propertyList,
                                           CMPIStatus* st);
    CMPIEnumeration* (*associators)(const CMPIBroker* broker, const CMPIContext* ctx,
                                    const CMPIObjectPath* op, const char* assocClass,
                                    const char* resultClass, const char* role,
                                    const char* resultRole, const char** propertyList,
                                    CMPIStatus* st);
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* broker, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const char* assocClass,
                                        const char* resultClass, const char* role,
                                        const char* resultRole, CMPIStatus* st);
    CMPIEnumeration* (*references)(const CMPIBroker* broker, const CMPIContext* ctx,
                                   const CMPIObjectPath* op, const char* resultClass,
                                   const char* role, const char** propertyList, CMPIStatus* st);
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* broker, const CMPIContext* ctx,
                                       const CMPIObjectPath* op, const char* resultClass,
                                       const char* role, CMPIStatus* st);
    CMPIData (*invokeMethod)(const CMPIBroker* broker, const CMPIContext* ctx,
                             const CMPIObjectPath* op, const char* method, const CMPIArgs* in,
                             CMPIArgs* out, CMPIStatus* st);
    CMPIStatus (*setProperty)(const CMPIBroker* broker, const CMPIContext* ctx,
                              const CMPIObjectPath* op, const char* name, const CMPIValue* value,
                              CMPIType type);
    CMPIData (*getProperty)(const CMPIBroker* broker, const CMPIContext* ctx,
                            const CMPIObjectPath* op, const char* name, CMPIStatus* st);
};

struct CMPIBrokerEncFT {
    int ftVersion;
    CMPIInstance* (*newInstance)(const CMPIBroker* broker, const CMPIObjectPath* op,
                                 CMPIStatus* st);
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* broker, const char* nameSpace,
                                     const char* className, CMPIStatus* st);
    CMPIArgs* (*newArgs)(const CMPIBroker* broker, CMPIStatus* st);
    CMPIString* (*newString)(const CMPIBroker* broker, const char* text, CMPIStatus* st);
    CMPIArray* (*newArray)(const CMPIBroker* broker, CMPICount size, CMPIType elementType,
                           CMPIStatus* st);
    CMPIDateTime* (*newDateTime)(const CMPIBroker* broker, CMPIStatus* st);
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* broker, CMPIUint64 microseconds,
                                           CMPIBoolean interval, CMPIStatus* st);
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* broker, const char* cimText,
                                          CMPIStatus* st);
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* broker, const char* query,
                                   const char* language, CMPIArray** projection, CMPIStatus* st);
    CMPIBoolean (*classPathIsA)(const CMPIBroker* broker, const CMPIObjectPath* op,
                                const char* className, CMPIStatus* st);
    CMPIString* (*toString)(const CMPIBroker* broker, const void* object, CMPIStatus* st);
    CMPIBoolean (*isOfType)(const CMPIBroker* broker, const void* object, const char* cmpiTypeName,
                            CMPIStatus* st);
    CMPIString* (*getType)(const CMPIBroker* broker, const void* object, CMPIStatus* st);
    CMPIString* (*getMessage)(const CMPIBroker* broker, const char* messageId,
                              const char* defaultText, CMPIStatus* st, CMPICount count, ...);
    CMPIStatus (*logMessage)(const CMPIBroker* broker, int severity, const char* id,
                             const char* text, const CMPIString* string);
    CMPIStatus (*trace)(const CMPIBroker* broker, int level, const char* component,
                        const char* text, const CMPIString* string);
};

struct CMPIBrokerExtFT {
    int ftVersion;
    char* (*resolveFileName)(const char* genericName);
    void* (*newThread)(void* (*start)(void*), void* arg, int detached);
    int (*joinThread)(void* thread, void** returnValue);
    int (*exitThread)(void* returnValue);
    int (*cancelThread)(void* thread);
    int (*threadSleep)(CMPIUint32 milliseconds);
    int (*threadOnce)(int* once, void (*init)(void));
    int (*createThreadKey)(unsigned int* key, void (*cleanup)(void*));
    int (*destroyThreadKey)(unsigned int key);
    void* (*getThreadSpecific)(unsigned int key);
    int (*setThreadSpecific)(unsigned int key, void* value);
    void* (*newMutex)(int options);
    void (*destroyMutex)(void* mutex);
    void (*lockMutex)(void* mutex);
    void (*unlockMutex)(void* mutex);
    void* (*newCondition)(int options);
    void (*destroyCondition)(void* cond);
    int (*condWait)(void* cond, void* mutex);
    int (*timedCondWait)(void* cond, void* mutex, struct timespec* deadline);
    int (*signalCondition)(void* cond);
};

struct CMPIInstanceMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* result, const CMPIObjectPath* op);
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* op,
                                     const char** propertyList);
    CMPIStatus (*getInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                              const CMPIObjectPath* op, const char** propertyList);
    CMPIStatus (*createInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* result, const CMPIObjectPath* op,
                                 const CMPIInstance* inst);
    CMPIStatus (*modifyInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* result, const CMPIObjectPath* op,
                                 const CMPIInstance* inst, const char** propertyList);
    CMPIStatus (*deleteInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* result, const CMPIObjectPath* op);
    CMPIStatus (*execQuery)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                            const CMPIObjectPath* op, const char* query, const char* language);
};

struct CMPIAssociationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*associators)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                              const CMPIResult* result, const CMPIObjectPath* op,
                              const char* assocClass, const char* resultClass, const char* role,
                              const char* resultRole, const char** propertyList);
    CMPIStatus (*associatorNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                  const CMPIResult* result, const CMPIObjectPath* op,
                                  const char* assocClass, const char* resultClass, const char* role,
                                  const char* resultRole);
    CMPIStatus (*references)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                             const CMPIResult* result, const CMPIObjectPath* op,
                             const char* resultClass, const char* role, const char** propertyList);
    CMPIStatus (*referenceNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* result, const CMPIObjectPath* op,
                                 const char* resultClass, const char* role);
};

struct CMPIMethodMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*invokeMethod)(CMPIMethodMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                               const CMPIObjectPath* op, const char* method, const CMPIArgs* in,
                               CMPIArgs* out);
};

struct CMPIPropertyMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIPropertyMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*setProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                              const CMPIObjectPath* op, const char* name, CMPIData data);
    CMPIStatus (*getProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                              const CMPIObjectPath* op, const char* name);
};

struct CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                  const CMPISelectExp* filter, const char* className,
                                  const CMPIObjectPath* op, const char* owner);
    CMPIStatus (*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                           const CMPISelectExp* filter, const char* className,
                           const CMPIObjectPath* op);
    CMPIStatus (*activateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                 const CMPISelectExp* filter, const char* className,
                                 const CMPIObjectPath* op, CMPIBoolean first);
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                   const CMPISelectExp* filter, const char* className,
                                   const CMPIObjectPath* op, CMPIBoolean last);
    CMPIStatus (*enableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
    CMPIStatus (*disableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
};

struct CMPIContextFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIContext* ctx);
    CMPIContext* (*clone)(const CMPIContext* ctx, CMPIStatus* st);
    CMPIData (*getEntry)(const CMPIContext* ctx, const char* name, CMPIStatus* st);
    CMPIData (*getEntryAt)(const CMPIContext* ctx, CMPICount index, CMPIString** name,
                           CMPIStatus* st);
    CMPICount (*getEntryCount)(const CMPIContext* ctx, CMPIStatus* st);
    CMPIStatus (*addEntry)(const CMPIContext* ctx, const char* name, const CMPIValue* value,
                           CMPIType type);
};

struct CMPIResultFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIResult* result);
    CMPIResult* (*clone)(const CMPIResult* result, CMPIStatus* st);
    CMPIStatus (*returnData)(const CMPIResult* result, const CMPIValue* value, CMPIType type);
    CMPIStatus (*returnInstance)(const CMPIResult* result, const CMPIInstance* inst);
    CMPIStatus (*returnObjectPath)(const CMPIResult* result, const CMPIObjectPath* op);
    CMPIStatus (*returnDone)(const CMPIResult* result);
};

struct CMPIInstanceFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIInstance* inst);
    CMPIInstance* (*clone)(const CMPIInstance* inst, CMPIStatus* st);
    CMPIData (*getProperty)(const CMPIInstance* inst, const char* name, CMPIStatus* st);
    CMPIData (*getPropertyAt)(const CMPIInstance* inst, CMPICount index, CMPIString** name,
                              CMPIStatus* st);
    CMPICount (*getPropertyCount)(const CMPIInstance* inst, CMPIStatus* st);
    CMPIStatus (*setProperty)(const CMPIInstance* inst, const char* name, const CMPIValue* value,
                              CMPIType type);
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* inst, CMPIStatus* st);
    CMPIStatus (*setPropertyFilter)(CMPIInstance* inst, const char** propertyList,
                                    const char** keyList);
    CMPIStatus (*setObjectPath)(CMPIInstance* inst, const CMPIObjectPath* op);
};

struct CMPIObjectPathFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* op);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setNameSpace)(CMPIObjectPath* op, const char* nameSpace);
    CMPIString* (*getNameSpace)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setHostname)(CMPIObjectPath* op, const char* host);
    CMPIString* (*getHostname)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setClassName)(CMPIObjectPath* op, const char* className);
    CMPIString* (*getClassName)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*addKey)(CMPIObjectPath* op, const char* name, const CMPIValue* value,
                         CMPIType type);
    CMPIData (*getKey)(const CMPIObjectPath* op, const char* name, CMPIStatus* st);
    CMPIData (*getKeyAt)(const CMPIObjectPath* op, CMPICount index, CMPIString** name,
                         CMPIStatus* st);
    CMPICount (*getKeyCount)(const CMPIObjectPath* op, CMPIStatus* st);
    CMPIStatus (*setNameSpaceFromObjectPath)(CMPIObjectPath* op, const CMPIObjectPath* source);
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(CMPIObjectPath* op,
                                                    const CMPIObjectPath* source);
    CMPIData (*getClassQualifier)(const CMPIObjectPath* op, const char* qualifier, CMPIStatus* st);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath* op, const char* property,
                                     const char* qualifier, CMPIStatus* st);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath* op, const char* method,
                                   const char* qualifier, CMPIStatus* st);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath* op, const char* method,
                                      const char* parameter, const char* qualifier, CMPIStatus* st);
    CMPIString* (*toString)(const CMPIObjectPath* op, CMPIStatus* st);
};

struct CMPIArgsFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArgs* args);
    CMPIArgs* (*clone)(const CMPIArgs* args, CMPIStatus* st);
    CMPIStatus (*addArg)(const CMPIArgs* args, const char* name, const CMPIValue* value,
                         CMPIType type);
    CMPIData (*getArg)(const CMPIArgs* args, const char* name, CMPIStatus* st);
    CMPIData (*getArgAt)(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* st);
    CMPICount (*getArgCount)(const CMPIArgs* args, CMPIStatus* st);
};

struct CMPIStringFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIString* str);
    CMPIString* (*clone)(const CMPIString* str, CMPIStatus* st);
    const char* (*getCharPtr)(const CMPIString* str, CMPIStatus* st);
};

struct CMPIArrayFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArray* array);
    CMPIArray* (*clone)(const CMPIArray* array, CMPIStatus* st);
    CMPICount (*getSize)(const CMPIArray* array, CMPIStatus* st);
    CMPIType (*getSimpleType)(const CMPIArray* array, CMPIStatus* st);
    CMPIData (*getElementAt)(const CMPIArray* array, CMPICount index, CMPIStatus* st);
    CMPIStatus (*setElementAt)(CMPIArray* array, CMPICount index, const CMPIValue* value,
                               CMPIType type);
};

struct CMPIEnumerationFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* en);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* en, CMPIStatus* st);
    CMPIData (*getNext)(const CMPIEnumeration* en, CMPIStatus* st);
    CMPIBoolean (*hasNext)(const CMPIEnumeration* en, CMPIStatus* st);
    CMPIArray* (*toArray)(const CMPIEnumeration* en, CMPIStatus* st);
};

struct CMPIDateTimeFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIDateTime* dt);
    CMPIDateTime* (*clone)(const CMPIDateTime* dt, CMPIStatus* st);
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* dt, CMPIStatus* st);
    CMPIString* (*getStringFormat)(const CMPIDateTime* dt, CMPIStatus* st);
    CMPIBoolean (*isInterval)(const CMPIDateTime* dt, CMPIStatus* st);
};

struct CMPISelectExpFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectExp* exp);
    CMPISelectExp* (*clone)(const CMPISelectExp* exp, CMPIStatus* st);
    CMPIBoolean (*evaluate)(const CMPISelectExp* exp, const CMPIInstance* inst, CMPIStatus* st);
    CMPIString* (*getString)(const CMPISelectExp* exp, CMPIStatus* st);
    CMPISelectCond* (*getDOC)(const CMPISelectExp* exp, CMPIStatus* st);
    CMPISelectCond* (*getCOD)(const CMPISelectExp* exp, CMPIStatus* st);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* exp, CMPIAccessor* accessor,
                                         void* parm, CMPIStatus* st);
};

struct CMPISelectCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectCond* cond);
    CMPISelectCond* (*clone)(const CMPISelectCond* cond, CMPIStatus* st);
    CMPICount (*getCountAndType)(const CMPISelectCond* cond, int* condType, CMPIStatus* st);
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* cond, CMPICount index, CMPIStatus* st);
};

struct CMPISubCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISubCond* sub);
    CMPISubCond* (*clone)(const CMPISubCond* sub, CMPIStatus* st);
    CMPICount (*getCount)(const CMPISubCond* sub, CMPIStatus* st);
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* sub, CMPICount index, CMPIStatus* st);
    CMPIPredicate* (*getPredicate)(const CMPISubCond* sub, const char* name, CMPIStatus* st);
};

struct CMPIPredicateFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIPredicate* pred);
    CMPIPredicate* (*clone)(const CMPIPredicate* pred, CMPIStatus* st);
    CMPIStatus (*getData)(const CMPIPredicate* pred, CMPIType* type, CMPIPredOp* operation,
                          CMPIString** left, CMPIString** right);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* pred, CMPIAccessor* accessor,
                                         void* parm, CMPIStatus* st);
};

#ifdef __cplusplus
} /* extern "C" */
#endif

#include "cmpi/cmpi_layout.h"

#endif /* CMPI_CMPI_H */
