// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/TUniqueFd.h"

#include <atomic>
#include <exception>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// Thrown by TOSSpecific::SpawnProcess while programs are cancelled. It is unrelated to TVRXException on purpose: a
// plug-in retries after a TVRXException, and a host that is shutting down wants the call to end.
class TProgramsCancelled : public std::exception
{
  public:
    ~TProgramsCancelled() override;
    const char* what() const noexcept override;
};

// The host's switch for all child processes: while cancelled, running programs are killed and new ones are refused.
// It turns once: programs are cancelled when a user interrupts the host's work, and resumed for the shutdown, which
// runs some. Thread: safe.
class TProcessControl
{
  public:
    static TProcessControl& Instance();

    // Ignored after Resume.
    void Cancel();
    void Resume();
    bool IsCancelled() const { return fCancelled; }

    using TObserver = std::function<void(const std::vector<std::string>& arguments, int timeoutSeconds)>;

    // Has each start of a program reported, on the thread that starts it; null for nobody.
    void SetObserver(TObserver observer);
    void NotifyStart(const std::vector<std::string>& arguments, int timeoutSeconds);

    // Readable while cancelled, for poll().
    int GetWakeFd() const { return fWake.Get(); }

  private:
    TProcessControl();

    std::mutex fMutex; // orders Cancel and Resume
    std::mutex fObserverMutex;
    TObserver fObserver;
    bool fResumed = false;
    std::atomic<bool> fCancelled{false};
    TUniqueFd fWake;
};

} // namespace NKOLVRX20
