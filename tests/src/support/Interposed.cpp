// SPDX-License-Identifier: MIT
// The functions that the test program puts in front of libc and of the host's process service. Each asks the current
// TOutsideWorld about the plug-in's calls; all others, and all while that object is absent, go to the next definition.
#include "tests/src/support/OutsideWorld.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>

#include <arpa/inet.h>
#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <pthread.h>
#include <sys/socket.h>
#include <unistd.h>

using NKOLVRX20::TOutsideWorld;

namespace {

template <typename TFunction> TFunction* Next(const char* name)
{
    void* const next = ::dlsym(RTLD_NEXT, name);
    if (!next) {
        std::fprintf(stderr, "nothing to forward to: %s\n", name);
        std::abort();
    }
    return reinterpret_cast<TFunction*>(next);
}

// Returns: the file to open in place of the path; null, and EACCES, when opening it is to fail.
const char* FileFor(const char* path)
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world || world->fFiles.count(path) == 0) {
        return path;
    }
    const std::string& file = world->fFiles.at(path);
    errno = EACCES;
    return file.empty() ? nullptr : file.c_str();
}

// Returns: whether a thread with this start belongs to Boost, as those of the plug-in alone do.
bool IsBoostThread(void* (*start)(void*))
{
    Dl_info library = {};
    const auto next = Next<int(const void*, Dl_info*)>("dladdr");
    return next(reinterpret_cast<void*>(start), &library) != 0 && library.dli_fname &&
           std::string(library.dli_fname).find("boost_thread") != std::string::npos;
}

// Returns: whether the socket is one of the tests' own; the plug-in's probe keeps the default options.
bool IsReusingAddresses(int descriptor)
{
    int reuse = 0;
    socklen_t length = sizeof reuse;
    return ::getsockopt(descriptor, SOL_SOCKET, SO_REUSEADDR, &reuse, &length) == 0 && reuse != 0;
}

} // namespace

extern "C" {

unsigned int sleep(unsigned int seconds)
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world) {
        return Next<unsigned int(unsigned int)>("sleep")(seconds);
    }
    world->Record("sleep " + std::to_string(seconds));
    if (world->fOnSleep) {
        world->fOnSleep(seconds);
    }
    return 0;
}

int system(const char* command)
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world) {
        return Next<int(const char*)>("system")(command);
    }
    world->Record(std::string("system ") + command);
    if (world->fOnSystem) {
        world->fOnSystem(command);
    }
    return 0;
}

int kill(pid_t pid, int signal) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world) {
        return Next<int(pid_t, int)>("kill")(pid, signal);
    }
    world->Record("kill " + std::to_string(pid) + " " + std::to_string(signal));
    return -1; // callers go on whatever it returns
}

int socket(int domain, int type, int protocol) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (world && world->fSocketFails && domain == AF_INET) {
        errno = EMFILE;
        return -1;
    }
    return Next<int(int, int, int)>("socket")(domain, type, protocol);
}

int bind(int descriptor, const sockaddr* address, socklen_t length) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (world && world->fIsPortFree && address->sa_family == AF_INET && !IsReusingAddresses(descriptor)) {
        const auto& internet = *reinterpret_cast<const sockaddr_in*>(address);
        const unsigned short port = ntohs(internet.sin_port);
        world->fProbe = ::inet_ntoa(internet.sin_addr);
        world->fProbe += (::fcntl(descriptor, F_GETFD) & FD_CLOEXEC) != 0 ? " close-on-exec" : "";
        if (port != 0 && !world->fIsPortFree(port)) {
            errno = EADDRINUSE;
            return -1;
        }
        if (port != 0 && !world->fBindForReal) {
            return 0;
        }
    }
    return Next<int(int, const sockaddr*, socklen_t)>("bind")(descriptor, address, length);
}

int dladdr(const void* address, Dl_info* info) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (world && world->fDladdrFails) {
        return 0;
    }
    const int found = Next<int(const void*, Dl_info*)>("dladdr")(address, info);
    if (world && world->fDladdrFile) {
        info->dli_fname = *world->fDladdrFile;
    }
    return found;
}

int pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*start)(void*), void* argument) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (world && IsBoostThread(start) && !world->TakeThread()) {
        return EAGAIN;
    }
    return Next<int(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*)>("pthread_create")(thread, attributes,
                                                                                                   start, argument);
}

DIR* opendir(const char* path)
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (world && !world->fUnreadableDirectory.empty() && world->fUnreadableDirectory == path) {
        errno = EACCES;
        return nullptr;
    }
    return Next<DIR*(const char*)>("opendir")(path);
}

std::FILE* fopen(const char* path, const char* mode)
{
    const char* file = FileFor(path);
    return file ? Next<std::FILE*(const char*, const char*)>("fopen")(file, mode) : nullptr;
}

// A caller that leaves the mode out leaves an undefined one here, which the next definition does not look at.
int open(const char* path, int flags, ...)
{
    va_list arguments;
    va_start(arguments, flags);
    const auto mode = static_cast<mode_t>(va_arg(arguments, int));
    va_end(arguments);
    const char* file = FileFor(path);
    return file ? Next<int(const char*, int, ...)>("open")(file, flags, mode) : -1;
}

} // extern "C"

namespace NKOLVRX20 {

namespace {

// The process service's own functions, for what runs outside of a TOutsideWorld. Looked up at the program's start, so
// that a wrong name shows in every run.
const auto gRunInEnvironment = Next<void(const std::string&, const std::vector<std::string>&, const std::string&,
                                         const std::vector<std::string>&, std::string&, int)>(
    "_ZN9NKOLVRX2011TOSSpecific12SpawnProcessERKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEERKSt6vectorIS6_"
    "SaIS6_EES8_SD_RS6_i");
const auto gRunByPath = Next<void(const std::string&, const std::vector<std::string>&, std::string&, int)>(
    "_ZN9NKOLVRX2011TOSSpecific12SpawnProcessERKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEERKSt6vectorIS6_"
    "SaIS6_EERS6_i");

} // namespace

void TOSSpecific::SpawnProcess(const std::string& commandLine, const std::vector<std::string>& arguments,
                               std::string& output, int timeoutSeconds)
{
    if (TOutsideWorld* world = TOutsideWorld::Current()) {
        world->Run({commandLine, arguments, "", {}, timeoutSeconds}, output);
    } else {
        gRunByPath(commandLine, arguments, output, timeoutSeconds);
    }
}

void TOSSpecific::SpawnProcess(const std::string& name, const std::vector<std::string>& arguments,
                               const std::string& programPath, const std::vector<std::string>& environment,
                               std::string& output, int timeoutSeconds)
{
    if (TOutsideWorld* world = TOutsideWorld::Current()) {
        world->Run({name, arguments, programPath, environment, timeoutSeconds}, output);
    } else {
        gRunInEnvironment(name, arguments, programPath, environment, output, timeoutSeconds);
    }
}

} // namespace NKOLVRX20
