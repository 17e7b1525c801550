// SPDX-License-Identifier: MIT
#include "host/cli/TProviderWatch.h"

#include "host/cli/Steps.h"

#include <utility>

namespace vrxhost {
namespace {

constexpr std::chrono::milliseconds kRetryInterval{500};

} // namespace

TProviderWatch::TProviderWatch(TStatusLine& line, const TVendorFiles& vendors, int deadlineSeconds, TRelease release)
    : fLine(line), fVendors(vendors), fDeadlineSeconds(deadlineSeconds), fRelease(std::move(release))
{
    if (fDeadlineSeconds > 0) {
        fThread = std::thread([this] { AwaitDeadlines(); });
    }
}

TProviderWatch::~TProviderWatch()
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fIsEnding = true;
    }
    fChanged.notify_all();
    if (fThread.joinable()) {
        fThread.join();
    }
}

void TProviderWatch::BeginProvider(const std::string& name)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fProvider = name;
    fClass.clear();
    fIsGivenUp = false;
    if (fDeadlineSeconds > 0) {
        fDeadline = std::chrono::steady_clock::now() + std::chrono::seconds(fDeadlineSeconds);
    }
    fChanged.notify_all();
}

void TProviderWatch::BeginClass(const std::string& className)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fClass = className;
    fLine.Show(StepOfClass(fProvider, className, fVendors));
}

void TProviderWatch::EndProvider()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fDeadline.reset();
}

// Repeated until the call has returned: the process that answers it may not run yet.
// The mutex is held while the provider is released, so that a provider that has just ended cannot cost the next one.
void TProviderWatch::AwaitDeadlines()
{
    std::unique_lock<std::mutex> lock(fMutex);
    while (!fIsEnding) {
        if (!fDeadline) {
            fChanged.wait(lock);
        } else if (std::chrono::steady_clock::now() < *fDeadline) {
            fChanged.wait_until(lock, *fDeadline);
        } else {
            fIsGivenUp = true;
            fRelease(fClass);
            fDeadline = std::chrono::steady_clock::now() + kRetryInterval;
        }
    }
}

} // namespace vrxhost
