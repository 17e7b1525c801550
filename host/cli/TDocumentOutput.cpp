// SPDX-License-Identifier: MIT
#include "host/cli/TDocumentOutput.h"

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <climits>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

namespace vrxhost {
namespace {

constexpr std::chrono::milliseconds kTimeAfterStop{500};

[[noreturn]] void ThrowErrno(const char* operation)
{
    throw std::system_error(errno, std::generic_category(), operation);
}

} // namespace

TDocumentOutput::TDocumentOutput() : fFd(::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1))
{
    if (!fFd) {
        ThrowErrno("copying standard output");
    }
    if (::dup2(STDERR_FILENO, STDOUT_FILENO) < 0) {
        ThrowErrno("pointing standard output at standard error");
    }
}

TDocumentOutput::~TDocumentOutput()
{
    ::dup2(fFd.Get(), STDOUT_FILENO);
}

bool TDocumentOutput::IsTerminal() const
{
    return ::isatty(fFd.Get()) == 1;
}

int TDocumentOutput::Write(const std::string& text, int stopFd)
{
    using TClock = std::chrono::steady_clock;
    bool stopped = false;
    TClock::time_point deadline; // once stopped
    for (std::size_t written = 0; written < text.size();) {
        const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - TClock::now());
        pollfd fds[] = {{fFd.Get(), POLLOUT, 0}, {stopped ? -1 : stopFd, POLLIN, 0}};
        const int ready = ::poll(fds, 2, stopped ? static_cast<int>(std::max<long>(left.count(), 0)) : -1);
        if (ready == 0) {
            return ECANCELED;
        }
        if (ready < 0) {
            if (errno != EINTR) {
                return errno;
            }
        } else if (fds[1].revents != 0) {
            stopped = true;
            deadline = TClock::now() + kTimeAfterStop;
        } else {
            // A writable pipe takes this much at once.
            const std::size_t count = std::min<std::size_t>(text.size() - written, PIPE_BUF);
            const ssize_t result = ::write(fFd.Get(), text.data() + written, count);
            if (result >= 0) {
                written += static_cast<std::size_t>(result);
            } else if (errno != EINTR && errno != EAGAIN) {
                return errno;
            }
        }
    }
    return 0;
}

} // namespace vrxhost
