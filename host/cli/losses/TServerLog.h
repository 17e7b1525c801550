// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

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
    const std::string fPath;
    std::uintmax_t fStart = 0; // bytes
};

} // namespace vrxhost
