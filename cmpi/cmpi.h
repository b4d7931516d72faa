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

#include "cmpi/cmpi_types.h"

#include <stddef.h>
#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

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
