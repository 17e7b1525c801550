// SPDX-License-Identifier: MIT
#include "host/core/SpawnChild.h"

#include <cerrno>
#include <csignal>

#include <fcntl.h>
#include <spawn.h>
#include <unistd.h>

extern char** environ;

namespace NKOLVRX20 {
namespace {

// RAII for the two plain structures of posix_spawn.
struct TSpawnSettings
{
    posix_spawnattr_t fAttributes{};
    posix_spawn_file_actions_t fActions{};

    TSpawnSettings()
    {
        posix_spawnattr_init(&fAttributes);
        posix_spawn_file_actions_init(&fActions);
    }
    ~TSpawnSettings()
    {
        posix_spawn_file_actions_destroy(&fActions);
        posix_spawnattr_destroy(&fAttributes);
    }
    TSpawnSettings(const TSpawnSettings&) = delete;
    TSpawnSettings& operator=(const TSpawnSettings&) = delete;
};

void SetFreshSignalsAndGroup(posix_spawnattr_t& attributes)
{
    sigset_t all, none;
    sigfillset(&all);
    sigemptyset(&none);
    posix_spawnattr_setsigdefault(&attributes, &all);
    posix_spawnattr_setsigmask(&attributes, &none);
    posix_spawnattr_setpgroup(&attributes, 0);
    posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETPGROUP);
}

int SetStandardStreams(posix_spawn_file_actions_t& actions, int output, int errorOutput)
{
    int error = posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    if (!error) {
        error = posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
    }
    if (!error) {
        error = posix_spawn_file_actions_adddup2(&actions, errorOutput, STDERR_FILENO);
    }
    if (!error) {
        error = posix_spawn_file_actions_addclosefrom_np(&actions, STDERR_FILENO + 1);
    }
    return error;
}

std::vector<char*> ToPointers(const std::vector<std::string>& texts)
{
    std::vector<char*> pointers;
    pointers.reserve(texts.size() + 1);
    for (const std::string& text : texts) {
        pointers.push_back(const_cast<char*>(text.c_str()));
    }
    pointers.push_back(nullptr);
    return pointers;
}

// In a process whose standard streams are closed, a pipe could land on 0 to 2 and be overwritten in the child.
int MoveAboveStandardStreams(TUniqueFd& fd)
{
    if (fd.Get() > STDERR_FILENO) {
        return 0;
    }
    TUniqueFd moved(::fcntl(fd.Get(), F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
    if (!moved) {
        return errno;
    }
    fd = std::move(moved);
    return 0;
}

} // namespace

int OpenPipe(TUniqueFd& readEnd, TUniqueFd& writeEnd)
{
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) {
        return errno;
    }
    readEnd = TUniqueFd(ends[0]);
    writeEnd = TUniqueFd(ends[1]);
    int error = MoveAboveStandardStreams(readEnd);
    if (!error) {
        error = MoveAboveStandardStreams(writeEnd);
    }
    // Only our end: the child's stays as a program expects it.
    if (!error && ::fcntl(readEnd.Get(), F_SETFL, O_NONBLOCK) != 0) {
        error = errno;
    }
    return error;
}

int SpawnChild(const TProcessRequest& request, int output, int errorOutput, pid_t& pid)
{
    TSpawnSettings settings;
    SetFreshSignalsAndGroup(settings.fAttributes);
    if (const int error = SetStandardStreams(settings.fActions, output, errorOutput)) {
        return error;
    }
    const auto arguments = ToPointers(request.fArguments);
    const auto environment = ToPointers(request.fEnvironment);
    const auto spawn = request.fSearchPath ? posix_spawnp : posix_spawn;
    return spawn(&pid, request.fProgram.c_str(), &settings.fActions, &settings.fAttributes, arguments.data(),
                 request.fInheritEnvironment ? environ : environment.data());
}

} // namespace NKOLVRX20
