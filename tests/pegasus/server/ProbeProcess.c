// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/ProbeProcess.h"

#include <errno.h>
#include <signal.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <strings.h>
#include <sys/mman.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

/* Takes memory until it is exhausted. */
static CMPIStatus grow(const CMPIBroker* broker)
{
    enum
    {
        kBlock = 1 << 20
    };
    for (void** last = NULL;;) {
        void** block = malloc(kBlock);
        if (block == NULL) {
            while (last != NULL) {
                block = *last;
                free(last);
                last = block;
            }
            const CMPIStatus failed = {CMPI_RC_ERR_FAILED, broker->eft->newString(broker, "no more memory", NULL)};
            return failed;
        }
        memset(block, 1, kBlock);
        *block = last;
        last = block;
    }
}

/* Takes 64 GB of addresses and none of memory. */
static CMPIUint32 reserve(void)
{
    return mmap(NULL, 64ull << 30, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0) != MAP_FAILED;
}

/* Returns: the error of the write. */
static CMPIUint32 writeToClosedPipe(void)
{
    int ends[2];
    if (pipe(ends) != 0) {
        return 0;
    }
    close(ends[0]);
    const CMPIUint32 error = write(ends[1], "x", 1) < 0 ? (CMPIUint32)errno : 0;
    close(ends[1]);
    return error;
}

/* Prints more than any log should hold. */
static CMPIUint32 flood(void)
{
    CMPIUint32 i = 0;
    for (; i < 60000; ++i) {
        printf("%07u the probe has something to say, again and again and again and again and again\n", (unsigned)i);
    }
    return i;
}

/* Starts a process that leaves group, session and parent. Returns: its id. */
static CMPIUint32 leaveChild(void)
{
    int ends[2];
    int pid = 0;
    if (pipe(ends) != 0) {
        return 0;
    }
    const pid_t child = fork();
    if (child == 0) {
        setsid();
        if (fork() == 0) {
            pid = getpid();
            if (write(ends[1], &pid, sizeof pid) > 0) {
                sleep(60);
            }
        }
        _exit(0);
    }
    waitpid(child, NULL, 0);
    if (read(ends[0], &pid, sizeof pid) < 0) {
        pid = 0;
    }
    return (CMPIUint32)pid;
}

/* What the agent may do: the lines of /proc/self/status that say so, then limits by name. */
static CMPIStatus describeConfinement(const CMPIResult* result)
{
    static const struct
    {
        const char* name;
        int resource;
    } kLimits[] = {{"data", RLIMIT_DATA}, {"file", RLIMIT_FSIZE}, {"core", RLIMIT_CORE}, {"address", RLIMIT_AS}};
    char text[1024] = "";
    char line[256];
    FILE* status = fopen("/proc/self/status", "r");
    while (status != NULL && fgets(line, sizeof line, status) != NULL) {
        if (strncmp(line, "NoNewPrivs", 10) == 0 || strncmp(line, "Cap", 3) == 0) {
            strncat(text, line, sizeof text - strlen(text) - 1);
        }
    }
    if (status != NULL) {
        fclose(status);
    }
    for (size_t i = 0; i < sizeof kLimits / sizeof kLimits[0]; ++i) {
        struct rlimit limit;
        getrlimit((unsigned)kLimits[i].resource, &limit);
        snprintf(line, sizeof line, "%s=%lld\n", kLimits[i].name, (long long)limit.rlim_max);
        strncat(text, line, sizeof text - strlen(text) - 1);
    }
    result->ft->returnData(result, (const CMPIValue*)text, CMPI_chars);
    return result->ft->returnDone(result);
}

/* A library's teardown that its other threads make unsafe. */
static int gExits;
__attribute__((destructor)) static void tearDown(void)
{
    if (gExits) {
        abort();
    }
}

/* Ends the process, or hangs, when the method is one of these. */
static void end(const char* method)
{
    if (strcasecmp(method, "Crash") == 0) {
        printf("lane 3 is dark\n");
        fprintf(stderr, "\033[2Jgiving up");
        raise(SIGSEGV);
    }
    if (strcasecmp(method, "ForkAndCrash") == 0) { /* the children keep the agent's descriptors */
        if (fork() == 0 || (fork() == 0 && setsid() > 0)) {
            sleep(20);
            _exit(0);
        }
        raise(SIGSEGV);
    }
    if (strcasecmp(method, "Exit") == 0) {
        gExits = 1;
        exit(3);
    }
    while (strcasecmp(method, "Hang") == 0) {
        pause();
    }
}

static CMPIUint32 ownId(void)
{
    return (CMPIUint32)getpid();
}

static const struct
{
    const char* method;
    CMPIUint32 (*number)(void);
} kNumbers[] = {{"ProcessId", ownId},
                {"Reserve", reserve},
                {"WriteToClosedPipe", writeToClosedPipe},
                {"Flood", flood},
                {"LeaveChild", leaveChild}};

CMPIStatus doInProcess(const CMPIBroker* broker, const CMPIResult* result, const char* method)
{
    const CMPIStatus unknown = {CMPI_RC_ERR_METHOD_NOT_FOUND, NULL};
    end(method);
    if (strcasecmp(method, "Grow") == 0) {
        return grow(broker);
    }
    if (strcasecmp(method, "Confinement") == 0) {
        return describeConfinement(result);
    }
    for (size_t i = 0; i < sizeof kNumbers / sizeof kNumbers[0]; ++i) {
        if (strcasecmp(method, kNumbers[i].method) == 0) {
            const CMPIValue value = {.uint32 = kNumbers[i].number()};
            result->ft->returnData(result, &value, CMPI_uint32);
            return result->ft->returnDone(result);
        }
    }
    return unknown;
}
