// SPDX-License-Identifier: MIT
/*
  The provider that the broker's tests drive: TST_Check has methods that run the checks, TST_Item has instances that are
  returned in as many ways as providers do it, right and wrong.
*/
#include "Conformance.h"

#include <stdatomic.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

const CMPIStatus kGarbage = {(CMPIrc)0x5A5A5A5A, (CMPIString*)0x5A5A5A5A5A5A5A5A};

static const CMPIBroker* gBroker;
static char gMode[64] = "";
static CMPIrc gCleanupAnswer = CMPI_RC_OK;
static atomic_int gRunning;  /* calls in progress */
static atomic_int gOverlaps; /* clean-ups seen while one was */

CMPIObjectPath* newPath(const Env* env, const char* className)
{
    return env->mb->eft->newObjectPath(env->mb, NS, className, NULL);
}

CMPIInstance* newInst(const Env* env, const char* className)
{
    return env->mb->eft->newInstance(env->mb, newPath(env, className), NULL);
}

const char* textOf(const CMPIString* string)
{
    return string == NULL ? "(null)" : (const char*)string->hdl;
}

static CMPIStatus failure(CMPIrc code, const char* text)
{
    const CMPIStatus status = {code, text == NULL ? NULL : gBroker->eft->newString(gBroker, text, NULL)};
    return status;
}

static const CMPIStatus kOk = {CMPI_RC_OK, NULL};

/* ---- Instances ---- */

static CMPIInstance* makeItem(int id)
{
    char text[32];
    snprintf(text, sizeof text, "%d", id);
    CMPIObjectPath* path = gBroker->eft->newObjectPath(gBroker, NS, "TST_Item", NULL);
    path->ft->addKey(path, "Id", (const CMPIValue*)text, CMPI_chars);
    CMPIInstance* instance = gBroker->eft->newInstance(gBroker, path, NULL);
    path->ft->release(path);
    instance->ft->setProperty(instance, "Id", (const CMPIValue*)text, CMPI_chars);
    snprintf(text, sizeof text, "item %d", id);
    instance->ft->setProperty(instance, "Text", (const CMPIValue*)text, CMPI_chars);
    const CMPIValue number = {.uint32 = (CMPIUint32)id};
    instance->ft->setProperty(instance, "Number", &number, CMPI_uint32);
    return instance;
}

static CMPIStatus returnItem(const CMPIResult* result, int id)
{
    CMPIInstance* instance = makeItem(id);
    const CMPIStatus status = result->ft->returnInstance(result, instance);
    instance->ft->release(instance);
    return status;
}

static CMPIStatus returnItems(const CMPIResult* result, int count)
{
    CMPIStatus status = kOk;
    for (int i = 0; i < count && status.rc == CMPI_RC_OK; ++i) {
        status = returnItem(result, i);
    }
    return status;
}

static CMPIStatus returnChanged(const CMPIResult* result)
{
    const CMPIInstance* instance = makeItem(0);
    result->ft->returnInstance(result, instance);
    instance->ft->setProperty(instance, "Text", (const CMPIValue*)"changed", CMPI_chars);
    return result->ft->returnInstance(result, instance);
}

/* Returns the broker's answers to wrong kinds of results as its message. */
static CMPIStatus returnWrongKinds(const CMPIResult* result)
{
    char text[64];
    const CMPIValue number = {.uint32 = 1};
    const CMPIrc path =
        result->ft->returnObjectPath(result, gBroker->eft->newObjectPath(gBroker, NS, "TST_Item", NULL)).rc;
    const CMPIrc data = result->ft->returnData(result, &number, CMPI_uint32).rc;
    const CMPIrc null = result->ft->returnInstance(result, NULL).rc;
    snprintf(text, sizeof text, "path %d, data %d, null %d", (int)path, (int)data, (int)null);
    return failure(CMPI_RC_ERR_FAILED, text);
}

static CMPIStatus returnAfterDone(const CMPIResult* result)
{
    returnItems(result, 1);
    result->ft->returnDone(result);
    result->ft->returnDone(result);
    returnItem(result, 1);
    return kOk;
}

/* Returns an instance of a class that the MOF has, or lacks. */
static CMPIStatus returnOther(const CMPIResult* result, const char* className)
{
    const CMPIObjectPath* path = gBroker->eft->newObjectPath(gBroker, NS, className, NULL);
    path->ft->addKey(path, "Id", (const CMPIValue*)"other", CMPI_chars);
    const CMPIInstance* instance = gBroker->eft->newInstance(gBroker, path, NULL);
    instance->ft->setProperty(instance, "Id", (const CMPIValue*)"other", CMPI_chars);
    instance->ft->setProperty(instance, "Text", (const CMPIValue*)"of another class", CMPI_chars);
    instance->ft->setProperty(instance, "OfLeaf", (const CMPIValue*)"of the leaf", CMPI_chars);
    if (strcmp(className, "TST_Everything") == 0) {
        setScalars(gBroker, instance);
    }
    return result->ft->returnInstance(result, instance);
}

/* The message names the properties that were asked for. */
static CMPIStatus nameProperties(const char** properties)
{
    char text[128] = "all";
    if (properties != NULL) {
        text[0] = '\0';
    }
    for (; properties != NULL && *properties != NULL; ++properties) {
        strncat(text, *properties, sizeof text - strlen(text) - 1);
        strncat(text, ";", sizeof text - strlen(text) - 1);
    }
    return failure(CMPI_RC_ERR_FAILED, text);
}

static CMPIStatus enumerate(const CMPIResult* result, const char** properties)
{
    int number = 0;
    char className[32];
    if (sscanf(gMode, "class %31s", className) == 1) {
        return returnOther(result, className);
    }
    if (sscanf(gMode, "count %d", &number) == 1) {
        return returnItems(result, number);
    }
    if (sscanf(gMode, "fail %d", &number) == 1) {
        returnItems(result, 3);
        return failure((CMPIrc)number, "the reason");
    }
    if (strcmp(gMode, "fail without text") == 0) {
        return failure(CMPI_RC_ERR_ACCESS_DENIED, NULL);
    }
    if (strcmp(gMode, "changed") == 0) {
        return returnChanged(result);
    }
    if (strcmp(gMode, "wrong kinds") == 0) {
        return returnWrongKinds(result);
    }
    if (strcmp(gMode, "after done") == 0) {
        return returnAfterDone(result);
    }
    if (strcmp(gMode, "properties") == 0) {
        return nameProperties(properties);
    }
    const CMPIStatus status = returnItems(result, 3);
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

static CMPIStatus tstEnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                                   const CMPIObjectPath* op, const char** properties)
{
    (void)mi, (void)ctx, (void)op;
    ++gRunning;
    const CMPIStatus status = enumerate(result, properties);
    --gRunning;
    return status;
}

static CMPIStatus tstEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                                       const CMPIObjectPath* op)
{
    (void)mi, (void)ctx, (void)op;
    CMPIStatus status = kOk;
    for (int i = 0; i < 3 && status.rc == CMPI_RC_OK; ++i) {
        const CMPIInstance* instance = makeItem(i);
        status = result->ft->returnObjectPath(result, instance->ft->getObjectPath(instance, NULL));
    }
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

static CMPIStatus tstGetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                                 const CMPIObjectPath* op, const char** properties)
{
    (void)mi, (void)ctx, (void)properties;
    if (strcmp(gMode, "nothing") == 0) {
        return kOk;
    }
    const CMPIData id = op->ft->getKey(op, "Id", NULL);
    CMPIStatus status = returnItem(result, atoi(textOf(id.value.string)));
    if (strcmp(gMode, "two") == 0) {
        status = returnItem(result, 1);
    }
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

static CMPIStatus logCleanup(const char* kind, CMPIBoolean terminating)
{
    char text[64];
    snprintf(text, sizeof text, "cleanup %s terminating %d", kind, terminating);
    gBroker->eft->logMessage(gBroker, CMPI_SEV_INFO, "", text, NULL);
    gOverlaps += gRunning != 0;
    return failure(gCleanupAnswer, NULL);
}

static CMPIStatus tstCleanup(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean terminating)
{
    (void)mi, (void)ctx;
    return logCleanup("instance", terminating);
}

/* ---- Methods ---- */

static const CheckRow* const kTables[] = {kTableChecks,    kStringChecks, kValueChecks,   kArrayChecks,  kPathChecks,
                                          kInstanceChecks, kCloneChecks,  kContextChecks, kUpcallChecks, kThreadChecks};
enum
{
    kTableCount = sizeof kTables / sizeof *kTables
};

/* Adds the names of all checks, or of those that hold everywhere, as an output. */
static void addNames(CMPIArgs* out, const char* name, int standardOnly)
{
    CMPICount count = 0;
    for (int fills = 0; fills < 2; ++fills) {
        CMPIValue names = {.array = fills ? gBroker->eft->newArray(gBroker, count, CMPI_chars, NULL) : NULL};
        count = 0;
        for (int t = 0; t < kTableCount; ++t) {
            for (const CheckRow* row = kTables[t]; row->name != NULL; ++row) {
                if (standardOnly && row->scope != kStandard) {
                    continue;
                }
                if (fills) {
                    names.array->ft->setElementAt(names.array, count, (const CMPIValue*)row->name, CMPI_chars);
                }
                ++count;
            }
        }
        if (fills) {
            out->ft->addArg(out, name, &names, CMPI_charsA);
        }
    }
}

static CMPIStatus listChecks(const CMPIResult* result, CMPIArgs* out)
{
    addNames(out, "Names", 0);
    addNames(out, "Standard", 1);
    const CMPIValue zero = {.uint32 = 0};
    return result->ft->returnData(result, &zero, CMPI_uint32);
}

static CMPIStatus runCheck(const Env* env)
{
    const char* wanted = textOf(env->in->ft->getArg(env->in, "Name", NULL).value.string);
    for (int t = 0; t < kTableCount; ++t) {
        for (const CheckRow* row = kTables[t]; row->name != NULL; ++row) {
            if (strcmp(row->name, wanted) == 0) {
                const char* failed = row->check(env);
                return env->result->ft->returnData(env->result, (const CMPIValue*)(failed == NULL ? "" : failed),
                                                   CMPI_chars);
            }
        }
    }
    return failure(CMPI_RC_ERR_NOT_FOUND, wanted);
}

/* Calls itself through the server until Depth is 0; every level adds its number to the trail. */
static CMPIStatus descend(const Env* env)
{
    CMPIValue depth = env->in->ft->getArg(env->in, "Depth", NULL).value;
    char trail[32] = "";
    if (depth.uint32 > 0) {
        const CMPIArgs* in = gBroker->eft->newArgs(gBroker, NULL);
        CMPIArgs* out = gBroker->eft->newArgs(gBroker, NULL);
        const CMPIValue less = {.uint32 = depth.uint32 - 1};
        in->ft->addArg(in, "Depth", &less, CMPI_uint32);
        CMPIStatus rc = kGarbage;
        gBroker->bft->invokeMethod(gBroker, env->ctx, env->op, "Descend", in, out, &rc);
        if (rc.rc != CMPI_RC_OK) {
            return rc;
        }
        snprintf(trail, sizeof trail, "%s", textOf(out->ft->getArg(out, "Trail", NULL).value.string));
    }
    const size_t end = strlen(trail);
    snprintf(trail + end, sizeof trail - end, "%u", (unsigned)depth.uint32);
    env->out->ft->addArg(env->out, "Trail", (const CMPIValue*)trail, CMPI_chars);
    depth.uint32 = 0;
    return env->result->ft->returnData(env->result, &depth, CMPI_uint32);
}

/* Returns every input parameter as output, and the first one as the return value. */
static CMPIStatus echo(const Env* env)
{
    const CMPICount count = env->in->ft->getArgCount(env->in, NULL);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = NULL;
        const CMPIData data = env->in->ft->getArgAt(env->in, i, &name, NULL);
        const CMPIValue* value = (data.state & CMPI_nullValue) != 0 ? NULL : &data.value;
        const CMPIStatus added = env->out->ft->addArg(env->out, textOf(name), value, data.type);
        if (added.rc != CMPI_RC_OK) {
            return added;
        }
    }
    const CMPIData first = env->in->ft->getArgAt(env->in, 0, NULL, NULL);
    return (first.state & CMPI_nullValue) != 0 ? kOk
                                               : env->result->ft->returnData(env->result, &first.value, first.type);
}

static CMPIStatus setMode(const Env* env)
{
    snprintf(gMode, sizeof gMode, "%s", textOf(env->in->ft->getArg(env->in, "Mode", NULL).value.string));
    int answer = 0;
    if (sscanf(gMode, "cleanup %d", &answer) == 1) {
        gCleanupAnswer = (CMPIrc)answer;
    }
    const CMPIValue zero = {.uint32 = 0};
    return env->result->ft->returnData(env->result, &zero, CMPI_uint32);
}

/* Returns the number of calls since the library was loaded, and of clean-ups that overlapped calls. */
static CMPIStatus tell(const Env* env)
{
    static CMPIUint32 calls;
    const CMPIValue count = {.uint32 = ++calls};
    const CMPIValue overlaps = {.sint32 = gOverlaps};
    env->out->ft->addArg(env->out, "Overlaps", &overlaps, CMPI_sint32);
    return env->result->ft->returnData(env->result, &count, CMPI_uint32);
}

static CMPIStatus tstInvokeMethod(CMPIMethodMI* mi, const CMPIContext* ctx, const CMPIResult* result,
                                  const CMPIObjectPath* op, const char* method, const CMPIArgs* in, CMPIArgs* out)
{
    (void)mi;
    const Env env = {gBroker, ctx, op, result, in, out};
    CMPIStatus status;
    ++gRunning;
    if (strcmp(method, "List") == 0) {
        status = listChecks(result, out);
    } else if (strcmp(method, "Run") == 0) {
        status = runCheck(&env);
    } else if (strcmp(method, "Descend") == 0) {
        status = descend(&env);
    } else if (strcmp(method, "Echo") == 0) {
        status = echo(&env);
    } else if (strcmp(method, "SetMode") == 0) {
        status = setMode(&env);
    } else if (strcmp(method, "Tell") == 0) {
        status = tell(&env);
    } else {
        status = failure(CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    }
    --gRunning;
    return status.rc == CMPI_RC_OK && strcmp(gMode, "no done") != 0 ? result->ft->returnDone(result) : status;
}

static CMPIStatus tstMethodCleanup(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating)
{
    (void)mi, (void)ctx;
    return logCleanup("method", terminating);
}

static const CMPIInstanceMIFT kInstanceMIFT = {.ftVersion = CMPIVersion200,
                                               .miVersion = CMPIVersion200,
                                               .miName = "instanceConformance",
                                               .cleanup = tstCleanup,
                                               .enumerateInstanceNames = tstEnumInstanceNames,
                                               .enumerateInstances = tstEnumInstances,
                                               .getInstance = tstGetInstance};
static const CMPIMethodMIFT kMethodMIFT = {.ftVersion = CMPIVersion200,
                                           .miVersion = CMPIVersion200,
                                           .miName = "methodConformance",
                                           .cleanup = tstMethodCleanup,
                                           .invokeMethod = tstInvokeMethod};

/* All factories get the same broker. */
static int isRightCall(const CMPIBroker* broker, const CMPIContext* ctx, const CMPIStatus* rc)
{
    const int isRight = broker != NULL && ctx != NULL && rc != NULL && rc->rc == CMPI_RC_OK && rc->msg == NULL &&
                        (gBroker == NULL || gBroker == broker);
    gBroker = broker;
    return isRight;
}

CMPIInstanceMI* Conformance_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc);
CMPIInstanceMI* Conformance_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    static CMPIInstanceMI mi = {NULL, &kInstanceMIFT};
    return isRightCall(broker, ctx, rc) ? &mi : NULL;
}

CMPIMethodMI* Conformance_Create_MethodMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc);
CMPIMethodMI* Conformance_Create_MethodMI(const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc)
{
    static CMPIMethodMI mi = {NULL, &kMethodMIFT};
    return isRightCall(broker, ctx, rc) ? &mi : NULL;
}
