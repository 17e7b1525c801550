// SPDX-License-Identifier: MIT
/*
  The encapsulated objects: what a provider holds of a broker's strings, paths, instances and so on.

  Every object is two words, the broker's handle and its function table; a table begins with its version, release and
  clone. Slots marked with a version were appended then; a table whose ftVersion is lower ends before them.
  An object that is not a clone lives until the provider's function returns; a clone until it is released.
  The handle of a CMPIString is its NUL-terminated text. Every trailing `rc` may be NULL.
 */
#pragma once

#include "types.h"

#ifdef __cplusplus
extern "C" {
#endif

struct CMPIContext
{
    void* hdl;
    const CMPIContextFT* ft;
};

struct CMPIResult
{
    void* hdl;
    const CMPIResultFT* ft;
};

struct CMPIString
{
    void* hdl;
    const CMPIStringFT* ft;
};

struct CMPIArray
{
    void* hdl;
    const CMPIArrayFT* ft;
};

struct CMPIEnumeration
{
    void* hdl;
    const CMPIEnumerationFT* ft;
};

struct CMPIInstance
{
    void* hdl;
    const CMPIInstanceFT* ft;
};

struct CMPIObjectPath
{
    void* hdl;
    const CMPIObjectPathFT* ft;
};

struct CMPIArgs
{
    void* hdl;
    const CMPIArgsFT* ft;
};

struct CMPIDateTime
{
    void* hdl;
    const CMPIDateTimeFT* ft;
};

struct CMPISelectExp
{
    void* hdl;
    const CMPISelectExpFT* ft;
};

struct CMPISelectCond
{
    void* hdl;
    const CMPISelectCondFT* ft;
};

struct CMPISubCond
{
    void* hdl;
    const CMPISubCondFT* ft;
};

struct CMPIPredicate
{
    void* hdl;
    const CMPIPredicateFT* ft;
};

struct CMPIError
{
    void* hdl;
    const CMPIErrorFT* ft;
};

struct CMPIPropertyList
{
    void* hdl;
    const CMPIPropertyListFT* ft;
};

struct CMPIEnumerationFilter
{
    void* hdl;
    const CMPIEnumerationFilterFT* ft;
};

struct CMPIContextFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIContext* self);
    CMPIContext* (*clone)(const CMPIContext* self, CMPIStatus* rc);
    CMPIData (*getEntry)(const CMPIContext*, const char* name, CMPIStatus* rc);
    CMPIData (*getEntryAt)(const CMPIContext*, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getEntryCount)(const CMPIContext*, CMPIStatus* rc);
    CMPIStatus (*addEntry)(const CMPIContext*, const char* name, const CMPIValue*, CMPIType);
};

struct CMPIResultFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIResult* self);
    CMPIResult* (*clone)(const CMPIResult* self, CMPIStatus* rc);
    CMPIStatus (*returnData)(const CMPIResult*, const CMPIValue*, CMPIType);
    CMPIStatus (*returnInstance)(const CMPIResult*, const CMPIInstance*);
    CMPIStatus (*returnObjectPath)(const CMPIResult*, const CMPIObjectPath*);
    CMPIStatus (*returnDone)(const CMPIResult*);
    CMPIStatus (*returnError)(const CMPIResult*, const CMPIError*); /* 2.0 */
};

struct CMPIStringFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIString* self);
    CMPIString* (*clone)(const CMPIString* self, CMPIStatus* rc);
    const char* (*getCharPtr)(const CMPIString*, CMPIStatus* rc);
    char* (*newCharsCP)(const CMPIString*, CMPICodepageID cpid, CMPIStatus* rc); /* 2.1 */
};

struct CMPIArrayFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIArray* self);
    CMPIArray* (*clone)(const CMPIArray* self, CMPIStatus* rc);
    CMPICount (*getSize)(const CMPIArray*, CMPIStatus* rc);
    CMPIType (*getSimpleType)(const CMPIArray*, CMPIStatus* rc);
    CMPIData (*getElementAt)(const CMPIArray*, CMPICount index, CMPIStatus* rc);
    CMPIStatus (*setElementAt)(const CMPIArray*, CMPICount index, const CMPIValue*, CMPIType);
};

struct CMPIEnumerationFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIEnumeration* self);
    CMPIEnumeration* (*clone)(const CMPIEnumeration* self, CMPIStatus* rc);
    CMPIData (*getNext)(const CMPIEnumeration*, CMPIStatus* rc);
    CMPIBoolean (*hasNext)(const CMPIEnumeration*, CMPIStatus* rc);
    CMPIArray* (*toArray)(const CMPIEnumeration*, CMPIStatus* rc);
};

struct CMPIInstanceFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIInstance* self);
    CMPIInstance* (*clone)(const CMPIInstance* self, CMPIStatus* rc);
    CMPIData (*getProperty)(const CMPIInstance*, const char* name, CMPIStatus* rc);
    CMPIData (*getPropertyAt)(const CMPIInstance*, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getPropertyCount)(const CMPIInstance*, CMPIStatus* rc);
    CMPIStatus (*setProperty)(const CMPIInstance*, const char* name, const CMPIValue*, CMPIType);
    CMPIObjectPath* (*getObjectPath)(const CMPIInstance*, CMPIStatus* rc);
    CMPIStatus (*setPropertyFilter)(const CMPIInstance*, const char** properties, const char** keyList);
    CMPIStatus (*setObjectPath)(const CMPIInstance*, const CMPIObjectPath*);
    CMPIStatus (*setPropertyWithOrigin)(const CMPIInstance*, const char* name, const CMPIValue*, CMPIType,
                                        const char* origin); /* 2.0 */
};

struct CMPIObjectPathFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIObjectPath* self);
    CMPIObjectPath* (*clone)(const CMPIObjectPath* self, CMPIStatus* rc);
    CMPIStatus (*setNameSpace)(const CMPIObjectPath*, const char* ns);
    CMPIString* (*getNameSpace)(const CMPIObjectPath*, CMPIStatus* rc);
    CMPIStatus (*setHostname)(const CMPIObjectPath*, const char* hn);
    CMPIString* (*getHostname)(const CMPIObjectPath*, CMPIStatus* rc);
    CMPIStatus (*setClassName)(const CMPIObjectPath*, const char* cn);
    CMPIString* (*getClassName)(const CMPIObjectPath*, CMPIStatus* rc);
    CMPIStatus (*addKey)(const CMPIObjectPath*, const char* key, const CMPIValue*, CMPIType);
    CMPIData (*getKey)(const CMPIObjectPath*, const char* key, CMPIStatus* rc);
    CMPIData (*getKeyAt)(const CMPIObjectPath*, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getKeyCount)(const CMPIObjectPath*, CMPIStatus* rc);
    CMPIStatus (*setNameSpaceFromObjectPath)(const CMPIObjectPath*, const CMPIObjectPath* src);
    CMPIStatus (*setHostAndNameSpaceFromObjectPath)(const CMPIObjectPath*, const CMPIObjectPath* src);
    CMPIData (*getClassQualifier)(const CMPIObjectPath*, const char* qName, CMPIStatus* rc);
    CMPIData (*getPropertyQualifier)(const CMPIObjectPath*, const char* pName, const char* qName, CMPIStatus* rc);
    CMPIData (*getMethodQualifier)(const CMPIObjectPath*, const char* methodName, const char* qName, CMPIStatus* rc);
    CMPIData (*getParameterQualifier)(const CMPIObjectPath*, const char* mName, const char* pName, const char* qName,
                                      CMPIStatus* rc);
    CMPIString* (*toString)(const CMPIObjectPath*, CMPIStatus* rc);
};

struct CMPIArgsFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIArgs* self);
    CMPIArgs* (*clone)(const CMPIArgs* self, CMPIStatus* rc);
    CMPIStatus (*addArg)(const CMPIArgs*, const char* name, const CMPIValue*, CMPIType);
    CMPIData (*getArg)(const CMPIArgs*, const char* name, CMPIStatus* rc);
    CMPIData (*getArgAt)(const CMPIArgs*, CMPICount index, CMPIString** name, CMPIStatus* rc);
    CMPICount (*getArgCount)(const CMPIArgs*, CMPIStatus* rc);
};

struct CMPIDateTimeFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIDateTime* self);
    CMPIDateTime* (*clone)(const CMPIDateTime* self, CMPIStatus* rc);
    CMPIUint64 (*getBinaryFormat)(const CMPIDateTime*, CMPIStatus* rc);
    CMPIString* (*getStringFormat)(const CMPIDateTime*, CMPIStatus* rc);
    CMPIBoolean (*isInterval)(const CMPIDateTime*, CMPIStatus* rc);
};

struct CMPISelectExpFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISelectExp* self);
    CMPISelectExp* (*clone)(const CMPISelectExp* self, CMPIStatus* rc);
    CMPIBoolean (*evaluate)(const CMPISelectExp*, const CMPIInstance*, CMPIStatus* rc);
    CMPIString* (*getString)(const CMPISelectExp*, CMPIStatus* rc);
    CMPISelectCond* (*getDOC)(const CMPISelectExp*, CMPIStatus* rc);
    CMPISelectCond* (*getCOD)(const CMPISelectExp*, CMPIStatus* rc);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPISelectExp*, CMPIAccessor* accessor, void*, CMPIStatus* rc);
};

struct CMPISelectCondFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISelectCond* self);
    CMPISelectCond* (*clone)(const CMPISelectCond* self, CMPIStatus* rc);
    CMPICount (*getCountAndType)(const CMPISelectCond*, int*, CMPIStatus* rc);
    CMPISubCond* (*getSubCondAt)(const CMPISelectCond*, CMPICount index, CMPIStatus* rc);
};

struct CMPISubCondFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPISubCond* self);
    CMPISubCond* (*clone)(const CMPISubCond* self, CMPIStatus* rc);
    CMPICount (*getCount)(const CMPISubCond*, CMPIStatus* rc);
    CMPIPredicate* (*getPredicateAt)(const CMPISubCond*, CMPICount index, CMPIStatus* rc);
    CMPIPredicate* (*getPredicate)(const CMPISubCond*, const char* name, CMPIStatus* rc);
};

struct CMPIPredicateFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIPredicate* self);
    CMPIPredicate* (*clone)(const CMPIPredicate* self, CMPIStatus* rc);
    CMPIStatus (*getData)(const CMPIPredicate*, CMPIType*, CMPIPredOp* prop, CMPIString** lhs, CMPIString** rhs);
    CMPIBoolean (*evaluateUsingAccessor)(const CMPIPredicate*, CMPIAccessor* accessorFnc, void*, CMPIStatus* rc);
};

struct CMPIErrorFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIError* self);
    CMPIError* (*clone)(const CMPIError* self, CMPIStatus* rc);
    CMPIErrorType (*getErrorType)(const CMPIError*, CMPIStatus* rc);              /* 2.0 */
    CMPIString* (*getOtherErrorType)(const CMPIError*, CMPIStatus* rc);           /* 2.0 */
    CMPIString* (*getOwningEntity)(const CMPIError*, CMPIStatus* rc);             /* 2.0 */
    CMPIString* (*getMessageID)(const CMPIError*, CMPIStatus* rc);                /* 2.0 */
    CMPIString* (*getMessage)(const CMPIError*, CMPIStatus* rc);                  /* 2.0 */
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError*, CMPIStatus* rc);  /* 2.0 */
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError*, CMPIStatus* rc); /* 2.0 */
    CMPIString* (*getProbableCauseDescription)(const CMPIError*, CMPIStatus* rc); /* 2.0 */
    CMPIArray* (*getRecommendedActions)(const CMPIError*, CMPIStatus* rc);        /* 2.0 */
    CMPIString* (*getErrorSource)(const CMPIError*, CMPIStatus* rc);              /* 2.0 */
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError*, CMPIStatus* rc); /* 2.0 */
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError*, CMPIStatus* rc);   /* 2.0 */
    CMPIrc (*getCIMStatusCode)(const CMPIError*, CMPIStatus* rc);                 /* 2.0 */
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError*, CMPIStatus* rc); /* 2.0 */
    CMPIArray* (*getMessageArguments)(const CMPIError*, CMPIStatus* rc);          /* 2.0 */
    CMPIStatus (*setErrorType)(const CMPIError*, CMPIErrorType et);               /* 2.0 */
    CMPIStatus (*setOtherErrorType)(const CMPIError*, const char* ot);            /* 2.0 */
    CMPIStatus (*setProbableCauseDescription)(const CMPIError*, const char* pcd); /* 2.0 */
    CMPIStatus (*setRecommendedActions)(const CMPIError*, const CMPIArray* ra);   /* 2.0 */
    CMPIStatus (*setErrorSource)(const CMPIError*, const char* es);               /* 2.0 */
    CMPIStatus (*setErrorSourceFormat)(const CMPIError*, CMPIErrorSrcFormat esf); /* 2.0 */
    CMPIStatus (*setOtherErrorSourceFormat)(const CMPIError*, const char* oef);   /* 2.0 */
    CMPIStatus (*setCIMStatusCodeDescription)(const CMPIError*, const char* scd); /* 2.0 */
    CMPIStatus (*setMessageArguments)(const CMPIError*, const CMPIArray* values); /* 2.0 */
};

struct CMPIPropertyListFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIPropertyList* self);
    CMPIPropertyList* (*clone)(const CMPIPropertyList* self, CMPIStatus* rc);
    CMPIBoolean (*isPropertyInList)(const CMPIPropertyList*, const char* pname, CMPIStatus* rc); /* 2.1 */
    const char** (*getProperties)(const CMPIPropertyList*, CMPIStatus* rc);                      /* 2.1 */
};

struct CMPIEnumerationFilterFT
{
    CMPIVersion ftVersion;
    CMPIStatus (*release)(CMPIEnumerationFilter* self);
    CMPIEnumerationFilter* (*clone)(const CMPIEnumerationFilter* self, CMPIStatus* rc);
    CMPIBoolean (*match)(const CMPIEnumerationFilter*, const CMPIInstance*, CMPIStatus* rc); /* 2.1 */
};

#ifdef __cplusplus
}
#endif
