/* Scalars, type codes, states, return codes and flags of CMPI 1.00.
 *
 * Included by cmpi.h only.
 */
#ifndef CMPI_CMPI_TYPES_H
#define CMPI_CMPI_TYPES_H

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

#endif /* CMPI_CMPI_TYPES_H */
