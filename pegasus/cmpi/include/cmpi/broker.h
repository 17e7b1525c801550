// SPDX-License-Identifier: MIT
/*
  The broker as a provider sees it: one object with four function tables.

  The factory of a provider receives the pointer and may keep it for as long as its library is loaded.
 */
#pragma once

#include "cmpios.h"
#include "objects.h"

#ifdef __cplusplus
extern "C" {
#endif

struct timespec;

struct CMPIBroker
{
    const void* hdl;
    const CMPIBrokerFT* bft;
    const CMPIBrokerEncFT* eft;
    const CMPIBrokerExtFT* xft;
    const CMPIBrokerMemFT* mft; /* 2.0 */
};

/* The server's operations, for the provider to call ("upcalls"), and the attaching of its own threads. */
struct CMPIBrokerFT
{
    unsigned int brokerCapabilities;
    CMPIVersion brokerVersion;
    const char* brokerName;
    CMPIContext* (*prepareAttachThread)(const CMPIBroker*, const CMPIContext*);
    CMPIStatus (*attachThread)(const CMPIBroker*, const CMPIContext*);
    CMPIStatus (*detachThread)(const CMPIBroker*, const CMPIContext*);
    CMPIStatus (*deliverIndication)(const CMPIBroker*, const CMPIContext*, const char* ns, const CMPIInstance* ind);
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* classPath,
                                               CMPIStatus* rc);
    CMPIInstance* (*getInstance)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                 const char** properties, CMPIStatus* rc);
    CMPIObjectPath* (*createInstance)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* classPath,
                                      const CMPIInstance* newInst, CMPIStatus* rc);
    CMPIStatus (*modifyInstance)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                 const CMPIInstance* modInst, const char** properties);
    CMPIStatus (*deleteInstance)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath);
    CMPIEnumeration* (*execQuery)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* classPath,
                                  const char* query, const char* lang, CMPIStatus* rc);
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* classPath,
                                           const char** properties, CMPIStatus* rc);
    CMPIEnumeration* (*associators)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                    const char* assocClass, const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties, CMPIStatus* rc);
    CMPIEnumeration* (*associatorNames)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                        const char* assocClass, const char* resultClass, const char* role,
                                        const char* resultRole, CMPIStatus* rc);
    CMPIEnumeration* (*references)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                   const char* resultClass, const char* role, const char** properties, CMPIStatus* rc);
    CMPIEnumeration* (*referenceNames)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                       const char* resultClass, const char* role, CMPIStatus* rc);
    CMPIData (*invokeMethod)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* objPath, const char* method,
                             const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc);
    CMPIStatus (*setProperty)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath, const char* name,
                              const CMPIValue*, CMPIType);
    CMPIData (*getProperty)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath, const char* name,
                            CMPIStatus* rc);
    CMPIEnumeration* (*enumerateInstancesFiltered)(const CMPIBroker*, const CMPIContext*,
                                                   const CMPIObjectPath* classPath, const char** properties,
                                                   const char* filterQueryLanguage, const char* filterQuery,
                                                   CMPIStatus* rc); /* 2.1 */
    CMPIEnumeration* (*associatorsFiltered)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                            const char* assocClass, const char* resultClass, const char* role,
                                            const char* resultRole, const char** properties,
                                            const char* filterQueryLanguage, const char* filterQuery,
                                            CMPIStatus* rc); /* 2.1 */
    CMPIEnumeration* (*referencesFiltered)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* instPath,
                                           const char* resultClass, const char* role, const char** properties,
                                           const char* filterQueryLanguage, const char* filterQuery,
                                           CMPIStatus* rc); /* 2.1 */
};

/* Makers of objects, and questions about them. */
struct CMPIBrokerEncFT
{
    CMPIVersion ftVersion;
    CMPIInstance* (*newInstance)(const CMPIBroker*, const CMPIObjectPath* instPath, CMPIStatus* rc);
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker*, const char* ns, const char* cn, CMPIStatus* rc);
    CMPIArgs* (*newArgs)(const CMPIBroker*, CMPIStatus* rc);
    CMPIString* (*newString)(const CMPIBroker*, const char* data, CMPIStatus* rc);
    CMPIArray* (*newArray)(const CMPIBroker*, CMPICount size, CMPIType, CMPIStatus* rc);
    CMPIDateTime* (*newDateTime)(const CMPIBroker*, CMPIStatus* rc);
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker*, CMPIUint64 binTime, CMPIBoolean interval, CMPIStatus* rc);
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker*, const char* datetime, CMPIStatus* rc);
    CMPISelectExp* (*newSelectExp)(const CMPIBroker*, const char* query, const char* lang, CMPIArray** projection,
                                   CMPIStatus* rc);
    CMPIBoolean (*classPathIsA)(const CMPIBroker*, const CMPIObjectPath* classPath, const char* className,
                                CMPIStatus* rc);
    CMPIString* (*toString)(const CMPIBroker*, const void* object, CMPIStatus* rc);
    CMPIBoolean (*isOfType)(const CMPIBroker*, const void* object, const char*, CMPIStatus* rc);
    CMPIString* (*getType)(const CMPIBroker*, const void* object, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIBroker*, const char* msgId, const char* defMsg, CMPIStatus* rc, CMPICount count,
                              ...);
    CMPIStatus (*logMessage)(const CMPIBroker*, CMPISeverity severity, const char* id, const char* text,
                             const CMPIString* string);
    CMPIStatus (*trace)(const CMPIBroker*, CMPILevel level, const char* component, const char* text,
                        const CMPIString* string);
    CMPIError* (*newCMPIError)(const CMPIBroker*, const char* owner, const char* msgID, const char* msg,
                               CMPIErrorSeverity sev, CMPIErrorProbableCause pc, CMPIrc cimStatusCode,
                               CMPIStatus* rc);                                                              /* 2.0 */
    CMPIStatus (*openMessageFile)(const CMPIBroker*, const char* msgFile, CMPIMsgFileHandle* msgFileHandle); /* 2.0 */
    CMPIStatus (*closeMessageFile)(const CMPIBroker*, CMPIMsgFileHandle msgFileHandle);                      /* 2.0 */
    CMPIString* (*getMessage2)(const CMPIBroker*, const char* msgId, CMPIMsgFileHandle msgFileHandle,
                               const char* defMsg, CMPIStatus* rc, CMPICount count, ...);                 /* 2.0 */
    CMPIPropertyList* (*newPropertyList)(const CMPIBroker*, const char** properties, CMPIStatus* rc);     /* 2.1 */
    CMPIString* (*newStringCP)(const CMPIBroker*, const char* data, CMPICodepageID cpid, CMPIStatus* rc); /* 2.1 */
    CMPIEnumerationFilter* (*newEnumerationFilter)(const CMPIBroker*, const char* filterQueryLanguage,
                                                   const char* filterQuery, CMPIStatus* rc); /* 2.1 */
};

/* Threads, mutexes and conditions of the platform. */
struct CMPIBrokerExtFT
{
    CMPIVersion ftVersion;
    char* (*resolveFileName)(const char* libName);
    CMPIThread (*newThread)(CMPIThreadFunc start, void*, int detached);
    int (*joinThread)(CMPIThread thread, CMPIThreadReturn* retval);
    int (*exitThread)(CMPIThreadReturn return_code);
    int (*cancelThread)(CMPIThread thread);
    int (*threadSleep)(CMPIUint32 msec);
    int (*threadOnce)(int* once, CMPIThreadOnceFunc function);
    int (*createThreadKey)(CMPIThreadKey* key, CMPIThreadKeyCleanupFunc cleanup);
    int (*destroyThreadKey)(CMPIThreadKey key);
    void* (*getThreadSpecific)(CMPIThreadKey key);
    int (*setThreadSpecific)(CMPIThreadKey key, void*);
    CMPIMutex (*newMutex)(int opt);
    void (*destroyMutex)(CMPIMutex mutex);
    void (*lockMutex)(CMPIMutex mutex);
    void (*unlockMutex)(CMPIMutex mutex);
    CMPICondition (*newCondition)(int opt);
    void (*destroyCondition)(CMPICondition cond);
    int (*condWait)(CMPICondition cond, CMPIMutex mutex);
    int (*timedCondWait)(CMPICondition cond, CMPIMutex mutex, struct timespec* wait);
    int (*signalCondition)(CMPICondition cond);
    int (*destroyMutex2)(CMPIMutex mutex);        /* 2.1 */
    int (*lockMutex2)(CMPIMutex mutex);           /* 2.1 */
    int (*unlockMutex2)(CMPIMutex mutex);         /* 2.1 */
    int (*destroyCondition2)(CMPICondition cond); /* 2.1 */
};

/* Memory that goes away with the provider's function. */
struct CMPIBrokerMemFT
{
    CMPIVersion ftVersion;                                                  /* 2.0 */
    CMPIGcStat* (*mark)(const CMPIBroker*, CMPIStatus* rc);                 /* 2.0 */
    CMPIStatus (*release)(const CMPIBroker*, const CMPIGcStat* gc);         /* 2.0 */
    void* (*cmpiMalloc)(const CMPIBroker*, size_t size);                    /* 2.0 */
    void* (*cmpiCalloc)(const CMPIBroker*, size_t nElems, size_t sizeElem); /* 2.0 */
    void* (*cmpiRealloc)(const CMPIBroker*, void* ptr, size_t size);        /* 2.0 */
    char* (*cmpiStrDup)(const CMPIBroker*, const char*);                    /* 2.0 */
    void (*cmpiFree)(const CMPIBroker*, void* ptr);                         /* 2.0 */
    void (*freeInstance)(const CMPIBroker*, CMPIInstance*);                 /* 2.0 */
    void (*freeObjectPath)(const CMPIBroker*, CMPIObjectPath* obj);         /* 2.0 */
    void (*freeArgs)(const CMPIBroker*, CMPIArgs*);                         /* 2.0 */
    void (*freeString)(const CMPIBroker*, CMPIString*);                     /* 2.0 */
    void (*freeArray)(const CMPIBroker*, CMPIArray* array);                 /* 2.0 */
    void (*freeDateTime)(const CMPIBroker*, CMPIDateTime*);                 /* 2.0 */
    void (*freeSelectExp)(const CMPIBroker*, CMPISelectExp*);               /* 2.0 */
    void (*freeChars)(const CMPIBroker*, char* chars);                      /* 2.1 */
};

#ifdef __cplusplus
}
#endif
