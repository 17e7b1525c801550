// SPDX-License-Identifier: MIT
// Entries of the host's core log.
#pragma once

#include "src/common/Text.h"

#include <host/ILogger.h>
#include <host/TVRXException.h>

#include <string>
#include <string_view>
#include <type_traits>

namespace NKOLVRX20 {

void WriteCoreLog(ILogger::EVRXLogSeverity severity, const std::string& text);

inline void AppendPart(std::string& text, std::string_view part)
{
    text += part;
}

// In plain decimal, whatever the host's locale is.
template <typename TNumber, typename = std::enable_if_t<std::is_integral_v<TNumber>>>
void AppendPart(std::string& text, TNumber part)
{
    static_assert(!std::is_same_v<TNumber, char>, "a character is a text");
    text += std::to_string(part);
}

// Returns: the parts, one after the other.
template <typename... TParts> std::string JoinText(const TParts&... parts)
{
    std::string text;
    (AppendPart(text, parts), ...);
    return text;
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

// Returns: the message of the exception in flight, of whichever family.
// Requires: a catch block around the call.
std::string DescribeCurrentException();

// Logs the parts and the exception in flight as a failure. For places that must not throw: an exception of the logger
// is dropped.
// Requires: a catch block around the call.
template <typename... TParts> void LogCaughtException(const TParts&... parts) noexcept
{
    try {
        LogFailure(parts..., DescribeCurrentException());
    } catch (...) { // the logger was the last resort
    }
}

} // namespace NKOLVRX20
