// SPDX-License-Identifier: MIT
/*
  The tables that a provider fills, one for each kind of interface ("MI") that it implements.

  A library exports, with C linkage, for the provider name that it is registered under:
      CMPIInstanceMI* <name>_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus* rc)
  and likewise _AssociationMI, _MethodMI, _PropertyMI, _IndicationMI; or, for any provider name,
      CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, const char* name, CMPIStatus*
  rc) and its four siblings. Before a slot is read, ftVersion is compared with the version that added it.
 */
#pragma once

#include "broker.h"

#ifdef __cplusplus
extern "C" {
#endif

struct CMPIInstanceMI
{
    void* hdl;
    const CMPIInstanceMIFT* ft;
};

struct CMPIAssociationMI
{
    void* hdl;
    const CMPIAssociationMIFT* ft;
};

struct CMPIMethodMI
{
    void* hdl;
    const CMPIMethodMIFT* ft;
};

struct CMPIPropertyMI
{
    void* hdl;
    const CMPIPropertyMIFT* ft;
};

struct CMPIIndicationMI
{
    void* hdl;
    const CMPIIndicationMIFT* ft;
};

struct CMPIInstanceMIFT
{
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*enumerateInstanceNames)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                         const CMPIObjectPath* classPath);
    CMPIStatus (*enumerateInstances)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                     const CMPIObjectPath* classPath, const char** properties);
    CMPIStatus (*getInstance)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                              const char** properties);
    CMPIStatus (*createInstance)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                 const CMPIObjectPath* classPath, const CMPIInstance*);
    CMPIStatus (*modifyInstance)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                                 const CMPIInstance* modInst, const char** properties);
    CMPIStatus (*deleteInstance)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*);
    CMPIStatus (*execQuery)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* classPath,
                            const char* query, const char* lang);
    CMPIStatus (*enumerateInstancesFiltered)(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                             const CMPIObjectPath* classPath, const char** properties,
                                             const char* filterQuerylanguage, const char* filterQuery,
                                             CMPIStatus* rc); /* 2.1 */
};

struct CMPIAssociationMIFT
{
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIAssociationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*associators)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                              const char* assocClass, const char* resultClass, const char* role, const char* resultRole,
                              const char** properties);
    CMPIStatus (*associatorNames)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                  const CMPIObjectPath* instPath, const char* assocClass, const char* resultClass,
                                  const char* role, const char* resultRole);
    CMPIStatus (*references)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                             const char* resultClass, const char* role, const char** properties);
    CMPIStatus (*referenceNames)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                 const CMPIObjectPath* instPath, const char* resultClass, const char* role);
    CMPIStatus (*associatorsFiltered)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                      const CMPIObjectPath* instPath, const char* assocClass, const char* resultClass,
                                      const char* role, const char* resultRole, const char** properties,
                                      const char* filterQueryLanguage, const char* filterQuery,
                                      CMPIBoolean continueOnError); /* 2.1 */
    CMPIStatus (*referencesFiltered)(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                     const CMPIObjectPath* instPath, const char* resultClass, const char* role,
                                     const char** properties, const char* filterQueryLanguage, const char* filterQuery,
                                     CMPIBoolean continueOnError); /* 2.1 */
};

struct CMPIMethodMIFT
{
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*invokeMethod)(CMPIMethodMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* objPath,
                               const char* method, const CMPIArgs* in, CMPIArgs* out);
};

struct CMPIPropertyMIFT
{
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIPropertyMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*setProperty)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                              const char* name, CMPIData data);
    CMPIStatus (*getProperty)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* instPath,
                              const char* name);
    CMPIStatus (*setPropertyWithOrigin)(CMPIPropertyMI*, const CMPIContext*, const CMPIResult*,
                                        CMPIObjectPath* instPath, const char* name, CMPIData data,
                                        const char* origin); /* 2.0 */
};

struct CMPIIndicationMIFT
{
    int ftVersion;
    int miVersion;
    const char* miName;
    CMPIStatus (*cleanup)(CMPIIndicationMI* mi, const CMPIContext* ctx, CMPIBoolean terminating);
    CMPIStatus (*authorizeFilter)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp* filter,
                                  const char* className, const CMPIObjectPath* classPath, const char* owner);
    CMPIStatus (*mustPoll)(CMPIIndicationMI*, const CMPIContext*, const CMPIResult*, const CMPISelectExp* filter,
                           const char* className, const CMPIObjectPath* classPath);
    CMPIStatus (*activateFilter)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp* filter,
                                 const char* className, const CMPIObjectPath* classPath, CMPIBoolean firstActivation);
    CMPIStatus (*deActivateFilter)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp* filter,
                                   const char* className, const CMPIObjectPath* classPath,
                                   CMPIBoolean lastDeActiviation);
    CMPIStatus (*enableIndications)(CMPIIndicationMI*, const CMPIContext*);
    CMPIStatus (*disableIndications)(CMPIIndicationMI*, const CMPIContext*);
    CMPIStatus (*authorizeFilterCollection)(CMPIIndicationMI*, const CMPIContext*,
                                            const CMPIInstance* collInst); /* 2.1 */
    CMPIStatus (*activateFilterCollection)(CMPIIndicationMI*, const CMPIContext*, const CMPIInstance* collInst,
                                           CMPIBoolean firstActivation); /* 2.1 */
    CMPIStatus (*deActivateFilterCollection)(CMPIIndicationMI*, const CMPIContext*, const CMPIInstance* collInst,
                                             CMPIBoolean lastDeActivation); /* 2.1 */
};

#ifdef __cplusplus
}
#endif
