// SPDX-License-Identifier: MIT
// How a server that an earlier run left running is found: its start file names a process, and the process listing shows
// whether that process still is a server.
#pragma once

#include <optional>
#include <string>

namespace NKOLVRX20 {

// The file in which a server of one consumer writes its process id. It lies in a directory where every user may write,
// so that only a regular file of root's or of the user's own counts.
class TStartFile
{
  public:
    // Requires: a consumer name that is safe in a shell command.
    explicit TStartFile(const std::string& consumer);

    // Returns: the process id; 0, for which HasServer is false, when the file begins with anything but a number;
    // nullopt, after a log line, when a file that counts is absent.
    std::optional<int> ReadProcessId() const;

    void Remove() const;

  private:
    const std::string fPath;
};

// All processes of the machine, as "ps -e" lists them.
class TProcessListing
{
  public:
    // Takes the listing, and logs it. A "ps" that fails leaves what it had written.
    // Blocks: up to 360 seconds.
    TProcessListing();

    // Returns: whether the process is listed on a line that names the server.
    bool HasServer(int pid) const;

  private:
    std::string fText;
};

} // namespace NKOLVRX20
