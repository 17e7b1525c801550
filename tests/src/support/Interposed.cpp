// The functions that the test program puts in front of libc and of the host's process service. Each asks the current
// TOutsideWorld about the plug-in's calls; all others, and all while that object is absent, go to the next definition.
#include "tests/src/support/OutsideWorld.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>

#include <dirent.h>
#include <dlfcn.h>
#include <netinet/in.h>
#include <pthread.h>
#include <sys/socket.h>
#include <unistd.h>

using NKOLVRX20::TOutsideWorld;

namespace {

template <typename TFunction> TFunction* Next(const char* name)
{
    return reinterpret_cast<TFunction*>(::dlsym(RTLD_NEXT, name));
}

std::FILE* OpenFile(const char* function, const char* path, const char* mode)
{
    const auto next = Next<std::FILE*(const char*, const char*)>(function);
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world) {
        return next(path, mode);
    }
    const auto redirected = world->fFiles.find(path);
    if (redirected == world->fFiles.end()) {
        return next(path, mode);
    }
    if (redirected->second.empty()) {
        errno = EACCES;
        return nullptr;
    }
    return next(redirected->second.c_str(), mode);
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
    return 0;
}

int kill(pid_t pid, int signal) noexcept
{
    TOutsideWorld* world = TOutsideWorld::Current();
    if (!world) {
        return Next<int(pid_t, int)>("kill")(pid, signal);
    }
    world->Record("kill " + std::to_string(pid) + " " + std::to_string(signal));
    return world->fKillFails ? -1 : 0;
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
        const unsigned short port = ntohs(reinterpret_cast<const sockaddr_in*>(address)->sin_port);
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
        info->dli_fname = world->fDladdrFile;
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
    return OpenFile("fopen", path, mode);
}

std::FILE* fopen64(const char* path, const char* mode)
{
    return OpenFile("fopen64", path, mode);
}

} // extern "C"

namespace NKOLVRX20 {

namespace {

// The process service's own function, for what runs outside of a TOutsideWorld.
constexpr char kRunInEnvironment[] =
    "_ZN9NKOLVRX2011TOSSpecific12SpawnProcessERKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEERKSt6vectorIS6_"
    "SaIS6_EES8_SC_RS6_i";
constexpr char kRunByPath[] =
    "_ZN9NKOLVRX2011TOSSpecific12SpawnProcessERKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEERKSt6vectorIS6_"
    "SaIS6_EERS6_i";

} // namespace

void TOutsideWorld::RunByPathForReal(const TSpawnCall& call, std::string& output)
{
    Next<void(const std::string&, const std::vector<std::string>&, std::string&, int)>(kRunByPath)(
        call.fName, call.fArguments, output, call.fTimeoutSeconds);
}

void TOSSpecific::SpawnProcess(const std::string& commandLine, const std::vector<std::string>& arguments,
                               std::string& output, int timeoutSeconds)
{
    if (TOutsideWorld* world = TOutsideWorld::Current()) {
        world->Run({commandLine, arguments, "", {}, timeoutSeconds}, output);
    } else {
        TOutsideWorld::RunByPathForReal({commandLine, arguments, "", {}, timeoutSeconds}, output);
    }
}

void TOSSpecific::SpawnProcess(const std::string& name, const std::vector<std::string>& arguments,
                               const std::string& programPath, const std::vector<std::string>& environment,
                               std::string& output, int timeoutSeconds)
{
    if (TOutsideWorld* world = TOutsideWorld::Current()) {
        world->Run({name, arguments, programPath, environment, timeoutSeconds}, output);
    } else {
        Next<void(const std::string&, const std::vector<std::string>&, const std::string&,
                  const std::vector<std::string>&, std::string&, int)>(kRunInEnvironment)(
            name, arguments, programPath, environment, output, timeoutSeconds);
    }
}

} // namespace NKOLVRX20
