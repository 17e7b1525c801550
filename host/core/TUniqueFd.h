// SPDX-License-Identifier: MIT
#pragma once

#include <utility>

#include <unistd.h>

namespace NKOLVRX20 {

// Owns one file descriptor.
class TUniqueFd
{
  public:
    TUniqueFd() noexcept : fFd(-1) {}
    explicit TUniqueFd(int fd) noexcept : fFd(fd) {}
    TUniqueFd(TUniqueFd&& other) noexcept : fFd(std::exchange(other.fFd, -1)) {}
    TUniqueFd& operator=(TUniqueFd&& other) noexcept
    {
        std::swap(fFd, other.fFd);
        return *this;
    }
    ~TUniqueFd() { Reset(); }

    int Get() const noexcept { return fFd; }
    explicit operator bool() const noexcept { return fFd >= 0; }

    void Reset() noexcept
    {
        if (fFd >= 0) {
            ::close(fFd);
        }
        fFd = -1;
    }

  private:
    int fFd;
};

} // namespace NKOLVRX20
