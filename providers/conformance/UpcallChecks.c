// SPDX-License-Identifier: MIT
/* The context, and upcalls made with it. The server answers upcalls by this provider itself. */
#include "Conformance.h"

#include <string.h>

static const char* contextHasItsEntries(const Env* env)
{
    const CMPIContextFT* ft = env->ctx->ft;
    CMPIStatus rc = kGarbage;
    REQUIRE(ft->getEntry(env->ctx, CMPIInvocationFlags, &rc).type == CMPI_uint32 && rc.rc == CMPI_RC_OK);
    REQUIRE(ft->getEntry(env->ctx, CMPIPrincipal, NULL).type == CMPI_string);
    REQUIRE(strcmp(textOf(ft->getEntry(env->ctx, CMPIInitNameSpace, NULL).value.string), NS) == 0);
    REQUIRE(ft->getEntry(env->ctx, CMPIAcceptLanguage, NULL).type == CMPI_string);
    REQUIRE(ft->getEntry(env->ctx, "Nope", &rc).state == (CMPI_nullValue | CMPI_notFound));
    REQUIRE(rc.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY);
    const CMPICount count = ft->getEntryCount(env->ctx, NULL);
    REQUIRE(count >= 4);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = NULL;
        const CMPIData at = ft->getEntryAt(env->ctx, i, &name, NULL);
        REQUIRE(name != NULL && at.type == ft->getEntry(env->ctx, textOf(name), NULL).type);
    }
    REQUIRE(ft->addEntry(env->ctx, "CMPIContentLanguage", (const CMPIValue*)"en", CMPI_chars).rc == CMPI_RC_OK);
    REQUIRE(ft->getEntryCount(env->ctx, NULL) == count + 1);
    return NULL;
}

static const char* enumerationsAreWalked(const Env* env)
{
    CMPIStatus rc = kGarbage;
    const CMPIObjectPath* path = newPath(env, "TST_Item");
    const CMPIEnumeration* found = env->mb->bft->enumerateInstances(env->mb, env->ctx, path, NULL, &rc);
    REQUIRE(found != NULL && rc.rc == CMPI_RC_OK && rc.msg == NULL);
    int count = 0;
    for (; found->ft->hasNext(found, NULL); ++count) {
        REQUIRE(found->ft->hasNext(found, NULL));
        const CMPIData data = found->ft->getNext(found, &rc);
        REQUIRE(data.type == CMPI_instance && rc.rc == CMPI_RC_OK);
        const CMPIObjectPath* own = data.value.inst->ft->getObjectPath(data.value.inst, NULL);
        REQUIRE(strcmp(textOf(own->ft->getNameSpace(own, NULL)), NS) == 0);
        REQUIRE(own->ft->getKey(own, "Id", NULL).type == CMPI_string);
    }
    REQUIRE(count == 3);
    REQUIRE((found->ft->getNext(found, &rc).state & CMPI_nullValue) != 0 && rc.rc == CMPI_RC_NO_MORE_ELEMENTS);
    return NULL;
}

static const char* enumerationsBecomeArrays(const Env* env)
{
    const CMPIObjectPath* path = newPath(env, "TST_Item");
    const CMPIEnumeration* found = env->mb->bft->enumerateInstances(env->mb, env->ctx, path, NULL, NULL);
    const CMPIArray* array = found->ft->toArray(found, NULL);
    REQUIRE(array->ft->getSize(array, NULL) == 3 && array->ft->getSimpleType(array, NULL) == CMPI_instance);
    REQUIRE(found->ft->hasNext(found, NULL));
    found->ft->getNext(found, NULL);
    REQUIRE(array->ft->getSize(array, NULL) == 3);
    return NULL;
}

static const char* namesLeadToInstances(const Env* env)
{
    const CMPIEnumeration* names =
        env->mb->bft->enumerateInstanceNames(env->mb, env->ctx, newPath(env, "TST_Item"), NULL);
    REQUIRE(names != NULL && names->ft->hasNext(names, NULL));
    const CMPIData name = names->ft->getNext(names, NULL);
    REQUIRE(name.type == CMPI_ref);
    CMPIStatus rc = kGarbage;
    const char* list[] = {"Text", NULL};
    const CMPIInstance* found = env->mb->bft->getInstance(env->mb, env->ctx, name.value.ref, list, &rc);
    REQUIRE(found != NULL && rc.rc == CMPI_RC_OK);
    REQUIRE(strcmp(textOf(found->ft->getProperty(found, "Text", NULL).value.string), "item 0") == 0);
    const CMPIObjectPath* path = found->ft->getObjectPath(found, NULL);
    REQUIRE(strcmp(textOf(path->ft->toString(path, NULL)), NS ":TST_Item.Id=\"0\"") == 0);
    return NULL;
}

static const char* propertiesComeOneByOne(const Env* env)
{
    const CMPIEnumeration* names =
        env->mb->bft->enumerateInstanceNames(env->mb, env->ctx, newPath(env, "TST_Item"), NULL);
    const CMPIData name = names->ft->getNext(names, NULL);
    REQUIRE(strcmp(textOf(env->mb->bft->getProperty(env->mb, env->ctx, name.value.ref, "Text", NULL).value.string),
                   "item 0") == 0);
    return NULL;
}

static const char* failuresComeAsCodes(const Env* env)
{
    CMPIStatus rc = kGarbage;
    const CMPIBrokerFT* bft = env->mb->bft;
    REQUIRE(bft->enumerateInstances(env->mb, env->ctx, newPath(env, "TST_Unknown"), NULL, &rc) == NULL);
    REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_CLASS && strstr(textOf(rc.msg), "TST_Unknown") != NULL);
    const CMPIObjectPath* nowhere = env->mb->eft->newObjectPath(env->mb, "root/nowhere", "TST_Item", NULL);
    REQUIRE(bft->enumerateInstanceNames(env->mb, env->ctx, nowhere, &rc) == NULL);
    REQUIRE(rc.rc == CMPI_RC_ERR_INVALID_NAMESPACE);
    return NULL;
}

/* A null path, and changes of a class whose provider has no functions for them. */
static const char* refusalsComeAsCodes(const Env* env)
{
    CMPIStatus rc = kGarbage;
    const CMPIBrokerFT* bft = env->mb->bft;
    REQUIRE(bft->getInstance(env->mb, env->ctx, NULL, NULL, &rc) == NULL && rc.rc == CMPI_RC_ERR_INVALID_PARAMETER);
    REQUIRE(bft->createInstance(env->mb, env->ctx, newPath(env, "TST_Item"), newInst(env, "TST_Item"), &rc) == NULL);
    REQUIRE(rc.rc == CMPI_RC_ERR_NOT_SUPPORTED);
    REQUIRE(bft->deleteInstance(env->mb, env->ctx, newPath(env, "TST_Item")).rc == CMPI_RC_ERR_NOT_SUPPORTED);
    REQUIRE(bft->modifyInstance(env->mb, env->ctx, newPath(env, "TST_Item"), newInst(env, "TST_Item"), NULL).rc ==
            CMPI_RC_ERR_NOT_SUPPORTED);
    REQUIRE(
        bft->setProperty(env->mb, env->ctx, newPath(env, "TST_Item"), "Text", (const CMPIValue*)"x", CMPI_chars).rc ==
        CMPI_RC_ERR_NOT_SUPPORTED);
    return NULL;
}

/* An upcall into the same provider has a frame of its own: objects made before it and its results stay. */
static const char* descends(const Env* env, CMPIUint32 levels, const char* trail)
{
    const CMPIString* before = env->mb->eft->newString(env->mb, "before", NULL);
    const CMPIArgs* in = env->mb->eft->newArgs(env->mb, NULL);
    CMPIArgs* out = env->mb->eft->newArgs(env->mb, NULL);
    const CMPIValue depth = {.uint32 = levels};
    in->ft->addArg(in, "Depth", &depth, CMPI_uint32);
    CMPIStatus rc = kGarbage;
    const CMPIData result =
        env->mb->bft->invokeMethod(env->mb, env->ctx, newPath(env, "TST_Check"), "Descend", in, out, &rc);
    REQUIRE(rc.rc == CMPI_RC_OK && result.type == CMPI_uint32 && result.value.uint32 == 0);
    REQUIRE(strcmp(textOf(out->ft->getArg(out, "Trail", NULL).value.string), trail) == 0);
    REQUIRE(strcmp(textOf(before), "before") == 0);
    return NULL;
}

static const char* upcallsReachTheirOwnProvider(const Env* env)
{
    return descends(env, 1, "01");
}

static const char* upcallsNest(const Env* env)
{
    return descends(env, 3, "0123");
}

static const char* unknownMethodsAreNotFound(const Env* env)
{
    const CMPIArgs* in = env->mb->eft->newArgs(env->mb, NULL);
    CMPIArgs* out = env->mb->eft->newArgs(env->mb, NULL);
    CMPIStatus rc = kGarbage;
    env->mb->bft->invokeMethod(env->mb, env->ctx, newPath(env, "TST_Check"), "Nope", in, out, &rc);
    REQUIRE(rc.rc == CMPI_RC_ERR_METHOD_NOT_FOUND);
    return NULL;
}

const CheckRow kContextChecks[] = {{"the context has its entries", contextHasItsEntries, kStandard},
                                   {NULL, NULL, kOursOnly}};
const CheckRow kUpcallChecks[] = {{"enumerations are walked", enumerationsAreWalked, kStandard},
                                  {"enumerations become arrays", enumerationsBecomeArrays, kOursOnly},
                                  {"names lead to instances", namesLeadToInstances, kStandard},
                                  {"properties come one by one", propertiesComeOneByOne, kOursOnly},
                                  {"failures come as codes", failuresComeAsCodes, kStandard},
                                  {"refusals come as codes", refusalsComeAsCodes, kOursOnly},
                                  {"upcalls reach their own provider", upcallsReachTheirOwnProvider, kStandard},
                                  {"unknown methods are not found", unknownMethodsAreNotFound, kStandard},
                                  {"upcalls nest", upcallsNest, kOursOnly},
                                  {NULL, NULL, kOursOnly}};
