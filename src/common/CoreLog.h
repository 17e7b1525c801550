// Entries of the host's core log, put together with a string stream in the "C" locale.
#pragma once

#include <host/ILogger.h>
#include <host/TVRXException.h>

#include <locale>
#include <sstream>
#include <string>

namespace Pegasus {
class String;
}

namespace NKOLVRX20 {

// Returns: the text in UTF-8. (What the stream operator of Pegasus::String writes depends on how OpenPegasus was
// built.)
std::string ToStdString(const Pegasus::String& text);

void WriteCoreLog(ILogger::EVRXLogSeverity severity, const std::string& text);

// Returns: the parts written one after the other; numbers in plain decimal whatever the host's locale is.
template <typename... TParts> std::string JoinText(const TParts&... parts)
{
    std::ostringstream text;
    text.imbue(std::locale::classic());
    (text << ... << parts);
    return text.str();
}

// A failure: severity 0.
template <typename... TParts> void LogFailure(const TParts&... parts)
{
    WriteCoreLog(ILogger::kError, JoinText(parts...));
}

// Progress, or the output of a program: severity 3.
template <typename... TParts> void LogProgress(const TParts&... parts)
{
    WriteCoreLog(ILogger::kInfo, JoinText(parts...));
}

// Requires: a catch block around the call.
// Logs the parts as a failure, "Class::Operation failed: " and what and which, and throws TVRXException with the
// status.
template <typename... TParts> [[noreturn]] void LogAndThrow(unsigned int status, const TParts&... parts)
{
    LogFailure(parts...);
    throw TVRXException(status);
}

// Returns: what the exception in flight says, whichever family it is of.
std::string DescribeCurrentException();

// Logs the parts and the exception in flight as a failure; for places that must not throw, so a logger that fails is
// given up on.
// Requires: a catch block around the call.
template <typename... TParts> void LogCaughtException(const TParts&... parts) noexcept
{
    try {
        LogFailure(parts..., DescribeCurrentException());
    } catch (...) { // nobody is left to tell
    }
}

} // namespace NKOLVRX20
