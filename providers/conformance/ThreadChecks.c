// SPDX-License-Identifier: MIT
/* Threads, locks and keys of the broker, and the provider's own threads. */
#include "Conformance.h"

#include <errno.h>
#include <stdlib.h>
#include <string.h>
#include <time.h>

typedef struct Shared
{
    const CMPIBroker* mb;
    CMPIMutex mutex;
    CMPICondition condition;
    int counter;
    int ready;
} Shared;

static CMPIThreadReturn countUp(void* parm)
{
    Shared* shared = parm;
    for (int i = 0; i < 10000; ++i) {
        shared->mb->xft->lockMutex(shared->mutex);
        ++shared->counter;
        shared->mb->xft->unlockMutex(shared->mutex);
    }
    return &shared->counter;
}

static const char* threadsShareAMutex(const Env* env)
{
    const CMPIBrokerExtFT* xft = env->mb->xft;
    Shared shared = {env->mb, xft->newMutex(0), NULL, 0, 0};
    CMPIThread threads[4];
    for (int i = 0; i < 4; ++i) {
        threads[i] = xft->newThread(countUp, &shared, 0);
        REQUIRE(threads[i] != NULL);
    }
    for (int i = 0; i < 4; ++i) {
        CMPIThreadReturn result = NULL;
        REQUIRE(xft->joinThread(threads[i], &result) == 0 && result == &shared.counter);
    }
    REQUIRE(shared.counter == 40000);
    xft->lockMutex(shared.mutex);
    xft->lockMutex(shared.mutex); /* recursive */
    xft->unlockMutex(shared.mutex);
    xft->unlockMutex(shared.mutex);
    xft->destroyMutex(shared.mutex);
    return NULL;
}

static CMPIThreadReturn makeReady(void* parm)
{
    Shared* shared = parm;
    shared->mb->xft->lockMutex(shared->mutex);
    shared->ready = 1;
    shared->mb->xft->signalCondition(shared->condition);
    shared->mb->xft->unlockMutex(shared->mutex);
    shared->mb->xft->exitThread(shared);
    return NULL;
}

static const char* conditionsWake(const Env* env)
{
    const CMPIBrokerExtFT* xft = env->mb->xft;
    Shared shared = {env->mb, xft->newMutex(0), xft->newCondition(0), 0, 0};
    xft->lockMutex(shared.mutex);
    struct timespec past = {time(NULL) - 1, 0};
    REQUIRE(xft->timedCondWait(shared.condition, shared.mutex, &past) == ETIMEDOUT);
    const CMPIThread thread = xft->newThread(makeReady, &shared, 0);
    while (!shared.ready) {
        struct timespec limit = {time(NULL) + 20, 0};
        REQUIRE(xft->timedCondWait(shared.condition, shared.mutex, &limit) == 0);
    }
    xft->unlockMutex(shared.mutex);
    CMPIThreadReturn result = NULL;
    REQUIRE(xft->joinThread(thread, &result) == 0 && result == &shared);
    REQUIRE(xft->destroyCondition2(shared.condition) == 0 && xft->destroyMutex2(shared.mutex) == 0);
    REQUIRE(xft->condWait(NULL, NULL) == EINVAL && xft->lockMutex2(NULL) == EINVAL);
    return NULL;
}

static int gOnceCount;
static int gKeyEnds;

static void countOnce(void)
{
    ++gOnceCount;
}

static void endKey(void* value)
{
    gKeyEnds += *(int*)value;
}

typedef struct KeyUse
{
    const CMPIBroker* mb;
    CMPIThreadKey key;
    int value;
} KeyUse;

static CMPIThreadReturn useKey(void* parm)
{
    KeyUse* use = parm;
    const int failed = use->mb->xft->setThreadSpecific(use->key, &use->value);
    return failed == 0 && use->mb->xft->getThreadSpecific(use->key) == &use->value ? use : NULL;
}

static const char* keysBelongToThreads(const Env* env)
{
    const CMPIBrokerExtFT* xft = env->mb->xft;
    CMPIThreadKey key;
    int value = 1;
    REQUIRE(xft->createThreadKey(&key, NULL) == 0 && xft->getThreadSpecific(key) == NULL);
    REQUIRE(xft->setThreadSpecific(key, &value) == 0 && xft->getThreadSpecific(key) == &value);
    REQUIRE(xft->destroyThreadKey(key) == 0 && xft->threadSleep(1) == 0);
    return NULL;
}

static const char* keysEndAndOnceIsOnce(const Env* env)
{
    const CMPIBrokerExtFT* xft = env->mb->xft;
    static int once;
    gOnceCount = 0;
    once = 0;
    REQUIRE(xft->threadOnce(&once, countOnce) == 1 && xft->threadOnce(&once, countOnce) == 1 && gOnceCount == 1);
    KeyUse use = {env->mb, 0, 5};
    gKeyEnds = 0;
    REQUIRE(xft->createThreadKey(&use.key, endKey) == 0);
    REQUIRE(xft->getThreadSpecific(use.key) == NULL);
    CMPIThreadReturn result = NULL;
    REQUIRE(xft->joinThread(xft->newThread(useKey, &use, 0), &result) == 0 && result == &use);
    REQUIRE(gKeyEnds == 5 && xft->getThreadSpecific(use.key) == NULL);
    REQUIRE(xft->destroyThreadKey(use.key) == 0);
    char* file = xft->resolveFileName("x");
    REQUIRE(file != NULL && strstr(file, "libx.so") != NULL);
    free(file);
    return NULL;
}

typedef struct Visitor
{
    const CMPIBroker* mb;
    CMPIContext* prepared; /* NULL: the thread does not attach */
    const char* failure;
} Visitor;

static const char* visit(const Visitor* visitor)
{
    const Env env = {visitor->mb, visitor->prepared, NULL, NULL, NULL, NULL};
    const CMPIEnumeration* found =
        visitor->mb->bft->enumerateInstances(visitor->mb, visitor->prepared, newPath(&env, "TST_Item"), NULL, NULL);
    REQUIRE(found != NULL && found->ft->hasNext(found, NULL));
    return NULL;
}

static CMPIThreadReturn visitOnThread(void* parm)
{
    Visitor* visitor = parm;
    if (visitor->prepared != NULL) {
        visitor->mb->bft->attachThread(visitor->mb, visitor->prepared);
    }
    visitor->failure = visit(visitor);
    if (visitor->prepared != NULL) {
        visitor->mb->bft->detachThread(visitor->mb, visitor->prepared);
    }
    return NULL;
}

/* Returns: the failure of an upcall on a thread with that context, or without one. */
static const char* visitWith(const Env* env, CMPIContext* prepared)
{
    Visitor visitor = {env->mb, prepared, "the thread did not run"};
    CMPIThreadReturn result = NULL;
    const CMPIThread thread = env->mb->xft->newThread(visitOnThread, &visitor, 0);
    REQUIRE(thread != NULL && env->mb->xft->joinThread(thread, &result) == 0);
    return visitor.failure;
}

static const char* attachedThreadsMayCall(const Env* env)
{
    CMPIContext* prepared = env->mb->bft->prepareAttachThread(env->mb, env->ctx);
    REQUIRE(prepared != NULL && prepared != env->ctx);
    return visitWith(env, prepared);
}

static const char* otherThreadsMayCall(const Env* env)
{
    return visitWith(env, NULL);
}

const CheckRow kThreadChecks[] = {{"threads share a mutex", threadsShareAMutex, kStandard},
                                  {"conditions wake", conditionsWake, kOursOnly},
                                  {"keys belong to threads", keysBelongToThreads, kStandard},
                                  {"keys end and once is once", keysEndAndOnceIsOnce, kOursOnly},
                                  {"attached threads may call", attachedThreadsMayCall, kStandard},
                                  {"other threads may call", otherThreadsMayCall, kOursOnly},
                                  {NULL, NULL, kOursOnly}};
