// SPDX-License-Identifier: MIT
/*
  The macros in which providers are usually written: calls through the function tables, statuses, and the stubs that
  make a provider's tables and entry points. What a call requires and returns stands with the table's function.
 */
#pragma once

#include "cmpift.h"

/* Makers of objects. */
#define CMNewInstance(b, op, rc) (((b)->eft->newInstance)((b), (op), (rc)))
#define CMNewObjectPath(b, ns, cn, rc) (((b)->eft->newObjectPath)((b), (ns), (cn), (rc)))
#define CMNewArgs(b, rc) (((b)->eft->newArgs)((b), (rc)))
#define CMNewString(b, text, rc) (((b)->eft->newString)((b), (text), (rc)))
#define CMNewArray(b, size, type, rc) (((b)->eft->newArray)((b), (size), (type), (rc)))
#define CMNewDateTime(b, rc) (((b)->eft->newDateTime)((b), (rc)))
#define CMNewDateTimeFromBinary(b, time, interval, rc)                                                                 \
    (((b)->eft->newDateTimeFromBinary)((b), (time), (interval), (rc)))
#define CMNewDateTimeFromChars(b, time, rc) (((b)->eft->newDateTimeFromChars)((b), (time), (rc)))
#define CMNewSelectExp(b, query, lang, projection, rc)                                                                 \
    (((b)->eft->newSelectExp)((b), (query), (lang), (projection), (rc)))
#define CMNewCMPIError(b, owner, id, text, severity, cause, code, rc)                                                  \
    (((b)->eft->newCMPIError)((b), (owner), (id), (text), (severity), (cause), (code), (rc)))
#define CMClassPathIsA(b, op, cn, rc) (((b)->eft->classPathIsA)((b), (op), (cn), (rc)))
#define CDToString(b, object, rc) (((b)->eft->toString)((b), (object), (rc)))
#define CDIsOfType(b, object, type, rc) (((b)->eft->isOfType)((b), (object), (type), (rc)))
#define CDGetType(b, object, rc) (((b)->eft->getType)((b), (object), (rc)))
#define CMLogMessage(b, severity, id, text, string) (((b)->eft->logMessage)((b), (severity), (id), (text), (string)))
#define CMTraceMessage(b, level, component, text, string)                                                              \
    (((b)->eft->trace)((b), (level), (component), (text), (string)))

/* Any object. */
#define CMClone(o, rc) (((o)->ft->clone)((o), (rc)))
#define CMRelease(o) (((o)->ft->release)((o)))

/* Strings, arrays, enumerations and datetimes. */
#define CMGetCharsPtr(s, rc) (((s)->ft->getCharPtr)((s), (rc)))
#define CMGetArrayCount(a, rc) (((a)->ft->getSize)((a), (rc)))
#define CMGetArrayType(a, rc) (((a)->ft->getSimpleType)((a), (rc)))
#define CMGetArrayElementAt(a, index, rc) (((a)->ft->getElementAt)((a), (index), (rc)))
#define CMSetArrayElementAt(a, index, value, type) (((a)->ft->setElementAt)((a), (index), (value), (type)))
#define CMGetNext(e, rc) (((e)->ft->getNext)((e), (rc)))
#define CMHasNext(e, rc) (((e)->ft->hasNext)((e), (rc)))
#define CMToArray(e, rc) (((e)->ft->toArray)((e), (rc)))
#define CMGetBinaryFormat(d, rc) (((d)->ft->getBinaryFormat)((d), (rc)))
#define CMGetStringFormat(d, rc) (((d)->ft->getStringFormat)((d), (rc)))
#define CMIsInterval(d, rc) (((d)->ft->isInterval)((d), (rc)))

/* Paths. */
#define CMSetNameSpace(p, ns) (((p)->ft->setNameSpace)((p), (ns)))
#define CMGetNameSpace(p, rc) (((p)->ft->getNameSpace)((p), (rc)))
#define CMSetHostname(p, host) (((p)->ft->setHostname)((p), (host)))
#define CMGetHostname(p, rc) (((p)->ft->getHostname)((p), (rc)))
#define CMSetClassName(p, cn) (((p)->ft->setClassName)((p), (cn)))
#define CMGetClassName(p, rc) (((p)->ft->getClassName)((p), (rc)))
#define CMAddKey(p, name, value, type) (((p)->ft->addKey)((p), (name), (value), (type)))
#define CMGetKey(p, name, rc) (((p)->ft->getKey)((p), (name), (rc)))
#define CMGetKeyAt(p, index, name, rc) (((p)->ft->getKeyAt)((p), (index), (name), (rc)))
#define CMGetKeyCount(p, rc) (((p)->ft->getKeyCount)((p), (rc)))
#define CMSetNameSpaceFromObjectPath(p, from) (((p)->ft->setNameSpaceFromObjectPath)((p), (from)))
#define CMSetHostAndNameSpaceFromObjectPath(p, from) (((p)->ft->setHostAndNameSpaceFromObjectPath)((p), (from)))
#define CMGetClassQualifier(p, qualifier, rc) (((p)->ft->getClassQualifier)((p), (qualifier), (rc)))
#define CMGetPropertyQualifier(p, property, qualifier, rc)                                                             \
    (((p)->ft->getPropertyQualifier)((p), (property), (qualifier), (rc)))
#define CMGetMethodQualifier(p, method, qualifier, rc) (((p)->ft->getMethodQualifier)((p), (method), (qualifier), (rc)))
#define CMGetParameterQualifier(p, method, parameter, qualifier, rc)                                                   \
    (((p)->ft->getParameterQualifier)((p), (method), (parameter), (qualifier), (rc)))
#define CMObjectPathToString(p, rc) (((p)->ft->toString)((p), (rc)))

/* Instances. */
#define CMGetProperty(i, name, rc) (((i)->ft->getProperty)((i), (name), (rc)))
#define CMGetPropertyAt(i, index, name, rc) (((i)->ft->getPropertyAt)((i), (index), (name), (rc)))
#define CMGetPropertyCount(i, rc) (((i)->ft->getPropertyCount)((i), (rc)))
#define CMSetProperty(i, name, value, type) (((i)->ft->setProperty)((i), (name), (value), (type)))
#define CMSetPropertyWithOrigin(i, name, value, type, origin)                                                          \
    (((i)->ft->setPropertyWithOrigin)((i), (name), (value), (type), (origin)))
#define CMGetObjectPath(i, rc) (((i)->ft->getObjectPath)((i), (rc)))
#define CMSetObjectPath(i, op) (((i)->ft->setObjectPath)((i), (op)))
#define CMSetPropertyFilter(i, properties, keys) (((i)->ft->setPropertyFilter)((i), (properties), (keys)))

/* Arguments of methods, and the context of a call. */
#define CMAddArg(a, name, value, type) (((a)->ft->addArg)((a), (name), (value), (type)))
#define CMGetArg(a, name, rc) (((a)->ft->getArg)((a), (name), (rc)))
#define CMGetArgAt(a, index, name, rc) (((a)->ft->getArgAt)((a), (index), (name), (rc)))
#define CMGetArgCount(a, rc) (((a)->ft->getArgCount)((a), (rc)))
#define CMGetContextEntry(c, name, rc) (((c)->ft->getEntry)((c), (name), (rc)))
#define CMGetContextEntryAt(c, index, name, rc) (((c)->ft->getEntryAt)((c), (index), (name), (rc)))
#define CMGetContextEntryCount(c, rc) (((c)->ft->getEntryCount)((c), (rc)))
#define CMAddContextEntry(c, name, value, type) (((c)->ft->addEntry)((c), (name), (value), (type)))

/* Results: what a provider delivers. */
#define CMReturnData(r, value, type) (((r)->ft->returnData)((r), (value), (type)))
#define CMReturnInstance(r, instance) (((r)->ft->returnInstance)((r), (instance)))
#define CMReturnObjectPath(r, op) (((r)->ft->returnObjectPath)((r), (op)))
#define CMReturnDone(r) (((r)->ft->returnDone)((r)))
#define CMReturnError(r, error) (((r)->ft->returnError)((r), (error)))

/* Filters of indications. */
#define CMEvaluateSelExp(f, instance, rc) (((f)->ft->evaluate)((f), (instance), (rc)))
#define CMGetSelExpString(f, rc) (((f)->ft->getString)((f), (rc)))
#define CMGetDoc(f, rc) (((f)->ft->getDOC)((f), (rc)))
#define CMGetCod(f, rc) (((f)->ft->getCOD)((f), (rc)))
#define CMGetSubCondCountAndType(c, type, rc) (((c)->ft->getCountAndType)((c), (type), (rc)))
#define CMGetSubCondAt(c, index, rc) (((c)->ft->getSubCondAt)((c), (index), (rc)))
#define CMGetPredicateCount(c, rc) (((c)->ft->getCount)((c), (rc)))
#define CMGetPredicateAt(c, index, rc) (((c)->ft->getPredicateAt)((c), (index), (rc)))
#define CMGetPredicateData(p, type, op, lhs, rhs) (((p)->ft->getData)((p), (type), (op), (lhs), (rhs)))

/* Operations of the server, and the attaching of own threads. */
#define CBPrepareAttachThread(b, ctx) (((b)->bft->prepareAttachThread)((b), (ctx)))
#define CBAttachThread(b, ctx) (((b)->bft->attachThread)((b), (ctx)))
#define CBDetachThread(b, ctx) (((b)->bft->detachThread)((b), (ctx)))
#define CBDeliverIndication(b, ctx, ns, indication) (((b)->bft->deliverIndication)((b), (ctx), (ns), (indication)))
#define CBEnumInstanceNames(b, ctx, op, rc) (((b)->bft->enumerateInstanceNames)((b), (ctx), (op), (rc)))
#define CBEnumInstances(b, ctx, op, properties, rc)                                                                    \
    (((b)->bft->enumerateInstances)((b), (ctx), (op), (properties), (rc)))
#define CBGetInstance(b, ctx, op, properties, rc) (((b)->bft->getInstance)((b), (ctx), (op), (properties), (rc)))
#define CBCreateInstance(b, ctx, op, instance, rc) (((b)->bft->createInstance)((b), (ctx), (op), (instance), (rc)))
#define CBModifyInstance(b, ctx, op, instance, properties)                                                             \
    (((b)->bft->modifyInstance)((b), (ctx), (op), (instance), (properties)))
#define CBDeleteInstance(b, ctx, op) (((b)->bft->deleteInstance)((b), (ctx), (op)))
#define CBExecQuery(b, ctx, op, query, lang, rc) (((b)->bft->execQuery)((b), (ctx), (op), (query), (lang), (rc)))
#define CBAssociators(b, ctx, op, association, cn, role, resultRole, properties, rc)                                   \
    (((b)->bft->associators)((b), (ctx), (op), (association), (cn), (role), (resultRole), (properties), (rc)))
#define CBAssociatorNames(b, ctx, op, association, cn, role, resultRole, rc)                                           \
    (((b)->bft->associatorNames)((b), (ctx), (op), (association), (cn), (role), (resultRole), (rc)))
#define CBReferences(b, ctx, op, cn, role, properties, rc)                                                             \
    (((b)->bft->references)((b), (ctx), (op), (cn), (role), (properties), (rc)))
#define CBReferenceNames(b, ctx, op, cn, role, rc) (((b)->bft->referenceNames)((b), (ctx), (op), (cn), (role), (rc)))
#define CBInvokeMethod(b, ctx, op, method, in, out, rc)                                                                \
    (((b)->bft->invokeMethod)((b), (ctx), (op), (method), (in), (out), (rc)))
#define CBSetProperty(b, ctx, op, name, value, type)                                                                   \
    (((b)->bft->setProperty)((b), (ctx), (op), (name), (value), (type)))
#define CBGetProperty(b, ctx, op, name, rc) (((b)->bft->getProperty)((b), (ctx), (op), (name), (rc)))

/* The text of a CMPIString, without a call. */
#ifdef __cplusplus
#define CMGetCharPtr(s) (static_cast<char*>((s)->hdl))
#else
#define CMGetCharPtr(s) ((char*)(s)->hdl)
#endif

#define CMIsNullObject(o) ((o) == NULL || (o)->hdl == NULL)
#define CMIsNullValue(data) (((data).state & CMPI_nullValue) != 0)
#define CMIsKeyValue(data) (((data).state & CMPI_keyValue) != 0)
#define CMIsArray(data) (((data).type & CMPI_ARRAY) != 0)

static inline CMPIStatus cmpiStatus(CMPIrc code, CMPIString* message)
{
    CMPIStatus status = {CMPI_RC_OK, NULL};
    status.rc = code;
    status.msg = message;
    return status;
}

static inline CMPIString* cmpiText(const CMPIBroker* broker, const char* text)
{
    return broker->eft->newString(broker, text, NULL);
}

static inline void cmpiSetStatus(CMPIStatus* status, CMPIrc code, CMPIString* message)
{
    if (status) {
        *status = cmpiStatus(code, message);
    }
}

/* Fill the status that `st` points to, which may be NULL. */
#define CMSetStatus(st, code) cmpiSetStatus((st), (code), NULL)
#define CMSetStatusWithString(st, code, string) cmpiSetStatus((st), (code), (string))
#define CMSetStatusWithChars(b, st, code, text) cmpiSetStatus((st), (code), cmpiText((b), (text)))

/* End the provider's function with a status. */
#define CMReturn(code) return cmpiStatus((code), NULL)
#define CMReturnWithString(code, string) return cmpiStatus((code), (string))
#define CMReturnWithChars(b, code, text) return cmpiStatus((code), cmpiText((b), (text)))

/*
  Stubs. Each makes the static function table of one kind of interface and exports <pn>_Create_<kind>MI, which keeps the
  broker in the variable `broker`, runs the statement `hook` once and returns the interface. The functions are the
  source's own; their names begin with `pfx`.
 */
#define CMNoHook

#define CMPI_STUB(kind, label, pfx, pn, broker, hook, ...)                                                             \
    static CMPI##kind##MIFT pfx##kind##Functions = {CMPI_VERSION, CMPI_VERSION, label #pn, __VA_ARGS__};               \
    CMPI_EXTERN_C CMPI_EXPORT CMPI##kind##MI* pn##_Create_##kind##MI(const CMPIBroker*, const CMPIContext*,            \
                                                                     CMPIStatus*);                                     \
    CMPI##kind##MI* pn##_Create_##kind##MI(const CMPIBroker* cmpiBroker, const CMPIContext* cmpiContext,               \
                                           CMPIStatus* cmpiResult)                                                     \
    {                                                                                                                  \
        static CMPI##kind##MI cmpiInterface = {NULL, &pfx##kind##Functions};                                           \
        (void)cmpiContext;                                                                                             \
        broker = cmpiBroker;                                                                                           \
        hook;                                                                                                          \
        cmpiSetStatus(cmpiResult, CMPI_RC_OK, NULL);                                                                   \
        return &cmpiInterface;                                                                                         \
    }

/* The slots that version 2.1 appended. */
#if CMPI_VERSION >= 210
#define CMPI_SINCE_210(function) function
#else
#define CMPI_SINCE_210(function) NULL
#endif

#define CMInstanceMIStub(pfx, pn, broker, hook)                                                                        \
    CMPI_STUB(Instance, "instance", pfx, pn, broker, hook, pfx##Cleanup, pfx##EnumInstanceNames, pfx##EnumInstances,   \
              pfx##GetInstance, pfx##CreateInstance, pfx##ModifyInstance, pfx##DeleteInstance, pfx##ExecQuery,         \
              CMPI_SINCE_210(pfx##EnumInstancesFiltered))

#define CMAssociationMIStub(pfx, pn, broker, hook)                                                                     \
    CMPI_STUB(Association, "association", pfx, pn, broker, hook, pfx##AssociationCleanup, pfx##Associators,            \
              pfx##AssociatorNames, pfx##References, pfx##ReferenceNames, CMPI_SINCE_210(pfx##AssociatorsFiltered),    \
              CMPI_SINCE_210(pfx##ReferencesFiltered))

#define CMMethodMIStub(pfx, pn, broker, hook)                                                                          \
    CMPI_STUB(Method, "method", pfx, pn, broker, hook, pfx##MethodCleanup, pfx##InvokeMethod)

#define CMPropertyMIStub(pfx, pn, broker, hook)                                                                        \
    CMPI_STUB(Property, "property", pfx, pn, broker, hook, pfx##PropertyCleanup, pfx##SetProperty, pfx##GetProperty,   \
              NULL)

#define CMIndicationMIStub(pfx, pn, broker, hook)                                                                      \
    CMPI_STUB(Indication, "Indication", pfx, pn, broker, hook, pfx##IndicationCleanup, pfx##AuthorizeFilter,           \
              pfx##MustPoll, pfx##ActivateFilter, pfx##DeActivateFilter, pfx##EnableIndications,                       \
              pfx##DisableIndications, CMPI_SINCE_210(pfx##AuthorizeFilterCollection),                                 \
              CMPI_SINCE_210(pfx##ActivateFilterCollection), CMPI_SINCE_210(pfx##DeActivateFilterCollection))
