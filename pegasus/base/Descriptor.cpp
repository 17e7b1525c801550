#include "pegasus/base/Descriptor.h"

#include <cerrno>

namespace Pegasus::base {

void Descriptor::reset(int fd) noexcept
{
    if (fFd >= 0) {
        const int error = errno;
        ::close(fFd);
        errno = error;
    }
    fFd = fd;
}

} // namespace Pegasus::base
