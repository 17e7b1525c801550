// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/StartFile.h"

#include "pegasus/server/admin/PrivateFile.h"

#include <unistd.h>

namespace Pegasus::server {

namespace {

constexpr std::size_t kMaxStartFileBytes = 64;

std::string contentFor(pid_t pid)
{
    return std::to_string(pid) + "\n";
}

} // namespace

std::string StartFile::pathOf(const std::string& consumer)
{
    return "/var/tmp/cimserverkol_tc_" + consumer + "_start.conf";
}

void StartFile::write(const std::string& path, pid_t pid)
{
    writePrivateFile(path, contentFor(pid));
}

void StartFile::remove(const std::string& path, pid_t pid) noexcept
try {
    if (readOwnFile(path, kMaxStartFileBytes) == contentFor(pid)) {
        ::unlink(path.c_str());
    }
} catch (...) { // out of memory: the file stays and names a process that has ended
}

} // namespace Pegasus::server
