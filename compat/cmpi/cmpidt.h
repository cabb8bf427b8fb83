/*
 * CMPI 2.0 data types: representation of values that an object manager (the broker) and a provider exchange. cmpift.h
 * declares the functions, and cmpimacs.h macros for them.
 *
 * The header is valid C99 and C++. Sizes, values, member order and struct tags are those of the CMPI 2.0 standard on
 * 64-bit Linux. A provider compiled with it runs in any broker that conforms to that standard.
 */
#ifndef CMPIDT_H
#define CMPIDT_H

#include <stddef.h>

#include "cmpi20/names.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Versions
 * Values of the version members of function tables: the interface version times a hundred.
 */
///@{
#define CMPIVersion100 100
#define CMPIVersion200 200
#define CMPICurrentVersion CMPIVersion200
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Scalars                                                                                         */
/* ---------------------------------------------------------------------------------------------- */

/** @name CIM scalars */
///@{
typedef unsigned char CMPIBoolean; /**< 0 is false, anything else is true */
typedef unsigned short CMPIChar16; /**< one UCS-2 character */
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
///@}

/** @name Scalars of the interface */
///@{
typedef unsigned int CMPICount;        /**< a number of elements, or a zero-based index */
typedef unsigned int CMPIFlags;        /**< a set of CMPI_FLAG_ bits */
typedef unsigned short CMPIType;       /**< one of the types below */
typedef unsigned short CMPIValueState; /**< a set of the value states below */
typedef void* CMPIMsgFileHandle;       /**< an open message catalogue of the broker */
typedef void CMPIGcStat;               /**< a mark of the broker's memory, used only as a pointer */
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Types                                                                                           */
/* ---------------------------------------------------------------------------------------------- */

/** @name Types of values
 * The type determines the member of CMPIValue; its bits determine the family of types.
 */
///@{
#define CMPI_null 0x0000 /**< no type: no value */

#define CMPI_SIMPLE 0x0002 /**< family of boolean and char16 */
#define CMPI_boolean 0x0002
#define CMPI_char16 0x0003

#define CMPI_REAL 0x0008 /**< family of the floating-point types */
#define CMPI_real32 0x0008
#define CMPI_real64 0x000c

#define CMPI_UINT 0x0080 /**< family of the unsigned integers */
#define CMPI_uint8 0x0080
#define CMPI_uint16 0x0090
#define CMPI_uint32 0x00a0
#define CMPI_uint64 0x00b0

#define CMPI_SINT 0x00c0 /**< family of the signed integers; contains the bit of the unsigned ones */
#define CMPI_sint8 0x00c0
#define CMPI_sint16 0x00d0
#define CMPI_sint32 0x00e0
#define CMPI_sint64 0x00f0

#define CMPI_INTEGER 0x00c0 /**< every integer shares a bit with this mask */

#define CMPI_ENC 0x1000 /**< family of the types whose value is a pointer */
#define CMPI_instance 0x1000
#define CMPI_ref 0x1100 /**< an object path */
#define CMPI_args 0x1200
#define CMPI_class 0x1300
#define CMPI_filter 0x1400 /**< a select expression */
#define CMPI_enumeration 0x1500
#define CMPI_string 0x1600 /**< a string object of the broker */
#define CMPI_chars 0x1700  /**< null-terminated characters; pass their address instead of that of a value */
#define CMPI_dateTime 0x1800
#define CMPI_ptr 0x1900      /**< bytes with a length, interpreted only by provider and caller */
#define CMPI_charsptr 0x1a00 /**< a pointer to a character pointer */
///@}

/** @name Types of arrays
 * An array's type is the type of its elements with one more bit.
 */
///@{
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
#define CMPI_stringA (CMPI_ARRAY | CMPI_string)
#define CMPI_charsA (CMPI_ARRAY | CMPI_chars)
#define CMPI_dateTimeA (CMPI_ARRAY | CMPI_dateTime)
#define CMPI_instanceA (CMPI_ARRAY | CMPI_instance)
#define CMPI_refA (CMPI_ARRAY | CMPI_ref)
///@}

/** @name Types of keys
 * Aliases of the usual types of object path keys.
 */
///@{
#define CMPI_keyInteger CMPI_sint64
#define CMPI_keyString CMPI_string
#define CMPI_keyBoolean CMPI_boolean
#define CMPI_keyRef CMPI_ref
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Values                                                                                          */
/* ---------------------------------------------------------------------------------------------- */

/** @name States of values
 * A set of bits. 0 means a good value. If the null bit is set, do not read the value.
 */
///@{
#define CMPI_goodValue ((CMPIValueState)0x0000)
#define CMPI_nullValue ((CMPIValueState)0x0100) /**< typed, but without a value */
#define CMPI_keyValue ((CMPIValueState)0x0200)  /**< the value is one of a key */
#define CMPI_notFound ((CMPIValueState)0x0400)  /**< the requested name does not exist */
#define CMPI_badValue ((CMPIValueState)0x8000)  /**< the value is unusable */
///@}

/** Uninterpreted bytes: address and length. */
struct _CMPIValuePtr {
    void* ptr;        /**< null for none */
    CMPICount length; /**< in bytes */
};

/**
 * A value of any type. The associated type (in CMPIData, or the next argument) determines the member. Pointers are
 * borrowed: storing a pointer does not transfer ownership.
 */
union _CMPIValue {
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

    /** @name Members with names of C types */
    ///@{
    CMPISint8 Byte;
    CMPISint16 Short;
    CMPISint32 Int;
    CMPISint64 Long;
    CMPIReal32 Float;
    CMPIReal64 Double;
    ///@}
};

/** A value with its type and state: the result of every reading function. Check the state first. */
struct _CMPIData {
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
};

/**
 * Reads a property by name, to evaluate a select expression without an instance.
 * @param name name of the property
 * @param parameter the argument of the evaluating function
 */
typedef CMPIData CMPIAccessor(const char* name, void* parameter);

/* ---------------------------------------------------------------------------------------------- */
/* Status                                                                                          */
/* ---------------------------------------------------------------------------------------------- */

/** Result of an operation. 1 to 17 are the status codes of CIM operations. */
typedef enum _CMPIrc {
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
    CMPI_RC_DO_NOT_UNLOAD = 50,         /**< result of a cleanup: not now, call again */
    CMPI_RC_NEVER_UNLOAD = 51,          /**< result of a cleanup: never unload the provider */
    CMPI_RC_ERR_INVALID_HANDLE = 60,    /**< an object has the wrong type or no longer exists */
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61, /**< a type is unknown or not allowed */
    CMPI_RC_ERROR_SYSTEM = 100,         /**< the operating system reported an error */
    CMPI_RC_ERROR = 200                 /**< the broker failed */
} CMPIrc;

/** A code and an optional message. Functions with a pointer parameter of this type set both members and accept null. */
struct _CMPIStatus {
    CMPIrc rc;
    CMPIString* msg;
};

/* ---------------------------------------------------------------------------------------------- */
/* Capabilities of brokers and flags of requests                                                   */
/* ---------------------------------------------------------------------------------------------- */

/** @name Broker capabilities
 * Sets of bits; each contains the capabilities that it depends on.
 */
///@{
#define CMPI_MB_BasicRead 0x0001
#define CMPI_MB_BasicWrite 0x0003
#define CMPI_MB_InstanceManipulation 0x0007
#define CMPI_MB_AssociationTraversal 0x0009
///@}

/** @name Broker classes */
///@{
#define CMPI_MB_Class_0 0x0001
#define CMPI_MB_Class_1 0x0003
#define CMPI_MB_Class_2 0x0007
///@}

/** @name Invocation flags
 * Options of the client, in the context entry CMPIInvocationFlags.
 */
///@{
#define CMPI_FLAG_LocalOnly 0x0001
#define CMPI_FLAG_DeepInheritance 0x0002
#define CMPI_FLAG_IncludeQualifiers 0x0004
#define CMPI_FLAG_IncludeClassOrigin 0x0008
///@}

/** @name Names of context entries */
///@{
#define CMPIInitNameSpace "CMPIInitNameSpace"     /**< string: the namespace of the provider's registration */
#define CMPIInvocationFlags "CMPIInvocationFlags" /**< uint32: CMPI_FLAG_ bits */
#define CMPIPrincipal "CMPIPrincipal"             /**< string: the user */
#define CMPIRole "CMPIRole"                       /**< string: the user's role */
#define CMPIAcceptLanguage "CMPIAcceptLanguage"   /**< string: the client's preferred languages */
#define CMPIContentLanguage "CMPIContentLanguage" /**< string: the language of the client's data */
///@}

/* ---------------------------------------------------------------------------------------------- */
/* Enumerations of parameters and results                                                          */
/* ---------------------------------------------------------------------------------------------- */

/** Operator of a predicate. */
typedef enum _CMPIPredOp {
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

/** Type of a condition. */
typedef enum _CMPISelectCondType {
    CMPI_COND_DOC = 0, /**< a disjunction of conjunctions */
    CMPI_COND_COD = 1  /**< a conjunction of disjunctions */
} CMPISelectCondType;

/** Severity of a message in the broker's log. */
typedef enum _CMPISeverity {
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4 /**< for developers only */
} CMPISeverity;

/** Level of a message in the broker's trace. */
typedef enum _CMPILevel { CMPI_LEV_INFO = 1, CMPI_LEV_WARNING = 2, CMPI_LEV_VERBOSE = 3 } CMPILevel;

/** Type of an error, as defined by the CIM schema. */
typedef enum _CMPIErrorType {
    UnknownErrorType = 0,
    OtherErrorType = 1, /**< described in the error object */
    CommunicationsError = 2,
    QualityOfServiceError = 3,
    SoftwareError = 4,
    HardwareError = 5,
    EnvironmentalError = 6,
    SecurityError = 7,
    Oversubscription_Error = 8,
    UnavailableResourceError = 9,
    UnsupportedOperationError = 10
} CMPIErrorType;

/** Severity of an error for the object that reports it. */
typedef enum _CMPIErrorSeverity {
    ErrorSevUnknown = 0,
    ErrorSevLow = 2,
    ErrorSevMedium = 3,
    ErrorSevHigh = 4,
    ErrorSevFatal = 5
} CMPIErrorSeverity;

/**
 * Probable cause of an error. The values are those of the CIM schema's ProbableCause, 0 to 130; use the number for
 * causes without a name.
 */
typedef enum _CMPIErrorProbableCause {
    ErrorProbCauseUnknown = 0,
    ErrorProbCauseOther = 1, /**< described in the error object */
    Unexpected_Information = 130
} CMPIErrorProbableCause;

/** Format of the source of an error. */
typedef enum _CMPIErrorSrcFormat {
    CMPIErrSrcUnknown = 0,
    CMPIErrSrcOther = 1, /**< described in the error object */
    CIMObjectHandle = 2  /**< an object path */
} CMPIErrorSrcFormat;

#ifdef __cplusplus
}
#endif

#endif
