// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/StopSignal.h"

#include <cerrno>
#include <system_error>

#include <poll.h>
#include <signal.h>
#include <sys/eventfd.h>
#include <sys/signalfd.h>

namespace Pegasus::server {

namespace {

base::Descriptor checked(int fd, const char* what)
{
    if (fd < 0) {
        throw std::system_error(errno, std::generic_category(), what);
    }
    return base::Descriptor(fd);
}

sigset_t endingSignals()
{
    sigset_t signals;
    ::sigemptyset(&signals);
    for (const int number : {SIGTERM, SIGINT, SIGHUP}) {
        ::sigaddset(&signals, number);
    }
    return signals;
}

void post(const base::Descriptor& event) noexcept
{
    ::eventfd_write(event.get(), 1);
}

} // namespace

StopSignal::StopSignal()
{
    const sigset_t signals = endingSignals();
    ::pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    ::signal(SIGPIPE, SIG_IGN);
    fEvent = checked(::eventfd(0, EFD_CLOEXEC), "cannot create an event");
    fEnd = checked(::eventfd(0, EFD_CLOEXEC), "cannot create an event");
    fSignals = checked(::signalfd(-1, &signals, SFD_CLOEXEC), "cannot receive signals");
    fWaiter = std::thread([this] { waitForSignal(); });
}

StopSignal::~StopSignal()
{
    post(fEnd);
    fWaiter.join();
}

void StopSignal::raise() noexcept
{
    post(fEvent);
}

void StopSignal::waitForSignal()
{
    pollfd waits[] = {{fSignals.get(), POLLIN, 0}, {fEnd.get(), POLLIN, 0}};
    while (::poll(waits, std::size(waits), -1) < 0 && errno == EINTR) {
    }
    if (waits[0].revents != 0) {
        raise();
    }
}

} // namespace Pegasus::server
