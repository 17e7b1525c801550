// SPDX-License-Identifier: MIT
/* The smallest useful provider: two lamps. Links nothing; the broker hands over every function that it calls. */
#include <cmpi/cmpi.h>

#include <stddef.h>

typedef struct
{
    const char* name;
    CMPIBoolean lit;
    CMPIUint32 frequency;
} Lamp;

static const Lamp kLamps[] = {{"power", 1, 0}, {"disk", 1, 5}};
static const CMPIBroker* gBroker;

static CMPIStatus status(CMPIrc code)
{
    CMPIStatus result = {code, NULL};
    return result;
}

static CMPIStatus returnLamp(const CMPIResult* results, const char* ns, const Lamp* lamp, int pathOnly)
{
    CMPIObjectPath* path = gBroker->eft->newObjectPath(gBroker, ns, "LAMP_Lamp", NULL);
    CMPIInstance* instance;
    CMPIValue value;

    path->ft->addKey(path, "Name", (const CMPIValue*)lamp->name, CMPI_chars);
    if (pathOnly) {
        return results->ft->returnObjectPath(results, path);
    }
    instance = gBroker->eft->newInstance(gBroker, path, NULL);
    instance->ft->setProperty(instance, "Name", (const CMPIValue*)lamp->name, CMPI_chars);
    value.boolean = lamp->lit;
    instance->ft->setProperty(instance, "Lit", &value, CMPI_boolean);
    value.uint32 = lamp->frequency;
    instance->ft->setProperty(instance, "Frequency", &value, CMPI_uint32);
    return results->ft->returnInstance(results, instance);
}

static CMPIStatus returnLamps(const CMPIResult* results, const CMPIObjectPath* of, int pathOnly)
{
    const CMPIString* ns = of->ft->getNameSpace(of, NULL);
    size_t i;

    for (i = 0; i < sizeof kLamps / sizeof kLamps[0]; ++i) {
        returnLamp(results, ns->ft->getCharPtr(ns, NULL), &kLamps[i], pathOnly);
    }
    return results->ft->returnDone(results);
}

static CMPIStatus cleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    (void)mi, (void)context, (void)terminating;
    return status(CMPI_RC_OK);
}

static CMPIStatus enumerateInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                         const CMPIObjectPath* of)
{
    (void)mi, (void)context;
    return returnLamps(results, of, 1);
}

static CMPIStatus enumerateInstances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                     const CMPIObjectPath* of, const char** properties)
{
    (void)mi, (void)context, (void)properties;
    return returnLamps(results, of, 0);
}

static CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                              const CMPIObjectPath* path, const char** properties)
{
    (void)mi, (void)context, (void)results, (void)path, (void)properties;
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                 const CMPIObjectPath* path, const CMPIInstance* instance)
{
    (void)mi, (void)context, (void)results, (void)path, (void)instance;
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                 const CMPIObjectPath* path, const CMPIInstance* instance, const char** properties)
{
    (void)mi, (void)context, (void)results, (void)path, (void)instance, (void)properties;
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                 const CMPIObjectPath* path)
{
    (void)mi, (void)context, (void)results, (void)path;
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus execQuery(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                            const CMPIObjectPath* path, const char* query, const char* language)
{
    (void)mi, (void)context, (void)results, (void)path, (void)query, (void)language;
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static const CMPIInstanceMIFT kFunctions = {
    .ftVersion = CMPIVersion200,
    .miVersion = CMPIVersion100,
    .miName = "Lamps",
    .cleanup = cleanup,
    .enumerateInstanceNames = enumerateInstanceNames,
    .enumerateInstances = enumerateInstances,
    .getInstance = getInstance,
    .createInstance = createInstance,
    .modifyInstance = modifyInstance,
    .deleteInstance = deleteInstance,
    .execQuery = execQuery,
};

/* The broker looks this up: the PG_Provider's name and the kind of interface. */
CMPIInstanceMI* Lamps_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* rc)
{
    static CMPIInstanceMI mi = {NULL, &kFunctions};

    (void)context;
    gBroker = broker;
    if (rc) {
        *rc = status(CMPI_RC_OK);
    }
    return &mi;
}
