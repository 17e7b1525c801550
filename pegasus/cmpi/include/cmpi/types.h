// SPDX-License-Identifier: MIT
/*
  The scalar types, codes and small structures that a CMPI provider and its broker exchange.

  Source: the Common Manageability Programming Interface of The Open Group; sizes and codes are those of x86-64 Linux
  and are the same for versions 1.0, 2.0 and 2.1, so that providers compiled elsewhere are binary compatible.
 */
#pragma once

#include <stddef.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef unsigned char CMPIBoolean;
typedef unsigned short CMPIChar16;
typedef unsigned char CMPIUint8;
typedef unsigned short CMPIUint16;
typedef unsigned int CMPIUint32;
typedef unsigned long long CMPIUint64;
typedef signed char CMPISint8;
typedef short CMPISint16;
typedef int CMPISint32;
typedef long long CMPISint64;
typedef float CMPIReal32;
typedef double CMPIReal64;

typedef unsigned int CMPICount;
typedef unsigned int CMPIFlags;
typedef int CMPIVersion;
typedef unsigned short CMPIType;
typedef unsigned short CMPIValueState;
typedef void* CMPIMsgFileHandle;
typedef void CMPIGcStat;

/* Versions of the interface; a table's ftVersion says which of its slots exist. */
#define CMPIVersion100 100
#define CMPIVersion200 200
#define CMPIVersion210 210

/* Codes of values. An array of a type is the type with CMPI_ARRAY set. */
#define CMPI_null 0x0000
#define CMPI_boolean 0x0002
#define CMPI_char16 0x0003
#define CMPI_real32 0x0008
#define CMPI_real64 0x000C
#define CMPI_uint8 0x0080
#define CMPI_uint16 0x0090
#define CMPI_uint32 0x00A0
#define CMPI_uint64 0x00B0
#define CMPI_sint8 0x00C0
#define CMPI_sint16 0x00D0
#define CMPI_sint32 0x00E0
#define CMPI_sint64 0x00F0
#define CMPI_instance 0x1000
#define CMPI_ref 0x1100
#define CMPI_args 0x1200
#define CMPI_class 0x1300
#define CMPI_filter 0x1400
#define CMPI_enumeration 0x1500
#define CMPI_string 0x1600
#define CMPI_chars 0x1700
#define CMPI_dateTime 0x1800
#define CMPI_ptr 0x1900
#define CMPI_charsptr 0x1A00
#define CMPI_SIMPLE 0x0002
#define CMPI_REAL 0x0008
#define CMPI_UINT 0x0080
#define CMPI_SINT 0x00C0
#define CMPI_INTEGER 0x00C0
#define CMPI_ENC 0x1000
#define CMPI_ARRAY 0x2000
#define CMPI_booleanA (CMPI_ARRAY | CMPI_boolean)
#define CMPI_char16A (CMPI_ARRAY | CMPI_char16)
#define CMPI_real32A (CMPI_ARRAY | CMPI_real32)
#define CMPI_real64A (CMPI_ARRAY | CMPI_real64)
#define CMPI_uint8A (CMPI_ARRAY | CMPI_uint8)
#define CMPI_uint16A (CMPI_ARRAY | CMPI_uint16)
#define CMPI_uint32A (CMPI_ARRAY | CMPI_uint32)
#define CMPI_uint64A (CMPI_ARRAY | CMPI_uint64)
#define CMPI_sint8A (CMPI_ARRAY | CMPI_sint8)
#define CMPI_sint16A (CMPI_ARRAY | CMPI_sint16)
#define CMPI_sint32A (CMPI_ARRAY | CMPI_sint32)
#define CMPI_sint64A (CMPI_ARRAY | CMPI_sint64)
#define CMPI_instanceA (CMPI_ARRAY | CMPI_instance)
#define CMPI_refA (CMPI_ARRAY | CMPI_ref)
#define CMPI_stringA (CMPI_ARRAY | CMPI_string)
#define CMPI_charsA (CMPI_ARRAY | CMPI_chars)
#define CMPI_dateTimeA (CMPI_ARRAY | CMPI_dateTime)
#define CMPI_charsptrA (CMPI_ARRAY | CMPI_charsptr)

/* Older names of the same codes. */
#define CMPI_Byte CMPI_sint8
#define CMPI_Short CMPI_sint16
#define CMPI_Int CMPI_sint32
#define CMPI_Long CMPI_sint64
#define CMPI_Float CMPI_real32
#define CMPI_Double CMPI_real64
#define CMPI_ByteA CMPI_sint8A
#define CMPI_ShortA CMPI_sint16A
#define CMPI_IntA CMPI_sint32A
#define CMPI_LongA CMPI_sint64A
#define CMPI_FloatA CMPI_real32A
#define CMPI_DoubleA CMPI_real64A

/* The four forms in which a key is handed back. */
#define CMPI_keyInteger CMPI_sint64
#define CMPI_keyString CMPI_string
#define CMPI_keyBoolean CMPI_boolean
#define CMPI_keyRef CMPI_ref

/* Bits of CMPIData.state. */
#define CMPI_goodValue 0x0000
#define CMPI_nullValue 0x0100
#define CMPI_keyValue 0x0200
#define CMPI_notFound 0x0400
#define CMPI_badValue 0x8000

/* Bits of the context entry CMPIInvocationFlags. */
#define CMPI_FLAG_LocalOnly 1
#define CMPI_FLAG_DeepInheritance 2
#define CMPI_FLAG_IncludeQualifiers 4
#define CMPI_FLAG_IncludeClassOrigin 8

/* Names of the context entries that a broker makes. */
#define CMPIInitNameSpace "CMPIInitNameSpace"
#define CMPIInvocationFlags "CMPIInvocationFlags"
#define CMPIPrincipal "CMPIPrincipal"
#define CMPIRole "CMPIRole"
#define CMPIAcceptLanguage "CMPIAcceptLanguage"
#define CMPIContentLanguage "CMPIContentLanguage"

/* What a broker says it can do (CMPIBrokerFT.brokerCapabilities). */
#define CMPI_MB_BasicRead 0x0001
#define CMPI_MB_BasicWrite 0x0003
#define CMPI_MB_InstanceManipulation 0x0007
#define CMPI_MB_AssociationTraversal 0x0009
#define CMPI_MB_QueryExecution 0x0011
#define CMPI_MB_QueryNormalization 0x0031
#define CMPI_MB_BasicQualifierSupport 0x0047
#define CMPI_MB_Indications 0x0081
#define CMPI_MB_OSEncapsulationSupport 0x0100
#define CMPI_MB_Supports_MemEnhancements 0x4000
#define CMPI_MB_Supports_Extended_Error 0x8000
#define CMPI_MB_Logging 0x10000
#define CMPI_MB_Tracing 0x20000
#define CMPI_MB_PropertyFiltering 0x40001
#define CMPI_MB_CodepageConversion 0x80000

/* In C++ too, any number may come from the other side of the interface. */
#ifdef __cplusplus
#define CMPI_ENUM_BASE : int
#else
#define CMPI_ENUM_BASE
#endif

/* 0 to 17 are the CIM status codes; the others stay between broker and provider. */
typedef enum CMPIrc CMPI_ENUM_BASE
{
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
    CMPI_RC_NO_MORE_ELEMENTS = 18,
    CMPI_RC_ERR_SERVER_LIMITS_EXCEEDED = 27,
    CMPI_RC_ERR_QUERY_FEATURE_NOT_SUPPORTED = 29,
    CMPI_RC_DO_NOT_UNLOAD = 50,
    CMPI_RC_NEVER_UNLOAD = 51,
    CMPI_RC_ERR_INVALID_HANDLE = 60,
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61,
    CMPI_RC_ERR_NOT_IN_CODEPAGE = 62,
    CMPI_RC_ERROR_SYSTEM = 100,
    CMPI_RC_ERROR = 200
} CMPIrc;

typedef enum CMPIPredOp CMPI_ENUM_BASE
{
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
    CMPI_PredOp_Not_Null = 11,
    CMPI_PredOp_Null = 12,
    CMPI_PredOp_And = 13,
    CMPI_PredOp_Or = 14
} CMPIPredOp;

typedef enum CMPISeverity CMPI_ENUM_BASE
{
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4
} CMPISeverity;

typedef enum CMPILevel CMPI_ENUM_BASE
{
    CMPI_LEV_INFO = 1,
    CMPI_LEV_WARNING = 2,
    CMPI_LEV_VERBOSE = 3
} CMPILevel;

typedef enum CMPISelectCondType CMPI_ENUM_BASE
{
    CMPI_COND_DOC = 0,
    CMPI_COND_COD = 1
} CMPISelectCondType;

typedef enum CMPIErrorType CMPI_ENUM_BASE
{
    UnknownErrorType = 0,
    OtherErrorType = 1,
    CommunicationsError = 2,
    QualityOfServiceError = 3,
    SoftwareError = 4,
    HardwareError = 5,
    EnvironmentalError = 6,
    SecurityError = 7,
    OversubscriptionError = 8,
    UnavailableResourceError = 9,
    UnsupportedOperationError = 10
} CMPIErrorType;

typedef enum CMPIErrorSeverity CMPI_ENUM_BASE
{
    ErrorSevUnknown = 0,
    ErrorSevLow = 2,
    ErrorSevMedium = 3,
    ErrorSevHigh = 4,
    ErrorSevFatal = 5
} CMPIErrorSeverity;

/* The numbers of CIM_Error.ProbableCause, 0 to 130; only the first two need a name here. */
typedef enum CMPIErrorProbableCause CMPI_ENUM_BASE
{
    ErrorProbCauseUnknown = 0,
    ErrorProbCauseOther = 1
} CMPIErrorProbableCause;

typedef enum CMPIErrorSrcFormat CMPI_ENUM_BASE
{
    CMPIErrSrcUnknown = 0,
    CMPIErrSrcOther = 1,
    CIMObjectHandle = 2
} CMPIErrorSrcFormat;

typedef enum CMPICodepageID CMPI_ENUM_BASE
{
    CMPI_CPID_SYSTEM = 1,
    CMPI_CPID_USASCII = 2,
    CMPI_CPID_UTF16 = 3
} CMPICodepageID;

typedef struct CMPIBroker CMPIBroker;
typedef struct CMPIContext CMPIContext;
typedef struct CMPIResult CMPIResult;
typedef struct CMPIString CMPIString;
typedef struct CMPIArray CMPIArray;
typedef struct CMPIEnumeration CMPIEnumeration;
typedef struct CMPIInstance CMPIInstance;
typedef struct CMPIObjectPath CMPIObjectPath;
typedef struct CMPIArgs CMPIArgs;
typedef struct CMPIDateTime CMPIDateTime;
typedef struct CMPISelectExp CMPISelectExp;
typedef struct CMPISelectCond CMPISelectCond;
typedef struct CMPISubCond CMPISubCond;
typedef struct CMPIPredicate CMPIPredicate;
typedef struct CMPIError CMPIError;
typedef struct CMPIPropertyList CMPIPropertyList;
typedef struct CMPIEnumerationFilter CMPIEnumerationFilter;
typedef struct CMPIInstanceMI CMPIInstanceMI;
typedef struct CMPIAssociationMI CMPIAssociationMI;
typedef struct CMPIMethodMI CMPIMethodMI;
typedef struct CMPIPropertyMI CMPIPropertyMI;
typedef struct CMPIIndicationMI CMPIIndicationMI;

typedef struct CMPIBrokerEncFT CMPIBrokerEncFT;
typedef struct CMPIBrokerExtFT CMPIBrokerExtFT;
typedef struct CMPIBrokerMemFT CMPIBrokerMemFT;
typedef struct CMPIBrokerFT CMPIBrokerFT;
typedef struct CMPIContextFT CMPIContextFT;
typedef struct CMPIResultFT CMPIResultFT;
typedef struct CMPIStringFT CMPIStringFT;
typedef struct CMPIArrayFT CMPIArrayFT;
typedef struct CMPIEnumerationFT CMPIEnumerationFT;
typedef struct CMPIInstanceFT CMPIInstanceFT;
typedef struct CMPIObjectPathFT CMPIObjectPathFT;
typedef struct CMPIArgsFT CMPIArgsFT;
typedef struct CMPIDateTimeFT CMPIDateTimeFT;
typedef struct CMPISelectExpFT CMPISelectExpFT;
typedef struct CMPISelectCondFT CMPISelectCondFT;
typedef struct CMPISubCondFT CMPISubCondFT;
typedef struct CMPIPredicateFT CMPIPredicateFT;
typedef struct CMPIErrorFT CMPIErrorFT;
typedef struct CMPIPropertyListFT CMPIPropertyListFT;
typedef struct CMPIEnumerationFilterFT CMPIEnumerationFilterFT;
typedef struct CMPIInstanceMIFT CMPIInstanceMIFT;
typedef struct CMPIAssociationMIFT CMPIAssociationMIFT;
typedef struct CMPIMethodMIFT CMPIMethodMIFT;
typedef struct CMPIPropertyMIFT CMPIPropertyMIFT;
typedef struct CMPIIndicationMIFT CMPIIndicationMIFT;

/* Text by pointer and length; the widest member of CMPIValue. */
typedef struct CMPIValuePtr
{
    void* ptr;
    CMPICount length;
} CMPIValuePtr;

/*
 * One value. Which member holds it follows from the type code that travels beside it.
 * Where a function takes (const CMPIValue*, CMPIType) and the type is CMPI_chars, the pointer itself is the text.
 */
typedef union CMPIValue {
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
} CMPIValue;

typedef struct CMPIData
{
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
} CMPIData;

typedef struct CMPIStatus
{
    CMPIrc rc;
    CMPIString* msg;
} CMPIStatus;

/* Reads a property of whatever `parm` stands for; used by query objects. */
typedef CMPIData CMPIAccessor(const char* name, void* parm);

#ifdef __cplusplus
}
#endif
