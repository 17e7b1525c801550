// SPDX-License-Identifier: MIT
/* The smallest useful provider: two lamps, and a method that sets how often one blinks. Links nothing; the broker hands
 * over every function that the macros call. */
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <stddef.h>
#include <string.h>
#include <strings.h>

typedef struct
{
    const char* name;
    CMPIBoolean lit;
    CMPIUint32 frequency;
} Lamp;

static const CMPIBroker* broker;
static Lamp lamps[] = {{"power", 1, 0}, {"disk", 1, 5}};
enum
{
    kLamps = sizeof lamps / sizeof lamps[0]
};

static CMPIObjectPath* pathOf(const Lamp* lamp, const CMPIObjectPath* of)
{
    CMPIObjectPath* path = CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(of, NULL)), "LAMP_Lamp", NULL);
    CMAddKey(path, "Name", (const CMPIValue*)lamp->name, CMPI_chars);
    return path;
}

static CMPIStatus returnLamp(const CMPIResult* results, const CMPIObjectPath* of, const Lamp* lamp)
{
    CMPIInstance* instance = CMNewInstance(broker, pathOf(lamp, of), NULL);
    CMSetProperty(instance, "Name", (const CMPIValue*)lamp->name, CMPI_chars);
    CMSetProperty(instance, "Lit", (const CMPIValue*)&lamp->lit, CMPI_boolean);
    CMSetProperty(instance, "Frequency", (const CMPIValue*)&lamp->frequency, CMPI_uint32);
    return CMReturnInstance(results, instance);
}

/* The lamp that a path names; NULL when there is none. */
static Lamp* lampOf(const CMPIObjectPath* path)
{
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIData name = CMGetKey(path, "Name", &status);
    int i;
    for (i = 0; i < kLamps && status.rc == CMPI_RC_OK && name.type == CMPI_string; ++i) {
        if (strcmp(CMGetCharPtr(name.value.string), lamps[i].name) == 0) {
            return &lamps[i];
        }
    }
    return NULL;
}

static CMPIStatus LampsCleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    (void)mi, (void)context, (void)terminating;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus LampsEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                         const CMPIObjectPath* of)
{
    int i;
    (void)mi, (void)context;
    for (i = 0; i < kLamps; ++i) {
        CMReturnObjectPath(results, pathOf(&lamps[i], of));
    }
    return CMReturnDone(results);
}

static CMPIStatus LampsEnumInstances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                     const CMPIObjectPath* of, const char** properties)
{
    int i;
    (void)mi, (void)context, (void)properties;
    for (i = 0; i < kLamps; ++i) {
        returnLamp(results, of, &lamps[i]);
    }
    return CMReturnDone(results);
}

static CMPIStatus LampsGetInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                   const CMPIObjectPath* path, const char** properties)
{
    const Lamp* lamp = lampOf(path);
    (void)mi, (void)context, (void)properties;
    if (lamp == NULL) {
        CMReturnWithChars(broker, CMPI_RC_ERR_NOT_FOUND, "there is no such lamp");
    }
    returnLamp(results, path, lamp);
    return CMReturnDone(results);
}

static CMPIStatus LampsCreateInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                      const CMPIObjectPath* path, const CMPIInstance* instance)
{
    (void)mi, (void)context, (void)results, (void)path, (void)instance;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus LampsModifyInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                      const CMPIObjectPath* path, const CMPIInstance* instance, const char** properties)
{
    (void)mi, (void)context, (void)results, (void)path, (void)instance, (void)properties;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus LampsDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                      const CMPIObjectPath* path)
{
    (void)mi, (void)context, (void)results, (void)path;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus LampsExecQuery(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* results,
                                 const CMPIObjectPath* path, const char* query, const char* language)
{
    (void)mi, (void)context, (void)results, (void)path, (void)query, (void)language;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus LampsMethodCleanup(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    (void)mi, (void)context, (void)terminating;
    CMReturn(CMPI_RC_OK);
}

/* uint32 Blink([In] uint32 Frequency, [Out] uint32 Before): 0, or 1 for a frequency that no eye follows. */
static CMPIStatus LampsInvokeMethod(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* results,
                                    const CMPIObjectPath* path, const char* method, const CMPIArgs* in, CMPIArgs* out)
{
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIData frequency = CMGetArg(in, "Frequency", &status);
    Lamp* lamp = lampOf(path);
    CMPIUint32 answer;
    (void)mi, (void)context;
    if (strcasecmp(method, "Blink") != 0) {
        CMReturn(CMPI_RC_ERR_METHOD_NOT_FOUND);
    }
    if (lamp == NULL) {
        CMReturnWithChars(broker, CMPI_RC_ERR_NOT_FOUND, "there is no such lamp");
    }
    if (status.rc != CMPI_RC_OK || frequency.type != CMPI_uint32 || CMIsNullValue(frequency)) {
        CMReturnWithChars(broker, CMPI_RC_ERR_INVALID_PARAMETER, "Frequency is missing");
    }
    answer = frequency.value.uint32 > 25;
    CMAddArg(out, "Before", (const CMPIValue*)&lamp->frequency, CMPI_uint32);
    if (answer == 0) {
        lamp->frequency = frequency.value.uint32;
    }
    CMReturnData(results, (const CMPIValue*)&answer, CMPI_uint32);
    return CMReturnDone(results);
}

/* The entry points: the PG_Provider's name and the kind of interface, Lamps_Create_InstanceMI and
 * Lamps_Create_MethodMI. */
CMInstanceMIStub(Lamps, Lamps, broker, CMNoHook) CMMethodMIStub(Lamps, Lamps, broker, CMNoHook)
