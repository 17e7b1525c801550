// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <chrono>
#include <limits>

namespace Pegasus::base {

// The one point in time that bounds everything that an operation does, however many waits it takes.
class Deadline
{
  public:
    using Clock = std::chrono::steady_clock;

    // A deadline that never passes.
    static constexpr Deadline never() noexcept { return Deadline(Clock::time_point::max()); }
    // `timeout` from now; never() where the clock cannot count that far.
    static Deadline after(std::chrono::milliseconds timeout) noexcept
    {
        const Clock::time_point now = Clock::now();
        const auto most = std::chrono::duration_cast<std::chrono::milliseconds>(Clock::time_point::max() - now);
        return timeout < most ? Deadline(now + timeout) : never();
    }
    // As after(); but 0 means never(), as it does in the settings of a server.
    static Deadline afterOrNever(std::chrono::milliseconds timeout) noexcept
    {
        return timeout.count() == 0 ? never() : after(timeout);
    }

    bool isNever() const noexcept { return fEnd == Clock::time_point::max(); }
    bool hasPassed() const noexcept { return !isNever() && Clock::now() >= fEnd; }
    // The time-out of poll(2): rounded up, so that a wait lasts until the deadline; 0 when it has passed, -1 for
    // never().
    int pollTimeoutMs() const noexcept
    {
        if (isNever()) {
            return -1;
        }
        const auto left = std::chrono::ceil<std::chrono::milliseconds>(fEnd - Clock::now()).count();
        return static_cast<int>(std::clamp<decltype(left)>(left, 0, std::numeric_limits<int>::max()));
    }
    // For condition variables: wait_until(lock, deadline.time()).
    constexpr Clock::time_point time() const noexcept { return fEnd; }

  private:
    constexpr explicit Deadline(Clock::time_point end) noexcept : fEnd(end) {}

    Clock::time_point fEnd;
};

} // namespace Pegasus::base
