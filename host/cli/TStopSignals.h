// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/TUniqueFd.h"

#include <atomic>
#include <functional>
#include <string>
#include <thread>

#include <signal.h>

namespace vrxhost {

// ^C and its relatives (SIGINT, SIGTERM, SIGHUP): the first is announced on standard error and calls a function on a
// thread of its own, the second ends the process at once. SIGINT and SIGHUP stay ignored where they are. Must be made
// before any other thread starts, so that all inherit the blocked signals.
class TStopSignals
{
  public:
    // erasure: goes before the announcement, to remove what a line on the terminal shows; outlives the object.
    TStopSignals(const char* erasure, std::function<void()> onFirst);
    // Ends the threads; the signals stay blocked.
    ~TStopSignals();

    TStopSignals(const TStopSignals&) = delete;
    TStopSignals& operator=(const TStopSignals&) = delete;

    bool IsStopped() const { return fStopped; }

    // Readable from the first signal on, for poll().
    int GetFd() const { return fEvent.Get(); }

    // Blocks: until the first signal, or for the time.
    // Returns: IsStopped.
    bool AwaitStop(int timeoutMs) const;

  private:
    void Announce() const;
    void AwaitSignals();
    void AwaitFirst();

    sigset_t fSignals{};
    const std::string fSentence;
    std::function<void()> fOnFirst;
    std::atomic<bool> fStopped{false};
    std::atomic<bool> fEnding{false};
    NKOLVRX20::TUniqueFd fEvent;
    // Both run from the start: while a plug-in is loaded, the host's own threads never become more.
    std::thread fSignalThread;
    std::thread fFirstThread;
};

} // namespace vrxhost
