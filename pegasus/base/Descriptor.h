#pragma once

#include <utility>

#include <unistd.h>

namespace Pegasus::server {

// Owns one file descriptor; -1 is none.
class Descriptor
{
  public:
    Descriptor() = default;
    explicit Descriptor(int fd) : fFd(fd) {}
    Descriptor(Descriptor&& other) noexcept : fFd(std::exchange(other.fFd, -1)) {}
    Descriptor& operator=(Descriptor&& other) noexcept
    {
        reset(std::exchange(other.fFd, -1));
        return *this;
    }
    ~Descriptor() { reset(); }

    int get() const { return fFd; }
    explicit operator bool() const { return fFd >= 0; }
    int release() { return std::exchange(fFd, -1); }
    void reset(int fd = -1)
    {
        if (fFd >= 0) {
            ::close(fFd);
        }
        fFd = fd;
    }

  private:
    int fFd = -1;
};

} // namespace Pegasus::server
