// SPDX-License-Identifier: MIT
// The child of the process tests: argv[1] says what it does. Every mode ends with its reader, or after 30 seconds.
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

#include <dirent.h>
#include <fcntl.h>
#include <poll.h>
#include <sys/file.h>
#include <unistd.h>

extern char** environ;

namespace {

constexpr unsigned int kLifetimeSeconds = 30;

int PrintArguments(int argc, char** argv)
{
    for (int i = 0; i < argc; ++i) {
        std::printf("[%s]", argv[i]);
    }
    return 0;
}

int PrintEnvironment()
{
    for (char** entry = environ; *entry; ++entry) {
        if (std::strncmp(*entry, "__LLVM_PROFILE", 14) != 0) // set by the coverage runtime itself
        {
            std::printf("[%s]", *entry);
        }
    }
    return 0;
}

int PrintDescriptors()
{
    DIR* directory = ::opendir("/proc/self/fd");
    const int own = ::dirfd(directory);
    for (int fd = 0; fd < 4096; ++fd) {
        if (fd != own && ::fcntl(fd, F_GETFD) != -1) {
            std::printf("[%d]", fd);
        }
    }
    ::closedir(directory);
    return 0;
}

// The mask, the dispositions and whether it leads a process group.
int PrintSignals()
{
    sigset_t mask;
    sigprocmask(SIG_SETMASK, nullptr, &mask);
    for (const int number : {SIGINT, SIGTERM, SIGPIPE, SIGCHLD, SIGUSR1}) {
        struct sigaction action;
        sigaction(number, nullptr, &action);
        std::printf("[%d %s %s]", number, sigismember(&mask, number) ? "blocked" : "open",
                    action.sa_handler == SIG_DFL ? "default" : "other");
    }
    std::printf("[%s]", ::getpgrp() == ::getpid() ? "leader" : "member");
    return 0;
}

int WriteBytes(long count)
{
    const std::string block(4096, 'x');
    for (; count > 0; count -= 4096) {
        std::fwrite(block.data(), 1, count < 4096 ? static_cast<std::size_t>(count) : 4096, stdout);
    }
    return 0;
}

// Leaves a descendant that keeps both pipes open until their reader closes them.
int LeaveDaemon()
{
    std::printf("parent");
    std::fflush(stdout);
    if (::fork() == 0) {
        ::setsid();
        pollfd output = {STDOUT_FILENO, 0, 0};
        ::poll(&output, 1, static_cast<int>(kLifetimeSeconds) * 1000);
        ::_exit(0);
    }
    return 0;
}

// A descendant of the same group holds a lock for as long as it lives; then both wait for ever.
int HoldLockInGroup(const char* path)
{
    int ready[2];
    char byte = 0;
    if (::pipe(ready) != 0) {
        return 1;
    }
    if (::fork() == 0) {
        ::flock(::open(path, O_RDWR | O_CREAT, 0600), LOCK_EX);
        const ssize_t ignored = ::write(ready[1], &byte, 1);
        (void)ignored;
        ::pause();
        ::_exit(0);
    }
    if (::read(ready[0], &byte, 1) != 1) {
        return 1;
    }
    std::printf("locked");
    std::fflush(stdout);
    ::pause();
    return 0;
}

// Joins the group of its parent; then waits for ever.
int LeaveGroup()
{
    if (::setpgid(0, ::getpgid(::getppid())) != 0) {
        return 1;
    }
    std::printf("left");
    std::fflush(stdout);
    ::pause();
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    ::alarm(kLifetimeSeconds);
    const std::string mode = argc > 1 ? argv[1] : "";
    const char* const value = argc > 2 ? argv[2] : "";
    if (mode == "arguments") {
        return PrintArguments(argc, argv);
    }
    if (mode == "environment") {
        return PrintEnvironment();
    }
    if (mode == "descriptors") {
        return PrintDescriptors();
    }
    if (mode == "signals") {
        return PrintSignals();
    }
    if (mode == "exit") {
        return std::atoi(value);
    }
    if (mode == "signal") {
        return std::raise(std::atoi(value));
    }
    if (mode == "bytes") {
        return WriteBytes(std::atol(value));
    }
    if (mode == "daemon") {
        return LeaveDaemon();
    }
    if (mode == "lock") {
        return HoldLockInGroup(value);
    }
    if (mode == "leave-group") {
        return LeaveGroup();
    }
    if (mode == "complain") {
        return std::fputs(value, stderr) < 0 ? 1 : 3;
    }
    if (mode == "write-forever") {
        for (;;) {
            WriteBytes(4096);
        }
    }
    if (mode == "input") {
        return std::getchar() == EOF ? 0 : 1;
    }
    return 99;
}
