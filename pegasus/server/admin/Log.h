#pragma once

#include <string>

namespace Pegasus::server {

enum class LogLevel
{
    kError,
    kWarning,
    kInformation,
    kDebug
};

// The server's log: one line an event, appended to <home>/cimserver.log (mode 0600). Past kMaxLogBytes the file is set
// aside as cimserver.log.1 and begun anew. Line ends within a text are written as "\n".
//
// Thread: any. Nothing throws: a log that cannot be written is no reason to fail a request.
class Log
{
  public:
    static constexpr std::size_t kMaxLogBytes = 8u << 20;

    // Until opened, lines are dropped. `alsoToStandardError` serves a server in the foreground.
    static void open(const std::string& home, bool alsoToStandardError) noexcept;
    static void setLevel(LogLevel least) noexcept;
    static void write(LogLevel severity, const std::string& text) noexcept;
};

} // namespace Pegasus::server
