// SPDX-License-Identifier: MIT
/* Clones and releases. */
#include "Conformance.h"

#include <malloc.h>
#include <pthread.h>
#include <string.h>

static const char* clonesAreApart(const Env* env)
{
    CMPIObjectPath* path = newPath(env, "TST_Root");
    path->ft->addKey(path, "Id", (const CMPIValue*)"a", CMPI_chars);
    CMPIStatus rc = kGarbage;
    CMPIObjectPath* copy = path->ft->clone(path, &rc);
    REQUIRE(copy != NULL && copy != path && rc.rc == CMPI_RC_OK && rc.msg == NULL);
    path->ft->addKey(path, "Id", (const CMPIValue*)"b", CMPI_chars);
    path->ft->release(path);
    REQUIRE(strcmp(textOf(copy->ft->getKey(copy, "Id", NULL).value.string), "a") == 0);
    REQUIRE(copy->ft->release(copy).rc == CMPI_RC_OK);

    CMPIInstance* instance = newInst(env, "TST_Root");
    instance->ft->setProperty(instance, "Text", (const CMPIValue*)"a", CMPI_chars);
    CMPIInstance* second = instance->ft->clone(instance, NULL);
    instance->ft->setProperty(instance, "Text", (const CMPIValue*)"b", CMPI_chars);
    REQUIRE(strcmp(textOf(second->ft->getProperty(second, "Text", NULL).value.string), "a") == 0);
    second->ft->release(second);

    CMPIArray* array = env->mb->eft->newArray(env->mb, 1, CMPI_uint8, NULL);
    CMPIArray* other = array->ft->clone(array, NULL);
    const CMPIValue one = {.uint8 = 1};
    array->ft->setElementAt(array, 0, &one, CMPI_uint8);
    REQUIRE(other->ft->getElementAt(other, 0, NULL).state == CMPI_nullValue);
    other->ft->release(other);

    CMPIArgs* args = env->mb->eft->newArgs(env->mb, NULL);
    CMPIArgs* same = args->ft->clone(args, NULL);
    args->ft->addArg(args, "A", &one, CMPI_uint8);
    REQUIRE(same->ft->getArgCount(same, NULL) == 0);
    same->ft->release(same);
    return NULL;
}

static void* releaseAll(void* objects)
{
    void** list = objects;
    CMPIString* string = list[0];
    CMPIDateTime* when = list[1];
    CMPIInstance* instance = list[2];
    string->ft->release(string);
    when->ft->release(when);
    instance->ft->release(instance);
    return NULL;
}

static const char* clonesEndOnOtherThreads(const Env* env)
{
    CMPIString* string = env->mb->eft->newString(env->mb, "x", NULL);
    CMPIDateTime* when = env->mb->eft->newDateTime(env->mb, NULL);
    CMPIInstance* instance = newInst(env, "TST_Everything");
    void* clones[] = {string->ft->clone(string, NULL), when->ft->clone(when, NULL),
                      instance->ft->clone(instance, NULL)};
    pthread_t thread;
    REQUIRE(pthread_create(&thread, NULL, releaseAll, clones) == 0);
    REQUIRE(pthread_join(thread, NULL) == 0);
    REQUIRE(strcmp(textOf(string), "x") == 0);
    return NULL;
}

static const char* releasesKeepMemoryFlat(const Env* env)
{
    const size_t before = mallinfo2().uordblks;
    for (int i = 0; i < 10000; ++i) {
        CMPIInstance* instance = newInst(env, "TST_Everything");
        CMPIValue value = {.string = env->mb->eft->newString(env->mb, "some text", NULL)};
        instance->ft->setProperty(instance, "S", &value, CMPI_string);
        value.string->ft->release(value.string);
        CMPIObjectPath* path = instance->ft->getObjectPath(instance, NULL);
        path->ft->release(path);
        instance->ft->release(instance);
    }
    REQUIRE(mallinfo2().uordblks < before + 10000 * 400); /* newInst keeps the path it made; nothing else may stay */
    return NULL;
}

static const char* argumentsMayBeReleased(const Env* env)
{
    REQUIRE(env->ctx->ft->release((CMPIContext*)env->ctx).rc == CMPI_RC_OK);
    REQUIRE(env->op->ft->release((CMPIObjectPath*)env->op).rc == CMPI_RC_OK);
    REQUIRE(env->in->ft->release((CMPIArgs*)env->in).rc == CMPI_RC_OK);
    REQUIRE(env->out->ft->release(env->out).rc == CMPI_RC_OK);
    REQUIRE(env->ctx->ft->getEntryCount(env->ctx, NULL) > 0);
    REQUIRE(env->op->ft->getClassName(env->op, NULL) != NULL);
    REQUIRE(env->in->ft->getArgCount(env->in, NULL) == 1);
    return NULL;
}

static const char* resultMayBeReleased(const Env* env)
{
    REQUIRE(env->result->ft->release((CMPIResult*)env->result).rc == CMPI_RC_OK);
    return NULL; /* the answer to this check is returned by it */
}

static const char* memoryBelongsToTheFrame(const Env* env)
{
    const CMPIBrokerMemFT* mft = env->mb->mft;
    CMPIStatus rc = kGarbage;
    CMPIGcStat* outer = mft->mark(env->mb, &rc);
    REQUIRE(outer != NULL && rc.rc == CMPI_RC_OK);
    char* text = mft->cmpiStrDup(env->mb, "12345");
    text = mft->cmpiRealloc(env->mb, text, 100);
    REQUIRE(strcmp(text, "12345") == 0);
    unsigned char* zeros = mft->cmpiCalloc(env->mb, 10, 10);
    REQUIRE(zeros[0] == 0 && zeros[99] == 0);
    REQUIRE(mft->cmpiCalloc(env->mb, (size_t)-1, 16) == NULL);
    mft->cmpiFree(env->mb, text);
    REQUIRE(mft->cmpiMalloc(env->mb, 1000) != NULL);
    REQUIRE(mft->mark(env->mb, NULL) != NULL); /* left open on purpose */
    REQUIRE(mft->release(env->mb, outer).rc == CMPI_RC_OK);
    REQUIRE(mft->release(env->mb, NULL).rc == CMPI_RC_ERR_INVALID_HANDLE);
    mft->freeString(env->mb, env->mb->eft->newString(env->mb, "x", NULL));
    mft->freeInstance(env->mb, newInst(env, "TST_Root"));
    REQUIRE(mft->cmpiMalloc(env->mb, 10) != NULL);
    REQUIRE(mft->mark(env->mb, NULL) != NULL); /* and forgotten */
    return NULL;
}

const CheckRow kCloneChecks[] = {{"clones are apart", clonesAreApart, kStandard},
                                 {"clones end on other threads", clonesEndOnOtherThreads, kOursOnly},
                                 {"releases keep memory flat", releasesKeepMemoryFlat, kOursOnly},
                                 {"arguments may be released", argumentsMayBeReleased, kStandard},
                                 {"the result may be released", resultMayBeReleased, kOursOnly},
                                 {"memory belongs to the frame", memoryBelongsToTheFrame, kOursOnly},
                                 {NULL, NULL, kOursOnly}};
