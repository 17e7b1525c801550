// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include <sys/types.h>

namespace Pegasus::server {

// The file under /var/tmp by which other programs find the process that serves one consumer: the process id in decimal,
// one newline. Its path is fixed by the programs that look for it.
//
// Everybody may write to its folder, so this server only writes it; the tree's lock decides whether a server runs.
// Thread: any.
class StartFile
{
  public:
    static std::string pathOf(const std::string& consumer);

    // Throws: std::system_error, also when another user's file or a folder lies at the path.
    static void write(const std::string& path, pid_t pid);

    // Removes the file if it is root's or the user's own and names `pid`.
    static void remove(const std::string& path, pid_t pid) noexcept;
};

} // namespace Pegasus::server
