// SPDX-License-Identifier: MIT
#include "host/cli/TStopSignals.h"

#include "host/cli/Options.h"

#include <cerrno>

#include <poll.h>
#include <sys/eventfd.h>
#include <unistd.h>

namespace vrxhost {
namespace {

// By whoever started the program: nohup the hang-up, a shell the ^C of a job in the background. A signal that is
// blocked and waited for would arrive all the same.
bool IsIgnored(int number)
{
    struct sigaction before = {};
    return ::sigaction(number, nullptr, &before) == 0 && before.sa_handler == SIG_IGN;
}

} // namespace

TStopSignals::TStopSignals(const char* erasure, std::function<void()> onFirst)
    : fSentence(std::string(erasure) + "vrxhost: stopping ...\n"), fOnFirst(std::move(onFirst)),
      fEvent(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
{
    sigemptyset(&fSignals);
    sigaddset(&fSignals, SIGTERM);
    for (const int number : {SIGINT, SIGHUP}) {
        if (!IsIgnored(number)) {
            sigaddset(&fSignals, number);
        }
    }
    pthread_sigmask(SIG_BLOCK, &fSignals, nullptr);
    fSignalThread = std::thread([this] { AwaitSignals(); });
    fFirstThread = std::thread([this] { AwaitFirst(); });
}

TStopSignals::~TStopSignals()
{
    fEnding = true;
    ::eventfd_write(fEvent.Get(), 1);
    pthread_kill(fSignalThread.native_handle(), SIGTERM); // any of the set wakes it
    fSignalThread.join();
    fFirstThread.join();
}

bool TStopSignals::AwaitStop(int timeoutMs) const
{
    pollfd event = {fEvent.Get(), POLLIN, 0};
    ::poll(&event, 1, timeoutMs);
    return fStopped;
}

// Bypasses the streams, whose lock a blocked write of another thread may hold: the second signal must be heard.
void TStopSignals::Announce() const
{
    pollfd error = {STDERR_FILENO, POLLOUT, 0};
    if (::poll(&error, 1, 0) == 1) {
        static_cast<void>(!::write(STDERR_FILENO, fSentence.data(), fSentence.size()));
    }
}

void TStopSignals::AwaitSignals()
{
    for (int number = 0; sigwait(&fSignals, &number) == 0 && !fEnding;) {
        if (fStopped) {
            ::_exit(kInterrupted);
        }
        Announce();
        fStopped = true;
        ::eventfd_write(fEvent.Get(), 1);
    }
}

// On a thread of its own, so that the second signal is heard while this is under way.
void TStopSignals::AwaitFirst()
{
    pollfd event = {fEvent.Get(), POLLIN, 0};
    while (::poll(&event, 1, -1) < 0 && errno == EINTR) {
        continue;
    }
    if (fStopped) {
        fOnFirst();
    }
}

} // namespace vrxhost
