// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/TStatusLine.h"
#include "host/cli/collect/IProviderWatch.h"
#include "host/cli/losses/TVendorFiles.h"

#include <atomic>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <thread>

namespace vrxhost {

// Shows which class the host waits for, and gives up a provider that takes longer than its deadline.
// Its thread runs from the start, so that the host's threads never become more.
// Thread: safe.
class TProviderWatch : public IProviderWatch
{
  public:
    using TRelease = std::function<void(const std::string& className)>;

    // release: called on the thread of this object when the deadline passes; it must end the call that waits for an
    // answer about the class. deadlineSeconds: 0 for none. The references outlive the object.
    TProviderWatch(TStatusLine& line, const TVendorFiles& vendors, int deadlineSeconds, TRelease release);
    ~TProviderWatch() override;

    void BeginProvider(const std::string& name) override;
    void BeginClass(const std::string& className) override;
    void EndProvider() override;
    bool IsGivenUp() const override { return fIsGivenUp; }
    int GetDeadlineSeconds() const override { return fDeadlineSeconds; }

  private:
    void AwaitDeadlines();

    TStatusLine& fLine;
    const TVendorFiles& fVendors;
    const int fDeadlineSeconds;
    const TRelease fRelease;
    std::mutex fMutex;
    std::condition_variable fChanged;
    std::string fProvider;
    std::string fClass;
    std::optional<std::chrono::steady_clock::time_point> fDeadline;
    std::atomic<bool> fIsGivenUp{false};
    bool fIsEnding = false;
    std::thread fThread;
};

} // namespace vrxhost
