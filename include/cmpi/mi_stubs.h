// Macros that write the function table and the factory of an MI. Included by cmpimacs.h.
//
// CM<kind>MIStub(pfx, pn, broker, hook) defines the exported function pn_Create_<kind>MI. It stores
// its first argument in the variable broker (static const CMPIBroker*), runs the statement hook,
// which may use the parameters ctx and rc (CMNoHook for none), and returns the one MI, which is
// static and has no hdl. The table is made of functions that the file has declared before, named
// pfx plus the slot's suffix. The macro is a whole definition: no semicolon follows it.
#ifndef KORVA_CMPI_MI_STUBS_H
#define KORVA_CMPI_MI_STUBS_H

#include "cmpidt.h"
#include "cmpift.h"

#define CMNoHook

#define CMPI_MI_FACTORY(miType, factory, table, broker, hook)                           \
    CMPI_EXTERN_C miType* factory(const CMPIBroker* cmpiBroker, const CMPIContext* ctx, \
                                  CMPIStatus* rc) {                                     \
        static miType cmpiMi = {NULL, &table};                                          \
        (void)ctx;                                                                      \
        (void)rc;                                                                       \
        broker = cmpiBroker;                                                            \
        hook;                                                                           \
        return &cmpiMi;                                                                 \
    }

#define CMInstanceMIStub(pfx, pn, broker, hook)                                             \
    static CMPIInstanceMIFT pn##_InstanceMITable = {                                        \
        CMPICurrentVersion,     CMPICurrentVersion,  "instance" #pn,   pfx##Cleanup,        \
        pfx##EnumInstanceNames, pfx##EnumInstances,  pfx##GetInstance, pfx##CreateInstance, \
        pfx##ModifyInstance,    pfx##DeleteInstance, pfx##ExecQuery};                       \
    CMPI_MI_FACTORY(CMPIInstanceMI, pn##_Create_InstanceMI, pn##_InstanceMITable, broker, hook)

#define CMAssociationMIStub(pfx, pn, broker, hook)                                                 \
    static CMPIAssociationMIFT pn##_AssociationMITable = {                                         \
        CMPICurrentVersion, CMPICurrentVersion,   "association" #pn, pfx##AssociationCleanup,      \
        pfx##Associators,   pfx##AssociatorNames, pfx##References,   pfx##ReferenceNames};         \
    CMPI_MI_FACTORY(CMPIAssociationMI, pn##_Create_AssociationMI, pn##_AssociationMITable, broker, \
                    hook)

#define CMMethodMIStub(pfx, pn, broker, hook)                                           \
    static CMPIMethodMIFT pn##_MethodMITable = {CMPICurrentVersion, CMPICurrentVersion, \
                                                "method" #pn, pfx##MethodCleanup,       \
                                                pfx##InvokeMethod};                     \
    CMPI_MI_FACTORY(CMPIMethodMI, pn##_Create_MethodMI, pn##_MethodMITable, broker, hook)

// setPropertyWithOrigin stays NULL.
#ifdef CMPI_VER_200
#define CMPI_NO_ORIGIN_SLOT , NULL
#else
#define CMPI_NO_ORIGIN_SLOT
#endif
#define CMPropertyMIStub(pfx, pn, broker, hook)                                          \
    static CMPIPropertyMIFT pn##_PropertyMITable = {                                     \
        CMPICurrentVersion,   CMPICurrentVersion, "property" #pn,                        \
        pfx##PropertyCleanup, pfx##SetProperty,   pfx##GetProperty CMPI_NO_ORIGIN_SLOT}; \
    CMPI_MI_FACTORY(CMPIPropertyMI, pn##_Create_PropertyMI, pn##_PropertyMITable, broker, hook)

#define CMIndicationMIStub(pfx, pn, broker, hook)                                               \
    static CMPIIndicationMIFT pn##_IndicationMITable =                                          \
        {CMPICurrentVersion,     CMPICurrentVersion,    "indication" #pn,                       \
         pfx##IndicationCleanup, pfx##AuthorizeFilter,  pfx##MustPoll,                          \
         pfx##ActivateFilter,    pfx##DeActivateFilter, pfx##EnableIndications,                 \
         pfx##DisableIndications};                                                              \
    CMPI_MI_FACTORY(CMPIIndicationMI, pn##_Create_IndicationMI, pn##_IndicationMITable, broker, \
                    hook)

#endif
