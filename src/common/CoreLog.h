// SPDX-License-Identifier: MIT
// Entries of the host's core log, put together with a string stream in the "C" locale.
#pragma once

#include "src/common/Text.h"

#include <host/ILogger.h>
#include <host/TVRXException.h>

#include <locale>
#include <sstream>
#include <string>

namespace NKOLVRX20 {

void WriteCoreLog(ILogger::EVRXLogSeverity severity, const std::string& text);

// Returns: the parts, one after the other, with numbers in plain decimal whatever the host's locale is.
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
