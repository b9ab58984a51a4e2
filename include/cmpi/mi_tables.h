// Function tables of a provider, one for each kind of MI. Included by cmpift.h.
//
// A provider fills ftVersion and miVersion with CMPICurrentVersion and keeps MI and table alive
// until cleanup returned. Slots that it does not serve return CMPI_RC_ERR_NOT_SUPPORTED. ctx, rslt
// and all arguments live until the call returns. Results go to rslt, followed by one returnDone;
// the returned status tells whether the request succeeded. Calls may come from several threads at
// once.
//
// cleanup comes before the library is unloaded; unless terminating is true, CMPI_RC_DO_NOT_UNLOAD
// and CMPI_RC_NEVER_UNLOAD refuse it.
#ifndef KORVA_CMPI_MI_TABLES_H
#define KORVA_CMPI_MI_TABLES_H

#include "cmpidt.h"
#include "cmpios.h"

#ifdef __cplusplus
extern "C" {
#endif

// Instances: read, enumerate, write, query.
struct _CMPIInstanceMI {
    const void* hdl;
    CMPIInstanceMIFT* ft;
};

struct _CMPIInstanceMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* rslt, const CMPIObjectPath* op);
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* op,
                                     const char** properties);
    CMPIStatus (*getInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char** properties);
    // Hands the path of the new instance to rslt.
    CMPIStatus (*createInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const CMPIInstance* inst);
    CMPIStatus (*modifyInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const CMPIInstance* inst,
                                 const char** properties);
    CMPIStatus (*deleteInstance)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op);
    CMPIStatus (*execQuery)(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                            const CMPIObjectPath* op, const char* query, const char* lang);
};

// Associations that start at the object op. A NULL class or role does not filter.
struct _CMPIAssociationMI {
    void* hdl;
    CMPIAssociationMIFT* ft;
};

struct _CMPIAssociationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*associators)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* assocClass,
                              const char* resultClass, const char* role, const char* resultRole,
                              const char** properties);
    CMPIStatus (*associatorNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                  const CMPIResult* rslt, const CMPIObjectPath* op,
                                  const char* assocClass, const char* resultClass, const char* role,
                                  const char* resultRole);
    // resultClass filters the association class here.
    CMPIStatus (*references)(CMPIAssociationMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                             const CMPIObjectPath* op, const char* resultClass, const char* role,
                             const char** properties);
    CMPIStatus (*referenceNames)(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                 const CMPIResult* rslt, const CMPIObjectPath* op,
                                 const char* resultClass, const char* role);
};

// Extrinsic methods.
struct _CMPIMethodMI {
    void* hdl;
    CMPIMethodMIFT* ft;
};

struct _CMPIMethodMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    // The return value goes out through returnData; out receives the output parameters.
    CMPIStatus (*invokeMethod)(CMPIMethodMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                               const CMPIObjectPath* op, const char* method, const CMPIArgs* in,
                               CMPIArgs* out);
};

// Single properties.
struct _CMPIPropertyMI {
    void* hdl;
    CMPIPropertyMIFT* ft;
};

struct _CMPIPropertyMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIPropertyMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*setProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* name, CMPIData data);
    CMPIStatus (*getProperty)(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                              const CMPIObjectPath* op, const char* name);
#ifdef CMPI_VER_200
    // op is not const in this slot.
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* rslt, CMPIObjectPath* op,
                                        const char* name, CMPIData data, const char* origin);
#endif
};

// Indications: which filters the provider accepts, and when it delivers.
struct _CMPIIndicationMI {
    void* hdl;
    CMPIIndicationMIFT* ft;
};

struct _CMPIIndicationMIFT {
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    // owner is never NULL.
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                  const CMPISelectExp* filter, const char* className,
                                  const CMPIObjectPath* op, const char* owner);
    CMPIStatus (*mustPoll)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                           const CMPISelectExp* filter, const char* className,
                           const CMPIObjectPath* op);
    // first: no other filter was active for this class.
    CMPIStatus (*activateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                 const CMPISelectExp* filter, const char* className,
                                 const CMPIObjectPath* op, CMPIBoolean first);
    // last: no filter remains for this class.
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                   const CMPISelectExp* filter, const char* className,
                                   const CMPIObjectPath* op, CMPIBoolean last);
    CMPIStatus (*enableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
    CMPIStatus (*disableIndications)(CMPIIndicationMI* mi, const CMPIContext* ctx);
};

#ifdef __cplusplus
}
#endif

#endif
