// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/Daemon.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/wait.h>

namespace Pegasus::server {

namespace {

constexpr char kReady = 'R';
constexpr char kFailed = 'F';
constexpr std::size_t kMaxMessageBytes = 64u << 10;

void writeFully(int fd, const std::string& text)
{
    for (std::size_t done = 0; done < text.size();) {
        const ssize_t n = ::write(fd, text.data() + done, text.size() - done);
        if (n < 0 && errno != EINTR) {
            return;
        }
        done += n > 0 ? static_cast<std::size_t>(n) : 0;
    }
}

std::string readToEnd(int fd)
{
    std::string text;
    char part[4096];
    while (text.size() < kMaxMessageBytes) {
        const ssize_t n = ::read(fd, part, sizeof part);
        if (n == 0 || (n < 0 && errno != EINTR)) {
            break;
        }
        if (n > 0) {
            text.append(part, static_cast<std::size_t>(n));
        }
    }
    return text;
}

void closeRange(unsigned first, unsigned last)
{
    if (first > last || ::syscall(SYS_close_range, first, last, 0) == 0) {
        return;
    }
    const unsigned limit = static_cast<unsigned>(::sysconf(_SC_OPEN_MAX));
    for (unsigned fd = first; fd <= last && fd < limit; ++fd) {
        ::close(static_cast<int>(fd));
    }
}

void detach()
{
    ::setsid();
    ::umask(077);
    const int null = ::open("/dev/null", O_RDWR);
    for (int fd = 0; fd <= STDERR_FILENO; ++fd) {
        ::dup2(null, fd);
    }
    if (null > STDERR_FILENO) {
        ::close(null);
    }
}

} // namespace

void openStandardDescriptors()
{
    int fd = -1;
    do {
        fd = ::open("/dev/null", O_RDWR);
    } while (fd >= 0 && fd <= STDERR_FILENO);
    ::close(fd);
}

void closeInheritedDescriptors(int keep)
{
    const auto first = static_cast<unsigned>(STDERR_FILENO + 1);
    if (keep < 0) {
        return closeRange(first, ~0u);
    }
    closeRange(first, static_cast<unsigned>(keep) - 1);
    closeRange(static_cast<unsigned>(keep) + 1, ~0u);
}

void LaunchSignal::ready()
{
    send(kReady, "");
}

void LaunchSignal::failed(const std::string& error)
{
    send(kFailed, error);
}

void LaunchSignal::send(char kind, const std::string& text)
{
    if (!fPipe) {
        return;
    }
    writeFully(fPipe.get(), kind + text);
    fPipe.reset();
}

LaunchResult launchDaemon(const std::function<void(LaunchSignal&)>& server)
{
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) {
        throw std::system_error(errno, std::generic_category(), "cannot create a pipe");
    }
    base::Descriptor reading(ends[0]);
    base::Descriptor writing(ends[1]);
    const pid_t child = ::fork();
    if (child < 0) {
        throw std::system_error(errno, std::generic_category(), "cannot create a process");
    }
    if (child == 0) {
        detach();
        reading.release(); // closed with the rest
        closeInheritedDescriptors(writing.get());
        LaunchSignal signal(std::move(writing));
        server(signal);
        ::_exit(0);
    }
    writing.reset();
    const std::string message = readToEnd(reading.get());
    if (!message.empty() && message[0] == kReady) {
        return {};
    }
    ::waitpid(child, nullptr, 0);
    return {1, message.empty() ? "cimserver not started: the process ended before it was ready" : message.substr(1)};
}

} // namespace Pegasus::server
