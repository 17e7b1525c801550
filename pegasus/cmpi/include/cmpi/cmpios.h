// SPDX-License-Identifier: MIT
/* Threads, mutexes and conditions of the platform, as CMPIBrokerExtFT hands them out. */
#pragma once

#ifdef __cplusplus
extern "C" {
#endif

typedef void* CMPIThread;
typedef void* CMPIThreadReturn;
typedef unsigned int CMPIThreadKey;
typedef void* CMPIMutex;
typedef void* CMPICondition;
typedef CMPIThreadReturn (*CMPIThreadFunc)(void* parm);
typedef void (*CMPIThreadOnceFunc)(void);
typedef void (*CMPIThreadKeyCleanupFunc)(void* value);

#ifdef __cplusplus
}
#endif
