// Macros over the function tables of CMPI: CM... for objects, CB... for up-calls to the broker.
//
// Unless a comment says otherwise a macro calls the table member of the same name; arguments,
// result, ownership and NULL rules are that member's, and the object itself comes first. Macros may
// evaluate an argument more than once. Where a macro takes a value and its type, the value may be
// any pointer: it is cast, and read as CMPIValue describes; for CMPI_chars it is the text itself.
#ifndef KORVA_CMPI_CMPIMACS_H
#define KORVA_CMPI_CMPIMACS_H

#include "cmpidt.h"
#include "cmpift.h"
#include "mi_stubs.h"

// A value argument as the tables take it.
#define CMPI_VALUE_ARGUMENT(v) ((const CMPIValue*)(v))

// Return a CMPIStatus from the calling function. These are blocks with their own braces: do not put
// one between an if without braces and its else.
#define CMReturn(code)                                  \
    {                                                   \
        const CMPIStatus cmpiReturned = {(code), NULL}; \
        return cmpiReturned;                            \
    }
#define CMReturnWithString(code, str)                    \
    {                                                    \
        const CMPIStatus cmpiReturned = {(code), (str)}; \
        return cmpiReturned;                             \
    }
// The text becomes a CMPIString made by broker b.
#define CMReturnWithChars(b, code, text) CMReturnWithString((code), CMNewString((b), (text), NULL))

// Fill the status that st points at; st must not be NULL.
#define CMSetStatus(st, code) ((st)->rc = (code), (st)->msg = NULL)
#define CMSetStatusWithString(st, code, str) ((st)->rc = (code), (st)->msg = (str))
#define CMSetStatusWithChars(b, st, code, text) \
    CMSetStatusWithString((st), (code), CMNewString((b), (text), NULL))

// Tests. They yield zero or any other value, which may be too wide for a CMPIBoolean.
#define CMIsNullObject(o) ((o) == NULL || *(void* const*)(o) == NULL)
#define CMIsNullValue(d) ((d).state & CMPI_nullValue)
#define CMIsKeyValue(d) ((d).state & CMPI_keyValue)
#define CMIsArray(d) ((d).type & CMPI_ARRAY)

// Any object: an independent copy for the caller, and the end of such a copy.
#define CMClone(o, rc) ((o)->ft->clone((o), (rc)))
#define CMRelease(o) ((o)->ft->release((o)))

// New objects.
#define CMNewInstance(b, op, rc) ((b)->eft->newInstance((b), (op), (rc)))
#define CMNewObjectPath(b, ns, cn, rc) ((b)->eft->newObjectPath((b), (ns), (cn), (rc)))
#define CMNewArgs(b, rc) ((b)->eft->newArgs((b), (rc)))
#define CMNewString(b, text, rc) ((b)->eft->newString((b), (text), (rc)))
#define CMNewArray(b, max, type, rc) ((b)->eft->newArray((b), (max), (type), (rc)))
#define CMNewDateTime(b, rc) ((b)->eft->newDateTime((b), (rc)))
#define CMNewDateTimeFromBinary(b, time, interval, rc) \
    ((b)->eft->newDateTimeFromBinary((b), (time), (interval), (rc)))
#define CMNewDateTimeFromChars(b, text, rc) ((b)->eft->newDateTimeFromChars((b), (text), (rc)))
#define CMNewSelectExp(b, query, lang, projection, rc) \
    ((b)->eft->newSelectExp((b), (query), (lang), (projection), (rc)))

// Objects of any kind.
#define CMClassPathIsA(b, op, cn, rc) ((b)->eft->classPathIsA((b), (op), (cn), (rc)))
#define CDToString(b, o, rc) ((b)->eft->toString((b), (o), (rc)))
#define CDIsOfType(b, o, typeName, rc) ((b)->eft->isOfType((b), (o), (typeName), (rc)))
#define CDGetType(b, o, rc) ((b)->eft->getType((b), (o), (rc)))

// Messages. The arguments after rc are the list (count, type, value, type, value ...). CMFmtArgs0
// to CMFmtArgs10 make it of CMFmt... pairs, for example CMFmtArgs2(CMFmtChars(name), CMFmtUint(n)).
#define CMGetMessage(b, id, text, rc, ...) \
    ((b)->eft->getMessage((b), (id), (text), (rc), __VA_ARGS__))
#define CMLogMessage(b, severity, id, text, str) \
    ((b)->eft->logMessage((b), (severity), (id), (text), (str)))
#define CMTraceMessage(b, level, component, text, str) \
    ((b)->eft->trace((b), (level), (component), (text), (str)))

#define CMFmtBoolean(v) CMPI_boolean, ((v) ? 1 : 0)
#define CMFmtSint(v) CMPI_sint32, ((CMPISint32)(v))
#define CMFmtUint(v) CMPI_uint32, ((CMPIUint32)(v))
#define CMFmtSint64(v) CMPI_sint64, ((CMPISint64)(v))
#define CMFmtUint64(v) CMPI_uint64, ((CMPIUint64)(v))
#define CMFmtReal(v) CMPI_real64, ((CMPIReal64)(v))
#define CMFmtChars(v) CMPI_chars, ((const char*)(v))
#define CMFmtString(v) CMPI_string, ((const CMPIString*)(v))

#define CMFmtArgs0() 0
#define CMFmtArgs1(a) 1, a
#define CMFmtArgs2(a, b) 2, a, b
#define CMFmtArgs3(a, b, c) 3, a, b, c
#define CMFmtArgs4(a, b, c, d) 4, a, b, c, d
#define CMFmtArgs5(a, b, c, d, e) 5, a, b, c, d, e
#define CMFmtArgs6(a, b, c, d, e, f) 6, a, b, c, d, e, f
#define CMFmtArgs7(a, b, c, d, e, f, g) 7, a, b, c, d, e, f, g
#define CMFmtArgs8(a, b, c, d, e, f, g, h) 8, a, b, c, d, e, f, g, h
#define CMFmtArgs9(a, b, c, d, e, f, g, h, i) 9, a, b, c, d, e, f, g, h, i
#define CMFmtArgs10(a, b, c, d, e, f, g, h, i, j) 10, a, b, c, d, e, f, g, h, i, j

// Object paths.
#define CMSetNameSpace(p, ns) ((p)->ft->setNameSpace((p), (ns)))
#define CMGetNameSpace(p, rc) ((p)->ft->getNameSpace((p), (rc)))
#define CMSetHostname(p, hn) ((p)->ft->setHostname((p), (hn)))
#define CMGetHostname(p, rc) ((p)->ft->getHostname((p), (rc)))
#define CMSetClassName(p, cn) ((p)->ft->setClassName((p), (cn)))
#define CMGetClassName(p, rc) ((p)->ft->getClassName((p), (rc)))
#define CMAddKey(p, name, v, type) ((p)->ft->addKey((p), (name), CMPI_VALUE_ARGUMENT(v), (type)))
#define CMGetKey(p, name, rc) ((p)->ft->getKey((p), (name), (rc)))
#define CMGetKeyAt(p, index, outName, rc) ((p)->ft->getKeyAt((p), (index), (outName), (rc)))
#define CMGetKeyCount(p, rc) ((p)->ft->getKeyCount((p), (rc)))
#define CMSetNameSpaceFromObjectPath(p, src) ((p)->ft->setNameSpaceFromObjectPath((p), (src)))
#define CMSetHostAndNameSpaceFromObjectPath(p, src) \
    ((p)->ft->setHostAndNameSpaceFromObjectPath((p), (src)))
#define CMGetClassQualifier(p, qName, rc) ((p)->ft->getClassQualifier((p), (qName), (rc)))
#define CMGetPropertyQualifier(p, pName, qName, rc) \
    ((p)->ft->getPropertyQualifier((p), (pName), (qName), (rc)))
#define CMGetMethodQualifier(p, mName, qName, rc) \
    ((p)->ft->getMethodQualifier((p), (mName), (qName), (rc)))
#define CMGetParameterQualifier(p, mName, pName, qName, rc) \
    ((p)->ft->getParameterQualifier((p), (mName), (pName), (qName), (rc)))
#define CMObjectPathToString(p, rc) ((p)->ft->toString((p), (rc)))

// Instances.
#define CMSetProperty(i, name, v, type) \
    ((i)->ft->setProperty((i), (name), CMPI_VALUE_ARGUMENT(v), (type)))
#define CMGetProperty(i, name, rc) ((i)->ft->getProperty((i), (name), (rc)))
#define CMGetPropertyAt(i, index, outName, rc) \
    ((i)->ft->getPropertyAt((i), (index), (outName), (rc)))
#define CMGetPropertyCount(i, rc) ((i)->ft->getPropertyCount((i), (rc)))
#define CMGetObjectPath(i, rc) ((i)->ft->getObjectPath((i), (rc)))
#define CMSetObjectPath(i, op) ((i)->ft->setObjectPath((i), (op)))
#define CMSetPropertyFilter(i, properties, keys) \
    ((i)->ft->setPropertyFilter((i), (properties), (keys)))

// Text. CMGetCharPtr reads the object without a call; the characters must not be written to.
#define CMGetCharsPtr(s, rc) ((s)->ft->getCharPtr((s), (rc)))
#define CMGetCharPtr(s) ((char*)(s)->hdl)

// Arrays: getSize, getSimpleType, getElementAt, setElementAt.
#define CMGetArrayCount(a, rc) ((a)->ft->getSize((a), (rc)))
#define CMGetArrayType(a, rc) ((a)->ft->getSimpleType((a), (rc)))
#define CMGetArrayElementAt(a, index, rc) ((a)->ft->getElementAt((a), (index), (rc)))
#define CMSetArrayElementAt(a, index, v, type) \
    ((a)->ft->setElementAt((a), (index), CMPI_VALUE_ARGUMENT(v), (type)))

// Arguments of methods.
#define CMAddArg(a, name, v, type) ((a)->ft->addArg((a), (name), CMPI_VALUE_ARGUMENT(v), (type)))
#define CMGetArg(a, name, rc) ((a)->ft->getArg((a), (name), (rc)))
#define CMGetArgAt(a, index, outName, rc) ((a)->ft->getArgAt((a), (index), (outName), (rc)))
#define CMGetArgCount(a, rc) ((a)->ft->getArgCount((a), (rc)))

// Context entries: getEntry, getEntryAt, getEntryCount, addEntry.
#define CMGetContextEntry(c, name, rc) ((c)->ft->getEntry((c), (name), (rc)))
#define CMGetContextEntryAt(c, index, outName, rc) \
    ((c)->ft->getEntryAt((c), (index), (outName), (rc)))
#define CMGetContextEntryCount(c, rc) ((c)->ft->getEntryCount((c), (rc)))
#define CMAddContextEntry(c, name, v, type) \
    ((c)->ft->addEntry((c), (name), CMPI_VALUE_ARGUMENT(v), (type)))

// Enumerations.
#define CMHasNext(e, rc) ((e)->ft->hasNext((e), (rc)))
#define CMGetNext(e, rc) ((e)->ft->getNext((e), (rc)))
#define CMToArray(e, rc) ((e)->ft->toArray((e), (rc)))

// Datetimes.
#define CMGetStringFormat(d, rc) ((d)->ft->getStringFormat((d), (rc)))
#define CMGetBinaryFormat(d, rc) ((d)->ft->getBinaryFormat((d), (rc)))
#define CMIsInterval(d, rc) ((d)->ft->isInterval((d), (rc)))

// Results. Their value is the CMPIStatus of the call; none leaves the calling function.
#define CMReturnData(r, v, type) ((r)->ft->returnData((r), CMPI_VALUE_ARGUMENT(v), (type)))
#define CMReturnInstance(r, i) ((r)->ft->returnInstance((r), (i)))
#define CMReturnObjectPath(r, op) ((r)->ft->returnObjectPath((r), (op)))
#define CMReturnDone(r) ((r)->ft->returnDone((r)))

// Queries: the members of CMPISelectExp, CMPISelectCond, CMPISubCond and CMPIPredicate.
#define CMEvaluateSelExp(s, inst, rc) ((s)->ft->evaluate((s), (inst), (rc)))
#define CMEvaluateSelExpUsingAccessor(s, fn, parm, rc) \
    ((s)->ft->evaluateUsingAccessor((s), (fn), (parm), (rc)))
#define CMGetSelExpString(s, rc) ((s)->ft->getString((s), (rc)))
#define CMGetDoc(s, rc) ((s)->ft->getDOC((s), (rc)))
#define CMGetCod(s, rc) ((s)->ft->getCOD((s), (rc)))
#define CMGetSubCondCountAndType(c, kind, rc) ((c)->ft->getCountAndType((c), (kind), (rc)))
#define CMGetSubCondAt(c, index, rc) ((c)->ft->getSubCondAt((c), (index), (rc)))
#define CMGetPredicateCount(s, rc) ((s)->ft->getCount((s), (rc)))
#define CMGetPredicateAt(s, index, rc) ((s)->ft->getPredicateAt((s), (index), (rc)))
#define CMGetPredicate(s, name, rc) ((s)->ft->getPredicate((s), (name), (rc)))
#define CMGetPredicateData(p, type, operation, lhs, rhs) \
    ((p)->ft->getData((p), (type), (operation), (lhs), (rhs)))
#define CMEvaluatePredicateUsingAccessor(p, fn, parm, rc) \
    ((p)->ft->evaluateUsingAccessor((p), (fn), (parm), (rc)))

// Up-calls, on a broker b in a context c: enumerateInstanceNames and enumerateInstances first.
#define CBEnumInstanceNames(b, c, op, rc) ((b)->bft->enumerateInstanceNames((b), (c), (op), (rc)))
#define CBEnumInstances(b, c, op, properties, rc) \
    ((b)->bft->enumerateInstances((b), (c), (op), (properties), (rc)))
#define CBGetInstance(b, c, op, properties, rc) \
    ((b)->bft->getInstance((b), (c), (op), (properties), (rc)))
#define CBCreateInstance(b, c, op, inst, rc) \
    ((b)->bft->createInstance((b), (c), (op), (inst), (rc)))
#define CBModifyInstance(b, c, op, inst, properties) \
    ((b)->bft->modifyInstance((b), (c), (op), (inst), (properties)))
#define CBDeleteInstance(b, c, op) ((b)->bft->deleteInstance((b), (c), (op)))
#define CBExecQuery(b, c, op, query, lang, rc) \
    ((b)->bft->execQuery((b), (c), (op), (query), (lang), (rc)))
#define CBAssociators(b, c, op, assocClass, resultClass, role, resultRole, properties, rc)    \
    ((b)->bft->associators((b), (c), (op), (assocClass), (resultClass), (role), (resultRole), \
                           (properties), (rc)))
#define CBAssociatorNames(b, c, op, assocClass, resultClass, role, resultRole, rc)                \
    ((b)->bft->associatorNames((b), (c), (op), (assocClass), (resultClass), (role), (resultRole), \
                               (rc)))
#define CBReferences(b, c, op, resultClass, role, properties, rc) \
    ((b)->bft->references((b), (c), (op), (resultClass), (role), (properties), (rc)))
#define CBReferenceNames(b, c, op, resultClass, role, rc) \
    ((b)->bft->referenceNames((b), (c), (op), (resultClass), (role), (rc)))
#define CBInvokeMethod(b, c, op, method, in, out, rc) \
    ((b)->bft->invokeMethod((b), (c), (op), (method), (in), (out), (rc)))
#define CBSetProperty(b, c, op, name, v, type) \
    ((b)->bft->setProperty((b), (c), (op), (name), CMPI_VALUE_ARGUMENT(v), (type)))
#define CBGetProperty(b, c, op, name, rc) ((b)->bft->getProperty((b), (c), (op), (name), (rc)))
#define CBPrepareAttachThread(b, c) ((b)->bft->prepareAttachThread((b), (c)))
#define CBAttachThread(b, c) ((b)->bft->attachThread((b), (c)))
#define CBDetachThread(b, c) ((b)->bft->detachThread((b), (c)))
#define CBDeliverIndication(b, c, ns, ind) ((b)->bft->deliverIndication((b), (c), (ns), (ind)))

// The older name of CBModifyInstance.
#define CBSetInstance(b, c, op, inst, properties) CBModifyInstance(b, c, op, inst, properties)

// Facts about the broker: CMPI_MB_* bits, CMPI level, name.
#define CBGetClassification(b) ((b)->bft->brokerCapabilities)
#define CBBrokerVersion(b) ((b)->bft->brokerVersion)
#define CBBrokerName(b) ((b)->bft->brokerName)

#ifdef CMPI_VER_200
#include "macros_200.h"
#endif

#endif
