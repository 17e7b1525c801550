// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/broker/BrokerTables.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <new>
#include <string>

#include <pthread.h>
#include <time.h>

// The platform's threads under CMPI's names. CMPI gives providers these so that they run on any platform; here each is
// one pthread call. Integer results are 0 or an errno, but for threadOnce().
namespace Pegasus::cmpi {
namespace {

// A CMPIThread is the pthread_t itself.
pthread_t native(CMPIThread thread)
{
    return reinterpret_cast<pthread_t>(thread);
}

// Ownership: the provider's; it calls free().
char* resolveFileName(const char* name)
{
    const std::string file = std::string("lib") + (name == nullptr ? "" : name) + ".so";
    return ::strdup(file.c_str());
}

CMPIThread newThread(CMPIThreadFunc start, void* parm, int detached)
{
    pthread_attr_t attributes;
    if (start == nullptr || ::pthread_attr_init(&attributes) != 0) {
        return nullptr;
    }
    ::pthread_attr_setdetachstate(&attributes, detached != 0 ? PTHREAD_CREATE_DETACHED : PTHREAD_CREATE_JOINABLE);
    pthread_t thread{};
    const int failed = ::pthread_create(&thread, &attributes, start, parm);
    ::pthread_attr_destroy(&attributes);
    // NOLINTNEXTLINE(performance-no-int-to-ptr): a pthread_t is a number here, a CMPIThread a pointer
    return failed != 0 ? nullptr : reinterpret_cast<CMPIThread>(thread);
}

int joinThread(CMPIThread thread, CMPIThreadReturn* result)
{
    return ::pthread_join(native(thread), result);
}

int exitThread(CMPIThreadReturn result)
{
    ::pthread_exit(result);
}

int cancelThread(CMPIThread thread)
{
    return ::pthread_cancel(native(thread));
}

// Sleeps the whole time, across signals to the process.
int threadSleep(CMPIUint32 milliseconds)
{
    timespec left{static_cast<time_t>(milliseconds / 1000), static_cast<long>(milliseconds % 1000) * 1000000L};
    int failed = 0;
    while ((failed = ::clock_nanosleep(CLOCK_MONOTONIC, 0, &left, &left)) == EINTR) {
    }
    return failed;
}

static_assert(sizeof(pthread_once_t) == sizeof(int), "CMPI keeps the once control in an int");

// Success is 1, as on OpenPegasus, whose providers may take 0 for a failure.
int threadOnce(int* once, CMPIThreadOnceFunc function)
{
    return ::pthread_once(once, function) == 0 ? 1 : 0;
}

static_assert(sizeof(pthread_key_t) == sizeof(CMPIThreadKey), "CMPI keeps keys in unsigned ints");

int createThreadKey(CMPIThreadKey* key, CMPIThreadKeyCleanupFunc cleanup)
{
    return ::pthread_key_create(key, cleanup);
}

int destroyThreadKey(CMPIThreadKey key)
{
    return ::pthread_key_delete(key);
}

void* getThreadSpecific(CMPIThreadKey key)
{
    return ::pthread_getspecific(key);
}

int setThreadSpecific(CMPIThreadKey key, void* value)
{
    return ::pthread_setspecific(key, value);
}

pthread_mutex_t* mutexOf(CMPIMutex mutex)
{
    return static_cast<pthread_mutex_t*>(mutex);
}

// Recursive: providers lock again in functions that they call under the lock, and other brokers allow it.
CMPIMutex newMutex(int)
{
    auto* mutex = new (std::nothrow) pthread_mutex_t;
    if (mutex == nullptr) {
        return nullptr;
    }
    pthread_mutexattr_t attributes;
    ::pthread_mutexattr_init(&attributes);
    ::pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
    ::pthread_mutex_init(mutex, &attributes);
    ::pthread_mutexattr_destroy(&attributes);
    return mutex;
}

int destroyMutex2(CMPIMutex mutex)
{
    if (mutex == nullptr) {
        return EINVAL;
    }
    const int failed = ::pthread_mutex_destroy(mutexOf(mutex));
    if (failed == 0) {
        delete mutexOf(mutex);
    }
    return failed;
}

int lockMutex2(CMPIMutex mutex)
{
    return mutex == nullptr ? EINVAL : ::pthread_mutex_lock(mutexOf(mutex));
}

int unlockMutex2(CMPIMutex mutex)
{
    return mutex == nullptr ? EINVAL : ::pthread_mutex_unlock(mutexOf(mutex));
}

void destroyMutex(CMPIMutex mutex)
{
    destroyMutex2(mutex);
}

void lockMutex(CMPIMutex mutex)
{
    lockMutex2(mutex);
}

void unlockMutex(CMPIMutex mutex)
{
    unlockMutex2(mutex);
}

pthread_cond_t* conditionOf(CMPICondition condition)
{
    return static_cast<pthread_cond_t*>(condition);
}

CMPICondition newCondition(int)
{
    auto* condition = new (std::nothrow) pthread_cond_t;
    if (condition != nullptr) {
        ::pthread_cond_init(condition, nullptr);
    }
    return condition;
}

int destroyCondition2(CMPICondition condition)
{
    if (condition == nullptr) {
        return EINVAL;
    }
    const int failed = ::pthread_cond_destroy(conditionOf(condition));
    if (failed == 0) {
        delete conditionOf(condition);
    }
    return failed;
}

void destroyCondition(CMPICondition condition)
{
    destroyCondition2(condition);
}

int condWait(CMPICondition condition, CMPIMutex mutex)
{
    if (condition == nullptr || mutex == nullptr) {
        return EINVAL;
    }
    return ::pthread_cond_wait(conditionOf(condition), mutexOf(mutex));
}

// `wait` is an absolute time of the real-time clock.
int timedCondWait(CMPICondition condition, CMPIMutex mutex, timespec* wait)
{
    if (condition == nullptr || mutex == nullptr || wait == nullptr) {
        return EINVAL;
    }
    return ::pthread_cond_timedwait(conditionOf(condition), mutexOf(mutex), wait);
}

int signalCondition(CMPICondition condition)
{
    return condition == nullptr ? EINVAL : ::pthread_cond_signal(conditionOf(condition));
}

} // namespace

const CMPIBrokerExtFT kThreadTable{
    CMPIVersion200,    resolveFileName,   newThread,        joinThread,      exitThread,
    cancelThread,      threadSleep,       threadOnce,       createThreadKey, destroyThreadKey,
    getThreadSpecific, setThreadSpecific, newMutex,         destroyMutex,    lockMutex,
    unlockMutex,       newCondition,      destroyCondition, condWait,        timedCondWait,
    signalCondition,   destroyMutex2,     lockMutex2,       unlockMutex2,    destroyCondition2};

} // namespace Pegasus::cmpi
