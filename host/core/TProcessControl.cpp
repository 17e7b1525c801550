// SPDX-License-Identifier: MIT
#include "host/core/TProcessControl.h"

#include <utility>

#include <sys/eventfd.h>

namespace NKOLVRX20 {

TProgramsCancelled::~TProgramsCancelled() = default;

const char* TProgramsCancelled::what() const noexcept
{
    return "The host is shutting down and runs no programs";
}

TProcessControl& TProcessControl::Instance()
{
    static TProcessControl* fgInstance = new TProcessControl; // outlives every plug-in
    return *fgInstance;
}

TProcessControl::TProcessControl() : fWake(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {}

void TProcessControl::Cancel()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fResumed) {
        return;
    }
    fCancelled = true; // before the wake-up, so that whoever wakes sees it
    ::eventfd_write(fWake.Get(), 1);
}

void TProcessControl::Resume()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fResumed = true;
    fCancelled = false;
    eventfd_t ignored = 0; // waiters only poll; this read alone resets the descriptor
    ::eventfd_read(fWake.Get(), &ignored);
}

void TProcessControl::SetObserver(TObserver observer)
{
    const std::lock_guard<std::mutex> lock(fObserverMutex);
    fObserver = std::move(observer);
}

void TProcessControl::NotifyStart(const std::vector<std::string>& arguments, int timeoutSeconds)
{
    const std::lock_guard<std::mutex> lock(fObserverMutex);
    if (fObserver) {
        fObserver(arguments, timeoutSeconds);
    }
}

} // namespace NKOLVRX20
