// Objects of CMPI and the function tables that serve them. Included by cmpift.h.
//
// Every object is a pair {hdl, ft}: hdl belongs to the object manager and is never NULL in a live
// object, ft is its function table. These rules hold for all tables:
// - Objects belong to the object manager, which reclaims them when the request that made them ends.
//   Only a clone is the caller's, who hands it to release.
// - rc may be NULL; where it is not, the callee fills it. A CMPIData that failed is known by rc
// alone.
//   An item that does not exist is CMPI_RC_ERR_NO_SUCH_PROPERTY, from some object managers
//   CMPI_RC_ERR_NOT_FOUND: treat any code but CMPI_RC_OK as missing.
// - outName may be NULL. An object it receives belongs to the object manager.
// - value is read as its type demands (see CMPIValue); NULL is the CIM NULL of that type.
#ifndef KORVA_CMPI_OBJECT_TABLES_H
#define KORVA_CMPI_OBJECT_TABLES_H

#include "cmpidt.h"
#include "cmpios.h"

#ifdef __cplusplus
extern "C" {
#endif

// Named values that accompany a request.
struct _CMPIContext {
    void* hdl;
    CMPIContextFT* ft;
};

struct _CMPIContextFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIContext* self);
    CMPIContext* (*clone)(const CMPIContext* self, CMPIStatus* rc);
    CMPIData (*getEntry)(const CMPIContext* self, const char* name, CMPIStatus* rc);
    CMPIData (*getEntryAt)(const CMPIContext* self, CMPICount index, CMPIString** outName,
                           CMPIStatus* rc);
    CMPICount (*getEntryCount)(const CMPIContext* self, CMPIStatus* rc);
    // Adds the entry or replaces its value.
    CMPIStatus (*addEntry)(const CMPIContext* self, const char* name, const CMPIValue* value,
                           CMPIType type);
};

// Where a provider puts its answer: any number of items, then returnDone.
struct _CMPIResult {
    void* hdl;
    CMPIResultFT* ft;
};

struct _CMPIResultFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIResult* self);
    CMPIResult* (*clone)(const CMPIResult* self, CMPIStatus* rc);
    // The value of a method or property.
    CMPIStatus (*returnData)(const CMPIResult* self, const CMPIValue* value, CMPIType type);
    CMPIStatus (*returnInstance)(const CMPIResult* self, const CMPIInstance* inst);
    CMPIStatus (*returnObjectPath)(const CMPIResult* self, const CMPIObjectPath* op);
    // Nothing follows. Called once, last.
    CMPIStatus (*returnDone)(const CMPIResult* self);
#ifdef CMPI_VER_200
    CMPIStatus (*returnError)(const CMPIResult* self, const CMPIError* er);
#endif
};

#ifdef CMPI_VER_200
// What went wrong, in the terms of the class CIM_Error. Getters of text may return NULL.
struct _CMPIError {
    void* hdl;
    CMPIErrorFT* ft;
};

struct _CMPIErrorFT {
    CMPISint32 ftVersion;
    CMPIStatus (*release)(CMPIError* self);
    CMPIError* (*clone)(const CMPIError* self, CMPIStatus* rc);
    CMPIErrorType (*getErrorType)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getOtherErrorType)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getOwningEntity)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getMessageID)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIError* self, CMPIStatus* rc);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError* self, CMPIStatus* rc);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getProbableCauseDescription)(const CMPIError* self, CMPIStatus* rc);
    // Array of strings.
    CMPIArray* (*getRecommendedActions)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getErrorSource)(const CMPIError* self, CMPIStatus* rc);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError* self, CMPIStatus* rc);
    CMPIrc (*getCIMStatusCode)(const CMPIError* self, CMPIStatus* rc);
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError* self, CMPIStatus* rc);
    // Array of strings.
    CMPIArray* (*getMessageArguments)(const CMPIError* self, CMPIStatus* rc);
    CMPIStatus (*setErrorType)(CMPIError* self, CMPIErrorType v);
    CMPIStatus (*setOtherErrorType)(CMPIError* self, const char* str);
    CMPIStatus (*setProbableCauseDescription)(CMPIError* self, const char* str);
    CMPIStatus (*setRecommendedActions)(CMPIError* self, const CMPIArray* a);
    CMPIStatus (*setErrorSource)(CMPIError* self, const char* str);
    CMPIStatus (*setErrorSourceFormat)(CMPIError* self, CMPIErrorSrcFormat v);
    CMPIStatus (*setOtherErrorSourceFormat)(CMPIError* self, const char* str);
    CMPIStatus (*setCIMStatusCodeDescription)(CMPIError* self, const char* str);
    CMPIStatus (*setMessageArguments)(CMPIError* self, CMPIArray* a);
};
#endif

// An instance: a class name and properties.
struct _CMPIInstance {
    void* hdl;
    CMPIInstanceFT* ft;
};

struct _CMPIInstanceFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIInstance* self);
    CMPIInstance* (*clone)(const CMPIInstance* self, CMPIStatus* rc);
    CMPIData (*getProperty)(const CMPIInstance* self, const char* name, CMPIStatus* rc);
    CMPIData (*getPropertyAt)(const CMPIInstance* self, CMPICount index, CMPIString** outName,
                              CMPIStatus* rc);
    CMPICount (*getPropertyCount)(const CMPIInstance* self, CMPIStatus* rc);
    // Adds the property or replaces its value.
    CMPIStatus (*setProperty)(const CMPIInstance* self, const char* name, const CMPIValue* value,
                              CMPIType type);
    // Path with the key bindings of the instance; a new object.
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance* self, CMPIStatus* rc);
    // Keeps names outside properties (NULL-terminated) out of the instance. keys is unused.
    CMPIStatus (*setPropertyFilter)(CMPIInstance* self, const char** properties, const char** keys);
    CMPIStatus (*setObjectPath)(CMPIInstance* self, const CMPIObjectPath* op);
#ifdef CMPI_VER_200
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance* self, const char* name,
                                        const CMPIValue* value, CMPIType type, const char* origin);
#endif
};

// An object path: host, namespace, class and key bindings. A class path has no key bindings.
struct _CMPIObjectPath {
    void* hdl;
    CMPIObjectPathFT* ft;
};

struct _CMPIObjectPathFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* self);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* self, CMPIStatus* rc);
    CMPIStatus (*setNameSpace)(CMPIObjectPath* self, const char* ns);
    CMPIString* (*getNameSpace)(const CMPIObjectPath* self, CMPIStatus* rc);
    CMPIStatus (*setHostname)(CMPIObjectPath* self, const char* hn);
    CMPIString* (*getHostname)(const CMPIObjectPath* self, CMPIStatus* rc);
    CMPIStatus (*setClassName)(CMPIObjectPath* self, const char* cn);
    CMPIString* (*getClassName)(const CMPIObjectPath* self, CMPIStatus* rc);
    // value must not be NULL: a key has a value.
    CMPIStatus (*addKey)(CMPIObjectPath* self, const char* name, const CMPIValue* value,
                         CMPIType type);
    // The state of the result has CMPI_keyValue set.
    CMPIData (*getKey)(const CMPIObjectPath* self, const char* name, CMPIStatus* rc);
    CMPIData (*getKeyAt)(const CMPIObjectPath* self, CMPICount index, CMPIString** outName,
                         CMPIStatus* rc);
    CMPICount (*getKeyCount)(const CMPIObjectPath* self, CMPIStatus* rc);
    // Copies namespace and class of src.
    CMPIStatus (*setNameSpaceFromObjectPath)(CMPIObjectPath* self, const CMPIObjectPath* src);
    // Copies host, namespace and class of src.
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(CMPIObjectPath* self,
                                                    const CMPIObjectPath* src);
    // Qualifiers are an optional service: the four slots may be NULL.
    CMPIData (*getClassQualifier)(const CMPIObjectPath* self, const char* qName, CMPIStatus* rc);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath* self, const char* pName,
                                     const char* qName, CMPIStatus* rc);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath* self, const char* mName, const char* qName,
                                   CMPIStatus* rc);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath* self, const char* mName,
                                      const char* pName, const char* qName, CMPIStatus* rc);
    CMPIString* (*toString)(const CMPIObjectPath* self, CMPIStatus* rc);
};

// A query, compiled by the object manager.
struct _CMPISelectExp {
    void* hdl;
    CMPISelectExpFT* ft;
};

struct _CMPISelectExpFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectExp* self);
    CMPISelectExp* (*clone)(const CMPISelectExp* self, CMPIStatus* rc);
    CMPIBoolean (*evaluate)(const CMPISelectExp* self, const CMPIInstance* inst, CMPIStatus* rc);
    CMPIString* (*getString)(const CMPISelectExp* self, CMPIStatus* rc);
    // The condition as an OR of ANDs.
    CMPISelectCond* (*getDOC)(const CMPISelectExp* self, CMPIStatus* rc);
    // The condition as an AND of ORs.
    CMPISelectCond* (*getCOD)(const CMPISelectExp* self, CMPIStatus* rc);
    // fn supplies the property values; parm is handed through to it.
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp* self, CMPIAccessor* fn, void* parm,
                                         CMPIStatus* rc);
};

// The WHERE clause of a query in a normal form.
struct _CMPISelectCond {
    void* hdl;
    CMPISelectCondFT* ft;
};

struct _CMPISelectCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISelectCond* self);
    CMPISelectCond* (*clone)(const CMPISelectCond* self, CMPIStatus* rc);
    // kind (may be NULL) receives a CMPISelectCondType.
    CMPICount (*getCountAndType)(const CMPISelectCond* self, int* kind, CMPIStatus* rc);
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond* self, CMPICount index, CMPIStatus* rc);
};

// One term of a normal form.
struct _CMPISubCond {
    void* hdl;
    CMPISubCondFT* ft;
};

struct _CMPISubCondFT {
    int ftVersion;
    CMPIStatus (*release)(CMPISubCond* self);
    CMPISubCond* (*clone)(const CMPISubCond* self, CMPIStatus* rc);
    CMPICount (*getCount)(const CMPISubCond* self, CMPIStatus* rc);
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond* self, CMPICount index, CMPIStatus* rc);
    CMPIPredicate* (*getPredicate)(const CMPISubCond* self, const char* name, CMPIStatus* rc);
};

// One comparison of a term.
struct _CMPIPredicate {
    void* hdl;
    CMPIPredicateFT* ft;
};

struct _CMPIPredicateFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIPredicate* self);
    CMPIPredicate* (*clone)(const CMPIPredicate* self, CMPIStatus* rc);
    // Any of the four outputs may be NULL.
    CMPIStatus (*getData)(const CMPIPredicate* self, CMPIType* t, CMPIPredOp* o, CMPIString** lhs,
                          CMPIString** rhs);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate* self, CMPIAccessor* fn, void* parm,
                                         CMPIStatus* rc);
};

// Arguments of a method call.
struct _CMPIArgs {
    void* hdl;
    CMPIArgsFT* ft;
};

struct _CMPIArgsFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArgs* self);
    CMPIArgs* (*clone)(const CMPIArgs* self, CMPIStatus* rc);
    CMPIStatus (*addArg)(const CMPIArgs* self, const char* name, const CMPIValue* value,
                         CMPIType type);
    CMPIData (*getArg)(const CMPIArgs* self, const char* name, CMPIStatus* rc);
    CMPIData (*getArgAt)(const CMPIArgs* self, CMPICount index, CMPIString** outName,
                         CMPIStatus* rc);
    CMPICount (*getArgCount)(const CMPIArgs* self, CMPIStatus* rc);
};

// Text. hdl points at the NUL-terminated characters, which live as long as the object.
struct _CMPIString {
    void* hdl;
    CMPIStringFT* ft;
};

struct _CMPIStringFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIString* self);
    CMPIString* (*clone)(const CMPIString* self, CMPIStatus* rc);
    const char* (*getCharPtr)(const CMPIString* self, CMPIStatus* rc);
};

// An array of a fixed number of elements of one type.
struct _CMPIArray {
    void* hdl;
    CMPIArrayFT* ft;
};

struct _CMPIArrayFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIArray* self);
    CMPIArray* (*clone)(const CMPIArray* self, CMPIStatus* rc);
    CMPICount (*getSize)(const CMPIArray* self, CMPIStatus* rc);
    // Type of an element, without CMPI_ARRAY.
    CMPIType (*getSimpleType)(const CMPIArray* self, CMPIStatus* rc);
    // An index past the end is CMPI_RC_ERR_NO_SUCH_PROPERTY.
    CMPIData (*getElementAt)(const CMPIArray* self, CMPICount index, CMPIStatus* rc);
    // type must be that of the array, else CMPI_RC_ERR_TYPE_MISMATCH.
    CMPIStatus (*setElementAt)(CMPIArray* self, CMPICount index, const CMPIValue* value,
                               CMPIType type);
};

// A walk over the objects that an up-call found.
struct _CMPIEnumeration {
    void* hdl;
    CMPIEnumerationFT* ft;
};

struct _CMPIEnumerationFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* self);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* self, CMPIStatus* rc);
    // Moves on, although self is const. The item is a CMPI_instance or a CMPI_ref.
    CMPIData (*getNext)(const CMPIEnumeration* self, CMPIStatus* rc);
    CMPIBoolean (*hasNext)(const CMPIEnumeration* self, CMPIStatus* rc);
    CMPIArray* (*toArray)(const CMPIEnumeration* self, CMPIStatus* rc);
};

// A point in time or an interval.
struct _CMPIDateTime {
    void* hdl;
    CMPIDateTimeFT* ft;
};

struct _CMPIDateTimeFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIDateTime* self);
    CMPIDateTime* (*clone)(const CMPIDateTime* self, CMPIStatus* rc);
    // Microseconds: since 1970 UTC, or of the interval.
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime* self, CMPIStatus* rc);
    // The 25 characters of a CIM datetime.
    CMPIString* (*getStringFormat)(const CMPIDateTime* self, CMPIStatus* rc);
    CMPIBoolean (*isInterval)(const CMPIDateTime* self, CMPIStatus* rc);
};

#ifdef __cplusplus
}
#endif

#endif
