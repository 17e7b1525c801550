#ifndef VRX_UNIQUEFD_H
#define VRX_UNIQUEFD_H

#include <utility>

#include <unistd.h>

namespace NKOLVRX20 {

// Owns one file descriptor.
class UniqueFd
{
  public:
    UniqueFd() noexcept : fFd(-1) {}
    explicit UniqueFd(int fd) noexcept : fFd(fd) {}
    UniqueFd(UniqueFd&& other) noexcept : fFd(std::exchange(other.fFd, -1)) {}
    UniqueFd& operator=(UniqueFd&& other) noexcept
    {
        std::swap(fFd, other.fFd);
        return *this;
    }
    ~UniqueFd() { Reset(); }

    int Get() const noexcept { return fFd; }
    explicit operator bool() const noexcept { return fFd >= 0; }

    void Reset() noexcept
    {
        if (fFd >= 0)
            ::close(fFd);
        fFd = -1;
    }

  private:
    int fFd;
};

} // namespace NKOLVRX20

#endif
