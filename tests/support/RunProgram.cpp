// SPDX-License-Identifier: MIT
#include "tests/support/RunProgram.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <stdexcept>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ;

namespace test {

namespace {

using Clock = std::chrono::steady_clock;

[[noreturn]] void fail(const std::string& what, int error)
{
    throw std::runtime_error(what + ": " + std::strerror(error));
}

// A pipe whose reading end stays here.
class OutputPipe
{
  public:
    OutputPipe()
    {
        int ends[2];
        if (::pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0) {
            fail("pipe", errno);
        }
        readEnd = ends[0];
        writeEnd = ends[1];
        // The child must not inherit the non-blocking mode of its output.
        ::fcntl(writeEnd, F_SETFL, 0);
    }
    ~OutputPipe()
    {
        ::close(readEnd);
        closeWriteEnd();
    }
    OutputPipe(const OutputPipe&) = delete;
    OutputPipe& operator=(const OutputPipe&) = delete;

    void closeWriteEnd()
    {
        if (writeEnd >= 0) {
            ::close(writeEnd);
        }
        writeEnd = -1;
    }
    void drainInto(std::string& text)
    {
        char buffer[4096];
        ssize_t got;
        while ((got = ::read(readEnd, buffer, sizeof buffer)) > 0) {
            text.append(buffer, static_cast<std::size_t>(got));
        }
        isOpen = isOpen && got != 0;
    }
    // What to wait for; poll() passes over a negative descriptor.
    pollfd toPoll() const { return {isOpen ? readEnd : -1, POLLIN, 0}; }

    int readEnd = -1;
    int writeEnd = -1;
    bool isOpen = true; // the child has not closed its end
};

std::vector<char*> pointers(std::vector<std::string>& texts)
{
    std::vector<char*> result;
    for (std::string& text : texts) {
        result.push_back(text.data());
    }
    result.push_back(nullptr);
    return result;
}

// getenv() in the child finds the first entry of a name, so replaced entries are removed.
std::vector<std::string> mergedEnvironment(const std::vector<std::string>& added)
{
    std::vector<std::string> merged = added;
    for (char** entry = environ; *entry; ++entry) {
        const std::string name(*entry, std::strcspn(*entry, "=") + 1);
        bool isReplaced = false;
        for (const std::string& text : added) {
            isReplaced = isReplaced || text.compare(0, name.size(), name) == 0;
        }
        if (!isReplaced) {
            merged.emplace_back(*entry);
        }
    }
    return merged;
}

pid_t start(std::vector<std::string> arguments, std::vector<std::string> environment, const OutputPipe& out,
            const OutputPipe& err)
{
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, out.writeEnd, STDOUT_FILENO);
    posix_spawn_file_actions_adddup2(&actions, err.writeEnd, STDERR_FILENO);
    posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    pid_t child = -1;
    const int error = ::posix_spawn(&child, arguments[0].c_str(), &actions, nullptr, pointers(arguments).data(),
                                    pointers(environment).data());
    posix_spawn_file_actions_destroy(&actions);
    if (error != 0) {
        fail("cannot start " + arguments[0], error);
    }
    return child;
}

// Reaps the child if it has ended.
bool hasEnded(pid_t child, int& status)
{
    return ::waitpid(child, &status, WNOHANG) == child;
}

// Readable when the child has ended.
class ChildHandle
{
  public:
    explicit ChildHandle(pid_t child) : fDescriptor(static_cast<int>(::syscall(SYS_pidfd_open, child, 0))) {}
    ~ChildHandle() { ::close(fDescriptor); }
    ChildHandle(const ChildHandle&) = delete;
    ChildHandle& operator=(const ChildHandle&) = delete;

    pollfd toPoll() const { return {fDescriptor, POLLIN, 0}; }

  private:
    int fDescriptor;
};

int millisecondsUntil(Clock::time_point deadline)
{
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Clock::now());
    return static_cast<int>(std::max<std::chrono::milliseconds::rep>(left.count(), 0));
}

} // namespace

ProgramResult runProgram(const std::vector<std::string>& arguments, const std::vector<std::string>& environment,
                         std::chrono::milliseconds limit)
{
    OutputPipe out;
    OutputPipe err;
    const pid_t child = start(arguments, mergedEnvironment(environment), out, err);
    out.closeWriteEnd();
    err.closeWriteEnd();

    const ChildHandle handle(child);
    const Clock::time_point deadline = Clock::now() + limit;
    ProgramResult result;
    int status = 0;
    bool isOver = false;
    while (!isOver) {
        pollfd events[] = {handle.toPoll(), out.toPoll(), err.toPoll()};
        if (::poll(events, 3, millisecondsUntil(deadline)) == 0) {
            ::kill(child, SIGKILL);
            ::waitpid(child, &status, 0);
            throw std::runtime_error(arguments[0] + " did not end in time");
        }
        isOver = hasEnded(child, status);
        out.drainInto(result.out);
        err.drainInto(result.err);
    }
    if (WIFEXITED(status)) {
        result.exitStatus = WEXITSTATUS(status);
    } else if (WIFSIGNALED(status)) {
        result.signal = WTERMSIG(status);
    }
    return result;
}

} // namespace test
