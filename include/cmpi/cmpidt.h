// Types and constants of CMPI 2.0. The layout is that of the Linux binary interface for i386 and
// x86-64, so that a provider works under any object manager of the platform.
//
// CMPI_VERSION, defined before the first inclusion, selects the level: 100, or 200 (the default).
// Members and types that level 200 added exist where CMPI_VER_200 is defined.
#ifndef KORVA_CMPI_CMPIDT_H
#define KORVA_CMPI_CMPIDT_H

#include "cmpios.h"

#define CMPIVersion100 100
#define CMPIVersion200 200

#ifndef CMPI_VERSION
#define CMPI_VERSION CMPIVersion200
#endif

#if CMPI_VERSION == CMPIVersion200
#define CMPI_VER_200 1
#define CMPI_VER_100 1
#define CMPICurrentVersion CMPIVersion200
#elif CMPI_VERSION == CMPIVersion100
#define CMPI_VER_100 1
#define CMPICurrentVersion CMPIVersion100
#else
#error "CMPI_VERSION must be 100 or 200"
#endif

#include "constants.h"
#ifdef CMPI_VER_200
#include "error_codes.h"
#endif

#ifdef __cplusplus
extern "C" {
#endif

// Scalars. Any non-zero CMPIBoolean is true; write 0 or 1.
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
typedef unsigned int CMPIFlags;   // CMPI_FLAG_* bits
typedef unsigned short CMPIType;  // CMPI_boolean ... CMPI_charsptr, with or without CMPI_ARRAY
typedef unsigned short CMPIValueState;  // CMPI_goodValue, CMPI_nullValue ... bits

// Opaque: a message file, a mark of the memory services.
typedef void* CMPIMsgFileHandle;
typedef void CMPIGcStat;

// Objects. Their members are in object_tables.h.
typedef struct _CMPIContext CMPIContext;
typedef struct _CMPIResult CMPIResult;
typedef struct _CMPIInstance CMPIInstance;
typedef struct _CMPIObjectPath CMPIObjectPath;
typedef struct _CMPISelectExp CMPISelectExp;
typedef struct _CMPISelectCond CMPISelectCond;
typedef struct _CMPISubCond CMPISubCond;
typedef struct _CMPIPredicate CMPIPredicate;
typedef struct _CMPIArgs CMPIArgs;
typedef struct _CMPIString CMPIString;
typedef struct _CMPIArray CMPIArray;
typedef struct _CMPIEnumeration CMPIEnumeration;
typedef struct _CMPIDateTime CMPIDateTime;

typedef struct _CMPIContextFT CMPIContextFT;
typedef struct _CMPIResultFT CMPIResultFT;
typedef struct _CMPIInstanceFT CMPIInstanceFT;
typedef struct _CMPIObjectPathFT CMPIObjectPathFT;
typedef struct _CMPISelectExpFT CMPISelectExpFT;
typedef struct _CMPISelectCondFT CMPISelectCondFT;
typedef struct _CMPISubCondFT CMPISubCondFT;
typedef struct _CMPIPredicateFT CMPIPredicateFT;
typedef struct _CMPIArgsFT CMPIArgsFT;
typedef struct _CMPIStringFT CMPIStringFT;
typedef struct _CMPIArrayFT CMPIArrayFT;
typedef struct _CMPIEnumerationFT CMPIEnumerationFT;
typedef struct _CMPIDateTimeFT CMPIDateTimeFT;

// The object manager. Its members are in broker_tables.h.
typedef struct _CMPIBroker CMPIBroker;
typedef struct _CMPIBrokerFT CMPIBrokerFT;
typedef struct _CMPIBrokerEncFT CMPIBrokerEncFT;
typedef struct _CMPIBrokerExtFT CMPIBrokerExtFT;

#ifdef CMPI_VER_200
typedef struct _CMPIError CMPIError;
typedef struct _CMPIErrorFT CMPIErrorFT;
typedef struct _CMPIBrokerMemFT CMPIBrokerMemFT;
#endif

// What a provider implements. The members are in mi_tables.h.
typedef struct _CMPIInstanceMI CMPIInstanceMI;
typedef struct _CMPIAssociationMI CMPIAssociationMI;
typedef struct _CMPIMethodMI CMPIMethodMI;
typedef struct _CMPIPropertyMI CMPIPropertyMI;
typedef struct _CMPIIndicationMI CMPIIndicationMI;
typedef struct _CMPIInstanceMIFT CMPIInstanceMIFT;
typedef struct _CMPIAssociationMIFT CMPIAssociationMIFT;
typedef struct _CMPIMethodMIFT CMPIMethodMIFT;
typedef struct _CMPIPropertyMIFT CMPIPropertyMIFT;
typedef struct _CMPIIndicationMIFT CMPIIndicationMIFT;

// Result of a call. msg may be NULL; it belongs to the object manager.
typedef struct _CMPIStatus {
    CMPIrc rc;
    CMPIString* msg;
} CMPIStatus;

// Bytes without a type.
typedef struct _CMPIValuePtr {
    void* ptr;
    CMPICount length;
} CMPIValuePtr;

// One value; the CMPIType beside it tells which member holds it. The pointers belong to the object
// manager.
//
// Functions that take a pair (const CMPIValue* value, CMPIType type) read as many bytes at value as
// the type has: pass the address of a variable of the member's type. Two types differ. For
// CMPI_chars, value is the char pointer itself, cast, and the text is copied. For CMPI_charsptr it
// is the address of a char pointer. An array type takes the address of a CMPIArray*.
typedef union _CMPIValue {
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

// A value with its type. Where state has CMPI_nullValue set, value holds nothing.
typedef struct _CMPIData {
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
} CMPIData;

// Supplies the property name to an evaluation; parm is what the evaluation was given.
typedef CMPIData CMPIAccessor(const char* name, void* parm);

#ifdef __cplusplus
}
#endif

#endif
