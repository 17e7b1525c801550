// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/TreeLock.h"

#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

namespace Pegasus::server {

namespace {

// Returns: whether the path still names the locked file. Its last holder may have removed it between our open and our
// lock.
bool isSameFile(int fd, const std::string& path)
{
    struct stat ours = {};
    struct stat named = {};
    return ::fstat(fd, &ours) == 0 && ::lstat(path.c_str(), &named) == 0 && ours.st_dev == named.st_dev &&
           ours.st_ino == named.st_ino;
}

} // namespace

bool TreeLock::acquire(const std::string& home)
{
    fPath = base::treeLockPath(home);
    for (;;) {
        fFile.reset(::open(fPath.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC, 0600));
        if (!fFile) {
            throw std::system_error(errno, std::generic_category(), "cannot open " + fPath);
        }
        if (!base::takeTreeLock(fFile)) {
            fFile.reset();
            return false;
        }
        if (isSameFile(fFile.get(), fPath)) {
            return true;
        }
    }
}

void TreeLock::release() noexcept
{
    if (!fFile) {
        return;
    }
    ::unlink(fPath.c_str());
    fFile.reset();
}

} // namespace Pegasus::server
