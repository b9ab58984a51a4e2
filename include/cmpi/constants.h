// Constants and status codes of CMPI. Included by cmpidt.h.
#ifndef KORVA_CMPI_CONSTANTS_H
#define KORVA_CMPI_CONSTANTS_H

// CMPIType: scalars.
#define CMPI_null 0
#define CMPI_boolean 0x02
#define CMPI_char16 0x03
#define CMPI_real32 0x08
#define CMPI_real64 0x0C
#define CMPI_uint8 0x80
#define CMPI_uint16 0x90
#define CMPI_uint32 0xA0
#define CMPI_uint64 0xB0
#define CMPI_sint8 0xC0
#define CMPI_sint16 0xD0
#define CMPI_sint32 0xE0
#define CMPI_sint64 0xF0

// CMPIType: objects and text.
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

// Groups of types. CMPI_UINT is a part of CMPI_SINT: to tell types apart, compare whole values.
#define CMPI_SIMPLE 0x02
#define CMPI_REAL 0x08
#define CMPI_UINT 0x80
#define CMPI_SINT 0xC0
#define CMPI_INTEGER 0xC0
#define CMPI_ENC 0x1000

// Array of a type: this bit beside the type of the elements.
#define CMPI_ARRAY 0x2000
#define CMPI_SIMPLEA (CMPI_ARRAY | CMPI_SIMPLE)
#define CMPI_booleanA (CMPI_ARRAY | CMPI_boolean)
#define CMPI_char16A (CMPI_ARRAY | CMPI_char16)
#define CMPI_REALA (CMPI_ARRAY | CMPI_REAL)
#define CMPI_real32A (CMPI_ARRAY | CMPI_real32)
#define CMPI_real64A (CMPI_ARRAY | CMPI_real64)
#define CMPI_UINTA (CMPI_ARRAY | CMPI_UINT)
#define CMPI_uint8A (CMPI_ARRAY | CMPI_uint8)
#define CMPI_uint16A (CMPI_ARRAY | CMPI_uint16)
#define CMPI_uint32A (CMPI_ARRAY | CMPI_uint32)
#define CMPI_uint64A (CMPI_ARRAY | CMPI_uint64)
#define CMPI_SINTA (CMPI_ARRAY | CMPI_SINT)
#define CMPI_sint8A (CMPI_ARRAY | CMPI_sint8)
#define CMPI_sint16A (CMPI_ARRAY | CMPI_sint16)
#define CMPI_sint32A (CMPI_ARRAY | CMPI_sint32)
#define CMPI_sint64A (CMPI_ARRAY | CMPI_sint64)
#define CMPI_INTEGERA (CMPI_ARRAY | CMPI_INTEGER)
#define CMPI_ENCA (CMPI_ARRAY | CMPI_ENC)
#define CMPI_stringA (CMPI_ARRAY | CMPI_string)
#define CMPI_charsA (CMPI_ARRAY | CMPI_chars)
#define CMPI_dateTimeA (CMPI_ARRAY | CMPI_dateTime)
#define CMPI_instanceA (CMPI_ARRAY | CMPI_instance)
#define CMPI_refA (CMPI_ARRAY | CMPI_ref)
#define CMPI_charsptrA (CMPI_ARRAY | CMPI_charsptr)

// Types of key values.
#define CMPI_keyInteger CMPI_sint64
#define CMPI_keyString CMPI_string
#define CMPI_keyBoolean CMPI_boolean
#define CMPI_keyRef CMPI_ref

// Types of the operands of a predicate: text that stands for a value of another type.
#define CMPI_charString CMPI_string
#define CMPI_integerString (CMPI_string | CMPI_sint64)
#define CMPI_realString (CMPI_string | CMPI_real64)
#define CMPI_numericString (CMPI_integerString | CMPI_realString)
#define CMPI_booleanString (CMPI_string | CMPI_boolean)
#define CMPI_dateTimeString (CMPI_string | CMPI_dateTime)
#define CMPI_classNameString (CMPI_string | CMPI_ref)
#define CMPI_nameString 0x1E00

// Older names of types; CMPI_NO_SYNONYM_SUPPORT hides them.
#ifndef CMPI_NO_SYNONYM_SUPPORT
#define CMPI_Byte CMPI_sint8
#define CMPI_Short CMPI_sint16
#define CMPI_Int CMPI_sint32
#define CMPI_Long CMPI_sint64
#define CMPI_Float CMPI_real32
#define CMPI_Double CMPI_real64
#define CMPI_ByteA (CMPI_ARRAY | CMPI_Byte)
#define CMPI_ShortA (CMPI_ARRAY | CMPI_Short)
#define CMPI_IntA (CMPI_ARRAY | CMPI_Int)
#define CMPI_LongA (CMPI_ARRAY | CMPI_Long)
#define CMPI_FloatA (CMPI_ARRAY | CMPI_Float)
#define CMPI_DoubleA (CMPI_ARRAY | CMPI_Double)
#endif

// CMPIValueState: bits, except that CMPI_goodValue is the absence of all.
#define CMPI_goodValue 0
#define CMPI_nullValue 0x0100
#define CMPI_keyValue 0x0200
#define CMPI_notFound 0x0400
#define CMPI_badValue 0x8000

// CMPIFlags: what a client wants with its instances.
#define CMPI_FLAG_LocalOnly 1
#define CMPI_FLAG_DeepInheritance 2
#define CMPI_FLAG_IncludeQualifiers 4
#define CMPI_FLAG_IncludeClassOrigin 8

// Names of context entries. CMPIInvocationFlags is a CMPI_uint32, the others are CMPI_string. An
// object manager need not set all of them.
#define CMPIPrincipal "CMPIPrincipal"
#define CMPIInvocationFlags "CMPIInvocationFlags"
#define CMPIInitNameSpace "CMPIInitNameSpace"
#define CMPIRole "CMPIRole"
#define CMPIAcceptLanguage "CMPIAcceptLanguage"
#define CMPIContentLanguage "CMPIContentLanguage"

// brokerCapabilities: what an object manager serves. A capability includes those it builds on.
#define CMPI_MB_BasicRead 0x001
#define CMPI_MB_BasicWrite 0x003
#define CMPI_MB_InstanceManipulation 0x007
#define CMPI_MB_AssociationTraversal 0x009
#define CMPI_MB_QueryExecution 0x011
#define CMPI_MB_QueryNormalization 0x031
#define CMPI_MB_BasicQualifierSupport 0x047
#define CMPI_MB_Indications 0x081
#define CMPI_MB_OSEncapsulationSupport 0x100

// The older set of capability bits; it overlaps with the one above.
#define CMPI_MB_Class_0 0x0001
#define CMPI_MB_Class_1 0x0003
#define CMPI_MB_Class_2 0x0007
#define CMPI_MB_Supports_PropertyMI 0x0100
#define CMPI_MB_Supports_IndicationMI 0x0200
#define CMPI_MB_Supports_IndicationPolling 0x0400
#define CMPI_MB_Supports_QueryNormalization 0x0800
#define CMPI_MB_Supports_Qualifier 0x1000
#define CMPI_MB_Supports_Schema 0x3000
#ifdef CMPI_VER_200
#define CMPI_MB_Supports_MemEnhancements 0x4000
#define CMPI_MB_Supports_Extended_Error 0x8000
#endif

// Status codes: 1 to 17 are the CIM status codes, 50 and 51 answer a cleanup.
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
    CMPI_RC_DO_NOT_UNLOAD = 50,
    CMPI_RC_NEVER_UNLOAD = 51,
    CMPI_RC_ERR_INVALID_HANDLE = 60,
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61,
    CMPI_RC_ERROR_SYSTEM = 100,
    CMPI_RC_ERROR = 200
} CMPIrc;

// Operator of a predicate.
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
#ifdef CMPI_VER_200
    CMPI_PredOp_Not_Null = 11,
    CMPI_PredOp_Null = 12,
    CMPI_PredOp_And = 13,
    CMPI_PredOp_Or = 14
#endif
} CMPIPredOp;

// Normal form of a condition: an OR of ANDs, an AND of ORs.
typedef enum _CMPISelectCondType { CMPI_COND_DOC = 0, CMPI_COND_COD = 1 } CMPISelectCondType;

// Severity of a log message.
typedef enum _CMPISeverity {
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4
} CMPISeverity;

// Level of a trace message.
typedef enum _CMPILevel { CMPI_LEV_INFO = 1, CMPI_LEV_WARNING = 2, CMPI_LEV_VERBOSE = 3 } CMPILevel;

#endif
