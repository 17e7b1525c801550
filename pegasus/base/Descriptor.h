// SPDX-License-Identifier: MIT
#pragma once

#include <cerrno>
#include <utility>

#include <unistd.h>

namespace Pegasus::base {

// Owns one file descriptor and closes it in the end; -1 means empty.
class Descriptor
{
  public:
    Descriptor() = default;
    explicit Descriptor(int fd) noexcept : fFd(fd) {}
    Descriptor(Descriptor&& other) noexcept : fFd(std::exchange(other.fFd, -1)) {}
    Descriptor& operator=(Descriptor&& other) noexcept
    {
        reset(std::exchange(other.fFd, -1));
        return *this;
    }
    ~Descriptor() { reset(); }

    int get() const noexcept { return fFd; }
    explicit operator bool() const noexcept { return fFd >= 0; }
    // Ownership: passes to the caller.
    int release() noexcept { return std::exchange(fFd, -1); }
    // Closes what it owns, then owns `fd`. errno stays as it was, so that it may be read after a failed call.
    void reset(int fd = -1) noexcept
    {
        if (fFd >= 0) {
            const int error = errno;
            ::close(fFd);
            errno = error;
        }
        fFd = fd;
    }

  private:
    int fFd = -1;
};

} // namespace Pegasus::base
