#pragma once

#include <Pegasus/Common/Config.h>

#include <algorithm>
#include <chrono>
#include <limits>

namespace Pegasus::client {

// The one point in time that bounds everything that an operation does.
class Deadline
{
  public:
    using Clock = std::chrono::steady_clock;

    explicit Deadline(Uint32 timeoutMs) : fEnd(Clock::now() + std::chrono::milliseconds(timeoutMs)) {}

    bool hasPassed() const { return Clock::now() >= fEnd; }
    // For poll(2): rounded up, so that a wait does not end before the deadline.
    int remainingMs() const
    {
        const auto left = std::chrono::ceil<std::chrono::milliseconds>(fEnd - Clock::now()).count();
        return static_cast<int>(std::clamp<decltype(left)>(left, 0, std::numeric_limits<int>::max()));
    }

  private:
    Clock::time_point fEnd;
};

} // namespace Pegasus::client
