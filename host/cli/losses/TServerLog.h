// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include <sys/types.h>

namespace vrxhost {

// A line of the private server's log about a vendor's module.
struct TServerLogLine
{
    std::string fModule;
    std::string fText;      // with the severity, without time and process
    bool fIsOutput = false; // what the module's process printed, and may say anything
};

// The log of a tree's own server, from where the object was made on. An installed OpenPegasus writes elsewhere: no
// lines.
class TServerLog
{
  public:
    static constexpr std::size_t kMaxBytes = 1024 * 1024; // that are read; what is before the last of them is left out

    explicit TServerLog(const std::string& root);

    // Returns: the lines that name a module, oldest first.
    std::vector<TServerLogLine> Read() const;

  private:
    static void Append(std::vector<TServerLogLine>& lines, const std::string& path, off_t start);

    const std::string fPath;
    ino_t fFile = 0;  // that was at the path then; 0: none
    off_t fStart = 0; // its size
};

} // namespace vrxhost
