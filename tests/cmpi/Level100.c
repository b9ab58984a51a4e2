/* The same headers at level 100: what level 200 added is gone, and nothing else has moved. */
#define CMPI_VERSION 100
#define CMPI_NO_SYNONYM_SUPPORT

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>
#include <stddef.h>

#ifdef CMPI_VER_200
#error "Level 100 must not define CMPI_VER_200"
#endif
#ifndef CMPI_VER_100
#error "Level 100 must define CMPI_VER_100"
#endif
#if defined(CMPI_MB_Supports_MemEnhancements) || defined(CMPI_MB_Supports_Extended_Error)
#error "Level 100 must not define the capabilities of level 200"
#endif
#if defined(CMSetPropertyWithOrigin) || defined(CMReturnError) || defined(CMGetErrorType)
#error "Level 100 must not define the macros of level 200"
#endif
#if defined(CMPI_Byte) || defined(CMPI_DoubleA)
#error "CMPI_NO_SYNONYM_SUPPORT must hide the older names of types"
#endif

/* At this level the names of level 200 are free. */
typedef int CMPIError;
typedef int CMPIBrokerMemFT;
enum { Timeout = 7, CMPI_PredOp_Or = 7 };

/* The compiler refuses an array of negative size. */
#define FACT(name, actual, in32, in64) \
    typedef char name[(actual) == (sizeof(void*) == 4 ? (in32) : (in64)) ? 1 : -1]
#define SIZE(type, in32, in64) FACT(SizeOf##type, sizeof(type), in32, in64)
#define OFFSET(type, member, in32, in64) \
    FACT(OffsetOf##type##member, offsetof(type, member), in32, in64)

/* clang-format off */
SIZE(CMPIStatus, 8, 16); SIZE(CMPIData, 12, 24); SIZE(CMPIBroker, 16, 32);
SIZE(CMPIBrokerFT, 84, 160); SIZE(CMPIBrokerEncFT, 68, 136); SIZE(CMPIBrokerExtFT, 84, 168);
SIZE(CMPIContextFT, 28, 56); SIZE(CMPIResultFT, 28, 56); SIZE(CMPIInstanceFT, 40, 80);
SIZE(CMPIObjectPathFT, 80, 160); SIZE(CMPISelectExpFT, 32, 64); SIZE(CMPISelectCondFT, 20, 40);
SIZE(CMPISubCondFT, 24, 48); SIZE(CMPIPredicateFT, 20, 40); SIZE(CMPIArgsFT, 28, 56);
SIZE(CMPIStringFT, 16, 32); SIZE(CMPIArrayFT, 28, 56); SIZE(CMPIEnumerationFT, 24, 48);
SIZE(CMPIDateTimeFT, 24, 48); SIZE(CMPIInstanceMIFT, 44, 80); SIZE(CMPIAssociationMIFT, 32, 56);
SIZE(CMPIMethodMIFT, 20, 32); SIZE(CMPIPropertyMIFT, 24, 40); SIZE(CMPIIndicationMIFT, 40, 72);
OFFSET(CMPIBroker, xft, 12, 24); OFFSET(CMPIBrokerEncFT, trace, 64, 128);
OFFSET(CMPIResultFT, returnDone, 24, 48); OFFSET(CMPIInstanceFT, setObjectPath, 36, 72);
OFFSET(CMPIPropertyMIFT, getProperty, 20, 32);
/* clang-format on */

int level100Version(void);
int level100StubVersion(void);

int level100Version(void) {
    return CMPICurrentVersion;
}

static const CMPIBroker* broker;

static CMPIStatus oldPropertyCleanup(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                     CMPIBoolean terminating) {
    CMReturn(CMPI_RC_NEVER_UNLOAD)
}

static CMPIStatus oldSetProperty(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const char* name, CMPIData data) {
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus oldGetProperty(CMPIPropertyMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const char* name) {
    CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

CMPropertyMIStub(old, OldProvider, broker, CMNoHook)

int level100StubVersion(void) {
    const CMPIPropertyMI* mi = OldProvider_Create_PropertyMI(NULL, NULL, NULL);
    return broker == NULL ? mi->ft->miVersion : -1;
}
