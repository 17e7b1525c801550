// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

namespace Pegasus::server {

// In order of weight: a level includes those before it.
enum class LogLevel
{
    kError,
    kWarning,
    kInformation,
    kDebug
};

// Returns: the text with its control bytes as "\\n", "\\x1b", so that a terminal which shows it obeys none of them.
std::string printable(std::string_view text);

// The server's log: one line an event, appended to <home>/cimserver.log (mode 0600). Past kMaxLogBytes the file is
// renamed to cimserver.log.1, and a new one begins. The server and its agents write the same file. Control bytes are
// written as "\n", "\x1b".
//
// A line whose write fails is lost.
// Thread: any.
class Log
{
  public:
    static constexpr std::size_t kMaxLogBytes = 8u << 20;

    // Lines written before are lost. `alsoToStandardError` serves a server in the foreground.
    static void open(const std::string& home, bool alsoToStandardError) noexcept;
    static void setLevel(LogLevel least) noexcept;
    static void write(LogLevel severity, const std::string& text) noexcept;
};

} // namespace Pegasus::server
