// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/PrivateFile.h"

#include "pegasus/base/Descriptor.h"
#include "pegasus/base/Users.h"

#include <cerrno>
#include <cstdio>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

namespace Pegasus::server {

namespace {

[[noreturn]] void fail(const std::string& what, const std::string& path)
{
    throw std::system_error(errno, std::generic_category(), what + " " + path);
}

void writeAll(int fd, const std::string& content, const std::string& path)
{
    for (std::size_t done = 0; done < content.size();) {
        const ssize_t n = ::write(fd, content.data() + done, content.size() - done);
        if (n >= 0) {
            done += static_cast<std::size_t>(n);
        } else if (errno != EINTR) {
            fail("cannot write", path);
        }
    }
}

} // namespace

void writePrivateFile(const std::string& path, const std::string& content)
{
    const std::string temporary = path + ".new." + std::to_string(::getpid());
    ::unlink(temporary.c_str());
    const base::Descriptor file(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (!file) {
        fail("cannot create", temporary);
    }
    try {
        writeAll(file.get(), content, temporary);
        if (::rename(temporary.c_str(), path.c_str()) != 0) {
            fail("cannot replace", path);
        }
    } catch (...) {
        ::unlink(temporary.c_str());
        throw;
    }
}

std::string readOwnFile(const std::string& path, std::size_t maxBytes)
{
    const base::Descriptor file(::open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
    struct stat info = {};
    if (!file || ::fstat(file.get(), &info) != 0 || !S_ISREG(info.st_mode) || !base::isTrustedUser(info.st_uid) ||
        (info.st_mode & S_IWOTH) != 0)
    {
        return {};
    }
    std::string content(maxBytes, '\0');
    std::size_t size = 0;
    while (size < maxBytes) {
        const ssize_t n = ::read(file.get(), content.data() + size, maxBytes - size);
        if (n == 0 || (n < 0 && errno != EINTR)) {
            break;
        }
        if (n > 0) {
            size += static_cast<std::size_t>(n);
        }
    }
    content.resize(size);
    return content;
}

} // namespace Pegasus::server
