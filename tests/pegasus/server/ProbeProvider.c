// SPDX-License-Identifier: MIT
/* A provider that does what a test asks for: many instances, endless instances, errors, upcalls, crashes.
 * Probe_Bulk delivers as many instances as SetCount said (1000 at first); Probe_Endless delivers for ever;
 * Probe_FailAfter delivers one instance, then fails; Probe_Sparse sets 2 of 17 properties, and Probe_Short has those
 * alone. */
#include "tests/pegasus/server/ProbeProcess.h"
#include "tests/pegasus/server/ProbeTraps.h"

#include <cmpi/cmpi.h>

#include <stdio.h>
#include <string.h>
#include <strings.h>

/* Each factory sets it, maybe while the other one's interface works. */
static const CMPIBroker* _Atomic gBroker;
#ifndef PROBE_COUNT
#define PROBE_COUNT 1000 /* a benchmark compiles it with another */
#endif
static CMPIUint32 gCount = PROBE_COUNT;
static char gT1[80] = "A text of about sixty characters, as inventories are full of <them>.";

static const CMPIStatus kOk = {CMPI_RC_OK, NULL};

static CMPIStatus failure(CMPIrc code, const char* text)
{
    CMPIStatus status = {code, gBroker->eft->newString(gBroker, text, NULL)};
    return status;
}

static const char* textOf(const CMPIString* string)
{
    return string == NULL ? "" : (const char*)string->hdl;
}

static void setText(CMPIInstance* instance, const char* name, const char* text)
{
    instance->ft->setProperty(instance, name, (const CMPIValue*)text, CMPI_chars);
}

static void setNumbers(CMPIInstance* instance, CMPIUint32 number)
{
    static const char* const kNames[] = {"N1", "N2", "N3", "N4", "N5", "N6"};
    CMPIValue value;
    for (size_t i = 0; i < sizeof kNames / sizeof kNames[0]; ++i) {
        value.uint64 = number * 1000003ull + i;
        instance->ft->setProperty(instance, kNames[i], &value, CMPI_uint64);
    }
    value.boolean = (CMPIBoolean)(number % 2);
    instance->ft->setProperty(instance, "Flag", &value, CMPI_boolean);
}

static CMPIObjectPath* makePath(const CMPIObjectPath* of, CMPIUint32 number)
{
    char id[32];
    CMPIString* nameSpace = of->ft->getNameSpace(of, NULL);
    CMPIString* className = of->ft->getClassName(of, NULL);
    CMPIObjectPath* path = gBroker->eft->newObjectPath(gBroker, textOf(nameSpace), textOf(className), NULL);
    snprintf(id, sizeof id, "bulk-%07u", (unsigned)number);
    path->ft->addKey(path, "Id", (const CMPIValue*)id, CMPI_chars);
    nameSpace->ft->release(nameSpace); /* an enumeration without end keeps nothing */
    className->ft->release(className);
    return path;
}

/* A sparse instance has the properties that every class has. */
static CMPIStatus deliver(const CMPIResult* result, const CMPIObjectPath* of, CMPIUint32 number, int isSparse)
{
    static const char* const kTexts[] = {"T2", "T3", "T4", "T5", "T6", "T7", "T8", "T9"};
    char id[32];
    CMPIObjectPath* path = makePath(of, number);
    CMPIStatus status = kOk;
    CMPIInstance* instance = gBroker->eft->newInstance(gBroker, path, &status);
    if (instance == NULL) {
        return status;
    }
    snprintf(id, sizeof id, "bulk-%07u", (unsigned)number);
    setText(instance, "Id", id);
    setText(instance, "T1", gT1);
    for (size_t i = 0; !isSparse && i < sizeof kTexts / sizeof kTexts[0]; ++i) {
        setText(instance, kTexts[i], "A text of about sixty characters, as inventories are full of <them>.");
    }
    if (!isSparse) {
        setNumbers(instance, number);
    }
    status = result->ft->returnInstance(result, instance);
    instance->ft->release(instance);
    path->ft->release(path);
    return status;
}

/* One instance of Probe_Trap, with its key on the path alone. */
static CMPIStatus deliverPathKey(const CMPIResult* result, const CMPIObjectPath* of)
{
    const CMPIInstance* instance = gBroker->eft->newInstance(gBroker, makePath(of, 0), NULL);
    const CMPIStatus status = result->ft->returnInstance(result, instance);
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

static CMPIStatus enumerateInstances(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                     const CMPIObjectPath* path, const char** properties)
{
    const char* name = textOf(path->ft->getClassName(path, NULL));
    CMPIStatus status = kOk;
    (void)mi, (void)context, (void)properties;
    if (strcasecmp(name, "Probe_FailAfter") == 0) {
        deliver(result, path, 0, 0);
        return failure(CMPI_RC_ERR_ACCESS_DENIED, "the probe says no: \xc3\xa9");
    }
    if (strcasecmp(name, "Probe_Trap") == 0) {
        return deliverPathKey(result, path);
    }
    const int endless = strcasecmp(name, "Probe_Endless") == 0;
    const int sparse = strcasecmp(name, "Probe_Sparse") == 0 || strcasecmp(name, "Probe_Short") == 0;
    for (CMPIUint32 i = 0; status.rc == CMPI_RC_OK && (endless || i < gCount); ++i) {
        status = deliver(result, path, i, sparse);
    }
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

static CMPIStatus enumerateInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                         const CMPIObjectPath* path)
{
    (void)mi, (void)context;
    for (CMPIUint32 i = 0; i < gCount; ++i) {
        CMPIObjectPath* name = makePath(path, i);
        result->ft->returnObjectPath(result, name);
        name->ft->release(name);
    }
    return result->ft->returnDone(result);
}

static CMPIStatus getInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties)
{
    unsigned number = 0;
    (void)mi, (void)context, (void)properties;
    const CMPIData id = path->ft->getKey(path, "Id", NULL);
    if (id.type != CMPI_string || sscanf(textOf(id.value.string), "bulk-%u", &number) != 1 || number >= gCount) {
        return failure(CMPI_RC_ERR_NOT_FOUND, "no such probe");
    }
    CMPIStatus status = deliver(result, path, number, 0);
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

/* One more instance, whatever it is to hold. */
static CMPIStatus createInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance)
{
    (void)mi, (void)context, (void)instance;
    result->ft->returnObjectPath(result, makePath(path, gCount++));
    return result->ft->returnDone(result);
}

/* Sets the T1 of all instances. */
static CMPIStatus modifyInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path, const CMPIInstance* instance, const char** properties)
{
    (void)mi, (void)context, (void)path;
    if (properties == NULL || properties[0] == NULL || strcasecmp(properties[0], "T1") != 0 || properties[1] != NULL) {
        return failure(CMPI_RC_ERR_NOT_SUPPORTED, "only T1 can be changed");
    }
    snprintf(gT1, sizeof gT1, "%s", textOf(instance->ft->getProperty(instance, "T1", NULL).value.string));
    return result->ft->returnDone(result);
}

/* Refused with a status that CIM does not know. */
static CMPIStatus deleteInstance(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* path)
{
    (void)mi, (void)context, (void)result, (void)path;
    return failure((CMPIrc)99, "not this one");
}

static CMPIStatus execQuery(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                            const CMPIObjectPath* path, const char* language, const char* query)
{
    (void)mi, (void)context, (void)result, (void)path, (void)language, (void)query;
    return failure(CMPI_RC_ERR_NOT_SUPPORTED, "");
}

static CMPIStatus cleanupInstances(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    (void)mi, (void)context, (void)terminating;
    return kOk;
}

static CMPIStatus returnNumber(const CMPIResult* result, CMPIUint32 number)
{
    CMPIValue value;
    value.uint32 = number;
    result->ft->returnData(result, &value, CMPI_uint32);
    return result->ft->returnDone(result);
}

static CMPIStatus echo(const CMPIResult* result, const CMPIArgs* in, CMPIArgs* out)
{
    const CMPIData text = in->ft->getArg(in, "Text", NULL);
    if (text.type == CMPI_string && (text.state & CMPI_nullValue) == 0) {
        out->ft->addArg(out, "Back", &text.value, CMPI_string);
    }
    return returnNumber(result, 0);
}

static CMPIStatus setCount(const CMPIResult* result, const CMPIArgs* in)
{
    const CMPIData count = in->ft->getArg(in, "Count", NULL);
    if (count.type != CMPI_uint32) {
        return failure(CMPI_RC_ERR_INVALID_PARAMETER, "Count");
    }
    gCount = count.value.uint32;
    return returnNumber(result, gCount);
}

/* Appends what the provider got: name, CMPI type and value. */
static void describe(char* text, size_t size, const char* name, CMPIData data)
{
    char value[64] = "?";
    if (data.state & CMPI_nullValue) {
        snprintf(value, sizeof value, "null");
    } else if (data.type & CMPI_ARRAY) {
        snprintf(value, sizeof value, "%u elements", data.value.array->ft->getSize(data.value.array, NULL));
    } else if (data.type == CMPI_boolean) {
        snprintf(value, sizeof value, "%d", data.value.boolean);
    } else if (data.type == CMPI_uint8) {
        snprintf(value, sizeof value, "%u", data.value.uint8);
    } else if (data.type == CMPI_sint64) {
        snprintf(value, sizeof value, "%lld", (long long)data.value.sint64);
    } else if (data.type == CMPI_real32) {
        snprintf(value, sizeof value, "%g", (double)data.value.real32);
    } else if (data.type == CMPI_char16) {
        snprintf(value, sizeof value, "%c", data.value.char16);
    } else if (data.type == CMPI_string) {
        snprintf(value, sizeof value, "%s", textOf(data.value.string));
    } else if (data.type == CMPI_dateTime) {
        snprintf(value, sizeof value, "%s",
                 textOf(data.value.dateTime->ft->getStringFormat(data.value.dateTime, NULL)));
    } else if (data.type == CMPI_ref) {
        snprintf(value, sizeof value, "to %s", textOf(data.value.ref->ft->getClassName(data.value.ref, NULL)));
    } else if (data.type == CMPI_instance) {
        const CMPIInstance* instance = data.value.inst;
        snprintf(value, sizeof value, "of %s", textOf(instance->ft->getProperty(instance, "Id", NULL).value.string));
    }
    const size_t used = strlen(text);
    snprintf(text + used, size - used, "%s:%04x=%s;", name, data.type, value);
}

static CMPIStatus describeArguments(const CMPIResult* result, const CMPIArgs* in)
{
    char text[1024] = "";
    for (CMPICount i = 0; i < in->ft->getArgCount(in, NULL); ++i) {
        CMPIString* name = NULL;
        const CMPIData data = in->ft->getArgAt(in, i, &name, NULL);
        describe(text, sizeof text, textOf(name), data);
    }
    result->ft->returnData(result, (const CMPIValue*)text, CMPI_chars);
    return result->ft->returnDone(result);
}

static CMPIStatus trap(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                       const CMPIArgs* in)
{
    const char* kind = textOf(in->ft->getArg(in, "Kind", NULL).value.string);
    const CMPIStatus status = doTrap(gBroker, context, path, kind);
    const CMPIValue zero = {.uint32 = 0};
    if (status.rc != CMPI_RC_OK) {
        return status;
    }
    result->ft->returnData(result, &zero, CMPI_uint32);
    return strcmp(kind, "no returnDone") == 0 ? kOk : result->ft->returnDone(result);
}

/* Calls back into the server: how many instances of Probe_Bulk does it say there are? */
static CMPIStatus countByUpcall(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path)
{
    CMPIStatus status = kOk;
    CMPIUint32 count = 0;
    CMPIObjectPath* bulk =
        gBroker->eft->newObjectPath(gBroker, textOf(path->ft->getNameSpace(path, NULL)), "Probe_Bulk", NULL);
    CMPIEnumeration* names = gBroker->bft->enumerateInstanceNames(gBroker, context, bulk, &status);
    if (names == NULL) {
        return status;
    }
    for (; names->ft->hasNext(names, NULL); names->ft->getNext(names, NULL)) {
        ++count;
    }
    return returnNumber(result, count);
}

/* Creates and changes an instance of a class of another module, which refuses to delete it. The number is that of the
 * steps that went as expected. */
static CMPIStatus changeProvidedByUpcall(const CMPIContext* context, const CMPIResult* result,
                                         const CMPIObjectPath* path)
{
    CMPIStatus status = kOk;
    CMPIUint32 steps = 0;
    const char* const list[] = {"T1", NULL};
    CMPIObjectPath* other =
        gBroker->eft->newObjectPath(gBroker, textOf(path->ft->getNameSpace(path, NULL)), "Probe_Other", NULL);
    CMPIInstance* instance = gBroker->eft->newInstance(gBroker, other, NULL);
    setText(instance, "T1", "modified");
    CMPIObjectPath* made = gBroker->bft->createInstance(gBroker, context, other, instance, &status);
    if (made == NULL) {
        return status;
    }
    steps += strcmp(textOf(made->ft->getKey(made, "Id", NULL).value.string), "bulk-0001000") == 0;
    steps += gBroker->bft->modifyInstance(gBroker, context, made, instance, (const char**)list).rc == CMPI_RC_OK;
    CMPIData data = gBroker->bft->getProperty(gBroker, context, made, "T1", &status);
    steps += data.type == CMPI_string && strcmp(textOf(data.value.string), "modified") == 0;
    steps +=
        gBroker->bft->setProperty(gBroker, context, made, "T1", (const CMPIValue*)"set", CMPI_chars).rc == CMPI_RC_OK;
    data = gBroker->bft->getProperty(gBroker, context, made, "T1", &status);
    steps += data.type == CMPI_string && strcmp(textOf(data.value.string), "set") == 0;
    steps += gBroker->bft->deleteInstance(gBroker, context, made).rc == (CMPIrc)99;
    return returnNumber(result, steps);
}

/* Creates, changes and deletes a stored instance. The number is that of the steps that succeeded. */
static CMPIStatus changeByUpcall(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path)
{
    CMPIStatus status = kOk;
    CMPIUint32 steps = 0;
    CMPIObjectPath* stored =
        gBroker->eft->newObjectPath(gBroker, textOf(path->ft->getNameSpace(path, NULL)), "Probe_Stored", NULL);
    stored->ft->addKey(stored, "Id", (const CMPIValue*)"by upcall", CMPI_chars);
    CMPIInstance* instance = gBroker->eft->newInstance(gBroker, stored, NULL);
    setText(instance, "Id", "by upcall");
    steps += gBroker->bft->createInstance(gBroker, context, stored, instance, &status) != NULL;
    setText(instance, "T1", "modified");
    steps += gBroker->bft->modifyInstance(gBroker, context, stored, instance, NULL).rc == CMPI_RC_OK;
    CMPIData data = gBroker->bft->getProperty(gBroker, context, stored, "T1", &status);
    steps += data.type == CMPI_string && strcmp(textOf(data.value.string), "modified") == 0;
    steps +=
        gBroker->bft->setProperty(gBroker, context, stored, "T1", (const CMPIValue*)"set", CMPI_chars).rc == CMPI_RC_OK;
    data = gBroker->bft->getProperty(gBroker, context, stored, "T1", &status);
    steps += data.type == CMPI_string && strcmp(textOf(data.value.string), "set") == 0;
    steps += gBroker->bft->deleteInstance(gBroker, context, stored).rc == CMPI_RC_OK;
    steps += gBroker->bft->getInstance(gBroker, context, stored, NULL, &status) == NULL &&
             status.rc == CMPI_RC_ERR_NOT_FOUND;
    return returnNumber(result, steps);
}

/* The bits of brokerCapabilities in CMPI 2.0 whose functions work. */
static CMPIUint32 servedCapabilities(const CMPIContext* context, const CMPIObjectPath* path)
{
    const CMPIBrokerFT* bft = gBroker->bft;
    const CMPIBrokerEncFT* eft = gBroker->eft;
    const char* const kText = "served";
    CMPIStatus status = kOk;
    CMPIObjectPath* stored =
        eft->newObjectPath(gBroker, textOf(path->ft->getNameSpace(path, NULL)), "Probe_Stored", NULL);
    stored->ft->addKey(stored, "Id", (const CMPIValue*)kText, CMPI_chars);
    CMPIInstance* instance = eft->newInstance(gBroker, stored, NULL);
    setText(instance, "Id", kText);
    CMPIUint32 served = bft->enumerateInstances(gBroker, context, stored, NULL, NULL) != NULL ? 0x1 : 0;
    const int isMade = bft->createInstance(gBroker, context, stored, instance, NULL) != NULL;
    const CMPIrc set = bft->setProperty(gBroker, context, stored, "T1", (const CMPIValue*)kText, CMPI_chars).rc;
    served |= set == CMPI_RC_OK ? 0x2 : 0;
    const CMPIrc modified = bft->modifyInstance(gBroker, context, stored, instance, NULL).rc;
    const CMPIrc deleted = bft->deleteInstance(gBroker, context, stored).rc;
    served |= isMade && modified == CMPI_RC_OK && deleted == CMPI_RC_OK ? 0x4 : 0;
    served |= bft->associatorNames(gBroker, context, stored, NULL, NULL, NULL, NULL, NULL) != NULL ? 0x8 : 0;
    served |= bft->execQuery(gBroker, context, stored, "SELECT * FROM Probe_Stored", "WQL", NULL) != NULL ? 0x10 : 0;
    /* Both normal forms of queries and the filters of indications are made of select expressions. */
    served |= eft->newSelectExp(gBroker, "SELECT * FROM X", "WQL", NULL, NULL) != NULL ? 0x20 | 0x80 : 0;
    stored->ft->getClassQualifier(stored, "Description", &status);
    served |= status.rc != CMPI_RC_ERR_NOT_SUPPORTED ? 0x40 : 0;
    CMPIMutex mutex = gBroker->xft->newMutex(0);
    served |= mutex != NULL ? 0x100 : 0;
    gBroker->xft->destroyMutex(mutex);
    const CMPIGcStat* mark = gBroker->mft->mark(gBroker, NULL);
    served |= mark != NULL && gBroker->mft->release(gBroker, mark).rc == CMPI_RC_OK ? 0x4000 : 0;
    const CMPIError* error =
        eft->newCMPIError(gBroker, "o", "i", kText, ErrorSevLow, ErrorProbCauseOther, CMPI_RC_ERR_FAILED, NULL);
    served |= error != NULL && strcmp(textOf(error->ft->getMessage(error, NULL)), kText) == 0 ? 0x8000 : 0;
    return served;
}

static CMPIStatus invokeMethod(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* result,
                               const CMPIObjectPath* path, const char* method, const CMPIArgs* in, CMPIArgs* out)
{
    (void)mi;
    if (strcasecmp(method, "Echo") == 0) {
        return echo(result, in, out);
    }
    if (strcasecmp(method, "SetCount") == 0) {
        return setCount(result, in);
    }
    if (strcasecmp(method, "Describe") == 0 || strcasecmp(method, "Undeclared") == 0) {
        return describeArguments(result, in);
    }
    if (strcasecmp(method, "CountByUpcall") == 0) {
        return countByUpcall(context, result, path);
    }
    if (strcasecmp(method, "ClaimedCapabilities") == 0) {
        return returnNumber(result, gBroker->bft->brokerCapabilities);
    }
    if (strcasecmp(method, "ServedCapabilities") == 0) {
        return returnNumber(result, servedCapabilities(context, path));
    }
    if (strcasecmp(method, "ChangeByUpcall") == 0) {
        return changeByUpcall(context, result, path);
    }
    if (strcasecmp(method, "ChangeProvidedByUpcall") == 0) {
        return changeProvidedByUpcall(context, result, path);
    }
    if (strcasecmp(method, "Trap") == 0) {
        return trap(context, result, path, in);
    }
    const CMPIStatus status = doInProcess(gBroker, result, method);
    return status.rc == CMPI_RC_ERR_METHOD_NOT_FOUND ? failure(CMPI_RC_ERR_METHOD_NOT_AVAILABLE, method) : status;
}

static CMPIStatus cleanupMethods(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean terminating)
{
    (void)mi, (void)context, (void)terminating;
    return kOk;
}

static const CMPIInstanceMIFT kInstanceTable = {
    CMPIVersion200,         CMPIVersion200,     "instanceProbe", cleanupInstances,
    enumerateInstanceNames, enumerateInstances, getInstance,     createInstance,
    modifyInstance,         deleteInstance,     execQuery,       NULL};
static const CMPIMethodMIFT kMethodTable = {CMPIVersion200, CMPIVersion200, "methodProbe", cleanupMethods,
                                            invokeMethod};

static CMPIInstanceMI gInstanceMI = {NULL, &kInstanceTable};
static CMPIMethodMI gMethodMI = {NULL, &kMethodTable};

CMPIInstanceMI* Probe_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status);
CMPIMethodMI* Probe_Create_MethodMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status);

CMPIInstanceMI* Probe_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status)
{
    (void)context, (void)status;
    gBroker = broker;
    return &gInstanceMI;
}

CMPIMethodMI* Probe_Create_MethodMI(const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status)
{
    (void)context, (void)status;
    gBroker = broker;
    return &gMethodMI;
}
