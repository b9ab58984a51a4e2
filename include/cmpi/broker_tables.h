// The broker: services that the object manager offers to a provider. Included by cmpift.h.
//
// Objects made here or returned from here belong to the object manager and are reclaimed when the
// request ends. rc may be NULL; where it is not, it is filled. A property list is a NULL-terminated
// array, and NULL stands for all properties. The tables may be called from any thread that the
// object manager knows: its own, or one that went through attachThread.
#ifndef KORVA_CMPI_BROKER_TABLES_H
#define KORVA_CMPI_BROKER_TABLES_H

#include "cmpidt.h"
#include "cmpios.h"

#ifdef __cplusplus
extern "C" {
#endif

struct timespec;

// The object manager as a provider sees it. mft may be NULL.
struct _CMPIBroker {
    void* hdl;
    CMPIBrokerFT* bft;
    CMPIBrokerEncFT* eft;
    CMPIBrokerExtFT* xft;
#ifdef CMPI_VER_200
    CMPIBrokerMemFT* mft;
#endif
};

// Up-calls: requests that the object manager serves through other providers.
struct _CMPIBrokerFT {
    // CMPI_MB_* bits.
    unsigned int brokerCapabilities;
    unsigned int brokerVersion;
    const char* brokerName;
    // Makes the context for a thread that is about to attach; called in the thread that starts it.
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    // Called in the new thread, before any other up-call of that thread.
    CMPIStatus (*attachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    // Ends the up-calls of the calling thread and frees ctx.
    CMPIStatus (*detachThread)(const CMPIBroker* mb, const CMPIContext* ctx);
    CMPIStatus (*deliverIndication)(const CMPIBroker* mb, const CMPIContext* ctx, const char* ns,
                                    const CMPIInstance* ind);
    // Paths of the class of op and of its subclasses.
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                               const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIInstance* (*getInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const char** properties, CMPIStatus* rc);
    // Path under which the instance was stored.
    CMPIObjectPath* (*createInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                      const CMPIObjectPath* op, const CMPIInstance* inst,
                                      CMPIStatus* rc);
    // A NULL property list means all properties.
    CMPIStatus (*modifyInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const CMPIInstance* inst,
                                 const char** properties);
    CMPIStatus (*deleteInstance)(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op);
    CMPIEnumeration* (*execQuery)(const CMPIBroker* mb, const CMPIContext* ctx,
                                  const CMPIObjectPath* op, const char* query, const char* lang,
                                  CMPIStatus* rc);
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* mb, const CMPIContext* ctx,
                                           const CMPIObjectPath* op, const char** properties,
                                           CMPIStatus* rc);
    // Instances at the far end of the associations of op; a NULL filter does not filter.
    CMPIEnumeration* (*associators)(const CMPIBroker* mb, const CMPIContext* ctx,
                                    const CMPIObjectPath* op, const char* assocClass,
                                    const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties,
                                    CMPIStatus* rc);
    // The same objects as paths.
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, const char* assocClass,
                                        const char* resultClass, const char* role,
                                        const char* resultRole, CMPIStatus* rc);
    // The association instances that point to op.
    CMPIEnumeration* (*references)(const CMPIBroker* mb, const CMPIContext* ctx,
                                   const CMPIObjectPath* op, const char* resultClass,
                                   const char* role, const char** properties, CMPIStatus* rc);
    // The same objects as paths.
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* mb, const CMPIContext* ctx,
                                       const CMPIObjectPath* op, const char* resultClass,
                                       const char* role, CMPIStatus* rc);
    CMPIData (*invokeMethod)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                             const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc);
    CMPIStatus (*setProperty)(const CMPIBroker* mb, const CMPIContext* ctx,
                              const CMPIObjectPath* op, const char* name, const CMPIValue* value,
                              CMPIType type);
    CMPIData (*getProperty)(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                            const char* name, CMPIStatus* rc);
};

// Makes objects, and examines objects of any kind (obj is a pointer to one).
struct _CMPIBrokerEncFT {
    int ftVersion;
    // Takes namespace and class of op, and its keys if it has any.
    CMPIInstance* (*newInstance)(const CMPIBroker* mb, const CMPIObjectPath* op, CMPIStatus* rc);
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* mb, const char* ns, const char* cn,
                                     CMPIStatus* rc);
    CMPIArgs* (*newArgs)(const CMPIBroker* mb, CMPIStatus* rc);
    // Copies data.
    CMPIString* (*newString)(const CMPIBroker* mb, const char* data, CMPIStatus* rc);
    // type is that of an element, without CMPI_ARRAY; all max elements start as CIM NULL.
    CMPIArray* (*newArray)(const CMPIBroker* mb, CMPICount max, CMPIType type, CMPIStatus* rc);
    // The present moment.
    CMPIDateTime* (*newDateTime)(const CMPIBroker* mb, CMPIStatus* rc);
    // binTime: microseconds since 1970 UTC, or of the interval.
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* mb, CMPIUint64 binTime,
                                           CMPIBoolean interval, CMPIStatus* rc);
    // utcTime: the 25 characters of a CIM datetime.
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* mb, const char* utcTime,
                                          CMPIStatus* rc);
    // projection (may be NULL) receives the selected property names.
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* mb, const char* query, const char* lang,
                                   CMPIArray** projection, CMPIStatus* rc);
    // True where the class of op is typeName or derives from it.
    CMPIBoolean (*classPathIsA)(const CMPIBroker* mb, const CMPIObjectPath* op,
                                const char* typeName, CMPIStatus* rc);
    // A rendering for people; its form is up to the object manager.
    CMPIString* (*toString)(const CMPIBroker* mb, const void* obj, CMPIStatus* rc);
    // typeName is a C type name such as "CMPIInstance".
    CMPIBoolean (*isOfType)(const CMPIBroker* mb, const void* obj, const char* typeName,
                            CMPIStatus* rc);
    CMPIString* (*getType)(const CMPIBroker* mb, const void* obj, CMPIStatus* rc);
    // After count follow count pairs (type, value) for $0 to $9 of the text: at most ten.
    CMPIString* (*getMessage)(const CMPIBroker* mb, const char* msgId, const char* defMsg,
                              CMPIStatus* rc, CMPICount count, ...);
    // severity is a CMPISeverity. string is used only where text is NULL.
    CMPIStatus (*logMessage)(const CMPIBroker* mb, int severity, const char* id, const char* text,
                             const CMPIString* string);
    // level is a CMPILevel. string is used only where text is NULL.
    CMPIStatus (*trace)(const CMPIBroker* mb, int level, const char* component, const char* text,
                        const CMPIString* string);
#ifdef CMPI_VER_200
    CMPIError* (*newCMPIError)(const CMPIBroker* mb, const char* owner, const char* msgID,
                               const char* msg, CMPIErrorSeverity sev, CMPIErrorProbableCause pc,
                               CMPIrc code, CMPIStatus* rc);
    // handle receives the file; it may become NULL.
    CMPIStatus (*openMessageFile)(const CMPIBroker* mb, const char* msgFile,
                                  CMPIMsgFileHandle* handle);
    CMPIStatus (*closeMessageFile)(const CMPIBroker* mb, CMPIMsgFileHandle handle);
    // Like getMessage, from an opened message file.
    CMPIString* (*getMessage2)(const CMPIBroker* mb, const char* msgId, CMPIMsgFileHandle handle,
                               const char* defMsg, CMPIStatus* rc, CMPICount count, ...);
#endif
};

// Threads, locks and names of the platform.
struct _CMPIBrokerExtFT {
    int ftVersion;
    // Name of a library as the platform spells it; the caller frees it with free().
    char* (*resolveFileName)(const char* str);
    CMPI_THREAD_TYPE (*newThread)(CMPI_THREAD_RETURN (*start)(void*), void* parm, int detached);
    int (*joinThread)(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* retval);
    // Ends the calling thread; does not return.
    int (*exitThread)(CMPI_THREAD_RETURN code);
    int (*cancelThread)(CMPI_THREAD_TYPE thread);
    // msec: milliseconds.
    int (*threadSleep)(CMPIUint32 msec);
    int (*threadOnce)(int* once, void (*init)(void));
    int (*createThreadKey)(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*));
    int (*destroyThreadKey)(CMPI_THREAD_KEY_TYPE key);
    void* (*getThreadSpecific)(CMPI_THREAD_KEY_TYPE key);
    int (*setThreadSpecific)(CMPI_THREAD_KEY_TYPE key, void* data);
    // opt is reserved: pass 0.
    CMPI_MUTEX_TYPE (*newMutex)(int opt);
    void (*destroyMutex)(CMPI_MUTEX_TYPE mutex);
    void (*lockMutex)(CMPI_MUTEX_TYPE mutex);
    void (*unlockMutex)(CMPI_MUTEX_TYPE mutex);
    // opt is reserved: pass 0.
    CMPI_COND_TYPE (*newCondition)(int opt);
    void (*destroyCondition)(CMPI_COND_TYPE cond);
    int (*condWait)(CMPI_COND_TYPE cond, CMPI_MUTEX_TYPE mutex);
    int (*timedCondWait)(CMPI_COND_TYPE cond, CMPI_MUTEX_TYPE mutex, struct timespec* wait);
    int (*signalCondition)(CMPI_COND_TYPE cond);
};

#ifdef CMPI_VER_200
// Memory that the object manager reclaims, and early release of it.
struct _CMPIBrokerMemFT {
    int ftVersion;
    // Opens a scope, scopes nest. release() drops what was made since.
    CMPIGcStat* (*mark)(const CMPIBroker* mb, CMPIStatus* rc);
    CMPIStatus (*release)(const CMPIBroker* mb, const CMPIGcStat* gc);
    void* (*cmpiMalloc)(const CMPIBroker* mb, size_t size);
    void* (*cmpiCalloc)(const CMPIBroker* mb, size_t n, size_t size);
    void* (*cmpiRealloc)(const CMPIBroker* mb, void* p, size_t size);
    char* (*cmpiStrDup)(const CMPIBroker* mb, const char* str);
    void (*cmpiFree)(const CMPIBroker* mb, void* p);
    // These free one object before its scope ends.
    void (*freeInstance)(const CMPIBroker* mb, CMPIInstance* x);
    void (*freeObjectPath)(const CMPIBroker* mb, CMPIObjectPath* x);
    void (*freeArgs)(const CMPIBroker* mb, CMPIArgs* x);
    void (*freeString)(const CMPIBroker* mb, CMPIString* x);
    void (*freeArray)(const CMPIBroker* mb, CMPIArray* x);
    void (*freeDateTime)(const CMPIBroker* mb, CMPIDateTime* x);
    void (*freeSelectExp)(const CMPIBroker* mb, CMPISelectExp* x);
};
#endif

#ifdef __cplusplus
}
#endif

#endif
