// Macros over the table members that CMPI level 200 added. Included by cmpimacs.h, whose rules
// hold.
#ifndef KORVA_CMPI_MACROS_200_H
#define KORVA_CMPI_MACROS_200_H

#define CMSetPropertyWithOrigin(i, name, v, type, origin) \
    ((i)->ft->setPropertyWithOrigin((i), (name), CMPI_VALUE_ARGUMENT(v), (type), (origin)))
#define CMReturnError(r, er) ((r)->ft->returnError((r), (er)))

#define CMNewCMPIError(b, owner, msgId, text, severity, cause, code, rc) \
    ((b)->eft->newCMPIError((b), (owner), (msgId), (text), (severity), (cause), (code), (rc)))

// Message files. CMGetMessage2 takes the same list as CMGetMessage.
#define CMOpenMessageFile(b, file, handle) ((b)->eft->openMessageFile((b), (file), (handle)))
#define CMCloseMessageFile(b, handle) ((b)->eft->closeMessageFile((b), (handle)))
#define CMGetMessage2(b, id, handle, text, rc, ...) \
    ((b)->eft->getMessage2((b), (id), (handle), (text), (rc), __VA_ARGS__))

// Errors. CMGetErrorMessage calls getMessage.
#define CMGetErrorType(e, rc) ((e)->ft->getErrorType((e), (rc)))
#define CMGetOtherErrorType(e, rc) ((e)->ft->getOtherErrorType((e), (rc)))
#define CMGetOwningEntity(e, rc) ((e)->ft->getOwningEntity((e), (rc)))
#define CMGetMessageID(e, rc) ((e)->ft->getMessageID((e), (rc)))
#define CMGetErrorMessage(e, rc) ((e)->ft->getMessage((e), (rc)))
#define CMGetPerceivedSeverity(e, rc) ((e)->ft->getPerceivedSeverity((e), (rc)))
#define CMGetProbableCause(e, rc) ((e)->ft->getProbableCause((e), (rc)))
#define CMGetProbableCauseDescription(e, rc) ((e)->ft->getProbableCauseDescription((e), (rc)))
#define CMGetRecommendedActions(e, rc) ((e)->ft->getRecommendedActions((e), (rc)))
#define CMGetErrorSource(e, rc) ((e)->ft->getErrorSource((e), (rc)))
#define CMGetErrorSourceFormat(e, rc) ((e)->ft->getErrorSourceFormat((e), (rc)))
#define CMGetOtherErrorSourceFormat(e, rc) ((e)->ft->getOtherErrorSourceFormat((e), (rc)))
#define CMGetCIMStatusCode(e, rc) ((e)->ft->getCIMStatusCode((e), (rc)))
#define CMGetCIMStatusCodeDescription(e, rc) ((e)->ft->getCIMStatusCodeDescription((e), (rc)))
#define CMGetMessageArguments(e, rc) ((e)->ft->getMessageArguments((e), (rc)))
#define CMSetErrorType(e, v) ((e)->ft->setErrorType((e), (v)))
#define CMSetOtherErrorType(e, text) ((e)->ft->setOtherErrorType((e), (text)))
#define CMSetProbableCauseDescription(e, text) ((e)->ft->setProbableCauseDescription((e), (text)))
#define CMSetRecommendedActions(e, a) ((e)->ft->setRecommendedActions((e), (a)))
#define CMSetErrorSource(e, text) ((e)->ft->setErrorSource((e), (text)))
#define CMSetErrorSourceFormat(e, v) ((e)->ft->setErrorSourceFormat((e), (v)))
#define CMSetOtherErrorSourceFormat(e, text) ((e)->ft->setOtherErrorSourceFormat((e), (text)))
#define CMSetCIMStatusCodeDescription(e, text) ((e)->ft->setCIMStatusCodeDescription((e), (text)))
#define CMSetMessageArguments(e, a) ((e)->ft->setMessageArguments((e), (a)))

#endif
